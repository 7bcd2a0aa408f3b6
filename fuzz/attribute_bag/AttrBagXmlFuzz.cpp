// The attribute-bag reader on arbitrary documents: whatever it keeps (also from a document it
// rejects) must write out as a text that reads back without failure to the very same text.
#include "FuzzText.h"
#include "attribute_bag/TIOAttrBag.h"

#include <cstdlib>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    TIOAttrBag bag;
    TIOAttrBag* last = nullptr;
    TIOAttrBag::ReadXml(fuzz::WideFromBytes(data, size), bag, &last);
    if (last == nullptr)
        std::abort();
    std::u16string first;
    bag.WriteXml(first);
    TIOAttrBag again;
    if (TIOAttrBag::ReadXml(first, again) != 0)
        std::abort();
    std::u16string second;
    again.WriteXml(second);
    if (second != first)
        std::abort();
    return 0;
}
