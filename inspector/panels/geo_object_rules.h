#pragma once
// What the inspector's panels ask of chart objects besides their attributes: the kind of
// their database, their catalogue, whether their class is hidden, their label, and texts
// converted to the library's ANSI code page.

#include <windows.h>

#include <optional>
#include <string>
#include <string_view>

#include <wrl/client.h>

#include "GeoData.h"

namespace br::inspector {

class PanelSettings;

// Class codes with a rule of their own.
inline constexpr long kClassLight = 75;
inline constexpr long kClassAggregation = 400;
inline constexpr long kClassAssociation = 401;
inline constexpr long kClassHarbourFacility = 55001;
inline constexpr long kClassInternalService = 55059;
inline constexpr long kClassExternalService = 55060;

// The catalogue marks classes not to show and attributes not to print with bit 15.
inline constexpr long kCatalogueHiddenBit = 0x8000;

bool IsChartKind(const GUID& kind);

// The kind of the object's database (through the object itself); none on failure.
std::optional<GUID> KindOf(IGeoObject* object);
// The kind of an attribute's owner, an object or a dataset; none on failure.
std::optional<GUID> OwnerKindOf(IGeoAttribute* attribute);

// The catalogue of the dataset's database; null when any step fails.
Microsoft::WRL::ComPtr<IGeoCatalog> CatalogueOf(IGeoDataSet* dataSet);

// A hidden class: the catalogue marks it, and the object holds no other object (slot 13
// yields nothing). An object without a catalogue is shown.
bool IsHiddenClass(IGeoObject* object, long classCode);

// The object's label (FormatObject with flags 6 and the settings' flag word), or its
// class code in decimal when the formatter gives nothing.
std::wstring ObjectLabel(const PanelSettings& settings, IGeoObject* object, long classCode);

// GetProperty converted to a 32-bit integer; none when the object has none.
std::optional<long> LongProperty(IGeoObject* object, long index);

// UTF-16 text in the ANSI code page; a null BSTR is an empty text.
std::string AnsiText(const wchar_t* text, std::size_t length);
std::string AnsiText(BSTR text);
// UTF-16 text in UTF-8 and back: texts in any script pass the byte-wise rules of
// attribute_text.h (which only look at ASCII) unharmed.
std::string Utf8Text(BSTR text);
std::wstring WideText(std::string_view utf8);

}  // namespace br::inspector
