#pragma once
// The dataset parameters a host hands back (IGeoDataSet::GetParameters): a VARIANT
// holding a one-dimensional array of VARIANTs, directly (VT_ARRAY|VT_VARIANT), by
// reference (VT_BYREF|VT_ARRAY|VT_VARIANT) or inside a VARIANT passed by reference
// (VT_BYREF|VT_VARIANT). The elements are copied, so the list outlives the host's answer.

#include <windows.h>
#include <oleauto.h>

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "GeoData.h"

namespace br::geo {

class ParameterList {
public:
  // Elements past this one are never read; copying stops there.
  static constexpr std::size_t kMaxElements = 64;

  ParameterList() = default;
  ~ParameterList();
  ParameterList(const ParameterList&) = delete;
  ParameterList& operator=(const ParameterList&) = delete;

  // False (and an empty list) for anything but the three forms above, an array of more
  // dimensions, or elements of another size than sizeof(VARIANT) (24 bytes on 64-bit).
  bool Assign(const VARIANT& value);
  // GetParameters of the dataset, read as above; the answer is cleared here.
  // The host's failure as it is, E_INVALIDARG for an answer of the wrong shape.
  HRESULT Read(IGeoDataSet* dataSet);

  std::size_t Size() const { return elements_.size(); }
  // Null past the end.
  const VARIANT* At(std::size_t index) const;

  // An element converted to a 32-bit integer (any integer or number type that converts).
  std::optional<long> Integer(std::size_t index) const;
  // A VT_BSTR element in the ANSI code page.
  std::optional<std::string> Text(std::size_t index) const;
  // A VT_DATE element.
  std::optional<double> Date(std::size_t index) const;

  void Clear();

private:
  bool CopyArray(SAFEARRAY* array);

  std::vector<VARIANT> elements_;
};

}  // namespace br::geo
