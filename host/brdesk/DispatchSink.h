// An events sink for one outgoing dispatch interface: every call goes to a handler.
#pragma once

#include <windows.h>
#include <ocidl.h>

#include <functional>

namespace br::brdesk {

class DispatchSink final : public IDispatch {
public:
  using Handler = std::function<void(DISPID, const DISPPARAMS&)>;

  DispatchSink(const IID& events, Handler handler) : events_(events), handler_(std::move(handler)) {}
  ~DispatchSink() { Disconnect(); }

  bool Connect(IUnknown* source);
  void Disconnect();

  STDMETHODIMP QueryInterface(REFIID riid, void** out) override;
  STDMETHODIMP_(ULONG) AddRef() override { return ++refs_; }
  STDMETHODIMP_(ULONG) Release() override { return --refs_; }  // owned by the desk
  STDMETHODIMP GetTypeInfoCount(UINT* count) override;
  STDMETHODIMP GetTypeInfo(UINT, LCID, ITypeInfo**) override { return E_NOTIMPL; }
  STDMETHODIMP GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) override { return E_NOTIMPL; }
  STDMETHODIMP Invoke(DISPID id, REFIID, LCID, WORD, DISPPARAMS* params, VARIANT*, EXCEPINFO*, UINT*) override;

private:
  const IID& events_;
  Handler handler_;
  ULONG refs_ = 0;
  IConnectionPoint* point_ = nullptr;
  DWORD cookie_ = 0;
};

}  // namespace br::brdesk
