#include "frame/geo/catalogue_texts.h"

#include <vector>

namespace br::geo {

namespace {

template <typename LengthCall, typename TextCall>
bool ReadText(IGeoCatalog* catalogue, LengthCall length, TextCall text, std::string& field) {
  if (catalogue == nullptr) {
    return false;
  }
  long size = -1;
  if (length(size) != S_OK || size < 0 || size > kMaxCatalogueText) {
    return false;
  }
  // One spare byte beyond what the host is told, so a host that writes its terminator
  // one place late still leaves the text terminated.
  std::vector<char> buffer(static_cast<std::size_t>(size) + 2, '\0');
  if (FAILED(text(size + 1, buffer.data()))) {
    return false;
  }
  buffer[static_cast<std::size_t>(size)] = '\0';
  field.assign(buffer.data());
  return true;
}

}  // namespace

bool ReadEnumText(IGeoCatalog* catalogue, long attributeCode, ULONG value, std::string& field) {
  return ReadText(
      catalogue, [&](long& size) { return catalogue->GetEnumTextLength(attributeCode, value, &size); },
      [&](long bufferSize, char* buffer) {
        return catalogue->GetEnumText(attributeCode, value, bufferSize, buffer);
      },
      field);
}

bool ReadClassName(IGeoCatalog* catalogue, long classCode, std::string& field) {
  return ReadText(
      catalogue, [&](long& size) { return catalogue->GetClassNameLength(classCode, &size); },
      [&](long bufferSize, char* buffer) {
        return catalogue->GetClassNameText(classCode, bufferSize, buffer);
      },
      field);
}

bool ReadAttributeName(IGeoCatalog* catalogue, long attributeCode, std::string& field) {
  return ReadText(
      catalogue, [&](long& size) { return catalogue->GetAttributeNameLength(attributeCode, &size); },
      [&](long bufferSize, char* buffer) {
        return catalogue->GetAttributeNameText(attributeCode, bufferSize, buffer);
      },
      field);
}

std::optional<long> FindAttributeCode(IGeoCatalog* catalogue, const char* acronym) {
  if (catalogue == nullptr || acronym == nullptr) {
    return std::nullopt;
  }
  long code = 0;
  if (catalogue->GetAttributeCode(acronym, &code) != S_OK) {
    return std::nullopt;
  }
  return code;
}

}  // namespace br::geo
