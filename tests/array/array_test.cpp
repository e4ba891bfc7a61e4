// The array: elements (stored types and readings, keys, slabs, borrowed texts, the
// one-word forms with a None key) and the store that holds them (capacity steps, edits
// and appends against plain models, dimensions and row states, the edit guard).
#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cstring>
#include <memory>
#include <random>
#include <string>
#include <utility>
#include <vector>

#include "array/array_edit.h"
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

// The element store: capacity steps, edits everywhere and appends against plain models,
// dimensions and row states, and the all-or-nothing guard of edits.
// 200 values deleted from the front down to 102: still 414, since the last delete
// started from 103 = 414 / 4; the next balance below that shrinks to 310.
ElementArray sparse() {
  ElementArray a;
  for (int i = 1; i <= 200; ++i) a.appendValue(i);
  while (a.size() > 102) a.deleteAt(0);
  return a;
}

TEST(Capacity, GrowsByHalfWhenSizePassesHalf) {
  ElementArray a;
  EXPECT_EQ(a.capacity(), 25);
  const int expected[][2] = {{12, 25}, {13, 37},  {18, 37},  {19, 55},  {27, 55},  {28, 82},
                             {41, 82}, {42, 123}, {62, 184}, {93, 276}, {139, 414}};
  int appended = 0;
  for (auto [count, capacity] : expected) {
    while (appended < count) a.appendValue(++appended);
    EXPECT_EQ(a.capacity(), capacity) << "after " << count << " appends";
  }

  // Setting far past the end grows step by step; clear starts over.
  ElementArray far;
  far.setString("a", 1000);
  EXPECT_EQ(far.size(), 1001);
  EXPECT_EQ(far.capacity(), 2094);
  far.clear();
  EXPECT_EQ(far.capacity(), 25);

  // An insert inside balances for the size before it grows, so inserting at the front
  // reaches 37 one element later than appending does.
  ElementArray front;
  for (int i = 1; i <= 13; ++i) front.insertValue(i, 0);
  EXPECT_EQ(front.capacity(), 25);
  front.insertValue(14, 0);
  EXPECT_EQ(front.capacity(), 37);
}

// Shrinking to 75 % happens when the size before a delete is under a quarter of the
// capacity; between a quarter and a half nothing changes.
TEST(Capacity, ShrinksWithHysteresis) {
  ElementArray a = sparse();
  ASSERT_EQ(a.capacity(), 414);
  // Growing back needs more than 207 elements.
  while (a.size() < 207) a.appendValue(1);
  EXPECT_EQ(a.capacity(), 414);
  a.appendValue(1);
  EXPECT_EQ(a.capacity(), 621);
  while (a.size() > 102) a.deleteAt(a.size() - 1);
  // 621 / 4 = 155, so the deletes from 154 down already shrank to 465 (465 / 4 = 116,
  // then from 115 down to 348).
  EXPECT_EQ(a.capacity(), 348);

  ElementArray b = sparse();
  const int steps[][2] = {{101, 310}, {76, 310}, {75, 232}, {57, 232}, {56, 174},
                          {42, 174},  {41, 130}, {31, 130}, {30, 97},  {0, 97}};
  for (auto [size, capacity] : steps) {
    while (b.size() > size) b.deleteAt(0);
    EXPECT_EQ(b.capacity(), capacity) << "at size " << size;  // below 26 nothing shrinks
  }
  // A shrink also needs more than 25 elements before the delete: 3534 elements
  // (capacity 10599) deleted down to 25 leave 105, and the delete from 25 keeps it.
  ElementArray last;
  last.setString("a", 3533);
  EXPECT_EQ(last.capacity(), 10599);
  while (last.size() > 24) last.deleteAt(last.size() - 1);
  EXPECT_EQ(last.capacity(), 105);
  for (int i = 1; i <= 48; ++i) b.appendValue(i);
  EXPECT_EQ(b.capacity(), 97);
  b.appendValue(49);
  EXPECT_EQ(b.capacity(), 145);

  // A set or insert inside the array also rebalances, which can shrink it; key setters
  // and reads leave the capacity alone.
  ElementArray set = sparse();
  set.setValue(5, 0);
  EXPECT_EQ(set.capacity(), 310);
  ElementArray inserted = sparse();
  inserted.insertValue(5, 0);
  EXPECT_EQ(inserted.capacity(), 310);
  ElementArray keyed = sparse();
  keyed.setKeyValue(1, 0);
  EXPECT_EQ(keyed.capacity(), 414);
}

