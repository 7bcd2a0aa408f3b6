// Texts between the terminal (UTF-8), the host's strings (the default multibyte code page) and
// UTF-16.
#pragma once

#include "host/binding/runtime_api.h"

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace wbhost::cli {

// UTF-8 to UTF-16; malformed sequences become U+FFFD. Empty input gives empty output.
std::u16string FromUtf8(std::string_view text);
// UTF-16 to UTF-8; unpaired surrogates become U+FFFD.
std::string ToUtf8(std::u16string_view text);

// TEXT (UTF-8) in the host's code page, as host programs hand text to the module.
std::string ToHostText(std::string_view utf8);
// The name of the host's code page (the converter the host's texts use).
std::string HostCodePage();
// The characters of TEXT that the host's code page cannot represent (they would become "?"),
// each once, in the order they first appear.
std::vector<char32_t> CharactersTheHostCannotKeep(std::u16string_view text);
// "U+65E5 '日', U+672C '本'" for CHARACTERS; the first ten, then how many more there are.
std::string DescribeCharacters(const std::vector<char32_t>& characters);

// Gives a handle back to the host (a null handle is ignored by the host).
struct HandleDisposer {
    void operator()(void** handle) const noexcept;
};
// A host handle that this host made and disposes of.
using OwnedHandle = std::unique_ptr<void*, HandleDisposer>;

// A new host string holding BYTES; null when the host is out of memory.
OwnedHandle NewHostString(std::string_view bytes);
// The bytes of a host string; empty for a null handle.
std::string HostStringBytes(WBHandle handle);

} // namespace wbhost::cli
