#pragma once
// A strict JSON reader (RFC 8259, UTF-8) that remembers where each value and key starts,
// so a scene file can be refused with the line and column of what is wrong. Duplicate keys,
// invalid UTF-8, lone surrogates, control characters in strings, nesting deeper than
// kMaxJsonDepth and anything after the top value are errors.

#include <string>
#include <vector>

namespace br::chartscene {

inline constexpr int kMaxJsonDepth = 100;

struct JsonMember;

struct JsonValue {
  enum class Kind { Null, Bool, Number, String, Array, Object };
  Kind kind = Kind::Null;
  bool boolean = false;
  double number = 0;
  bool integral = false;  // a number written without fraction or exponent that fits 64 bits
  long long integer = 0;  // its value when integral
  std::string text;       // a string's UTF-8
  std::vector<JsonValue> items;
  std::vector<JsonMember> members;  // in file order
  int line = 0;  // from 1
  int column = 0;  // from 1, in characters

  // The member of that key, or null (objects only).
  const JsonValue* Find(const std::string& key) const;
};

struct JsonMember {
  std::string key;
  int line = 0;
  int column = 0;
  JsonValue value;
};

struct JsonError {
  int line = 0;
  int column = 0;
  std::string message;
};

bool ParseJson(const std::string& text, JsonValue& value, JsonError& error);

}  // namespace br::chartscene
