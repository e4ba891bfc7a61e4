#include "session.h"

namespace quorrel::tool {
namespace {

std::string argumentCount(int count) {
  if (count == 0) return "no arguments";
  return std::to_string(count) + (count == 1 ? " argument" : " arguments");
}

// The arguments must match the declared parameters in number and type.
void checkArguments(const Signature& signature, const std::vector<Argument>& args,
                    const std::string& what, uint16_t textType) {
  if (static_cast<int>(args.size()) != signature.paramCount) {
    throw ScriptError(what + " takes " + argumentCount(signature.paramCount) + ", " +
                      std::to_string(args.size()) + " given");
  }
  for (size_t i = 0; i < args.size(); ++i) {
    const bool wantsText = signature.paramTypes[i] == textType;
    if (args[i].isText != wantsText) {
      throw ScriptError("argument " + std::to_string(i + 1) + " of " + what + " must be " +
                        (wantsText ? "a quoted string" : "an integer"));
    }
  }
}

}  // namespace

Instance& Session::instance() {
  if (!instance_) instance_ = std::make_unique<Instance>(module_.get(), SetupFields{});
  return *instance_;
}

void Session::replaceInstance(const SetupFields& setup) {
  instance_.reset();
  instance_ = std::make_unique<Instance>(module_.get(), setup);
}

void Session::execute(const Command& command, std::ostream& out) {
  switch (command.kind) {
    case CommandKind::Empty:
      return;
    case CommandKind::New:
      replaceInstance(command.setup);
      return;
    case CommandKind::Action: {
      const std::string what = "action " + std::to_string(command.code);
      checkArguments(module_.get().actionSignature(command.code), command.args, what,
                     abi::kActionParamText);
      instance().callAction(command.code, command.args);
      return;
    }
    case CommandKind::Expression: {
      int32_t code = command.code;
      if (!command.name.empty()) {
        const auto named = module_.get().expressionCodeOfName(command.name);
        if (!named) throw ScriptError("unknown expression " + quoteText(command.name));
        code = *named;
      }
      const std::string what = "expression " + std::to_string(code);
      checkArguments(module_.get().expressionSignature(code), command.args, what,
                     abi::kExpressionParamText);
      const ExpressionResult result = instance().callExpression(code, command.args);
      out << (result.isText ? quoteText(result.text) : std::to_string(result.number)) << '\n';
      return;
    }
  }
}

int runScript(const ModuleLoader& module, std::istream& in, const std::string& name,
              std::ostream& out, std::ostream& err) {
  Session session(module);
  std::string line;
  for (int lineNumber = 1; std::getline(in, line); ++lineNumber) {
    try {
      session.execute(parseLine(line), out);
    } catch (const ScriptError& error) {
      out.flush();
      err << name << ':' << lineNumber << ": error: " << error.what() << '\n';
      return 2;
    }
  }
  return 0;
}

}  // namespace quorrel::tool
