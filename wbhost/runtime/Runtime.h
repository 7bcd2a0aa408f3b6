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

// Host error codes of this host beyond those the modules test for.
enum : int32_t {
    kWBIOErr = 6,        // a file operation failed
    kWBAccessDenied = 8, // access to the file was denied
    kWBDiskFull = 9,     // the disk is full
    kWBFileExists = 10,  // a file or folder of that name already exists
};
// What a variant attribute read answers when the variant has no attribute of that name and
// kind (the generic failure: callers only tell it from success).
inline constexpr WBErr kWBAttrMissing = kWBGenericErr;

// Types of FIsAPathOfType.
enum : int32_t { kWBAbsolutePath = 0, kWBRelativePath = 1, kWBEmptyPath = 2 };

WBRT_EXPORT TargetItemFromAppRefFn TargetItemFromAppRef;
WBRT_EXPORT ControlOnlineHelpFn ControlOnlineHelp;

WBRT_EXPORT WbVariantPStrGetStringAttrFn WbVariantPStrGetStringAttr;
WBRT_EXPORT WbVariantPStrSetStringAttrFn WbVariantPStrSetStringAttr;
WBRT_EXPORT WbVariantPStrSetUI32AttrFn WbVariantPStrSetUI32Attr;
WBRT_EXPORT WbVariantPStrGetWbVariantAttrFn WbVariantPStrGetWbVariantAttr;
WBRT_EXPORT WbVariantDestroyFn WbVariantDestroy;
// A new variant without attributes; null when out of memory. Release it with WbVariantDestroy.
WBRT_EXPORT WBVariant WbVariantCreate(void);
// The 32-bit attribute NAME in *value; kWBAttrMissing when there is none of that kind.
WBRT_EXPORT WBErr WbVariantPStrGetUI32Attr(WBVariant variant, const unsigned char* name,
                                           uint32_t* value);
// Sets attribute NAME to a copy of VALUE as it is now.
WBRT_EXPORT WBErr WbVariantPStrSetWbVariantAttr(WBVariant variant, const unsigned char* name,
                                                WBVariant value);

WBRT_EXPORT FEmptyPathFn FEmptyPath;
WBRT_EXPORT FTextToPathFn FTextToPath;
WBRT_EXPORT FFileSystemCStrToPathFn FFileSystemCStrToPath;
WBRT_EXPORT FPathToPathFn FPathToPath;
WBRT_EXPORT FDestroyPathFn FDestroyPath;
WBRT_EXPORT FDirNameFn FDirName;
WBRT_EXPORT FNamePtrFn FNamePtr;
WBRT_EXPORT FExistsFn FExists;
WBRT_EXPORT FIsAPathOfTypeFn FIsAPathOfType;
WBRT_EXPORT FileInArchiveFn FileInArchive;
WBRT_EXPORT FileInWBLibpFn FileInWBLibp;
WBRT_EXPORT FPathToDSStringFn FPathToDSString;
WBRT_EXPORT FGetSpecialDirFn FGetSpecialDir;
WBRT_EXPORT FPathToFileSystemDSStringFn FPathToFileSystemDSString;
WBRT_EXPORT FCopyFn FCopy;
WBRT_EXPORT FMoveFn FMove;
WBRT_EXPORT FRemoveFn FRemove;
