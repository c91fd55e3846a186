#include "host/chartscene/model/json_reader.h"

#include "host/chartscene/model/utf8_sequence.h"

#include <cerrno>
#include <cstdlib>

namespace br::chartscene {

const JsonValue* JsonValue::Find(const std::string& key) const {
  for (const JsonMember& member : members) {
    if (member.key == key) return &member.value;
  }
  return nullptr;
}

namespace {

class Parser {
public:
  explicit Parser(const std::string& text) : text_(text) {
    if (text_.compare(0, 3, "\xEF\xBB\xBF") == 0) position_ = 3;
  }

  bool Parse(JsonValue& value, JsonError& error) {
    SkipSpace();
    if (!ParseValue(value, 0)) {
      error = error_;
      return false;
    }
    SkipSpace();
    if (position_ < text_.size()) {
      Fail("text after the end of the document");
      error = error_;
      return false;
    }
    return true;
  }

private:
  bool Fail(const std::string& message) {
    error_.line = line_;
    error_.column = column_;
    error_.message = message;
    return false;
  }

  bool AtEnd() const { return position_ >= text_.size(); }
  char Peek() const { return AtEnd() ? '\0' : text_[position_]; }

  // Moves one byte on; columns count characters, not UTF-8 continuation bytes.
  void Advance() {
    const unsigned char c = static_cast<unsigned char>(text_[position_++]);
    if (c == '\n') {
      ++line_;
      column_ = 1;
    } else if ((c & 0xC0) != 0x80) {
      ++column_;
    }
  }

  void SkipSpace() {
    while (!AtEnd() && (Peek() == ' ' || Peek() == '\t' || Peek() == '\n' || Peek() == '\r')) Advance();
  }

  bool Expect(const char* word) {
    for (const char* c = word; *c; ++c) {
      if (Peek() != *c) return Fail(std::string("expected ") + word);
      Advance();
    }
    return true;
  }

  bool ParseValue(JsonValue& value, int depth) {
    value.line = line_;
    value.column = column_;
    if (depth > kMaxJsonDepth) return Fail("nested too deeply");
    switch (Peek()) {
      case '{': return ParseObject(value, depth);
      case '[': return ParseArray(value, depth);
      case '"': value.kind = JsonValue::Kind::String; return ParseString(value.text);
      case 't': value.kind = JsonValue::Kind::Bool; value.boolean = true; return Expect("true");
      case 'f': value.kind = JsonValue::Kind::Bool; return Expect("false");
      case 'n': value.kind = JsonValue::Kind::Null; return Expect("null");
      default:
        if (Peek() == '-' || (Peek() >= '0' && Peek() <= '9')) return ParseNumber(value);
        return Fail(AtEnd() ? "unexpected end of the document" : "expected a value");
    }
  }

  bool ParseObject(JsonValue& value, int depth) {
    value.kind = JsonValue::Kind::Object;
    Advance();
    SkipSpace();
    if (Peek() == '}') {
      Advance();
      return true;
    }
    for (;;) {
      SkipSpace();
      JsonMember member;
      member.line = line_;
      member.column = column_;
      if (Peek() != '"') return Fail("expected a key in quotes");
      if (!ParseString(member.key)) return false;
      for (const JsonMember& other : value.members) {
        if (other.key == member.key) {
          error_ = {member.line, member.column, "the key \"" + member.key + "\" appears twice"};
          return false;
        }
      }
      SkipSpace();
      if (Peek() != ':') return Fail("expected ':'");
      Advance();
      SkipSpace();
      if (!ParseValue(member.value, depth + 1)) return false;
      value.members.push_back(std::move(member));
      SkipSpace();
      if (Peek() == ',') {
        Advance();
        continue;
      }
      if (Peek() == '}') {
        Advance();
        return true;
      }
      return Fail("expected ',' or '}'");
    }
  }

  bool ParseArray(JsonValue& value, int depth) {
    value.kind = JsonValue::Kind::Array;
    Advance();
    SkipSpace();
    if (Peek() == ']') {
      Advance();
      return true;
    }
    for (;;) {
      SkipSpace();
      JsonValue item;
      if (!ParseValue(item, depth + 1)) return false;
      value.items.push_back(std::move(item));
      SkipSpace();
      if (Peek() == ',') {
        Advance();
        continue;
      }
      if (Peek() == ']') {
        Advance();
        return true;
      }
      return Fail("expected ',' or ']'");
    }
  }

  static void AppendUtf8(std::string& out, unsigned long code) {
    if (code < 0x80) {
      out += static_cast<char>(code);
    } else if (code < 0x800) {
      out += static_cast<char>(0xC0 | (code >> 6));
      out += static_cast<char>(0x80 | (code & 0x3F));
    } else if (code < 0x10000) {
      out += static_cast<char>(0xE0 | (code >> 12));
      out += static_cast<char>(0x80 | ((code >> 6) & 0x3F));
      out += static_cast<char>(0x80 | (code & 0x3F));
    } else {
      out += static_cast<char>(0xF0 | (code >> 18));
      out += static_cast<char>(0x80 | ((code >> 12) & 0x3F));
      out += static_cast<char>(0x80 | ((code >> 6) & 0x3F));
      out += static_cast<char>(0x80 | (code & 0x3F));
    }
  }

