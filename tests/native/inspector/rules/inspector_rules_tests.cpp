#include "inspector/rules/attribute_text.h"
#include "inspector/rules/FillLimits.h"
#include "inspector/rules/guid_text.h"
#include "inspector/rules/object_groups.h"
#include "inspector/rules/record_layout.h"
#include "inspector/rules/record_search.h"

#include <doctest/doctest.h>

#include <vector>

using namespace br::inspector;

TEST_CASE("records in an array follow the record size of the platform") {
  SUBCASE("24-byte records of 64-bit Windows, as bytes") {
    CHECK(RecordCount(1, 48, 24) == 2);
    CHECK(RecordCount(1, 52, 24) == 2);  // the last 4 bytes are no record
    CHECK(RecordCount(1, 40, 24) == 1);
    CHECK(RecordCount(1, 30, 24) == 0);  // not a multiple of 4
    CHECK(RecordCount(1, 20, 24) == 0);
  }
  SUBCASE("20-byte records of 32-bit Windows, as bytes") {
    CHECK(RecordCount(1, 40, 20) == 2);
    CHECK(RecordCount(1, 44, 20) == 2);
    CHECK(RecordCount(1, 30, 20) == 0);
  }
  SUBCASE("whole records, and elements of other sizes") {
    CHECK(RecordCount(24, 3, 24) == 3);
    CHECK(RecordCount(20, 3, 24) == 0);
    CHECK(RecordCount(4, 12, 24) == 0);
    CHECK(RecordCount(1, 0, 24) == 0);
    CHECK(RecordCount(0, 48, 24) == 0);
    CHECK(RecordCount(1u << 31, 1u << 31, 24) == 0);  // a byte size beyond the address space
  }
}

TEST_CASE("tree data words name the header or an object's record") {
  CHECK(IsRecordWord(-2, 3));
  CHECK(RecordOfWord(-2) == 0);
  CHECK(IsRecordWord(1, 3));
  CHECK(IsRecordWord(2, 3));
  CHECK(RecordOfWord(2) == 2);
  CHECK_FALSE(IsRecordWord(0, 3));   // record 0 is reached through the header's -2 only
  CHECK_FALSE(IsRecordWord(3, 3));
  CHECK_FALSE(IsRecordWord(-1, 3));
  CHECK_FALSE(IsRecordWord(-2, 0));  // a header item of a cleared list
  CHECK_FALSE(IsRecordWord(1, 0));
}

TEST_CASE("conditional aids to navigation, and the order of the groups") {
  AidFacts facts;
  CHECK(GroupOfClass(84, facts) == kGroupOthers);
  facts.attribute40 = 7;
  CHECK(GroupOfClass(84, facts) == kGroupAidsToNavigation);
  facts.list94Has33 = true;
  CHECK(GroupOfClass(12, facts) == kGroupAidsToNavigation);
  CHECK(GroupOfClass(74, facts) == kGroupOthers);  // also needs 17 in list 35
  facts.list35Has17 = true;
  CHECK(GroupOfClass(74, facts) == kGroupAidsToNavigation);
  CHECK(GroupOfClass(75000, facts) == kGroupOthers);
  CHECK(kInsertionOrder[6] == kGroupAggregations);
  CHECK(kInsertionOrder[8] == kGroupOthers);
}

TEST_CASE("marked icons and flag bits") {
  CHECK(MarkedIcon(5) == 11);
  CHECK(MarkedIcon(30) == 30);
  CHECK(MarkedIcon(31) == 78);
  CHECK(MarkedIcon(77) == kIconCount - 1);
  CHECK(MarkedIcon(78) == 78);
  CHECK(IsMarkedFlags(1u << 9));
  CHECK_FALSE(IsMarkedFlags(1u << 10));
  CHECK(IsHiddenFlags(1u << 25));
  CHECK_FALSE(IsHiddenFlags(1u << 24));
}

TEST_CASE("identity texts are read strictly") {
  const std::u16string text = u"{01020304-0506-0708-090A-0B0C0D0E0F10}";
  const auto id = ParseIdText(text);
  REQUIRE(id);
  // Data1 little-endian: the text's first pair is the fourth byte.
  CHECK((*id)[0] == 0x04);
  CHECK((*id)[3] == 0x01);
  CHECK((*id)[4] == 0x06);
  CHECK((*id)[8] == 0x09);
  CHECK((*id)[15] == 0x10);
  CHECK(IdText(*id) == text);
  CHECK(ParseIdText(u"{01020304-0506-0708-090a-0b0c0d0e0f10}") == id);

  for (const char16_t* bad : {u"", u"BR_Info.XObjectInspector", u"01020304-0506-0708-090A-0B0C0D0E0F10",
                              u"{01020304-0506-0708-090A-0B0C0D0E0F10", u"{01020304-0506-0708-090A-0B0C0D0E0F1G}",
                              u"{01020304+0506-0708-090A-0B0C0D0E0F10}", u"{ 1020304-0506-0708-090A-0B0C0D0E0F10}",
                              u"{01020304-0506-0708-090A-0B0C0D0E0F10}x"})
    CHECK_FALSE(ParseIdText(bad));
}