// File bytes: empty or missing ones store None; a text reads with its terminator; a
// read outside leaves the block alone.
TEST(Store, FileBytesAndByteReads) {
  ElementArray f;
  ByteBlock block{"untouched", 9};
  EXPECT_FALSE(f.getBytes(block, 0));
  EXPECT_STREQ(block.bytes, "untouched");
  f.appendFile({"x\0y", 3});
  f.appendFile({nullptr, 4});
  f.appendFile({"abc", 0});
  f.appendString("abc");
  EXPECT_EQ(contents(f), std::string("<x\0y>|~|~|abc", 13));
  ASSERT_TRUE(f.getBytes(block, 1));
  EXPECT_EQ(block.bytes, nullptr);
  EXPECT_EQ(block.length, 0);
  ASSERT_TRUE(f.getBytes(block, 3));
  EXPECT_EQ(block.length, 4);
  EXPECT_EQ(std::memcmp(block.bytes, "abc", 4), 0);
}

// Each element's text form and key text ("-" for no key).
using Entries = std::vector<std::pair<std::string, std::string>>;
Entries entries(ElementArray& a) {
  Entries out;
  for (int32_t i = 0; i < a.size(); ++i) {
    const std::string text = a.getString(i);  // read before the key: they share a buffer
    const char* key = a.getKeyString(i);
    out.emplace_back(text, key == nullptr ? "-" : key);
  }
  return out;
}

// Edits at the front, in the middle and at the back, with keys and every value type,
// agree with a vector of texts.
TEST(Store, EditsEverywhereAgreeWithAPlainVector) {
  std::mt19937 random(5);
  ElementArray a;
  Entries m;
  for (int step = 0; step < 20000; ++step) {
    const auto size = static_cast<int32_t>(m.size());
    const int pick = static_cast<int>(random() % 100);
    int32_t index = size == 0 ? 0 : static_cast<int32_t>(random() % static_cast<unsigned>(size));
    if (pick % 3 == 0) index = pick % 2 == 0 ? 0 : std::max(size - 1, 0);
    const auto at = m.begin() + index;
    const int32_t value = static_cast<int32_t>(random() % 5);
    const std::string number = value == 0 ? "" : std::to_string(value);
    const std::string text = "t" + std::to_string(step);
    if (pick < 40 || size < 50) {
      if (pick % 2 == 0) a.insertValue(value, index);
      if (pick % 2 != 0) a.insertString(text.c_str(), index);
      m.insert(at, {pick % 2 == 0 ? number : text, "-"});
    } else if (pick < 80) {
      a.deleteAt(index);
      m.erase(at);
    } else if (pick < 88) {
      a.setKeyString(text.c_str(), index);
      at->second = text;
    } else if (pick < 92) {
      a.setKeyValue(value, index);
      at->second = number;
    } else if (pick < 96) {
      a.setValue(value, index);
      at->first = number;
    } else {
      a.setFile({"bytes", 5}, index);
      at->first = "";
    }
    if (step % 97 == 0 || step == 19999) {
      ASSERT_EQ(entries(a), m) << "step " << step;
    }
  }
}

