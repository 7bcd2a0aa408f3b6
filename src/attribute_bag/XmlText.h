// Text helpers shared by the attribute-bag and cluster-XML forms: escaping, trimming, UTF-8.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace wbhw {

// Status of a failed read of either XML form.
inline constexpr int32_t kXmlReadFailed = static_cast<int32_t>(0x80004005u);

// Appends TEXT to OUT with "&", "<" and ">" written as entities, and a carriage return as a
// character reference (a raw one would come back as a line feed). Empty TEXT appends nothing.
void AppendEscapedText(std::u16string_view text, std::u16string& out);

// As AppendEscapedText, for the inside of a double-quoted XML attribute: also writes '"', tab
// and line feed as references, since a reader would end the value there or turn them into blanks.
void AppendEscapedAttribute(std::u16string_view text, std::u16string& out);

// UTF-8 for an XML reader: surrogate pairs become one four-byte sequence, while unpaired
// surrogates and the characters that XML cannot carry at all (controls other than tab, line feed
// and carriage return; U+FFFE; U+FFFF) become "?".
std::string ToXmlUtf8Lenient(std::u16string_view wide);

// Strict UTF-8 conversion: false (OUT unspecified) when WIDE holds an unpaired surrogate.
bool ToUtf8Strict(std::u16string_view wide, std::string& out);

} // namespace wbhw
