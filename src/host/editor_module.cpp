// The library entry: the module handle is the only global state, kept at attach
// time for the resource loads of the menus, strings and setup dialog.
#include "host/editor_module.h"

namespace {

HINSTANCE attachedModule = nullptr;

}  // namespace

namespace quorrel::host {

HINSTANCE moduleInstance() {
  return attachedModule;
}

}  // namespace quorrel::host

#ifdef _WIN32

extern "C" BOOL WINAPI DllMain(HINSTANCE module, DWORD reason, LPVOID) {
  if (reason == DLL_PROCESS_ATTACH) attachedModule = module;
  return TRUE;
}

#endif
