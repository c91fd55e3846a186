#pragma once
// What an accessibility client (a screen reader, an automation tool, a test)
// reads of a self-drawn component: a plain COM object answering IAccessible for
// the component's client area. Labels are static text, buttons push, check or
// radio buttons, edits text with their content as value; TableAccessible adds
// the rows of a table as children.
//
// The component's peer makes the object on the first WM_GETOBJECT, keeps one
// reference while the window lives and disconnects it when the window or the
// component goes; a client still holding it then gets CO_E_OBJNOTCONNECTED.
//
// Children are numbered from 1; 0 (CHILDID_SELF) is the component itself. The
// protected hooks receive only ids that have been checked against childCount.
// IDispatch offers no type information: clients call the IAccessible methods.

#include <windows.h>
#include <oleacc.h>

#include <string>

namespace toolkit {

class cXComponent;

class ComponentAccessible : public IAccessible {
public:
  // Counts an object of this folder for as long as it lives: clients may hold one
  // after its widget has gone, and its code must stay loaded until they let it go.
  class Counted {
  public:
    Counted() noexcept;
    ~Counted();
    Counted(const Counted&) = delete;
    Counted& operator=(const Counted&) = delete;
  };
  // Objects alive: a module may unload only at 0.
  static LONG liveObjects() noexcept;

  // Starts with one reference, the caller's.
  explicit ComponentAccessible(cXComponent& component);
  ComponentAccessible(const ComponentAccessible&) = delete;
  ComponentAccessible& operator=(const ComponentAccessible&) = delete;

  // The component is gone: every later call answers CO_E_OBJNOTCONNECTED.
  void disconnect() { component_ = nullptr; }
  bool connected() const { return component_ != nullptr; }
  // The answer to WM_GETOBJECT: positive, or a negative error when oleacc is missing
  // or refuses. oleacc.dll is loaded by the first request, not with the library.
  LRESULT toLresult(WPARAM wParam);

  // IUnknown
  HRESULT STDMETHODCALLTYPE QueryInterface(REFIID iid, void** object) override;
  ULONG STDMETHODCALLTYPE AddRef() override;
  ULONG STDMETHODCALLTYPE Release() override;

  // IDispatch
  HRESULT STDMETHODCALLTYPE GetTypeInfoCount(UINT* count) override;
  HRESULT STDMETHODCALLTYPE GetTypeInfo(UINT index, LCID locale, ITypeInfo** info) override;
  HRESULT STDMETHODCALLTYPE GetIDsOfNames(REFIID iid, LPOLESTR* names, UINT count, LCID locale,
                                          DISPID* ids) override;
  HRESULT STDMETHODCALLTYPE Invoke(DISPID id, REFIID iid, LCID locale, WORD flags, DISPPARAMS* params,
                                   VARIANT* result, EXCEPINFO* exception, UINT* argumentError) override;

  // IAccessible
  HRESULT STDMETHODCALLTYPE get_accParent(IDispatch** parent) override;
  HRESULT STDMETHODCALLTYPE get_accChildCount(LONG* count) override;
  HRESULT STDMETHODCALLTYPE get_accChild(VARIANT child, IDispatch** object) override;
  HRESULT STDMETHODCALLTYPE get_accName(VARIANT child, BSTR* name) override;
  HRESULT STDMETHODCALLTYPE get_accValue(VARIANT child, BSTR* value) override;
  HRESULT STDMETHODCALLTYPE get_accDescription(VARIANT child, BSTR* description) override;
  HRESULT STDMETHODCALLTYPE get_accRole(VARIANT child, VARIANT* role) override;
  HRESULT STDMETHODCALLTYPE get_accState(VARIANT child, VARIANT* state) override;
  HRESULT STDMETHODCALLTYPE get_accHelp(VARIANT child, BSTR* help) override;
  HRESULT STDMETHODCALLTYPE get_accHelpTopic(BSTR* helpFile, VARIANT child, LONG* topic) override;
  HRESULT STDMETHODCALLTYPE get_accKeyboardShortcut(VARIANT child, BSTR* shortcut) override;
  HRESULT STDMETHODCALLTYPE get_accFocus(VARIANT* child) override;
  HRESULT STDMETHODCALLTYPE get_accSelection(VARIANT* children) override;
  HRESULT STDMETHODCALLTYPE get_accDefaultAction(VARIANT child, BSTR* action) override;
  HRESULT STDMETHODCALLTYPE accSelect(LONG flags, VARIANT child) override;
  HRESULT STDMETHODCALLTYPE accLocation(LONG* left, LONG* top, LONG* width, LONG* height,
                                        VARIANT child) override;
  HRESULT STDMETHODCALLTYPE accNavigate(LONG direction, VARIANT start, VARIANT* end) override;
  HRESULT STDMETHODCALLTYPE accHitTest(LONG x, LONG y, VARIANT* child) override;
  HRESULT STDMETHODCALLTYPE accDoDefaultAction(VARIANT child) override;
  HRESULT STDMETHODCALLTYPE put_accName(VARIANT child, BSTR name) override;
  HRESULT STDMETHODCALLTYPE put_accValue(VARIANT child, BSTR value) override;

protected:
  virtual ~ComponentAccessible();

  cXComponent& component() const { return *component_; }

  virtual LONG childCount() const;
  virtual std::string nameOf(LONG child) const;          // empty: no name
  // The name as clients read it: nameOf's ANSI text widened, unless a component keeps
  // texts in UTF-16 and answers them as they are.
  virtual std::wstring wideNameOf(LONG child) const;
  // The value as clients read it, likewise: valueOf's text widened unless overridden.
  virtual bool wideValueOf(LONG child, std::wstring& value) const;
  virtual bool valueOf(LONG child, std::string& value) const;  // false: no value
  virtual LONG roleOf(LONG child) const;
  virtual LONG stateOf(LONG child) const;
  virtual RECT screenRectOf(LONG child) const;
  virtual LONG childAt(POINT client) const;              // CHILDID_SELF when none is there
  // The focused child, CHILDID_SELF, or -1 when the focus is elsewhere.
  virtual LONG focusedChild() const;
  // VT_EMPTY when nothing is selected, VT_I4 for one child, VT_UNKNOWN (an
  // IEnumVARIANT) for several.
  virtual HRESULT selectionOf(VARIANT& selection) const;
  virtual HRESULT select(LONG flags, LONG child);
  virtual LONG neighbour(LONG child, LONG direction) const;  // 0: none

  // The states every window shares: invisible, unavailable, focused.
  LONG windowState() const;
  bool hasFocus() const;

private:
  // Runs `answer` for a checked child id; COM errors instead of exceptions.
  template <typename Answer>
  HRESULT forChild(const VARIANT& child, Answer&& answer);
  static HRESULT textAnswer(const std::string& text, BSTR* out, HRESULT whenEmpty);
  static HRESULT textAnswer(const std::wstring& text, BSTR* out, HRESULT whenEmpty);

  Counted counted_;
  cXComponent* component_;
  LONG references_ = 1;
};

}  // namespace toolkit
