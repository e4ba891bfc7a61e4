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

}  // namespace
}  // namespace quorrel::tool
