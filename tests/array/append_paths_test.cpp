#include <gtest/gtest.h>

#include <string>

#include "array/element_array.h"

namespace quorrel {
namespace {

// Appends take a shortcut while they cannot change the capacity or the row count; the
// result must be that of inserting at the end, through growth, shrinking and tables.
TEST(AppendPaths, AppendsMatchInsertsAtTheEnd) {
  for (int32_t dims : {1, 2}) {
    ElementArray appended;
    ElementArray inserted;
    for (ElementArray* a : {&appended, &inserted}) {
      a->setDimensions(dims);
      if (dims == 2) a->setBoundary(1, 3);
    }
    for (int step = 0; step < 400; ++step) {
      if (step % 97 == 96) {
        // Delete most of the array so that the capacity shrinks on the next appends.
        while (appended.size() > 3) {
          appended.deleteAt(0);
          inserted.deleteAt(0);
        }
      }
      const std::string text = step % 5 == 0 ? std::string() : "t" + std::to_string(step);
      if (step % 3 == 0) {
        appended.appendValue(step);
        inserted.insertValue(step, inserted.size());
      } else if (step % 7 == 0) {
        appended.appendString(nullptr);
        inserted.insertString(nullptr, inserted.size());
      } else {
        appended.appendString(text.c_str());
        inserted.insertString(text.c_str(), inserted.size());
      }
      ASSERT_EQ(appended.size(), inserted.size()) << "dims " << dims << " step " << step;
      ASSERT_EQ(appended.capacity(), inserted.capacity()) << "dims " << dims << " step " << step;
      ASSERT_EQ(appended.rowStates, inserted.rowStates) << "dims " << dims << " step " << step;
      const int32_t last = appended.size() - 1;
      ASSERT_EQ(appended.at(last).type(), inserted.at(last).type()) << "step " << step;
      ASSERT_STREQ(appended.getString(last), inserted.getString(last)) << "step " << step;
    }
  }
}

}  // namespace
}  // namespace quorrel
