// Arbitrary masks, texts and key sequences: the edit must keep its caret and
// selection inside the text and on places it may rest on, whatever comes.
#include <doctest/doctest.h>

#include <random>
#include <string>

#include "FakeClipboard.h"
#include "toolkit/widgets/edit/EditModel.h"

using namespace toolkit;

namespace {

std::string randomBytes(std::mt19937& rng, size_t maxLength, const std::string& alphabet) {
  std::uniform_int_distribution<size_t> len(0, maxLength);
  std::uniform_int_distribution<size_t> pick(0, alphabet.size() - 1);
  std::string s(len(rng), ' ');
  for (char& c : s) c = alphabet[pick(rng)];
  return s;
}

void checkInvariants(const EditModel& edit) {
  const int length = static_cast<int>(edit.text().size());
  REQUIRE(edit.caret() >= 0);
  REQUIRE(edit.caret() <= length);
  REQUIRE(edit.selectionStart() >= 0);
  REQUIRE(edit.selectionEnd() <= length);
  const EditPositions places(edit.type(), edit.mask(), edit.text());
  if (places.restricted()) {
    REQUIRE((places.editable(edit.caret()) || (places.first() < 0 && edit.caret() == 0)));
  }
  if (edit.type() >= kEditLatitude) REQUIRE(edit.selectionLength() == 0);
  if (edit.maxLength() > 0 && edit.isFree() && edit.type() == kEditText)
    REQUIRE(length <= edit.maxLength());
}

}  // namespace

TEST_CASE("random masks and key sequences keep the edit consistent") {
  std::mt19937 rng(20240601);
  std::string bytes;
  for (int c = 0; c < 256; ++c) bytes.push_back(static_cast<char>(c));
  const std::string maskAlphabet = "DMSdms$9-.'\xB0 yMd'g" + std::string(1, '\0');
  const int types[] = {1, 2, 3, 6, 7, 8};
  for (int round = 0; round < 400; ++round) {
    FakeClipboard clip;
    EditModel edit(static_cast<int>(rng() % 12));
    const int type = types[rng() % 6];
    const std::string mask = randomBytes(rng, 24, maskAlphabet);
    if (type == kEditText) edit.setText(randomBytes(rng, mask.size() + 2, bytes));
    edit.setEditType(type, mask);
    if (type == kEditMonth) edit.setDateText(randomBytes(rng, 16, "0123456789-. "), 45000.0);
    if (type == kEditDecimal || type >= kEditLatitude) {
      std::uniform_real_distribution<double> value(-400.0, 400.0);
      edit.setValue(value(rng));
    }
    checkInvariants(edit);
    for (int step = 0; step < 80; ++step) {
      switch (rng() % 6) {
        case 0:
        case 1: edit.typeChar(static_cast<unsigned char>(rng() % 256)); break;
        case 2: {
          const EditKey key = static_cast<EditKey>(rng() % 12);
          edit.pressKey(key, rng() % 2 == 0, rng() % 3 == 0, clip);
          break;
        }
        case 3: edit.placeCaret(static_cast<int>(rng() % 40) - 5, rng() % 2 == 0); break;
        case 4: edit.setCaret(static_cast<int>(rng() % 40) - 5, static_cast<int>(rng() % 40) - 20); break;
        default:
          clip.held = randomBytes(rng, 20, bytes);
          edit.pressKey(EditKey::LetterV, false, true, clip);
          break;
      }
      checkInvariants(edit);
      (void)edit.getValue();
      (void)edit.getNumber();
    }
  }
}
