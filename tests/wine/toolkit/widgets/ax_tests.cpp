// AXComponent hosting a control through atl.dll's "AtlAxWin" window. The control
// is a small test class registered in this process only.
#include <doctest/doctest.h>

#include <ole2.h>

#include "tests/wine/common/widget_test_support.h"
#include "toolkit/widgets/AXComponent.h"

using namespace toolkit;
using namespace wtest;

namespace {

// {6A1C7E52-3B9D-4C8E-9F41-2D5B7A0C9E13}
const CLSID kTestControl = {0x6a1c7e52, 0x3b9d, 0x4c8e, {0x9f, 0x41, 0x2d, 0x5b, 0x7a, 0x0c, 0x9e, 0x13}};

// Records what its host asks of it.
class TestControl : public IOleObject {
public:
  LONG refs = 1;
  IOleClientSite* site = nullptr;
  HWND activatedIn = nullptr;
  LONG verb = 0;
  static int alive;

  TestControl() { ++alive; }
  virtual ~TestControl() { --alive; }

  HRESULT STDMETHODCALLTYPE QueryInterface(REFIID iid, void** out) override {
    if (!out) return E_POINTER;
    if (iid == IID_IUnknown || iid == IID_IOleObject) {
      *out = static_cast<IOleObject*>(this);
      AddRef();
      return S_OK;
    }
    *out = nullptr;
    return E_NOINTERFACE;
  }
  ULONG STDMETHODCALLTYPE AddRef() override { return static_cast<ULONG>(InterlockedIncrement(&refs)); }
  ULONG STDMETHODCALLTYPE Release() override {
    const LONG left = InterlockedDecrement(&refs);
    if (left == 0) delete this;
    return static_cast<ULONG>(left);
  }
  HRESULT STDMETHODCALLTYPE SetClientSite(IOleClientSite* clientSite) override {
    if (clientSite) clientSite->AddRef();
    if (site) site->Release();
    site = clientSite;
    return S_OK;
  }
  HRESULT STDMETHODCALLTYPE GetClientSite(IOleClientSite** out) override {
    *out = site;
    if (site) site->AddRef();
    return S_OK;
  }
  HRESULT STDMETHODCALLTYPE SetHostNames(LPCOLESTR, LPCOLESTR) override { return S_OK; }
  HRESULT STDMETHODCALLTYPE Close(DWORD) override { return S_OK; }
  HRESULT STDMETHODCALLTYPE SetMoniker(DWORD, IMoniker*) override { return E_NOTIMPL; }
  HRESULT STDMETHODCALLTYPE GetMoniker(DWORD, DWORD, IMoniker**) override { return E_NOTIMPL; }
  HRESULT STDMETHODCALLTYPE InitFromData(IDataObject*, BOOL, DWORD) override { return E_NOTIMPL; }
  HRESULT STDMETHODCALLTYPE GetClipboardData(DWORD, IDataObject**) override { return E_NOTIMPL; }
  HRESULT STDMETHODCALLTYPE DoVerb(LONG v, LPMSG, IOleClientSite*, LONG, HWND parent, LPCRECT) override {
    verb = v;
    activatedIn = parent;
    return S_OK;
  }
  HRESULT STDMETHODCALLTYPE EnumVerbs(IEnumOLEVERB**) override { return E_NOTIMPL; }
  HRESULT STDMETHODCALLTYPE Update() override { return S_OK; }
  HRESULT STDMETHODCALLTYPE IsUpToDate() override { return S_OK; }
  HRESULT STDMETHODCALLTYPE GetUserClassID(CLSID* id) override {
    *id = kTestControl;
    return S_OK;
  }
  HRESULT STDMETHODCALLTYPE GetUserType(DWORD, LPOLESTR*) override { return E_NOTIMPL; }
  HRESULT STDMETHODCALLTYPE SetExtent(DWORD, SIZEL*) override { return S_OK; }
  HRESULT STDMETHODCALLTYPE GetExtent(DWORD, SIZEL*) override { return E_NOTIMPL; }
  HRESULT STDMETHODCALLTYPE Advise(IAdviseSink*, DWORD*) override { return E_NOTIMPL; }
  HRESULT STDMETHODCALLTYPE Unadvise(DWORD) override { return E_NOTIMPL; }
  HRESULT STDMETHODCALLTYPE EnumAdvise(IEnumSTATDATA**) override { return E_NOTIMPL; }
  HRESULT STDMETHODCALLTYPE GetMiscStatus(DWORD, DWORD* status) override {
    *status = 0;
    return S_OK;
  }
  HRESULT STDMETHODCALLTYPE SetColorScheme(LOGPALETTE*) override { return E_NOTIMPL; }
};
int TestControl::alive = 0;

TestControl* g_lastMade = nullptr;

class TestFactory : public IClassFactory {
public:
  HRESULT STDMETHODCALLTYPE QueryInterface(REFIID iid, void** out) override {
    if (iid == IID_IUnknown || iid == IID_IClassFactory) {
      *out = static_cast<IClassFactory*>(this);
      return S_OK;
    }
    *out = nullptr;
    return E_NOINTERFACE;
  }
  ULONG STDMETHODCALLTYPE AddRef() override { return 2; }
  ULONG STDMETHODCALLTYPE Release() override { return 1; }
  HRESULT STDMETHODCALLTYPE CreateInstance(IUnknown* outer, REFIID iid, void** out) override {
    if (outer) return CLASS_E_NOAGGREGATION;
    auto* control = new TestControl;
    g_lastMade = control;
    const HRESULT hr = control->QueryInterface(iid, out);
    control->Release();
    return hr;
  }
  HRESULT STDMETHODCALLTYPE LockServer(BOOL) override { return S_OK; }
};

// COM for this thread and the test class, for the life of one test.
struct Registered {
  TestFactory factory;
  DWORD cookie = 0;
  Registered() {
    OleInitialize(nullptr);
    CoRegisterClassObject(kTestControl, &factory, CLSCTX_INPROC_SERVER, REGCLS_MULTIPLEUSE, &cookie);
  }
  ~Registered() {
    CoRevokeClassObject(cookie);
    OleUninitialize();
  }
};

}  // namespace

