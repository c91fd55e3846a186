#pragma once
// The wrong answers of scene_misanswers.h as the wrappers hand them out. Each helper looks
// whether its operation is to misanswer in a way its out-value can carry; if so it writes
// the wrong answer and returns true, and the wrapper returns S_OK at once.

#include <windows.h>
#include <oleauto.h>

#include "host/chartscene/model/scene_misanswers.h"

namespace br::chartscene {

// A VARIANT out-value (already initialised): WrongType a text, WrongShape a two-dimensional
// array of element (VT_UI1 for records of bytes, else VT_VARIANT), NullOut VT_EMPTY,
// HugeText a text of kHugeTextLength characters.
bool MisanswerVariant(const char* operation, VARIANT* value, VARTYPE element = VT_VARIANT);
// A byte array out-value (already null): WrongType an array of texts, WrongShape two
// dimensions, NullOut null, HugeText kHugeTextLength bytes of letters.
bool MisanswerByteArray(const char* operation, SAFEARRAY** array, ULONG usualBytes);
// Any other out-value: NullOut leaves it as the wrapper cleared it (or unwritten).
inline bool MisanswerNull(const char* operation) { return Misanswers(operation, Misanswer::NullOut); }

// In a wrapper, after SCENE_CALL: answer S_OK with the out-value as the wrapper cleared it.
#define SCENE_MISANSWER_NULL(operation) \
  do {                                  \
    if (MisanswerNull(operation)) return S_OK; \
  } while (false)

}  // namespace br::chartscene
