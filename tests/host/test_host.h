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

// An instance of the loaded module.
class Instance : public quorrel::hostsim::Instance {
 public:
  explicit Instance(SetupRecord setup = SetupRecord(), bool createNow = true)
      : quorrel::hostsim::Instance(module(), std::move(setup), createNow) {}
};

// Arguments of a code's declared types: `text` for each text, `number` for the others.
inline std::vector<Arg> argsFor(const quorrel::hostsim::Signature& signature, int32_t number,
                                const std::string& text) {
  std::vector<Arg> args;
  for (int i = 0; i < signature.paramCount; ++i) {
    const uint16_t type = signature.paramTypes[i];
    args.push_back(type == kActionParamText || type == kExpressionParamText ? Arg(text)
                                                                            : Arg(number));
  }
  return args;
}

}  // namespace testhost
