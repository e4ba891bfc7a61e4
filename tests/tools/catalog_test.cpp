// Action names as the quorrel command reads them; the descriptions it shows from the
// help page are pinned by the names_list case.
#include "catalog.h"

#include <gtest/gtest.h>

#include "host/abi.h"

namespace quorrel::tool {
namespace {

TEST(Catalog, EveryActionNameIsUniqueAndFindsItsCode) {
  for (int32_t code = 0; code < abi::kActionCount; ++code) {
    EXPECT_EQ(actionCodeOfName(actionEntry(code).name), code) << actionEntry(code).name;
  }
  EXPECT_FALSE(actionCodeOfName("SetLabel"));
  EXPECT_FALSE(actionCodeOfName(""));
  EXPECT_FALSE(describe(true, abi::kActionCount));
}

}  // namespace
}  // namespace quorrel::tool
