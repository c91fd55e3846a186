#include "host/chartscene/server/SceneProjection.h"

#include "host/chartscene/server/scene_misanswer_values.h"

#include "host/chartscene/model/scene_geometry.h"

namespace br::chartscene {

SceneProjection::SceneProjection(SceneRef scene, std::size_t index)
    : ComObject<IGeoProjection>("Projection"), scene_(std::move(scene)), index_(index) {}

IGeoProjection* NewProjection(const SceneRef& scene, std::size_t projection) {
  return new SceneProjection(scene, projection);
}

STDMETHODIMP SceneProjection::GeoToPixel(const GEO_POINT* geo, POINT* pixels, long count) {
  SCENE_CALL("IGeoProjection.GeoToPixel");
  SCENE_MISANSWER_NULL("IGeoProjection.GeoToPixel");
  if (geo == nullptr || pixels == nullptr) return E_POINTER;
  if (count < 0) return E_INVALIDARG;
  const SceneProjectionModel& projection = scene_->Model().projections[index_];
  for (long i = 0; i < count; ++i) {
    const PixelPoint pixel = ProjectToPixel(projection, geo[i].La * 1e-7, geo[i].Fi * 1e-7);
    pixels[i].x = pixel.x;
    pixels[i].y = pixel.y;
  }
  return S_OK;
}

}  // namespace br::chartscene
