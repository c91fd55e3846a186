#include "tides/objects/TidesPort.h"

#include "frame/com/bstr_text.h"
#include "tides/engine/prediction.h"
#include "tides/objects/platform_dates.h"

#include <cmath>
#include <new>

namespace br::tides {

const br::com::ClassIdentity TidesPort::kClass = {&CLSID_TidesPort, &IID_ITidesPort, &DIID__ITidesPortEvents,
                                                  L"TidesPort"};

const TidesPort::Entry TidesPort::kInterfaces[] = {
    {&IID_IUnknown, Self},
    {&IID_ITidesPort, Self},
    {&IID_IDispatch, Self},
    {&IID_IConnectionPointContainer, ConnectionPoints},
    {&IID_ISupportErrorInfo, ErrorInfo},
    {nullptr, nullptr},
};

namespace {
constexpr double kDegreesPerMinute = 0.016666666666666666;
constexpr double kPublishedPerInternal = 0.01;
constexpr DISPID kCalculatedEvent = 1;
}  // namespace

void TidesPort::Attach(const std::wstring& name, std::int16_t latitude, std::int16_t longitude) {
  name_ = name;
  latitude_ = latitude;
  longitude_ = longitude;
  points_.clear();
  initialised_ = true;
}

STDMETHODIMP TidesPort::get_PortName(BSTR* name) {
  if (!initialised_) return E_ACCESSDENIED;
  if (!name) return E_POINTER;
  return Guard([&] {
    *name = br::com::BstrFromWide(name_);
    return S_OK;
  });
}

STDMETHODIMP TidesPort::GetPortPos(double* latitude, double* longitude) {
  if (!initialised_) return E_ACCESSDENIED;
  if (!latitude || !longitude) return E_POINTER;
  *latitude = latitude_ * kDegreesPerMinute;
  *longitude = longitude_ * kDegreesPerMinute;
  return S_OK;
}

STDMETHODIMP TidesPort::Calculate(double step, double predictDate) {
  if (!initialised_) return E_ACCESSDENIED;
  predictionDate_ = std::trunc(predictDate);
  const HRESULT hr = Guard([&] { return Predict(step) ? S_OK : S_FALSE; });
  if (hr != S_OK) points_.clear();
  // A day that cannot be predicted still finishes the Calculate: sinks read NumPoints 0.
  FireEvent(kCalculatedEvent);
  return FAILED(hr) ? hr : S_OK;
}

bool TidesPort::Predict(double step) {
  CalendarDate date;
  if (!SplitDayCountDate(predictionDate_, date)) return false;
  const std::int32_t count = DaySampleCount(step);
  if (count < 1 || count > kMaxDayPoints) return false;
  points_.clear();
  points_.resize(static_cast<std::size_t>(count), 0.0f);  // may throw std::bad_alloc

  StationIndexRecord key;
  key.latitude = latitude_;
  key.longitude = longitude_;
  StationHeader header;
  SunDay sun;
  const DayPrediction day =
      PredictDay(key, header, date, step, points_.data(), points_.size(), sun, PlatformLocalMidnight());
  if (!day.stationFound) return false;
  step_ = step;
  timeZone_ = header.zone;

  const PublishedSunTimes times = PublishSunTimes(sun);
  const HourMinute& begin = times.events[kTwilightBegin];
  const HourMinute& rise = times.events[kSunrise];
  const HourMinute& set = times.events[kSunset];
  const HourMinute& end = times.events[kTwilightEnd];
  return ComposeDayCountDate(date, begin.hour, begin.minute, beginTwilight_) &&
         ComposeDayCountDate(date, rise.hour, rise.minute, sunRise_) &&
         ComposeDayCountDate(date, set.hour, set.minute, sunSet_) &&
         ComposeDayCountDate(date, end.hour, end.minute, endTwilight_);
}

HRESULT TidesPort::ReadDouble(double field, double* out) const noexcept {
  const HRESULT hr = CheckPointsAndOut(out);
  if (hr == S_OK) *out = field;
  return hr;
}

STDMETHODIMP TidesPort::get_PredictionDate(double* date) { return ReadDouble(predictionDate_, date); }

STDMETHODIMP TidesPort::get_NumPoints(long* count) {
  if (!initialised_) return E_ACCESSDENIED;
  if (!count) return E_POINTER;
  *count = static_cast<long>(points_.size());
  return S_OK;
}

STDMETHODIMP TidesPort::get_WavePoint(long index, double* value) {
  const HRESULT hr = CheckPointsAndOut(value);
  if (hr != S_OK) return hr;
  if (index < 0 || static_cast<unsigned long>(index) >= points_.size()) return E_INVALIDARG;
  *value = points_[static_cast<std::size_t>(index)] * kPublishedPerInternal;
  return S_OK;
}

long TidesPort::MaxIndex() const noexcept {
  long best = 0;
  for (std::size_t k = 1; k < points_.size(); ++k) {
    if (points_[k] > points_[static_cast<std::size_t>(best)]) best = static_cast<long>(k);
  }
  return best;
}

long TidesPort::MinIndex() const noexcept {
  long best = 0;
  for (std::size_t k = 1; k < points_.size(); ++k) {
    if (points_[k] < points_[static_cast<std::size_t>(best)]) best = static_cast<long>(k);
  }
  return best;
}

STDMETHODIMP TidesPort::get_MaxValueIndex(long* index) {
  const HRESULT hr = CheckPointsAndOut(index);
  if (hr == S_OK) *index = MaxIndex();
  return hr;
}

STDMETHODIMP TidesPort::get_MinValueIndex(long* index) {
  const HRESULT hr = CheckPointsAndOut(index);
  if (hr == S_OK) *index = MinIndex();
  return hr;
}

STDMETHODIMP TidesPort::get_MaxValue(double* value) {
  const HRESULT hr = CheckPointsAndOut(value);
  if (hr == S_OK) *value = points_[static_cast<std::size_t>(MaxIndex())] * kPublishedPerInternal;
  return hr;
}

STDMETHODIMP TidesPort::get_MinValue(double* value) {
  const HRESULT hr = CheckPointsAndOut(value);
  if (hr == S_OK) *value = points_[static_cast<std::size_t>(MinIndex())] * kPublishedPerInternal;
  return hr;
}

STDMETHODIMP TidesPort::get_Step(double* step) { return ReadDouble(step_, step); }
STDMETHODIMP TidesPort::get_SunRise(double* date) { return ReadDouble(sunRise_, date); }
STDMETHODIMP TidesPort::get_SunSet(double* date) { return ReadDouble(sunSet_, date); }
STDMETHODIMP TidesPort::get_BeginTwilight(double* date) { return ReadDouble(beginTwilight_, date); }
STDMETHODIMP TidesPort::get_EndTwilight(double* date) { return ReadDouble(endTwilight_, date); }

STDMETHODIMP TidesPort::get_TimeZone(long* zone) {
  const HRESULT hr = CheckPointsAndOut(zone);
  if (hr == S_OK) *zone = timeZone_;
  return hr;
}

}  // namespace br::tides
