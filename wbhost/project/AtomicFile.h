// Whole-file reads and writes that never leave a half-written file behind.
#pragma once

#include <functional>
#include <string>
#include <string_view>

namespace wbhost::project {

class ProjectLock;

// Replaces the file PATH by CONTENT: writes a temporary file of its own beside it (a fresh,
// unique name per save, so two saves never write or rename each other's file), flushes it to
// disk, then renames it over PATH and flushes the folder, so PATH is always either the old or
// the new file. When PATH is a symbolic link, the file it leads to is replaced and the link
// stays. BEFORERENAME (optional) runs between the flush and the rename; answering false stops
// there as a crash would (the temporary file stays, PATH is untouched) and the call answers
// false. LOCK (optional) moves to the new file once it is in place. Otherwise false with a
// message in ERROR (may be null) on any failure, after removing the temporary file.
bool WriteFileAtomically(const std::string& path, std::string_view content, std::string* error,
                         const std::function<bool()>& beforeRename = {},
                         ProjectLock* lock = nullptr);
// The file that PATH names once symbolic links are followed (PATH itself when it is none); a
// link that leads nowhere gives the path it would create.
std::string FollowLinks(const std::string& path);
// The bytes of the file PATH into CONTENT, read as every outside file is
// (resources/InputFile.h); false with "PATH: reason" in ERROR (may be null).
bool ReadWholeFile(const std::string& path, std::string& content, std::string* error);

} // namespace wbhost::project