TEST_CASE("an AXComponent hosts a control by class id in the platform's hosting window, again in a new window") {
  Registered registered;
  REQUIRE(AXComponent::hostingAvailable());
  MountedPanel panel;
  g_lastMade = nullptr;
  {
    AXComponent ax;
    panel.add(&ax);
    CHECK_FALSE(ax.create(CLSID{0x11111111, 0x2222, 0x3333, {4, 4, 4, 4, 4, 4, 4, 4}}));  // nobody serves it
    void* none = reinterpret_cast<void*>(1);
    CHECK(ax.getControl(IID_IUnknown, &none) == E_FAIL);
    CHECK(none == nullptr);

    REQUIRE(ax.create(kTestControl));
    REQUIRE(g_lastMade);
    TestControl* control = g_lastMade;
    HWND hostWindow = ax.hostWindow();
    REQUIRE(hostWindow);
    CHECK(windowClass(hostWindow) == AXComponent::kHostClass);
    CHECK(GetParent(hostWindow) == ax.getHandle());
    CHECK(control->site != nullptr);
    CHECK(control->verb == OLEIVERB_INPLACEACTIVATE);
    CHECK(control->activatedIn == hostWindow);
    IOleObject* object = nullptr;
    REQUIRE(ax.getControl(IID_IOleObject, reinterpret_cast<void**>(&object)) == S_OK);
    CHECK(object == static_cast<IOleObject*>(control));
    object->Release();

    ax.destroyWindow();  // the control goes with the window ...
    CHECK(TestControl::alive == 1);  // ... but the component still holds it
    REQUIRE(ax.create(panel.getHandle()));  // ... and comes back with a new one
    CHECK(ax.isHosting());
    CHECK(ax.hostWindow() != nullptr);
    CHECK(TestControl::alive == 1);
    panel.removeComponent(&ax, false);
  }
  CHECK(TestControl::alive == 0);  // the host window let it go with the component
}
