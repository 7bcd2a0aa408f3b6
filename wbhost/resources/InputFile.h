// Files that come from outside the host (descriptions, project files, answer files, documents
// to insert), read the one way every command reads them: regular files only, within a size
// limit, with a message that says what was wrong. A FIFO would block, a device like /dev/zero
// would never end and a folder reads as nothing: each is refused before a byte is read.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace wbhost::resources {

// The largest file the host reads: far above any description or project, far below what
// would exhaust the machine.
inline constexpr size_t kMaxInputFileBytes = 64u * 1024u * 1024u;

// Checks that PATH names a regular file of at most LIMIT bytes. False with the reason in ERROR
// ("no such file", "it is a folder", "it is not a regular file", "it is larger than ...").
bool CheckInputFile(const std::string& path, std::string& error, size_t limit = kMaxInputFileBytes);

// The whole of the regular file PATH, of at most LIMIT bytes, into CONTENT. False with the
// reason in ERROR, CONTENT untouched, when the file is refused or cannot be read.
bool ReadInputFile(const std::string& path, std::string& content, std::string& error,
                   size_t limit = kMaxInputFileBytes);

// The text of a document's BYTES as the XML loader reads a file: a UTF-16 byte-order mark
// (either order) means UTF-16, a UTF-8 one is dropped, anything else is UTF-8 (malformed
// sequences become U+FFFD).
std::u16string DecodeDocument(std::string_view bytes);

// The text of a text file's BYTES without a UTF-8 byte-order mark at the start.
std::string_view WithoutByteOrderMark(std::string_view bytes);

} // namespace wbhost::resources
