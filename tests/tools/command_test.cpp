// The quorrel command's own parts, without the module (the cases pin the rest end to
// end): action names, printed script texts, RFC 4180 CSV and JSON strings.
#include <gtest/gtest.h>

#include "catalog.h"
#include "host/abi.h"
#include "script.h"
#include "text_formats.h"

namespace quorrel::tool {
namespace {

TEST(Catalog, EveryActionNameIsUniqueAndFindsItsCode) {
  for (int32_t code = 0; code < abi::kActionCount; ++code) {
    EXPECT_EQ(codeOfName(true, actionEntry(code).name), code) << actionEntry(code).name;
  }
  EXPECT_FALSE(codeOfName(true, "SetLabel"));
  EXPECT_FALSE(codeOfName(true, ""));
  EXPECT_FALSE(describe(true, abi::kActionCount));
}

TEST(ScriptLiterals, PrintedTextsEscapeEverythingButPrintableAscii) {
  EXPECT_EQ(quoteText("a,b,7"), R"("a,b,7")");
  EXPECT_EQ(quoteText(" ~"), R"(" ~")");
  EXPECT_EQ(quoteText("\"\\\n\r\t"), R"("\"\\\n\r\t")");
  EXPECT_EQ(quoteText(std::string("\x01\x1f\x7f\x80\xc3\xa9\xff")),
            R"("\x01\x1f\x7f\x80\xc3\xa9\xff")");
  // Every byte but 0 reads back as itself from its printed form.
  std::string all;
  for (int byte = 1; byte < 256; ++byte) all += static_cast<char>(byte);
  EXPECT_EQ(parseQuoted(quoteText(all)), all);
}

TEST(ScriptLiterals, Utf8FormKeepsOnlyValidPrintableCharacters) {
  setTextForm(TextForm::Utf8);
  // é and € pass; a lone lead byte, an overlong "/", a surrogate half and the C1
  // control U+0085 stay escaped byte by byte.
  EXPECT_EQ(quoteText("\xc3\xa9\xe2\x82\xac \xc3 \xc0\xaf \xed\xa0\x80 \xc2\x85"),
            R"("é€ \xc3 \xc0\xaf \xed\xa0\x80 \xc2\x85")");
  setTextForm(TextForm::Escaped);
  // Cuts count characters, so "Zoë Ña..." is nine.
  EXPECT_EQ(cutToWidth("Zoë Ñandú", 10), "Zoë Ñandú");
  EXPECT_EQ(cutToWidth("Zoë Ñandú!", 9), "Zoë Ña...");
  EXPECT_EQ(cutToWidth("abcdef", 4), "a...");
  EXPECT_EQ(cutToWidth("abcdef", 0), "abcdef");
}

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
  };
  for (const auto& c : cases) {
    const Rfc4180Read read = readRfc4180(c.text);
    EXPECT_EQ(read.rows, c.rows) << c.text;
    EXPECT_FALSE(read.problem) << c.text;
  }
}

TEST(Rfc4180, NamesTheLineAndColumnOfTheFirstBrokenRecordAndKeepsTheRecordsBefore) {
  const struct {
    std::string_view text;
    size_t line, column;
    const char* what;
    CsvRows before;
  } cases[] = {
      // The quote opens on line 1 and is never closed.
      {"a,\"unterminated\nb,2\n", 1, 3, "a quoted field is not closed", {}},
      // A quoted line break counts: the text after the quote is on line 3.
      {"h\n\"x\ny\"z,1\n", 3, 3, "text after a closing quote", {{"h"}}},
      {"ok\r\nok\r\na\"b\r\n", 3, 2, "a quote inside an unquoted field", {{"ok"}, {"ok"}}},
  };
  for (const auto& c : cases) {
    const Rfc4180Read read = readRfc4180(c.text);
    ASSERT_TRUE(read.problem) << c.text;
    EXPECT_EQ(read.problem->line, c.line) << c.text;
    EXPECT_EQ(read.problem->column, c.column) << c.text;
    EXPECT_EQ(read.problem->what, c.what) << c.text;
    EXPECT_EQ(read.rows, c.before) << c.text;
  }
}

TEST(Rfc4180, LenientKeepsStrayQuotesAsCharactersAndNamesTheirLines) {
  const struct {
    std::string_view text;
    CsvRows rows;
    std::vector<size_t> lines;
  } cases[] = {
      {"37\xc2\xb0"
       "36'37.8\"N,1\r\nx,\"a\"b,c\r\n\"ok\"\r\n",
       {{"37\xc2\xb0"
         "36'37.8\"N",
         "1"},
        {"x", "a\"b", "c"},
        {"ok"}},
       {1, 2}},
      // Doubled quotes stay two characters outside quotes; "q"""x is q, a quote, then "x.
      {"a\"\"b,\"q\"\"\"x\n", {{"a\"\"b", "q\"\"x"}}, {1}},
  };
  for (const auto& c : cases) {
    const Rfc4180Read read = readRfc4180(c.text, true);
    EXPECT_FALSE(read.problem) << c.text;
    EXPECT_EQ(read.rows, c.rows) << c.text;
    EXPECT_EQ(read.keptQuoteLines, c.lines) << c.text;
  }
}

TEST(Rfc4180, WritesQuotesOnlyWhereNeededAndReadsBack) {
  // A lone CR or LF each needs quotes: either one alone would end the record.
  const CsvRows rows = {{"plain", "a,b", "q\"", ""}, {"cr\r", "lf\n", " lead"}, {""}};
  const std::string text = writeRfc4180(rows);
  EXPECT_EQ(text, "plain,\"a,b\",\"q\"\"\",\r\n\"cr\r\",\"lf\n\", lead\r\n\r\n");
  EXPECT_EQ(readRfc4180(text).rows, rows);
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

TEST(Json, ReadsWhatItWritesAndNamesTheLineOfAMistake) {
  const JsonRead read =
      readJson("{\"a\": [1, -2147483648, 2.5, null, true],\n \"s\": \"\\u00e9\\ud83d\\ude00\\n\"}");
  ASSERT_FALSE(read.problem);
  const JsonValue* a = read.value.find("a");
  ASSERT_TRUE(a && a->items.size() == 5);
  EXPECT_EQ(a->items[1].integer, -2147483648);
  EXPECT_FALSE(a->items[2].integer);  // not an integer
  EXPECT_EQ(a->items[3].kind, JsonValue::Kind::Null);
  EXPECT_EQ(read.value.find("s")->text, "\xc3\xa9\xf0\x9f\x98\x80\n");
  const JsonRead broken = readJson("{\n\"a\": [1,\n 2\n}");
  ASSERT_TRUE(broken.problem);
  EXPECT_EQ(broken.problem->line, 4u);
  EXPECT_EQ(broken.problem->column, 1u);
  EXPECT_EQ(broken.problem->what, "a comma or closing bracket is missing");
}

TEST(Base64, EncodesEveryLengthAndRefusesOtherText) {
  EXPECT_EQ(base64(""), "");
  EXPECT_EQ(base64("f"), "Zg==");
  EXPECT_EQ(base64("fo"), "Zm8=");
  EXPECT_EQ(base64(std::string("\0\xff\x10", 3)), "AP8Q");
  EXPECT_EQ(fromBase64("Zm8="), "fo");
  EXPECT_EQ(fromBase64("AP8Q"), std::string("\0\xff\x10", 3));
  EXPECT_FALSE(fromBase64("Z"));
  EXPECT_FALSE(fromBase64("Zm-8"));
}

}  // namespace
}  // namespace quorrel::tool