// Appends take a shortcut while they cannot change the capacity or the row count, and
// appendNone(n) and appendElements of n elements append in bulk: each must leave what
// inserting at the end one by one leaves (elements, keys, capacity, row states),
// through growth, shrinking and tables.
TEST(Store, AppendsMatchSingleInsertsAtTheEnd) {
  for (int32_t dims : {1, 2}) {
    ElementArray appended, inserted;
    for (ElementArray* a : {&appended, &inserted}) {
      a->setDimensions(dims);
      a->setBoundary(1, 3);  // refused in one dimension
    }
    for (int step = 0; step < 400; ++step) {
      if (step % 97 == 96) {
        // Delete most of the array so that the capacity shrinks on the next appends.
        for (ElementArray* a : {&appended, &inserted}) {
          while (a->size() > 3) a->deleteAt(0);
        }
      }
      const std::string text = step % 5 == 0 ? std::string() : "t" + std::to_string(step);
      if (step % 3 == 0) {
        appended.appendValue(step);
        inserted.insertValue(step, inserted.size());
      } else {
        const char* t = step % 7 == 0 ? nullptr : text.c_str();
        appended.appendString(t);
        inserted.insertString(t, inserted.size());
      }
      ASSERT_EQ(contents(appended), contents(inserted)) << "dims " << dims << " step " << step;
      ASSERT_EQ(appended.capacity(), inserted.capacity()) << "dims " << dims << " step " << step;
      ASSERT_EQ(appended.rowStates, inserted.rowStates) << "dims " << dims << " step " << step;
    }
  }

  const auto prepare = [](ElementArray& a, int32_t start) {
    a.setDimensions(2);
    a.setBoundary(1, 4);
    a.settings.autoSelectNewRows = true;
    for (int32_t i = 0; i < start; ++i) a.appendValue(i + 1);
    // A sparse array, whose next append may shrink the capacity; at 600, down to 20
    // elements in a large capacity, so that appends past 25 shrink it again.
    while (a.size() > (start == 600 ? 20 : start - start / 2)) a.deleteAt(0);
  };
  for (int32_t start : {0, 12, 30, 200, 600}) {
    for (int64_t n : {1, 2, 13, 100, 1000}) {
      ElementArray none, run, single, singleKeyed;
      for (ElementArray* a : {&none, &run, &single, &singleKeyed}) prepare(*a, start);
      none.appendNone(n);
      std::vector<Element> elements;
      for (int64_t i = 0; i < n; ++i) {
        single.appendString(nullptr);
        const std::string text = "t" + std::to_string(i);
        elements.push_back(
            Element::keyed(ElementValue::ofText(text.c_str()), ElementValue::ofValue(-1)));
        singleKeyed.appendString(text.c_str());
        singleKeyed.setKeyValue(-1, singleKeyed.size() - 1);
      }
      run.appendElements(elements);
      EXPECT_EQ(elements.back().type(), ElementType::None);  // moved out
      for (auto [bulk, one] : {std::pair{&none, &single}, std::pair{&run, &singleKeyed}}) {
        ASSERT_EQ(entries(*bulk), entries(*one)) << start << " + " << n;
        EXPECT_EQ(bulk->capacity(), one->capacity()) << start << " + " << n;
        EXPECT_EQ(bulk->rowStates, one->rowStates) << start << " + " << n;
      }
    }
  }
  ElementArray capped;
  capped.appendNone(int64_t{ElementArray::kMaxSize} + 5);
  EXPECT_EQ(capped.size(), ElementArray::kMaxSize);
  std::vector<Element> more(3);
  more[0] = Element::of(ElementValue::ofValue(9));
  capped.appendElements(more);
  EXPECT_EQ(capped.size(), ElementArray::kMaxSize);
  EXPECT_EQ(more[0].number(), 9);  // refused, so not taken
}

// The resize written out step by step with single inserts and deletes.
void resizeStepByStep(ElementArray& a, int32_t d, int32_t n) {
  if (n < 1 || d < 0 || d >= a.dimensions()) return;
  const int32_t old = a.boundaryEntry(d);
  const int32_t block = a.stride(d);
  const int32_t unit = a.stride(d - 1);
  const int32_t size = a.size();
  if (n != old && block > 0 && block < size) {
    for (int32_t k = 1; k * block <= size; ++k) {
      const int32_t count = unit * (n > old ? n - old : old - n);
      for (int32_t i = 0; i < count; ++i) {
        if (n > old) {
          a.insertFile({}, k * block + (k - 1) * count);
        } else {
          a.deleteAt(k * (block - count));
        }
      }
    }
  }
  a.setBoundary(d, n);
}

