// The extension module as a host sees it: a shared library opened by path and
// reached only through its exported entry points.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "script.h"

namespace quorrel::tool {

// The module cannot be opened or lacks an entry point the command needs.
struct ModuleError : std::runtime_error {
  using std::runtime_error::runtime_error;
};

// What the script needs to know of one action or expression.
struct Signature {
  int paramCount = 0;
  uint16_t paramTypes[2] = {0, 0};
};

struct ExpressionResult {
  bool isText = false;
  int32_t number = 0;
  std::string text;
};

class Module {
 public:
  // Opens the library; throws ModuleError when it or a run-side entry point is missing.
  static std::unique_ptr<Module> open(const std::string& path);
  ~Module();
  Module(const Module&) = delete;
  Module& operator=(const Module&) = delete;

  const std::string& path() const { return path_; }
  Signature actionSignature(int32_t code) const;
  Signature expressionSignature(int32_t code) const;

  // Editor side: names, display strings, titles; empty when the module has no such entry.
  std::optional<int32_t> expressionCodeOfName(std::string_view name) const;
  std::string actionString(int32_t code) const;
  std::string expressionString(int32_t code) const;
  std::string actionTitle(int32_t code, int param) const;
  std::string expressionTitle(int32_t code) const;
  // Writes the menu tree (actions, expressions or conditions) in the indented form.
  void printMenu(std::string_view which, std::string& out) const;

  // Looks up an exported symbol; null when absent.
  void* symbol(const char* name) const;

 private:
  Module(std::string path, void* handle);
  std::string path_;
  void* handle_;
};

// Opens the module on first use, so that a script's own mistakes are reported
// without it.
class ModuleLoader {
 public:
  explicit ModuleLoader(std::string path) : path_(std::move(path)) {}
  const Module& get() const {
    if (!module_) module_ = Module::open(path_);
    return *module_;
  }

 private:
  std::string path_;
  mutable std::unique_ptr<Module> module_;
};

// One run-time instance: a RunRecord created from a setup record, destroyed with the object.
class Instance {
 public:
  Instance(const Module& module, const SetupFields& setup);
  ~Instance();
  Instance(const Instance&) = delete;
  Instance& operator=(const Instance&) = delete;

  void callAction(int32_t code, const std::vector<Argument>& args);
  ExpressionResult callExpression(int32_t code, const std::vector<Argument>& args);

 private:
  struct State;
  std::unique_ptr<State> state_;
};

// The module beside the executable: the install layout, then the build tree.
std::string defaultModulePath();

// Standard input, output and error carry bytes as they are (Windows would translate
// line ends otherwise).
void useBinaryStandardStreams();

}  // namespace quorrel::tool
