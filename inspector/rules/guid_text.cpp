#include "inspector/rules/guid_text.h"

namespace br::inspector {

namespace {

int HexValue(char16_t c) {
  if (c >= u'0' && c <= u'9') return c - u'0';
  if (c >= u'a' && c <= u'f') return c - u'a' + 10;
  if (c >= u'A' && c <= u'F') return c - u'A' + 10;
  return -1;
}

// Where each byte of the layout starts in the text, in text order.
constexpr int kPositions[16] = {1, 3, 5, 7, 10, 12, 15, 17, 20, 22, 25, 27, 29, 31, 33, 35};
// The byte of the layout each text pair fills: Data1, Data2, Data3 are little-endian.
constexpr int kByteOf[16] = {3, 2, 1, 0, 5, 4, 7, 6, 8, 9, 10, 11, 12, 13, 14, 15};

}  // namespace

std::optional<IdBytes> ParseIdText(std::u16string_view text) {
  if (text.size() != 38 || text[0] != u'{' || text[37] != u'}') return std::nullopt;
  if (text[9] != u'-' || text[14] != u'-' || text[19] != u'-' || text[24] != u'-') return std::nullopt;
  IdBytes id{};
  for (int i = 0; i < 16; ++i) {
    const int high = HexValue(text[kPositions[i]]);
    const int low = HexValue(text[kPositions[i] + 1]);
    if (high < 0 || low < 0) return std::nullopt;
    id[kByteOf[i]] = static_cast<unsigned char>(high * 16 + low);
  }
  return id;
}

std::u16string IdText(const IdBytes& id) {
  static const char16_t kDigits[] = u"0123456789ABCDEF";
  std::u16string text(38, u'-');
  text[0] = u'{';
  text[37] = u'}';
  for (int i = 0; i < 16; ++i) {
    const unsigned char b = id[kByteOf[i]];
    text[kPositions[i]] = kDigits[b >> 4];
    text[kPositions[i] + 1] = kDigits[b & 15];
  }
  return text;
}

IdBytes DataSetIdOf(const IdBytes& id) {
  IdBytes result = id;
  for (int i = 0; i < 8; ++i) result[i] = 0;
  return result;
}

bool IsDataSetId(const IdBytes& id) {
  for (int i = 0; i < 8; ++i)
    if (id[i] != 0) return false;
  return true;
}

std::string DataSetNameOf(const IdBytes& id) {
  std::string name;
  for (int i = 8; i < 16 && id[i] != '.' && id[i] != 0; ++i) name += static_cast<char>(id[i]);
  return name;
}

std::string_view StemOf(std::string_view fileName) {
  const std::size_t stop = fileName.find('.');
  return stop == std::string_view::npos ? fileName : fileName.substr(0, stop);
}

}  // namespace br::inspector
