// Error texts of the embedded host, written for people reading them in a dialog or a log.
#include "runtime/ErrorTexts.h"

namespace wbhost::runtime {

namespace {

struct ErrorEntry {
    int32_t code;
    const char* text;
};

constexpr ErrorEntry kErrorTexts[] = {
    {1, "An argument passed to the host is not valid."},
    {2, "The host ran out of memory."},
    {4, "The end of the file was reached."},
    {5, "The file is already open."},
    {6, "A file input or output operation failed."},
    {7, "The file or folder was not found."},
    {8, "Access to the file was denied, or the file is in use."},
    {9, "The disk is full."},
    {10, "A file or folder of that name already exists."},
    {11, "Too many files are open."},
    {23, "The file is not in the expected format."},
    {37, "The device is not available."},
    {42, "The operation failed."},
    {53, "This host does not support the operation."},
};

} // namespace

const char* ErrorText(int32_t code) noexcept {
    for (const ErrorEntry& entry : kErrorTexts) {
        if (entry.code == code) {
            return entry.text;
        }
    }
    return nullptr;
}

} // namespace wbhost::runtime
