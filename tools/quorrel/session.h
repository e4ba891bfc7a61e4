// Runs script commands against one instance at a time, as the host would.
#pragma once

#include <istream>
#include <memory>
#include <ostream>
#include <string>

#include "module.h"
#include "script.h"

namespace quorrel::tool {

class Session {
 public:
  explicit Session(const ModuleLoader& module) : module_(module) {}

  // Runs one parsed command; throws ScriptError for a call that does not fit the tables.
  void execute(const Command& command, std::ostream& out);

  // The current instance, created with the default setup when there is none.
  Instance& instance();
  void replaceInstance(const SetupFields& setup);

 private:
  const ModuleLoader& module_;
  std::unique_ptr<Instance> instance_;
};

// Runs a whole script; reports the first error as "NAME:LINE: error: WHAT" and returns 2.
int runScript(const ModuleLoader& module, std::istream& in, const std::string& name,
              std::ostream& out, std::ostream& err);

}  // namespace quorrel::tool
