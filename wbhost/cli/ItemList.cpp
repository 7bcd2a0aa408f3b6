// Reading item lists.
#include "cli/ItemList.h"

#include "cli/HostText.h"

namespace wbhost::cli {

namespace {

bool EqualsAscii(std::string_view text, std::string_view lowerWord) {
    if (text.size() != lowerWord.size())
        return false;
    for (size_t i = 0; i < text.size(); ++i) {
        const char c =
            text[i] >= 'A' && text[i] <= 'Z' ? static_cast<char>(text[i] - 'A' + 'a') : text[i];
        if (c != lowerWord[i])
            return false;
    }
    return true;
}

// True when LINE is well-formed UTF-8 (it reads back as it was written).
bool IsUtf8(std::string_view line) {
    return ToUtf8(FromUtf8(line)) == line;
}

bool IsBlankOrComment(std::string_view line) {
    const size_t first = line.find_first_not_of(" \t");
    return first == std::string_view::npos || line[first] == '#';
}

// Reads the fields of one LINE (number NUMBER) into ITEM.
std::optional<ItemListError> ParseLine(std::string_view line, size_t number, ItemLine& item) {
    item.line = number;
    std::vector<std::pair<size_t, std::string_view>> fields; // 0-based column, text
    for (size_t start = 0;;) {
        const size_t tab = line.find('\t', start);
        fields.emplace_back(start, line.substr(start, tab - start));
        if (tab == std::string_view::npos)
            break;
        start = tab + 1;
    }
    const auto fail = [&](size_t field, std::string message) {
        const size_t column = field < fields.size() ? fields[field].first : line.size();
        return ItemListError{number, column + 1, std::move(message)};
    };
    if (fields.size() < 2)
        return fail(1, "expected NAME<TAB>RESOURCE");
    if (fields[0].second.empty())
        return fail(0, "empty item name");
    if (fields[1].second.empty())
        return fail(1, "empty resource");
    item.name = fields[0].second;
    item.resource = fields[1].second;
    for (size_t i = 2; i < fields.size(); ++i) {
        std::pair<std::string, std::string> attribute;
        if (auto why = SplitAttributeText(fields[i].second, attribute))
            return fail(i, std::move(*why));
        item.attributes.push_back(std::move(attribute));
    }
    return std::nullopt;
}

} // namespace

std::optional<std::string> SplitAttributeText(std::string_view text,
                                              std::pair<std::string, std::string>& attribute) {
    const size_t equals = text.find('=');
    if (equals == std::string_view::npos)
        return "attribute \"" + std::string(text) + "\" is not of the form ATTRIBUTE=VALUE";
    if (equals == 0)
        return "attribute \"" + std::string(text) + "\" has no name";
    const std::string_view name = text.substr(0, equals);
    if (EqualsAscii(name, "name") || EqualsAscii(name, "resource"))
        return "the attribute \"" + std::string(name) +
               "\" is given by the item's place and resource";
    attribute = {std::string(name), std::string(text.substr(equals + 1))};
    return std::nullopt;
}

std::optional<ItemListError> ParseItemList(std::string_view text, std::vector<ItemLine>& lines) {
    size_t number = 0;
    while (!text.empty()) {
        ++number;
        const size_t end = text.find('\n');
        std::string_view line = text.substr(0, end);
        text.remove_prefix(end == std::string_view::npos ? text.size() : end + 1);
        if (!line.empty() && line.back() == '\r')
            line.remove_suffix(1);
        if (!IsUtf8(line))
            return ItemListError{number, 1, "the line is not UTF-8 text"};
        if (IsBlankOrComment(line))
            continue;
        ItemLine item;
        if (auto error = ParseLine(line, number, item))
            return error;
        lines.push_back(std::move(item));
    }
    return std::nullopt;
}

} // namespace wbhost::cli