// Elements, keys, capacity and row states after a resize are those its single inserts
// and deletes reach.
TEST(Dimensions, ResizeMatchesSingleStepsOnRandomArrays) {
  std::mt19937 random(11);
  for (int round = 0; round < 400; ++round) {
    ElementArray fast;
    ElementArray slow;
    const auto pick = [&](uint32_t n) { return static_cast<int32_t>(random() % n); };
    const int32_t dims = 1 + pick(3), x = 1 + pick(4), y = 1 + pick(3), count = pick(70);
    const int32_t autoSelect = pick(2);
    for (ElementArray* a : {&fast, &slow}) {
      a->settings.autoSelectNewRows = autoSelect;
      a->setDimensions(3);
      a->setBoundary(1, x);
      a->setBoundary(2, y);
      a->setDimensions(dims);
      if (round % 3 == 0) a->setBoundary(0, 1 + round % 4);
      for (int32_t i = 1; i <= count; ++i) a->appendValue(i);
      for (int32_t i = 0; i < count; i += 3) a->setKeyValue(i + 1, i);
      for (uint8_t& state : a->rowStates) state = RowSelected + (state + round) % 2;
    }
    for (int step = 0; step < 2; ++step) {
      const int32_t d = pick(3), n = 1 + pick(5);
      fast.resizeBoundary(d, n);
      resizeStepByStep(slow, d, n);
      ASSERT_EQ(contents(fast), contents(slow)) << "round " << round << " d " << d << " n " << n;
      for (int32_t i = 0; i < fast.size(); ++i) ASSERT_EQ(fast.getKeyValue(i), slow.getKeyValue(i));
      ASSERT_EQ(fast.capacity(), slow.capacity()) << "round " << round;
      ASSERT_EQ(fast.boundaryEntry(d), slow.boundaryEntry(d));
      ASSERT_EQ(fast.rowStates, slow.rowStates) << "round " << round;
    }
  }
}

// States belong to positions, not rows: edits that change the row count drop or add
// positions at the end, new ones from the automatic selection; key setters change none.
TEST(RowStates, StatesBelongToPositionsNotRows) {
  ElementArray a = shaped(2, 3);
  EXPECT_EQ(a.indexOfDimIndex(nullptr), 0);  // no list at all reads as index 0
  a.settings.autoSelectNewRows = true;
  for (int i = 1; i <= 6; ++i) a.appendValue(i);
  a.rowStates = {U, S};
  a.deleteAt(4);
  EXPECT_EQ(a.rowStates, (States{U}));
  for (int i = 0; i < 4; ++i) a.insertValue(9, 0);
  EXPECT_EQ(a.rowStates, (States{U, S, S}));
  a.settings.autoSelectNewRows = false;
  EXPECT_EQ(a.rowStates, (States{U, S, S}));
  for (int i = 0; i < 3; ++i) a.appendValue(9);
  EXPECT_EQ(a.rowStates, (States{U, S, S, U}));
  a.setKeyValue(1, 0);
  EXPECT_EQ(a.rowStates.size(), 4u);

  // Setting changes bring the list up to date.
  a.settings.autoSelectNewRows = true;
  a.setBoundary(1, 4);
  EXPECT_EQ(a.rowStates, (States{U, S, S}));
  a.setBoundary(1, 2);
  EXPECT_EQ(a.rowStates, (States{U, S, S, S, S, S}));
  a.setDimensions(3);
  EXPECT_TRUE(a.rowStates.empty());
  a.setDimensions(2);
  EXPECT_EQ(a.rowStates, (States{S, S, S, S, S, S}));
  a.clear();
  EXPECT_TRUE(a.rowStates.empty());
}

