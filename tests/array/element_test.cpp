// Elements: the stored types and their readings, keys, slabs, borrowed texts and the
// one-word forms of elements with a None key.
#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cstring>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include "array/element.h"
#include "array/element_array.h"
#include "array/text.h"
#include "support/array_text.h"

namespace quorrel {
namespace {

// Zero and empty operands are stored as None, while the empty text is a real String of
// size 1; file bytes read as nothing; numbers read as their decimal text.
TEST(Element, StoredTypesAndTheirReadings) {
  using T = ElementType;
  const struct {
    ElementValue operand;
    ElementType type;
    int32_t size, value;
    const char* text;
  } cases[] = {// clang-format off
      {ElementValue::ofValue(0), T::None, 0, 0, ""},
      {ElementValue::ofBytes("abc", 0), T::None, 0, 0, ""},
      {ElementValue::ofBytes("abc", -3), T::None, 0, 0, ""},
      {ElementValue::ofBytes(nullptr, 5), T::None, 0, 0, ""},
      {ElementValue::ofText(nullptr), T::None, 0, 0, ""},
      {{T::Value, 9, nullptr, -1}, T::None, 0, 0, ""},
      {ElementValue::ofText(""), T::String, 1, 0, ""},
      {ElementValue::ofBytes("7\0z", 3), T::File, 3, 0, ""},
      {ElementValue::ofValue(5), T::Value, 4, 5, "5"},
      {ElementValue::ofValue(-12), T::Value, 4, -12, "-12"},
      {ElementValue::ofValue(10), T::Value, 4, 10, "10"},
      {ElementValue::ofValue(INT32_MAX), T::Value, 4, INT32_MAX, "2147483647"},
      {ElementValue::ofValue(INT32_MIN), T::Value, 4, INT32_MIN, "-2147483648"}};
  // clang-format on
  NumberText scratch;
  Element e;
  for (const auto& c : cases) {
    e.assign(ElementValue::ofValue(1));
    e.assign(c.operand);
    EXPECT_EQ(e.type(), c.type) << c.text;
    EXPECT_EQ(e.size(), c.size);
    EXPECT_EQ(e.asValue(), c.value);
    EXPECT_STREQ(e.asString(scratch), c.text);
    EXPECT_EQ(e.textLength(), static_cast<int32_t>(std::strlen(c.text)));
  }
  e.assign(ElementValue::ofBytes("7\0z", 3));
  EXPECT_EQ(std::memcmp(e.bytes(), "7\0z", 3), 0);
  char out[12];
  EXPECT_EQ(writeDecimal(0, out), 1);
  EXPECT_STREQ(out, "0");
  EXPECT_EQ(writeDecimal(INT32_MIN, out), 11);
  EXPECT_STREQ(out, "-2147483648");
}

// A key takes a whole text whatever size the operand claims, and a Value key is 4 bytes;
// changes of value keep the key, and moving an element moves its key.
TEST(Element, KeysFollowTheValueRulesAndSurviveNewValues) {
  Element e;
  e.setKey({ElementType::String, 0, "hello", 2});
  EXPECT_EQ(describe(e), "None 0 «» 0 key String 6 «hello» 0");
  e.setKey({ElementType::Value, -3, nullptr, 9});
  EXPECT_EQ(describe(e), "None 0 «» 0 key Value 4 «-3» -3");
  for (const ElementValue& v : {ElementValue::ofValue(7), ElementValue::ofBytes("ab", 2),
                                ElementValue::ofValue(0), ElementValue::ofText("")}) {
    e.assign(v);
    ASSERT_NE(e.key(), nullptr);
    EXPECT_EQ(e.key()->asValue(), -3);
    e.deleteKey();
    EXPECT_EQ(e.key(), nullptr);
    e.setKey(ElementValue::ofValue(-3));
    EXPECT_EQ(e.asValue(), v.type == ElementType::Value ? v.number : 0);
  }
  EXPECT_EQ(describe(e), "String 1 «» 0 key Value 4 «-3» -3");
  Element moved(std::move(e));
  EXPECT_EQ(describe(e), "None 0 «» 0");
  EXPECT_EQ(describe(moved), "String 1 «» 0 key Value 4 «-3» -3");
}

// Elements built from a slab share its blocks but must behave as if each had its own
// record: outlive the slab, be edited, re-keyed and freed in any order (the sanitizer
// build checks that no freed record is touched and every block is freed).
TEST(Element, SlabBuiltElementsAreIndependent) {
  std::vector<Element> elements;
  std::vector<std::string> expected;
  {
    RecordSlab slab;
    for (int i = 0; i < 6000; ++i) {
      // Mostly short texts; every 97th is too long for a slab and every 5th is keyed.
      const std::string text(i % 97 == 0 ? 700 : 1 + i % 23, static_cast<char>('a' + i % 26));
      const ElementValue value = ElementValue::ofText(text.c_str());
      elements.push_back(i % 5 == 0 ? Element::keyed(value, ElementValue::ofValue(i), &slab)
                                    : Element::of(value, &slab));
      expected.push_back(text);
    }
    elements.push_back(Element::keyed({}, {}, &slab));  // a None under a None key
    expected.emplace_back();
  }
  EXPECT_EQ(elements.back().type(), ElementType::None);
  EXPECT_TRUE(elements.back().hasKey());
  EXPECT_EQ(elements.back().key()->type(), ElementType::None);

  std::mt19937 random(7);
  for (std::size_t i = 0; i + 1 < elements.size(); i += 3) {
    const auto pick = random() % 4;
    if (pick == 0) elements[i].assign(ElementValue::ofValue(-9));
    if (pick == 1) elements[i].setKey(ElementValue::ofText("k"));
    if (pick == 2) elements[i].deleteKey();
    if (pick == 3) elements[i].reset();
    if (pick == 0 || pick == 3) expected[i] = pick == 0 ? "-9" : "";
  }
  std::vector<std::size_t> order(elements.size());
  for (std::size_t i = 0; i < order.size(); ++i) order[i] = i;
  std::shuffle(order.begin(), order.end(), random);
  NumberText scratch;
  for (std::size_t n = 0; n < order.size(); ++n) {
    for (std::size_t k = n; n % 500 == 0 && k < order.size(); ++k) {
      ASSERT_STREQ(elements[order[k]].asString(scratch), expected[order[k]].c_str());
    }
    elements[order[n]].reset();
  }
}

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
