// The DLL's export and import tables, read back from the file.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cctype>
#include <fstream>
#include <sstream>

#include "windows/dll_image.h"

namespace quorrel::pe {
namespace {

struct EntryPoint {
  const char* name;
  uint32_t ordinal;
  uint32_t argumentBytes;  // four per 32-bit argument
};

// Every entry point the host calls, with its ordinal and argument count.
constexpr EntryPoint kEntryPoints[] = {
    {"GetInfos", 2, 4},
    {"CreateObject", 14, 12},
    {"GetHelpFileName", 16, 0},
    {"EditObject", 18, 16},
    {"GetObjectRect", 19, 16},
    {"GetObjInfos", 36, 28},
    {"CreateRunObject", 50, 12},
    {"DestroyRunObject", 51, 8},
    {"HandleRunObject", 52, 4},
    {"DisplayRunObject", 53, 4},
    {"ReInitRunObject", 56, 4},
    {"PauseRunObject", 57, 4},
    {"ContinueRunObject", 58, 4},
    {"GetRunObjectInfos", 59, 8},
    {"GetConditionMenu", 60, 12},
    {"GetActionMenu", 61, 12},
    {"GetExpressionMenu", 62, 12},
    {"GetConditionCodeFromMenu", 63, 8},
    {"GetActionCodeFromMenu", 64, 8},
    {"GetExpressionCodeFromMenu", 65, 8},
    {"GetConditionString", 66, 16},
    {"GetActionString", 67, 16},
    {"GetExpressionString", 68, 16},
    {"GetConditionTitle", 72, 20},
    {"GetActionTitle", 73, 20},
    {"GetExpressionTitle", 74, 16},
    {"GetConditionInfos", 75, 8},
    {"GetActionInfos", 76, 8},
    {"GetExpressionInfos", 77, 8},
    {"GetRunObjectDataSize", 80, 8},
};

std::vector<Export> expectedExports() {
  std::vector<Export> exports;
  for (const EntryPoint& e : kEntryPoints) exports.push_back({e.name, e.ordinal});
  return exports;
}

std::vector<Export> sortedByOrdinal(std::vector<Export> exports) {
  std::sort(exports.begin(), exports.end(),
            [](const Export& a, const Export& b) { return a.ordinal < b.ordinal; });
  return exports;
}

std::string lower(std::string text) {
  for (char& c : text) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  return text;
}

TEST(DllHeaders, IsA32BitX86Dll) {
  const Image& image = dllImage();
  EXPECT_EQ(image.machine, 0x14c);  // i386
  EXPECT_EQ(image.optionalMagic, 0x10b);
  EXPECT_TRUE(image.characteristics & 0x2000) << "not marked as a DLL";
  EXPECT_EQ(lower(image.exportDllName), "quorrel.dll");
}

TEST(DllExports, ExactlyTheEntryPointsByPlainNameAndOrdinal) {
  const Image& image = dllImage();
  EXPECT_THAT(sortedByOrdinal(image.exports), ::testing::ElementsAreArray(expectedExports()));
  // Nothing is exported by ordinal alone, and no stdcall decoration leaks out.
  EXPECT_EQ(image.exportSlotsInUse, std::size(kEntryPoints));
  for (const Export& e : image.exports) {
    EXPECT_EQ(e.name.find('@'), std::string::npos) << e.name;
    EXPECT_NE(e.name.front(), '_') << e.name;
  }
  EXPECT_LE(image.ordinalBase, 2u);
  // GetProcAddress searches the name table by bisection: it must be in byte order.
  std::vector<std::string> names;
  for (const Export& e : image.exports) names.push_back(e.name);
  EXPECT_TRUE(std::is_sorted(names.begin(), names.end()));
}

// The list the .def and the Linux version script are generated from must say the same.
TEST(DllExports, EntryPointListMatchesTheHostsTable) {
  std::ifstream in(QUORREL_ENTRY_POINTS);
  ASSERT_TRUE(in) << QUORREL_ENTRY_POINTS;
  std::vector<std::tuple<std::string, uint32_t, uint32_t>> listed;
  for (std::string line; std::getline(in, line);) {
    if (line.empty() || line[0] == '#') continue;
    std::istringstream fields(line);
    std::string name;
    uint32_t ordinal = 0, bytes = 0;
    fields >> name >> ordinal >> bytes;
    listed.emplace_back(name, ordinal, bytes);
  }
  std::vector<std::tuple<std::string, uint32_t, uint32_t>> expected;
  for (const EntryPoint& e : kEntryPoints)
    expected.emplace_back(e.name, e.ordinal, e.argumentBytes);
  std::sort(listed.begin(), listed.end());
  std::sort(expected.begin(), expected.end());
  EXPECT_EQ(listed, expected);
}

bool isSystemDll(const std::string& name) {
  const std::string dll = lower(name);
  return dll == "kernel32.dll" || dll == "user32.dll" || dll == "msvcrt.dll" ||
         dll == "ucrtbase.dll" || dll.rfind("api-ms-win-crt-", 0) == 0;
}

TEST(DllImports, OnlySystemDlls) {
  const Image& image = dllImage();
  ASSERT_FALSE(image.importedDlls.empty());
  for (const std::string& dll : image.importedDlls) {
    EXPECT_TRUE(isSystemDll(dll)) << "imports " << dll;
  }
  EXPECT_TRUE(image.delayImportedDlls.empty());
  std::vector<std::string> names;
  for (const std::string& dll : image.importedDlls) names.push_back(lower(dll));
  // Menus, strings and the dialog come from USER32; the module handle from KERNEL32.
  EXPECT_THAT(names, ::testing::Contains("kernel32.dll"));
  EXPECT_THAT(names, ::testing::Contains("user32.dll"));
}

}  // namespace
}  // namespace quorrel::pe
