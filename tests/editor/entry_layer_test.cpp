// The editor's entry points: the menus, menu codes, titles and display strings, and the
// entry layer as a careless or failing host meets it: codes out of range, null and
// destroyed records, stale handles, and allocations that throw inside every family of
// entry points, where nothing may crash and no exception may leave an entry point. The
// menu trees (ids, texts and item states) and every code's texts are pinned by the
// editor script case (tests/tools/cases/editor.out); these pin what that output does
// not show: ownership, lengths, cuts.
#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <new>
#include <utility>
#include <vector>

#include "host/entry_points.h"
#include "host/run_record.h"
#include "hostsim/host_simulator.h"
#include "platform/windows_services.h"

namespace {

// While set, every operator new of the process throws; the count shows that the code
// under test did try to allocate.
bool refuseAllocations = false;
int refused = 0;

}  // namespace

// The replacement pair is malloc and free, which GCC takes for a mismatch where it
// inlines them into standard containers.
#pragma GCC diagnostic ignored "-Wmismatched-new-delete"

void* operator new(std::size_t size) {
  if (refuseAllocations) {
    ++refused;
    throw std::bad_alloc();
  }
  if (void* p = std::malloc(size == 0 ? 1 : size)) return p;
  throw std::bad_alloc();
}
void operator delete(void* p) noexcept {
  std::free(p);
}
void operator delete(void* p, std::size_t) noexcept {
  std::free(p);
}

