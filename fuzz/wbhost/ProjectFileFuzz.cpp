// The host's project-file reader on arbitrary text. A text it accepts is written back in the
// same form and reads again into the same project, and the escaped fields round-trip on their own.
#include "FuzzCheck.h"
#include "project/ProjectFormat.h"

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <string>
#include <string_view>

namespace {

using wbhost::project::SavedItem;
using wbhost::project::SavedProject;

using wbt::fuzz::Check;

bool SameItem(const SavedItem& a, const SavedItem& b) {
    return std::memcmp(&a.id, &b.id, sizeof a.id) == 0 &&
           std::memcmp(&a.type, &b.type, sizeof a.type) == 0 && a.flags == b.flags &&
           a.name == b.name && a.parent == b.parent && a.descriptionFile == b.descriptionFile &&
           a.properties == b.properties;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const std::string_view text(reinterpret_cast<const char*>(data), size);
    SavedProject project;
    std::string error;
    if (!wbhost::project::ParseProject(text, project, &error)) {
        Check(!error.empty() && project.items.empty());
    } else {
        const std::string written = wbhost::project::FormatProject(project);
        SavedProject again;
        Check(wbhost::project::ParseProject(written, again, &error));
        Check(again.items.size() == project.items.size());
        for (size_t i = 0; i < project.items.size(); ++i)
            Check(SameItem(project.items[i], again.items[i]));
        Check(wbhost::project::FormatProject(again) == written);
    }
    // The whole input as one field: what unescapes escapes back to a field of the same text.
    std::u16string field;
    if (wbhost::project::UnescapeField(text, field)) {
        std::u16string back;
        Check(wbhost::project::UnescapeField(wbhost::project::EscapeField(field), back));
        Check(back == field);
    }
    std::string bytes;
    if (wbhost::project::UnescapeBytes(text, bytes)) {
        std::string back;
        Check(wbhost::project::UnescapeBytes(wbhost::project::EscapeBytes(bytes), back));
        Check(back == bytes);
    }
    return 0;
}
