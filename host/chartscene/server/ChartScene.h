#pragma once
// The scriptable ChartScene object ("ChartScene.Scene"): loads a scene file and hands out
// what it holds (see ChartScene.idl). Objects it hands out keep the scene alive on their
// own; the owners named in object records are kept by this object until the next Load.

#include <windows.h>
#include <oaidl.h>

#include <string>
#include <vector>

#include <wrl/client.h>

#include "ChartScene_h.h"
#include "host/chartscene/server/ComObject.h"
#include "host/chartscene/server/SceneState.h"

namespace br::chartscene {

class ChartScene final : public ComObject<IChartScene, ISupportErrorInfo> {
public:
  static HRESULT Create(IUnknown** object);

  // IDispatch, through the type library in chartscene.dll
  STDMETHODIMP GetTypeInfoCount(UINT* count) override;
  STDMETHODIMP GetTypeInfo(UINT index, LCID, ITypeInfo** info) override;
  STDMETHODIMP GetIDsOfNames(REFIID iid, LPOLESTR* names, UINT count, LCID, DISPID* ids) override;
  STDMETHODIMP Invoke(DISPID id, REFIID iid, LCID, WORD flags, DISPPARAMS* params, VARIANT* result,
                      EXCEPINFO* exception, UINT* argumentError) override;

  // IChartScene
  STDMETHODIMP Load(BSTR path) override;
  STDMETHODIMP get_LastError(BSTR* text) override;
  STDMETHODIMP Database(BSTR name, IUnknown** database) override;
  STDMETHODIMP DataSet(BSTR id, IUnknown** dataSet) override;
  STDMETHODIMP Object(BSTR name, IUnknown** object) override;
  STDMETHODIMP Projection(BSTR name, IUnknown** projection) override;
  STDMETHODIMP PresParams(BSTR name, IUnknown** params) override;
  STDMETHODIMP ColorMap(BSTR name, IUnknown** map) override;
  STDMETHODIMP Palette(BSTR name, long* handle) override;
  STDMETHODIMP ObjectRecords(BSTR names, VARIANT* records) override;
  STDMETHODIMP Counter(BSTR name, long* value) override;
  STDMETHODIMP SetFault(BSTR operation, long result) override;
  STDMETHODIMP ClearFaults() override;
  STDMETHODIMP HeaderText(IUnknown* dataSet, BSTR* text) override;
  STDMETHODIMP AttributeText(IUnknown* object, BSTR* text) override;
  STDMETHODIMP FormatterOption(long id, BSTR* text) override;
  STDMETHODIMP ObjectId(IUnknown* object, BSTR* guid) override;

  // ISupportErrorInfo
  STDMETHODIMP InterfaceSupportsErrorInfo(REFIID iid) override;

protected:
  // IDispatch is the dual interface's base.
  void* QueryExtra(REFIID iid) override;

private:
  ChartScene();

  HRESULT TypeInfo(ITypeInfo** info);
  // Fails with hr and a description for the client.
  HRESULT Fail(HRESULT hr, const std::wstring& description);
  // The index of a named entry of the loaded scene; SIZE_MAX (and a failure description)
  // when there is no such entry.
  template <typename List>
  std::size_t Named(const List& list, BSTR name, const wchar_t* what);

  SceneRef scene_;
  std::wstring lastError_;
  Microsoft::WRL::ComPtr<ITypeInfo> typeInfo_;
  std::vector<Microsoft::WRL::ComPtr<IUnknown>> owners_;  // of the records handed out
};

}  // namespace br::chartscene
