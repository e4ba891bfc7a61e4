// Printed texts of the script language, without the module (the cases pin the rest of
// the language end to end).
#include <gtest/gtest.h>

#include "script.h"

namespace quorrel::tool {
namespace {

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

}  // namespace
}  // namespace quorrel::tool
