// Every host runtime function the module calls, bound lazily by name: call them as
// qv::host::rt::DSNewHandle(size) and so on. Signatures are those of runtime_api.h.
#pragma once

#include "host/binding/BoundFunction.h"
#include "host/binding/runtime_api.h"

namespace qv::host::rt {

#define QV_HOST_FUNCTION(Name)                                                                     \
    inline BoundFunction<Name##Fn> Name {                                                          \
#Name                                                                                      \
    }

QV_HOST_FUNCTION(DSNewHandle);
QV_HOST_FUNCTION(DSNewHClr);
QV_HOST_FUNCTION(DSSetHSzClr);
QV_HOST_FUNCTION(DSDisposeHandle);
QV_HOST_FUNCTION(NumericArrayResize);
QV_HOST_FUNCTION(LToCStrN);
QV_HOST_FUNCTION(GGetOneErrorCode);
QV_HOST_FUNCTION(GetLangStr);
QV_HOST_FUNCTION(TargetItemFromAppRef);
QV_HOST_FUNCTION(QueryInterfaceForWBRefNum);
QV_HOST_FUNCTION(WbVariantPStrGetStringAttr);
QV_HOST_FUNCTION(WbVariantPStrSetStringAttr);
QV_HOST_FUNCTION(WbVariantPStrSetUI32Attr);
QV_HOST_FUNCTION(WbVariantPStrGetWbVariantAttr);
QV_HOST_FUNCTION(WbVariantDestroy);
QV_HOST_FUNCTION(ControlOnlineHelp);
QV_HOST_FUNCTION(FEmptyPath);
QV_HOST_FUNCTION(FTextToPath);
QV_HOST_FUNCTION(FFileSystemCStrToPath);
QV_HOST_FUNCTION(FPathToPath);
QV_HOST_FUNCTION(FDestroyPath);
QV_HOST_FUNCTION(FDirName);
QV_HOST_FUNCTION(FNamePtr);
QV_HOST_FUNCTION(FExists);
QV_HOST_FUNCTION(FIsAPathOfType);
QV_HOST_FUNCTION(FileInArchive);
QV_HOST_FUNCTION(FileInWBLibp);
QV_HOST_FUNCTION(FPathToDSString);
QV_HOST_FUNCTION(FGetSpecialDir);
QV_HOST_FUNCTION(FPathToFileSystemDSString);
QV_HOST_FUNCTION(FCopy);
QV_HOST_FUNCTION(FMove);
QV_HOST_FUNCTION(FRemove);

#undef QV_HOST_FUNCTION

} // namespace qv::host::rt
