// Ports for the list tests: a name and nothing else (the list reads only the
// name), counting references; and a select-changed sink that records the names
// of the ports it was given.
#pragma once

#include "BR_Info.h"
#include "tests/wine/common/not_a_port.h"

#include <functional>
#include <string>
#include <vector>

namespace br::test {

class NamedPort final : public ITidesPort {
public:
  explicit NamedPort(const wchar_t* name) : name_(name) {}
  ULONG References() const { return refs_; }

  STDMETHODIMP QueryInterface(REFIID riid, void** out) override;
  STDMETHODIMP_(ULONG) AddRef() override { return ++refs_; }
  STDMETHODIMP_(ULONG) Release() override { return --refs_; }
  STDMETHODIMP GetTypeInfoCount(UINT* count) override { *count = 0; return S_OK; }
  STDMETHODIMP GetTypeInfo(UINT, LCID, ITypeInfo**) override { return E_NOTIMPL; }
  STDMETHODIMP GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) override { return E_NOTIMPL; }
  STDMETHODIMP Invoke(DISPID, REFIID, LCID, WORD, DISPPARAMS*, VARIANT*, EXCEPINFO*, UINT*) override { return E_NOTIMPL; }
  STDMETHODIMP get_PortName(BSTR* name) override;
  STDMETHODIMP GetPortPos(double*, double*) override { return E_NOTIMPL; }
  STDMETHODIMP Calculate(double, double) override { return E_NOTIMPL; }
  STDMETHODIMP get_PredictionDate(double*) override { return E_NOTIMPL; }
  STDMETHODIMP get_NumPoints(LONG*) override { return E_NOTIMPL; }
  STDMETHODIMP get_WavePoint(LONG, double*) override { return E_NOTIMPL; }
  STDMETHODIMP get_MaxValueIndex(LONG*) override { return E_NOTIMPL; }
  STDMETHODIMP get_MinValueIndex(LONG*) override { return E_NOTIMPL; }
  STDMETHODIMP get_MaxValue(double*) override { return E_NOTIMPL; }
  STDMETHODIMP get_MinValue(double*) override { return E_NOTIMPL; }
  STDMETHODIMP get_Step(double*) override { return E_NOTIMPL; }
  STDMETHODIMP get_SunRise(double*) override { return E_NOTIMPL; }
  STDMETHODIMP get_SunSet(double*) override { return E_NOTIMPL; }
  STDMETHODIMP get_BeginTwilight(double*) override { return E_NOTIMPL; }
  STDMETHODIMP get_EndTwilight(double*) override { return E_NOTIMPL; }
  STDMETHODIMP get_TimeZone(LONG*) override { return E_NOTIMPL; }

private:
  std::wstring name_;
  ULONG refs_ = 0;
};

class SelectSink final : public IDispatch {
public:
  bool Connect(IUnknown* source);
  void Disconnect();

  std::vector<std::wstring> names;  // port names in call order
  std::vector<VARTYPE> types;       // argument types
  std::function<void()> onCall;

  STDMETHODIMP QueryInterface(REFIID riid, void** out) override;
  STDMETHODIMP_(ULONG) AddRef() override { return ++refs_; }
  STDMETHODIMP_(ULONG) Release() override { return --refs_; }
  STDMETHODIMP GetTypeInfoCount(UINT* count) override { *count = 0; return S_OK; }
  STDMETHODIMP GetTypeInfo(UINT, LCID, ITypeInfo**) override { return E_NOTIMPL; }
  STDMETHODIMP GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) override { return E_NOTIMPL; }
  STDMETHODIMP Invoke(DISPID id, REFIID, LCID, WORD, DISPPARAMS* params, VARIANT*, EXCEPINFO*, UINT*) override;

private:
  ULONG refs_ = 0;
  IConnectionPoint* point_ = nullptr;
  DWORD cookie_ = 0;
};

// The name of a port given as IUnknown (empty when it is no port).
std::wstring NameOf(IUnknown* port);

}  // namespace br::test
