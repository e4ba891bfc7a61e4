// The host tests drive the built module through the host simulator, loaded once for
// the whole test program.
#pragma once

#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "hostsim/host_simulator.h"

namespace testhost {

using namespace quorrel::abi;
using quorrel::hostsim::SetupRecord;
using Arg = quorrel::hostsim::Argument;

struct LoadedModule {
  std::unique_ptr<quorrel::hostsim::Module> module;
  std::string error;
};
inline LoadedModule& loadedModule() {
  static LoadedModule loaded = [] {
    LoadedModule l;
    try {
      l.module = quorrel::hostsim::Module::open(QUORREL_MODULE_PATH);
    } catch (const std::exception& error) {
      l.error = error.what();
    }
    return l;
  }();
  return loaded;
}
// Throws (a failed test) when the module could not be loaded.
inline const quorrel::hostsim::Module& module() {
  if (!loadedModule().module) throw std::runtime_error(loadedModule().error);
  return *loadedModule().module;
}
#define ASSERT_MODULE_LOADED() ASSERT_NE(loadedModule().module, nullptr) << loadedModule().error

inline void* symbol(const char* name) {
  return module().symbol(name);
}
template <typename Fn>
Fn entry(const char* name) {
  return module().entry<Fn>(name);
}

// A code's declared parameter types as letters, from its information entry (the
// names_list case pins them): T text, N number (actions) or I integer (expressions),
// '-' none.
inline std::string parameterLetters(const quorrel::hostsim::Signature& signature) {
  std::string letters = "--";
  for (int i = 0; i < signature.paramCount; ++i) {
    const uint16_t type = signature.paramTypes[i];
    letters[i] = type == 45 || type == 3 ? 'T' : type == 22 ? 'N' : type == 1 ? 'I' : '?';
  }
  return letters;
}
inline std::string actionParams(int code) {
  return parameterLetters(module().actionSignature(code));
}
inline std::string expressionParams(int code) {
  return parameterLetters(module().expressionSignature(code));
}

class Instance : public quorrel::hostsim::Instance {
 public:
  explicit Instance(SetupRecord setup = SetupRecord(), bool createNow = true)
      : quorrel::hostsim::Instance(module(), std::move(setup), createNow) {}

  void* elementArray() { return readField<void*>(record(), kRunElementArray); }
  int32_t betweenColumn() { return readField<int32_t>(record(), kRunBetweenColumn); }

  int16_t action(int code, const Arg& p1 = Arg(), const Arg& p2 = Arg()) {
    return callAction(code, {p1, p2});
  }
  // Results as the host reads them, each call checked against the host's rules, with
  // other host flags set to show that they stay.
  int32_t number(int code, std::vector<Arg> params = {}) {
    setFlags(0x0101);
    const auto result = callExpression(code, params);
    EXPECT_FALSE(result.isText) << "expression " << code;
    return result.number;
  }
  std::string text(int code, std::vector<Arg> params = {}) {
    setFlags(0x0101);
    const auto result = callExpression(code, params);
    EXPECT_TRUE(result.isText) << "expression " << code;
    return result.text;
  }
};

// Arguments for an expression's declared parameter types.
inline std::vector<Arg> argsFor(const std::string& types, int32_t number, const char* text) {
  std::vector<Arg> args;
  for (int i = 0; i < 2; ++i) {
    if (types[i] == 'I') args.emplace_back(number);
    if (types[i] == 'T') args.emplace_back(text);
  }
  return args;
}

}  // namespace testhost
