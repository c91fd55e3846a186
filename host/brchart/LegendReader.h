// The legend fields at a chart position, from BR_Info's XChartLegend over the chart's
// dataset and projection as the chart host hands them out: what the status line shows
// under the pointer.
#pragma once

#include <windows.h>

#include <string>

#include "BR_Info.h"
#include "host/brchart/SceneClient.h"

namespace br::brchart {

class LegendReader {
public:
  LegendReader() = default;
  ~LegendReader();
  LegendReader(const LegendReader&) = delete;
  LegendReader& operator=(const LegendReader&) = delete;

  // Makes the legend object over the host's dataset of that id; false with a message.
  bool Open(SceneClient& host, const std::string& dataSetId, std::string& error);
  bool IsOpen() const { return legend_ != nullptr; }

  // "1:22000, depths Meters, soundings Lowest astronomical tide, WGS 84, zone of confidence
  // A2, variation 0.8°W" at
  // that position (UTF-8); "" when the legend is not open.
  std::string At(double lat, double lon);

private:
  IXChartLegend* legend_ = nullptr;
  IUnknown* dataSet_ = nullptr;
  IUnknown* projection_ = nullptr;
};

}  // namespace br::brchart
