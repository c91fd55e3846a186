#include "frame/errors/err_text.h"

#include <cstdarg>
#include <cstdio>
#include <cstring>
#include <vector>

namespace br {

namespace {

const char* OrNull(const char* text) { return text != nullptr ? text : "(null)"; }

__attribute__((format(printf, 1, 2))) std::string Printf(const char* format, ...) {
  std::vector<char> buffer(256);
  for (;;) {
    va_list args;
    va_start(args, format);
    const int length = std::vsnprintf(buffer.data(), buffer.size(), format, args);
    va_end(args);
    if (length >= 0 && static_cast<std::size_t>(length) < buffer.size()) {
      return std::string(buffer.data(), static_cast<std::size_t>(length));
    }
    // Some C runtimes answer -1 instead of the needed size.
    buffer.resize(length >= 0 ? static_cast<std::size_t>(length) + 1 : buffer.size() * 2);
  }
}

}  // namespace

void SplitSourceName(const char* path, std::string& name, std::string& extension) {
  name.clear();
  extension.clear();
  if (path == nullptr) {
    return;
  }
  const char* base = path;
  for (const char* p = path; *p != '\0'; ++p) {
    if (*p == '\\' || *p == '/' || *p == ':') {
      base = p + 1;
    }
  }
  const char* dot = std::strrchr(base, '.');
  if (dot == nullptr) {
    name = base;
  } else {
    name.assign(base, dot);
    extension = dot;
  }
}

std::int32_t LineOffset(const ErrRecord& record) {
  return record.line == -1 ? -1 : record.line - record.firstLine;
}

std::string FirstLineOf(const char* text) {
  if (text == nullptr) {
    return std::string();
  }
  return std::string(text, std::strcspn(text, "\r\n"));
}

std::string FormatErrLogLine(const ErrRecord& record, const ErrReportContext& context) {
  std::string name, extension;
  SplitSourceName(record.file, name, extension);
  return Printf("ERR: %s %s file:%s%s(%d) %s::%s line:%d code:%X text:'%s' thread:%d hres:0x%X(%s) \n",
                context.date.c_str(), context.time.c_str(), name.c_str(), extension.c_str(),
                static_cast<int>(record.line), OrNull(context.className), OrNull(record.function),
                static_cast<int>(LineOffset(record)),
                static_cast<unsigned>(record.code | LIBRARY_ERROR_BIT), OrNull(record.text),
                static_cast<int>(context.threadId), static_cast<unsigned>(record.result),
                OrNull(context.systemText));
}

std::string FormatErrBoxText(const ErrRecord& record, const ErrReportContext& context) {
  std::string name, extension;
  SplitSourceName(record.file, name, extension);
  std::string text = Printf("%s%s(%d) %s::%s line:%d code:%X hres:0x%X(%s)", name.c_str(),
                            extension.c_str(), static_cast<int>(record.line),
                            OrNull(context.className), OrNull(record.function),
                            static_cast<int>(LineOffset(record)),
                            static_cast<unsigned>(record.code | LIBRARY_ERROR_BIT),
                            static_cast<unsigned>(record.result), OrNull(context.systemText));
  if (record.text != nullptr && *record.text != '\0') {
    text += '\n';
    text += record.text;
  }
  if (text.size() > ERR_BOX_TEXT_MAX) {
    text.resize(ERR_BOX_TEXT_MAX);
  }
  return text;
}

}  // namespace br
