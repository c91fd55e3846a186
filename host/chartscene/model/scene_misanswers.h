#pragma once
// Wrong answers given with success, the second half of the stand-in's fault injection
// (scene_counters.h has the failing results): a host that answers S_OK with a VARIANT of
// another type, an array of another shape, no out-value at all, an enumerator that never
// ends or a text of a megabyte. Each wrapper gives the kinds its operation can give; the
// counter "misanswers.given" counts the wrong answers actually handed out, so a test
// knows which operations and kinds its client reached.

#include <cstddef>
#include <string>
#include <string_view>

namespace br::chartscene {

enum class Misanswer : int {
  None = 0,
  WrongType = 1,   // a VARIANT or array of another type than the operation's
  WrongShape = 2,  // an array of two dimensions (of the usual element count)
  NullOut = 3,     // S_OK with the out-value left empty, null or unwritten
  Endless = 4,     // an enumerator whose Next never reports the end
  HugeText = 5,    // a text (or text length) of kHugeTextLength characters
};
inline constexpr int kMisanswerKinds = 5;
inline constexpr std::size_t kHugeTextLength = std::size_t(1) << 20;

// kind None removes the operation's misanswer.
void SetMisanswer(const std::string& operation, Misanswer kind);
void ClearMisanswers();
// Whether the operation is to give that wrong answer now; counts it when it is. Cheap
// when nothing is set: one atomic read.
bool Misanswers(std::string_view operation, Misanswer kind);

}  // namespace br::chartscene
