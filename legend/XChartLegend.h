// XChartLegend: the legend of one chart dataset at one position (units, datums, dates,
// edition, scale, projection, quality, magnetic variation, producing agency). Windowless:
// SetLegendData fills the record and always answers S_OK (failures are reported through
// the error reporter and leave the defaults); the seventeen properties only read it.
//
// What is kept between calls: the header and parameter values of the last dataset, keyed
// by its identity, edition and update number, and its meta object list. What is looked up
// on every call: everything that depends on the position (magnetic variation, the two
// qualities and the datums the meta objects give).
#pragma once

#include "frame/com/DispatchObject.h"
#include "frame/errors/cErrReporter.h"
#include "frame/geo/AgencyTable.h"
#include "legend/record/legend_record.h"

#include "BR_Info.h"
#include "GeoData.h"

#include <vector>

namespace br::legend {

class XChartLegend final : public br::com::DispatchObject<XChartLegend, IXChartLegend> {
public:
  static const br::com::ClassIdentity kClass;
  static const Entry kInterfaces[];

  XChartLegend();
  ~XChartLegend() override;

  // IXChartLegend
  STDMETHODIMP SetLegendData(IUnknown* dataSet, IUnknown* projection, long latitude, long longitude) override;
  STDMETHODIMP get_DepthUnits(BSTR* value) override;
  STDMETHODIMP get_HeightUnits(BSTR* value) override;
  STDMETHODIMP get_SoundingDatum(BSTR* value) override;
  STDMETHODIMP get_VerticalDatum(BSTR* value) override;
  STDMETHODIMP get_HorizontalDatum(BSTR* value) override;
  STDMETHODIMP get_EditionDate(DATE* value) override;
  STDMETHODIMP get_UpdateDate(DATE* value) override;
  STDMETHODIMP get_EditionNumber(long* value) override;
  STDMETHODIMP get_UpdateNumber(long* value) override;
  STDMETHODIMP get_SourceIDCode(BSTR* value) override;
  STDMETHODIMP get_BathymetricQuality(BSTR* value) override;
  STDMETHODIMP get_NonBathymetricQuality(double* value) override;
  STDMETHODIMP get_DefaultScale(long* value) override;
  STDMETHODIMP get_Projection(BSTR* value) override;
  STDMETHODIMP get_MagneticVariation(double* value) override;
  STDMETHODIMP get_SourceProducingAgency(BSTR* value) override;

private:
  void Reset();
  void Fill(IUnknown* dataSet, IUnknown* projection, long latitude, long longitude);
  void FillVector(IGeoDataSet* dataSet, IGeoProjection* projection, long latitude, long longitude);
  // False when the header shows the dataset of the last fill (nothing was read anew).
  bool FillHeader(IGeoDataSet* dataSet);
  void FillParameters(IGeoDataSet* dataSet, IGeoCatalog* catalogue);
  // The position's part of one call: what the hit tests need and what they found so far.
  struct PositionLookup;
  // Lists the meta objects; each one is also looked up for the position as it comes, so a
  // fresh list costs no second fetch of every object.
  void ReadMetaObjects(IGeoDataSet* dataSet, PositionLookup& lookup);
  // Clears the position's fields; false when no hit test can run (no geodesy library, no
  // pixel for the position).
  bool BeginPosition(IGeoProjection* projection, IGeoCatalog* catalogue, long latitude, long longitude,
                     PositionLookup& lookup);
  void LookUpObject(IGeoObject* object, long classCode, PositionLookup& lookup);
  bool Wanted(long classCode, const PositionLookup& lookup) const;
  void FillRaster(IGeoRasterDataSet* raster);

  static HRESULT ReadText(const std::string& text, BSTR* value);
  static HRESULT ReadDate(const CalendarDate& date, DATE* value);

  br::cErrReporter reporter_;
  br::geo::AgencyTable agencies_;
  LegendRecord record_;
  CacheKey key_;
  // The datums the parameters gave: each position lookup starts again from them.
  std::string parameterSoundingDatum_;
  std::string parameterVerticalDatum_;
  // The meta objects of the dataset, with their class codes (0 when the host gave none):
  // a position lookup skips the objects whose class can add nothing more.
  struct MetaObject {
    GUID id;
    long classCode;
  };
  std::vector<MetaObject> metaObjects_;
  bool busy_ = false;              // a fill is running (a report's box may call us back)
  bool selectionFailed_ = false;   // this attempt's selection step failed
};

}  // namespace br::legend
