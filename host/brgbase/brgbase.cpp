// Stand-in of the maker's geodesy library BRGBASE.dll, for tests and demos: datum names
// from the public S-57 list (the HORDAT enumeration of gdal-data's s57expectedinput.csv,
// turned into hordat_names.inc at build time), the normalised angle unit 1e-7 degree, and
// a map-metrics block that the stand-in chart host's hit test checks.
#include <windows.h>

#include <cstring>

#include "GeoData.h"
#include "host/brgbase/map_metrics.h"

namespace {

struct DatumName {
  long code;
  const char* name;
};

const DatumName kDatumNames[] = {
#include "hordat_names.inc"
};

}  // namespace

// The datum's name into buffer (terminated, cut to size - 1); its whole length, 0 when
// the code is not in the list.
extern "C" long WINAPI GetGeodeticDatumTypeName(long code, char* buffer, long size) {
  const char* name = "";
  for (const DatumName& row : kDatumNames) {
    if (row.code == code) name = row.name;
  }
  const long length = static_cast<long>(std::strlen(name));
  if (buffer != nullptr && size > 0) {
    const long copied = length < size ? length : size - 1;
    std::memcpy(buffer, name, static_cast<std::size_t>(copied));
    buffer[copied] = '\0';
  }
  return length;
}

extern "C" double WINAPI nrm2deg(long normalised) { return normalised * 1e-7; }

extern "C" void WINAPI TMapMetrics__init(GEO_MAP_METRICS* block, long flags) {
  if (block == nullptr) return;
  std::memset(block, 0, sizeof(*block));
  const br::brgbase::MapMetricsView view{br::brgbase::kMapMetricsMark, static_cast<std::int32_t>(flags)};
  std::memcpy(block->Data, &view, sizeof(view));
}

extern "C" void WINAPI TMapMetrics__clear(GEO_MAP_METRICS* block) {
  if (block != nullptr) std::memset(block, 0, sizeof(*block));
}
