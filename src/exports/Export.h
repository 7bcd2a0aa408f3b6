// Marks a C function as one of the module's exports (it must also be listed in exports.list).
#pragma once

#define WBT_EXPORT extern "C" __attribute__((visibility("default")))