namespace {

namespace abi = quorrel::abi;
namespace host = quorrel::host;
using abi::HostWord;
using quorrel::hostsim::Instance;

// The module linked into this program, driven as the host drives it.
const quorrel::hostsim::Module& module() {
  static const auto linked = quorrel::hostsim::Module::linked();
  return *linked;
}
const abi::ActionRoutine* actions() {
  return module().routines().actions;
}
const abi::ExpressionRoutine* expressions() {
  return module().routines().expressions;
}
const quorrel::ElementArray* arrayOf(Instance& instance) {
  return host::elementArrayOf(instance.record());
}

TEST(EntryLayer, CodesOutOfRangeGetNoEntryTitleOrString) {
  // The condition table's one entry is code 0; the low 16 bits of a code count.
  for (int32_t code : {-1, 79, 80, 0x7FFF, 0x8000, 0x1004F}) {
    EXPECT_EQ(GetActionInfos(nullptr, code), nullptr) << code;
  }
  for (int32_t code : {-1, 60, 0x7FFF, 0x1003C}) {
    EXPECT_EQ(GetExpressionInfos(nullptr, code), nullptr) << code;
  }
  for (int32_t code : {-1, 1, 2}) EXPECT_EQ(GetConditionInfos(nullptr, code), nullptr) << code;
  EXPECT_NE(GetActionInfos(nullptr, 78), nullptr);
  EXPECT_NE(GetExpressionInfos(nullptr, 0x1003B), nullptr);

  // Action 200 would be string 28400 (expression 0's name), expression -200 an action's.
  struct Call {
    const char* what;
    int32_t (*call)(char*, int32_t);
  };
  const Call calls[] = {
      {"action string 200", [](char* b, int32_t n) { return GetActionString(nullptr, 200, b, n); }},
      {"expression string -200",
       [](char* b, int32_t n) { return GetExpressionString(nullptr, -200, b, n); }},
      {"condition string 1",
       [](char* b, int32_t n) { return GetConditionString(nullptr, 1, b, n); }},
      {"action title 79", [](char* b, int32_t n) { return GetActionTitle(nullptr, 79, 0, b, n); }},
      {"action title -1", [](char* b, int32_t n) { return GetActionTitle(nullptr, -1, 1, b, n); }},
      {"expression title 60",
       [](char* b, int32_t n) { return GetExpressionTitle(nullptr, 60, b, n); }},
      {"condition title 1",
       [](char* b, int32_t n) { return GetConditionTitle(nullptr, 1, 0, b, n); }},
  };
  for (const Call& c : calls) {
    char buffer[64] = "untouched";
    EXPECT_EQ(c.call(buffer, sizeof buffer), 0) << c.what;
    EXPECT_STREQ(buffer, "") << c.what;
    EXPECT_EQ(c.call(nullptr, 64), 0) << c.what;
  }
}

TEST(EntryLayer, NullAndDestroyedRecordsAreRefused) {
  EXPECT_EQ(CreateRunObject(nullptr, nullptr, 0), 0);
  EXPECT_EQ(DestroyRunObject(nullptr, 0), 0);
  EXPECT_EQ(actions()[8](nullptr, reinterpret_cast<HostWord>("x"), 0), 0);
  EXPECT_EQ(expressions()[0](nullptr, 0), 0u);

  Instance instance(module());
  ASSERT_NE(arrayOf(instance), nullptr);
  actions()[8](instance.record(), reinterpret_cast<HostWord>("x"), 0);
  EXPECT_EQ(expressions()[0](instance.record(), 0), 1u);
  // A second destroy, and calls after the first, find no array (ASan sees any reuse).
  instance.destroy();
  EXPECT_EQ(arrayOf(instance), nullptr);
  EXPECT_EQ(DestroyRunObject(instance.record(), 0), 0);
  EXPECT_EQ(actions()[8](instance.record(), reinterpret_cast<HostWord>("x"), 0), 0);
  EXPECT_EQ(expressions()[0](instance.record(), 0), 0u);

  // A header without services: parameters arrive as 0 and no text is handed over.
  Instance bare(module());
  std::vector<unsigned char> noServices(abi::kRunHeaderMinSize, 0);
  host::writeField<void*>(bare.record(), abi::kRunHeader, noServices.data());
  actions()[8](bare.record(), reinterpret_cast<HostWord>("x"), 0);
  EXPECT_EQ(expressions()[16](bare.record(), 0), 0u);
  host::writeField<void*>(bare.record(), abi::kRunHeader, nullptr);
  EXPECT_EQ(expressions()[16](bare.record(), 0), 0u);
}

TEST(EntryLayer, StaleMenuHandlesNameNothing) {
  // Menus freed and made again, many times: no new handle is an old one, so the old
  // ones stay dead even where the allocator hands the same memory out again.
  std::vector<HMENU> dead;
  for (int i = 0; i < 100; ++i) {
    HMENU menu = CreatePopupMenu();
    ASSERT_NE(menu, nullptr);
    for (HMENU old : dead) ASSERT_NE(menu, old);
    ASSERT_TRUE(DestroyMenu(menu));
    dead.push_back(menu);
  }
  HMENU live = CreatePopupMenu();
  for (HMENU old : dead) {
    EXPECT_FALSE(DestroyMenu(old));
    EXPECT_EQ(GetMenuItemCount(old), -1);
    EXPECT_FALSE(AppendMenuA(old, MF_STRING, 1, "x"));
  }
  EXPECT_EQ(GetMenuItemCount(live), 0);
  DestroyMenu(live);
}

// With every allocation throwing, an entry point of each family answers its failure
// value (and the host may go on using the module). Expressions, whose texts are built
// inside the standard library here, are failed allocation by allocation in
// fuzz/alloc_faults.cpp.
TEST(EntryLayer, ThrowsInsideEveryFamilyStayInside) {
  module();  // the host's own tables are read before memory runs out
  Instance ready(module());
  for (const char* text : {"a", "b"})
    actions()[8](ready.record(), reinterpret_cast<HostWord>(text), 0);
  HMENU menu = CreatePopupMenu();
  std::vector<unsigned char> setup(abi::kSetupRecordSize, 0);
  Instance fresh(module(), {}, false);

  struct Call {
    const char* family;
    HostWord (*call)(Instance&, Instance&, HMENU, void*);
    HostWord failure;
  };
  const Call calls[] = {
      {"run object",
       [](Instance&, Instance& f, HMENU, void*) -> HostWord {
         CreateRunObject(f.record(), nullptr, 0);
         return arrayOf(f) != nullptr;
       },
       0},
      {"action",
       [](Instance& r, Instance&, HMENU, void*) -> HostWord {
         // A delimiter too long to be stored without an allocation.
         actions()[57](r.record(),
                       reinterpret_cast<HostWord>("; a delimiter of forty characters ;"), 0);
         return expressions()[0](r.record(), 0);  // the size
       },
       2},
      {"menu",
       [](Instance&, Instance&, HMENU, void*) {
         return reinterpret_cast<HostWord>(GetActionMenu(0, 0, 0));
       },
       0},
      {"title",
       [](Instance&, Instance&, HMENU, void*) -> HostWord {
         char buffer[64];
         return static_cast<HostWord>(GetActionTitle(nullptr, 6, 0, buffer, sizeof buffer));
       },
       0},
      {"editor",
       [](Instance&, Instance&, HMENU, void* s) -> HostWord {
         return static_cast<HostWord>(CreateObject(nullptr, 0, s));
       },
       static_cast<HostWord>(-1)},
      {"platform menus",
       [](Instance&, Instance&, HMENU m, void*) -> HostWord {
         return static_cast<HostWord>(AppendMenuA(m, MF_STRING, 1, "item")) +
                reinterpret_cast<HostWord>(CreatePopupMenu()) +
                reinterpret_cast<HostWord>(LoadMenuA(nullptr, MAKEINTRESOURCEA(20000)));
       },
       0},
  };
  for (const Call& c : calls) {
    refused = 0;
    refuseAllocations = true;
    const HostWord answer = c.call(ready, fresh, menu, setup.data());
    refuseAllocations = false;
    EXPECT_GT(refused, 0) << c.family;
    EXPECT_EQ(answer, c.failure) << c.family;
  }
  // Everything works again once memory is back.
  EXPECT_EQ(calls[1].call(ready, fresh, menu, setup.data()), 2u);
  const auto built = reinterpret_cast<HMENU>(calls[2].call(ready, fresh, menu, setup.data()));
  EXPECT_NE(built, nullptr);
  DestroyMenu(built);
  EXPECT_EQ(GetMenuItemCount(menu), 0);
  DestroyMenu(menu);
}

// Each call builds a new popup, which the caller owns: destroying one leaves the other.
TEST(EditorMenus, EveryCallIsFresh) {
  EXPECT_EQ(GetConditionMenu(0, 0, 0), nullptr);
  for (auto build : {GetActionMenu, GetExpressionMenu}) {
    HMENU first = static_cast<HMENU>(build(0, 0, 0));
    HMENU second = static_cast<HMENU>(build(0, 0, 0));
    ASSERT_TRUE(first && second);
    ASSERT_NE(first, second);
    const int items = GetMenuItemCount(first);
    EXPECT_TRUE(DestroyMenu(first));
    EXPECT_EQ(GetMenuItemCount(second), items);
    EXPECT_TRUE(DestroyMenu(second));
  }
}

TEST(EditorMenus, CodesFromMenuCommands) {
  // Only the low 16 bits of the id count.
  for (auto [id, code] : {std::pair{24999, -1},
                          {25000, 0},
                          {25057, 57},
                          {25078, 78},
                          {25079, -1},
                          {27000, -1},
                          {0x10000 + 25006, 6}}) {
    EXPECT_EQ(GetActionCodeFromMenu(nullptr, id), code) << id;
  }
  for (auto [id, code] :
       {std::pair{26999, -1}, {27000, 0}, {27059, 59}, {27060, -1}, {25000, -1}}) {
    EXPECT_EQ(GetExpressionCodeFromMenu(nullptr, id), code) << id;
  }
  for (int id : {0, 25000, 26000, 27000, -1}) EXPECT_EQ(GetConditionCodeFromMenu(nullptr, id), -1);
}

TEST(EditorStrings, LengthsCutsAndTablesEnds) {
  char buffer[256];
  char second[256];
  // Both parameters of an action share its title.
  for (int code = 0; code < 79; ++code) {
    EXPECT_NE(GetActionTitle(nullptr, code, 0, buffer, sizeof buffer), 0);
    GetActionTitle(nullptr, code, 1, second, sizeof second);
    EXPECT_STREQ(second, buffer) << code;
  }
  char small[16] = "untouched";
  EXPECT_NE(GetConditionTitle(nullptr, 0, 0, small, sizeof small), 0);  // no text, answers
  EXPECT_STREQ(small, "untouched");
  GetActionTitle(nullptr, 44, 0, small, 5);  // cut to the buffer, terminator included
  EXPECT_STREQ(small, "Sort");

  // A string's answer is its length as written: cut to the buffer, terminator included;
  // the size counts in 16 bits and the code in its low 16 bits. No conditions, so no
  // condition strings, nor strings past the tables.
  const struct {
    abi::GetStringFn get;
    int32_t code, size, answer;
    const char* text;
  } strings[] = {{GetActionString, 6, 256, 28, nullptr},
                 {GetActionString, 6, 10, 9, "11%s: Ins"},
                 {GetActionString, 6, 1, 0, ""},
                 {GetExpressionString, 39, 6, 5, "index"},
                 {GetActionString, 6, 0x1000A, 9, "11%s: Ins"},
                 {GetExpressionString, 0x20000, 256, 5, "size("},
                 {GetConditionString, 0, 256, 0, ""},
                 {GetActionString, 79, 256, 0, ""},
                 {GetExpressionString, 60, 256, 0, ""}};
  for (const auto& s : strings) {
    EXPECT_EQ(s.get(nullptr, s.code, buffer, s.size), s.answer) << s.code << " " << s.size;
    EXPECT_STREQ(s.text == nullptr ? buffer : s.text, buffer) << s.code << " " << s.size;
  }

  // Object information: four strings; the fifth does not exist, so the answer is 0.
  char name[255], author[255], copyright[255], comment[255], extra[255];
  std::memset(extra, 'x', sizeof extra);
  EXPECT_EQ(GetObjInfos(0, 0, name, author, copyright, comment, extra), 0);
  EXPECT_STREQ(name, "Quorrel object");
  EXPECT_STREQ(author, "Quorrel team");
  EXPECT_STREQ(extra, "");
}

}  // namespace