  bool ParseHex4(unsigned long& code) {
    code = 0;
    for (int i = 0; i < 4; ++i) {
      const char c = Peek();
      int digit = -1;
      if (c >= '0' && c <= '9') digit = c - '0';
      if (c >= 'a' && c <= 'f') digit = c - 'a' + 10;
      if (c >= 'A' && c <= 'F') digit = c - 'A' + 10;
      if (digit < 0) return Fail("expected four hexadecimal digits");
      code = code * 16 + static_cast<unsigned long>(digit);
      Advance();
    }
    return true;
  }

  // One UTF-8 sequence copied whole, or an error at its first byte.
  bool CopyUtf8(std::string& out) {
    std::uint32_t code = 0;
    const std::size_t length = Utf8SequenceAt(text_.data() + position_, text_.size() - position_, code);
    if (length == 0) return Fail("invalid UTF-8");
    for (std::size_t i = 0; i < length; ++i) {
      out += text_[position_];
      Advance();
    }
    return true;
  }

  bool ParseString(std::string& out) {
    Advance();  // the opening quote
    for (;;) {
      if (AtEnd()) return Fail("a string is not closed");
      const unsigned char c = static_cast<unsigned char>(Peek());
      if (c == '"') {
        Advance();
        return true;
      }
      if (c < 0x20) return Fail("a control character in a string");
      if (c >= 0x80) {
        if (!CopyUtf8(out)) return false;
        continue;
      }
      if (c != '\\') {
        out += static_cast<char>(c);
        Advance();
        continue;
      }
      Advance();
      const char escape = Peek();
      if (AtEnd()) return Fail("a string is not closed");
      Advance();
      switch (escape) {
        case '"': out += '"'; break;
        case '\\': out += '\\'; break;
        case '/': out += '/'; break;
        case 'b': out += '\b'; break;
        case 'f': out += '\f'; break;
        case 'n': out += '\n'; break;
        case 'r': out += '\r'; break;
        case 't': out += '\t'; break;
        case 'u': {
          unsigned long code = 0;
          if (!ParseHex4(code)) return false;
          if (code >= 0xDC00 && code <= 0xDFFF) return Fail("a lone low surrogate");
          if (code >= 0xD800 && code <= 0xDBFF) {
            if (Peek() != '\\') return Fail("a lone high surrogate");
            Advance();
            if (Peek() != 'u') return Fail("a lone high surrogate");
            Advance();
            unsigned long low = 0;
            if (!ParseHex4(low)) return false;
            if (low < 0xDC00 || low > 0xDFFF) return Fail("a lone high surrogate");
            code = 0x10000 + ((code - 0xD800) << 10) + (low - 0xDC00);
          }
          AppendUtf8(out, code);
          break;
        }
        default:
          return Fail("an unknown escape in a string");
      }
    }
  }

  bool ParseNumber(JsonValue& value) {
    value.kind = JsonValue::Kind::Number;
    const std::size_t start = position_;
    bool fraction = false;
    if (Peek() == '-') Advance();
    if (Peek() == '0') {
      Advance();
    } else if (Peek() >= '1' && Peek() <= '9') {
      while (Peek() >= '0' && Peek() <= '9') Advance();
    } else {
      return Fail("expected a digit");
    }
    if (Peek() == '.') {
      fraction = true;
      Advance();
      if (!(Peek() >= '0' && Peek() <= '9')) return Fail("expected a digit after '.'");
      while (Peek() >= '0' && Peek() <= '9') Advance();
    }
    if (Peek() == 'e' || Peek() == 'E') {
      fraction = true;
      Advance();
      if (Peek() == '+' || Peek() == '-') Advance();
      if (!(Peek() >= '0' && Peek() <= '9')) return Fail("expected a digit in the exponent");
      while (Peek() >= '0' && Peek() <= '9') Advance();
    }
    const std::string digits = text_.substr(start, position_ - start);
    value.number = std::strtod(digits.c_str(), nullptr);
    if (!fraction) {
      errno = 0;
      const long long integer = std::strtoll(digits.c_str(), nullptr, 10);
      if (errno == 0) {
        value.integral = true;
        value.integer = integer;
      }
    }
    return true;
  }

  const std::string& text_;
  std::size_t position_ = 0;
  int line_ = 1;
  int column_ = 1;
  JsonError error_;
};

}  // namespace

bool ParseJson(const std::string& text, JsonValue& value, JsonError& error) {
  value = JsonValue();
  return Parser(text).Parse(value, error);
}

}  // namespace br::chartscene
