// RFC 4180 CSV and JSON strings, without the module.
#include "text_formats.h"

#include <gtest/gtest.h>

namespace quorrel::tool {
namespace {

TEST(Rfc4180, ReadsQuotesDoubledQuotesAndLineBreaks) {
  const struct {
    std::string_view text;
    CsvRows rows;
  } cases[] = {
      {"", {}},
      {"a,b\r\n", {{"a", "b"}}},
      {"a,b", {{"a", "b"}}},
      {"a\nb\rc\r\n", {{"a"}, {"b"}, {"c"}}},
      {",\r\n", {{"", ""}}},
      {"\r\n", {{""}}},
      {R"("a,b","say ""hi""",""
x)",
       {{"a,b", "say \"hi\"", ""}, {"x"}}},
      {"\"two\r\nlines\",z\r\n", {{"two\r\nlines", "z"}}},
      // Lenient: a quote inside an unquoted field is text; text after a closing
      // quote is kept; an unterminated quote runs to the end.
      {"a\"b,\"c\"d,\"e\nf", {{"a\"b", "cd", "e\nf"}}},
  };
  for (const auto& c : cases) EXPECT_EQ(readRfc4180(c.text), c.rows) << c.text;
}

TEST(Rfc4180, WritesQuotesOnlyWhereNeededAndReadsBack) {
  // A lone CR or LF each needs quotes: either one alone would end the record.
  const CsvRows rows = {{"plain", "a,b", "q\"", ""}, {"cr\r", "lf\n", " lead"}, {""}};
  const std::string text = writeRfc4180(rows);
  EXPECT_EQ(text, "plain,\"a,b\",\"q\"\"\",\r\n\"cr\r\",\"lf\n\", lead\r\n\r\n");
  EXPECT_EQ(readRfc4180(text), rows);
}

TEST(Json, StringsEscapeControlsAndKeepUtf8) {
  EXPECT_EQ(jsonString("a\"\\\n\r\t\x01"), R"("a\"\\\n\r\t\u0001")");
  EXPECT_EQ(jsonString("\xc3\xa9\xe2\x86\x92"), "\"\xc3\xa9\xe2\x86\x92\"");
  // Bytes that are not UTF-8 (a lone continuation, an overlong form, a surrogate)
  // become the Latin-1 characters of their values.
  EXPECT_EQ(jsonString("\x80"), "\"\xc2\x80\"");
  EXPECT_EQ(jsonString("\xc0\xaf"), "\"\xc3\x80\xc2\xaf\"");
  EXPECT_EQ(jsonString("\xed\xa0\x80"), "\"\xc3\xad\xc2\xa0\xc2\x80\"");
}

}  // namespace
}  // namespace quorrel::tool
