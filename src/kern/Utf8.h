// UTF-8 <-> UTF-16 conversion. Two rules: the module's own (at most three bytes per sequence, one
// UTF-16 unit per sequence, surrogates passed through unpaired), which the host's texts follow,
// and standard UTF-8, which XML readers demand.
#pragma once

#include <string>
#include <string_view>

namespace qv::kern {

// Decodes UTF-8. Overlong forms, four-byte sequences, bad or missing continuation bytes and
// sequences cut by the end raise InvalidSequence. Empty input gives an empty result.
std::u16string Utf8ToWide(std::string_view utf8);

// Encodes each UTF-16 unit on its own (a surrogate pair becomes two three-byte sequences).
std::string WideToUtf8(std::u16string_view wide);

// Standard UTF-8: a surrogate pair becomes one four-byte sequence. A lone surrogate becomes
// `lone` when that is not 0, otherwise its own three-byte form (which a strict reader rejects).
std::string WideToStandardUtf8(std::u16string_view wide, char16_t lone = 0);

// True when `wide` holds a surrogate that is not half of a pair.
bool HasLoneSurrogate(std::u16string_view wide) noexcept;

} // namespace qv::kern
