#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "array/element.h"
#include "array/element_array.h"
#include "support/array_text.h"

namespace quorrel {
namespace {

// A borrowed text reads exactly as the String that a copy would store, and every edit
// leaves the lender's bytes alone.
TEST(BorrowedText, ReadsAsAStringAndEditsNeverWriteThrough) {
  char block[] = "-42x\0 7\0";
  Element e = Element::borrowed(block);
  EXPECT_EQ(describe(e), "String 5 «-42x» -42");
  EXPECT_EQ(e.bytes(), block);
  EXPECT_EQ(e.textLength(), 4);
  EXPECT_TRUE(e.ownsNothing());
  const ElementValue v = e.view();
  EXPECT_TRUE(v.type == ElementType::String && v.size == 5 && v.bytes == block);

  // A key moves the value into a record of its own; deleting the key keeps that copy.
  e.setKey(ElementValue::ofText("k"));
  EXPECT_NE(e.bytes(), block);
  EXPECT_EQ(describe(e), "String 5 «-42x» -42 key String 2 «k» 0");
  e.deleteKey();
  EXPECT_STREQ(e.bytes(), "-42x");

  // A value assigned over a borrowed one.
  Element other = Element::borrowed(block + 5);
  other.assign(ElementValue::ofText("new"));
  EXPECT_STREQ(other.bytes(), "new");
  EXPECT_STREQ(block + 5, " 7");
  other = Element::borrowed(block + 5);
  EXPECT_EQ(other.asValue(), 7);
  other.assign(ElementValue::ofValue(9));
  EXPECT_EQ(other.type(), ElementType::Value);
  EXPECT_EQ(std::string(block, sizeof block), std::string("-42x\0 7\0", 9));
}

// An element whose key is None stays one word while it is a Value, a None or a borrowed
// text, and reads and edits as the record with a None key that it stands for.
TEST(NoneKeyWords, BehaveAsElementsWithANoneKey) {
  const char* text = "txt";
  const char* const before[] = {"Value 4 «-5» -5", "None 0 «» 0", "String 4 «txt» 0",
                                "Value 4 «-5» -5"};
  for (int form = 0; form < 4; ++form) {
    SCOPED_TRACE(form);
    Element e = form == 0   ? Element::noneKeyed(ElementValue::ofValue(-5))
                : form == 1 ? Element::noneKeyed({})
                : form == 2 ? Element::borrowedWithNoneKey(text)
                            : Element::keyed(ElementValue::ofValue(-5), ElementValue::ofValue(0));
    EXPECT_TRUE(e.ownsNothing());
    EXPECT_EQ(describe(e), std::string(before[form]) + " key None 0 «» 0");
    e.setKey(ElementValue::ofValue(0));  // still a None key, still a word
    EXPECT_TRUE(e.ownsNothing());
    e.assignValue(8);
    EXPECT_EQ(describe(e), "Value 4 «8» 8 key None 0 «» 0");
    e.assign(ElementValue::ofText("x"));  // a text of its own needs a record: key kept
    EXPECT_FALSE(e.ownsNothing());
    EXPECT_EQ(describe(e), "String 2 «x» 0 key None 0 «» 0");
  }

  Element v = Element::noneKeyed(ElementValue::ofValue(7));
  v.setKey(ElementValue::ofText("k"));
  EXPECT_EQ(describe(v), "Value 4 «7» 7 key String 2 «k» 0");
  v.deleteKey();
  EXPECT_EQ(describe(v), "Value 4 «7» 7");
  Element words[] = {Element::noneKeyed(ElementValue::ofValue(3)), Element::noneKeyed({}),
                     Element::borrowedWithNoneKey(text)};
  for (Element& w : words) {
    w.deleteKey();
    EXPECT_FALSE(w.hasKey());
    EXPECT_EQ(w.key(), nullptr);
  }
  EXPECT_EQ(words[0].asValue(), 3);
  EXPECT_EQ(words[2].bytes(), text);
}

// The array keeps the lender alive until it is cleared, through moves of the array.
TEST(BorrowedText, TheArrayKeepsItsBlocksUntilCleared) {
  auto block = std::make_shared<std::string>(std::string("one\0two", 8));
  const std::weak_ptr<std::string> watch = block;
  ElementArray moved;
  {
    ElementArray array;
    array.keepBlock(block);
    array.appendNone(2);
    array.at(0) = Element::borrowed(block->c_str());
    array.at(1) = Element::borrowed(block->c_str() + 4);
    block.reset();
    moved = std::move(array);
  }
  ASSERT_FALSE(watch.expired());
  EXPECT_STREQ(moved.getString(1), "two");
  moved.setString("edited", 0);
  moved.deleteAt(1);
  EXPECT_STREQ(moved.getString(0), "edited");
  EXPECT_FALSE(watch.expired());
  moved.clear();
  EXPECT_TRUE(watch.expired());
}

}  // namespace
}  // namespace quorrel