TEST_CASE("the dataset an identity names") {
  IdBytes id{1, 0, 0, 0, 0, 0, 0, 0, 'F', 'R', '5', 'B', 'R', '0', '1', '0'};
  CHECK(DataSetNameOf(id) == "FR5BR010");  // eight characters, no stop: read no further
  CHECK_FALSE(IsDataSetId(id));
  const IdBytes header = DataSetIdOf(id);
  CHECK(IsDataSetId(header));
  CHECK(DataSetNameOf(header) == "FR5BR010");
  CHECK(header[0] == 0);
  IdBytes short_{2, 0, 0, 0, 0, 0, 0, 0, '1', '.', '.', '.', '.', '.', '.', '.'};
  CHECK(DataSetNameOf(short_) == "1");
  IdBytes zero{3, 0, 0, 0, 0, 0, 0, 0, 'A', 'B', 0, 'C', '.', '.', '.', '.'};
  CHECK(DataSetNameOf(zero) == "AB");
  CHECK(StemOf("FR5BR010.000") == "FR5BR010");
  CHECK(StemOf("NOSTOP") == "NOSTOP");
  CHECK(StemOf(".000").empty());
}

TEST_CASE("the remembered selection is found at its own entry") {
  // Records: 0 the header's copy of the selected object (b), then a, b, c.
  const std::vector<char> records = {'b', 'a', 'b', 'c'};
  auto find = [&](char wanted) {
    return FindRememberedRecord(records.size(), [&](std::size_t i) { return records[i] == wanted; });
  };
  CHECK(find('b') == std::optional<std::size_t>(2));  // not 0 counted as 1: that is a
  CHECK(find('a') == std::optional<std::size_t>(1));
  CHECK(find('c') == std::optional<std::size_t>(3));
  CHECK_FALSE(find('z'));

  const std::vector<char> onlyHeader = {'h', 'a'};
  CHECK(FindRememberedRecord(onlyHeader.size(), [&](std::size_t i) { return onlyHeader[i] == 'h'; }) ==
        std::optional<std::size_t>(1));
  CHECK_FALSE(FindRememberedRecord(1, [](std::size_t) { return true; }));  // a header alone has no object
  CHECK_FALSE(FindRememberedRecord(0, [](std::size_t) { return true; }));
}

TEST_CASE("attribute texts lose their heading and keep one field a line") {
  CHECK(AttributeLines(u"Light#Colour=white|Period=4") == std::u16string(u"Colour\rwhite\rPeriod\r4"));
  CHECK(AttributeLines(u"Buoy|Name=Kerviniou") == std::u16string(u"Name\rKerviniou"));
  CHECK(AttributeLines(u"A=") == std::u16string(u""));
  // A separator only at the first place is no heading.
  CHECK_FALSE(AttributeLines(u"#nothing"));
  CHECK_FALSE(AttributeLines(u"plain text"));
  CHECK_FALSE(AttributeLines(u""));
}

namespace {

FillLimits::Id IdOf(unsigned n) {
  FillLimits::Id id{};
  id[0] = static_cast<unsigned char>(n);
  id[1] = static_cast<unsigned char>(n >> 8);
  return id;
}

}  // namespace

TEST_CASE("the fill of related objects is bounded") {
  SUBCASE("a relation back up the path is refused without a cut") {
    FillLimits limits;
    REQUIRE(limits.Enter(IdOf(1)));
    REQUIRE(limits.Enter(IdOf(2)));
    CHECK_FALSE(limits.Enter(IdOf(1)));
    CHECK(limits.FirstCut() == FillLimits::Cut::kNone);
    limits.Leave(IdOf(2));
    CHECK(limits.Depth() == 1);
    CHECK(limits.Enter(IdOf(2)));  // a sibling branch may show it again
    CHECK(limits.Items() == 3);
  }
  SUBCASE("depth") {
    FillLimits limits;
    unsigned n = 1;
    while (limits.Enter(IdOf(n))) ++n;
    CHECK(limits.Depth() == FillLimits::kMaxDepth);
    CHECK(n == FillLimits::kMaxDepth + 1);
    CHECK(limits.FirstCut() == FillLimits::Cut::kDepth);
  }
  SUBCASE("items") {
    FillLimits limits;
    unsigned n = 1;
    while (limits.Enter(IdOf(n))) {
      limits.Leave(IdOf(n));
      ++n;
    }
    CHECK(limits.Items() == FillLimits::kMaxItems);
    CHECK(limits.FirstCut() == FillLimits::Cut::kItems);
    CHECK(limits.Depth() == 0);
  }
}
