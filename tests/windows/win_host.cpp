// A small Windows host for the DLL, run under Wine by the test suite: it loads the
// DLL, finds every entry point by ordinal, creates an instance from a setup record,
// runs a few actions and expressions through the routine tables with host services of
// its own, and walks the real menus that GetActionMenu and GetExpressionMenu build.
// Prints one line per check and exits with the number of failures.
#include <windows.h>

#include <cstdio>
#include <cstring>
#include <string>
#include <vector>

#include "host/abi.h"

namespace abi = quorrel::abi;

namespace {

int failures = 0;

void check(bool ok, const std::string& what) {
  std::printf("%s %s\n", ok ? "ok  " : "FAIL", what.c_str());
  if (!ok) ++failures;
}

template <typename Fn>
Fn byOrdinal(HMODULE dll, WORD ordinal, const char* name) {
  FARPROC byNumber = GetProcAddress(dll, MAKEINTRESOURCEA(ordinal));
  FARPROC byName = GetProcAddress(dll, name);
  check(byNumber != nullptr && byNumber == byName,
        std::string(name) + " at ordinal " + std::to_string(ordinal));
  return reinterpret_cast<Fn>(reinterpret_cast<void*>(byNumber));
}

// Host services: parameters come from a list, result texts from host buffers.
std::vector<abi::HostWord> parameters;
std::size_t nextParameter = 0;
std::vector<std::string> resultBuffers;

abi::HostWord QUORREL_CALL fetchFirst(void*, int32_t, abi::HostWord) {
  nextParameter = 1;
  return parameters.at(0);
}
abi::HostWord QUORREL_CALL fetchNext(void*, int32_t, abi::HostWord) {
  return parameters.at(nextParameter++);
}
char* QUORREL_CALL allocateResult(void*, int32_t size, int32_t) {
  resultBuffers.emplace_back(static_cast<std::size_t>(size), '\0');
  return resultBuffers.back().data();
}

int countCommands(HMENU menu) {
  int count = 0;
  for (int i = 0; i < GetMenuItemCount(menu); ++i) {
    if (HMENU sub = GetSubMenu(menu, i)) {
      count += countCommands(sub);
    } else if (GetMenuItemID(menu, i) != 0) {
      ++count;
    }
  }
  return count;
}

std::string itemText(HMENU menu, int position) {
  char text[80] = {};
  GetMenuStringA(menu, static_cast<UINT>(position), text, sizeof text, MF_BYPOSITION);
  return text;
}

void walkMenus(HMODULE dll) {
  auto conditionMenu = byOrdinal<abi::GetMenuFn>(dll, 60, "GetConditionMenu");
  auto actionMenu = byOrdinal<abi::GetMenuFn>(dll, 61, "GetActionMenu");
  auto expressionMenu = byOrdinal<abi::GetMenuFn>(dll, 62, "GetExpressionMenu");
  if (!conditionMenu || !actionMenu || !expressionMenu) return;

  check(conditionMenu(0, 0, 0) == nullptr, "GetConditionMenu gives no menu");

  HMENU actions = static_cast<HMENU>(actionMenu(0, 0, 0));
  check(actions != nullptr && IsMenu(actions), "GetActionMenu gives a menu");
  if (actions) {
    const int count = GetMenuItemCount(actions);
    check(itemText(actions, 0) == "File" && GetSubMenu(actions, 0), "first item is File");
    HMENU settings = GetSubMenu(actions, count - 1);
    check(itemText(actions, count - 1) == "Settings" && settings, "last item is Settings");
    if (settings) {
      const int last = GetMenuItemCount(settings) - 1;
      check(GetMenuItemID(settings, last) == 25057 &&
                itemText(settings, last) == "Set list delimiter",
            "Settings ends with 25057 Set list delimiter");
    }
    check(countCommands(actions) == 79, "79 action commands");
    DestroyMenu(actions);
  }

  HMENU expressions = static_cast<HMENU>(expressionMenu(0, 0, 0));
  check(expressions != nullptr, "GetExpressionMenu gives a menu");
  if (expressions) {
    check(GetMenuItemID(expressions, 0) == 27000 && itemText(expressions, 0) == "Get size",
          "27000 Get size first");
    check(GetMenuItemID(expressions, 1) == 27001 && itemText(expressions, 1) == "Get capacity",
          "27001 Get capacity second");
    check(countCommands(expressions) == 60, "60 expression commands");
    DestroyMenu(expressions);
  }
}

void editorStrings(HMODULE dll) {
  auto actionString = byOrdinal<abi::GetStringFn>(dll, 67, "GetActionString");
  auto expressionString = byOrdinal<abi::GetStringFn>(dll, 68, "GetExpressionString");
  auto actionTitle = byOrdinal<abi::GetParamTitleFn>(dll, 73, "GetActionTitle");
  auto actionCode = byOrdinal<abi::GetCodeFromMenuFn>(dll, 64, "GetActionCodeFromMenu");
  if (!actionString || !expressionString || !actionTitle || !actionCode) return;
  char buffer[256] = {};
  actionString(nullptr, 17, buffer, sizeof buffer);
  check(std::strcmp(buffer, "10%s: Delete all") == 0, "display string of action 17");
  check(actionString(nullptr, 6, buffer, 10) == 9 && std::strcmp(buffer, "11%s: Ins") == 0,
        "display string cut to 10 characters");
  check(
      expressionString(nullptr, 0, buffer, sizeof buffer) == 5 && std::strcmp(buffer, "size(") == 0,
      "name of expression 0");
  actionTitle(nullptr, 44, 1, buffer, sizeof buffer);
  check(std::strcmp(buffer, "Sort rows by label value ascending") == 0, "title of action 44");
  check(actionCode(nullptr, 25078) == 78 && actionCode(nullptr, 25079) == -1,
        "action codes from menu ids");
}

void runScript(HMODULE dll) {
  auto getInfos = byOrdinal<abi::GetInfosFn>(dll, 2, "GetInfos");
  auto runInfos = byOrdinal<abi::GetRunObjectInfosFn>(dll, 59, "GetRunObjectInfos");
  auto dataSize = byOrdinal<abi::GetRunObjectDataSizeFn>(dll, 80, "GetRunObjectDataSize");
  auto create = byOrdinal<abi::CreateRunObjectFn>(dll, 50, "CreateRunObject");
  auto destroy = byOrdinal<abi::DestroyRunObjectFn>(dll, 51, "DestroyRunObject");
  if (!getInfos || !runInfos || !dataSize || !create || !destroy) return;

  check(getInfos(0) == 512 && getInfos(7) == 243, "GetInfos answers");
  check(dataSize(0, 0) == 192, "run record of 192 bytes");

  unsigned char info[64] = {};
  check(runInfos(0, info) == 1, "GetRunObjectInfos");
  abi::ActionRoutine* actions = nullptr;
  abi::ExpressionRoutine* expressions = nullptr;
  std::memcpy(&actions, info + 4, 4);
  std::memcpy(&expressions, info + 8, 4);
  check(std::memcmp(info + 28, "RQUZ", 4) == 0, "identifier RQUZ at byte 28");

  std::vector<unsigned char> header(920, 0);
  auto first = &fetchFirst;
  auto next = &fetchNext;
  auto allocate = &allocateResult;
  std::memcpy(header.data() + 876, &first, 4);
  std::memcpy(header.data() + 880, &next, 4);
  std::memcpy(header.data() + 916, &allocate, 4);
  std::vector<unsigned char> record(192, 0);
  unsigned char* headerAddress = header.data();
  std::memcpy(record.data() + 8, &headerAddress, 4);

  std::vector<unsigned char> setup(1076, 0);
  const int32_t two = 2, three = 3, on = 1;
  std::memcpy(setup.data() + 24, &two, 4);
  std::memcpy(setup.data() + 28, &three, 4);
  std::memcpy(setup.data() + 44, ",", 2);
  std::memcpy(setup.data() + 1072, &on, 4);
  check(create(record.data(), setup.data(), 0) == 0, "CreateRunObject");

  const auto text = [](const char* t) { return reinterpret_cast<abi::HostWord>(t); };
  actions[34](record.data(), text("a,b,7"), 0);  // Append row from list
  actions[9](record.data(), 12, 0);              // Append value
  parameters = {};
  check(expressions[0](record.data(), 0) == 4, "size( is 4");
  parameters = {0};
  const abi::HostWord row = expressions[41](record.data(), 0);  // rowList$( 0
  uint16_t flags = 0;
  std::memcpy(&flags, record.data() + 124, 2);
  check(
      row != 0 && std::strcmp(reinterpret_cast<const char*>(row), "a,b,7") == 0 && (flags & 0x8000),
      "rowList$(0) is a,b,7 with the string flag");
  parameters = {3};
  check(expressions[3](record.data(), 0) == 12, "get(3) is 12");
  parameters = {1, 1};
  check(expressions[39](record.data(), 0) == 4, "indexOfXY(1, 1) is 4");
  check(destroy(record.data(), 0) == 0, "DestroyRunObject");
}

}  // namespace

int main(int argc, char** argv) {
  if (argc < 2) {
    std::printf("usage: quorrel_winhost quorrel.dll\n");
    return 2;
  }
  HMODULE dll = LoadLibraryA(argv[1]);
  check(dll != nullptr, std::string("LoadLibrary ") + argv[1]);
  if (!dll) return failures;
  runScript(dll);
  walkMenus(dll);
  editorStrings(dll);
  FreeLibrary(dll);
  std::printf("%d failure(s)\n", failures);
  return failures;
}
