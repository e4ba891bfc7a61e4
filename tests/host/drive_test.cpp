// Every action and every expression, called in code order on a live table, twice:
// each action answers 0, and every text result is a complete copy in its buffer.
#include <cstdio>

#include "param_types.h"
#include "test_host.h"

namespace testhost {
namespace {

TEST(DriveTest, EveryActionAndExpressionOnALiveInstance) {
  ASSERT_TRUE(Module::get().loaded()) << Module::get().error();
  const std::string path = ::testing::TempDir() + "quorrel_host_drive.dat";
  Instance t(SetupRecord().set(kSetupXBoundary, 3).set(kSetupAutoSelectRows, 1));
  for (int round = 0; round < 2; ++round) {
    t.action(34, "a,1,x");
    t.action(34, "b,2,y");
    t.action(48, "name", 0);
    for (int code = 0; code < 79; ++code) {
      const char* types = kActionParams[code];
      Arg p1 = types[0] == 'T' ? Arg(path) : Arg(1);
      Arg p2 = types[1] == 'T' ? Arg(path) : Arg(1);
      EXPECT_EQ(t.action(code, p1, p2), 0) << "action " << code;
    }
    for (int code = 0; code < 60; ++code) {
      std::vector<Arg> args;
      for (int i = 0; i < 2; ++i) {
        if (kExpressionParams[code][i] == 'I') args.emplace_back(0);
        if (kExpressionParams[code][i] == 'T') args.emplace_back("name");
      }
      t.setFlags(0);
      const HostWord result = t.expression(code, args);
      if (t.flags() == kResultIsString) {
        ASSERT_EQ(t.allocations.size(), 1u) << "expression " << code;
        const char* text = reinterpret_cast<const char*>(result);
        EXPECT_EQ(std::strlen(text) + 1, static_cast<std::size_t>(t.allocations[0]));
      } else {
        EXPECT_TRUE(t.allocations.empty()) << "expression " << code;
      }
    }
  }
  std::remove(path.c_str());
}

}  // namespace
}  // namespace testhost
