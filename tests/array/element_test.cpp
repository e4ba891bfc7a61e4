#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cstring>
#include <random>
#include <string>
#include <vector>

#include "array/element.h"
#include "array/text.h"

namespace quorrel {
namespace {

TEST(Element, ZeroAndEmptyOperandsAreStoredAsNone) {
  NumberText scratch;
  Element e;
  e.assign(ElementValue::ofValue(0));
  EXPECT_EQ(e.type(), ElementType::None);
  EXPECT_EQ(e.size(), 0);
  EXPECT_EQ(e.asValue(), 0);
  EXPECT_STREQ(e.asString(scratch), "");
  EXPECT_EQ(e.textLength(), 0);

  e.assign(ElementValue::ofBytes("abc", 0));
  EXPECT_EQ(e.type(), ElementType::None);
  e.assign(ElementValue::ofBytes("abc", -3));
  EXPECT_EQ(e.type(), ElementType::None);
  e.assign(ElementValue::ofBytes(nullptr, 5));
  EXPECT_EQ(e.type(), ElementType::None);
  e.assign(ElementValue::ofText(nullptr));
  EXPECT_EQ(e.type(), ElementType::None);
  e.assign({ElementType::Value, 9, nullptr, -1});
  EXPECT_EQ(e.type(), ElementType::None);

  // The empty text is a real String of size 1, not None.
  e.assign(ElementValue::ofText(""));
  EXPECT_EQ(e.type(), ElementType::String);
  EXPECT_EQ(e.size(), 1);
  EXPECT_STREQ(e.asString(scratch), "");
  EXPECT_EQ(e.asValue(), 0);
  EXPECT_EQ(e.textLength(), 0);
}

TEST(Element, NumbersReadAsDecimalText) {
  NumberText scratch;
  Element e;
  const struct {
    int32_t value;
    const char* text;
  } cases[] = {
      {5, "5"}, {-12, "-12"}, {10, "10"}, {INT32_MAX, "2147483647"}, {INT32_MIN, "-2147483648"}};
  for (const auto& c : cases) {
    e.assign(ElementValue::ofValue(c.value));
    EXPECT_EQ(e.type(), ElementType::Value);
    EXPECT_EQ(e.size(), 4);
    EXPECT_EQ(e.asValue(), c.value);
    EXPECT_STREQ(e.asString(scratch), c.text);
    EXPECT_EQ(e.textLength(), static_cast<int32_t>(std::strlen(c.text)));
  }
}

TEST(Element, FileBytesReadAsNothing) {
  NumberText scratch;
  Element e;
  e.assign(ElementValue::ofBytes("7\0z", 3));
  EXPECT_EQ(e.type(), ElementType::File);
  EXPECT_EQ(e.size(), 3);
  EXPECT_EQ(std::memcmp(e.bytes(), "7\0z", 3), 0);
  EXPECT_STREQ(e.asString(scratch), "");
  EXPECT_EQ(e.asValue(), 0);
  EXPECT_EQ(e.textLength(), 0);
}

TEST(Element, TextReadsAsNumberLikeAtol) {
  const struct {
    const char* text;
    int32_t value;
  } cases[] = {
      {"0042", 42},
      {"  9 apples", 9},
      {"-", 0},
      {" -7", -7},
      {"12abc", 12},
      {"abc", 0},
      {"+5", 5},
      {"\t\n\v\f\r8", 8},
      {"+-3", 0},
      {"- 3", 0},
      {"3 4", 3},
      {"\xa0"
       "5",
       0},  // not white space in the C locale
      {"2147483647", INT32_MAX},
      {"2147483648", INT32_MAX},
      {"99999999999999999999999", INT32_MAX},
      {"-2147483648", INT32_MIN},
      {"-2147483649", INT32_MIN},
      {"-99999999999999999999999", INT32_MIN},
      {"000000000000000000000000012", 12},
  };
  for (const auto& c : cases) {
    Element e;
    e.assign(ElementValue::ofText(c.text));
    EXPECT_EQ(e.asValue(), c.value) << "text «" << c.text << "»";
    EXPECT_EQ(readDecimal(std::string_view(c.text)), c.value) << "text «" << c.text << "»";
  }
  // A token cut out of a longer text reads only its own characters.
  EXPECT_EQ(readDecimal(std::string_view("123456", 3)), 123);
}

TEST(Element, KeysFollowTheValueRulesAndSurviveNewValues) {
  NumberText scratch;
  Element e;
  e.deleteKey();  // no key yet: nothing happens
  EXPECT_EQ(e.key(), nullptr);

  // The key takes the whole text, whatever size the operand claims.
  e.setKey({ElementType::String, 0, "hello", 2});
  ASSERT_NE(e.key(), nullptr);
  EXPECT_EQ(e.key()->type(), ElementType::String);
  EXPECT_EQ(e.key()->size(), 6);
  EXPECT_STREQ(e.key()->asString(scratch), "hello");

  // A key of 0 exists but is None.
  e.setKey(ElementValue::ofValue(0));
  ASSERT_NE(e.key(), nullptr);
  EXPECT_EQ(e.key()->type(), ElementType::None);
  EXPECT_EQ(e.key()->asValue(), 0);

  // A Value key always has size 4, whatever the operand says.
  e.setKey({ElementType::Value, -3, nullptr, 9});
  EXPECT_EQ(e.key()->size(), 4);
  EXPECT_EQ(e.key()->asValue(), -3);

  e.assign(ElementValue::ofText("value"));
  e.assign(ElementValue::ofValue(0));
  ASSERT_NE(e.key(), nullptr);
  EXPECT_EQ(e.key()->asValue(), -3);

  e.setKey(ElementValue::ofBytes("ab", 2));
  EXPECT_EQ(e.key()->type(), ElementType::File);
  EXPECT_EQ(e.key()->size(), 2);

  e.deleteKey();
  EXPECT_EQ(e.key(), nullptr);

  e.assign(ElementValue::ofText("x"));
  e.setKey(ElementValue::ofValue(1));
  e.reset();
  EXPECT_EQ(e.type(), ElementType::None);
  EXPECT_EQ(e.key(), nullptr);
}

TEST(Text, WritesEveryNumberWithoutPadding) {
  char out[12];
  EXPECT_EQ(writeDecimal(0, out), 1);
  EXPECT_STREQ(out, "0");
  EXPECT_EQ(writeDecimal(INT32_MIN, out), 11);
  EXPECT_STREQ(out, "-2147483648");
  EXPECT_EQ(writeDecimal(-1, out), 2);
  EXPECT_STREQ(out, "-1");
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
  NumberText scratch;
  EXPECT_EQ(elements.back().type(), ElementType::None);
  EXPECT_TRUE(elements.back().hasKey());
  EXPECT_EQ(elements.back().key()->type(), ElementType::None);

  std::mt19937 random(7);
  for (std::size_t i = 0; i + 1 < elements.size(); i += 3) {
    switch (random() % 4) {
      case 0:
        elements[i].assign(ElementValue::ofValue(-9));
        expected[i] = "-9";
        break;
      case 1:
        elements[i].setKey(ElementValue::ofText("k"));
        break;
      case 2:
        elements[i].deleteKey();
        break;
      default:
        elements[i].reset();
        expected[i].clear();
        break;
    }
  }
  std::vector<std::size_t> order(elements.size());
  for (std::size_t i = 0; i < order.size(); ++i) order[i] = i;
  std::shuffle(order.begin(), order.end(), random);
  for (std::size_t n = 0; n < order.size(); ++n) {
    if (n % 500 == 0) {
      for (std::size_t k = n; k < order.size(); ++k) {
        ASSERT_STREQ(elements[order[k]].asString(scratch), expected[order[k]].c_str());
      }
    }
    elements[order[n]].reset();
  }
}

}  // namespace
}  // namespace quorrel
