// Reads arbitrary bytes as an item list and checks what the reader promises: items are numbered
// in order within the text's lines, never have an empty name or resource, and their attributes
// have names; an error names a line and column of the text.
#include "cli/ItemList.h"

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <string_view>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const std::string_view text(reinterpret_cast<const char*>(data), size);
    const size_t lineCount = static_cast<size_t>(std::count(text.begin(), text.end(), '\n')) + 1;
    std::vector<wbhost::cli::ItemLine> lines;
    const auto error = wbhost::cli::ParseItemList(text, lines);
    size_t previous = 0;
    for (const auto& line : lines) {
        if (line.line <= previous || line.line > lineCount || line.name.empty() ||
            line.resource.empty() || line.name.find('\t') != std::string::npos)
            std::abort();
        for (const auto& [name, value] : line.attributes)
            if (name.empty() || name.find('=') != std::string::npos)
                std::abort();
        previous = line.line;
    }
    if (error && (error->line <= previous || error->line > lineCount || error->column == 0 ||
                  error->message.empty()))
        std::abort();
    return 0;
}
