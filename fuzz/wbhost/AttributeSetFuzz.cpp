// The host's attribute-set reader, on arbitrary text and on the sets the host writes for new
// items: a written set reads back as exactly the name and resource it was written with.
#include "../attribute_bag/FuzzText.h"
#include "FuzzCheck.h"
#include "cli/AttributeSet.h"

#include <cstdint>
#include <cstdlib>
#include <string>

namespace {

using wbt::fuzz::Check;

// Whether XML can carry C at all (a set holding anything else is not well formed).
bool XmlCharacter(char16_t c) {
    return c == u'\t' || c == u'\n' || c == u'\r' || (c >= 0x20 && c < 0xD800) ||
           (c >= 0xE000 && c < 0xFFFE);
}

// Two texts from UTF-16 units of the input, split at the first U+0000.
std::pair<std::u16string, std::u16string> NameAndResource(const uint8_t* data, size_t size) {
    std::pair<std::u16string, std::u16string> texts;
    std::u16string* into = &texts.first;
    for (size_t i = 0; i + 1 < size; i += 2) {
        const auto c = static_cast<char16_t>(data[i] | (data[i + 1] << 8));
        if (c == 0 && into == &texts.first)
            into = &texts.second;
        else if (XmlCharacter(c))
            into->push_back(c);
    }
    return texts;
}

} // namespace

// The first byte chooses: the rest read as an attribute-set text (UTF-8, bad bytes replaced), or
// as a name and a resource to write into a set and read back.
extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    if (size == 0)
        return 0;
    if ((data[0] & 1) == 0) {
        wbhost::cli::ReadAttributeSet(fuzz::WideFromBytes(data + 1, size - 1));
        return 0;
    }
    const auto [name, resource] = NameAndResource(data + 1, size - 1);
    const auto read =
        wbhost::cli::ReadAttributeSet(wbhost::cli::NewItemAttributeSet(name, resource));
    Check(read.has_value());
    Check(read->size() == 2);
    Check((*read)[0] == wbhost::cli::SetAttribute(u"name", name));
    Check((*read)[1] == wbhost::cli::SetAttribute(u"resource", resource));
    return 0;
}
