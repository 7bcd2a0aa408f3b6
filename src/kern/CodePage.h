// Multibyte text in a named code page <-> UTF-16, through ICU converters.
#pragma once

#include <string>
#include <string_view>

namespace qv::kern {

// Converts text in a code page to UTF-16. codePage: "" for the system default (windows-1252,
// or the converter named by the environment variable WBTANGIO_CODEPAGE), "US-ASCII" or "cp932";
// any other name raises InvalidLocale. Bytes with no meaning in the code page become U+FFFD
// (U+001A for single-byte pages); a conversion ICU cannot run raises WinError. Empty input gives
// an empty result.
std::u16string AnsiToWide(std::string_view text, std::string_view codePage = {});

// Converts UTF-16 to a code page (names as for AnsiToWide). Characters the code page lacks,
// and unpaired surrogates, become "?". Empty input gives an empty result.
std::string WideToAnsi(std::u16string_view text, std::string_view codePage = {});

// The ICU converter name a code page name stands for; raises InvalidLocale for unknown names.
std::string ConverterName(std::string_view codePage);

} // namespace qv::kern
