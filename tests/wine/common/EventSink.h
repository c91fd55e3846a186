// A test sink for an events dispinterface: counts the calls, keeps the last call's id and
// arguments, and can run an action from inside a call.
#pragma once

#include "frame/com/ComRef.h"

#include <windows.h>
#include <oaidl.h>
#include <ocidl.h>

#include <functional>
#include <string>
#include <vector>

namespace br::test {

class EventSink final : public IDispatch {
public:
  explicit EventSink(const IID& events) : events_(events) {}

  bool Connect(IUnknown* source);
  void Disconnect();

  int calls = 0;
  DISPID lastId = 0;
  LCID lastLocale = 0;
  WORD lastFlags = 0;
  bool lastIidNull = false;
  std::vector<double> lastDoubles;  // VT_R8 arguments of the last call, in call order
  UINT lastArgumentCount = 0;
  // Of every call: the type of its first argument and, when recordPortNames is set, the
  // name of the port it is (empty when it is none).
  std::vector<VARTYPE> argumentTypes;
  bool recordPortNames = false;
  std::vector<std::wstring> portNames;
  std::function<void()> onCall;     // runs inside Invoke, after counting

  STDMETHODIMP QueryInterface(REFIID riid, void** out) override;
  STDMETHODIMP_(ULONG) AddRef() override { return ++refs_; }
  STDMETHODIMP_(ULONG) Release() override { return --refs_; }  // lives on the test's stack
  STDMETHODIMP GetTypeInfoCount(UINT* count) override { return count ? (*count = 0, S_OK) : S_OK; }
  STDMETHODIMP GetTypeInfo(UINT, LCID, ITypeInfo** out) override { return out ? (*out = nullptr, E_NOTIMPL) : E_NOTIMPL; }
  STDMETHODIMP GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) override { return E_NOTIMPL; }
  STDMETHODIMP Invoke(DISPID id, REFIID riid, LCID locale, WORD flags, DISPPARAMS* params, VARIANT* result,
                      EXCEPINFO*, UINT*) override;

  ULONG References() const { return refs_; }

private:
  const IID& events_;
  ULONG refs_ = 0;
  br::com::ComRef<IConnectionPoint> point_;
  DWORD cookie_ = 0;
};

// The name of a port given as any of its interfaces (empty when it is no port).
std::wstring PortName(IUnknown* port);

}  // namespace br::test
