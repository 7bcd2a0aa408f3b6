// Whole-file reads and writes that never leave a half-written file behind.
#pragma once

#include <functional>
#include <string>
#include <string_view>

namespace wbhost::project {

// The temporary file a save of PATH writes before it replaces PATH: PATH + ".tmp".
std::string TemporaryFileFor(const std::string& path);
// Replaces the file PATH by CONTENT: writes the temporary file beside it (replacing one an
// earlier, killed save left), flushes it to disk, then renames it over PATH and flushes the
// folder, so PATH is always either the old or the new file. BEFORERENAME (optional) runs between
// the flush and the rename; answering false stops there as a crash would (the temporary file
// stays, PATH is untouched) and the call answers false. Otherwise false with a message in ERROR
// (may be null) on any failure, after removing the temporary file.
bool WriteFileAtomically(const std::string& path, std::string_view content, std::string* error,
                         const std::function<bool()>& beforeRename = {});
// The bytes of the file PATH into CONTENT, read as every outside file is
// (resources/InputFile.h); false with "PATH: reason" in ERROR (may be null).
bool ReadWholeFile(const std::string& path, std::string& content, std::string* error);

} // namespace wbhost::project
