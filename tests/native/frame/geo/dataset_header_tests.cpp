// The dataset header record: every field at its offset, little-endian; short records
// give the fields they hold and no more; texts end at their zero, their field or the data.
#include <doctest/doctest.h>

#include <cstring>
#include <vector>

#include "frame/geo/dataset_header.h"

using namespace br::geo;

namespace {

void Put(std::vector<unsigned char>& bytes, std::size_t offset, unsigned long long value, int size) {
  for (int i = 0; i < size; ++i) bytes[offset + i] = static_cast<unsigned char>(value >> (8 * i));
}

void PutText(std::vector<unsigned char>& bytes, std::size_t offset, const char* text) {
  std::memcpy(&bytes[offset], text, std::strlen(text));
}

std::vector<unsigned char> FullRecord() {
  std::vector<unsigned char> bytes(kDataSetHeaderSize, 0);
  Put(bytes, 16, 22000, 4);
  Put(bytes, 20, 0xFFFFFFFE, 4);  // level -2
  Put(bytes, 24, 0xFFFF, 2);
  Put(bytes, 26, 3, 2);
  Put(bytes, 28, 0x01D9'5C3A'1234'5678ULL, 8);
  Put(bytes, 36, 0x01D8'0000'0000'0001ULL, 8);
  Put(bytes, 48, 550, 4);
  Put(bytes, 52, 0x0203, 4);
  PutText(bytes, 60, "FR-SHOM 2023");
  bytes[312] = kHeaderStatusTerminated | kHeaderStatusNewEdition;
  PutText(bytes, 316, "FR5BR010.000");
  Put(bytes, 572, 5, 4);
  for (int i = 0; i < 16; ++i) bytes[576 + i] = static_cast<unsigned char>(0xA0 + i);
  return bytes;
}

}  // namespace

TEST_CASE("a whole record gives every field, little-endian, signed where it is signed") {
  const std::vector<unsigned char> bytes = FullRecord();
  const DataSetHeader header = ParseDataSetHeader(bytes.data(), bytes.size());
  CHECK(*header.scale == 22000u);
  CHECK(*header.level == -2);
  CHECK(*header.edition == 0xFFFF);
  CHECK(*header.update == 3);
  CHECK(*header.updateDate == 0x01D9'5C3A'1234'5678ULL);
  CHECK(*header.issueDate == 0x01D8'0000'0000'0001ULL);
  CHECK(*header.agency == 550u);
  CHECK(*header.sourceAgency == 0x0203u);
  CHECK(*header.sourceId == "FR-SHOM 2023");
  CHECK(*header.status == 3);
  CHECK(*header.fileName == "FR5BR010.000");
  CHECK(*header.usage == 5u);
  REQUIRE(header.identity.has_value());
  CHECK((*header.identity)[0] == 0xA0);
  CHECK((*header.identity)[15] == 0xAF);
}

TEST_CASE("a short record gives only the fields it holds whole") {
  const std::vector<unsigned char> bytes = FullRecord();
  struct Row {
    std::size_t size;
    bool scale, edition, updateDate, sourceId, status, fileName, usage, identity;
  };
  const Row rows[] = {
      {0, false, false, false, false, false, false, false, false},
      {19, false, false, false, false, false, false, false, false},   // scale needs 16..19
      {20, true, false, false, false, false, false, false, false},
      {35, true, true, false, false, false, false, false, false},     // update date needs 28..35
      {61, true, true, true, true, false, false, false, false},       // one byte of the source id
      {313, true, true, true, true, true, false, false, false},
      {575, true, true, true, true, true, true, false, false},       // usage needs 572..575
      {576, true, true, true, true, true, true, true, false},
      {591, true, true, true, true, true, true, true, false},         // identity one byte short
      {592, true, true, true, true, true, true, true, true},
  };
  for (const Row& row : rows) {
    INFO("size " << row.size);
    const DataSetHeader header = ParseDataSetHeader(bytes.data(), row.size);
    CHECK(header.scale.has_value() == row.scale);
    CHECK(header.edition.has_value() == row.edition);
    CHECK(header.updateDate.has_value() == row.updateDate);
    CHECK(header.sourceId.has_value() == row.sourceId);
    CHECK(header.status.has_value() == row.status);
    CHECK(header.fileName.has_value() == row.fileName);
    CHECK(header.usage.has_value() == row.usage);
    CHECK(header.identity.has_value() == row.identity);
  }
  // A text cut by the end of the data keeps what there is.
  CHECK(*ParseDataSetHeader(bytes.data(), 64).sourceId == "FR-S");
  CHECK(*ParseDataSetHeader(bytes.data(), 320).fileName == "FR5B");
  CHECK_FALSE(ParseDataSetHeader(nullptr, 592).scale.has_value());
}

TEST_CASE("texts stop at their zero, or at their field's end when the host wrote none") {
  std::vector<unsigned char> bytes = FullRecord();
  std::memset(&bytes[60], 'S', 252);  // source id fills its field, no terminator
  std::memset(&bytes[316], 'N', 256);  // the file name runs into the usage code
  const DataSetHeader header = ParseDataSetHeader(bytes.data(), bytes.size());
  CHECK(header.sourceId->size() == 252);
  CHECK(header.fileName->size() == 256);
  CHECK(*header.usage == 5u);

  const unsigned char data[] = {'a', 'b', 0, 'c', 'd'};
  CHECK(*BoundedText(data, sizeof(data), 0, 5) == "ab");
  CHECK(*BoundedText(data, sizeof(data), 3, 10) == "cd");
  CHECK(BoundedText(data, sizeof(data), 2, 1)->empty());
  CHECK_FALSE(BoundedText(data, sizeof(data), 5, 1).has_value());
}