// Whatever happens, there is exactly one state per table row.
TEST(RowStates, AlwaysOnePerTableRow) {
  std::mt19937 random(7);
  ElementArray a = shaped(2, 3);
  for (int step = 0; step < 3000; ++step) {
    const int32_t pick = static_cast<int32_t>(random() % 100);
    const int32_t index = static_cast<int32_t>(random() % 40) - 2;
    const int32_t small = static_cast<int32_t>(random() % 6) - 1;
    if (pick < 30) {
      a.appendValue(index);
    } else if (pick < 45) {
      a.insertString("t", index);
    } else if (pick < 60) {
      a.deleteAt(index);
    } else if (pick < 68) {
      a.setValue(small, index);
    } else if (pick < 74) {
      a.setBoundary(small, small + 1);
    } else if (pick < 82) {
      a.resizeBoundary(small, small + static_cast<int32_t>(random() % 3));
    } else if (pick < 88) {
      a.setDimensions(pick < 85 ? 2 : small);
    } else if (pick < 90) {
      a.clear();
    } else if (pick < 95) {
      a.settings.autoSelectNewRows = small > 1 ? 1 : 0;
    } else if (a.size() > 60) {
      a.deleteAt(0);
    }
    ASSERT_EQ(a.rowStates.size(), static_cast<size_t>(a.tableRowCount())) << "step " << step;
    for (uint8_t state : a.rowStates) ASSERT_TRUE(state == S || state == U);
    ASSERT_LT(a.size(), 100000);
  }
}

// The all-or-nothing guard: an edit that is not committed leaves the array exactly as
// it was, whatever its kind; one that is committed keeps everything it did.
// Everything an edit may change, as one text: elements, capacity, shape, row states.
std::string state(ElementArray& a) {
  std::string out = "[" + contents(a) + "] cap " + std::to_string(a.capacity()) + " dims " +
                    std::to_string(a.dimensions()) + " x " + std::to_string(a.boundary(1)) +
                    " rows";
  for (uint8_t s : a.rowStates) out += " " + std::to_string(s);
  return out + (a.labels ? " labelled" : "");
}

// A 2-column table of 3 rows, the middle one selected.
ElementArray table() {
  ElementArray a = shaped(2, 2);
  for (int i = 0; i < 6; ++i) a.appendValue(i);
  a.rowStates[1] = RowSelected;
  return a;
}

TEST(ArrayEdit, UndoneUnlessCommitted) {
  ElementArray a = table();
  const std::string before = state(a);
  {  // Growing: appends past a capacity step, a new shape, labels.
    ArrayEdit edit(a, ArrayEdit::Growing);
    for (int i = 0; i < 40; ++i) a.appendString("g");
    a.setDimensions(3);
    a.labels.emplace();
  }
  EXPECT_EQ(state(a), before);
  {  // InsertingAt: inserts in the middle, a swapped cell, growth past the end.
    std::vector<Element> cells;
    cells.push_back(Element::of(ElementValue::ofText("swapped")));
    ArrayEdit edit(a, ArrayEdit::InsertingAt, 2);
    a.insertString("i", 2);
    a.insertString("j", 2);
    edit.swapIn(0, cells);
    ArrayEdit growth(a, ArrayEdit::InsertingAt, a.size());
    a.setString("far", 60);
  }
  EXPECT_EQ(state(a), before);
  {  // Replacing: the array itself is never touched; the copy keeps its shape.
    ArrayEdit edit(a, ArrayEdit::Replacing);
    EXPECT_EQ(state(edit.target()), "[] cap 25 dims 2 x 2 rows");
    edit.target().appendString("new");
  }
  EXPECT_EQ(state(a), before);
}

TEST(ArrayEdit, CommittedEditsStay) {
  ElementArray a = table();
  {
    ArrayEdit edit(a, ArrayEdit::Replacing);
    edit.target().appendString("p");
    edit.target().appendString("q");
    edit.commit();
  }
  EXPECT_EQ(contents(a), "p|q");
  EXPECT_EQ(a.boundary(1), 2);
  {
    std::vector<Element> cells;
    cells.push_back(Element::of(ElementValue::ofValue(7)));
    ArrayEdit edit(a, ArrayEdit::InsertingAt, a.size());
    edit.swapIn(1, cells);
    a.setString("r", 2);
    edit.commit();
  }
  EXPECT_EQ(contents(a), "p|#7|r");
}

}  // namespace
}  // namespace quorrel
