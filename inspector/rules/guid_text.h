#pragma once
// Object identities as text: the registry form in braces, 38 characters, and nothing
// else. The platform's parser also takes program identifiers and a null string, which
// must never name an object here.

#include <array>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace br::inspector {

// The 16 bytes of an identity in the platform's GUID layout (a little-endian 32-bit
// number, two 16-bit numbers, eight bytes).
using IdBytes = std::array<unsigned char, 16>;

// "{XXXXXXXX-XXXX-XXXX-XXXX-XXXXXXXXXXXX}", hexadecimal digits in either case; none for
// anything else (other lengths, missing braces or hyphens, blanks, signs).
std::optional<IdBytes> ParseIdText(std::u16string_view text);

// The registry form, upper-case digits.
std::u16string IdText(const IdBytes& id);

// The identity with its first 8 bytes zero: it names the dataset the identity's last
// 8 bytes name.
IdBytes DataSetIdOf(const IdBytes& id);
bool IsDataSetId(const IdBytes& id);

// The dataset name in an identity's last 8 bytes: the characters up to the first full
// stop or zero byte, at most 8 (a name of 8 characters has no stop).
std::string DataSetNameOf(const IdBytes& id);

// A file name up to its first full stop.
std::string_view StemOf(std::string_view fileName);

}  // namespace br::inspector
