// Files that a description names (includes, deferred files) are read only from inside the
// directory the loader was given: a description from elsewhere must not make the host read, or
// quote in its messages, any other file of the machine.
#pragma once

#include <string>
#include <string_view>

namespace wbhw {

// What a confined lookup found.
struct ConfinedFile {
    // The file's real path (links resolved) when it exists inside the directory; empty otherwise.
    std::string path;
    // Why the name was refused; empty when it was not (a missing file is not refused).
    std::u16string refusal;
};

// Resolves RELATIVE against DIRECTORY. Refused: absolute names, and names whose real path
// (after "..", and links followed) lies outside the real path of DIRECTORY.
ConfinedFile ResolveConfined(const std::string& directory, std::string_view relative);

} // namespace wbhw
