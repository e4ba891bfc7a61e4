// The command drives the module through the host simulator; these are its names here.
#pragma once

#include "hostsim/host_simulator.h"
#include "script.h"

namespace quorrel::tool {

using hostsim::defaultModulePath;
using hostsim::defaultModulePlaces;
using hostsim::ExpressionResult;
using hostsim::Instance;
using hostsim::MenuItem;
using hostsim::Module;
using hostsim::ModuleError;
using hostsim::ModuleLoader;
using hostsim::prepareStandardStreams;
using hostsim::Signature;
using hostsim::standardOutputReaderGone;

}  // namespace quorrel::tool
