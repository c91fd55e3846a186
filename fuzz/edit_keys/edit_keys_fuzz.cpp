// The one-line edit's logic (cXEdit2) under arbitrary masks, texts, values and sequences of
// typed characters, keys, clicks and pastes: what a user and a host can give it.
//
// One input: u8 type, u8 maximum length, u64 value bits, the mask up to a zero byte, the
// first text up to a zero byte, then two bytes per step (what, and its argument).
//
// Checked beyond "no crash": the caret and the selection stay inside the text and the caret
// on a place it may rest on; coordinate and date fields never select; free text keeps to its
// maximum length; numbers, coordinates and dates always read back as a number.
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>

#include "fuzz/common/fuzz_check.h"
#include "toolkit/widgets/edit/EditModel.h"

using namespace toolkit;

namespace {

class Clipboard final : public EditClipboard {
public:
  bool put(const std::string& text) override {
    held = text;
    return true;
  }
  std::string get() override { return held; }
  std::string held;
};

void CheckInvariants(const EditModel& edit) {
  const int length = static_cast<int>(edit.text().size());
  FUZZ_CHECK(edit.caret() >= 0 && edit.caret() <= length);
  FUZZ_CHECK(edit.selectionStart() >= 0 && edit.selectionEnd() <= length);
  const EditPositions places(edit.type(), edit.mask(), edit.text());
  if (places.restricted()) FUZZ_CHECK(places.editable(edit.caret()) || (places.first() < 0 && edit.caret() == 0));
  if (edit.type() >= kEditLatitude) FUZZ_CHECK(edit.selectionLength() == 0);
  if (edit.maxLength() > 0 && edit.isFree() && edit.type() == kEditText) FUZZ_CHECK(length <= edit.maxLength());
  // Free text reads as whatever number it spells ("nan" included); the other fields hold
  // only digits, signs and letters they place themselves.
  if (edit.type() != kEditText) FUZZ_CHECK(!std::isnan(edit.getValue()));
  (void)edit.getNumber();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  br::fuzz::InputReader in(data, size);
  static const int kTypes[] = {1, 2, 3, 6, 7, 8, 4, 0};
  const int type = kTypes[in.U8() & 7];
  const int maxLength = static_cast<std::int8_t>(in.U8());
  const std::uint64_t bits = in.U64();
  const std::string mask(in.UntilZero());
  const std::string first(in.UntilZero());
  double value;
  std::memcpy(&value, &bits, sizeof value);

  EditModel edit(maxLength);
  Clipboard clipboard;
  if (type == kEditText) edit.setText(first);
  edit.setEditType(type, mask);
  if (type == kEditMonth) edit.setDateText(first, value);
  edit.setValue(value);
  CheckInvariants(edit);

  while (in.Remaining() >= 2) {
    const std::uint8_t what = in.U8();
    const std::uint8_t argument = in.U8();
    switch (what % 8) {
      case 0:
      case 1: edit.typeChar(argument); break;
      case 2: edit.pressKey(static_cast<EditKey>(argument % 12), (argument & 0x40) != 0, (argument & 0x80) != 0, clipboard); break;
      case 3: edit.placeCaret(static_cast<int>(argument % 64) - 8, (what & 0x80) != 0); break;
      case 4: edit.setCaret(static_cast<int>(argument % 64) - 8, static_cast<int>(static_cast<std::int8_t>(argument))); break;
      case 5:
        clipboard.held.assign(first.size() > argument % 32 ? first.substr(argument % 32) : mask);
        edit.pressKey(EditKey::LetterV, false, true, clipboard);
        break;
      case 6: edit.setMaxLength(static_cast<std::int8_t>(argument)); break;
      default: edit.setSelectionLength(static_cast<std::int8_t>(argument)); break;
    }
    CheckInvariants(edit);
  }
  return 0;
}
