// A chart scene a test writes itself, loaded into the stand-in host (chartscene.dll,
// registered in the suite's prefix) through its scriptable class, late bound, so a suite
// needs no generated header of the stand-in. Objects, databases and datasets come back
// as the host hands them to BR_Info.
#pragma once

#include <windows.h>
#include <objbase.h>

#include <string>

#include <wrl/client.h>

#include "GeoData.h"

namespace br::test {

class ScratchScene {
public:
  // Writes the JSON to a temporary file and loads it (REQUIREs both). COM must be set up.
  explicit ScratchScene(const std::string& json);
  // The sample scene of the source tree (data/harbour/harbour.json, found through the
  // BR_SOURCE_DIR environment variable), loaded in place and left as it is.
  struct SampleHarbour {};
  explicit ScratchScene(SampleHarbour);
  ~ScratchScene();
  ScratchScene(const ScratchScene&) = delete;
  ScratchScene& operator=(const ScratchScene&) = delete;

  Microsoft::WRL::ComPtr<IGeoObject> Object(const wchar_t* name) const;
  Microsoft::WRL::ComPtr<IGeoDatabase> Database(const wchar_t* name) const;
  // A dataset by id, as the host's dataset entry (IGeoDataSet, IGeoLibraryDataSet, ...).
  Microsoft::WRL::ComPtr<IUnknown> DataSet(const wchar_t* id) const;
  // The identity of the dataset itself: first 8 bytes zero, the id padded with '.'.
  static GUID DataSetIdentity(const char* id);
  // The object's identity (GetId).
  static GUID IdOf(IGeoObject* object);
  // Object records of the named objects ("a, b, dataset:ID") as SetInfo takes them:
  // VT_ARRAY|VT_UI1 (REQUIREd); the caller clears it.
  VARIANT Records(const wchar_t* names) const;
  // The last value the host's object formatters were given for option `id` ("I4:2",
  // "BSTR:feet"), empty when none was.
  std::wstring FormatterOption(long id) const;

private:
  void Load(const std::wstring& file);
  Microsoft::WRL::ComPtr<IUnknown> Call(const wchar_t* method, const wchar_t* argument) const;
  // The method's answer as it is (VT_EMPTY when the call fails); the caller clears it.
  VARIANT CallValue(const wchar_t* method, const wchar_t* argument) const;

  Microsoft::WRL::ComPtr<IDispatch> scene_;
  std::wstring file_;
};

}  // namespace br::test
