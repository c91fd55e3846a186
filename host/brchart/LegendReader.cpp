#include "host/brchart/LegendReader.h"

#include <oleauto.h>

#include <cfloat>
#include <cmath>
#include <cstdio>

namespace br::brchart {

namespace {

std::string Utf8(BSTR text) {
  if (!text) return "";
  const int n = WideCharToMultiByte(CP_UTF8, 0, text, -1, nullptr, 0, nullptr, nullptr);
  std::string out(n > 0 ? n - 1 : 0, '\0');
  if (n > 1) WideCharToMultiByte(CP_UTF8, 0, text, -1, &out[0], n, nullptr, nullptr);
  return out;
}

// A text property: read, converted and freed; "" on failure.
template <typename Getter>
std::string TextOf(Getter get) {
  BSTR text = nullptr;
  std::string out;
  if (SUCCEEDED(get(&text))) out = Utf8(text);
  SysFreeString(text);
  return out;
}

}  // namespace

LegendReader::~LegendReader() {
  if (legend_) legend_->Release();
  if (dataSet_) dataSet_->Release();
  if (projection_) projection_->Release();
}

bool LegendReader::Open(SceneClient& host, const std::string& dataSetId, std::string& error) {
  dataSet_ = host.DataSet(dataSetId);
  projection_ = host.ProjectionObject();
  if (!dataSet_ || !projection_) {
    error = "no legend: the chart host has no dataset " + dataSetId;
    return false;
  }
  CLSID id{};
  if (FAILED(CLSIDFromProgID(L"BR_Info.XChartLegend", &id)) ||
      FAILED(CoCreateInstance(id, nullptr, CLSCTX_INPROC_SERVER, IID_IXChartLegend, reinterpret_cast<void**>(&legend_)))) {
    error = "no legend: BR_Info.XChartLegend cannot be made";
    return false;
  }
  return true;
}

std::string LegendReader::At(double lat, double lon) {
  if (!legend_) return "";
  const long la = static_cast<long>(std::lround(lat * 1e7)), fi = static_cast<long>(std::lround(lon * 1e7));
  if (FAILED(legend_->SetLegendData(dataSet_, projection_, la, fi))) return "";
  std::string text;
  long scale = 0;
  if (SUCCEEDED(legend_->get_DefaultScale(&scale)) && scale > 0) text = "1:" + std::to_string(scale);
  const auto add = [&text](const std::string& label, const std::string& value) {
    if (value.empty()) return;
    if (!text.empty()) text += ", ";
    text += label + value;
  };
  add("depths ", TextOf([&](BSTR* t) { return legend_->get_DepthUnits(t); }));
  add("soundings ", TextOf([&](BSTR* t) { return legend_->get_SoundingDatum(t); }));
  add("", TextOf([&](BSTR* t) { return legend_->get_HorizontalDatum(t); }));
  add("", TextOf([&](BSTR* t) { return legend_->get_BathymetricQuality(t); }));
  double variation = DBL_MAX;
  if (legend_->get_MagneticVariation(&variation) == S_OK && variation != DBL_MAX && std::isfinite(variation)) {
    char v[48];
    std::snprintf(v, sizeof v, "%.1f\xC2\xB0%c", std::fabs(variation), variation < 0 ? 'W' : 'E');
    add("variation ", v);
  }
  return text;
}

}  // namespace br::brchart
