// The host runtime functions that this host exports to the modules it loads, declared for the
// host's own code and tests. Modules never include this: they bind the functions by name.
#pragma once

#include "host/binding/runtime_api.h"

#define WBRT_EXPORT extern "C" __attribute__((visibility("default")))

// The runtime's version text, found by modules that look for a host runtime in the executable.
WBRT_EXPORT const char gWBRTVersion[];

WBRT_EXPORT DSNewHandleFn DSNewHandle;
WBRT_EXPORT DSNewHClrFn DSNewHClr;
WBRT_EXPORT DSSetHSzClrFn DSSetHSzClr;
WBRT_EXPORT DSDisposeHandleFn DSDisposeHandle;
WBRT_EXPORT NumericArrayResizeFn NumericArrayResize;
WBRT_EXPORT LToCStrNFn LToCStrN;
WBRT_EXPORT GGetOneErrorCodeFn GGetOneErrorCode;
WBRT_EXPORT GetLangStrFn GetLangStr;
WBRT_EXPORT QueryInterfaceForWBRefNumFn QueryInterfaceForWBRefNum;
// The size in bytes of a live block; 0 for null or unknown handles.
WBRT_EXPORT size_t DSGetHandleSize(WBHandle handle);
