// Action names and the help page's prose as the quorrel command reads them.
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
}

TEST(Catalog, DescriptionsComeFromTheHelpPageBlocks) {
  const auto label = describe(true, 48);
  ASSERT_TRUE(label);
  EXPECT_EQ(label->params, (std::vector<std::string>{"the label text", "column index"}));
  EXPECT_EQ(label->prose.rfind("Names a column.", 0), 0u);
  EXPECT_FALSE(label->bad.empty());
  const auto size = describe(false, 0);
  ASSERT_TRUE(size);
  EXPECT_TRUE(size->params.empty());
  EXPECT_EQ(size->prose, "The number of elements.");
  // The file actions' paths are where the help page says.
  EXPECT_EQ(describe(true, 19)->params[actionEntry(19).pathParam], "path of the file to extend");
  EXPECT_FALSE(describe(true, abi::kActionCount));
}

}  // namespace
}  // namespace quorrel::tool
