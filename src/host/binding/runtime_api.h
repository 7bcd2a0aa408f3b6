// The C signatures of the host runtime's functions, shared by the module (which binds them by name
// at run time) and the embedded host (which defines and exports them). Only the types live here:
// nothing in this header is a declaration of a function, so both sides can include it.
#pragma once

#include <stddef.h>
#include <stdint.h>

extern "C" {

// A host error code: 0 means no error; the host gives the others their meaning and text.
typedef int32_t WBErr;
// A relocatable host block: a pointer to the host's pointer to the data. The data may move when
// the block is resized; the handle itself stays valid until it is disposed of.
typedef void** WBHandle;
// An opaque host variant carrying named attributes.
typedef struct WBVariantRec* WBVariant;
// An opaque host path object.
typedef struct WBPathRec* WBPath;
// A host reference number (application, program, project item, resource tree, ...).
typedef uint32_t WBRefNum;

// Host error codes that the module itself produces or tests for.
enum : int32_t {
    kWBNoErr = 0,
    kWBArgErr = 1,        // a bad argument
    kWBMemFullErr = 2,    // out of memory
    kWBFileNotFound = 7,  // file or path not found
    kWBGenericErr = 42,   // a generic failure
    kWBNotSupported = 53, // the call is not supported by this host
};

// Element type codes of NumericArrayResize.
enum : int32_t {
    kWBTypeI8 = 1,
    kWBTypeI16 = 2,
    kWBTypeI32 = 3,
    kWBTypeI64 = 4,
    kWBTypeU8 = 5, // bytes: the element type of a host string
    kWBTypeU16 = 6,
    kWBTypeU32 = 7,
    kWBTypeU64 = 8,
    kWBTypeF32 = 9,
    kWBTypeF64 = 10,
};

// Selectors of GetLangStr.
enum : int32_t {
    kWBLangStrUiLanguage = 0, // the language code of the host's user interface, e.g. "eng"
};

// Answers of FExists.
enum : int32_t { kWBPathAbsent = 0, kWBPathIsFile = 1, kWBPathIsDirectory = 2 };

// Memory manager. A new block of `size` bytes, or null when it cannot be allocated.
typedef WBHandle DSNewHandleFn(size_t size);
// A new zero-filled block of `size` bytes, or null.
typedef WBHandle DSNewHClrFn(size_t size);
// Resizes a block; bytes added at the end are zero. The data may move.
typedef WBErr DSSetHSzClrFn(WBHandle handle, size_t size);
// Releases a block; a null or unknown handle answers kWBArgErr.
typedef WBErr DSDisposeHandleFn(WBHandle handle);
// Sizes a host array of `numDims` 32-bit dimension sizes followed by `numElements` elements of
// `typeCode` (the data starts at the dimension block's size rounded up to the element size). A
// null *handle is allocated; the dimension sizes are left to the caller.
typedef WBErr NumericArrayResizeFn(int32_t typeCode, int32_t numDims, WBHandle* handle,
                                   size_t numElements);
// Copies the host string data `text` (32-bit count, then bytes) into `buffer` of `size` bytes,
// always zero-terminated when size > 0; answers the number of bytes copied.
typedef int32_t LToCStrNFn(const void* text, char* buffer, int32_t size);

// Texts. Non-zero when the host has a text for `code`; it is then put in a new host string
// handle at *text, which the caller disposes of.
typedef int32_t GGetOneErrorCodeFn(WBErr code, WBHandle* text);
// A localised host string chosen by `selector` (kWBLangStr...), put in a new handle at *text.
typedef WBErr GetLangStrFn(int32_t selector, WBHandle* text);

// Host objects. The project target item behind an application reference (a COM interface
// pointer, added-to, in *item).
typedef WBErr TargetItemFromAppRefFn(WBRefNum appRef, void** item);
// The COM interface `iid` (a pointer to a 16-byte GUID) of the object behind the reference number
// at `refnum` (host programs hand refnums by reference, and the pointer is passed on as it came);
// answers a COM-style status.
typedef int32_t QueryInterfaceForWBRefNumFn(const WBRefNum* refnum, const void* iid, void** object);

// Variants. Attribute names are Pascal strings (a length byte, then the bytes).
typedef WBErr WbVariantPStrGetStringAttrFn(WBVariant variant, const unsigned char* name,
                                           WBHandle* value);
typedef WBErr WbVariantPStrSetStringAttrFn(WBVariant variant, const unsigned char* name,
                                           WBHandle value);
typedef WBErr WbVariantPStrSetUI32AttrFn(WBVariant variant, const unsigned char* name,
                                         uint32_t value);
typedef WBErr WbVariantPStrGetWbVariantAttrFn(WBVariant variant, const unsigned char* name,
                                              WBVariant* value);
typedef WBErr WbVariantDestroyFn(WBVariant variant);

// Opens the host's online help: `command` chooses the action, `helpFile` and `topic` may be null.
typedef WBErr ControlOnlineHelpFn(int32_t command, const char* helpFile, const char* topic);

// Paths. Every path the host hands out is released with FDestroyPath.
typedef WBPath FEmptyPathFn(WBPath reuse);
typedef WBErr FTextToPathFn(const char* text, int32_t length, WBPath* path);
typedef WBErr FFileSystemCStrToPathFn(const char* text, WBPath* path);
typedef WBErr FPathToPathFn(WBPath source, WBPath* copy);
typedef WBErr FDestroyPathFn(WBPath* path);
typedef WBErr FDirNameFn(WBPath path, WBPath* directory);
// The last component of `path`, zero-terminated, valid while the path lives.
typedef WBErr FNamePtrFn(WBPath path, const char** name);
// kWBPathAbsent, kWBPathIsFile or kWBPathIsDirectory.
typedef int32_t FExistsFn(WBPath path);
typedef int32_t FIsAPathOfTypeFn(WBPath path, int32_t type);
typedef int32_t FileInArchiveFn(WBPath path);
typedef int32_t FileInWBLibpFn(WBPath path);
typedef WBErr FPathToDSStringFn(WBPath path, WBHandle* text);
// The special folder of FGetSpecialDir that modules ask for: the host's own folder.
enum : int32_t { kWBHostFolder = 4 };
typedef WBErr FGetSpecialDirFn(int32_t kind, WBPath* directory);
typedef WBErr FPathToFileSystemDSStringFn(WBPath path, WBHandle* text);
typedef WBErr FCopyFn(WBPath from, WBPath to);
typedef WBErr FMoveFn(WBPath from, WBPath to);
typedef WBErr FRemoveFn(WBPath path);

// The run-time engine's C-interface function table: a pointer-sized field whose low 32 bits are
// the revision, then function pointers. Slot 1 opens a connection, 2 closes it, 3 starts it, 109
// opens a connection to a named application (revision 40 and later).
typedef const void* const* GetCInterfaceFunctionTableFn(void);
typedef int32_t WBCIntOpenFn(void** connection, int32_t mode, int32_t flags);
typedef int32_t WBCIntCloseFn(void* connection);
typedef int32_t WBCIntStartFn(void* connection);
typedef int32_t WBCIntOpenByNameFn(void** connection, int32_t mode, int32_t flags,
                                   const char* application);

} // extern "C"
