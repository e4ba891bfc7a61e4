#include <gtest/gtest.h>

#include <random>
#include <string>
#include <vector>

#include "array/element_array.h"

namespace quorrel {
namespace {

// A plain model of what the array holds: each element's text form and key text.
struct Model {
  std::vector<std::string> texts;
  std::vector<std::string> keys;  // "-" for no key
};

void expectSame(ElementArray& a, const Model& m, int step) {
  ASSERT_EQ(a.size(), static_cast<int32_t>(m.texts.size())) << "step " << step;
  for (int32_t i = 0; i < a.size(); ++i) {
    ASSERT_EQ(std::string(a.getString(i)), m.texts[static_cast<size_t>(i)]) << "step " << step;
    const char* key = a.getKeyString(i);
    ASSERT_EQ(key == nullptr ? std::string("-") : std::string(key), m.keys[static_cast<size_t>(i)])
        << "step " << step << " index " << i;
  }
}

// Edits at the front, in the middle and at the back, with keys and every value type,
// agree with a vector of texts.
TEST(StoreModel, EditsEverywhereAgreeWithAPlainVector) {
  std::mt19937 random(5);
  ElementArray a;
  Model m;
  for (int step = 0; step < 20000; ++step) {
    const auto size = static_cast<int32_t>(m.texts.size());
    const int pick = static_cast<int>(random() % 100);
    int32_t index = size == 0 ? 0 : static_cast<int32_t>(random() % static_cast<unsigned>(size));
    if (pick % 3 == 0) index = pick % 2 == 0 ? 0 : std::max(size - 1, 0);
    const int32_t value = static_cast<int32_t>(random() % 5);
    const std::string text = "t" + std::to_string(step);
    if (pick < 40 || size < 50) {
      if (pick % 2 == 0) {
        a.insertValue(value, index);
      } else {
        a.insertString(text.c_str(), index);
      }
      const std::string shown = pick % 2 == 0 ? (value == 0 ? "" : std::to_string(value)) : text;
      m.texts.insert(m.texts.begin() + index, shown);
      m.keys.insert(m.keys.begin() + index, "-");
    } else if (pick < 80) {
      a.deleteAt(index);
      m.texts.erase(m.texts.begin() + index);
      m.keys.erase(m.keys.begin() + index);
    } else if (pick < 88) {
      a.setKeyString(text.c_str(), index);
      m.keys[static_cast<size_t>(index)] = text;
    } else if (pick < 92) {
      a.setKeyValue(value, index);
      m.keys[static_cast<size_t>(index)] = value == 0 ? "" : std::to_string(value);
    } else if (pick < 96) {
      a.setValue(value, index);
      m.texts[static_cast<size_t>(index)] = value == 0 ? "" : std::to_string(value);
    } else {
      a.setFile({"bytes", 5}, index);
      m.texts[static_cast<size_t>(index)] = "";
    }
    if (step % 97 == 0) expectSame(a, m, step);
  }
  expectSame(a, m, -1);
}

TEST(StoreModel, KeysSurviveEveryChangeOfValue) {
  NumberText scratch;
  Element e;
  e.setKey(ElementValue::ofText("k"));  // a key on a None element
  EXPECT_EQ(e.type(), ElementType::None);
  EXPECT_STREQ(e.key()->asString(scratch), "k");
  const ElementValue values[] = {ElementValue::ofValue(7),       ElementValue::ofText("text"),
                                 ElementValue::ofBytes("ab", 2), ElementValue::ofValue(0),
                                 ElementValue::ofValue(-1),      ElementValue::ofText("")};
  for (const ElementValue& v : values) {
    e.assign(v);
    ASSERT_NE(e.key(), nullptr);
    EXPECT_STREQ(e.key()->asString(scratch), "k");
  }
  EXPECT_EQ(e.type(), ElementType::String);
  EXPECT_EQ(e.size(), 1);

  // Removing and adding keys keeps the value, whatever it is.
  for (const ElementValue& v : values) {
    e.assign(v);
    e.deleteKey();
    EXPECT_EQ(e.key(), nullptr);
    EXPECT_EQ(e.type(), v.type == ElementType::Value && v.number == 0 ? ElementType::None : v.type);
    e.setKey(ElementValue::ofValue(3));
    e.setKey(ElementValue::ofValue(4));
    EXPECT_EQ(e.key()->asValue(), 4);
    EXPECT_EQ(e.asValue(), v.type == ElementType::Value ? v.number : 0);
    e.deleteKey();
    e.setKey(ElementValue::ofText("again"));
    EXPECT_STREQ(e.key()->asString(scratch), "again");
  }

  // Moving an element moves its key and leaves the source empty.
  Element moved(std::move(e));
  EXPECT_EQ(e.type(), ElementType::None);
  EXPECT_EQ(e.key(), nullptr);
  EXPECT_STREQ(moved.key()->asString(scratch), "again");
  std::swap(e, moved);
  EXPECT_STREQ(e.key()->asString(scratch), "again");
  EXPECT_EQ(moved.key(), nullptr);
}

}  // namespace
}  // namespace quorrel
