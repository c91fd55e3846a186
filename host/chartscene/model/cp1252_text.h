#pragma once
// Code page 1252, the catalogue's text form. gdal-data's S-57 files mix UTF-8 and
// Latin-1 bytes from line to line; each text is taken as UTF-8 when it is valid UTF-8
// and as 1252 bytes when it is not.

#include <string>

namespace br::chartscene {

// UTF-8 (or already 1252) text to 1252. Characters 1252 lacks become '?'; U+0080 to
// U+009F, which only appear where 1252 bytes were read as Latin-1, keep their byte.
std::string Cp1252FromMixed(const std::string& text);

std::string Utf8FromCp1252(const std::string& text);

}  // namespace br::chartscene
