#pragma once
// VARIANTs of the stand-in's typed values, and texts of values for its formatter.

#include <windows.h>
#include <oleauto.h>

#include "host/chartscene/model/scene_model.h"

namespace br::chartscene {

// A new VARIANT (cleared first); E_OUTOFMEMORY when a string or array cannot be made.
HRESULT VariantFromTyped(const TypedValue& value, VARIANT* out);

// A SAFEARRAY of bytes (VT_UI1) holding data; null when it cannot be made.
SAFEARRAY* ByteArray(const std::vector<unsigned char>& data);

}  // namespace br::chartscene
