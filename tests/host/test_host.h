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

// Opened on first use; a module that cannot be opened fails each test with the reason.
inline const quorrel::hostsim::Module& module() {
  static const auto loaded = quorrel::hostsim::Module::open(QUORREL_MODULE_PATH);
  return *loaded;
}

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
