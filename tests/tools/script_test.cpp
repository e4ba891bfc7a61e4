// The script language's literals, tokens and printed texts, without the module.
#include "script.h"

#include <gtest/gtest.h>

namespace quorrel::tool {
namespace {

std::string what(void (*call)()) {
  try {
    call();
  } catch (const ScriptError& error) {
    return error.what();
  }
  return "no error";
}

TEST(ScriptLiterals, IntegersCoverExactlyInt32) {
  EXPECT_EQ(parseInteger("-2147483648"), INT32_MIN);
  EXPECT_EQ(parseInteger("+2147483647"), INT32_MAX);
  EXPECT_EQ(parseInteger("007"), 7);
  EXPECT_EQ(parseInteger("-0"), 0);
  EXPECT_EQ(what([] { parseInteger("2147483648"); }),
            "integer 2147483648 is out of range -2147483648..2147483647");
  EXPECT_EQ(what([] { parseInteger("99999999999999999999999"); }),
            "integer 99999999999999999999999 is out of range -2147483648..2147483647");
  EXPECT_EQ(what([] { parseInteger("0x10"); }), "malformed integer \"0x10\"");
  EXPECT_EQ(what([] { parseInteger(""); }), "malformed integer \"\"");
}

TEST(ScriptLiterals, StringEscapes) {
  EXPECT_EQ(parseQuoted(R"("a\\b\"c\n\r\t")"), "a\\b\"c\n\r\t");
  EXPECT_EQ(parseQuoted(R"("\x41\xfF\x01")"), "A\xff\x01");
  EXPECT_EQ(parseQuoted(R"("")"), "");
  EXPECT_EQ(what([] { parseQuoted(R"("\x00")"); }), "\\x00 is not allowed in a string");
  EXPECT_EQ(what([] { parseQuoted(std::string_view("\"a\0b\"", 5)); }),
            "a zero byte is not allowed in a string");
  EXPECT_EQ(what([] { parseQuoted(R"("\x0")"); }), "\\x needs two hex digits");
  EXPECT_EQ(what([] { parseQuoted(R"("\a")"); }), "unknown escape \\a in string");
  EXPECT_EQ(what([] { parseQuoted(R"("ab)"); }), "unterminated string");
  EXPECT_EQ(what([] { parseQuoted(R"("ab\")"); }), "unterminated string");
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

TEST(ScriptLines, TokensAndCommands) {
  EXPECT_EQ(splitTokens("A 6\t\"a b\\\" c\"  5\r"),
            (std::vector<std::string>{"A", "6", "\"a b\\\" c\"", "5"}));
  EXPECT_EQ(parseLine("   # comment").kind, CommandKind::Empty);
  EXPECT_EQ(parseLine(" \t").kind, CommandKind::Empty);

  const Command created = parseLine("new delimiter=\"; \" x=-3 autoselect=1");
  EXPECT_EQ(created.kind, CommandKind::New);
  EXPECT_EQ(created.setup.delimiter, "; ");
  EXPECT_EQ(created.setup.x, -3);
  EXPECT_EQ(created.setup.autoSelect, 1);
  EXPECT_EQ(created.setup.dims, 2);
  EXPECT_EQ(created.setup.y, 10);

  const Command named = parseLine("E rowList$( 0");
  EXPECT_EQ(named.kind, CommandKind::Expression);
  EXPECT_EQ(named.name, "rowList$(");
  ASSERT_EQ(named.args.size(), 1u);
  EXPECT_FALSE(named.args[0].isText);

  const Command action = parseLine("A +06 \"x\" -1");
  EXPECT_EQ(action.code, 6);
  ASSERT_EQ(action.args.size(), 2u);
  EXPECT_EQ(action.args[0].text, "x");
  EXPECT_EQ(action.args[1].number, -1);
}

}  // namespace
}  // namespace quorrel::tool
