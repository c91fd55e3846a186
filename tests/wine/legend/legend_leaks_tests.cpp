// XChartLegend's heap over 10 000 SetLegendData calls: cache misses and hits of the vector
// dataset at moving positions, the raster dataset, resets and objects of the wrong kind.
#include "tests/wine/common/DllUnderTest.h"
#include "tests/wine/common/SceneClient.h"
#include "tests/wine/common/SceneProbe.h"
#include "tests/wine/common/leak_counters.h"

#include "BR_Info.h"

#include <doctest/doctest.h>

#include <cmath>
#include <cstdio>

using namespace br::test;

namespace {

long Unit(double degrees) { return static_cast<long>(std::lround(degrees * 1e7)); }

}  // namespace

TEST_CASE("10 000 SetLegendData calls leave the heaps and the host's wrappers flat") {
  SceneProbe probe;
  DllUnderTest dll;
  {
    SceneClient scene;
    REQUIRE(scene.Load(SceneClient::SamplePath()) == S_OK);
    auto vector = scene.Component(L"DataSet", L"FR5BR010");
    auto raster = scene.Component(L"DataSet", L"FR3BR001");
    auto projection = scene.Component(L"Projection", L"chart");
    ComRef<IXChartLegend> legend;
    REQUIRE(dll.Create(CLSID_XChartLegend, IID_IXChartLegend, legend.OutVoid()) == S_OK);
    const auto work = [&](int i) {
      const long la = Unit(48.30 + 0.001 * (i % 100)), fi = Unit(-4.60 + 0.001 * (i % 97));
      switch (i % 5) {
        case 0: legend->SetLegendData(nullptr, nullptr, 0, 0); [[fallthrough]];  // then a miss
        case 1:
        case 2: CHECK(legend->SetLegendData(vector.Get(), projection.Get(), la, fi) == S_OK); break;
        case 3: CHECK(legend->SetLegendData(raster.Get(), projection.Get(), la, fi) == S_OK); break;
        default: CHECK(legend->SetLegendData(projection.Get(), projection.Get(), la, fi) == S_OK); break;
      }
      BSTR text = nullptr;
      legend->get_SourceProducingAgency(&text);
      SysFreeString(text);
      double variation = 0;
      legend->get_MagneticVariation(&variation);
    };
    for (int i = 0; i < 200; ++i) work(i);
    const long objects = probe.Counter("live.Object");
    const std::size_t before = HeapBytesInUse();
    for (int i = 0; i < 10000; ++i) work(i);
    const std::size_t after = HeapBytesInUse();
    std::printf("heap in use: %zu bytes before, %zu after 10000 SetLegendData calls\n", before, after);
    CHECK(after <= before + 8192);
    CHECK(probe.Counter("live.Object") == objects);
    CHECK(probe.Counter("selections.open") == 0);
  }
  CHECK(dll.CanUnloadNow() == S_OK);
}
