#include "io/ini_file.h"

#include <cstring>
#include <memory>
#include <string_view>

#include "io/apply.h"
#include "io/file_handle.h"
#include "io/parsing.h"

namespace quorrel {

namespace {

constexpr const char* kSectionName = "ZUBArray";
constexpr std::string_view kLineEnd = "\r\n";

void writeSectionLine(BufferedWriter& out, const char* name) {
  out.text("[");
  if (name != nullptr) out.text(name);
  out.text("]\r\n");
}

void writeEntry(BufferedWriter& out, const char* key, const char* value) {
  const std::string_view k = key != nullptr ? key : "";
  const std::string_view v = value != nullptr ? value : "";
  const std::size_t total = k.size() + 1 + v.size() + kLineEnd.size();
  if (char* p = out.room(total)) {
    std::memcpy(p, k.data(), k.size());
    p += k.size();
    *p++ = '=';
    std::memcpy(p, v.data(), v.size());
    std::memcpy(p + v.size(), kLineEnd.data(), kLineEnd.size());
    out.commit(total);
    return;
  }
  out.text(k);
  out.text("=");
  out.text(v);
  out.text(kLineEnd);
}

// Handles one line of an INI text (not empty, no line break) whose first "=" is at
// `equals` (null when it has none), cutting names, keys and values in place.
template <class Sink>
[[gnu::always_inline]] inline void parseIniLine(char* line, char* end, char* equals,
                                                bool& inSection, Sink& sink) {
  if (end - line <= 1) return;
  char* p = line;
  while (p < end && (*p == ' ' || *p == '\t')) ++p;
  if (p < end && *p == '[') {
    if (p + 1 >= end || std::memchr(p + 1, ']', static_cast<std::size_t>(end - p - 1)) == nullptr) {
      return;
    }
    // The name runs to the end of the line less its last character (the "]" of a
    // written section line).
    end[-1] = '\0';
    sink.section(p + 1);
    inSection = true;
    return;
  }
  if (end - p >= 2 && p[0] == '/' && p[1] == '/') return;
  if (!inSection) return;
  *end = '\0';
  if (equals == nullptr) {
    sink.entry({p, static_cast<std::size_t>(end - p)}, {});
    return;
  }
  *equals = '\0';
  sink.entry({p, static_cast<std::size_t>(equals - p)},
             {equals + 1, static_cast<std::size_t>(end - equals - 1)});
}

// Walks the lines of an INI text in one pass over its bytes and hands sections and
// entries to the sink (a key without "=" has a value with no data). Lines end at CR
// or LF, a run of them being one break. Lines of 0 or 1 characters, "//" comments
// (after leading blanks) and entry lines before the first section are skipped.
// text[size] must be writable.
template <class Sink>
void parseIni(char* text, std::size_t size, Sink& sink) {
  bool inSection = false;
  std::size_t start = 0;
  char* equals = nullptr;
  io_detail::forEachByteOf(text, size, '\r', '\n', '=', [&](std::size_t at) {
    if (text[at] == '=') {
      if (equals == nullptr) equals = text + at;
      return;
    }
    if (at > start) parseIniLine(text + start, text + at, equals, inSection, sink);
    start = at + 1;
    equals = nullptr;
  });
  if (start < size) parseIniLine(text + start, text + size, equals, inSection, sink);
}

// The String operand of a cut text (zero-terminated in place, no zero byte inside: a
// text file is read up to its first one); none for a missing value.
ElementValue cutText(std::string_view text) {
  if (text.data() == nullptr) return {};
  return {ElementType::String, 0, text.data(), static_cast<int32_t>(text.size() + 1)};
}

// Keys are borrowed from the file's bytes; values are copied into their records.
struct LoadSink {
  io_detail::AppendRun& run;
  void section(const char*) {}
  void entry(std::string_view key, std::string_view value) {
    run.add(Element::keyedWith(cutText(value), Element::borrowed(key.data()), run.slab()));
  }
};

}  // namespace

FileStatus saveIniFile(const ElementArray& array, const char* path, FileMode mode) {
  return saveWith(path, mode, [&](BufferedWriter& out) {
    writeSectionLine(out, kSectionName);
    NumberText keyScratch;
    NumberText valueScratch;
    for (const Element& e : array.slots()) {
      const char* key = e.hasKey() ? e.key()->asString(keyScratch) : nullptr;
      writeEntry(out, key, e.asString(valueScratch));
    }
    out.text(kLineEnd);
  });
}

FileStatus loadIniFile(ElementArray& array, const char* path, LoadMode mode) {
  return loadWith(array, path, mode, ReadAs::Text,
                  [](ElementArray& target, const std::shared_ptr<ByteBuffer>& text) {
                    io_detail::AppendRun run(target);
                    LoadSink sink{run};
                    parseIni(text->data(), text->size(), sink);
                    if (run.size() > 0) target.keepBlock(text);
                    run.flush();
                  });
}

}  // namespace quorrel
