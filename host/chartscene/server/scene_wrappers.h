#pragma once
// The stand-in host's wrappers over a loaded scene, each made with one reference for the
// caller. A dataset comes as IGeoDataSet (vector and library datasets; libraries also
// answer IGeoLibraryDataSet) or, for a raster dataset, as IGeoRasterDataSet only.

#include <windows.h>

#include <vector>

#include "GeoData.h"
#include "host/chartscene/server/SceneState.h"

#define CHARTSCENE_RESERVED(n) \
  STDMETHODIMP Reserved##n() override { return E_NOTIMPL; }

// Counts the call and returns the fault injected for it, if any (a wrapper's scene_).
#define SCENE_CALL(operation)                      \
  do {                                             \
    const HRESULT fault_ = scene_->Call(operation); \
    if (fault_ != S_OK) return fault_;             \
  } while (false)

namespace br::chartscene {

IGeoDatabase* NewDatabase(const SceneRef& scene, std::size_t database);
IUnknown* NewDataSet(const SceneRef& scene, std::size_t dataSet);
IGeoObject* NewObject(const SceneRef& scene, std::size_t object);
IGeoAttribute* NewAttribute(const SceneRef& scene, std::size_t object, std::size_t attribute);
// Attributes (attributes of the object) or objects (the listed indices), one per Next.
IGeoObjectEnum* NewAttributeEnum(const SceneRef& scene, std::size_t object);
IGeoObjectEnum* NewObjectEnum(const SceneRef& scene, std::vector<std::size_t> objects);
IGeoSelectionEnum* NewSelectionEnum(const SceneRef& scene, std::size_t dataSet);
IGeoProjection* NewProjection(const SceneRef& scene, std::size_t projection);
IPresParams* NewPresParams(const SceneRef& scene, std::size_t params);
IColorMap* NewColorMap(const SceneRef& scene, std::size_t map);

// GUIDs from and to the model's 16 identity bytes.
GUID GuidOf(const std::array<unsigned char, 16>& bytes);
const unsigned char* BytesOf(REFGUID guid);

// A text of the catalogue into a host buffer: at most size - 1 bytes and a terminator.
// S_OK when it all fit, S_FALSE when it was cut, E_INVALIDARG without a buffer.
HRESULT CopyCatalogueText(const std::string& text, long size, char* buffer);

}  // namespace br::chartscene
