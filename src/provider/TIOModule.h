// Module-wide state of the plug-in: its own module handle, used to find the files it ships.
#pragma once

namespace tio {

// The handle of the module that holds this code (as the dynamic linker knows it), looked up
// once; null only if the dynamic linker does not know the module.
void* ModuleInstance();

} // namespace tio
