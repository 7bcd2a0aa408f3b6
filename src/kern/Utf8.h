// UTF-8 <-> UTF-16 conversion with the module's own rules: at most three bytes per sequence,
// one UTF-16 unit per sequence, surrogates passed through unpaired.
#pragma once

#include <string>
#include <string_view>

namespace qv::kern {

// Decodes UTF-8. Overlong forms, four-byte sequences, bad or missing continuation bytes and
// sequences cut by the end raise InvalidSequence. Empty input gives an empty result.
std::u16string Utf8ToWide(std::string_view utf8);

// Encodes each UTF-16 unit on its own (a surrogate pair becomes two three-byte sequences).
std::string WideToUtf8(std::u16string_view wide);

} // namespace qv::kern
