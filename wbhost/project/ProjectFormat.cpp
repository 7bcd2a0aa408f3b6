// Writing and reading the project file's text form.
#include "project/ProjectFormat.h"

#include "kern/GuidText.h"
#include "kern/Utf8.h"

#include <charconv>
#include <map>
#include <set>

namespace wbhost::project {

namespace {

constexpr std::string_view kHeader = "wbhost-project 1";
constexpr std::string_view kEnd = "end";

std::string FlagsText(uint32_t flags) {
    static constexpr char kDigits[] = "0123456789ABCDEF";
    std::string text(8, '0');
    for (int i = 7; i >= 0; --i, flags >>= 4)
        text[static_cast<size_t>(i)] = kDigits[flags & 0xF];
    return text;
}

std::vector<std::string_view> SplitFields(std::string_view line) {
    std::vector<std::string_view> fields;
    size_t start = 0;
    for (;;) {
        const size_t space = line.find(' ', start);
        fields.push_back(line.substr(start, space - start));
        if (space == std::string_view::npos)
            return fields;
        start = space + 1;
    }
}

bool ParseGuidField(std::string_view field, GUID& guid) {
    try {
        guid = qv::kern::StringToGuid(field);
        return true;
    } catch (...) {
        return false;
    }
}

template <class Int> bool ParseNumber(std::string_view field, Int& value, int base) {
    if (field.empty())
        return false;
    const auto [end, ec] = std::from_chars(field.data(), field.data() + field.size(), value, base);
    return ec == std::errc() && end == field.data() + field.size();
}

// Reads the lines after the header into PROJECT, remembering the items by identifier.
class Reader {
public:
    explicit Reader(SavedProject& project) : project_(project) {}

    // An empty message when LINE was read; otherwise what is wrong with it.
    std::string Line(std::string_view line) {
        const auto fields = SplitFields(line);
        const std::string_view kind = fields[0];
        if (kind == "item")
            return Item(fields);
        if (kind == "target")
            return Target(fields);
        if (kind == "string" || kind == "int" || kind == "bool")
            return PropertyLine(fields);
        return "unknown line kind \"" + std::string(kind) + "\"";
    }

private:
    std::string Item(const std::vector<std::string_view>& fields) {
        if (fields.size() != 6)
            return "an item line has six fields";
        SavedItem item;
        if (!ParseGuidField(fields[1], item.id) || !ParseGuidField(fields[3], item.type))
            return "malformed identifier or type";
        if (fields[4].size() != 8 || !ParseNumber(fields[4], item.flags, 16))
            return "malformed flag word";
        if (!UnescapeField(fields[5], item.name) || item.name.empty())
            return "malformed item name";
        if (byId_.count(item.id) != 0)
            return "identifier used twice";
        if (fields[2] == "-") {
            if (!project_.items.empty())
                return "only the first item is the root";
        } else {
            GUID parent{};
            if (!ParseGuidField(fields[2], parent))
                return "malformed parent";
            const auto found = byId_.find(parent);
            if (found == byId_.end())
                return "the parent is not an earlier item";
            item.parent = found->second;
        }
        if (project_.items.empty() && item.parent != SavedItem::kNoParent)
            return "the first item must be the root";
        byId_[item.id] = project_.items.size();
        project_.items.push_back(std::move(item));
        return {};
    }

    std::string Target(const std::vector<std::string_view>& fields) {
        if (fields.size() != 3)
            return "a target line has three fields";
        SavedItem* item = Find(fields[1]);
        if (item == nullptr)
            return "target of an unknown item";
        std::string file;
        if (!UnescapeBytes(fields[2], file) || file.empty() || !item->descriptionFile.empty())
            return "malformed or repeated description file";
        item->descriptionFile = std::move(file);
        return {};
    }

    std::string PropertyLine(const std::vector<std::string_view>& fields) {
        if (fields.size() != 4)
            return "a property line has four fields";
        SavedItem* item = Find(fields[1]);
        if (item == nullptr)
            return "property of an unknown item";
        std::u16string name;
        if (!UnescapeField(fields[2], name) || name.empty())
            return "malformed property name";
        Property property;
        if (fields[0] == "string") {
            if (!UnescapeField(fields[3], property.text))
                return "malformed property text";
        } else if (fields[0] == "int") {
            property.kind = Property::Kind::Int;
            if (!ParseNumber(fields[3], property.number, 10))
                return "malformed integer";
        } else {
            property.kind = Property::Kind::Bool;
            if (fields[3] != "0" && fields[3] != "1")
                return "a Boolean is 0 or 1";
            property.number = fields[3] == "1" ? 1 : 0;
        }
        // A second value for one name would silently hide the first: the file is damaged.
        if (!item->properties.emplace(std::move(name), std::move(property)).second)
            return "property given twice";
        return {};
    }

    SavedItem* Find(std::string_view idField) {
        GUID id{};
        if (!ParseGuidField(idField, id))
            return nullptr;
        const auto found = byId_.find(id);
        return found == byId_.end() ? nullptr : &project_.items[found->second];
    }

    SavedProject& project_;
    std::map<GUID, size_t> byId_;
};

} // namespace

std::string EscapeField(std::u16string_view text) {
    return EscapeBytes(qv::kern::WideToUtf8(text));
}

std::string EscapeBytes(std::string_view bytes) {
    if (bytes.empty())
        return "\\e";
    static constexpr char kDigits[] = "0123456789ABCDEF";
    std::string out;
    for (const char c : bytes) {
        const auto byte = static_cast<unsigned char>(c);
        if (c == '\\') {
            out += "\\\\";
        } else if (c == ' ') {
            out += "\\s";
        } else if (byte < 0x20 || byte == 0x7F) {
            out += "\\x";
            out += kDigits[byte >> 4];
            out += kDigits[byte & 0xF];
        } else {
            out += c;
        }
    }
    return out;
}

bool UnescapeField(std::string_view field, std::u16string& text) {
    std::string bytes;
    if (!UnescapeBytes(field, bytes))
        return false;
    try {
        text = qv::kern::Utf8ToWide(bytes);
        return true;
    } catch (...) {
        return false;
    }
}

bool UnescapeBytes(std::string_view field, std::string& bytes) {
    bytes.clear();
    if (field.empty())
        return false;
    if (field == "\\e")
        return true;
    for (size_t i = 0; i < field.size(); ++i) {
        if (field[i] != '\\') {
            bytes += field[i];
            continue;
        }
        if (++i == field.size())
            return false;
        if (field[i] == '\\') {
            bytes += '\\';
        } else if (field[i] == 's') {
            bytes += ' ';
        } else if (field[i] == 'x' && i + 2 < field.size()) {
            uint8_t byte = 0;
            if (!ParseNumber(field.substr(i + 1, 2), byte, 16))
                return false;
            bytes += static_cast<char>(byte);
            i += 2;
        } else {
            return false;
        }
    }
    return true;
}

std::string FormatProject(const SavedProject& project) {
    std::string out(kHeader);
    out += '\n';
    for (const SavedItem& item : project.items) {
        const std::string id = qv::kern::GuidToNarrowString(item.id);
        const std::string parent =
            item.parent == SavedItem::kNoParent
                ? std::string("-")
                : qv::kern::GuidToNarrowString(project.items[item.parent].id);
        out += "item " + id + ' ' + parent + ' ' + qv::kern::GuidToNarrowString(item.type) + ' ' +
               FlagsText(item.flags) + ' ' + EscapeField(item.name) + '\n';
        if (!item.descriptionFile.empty())
            out += "target " + id + ' ' + EscapeBytes(item.descriptionFile) + '\n';
        for (const auto& [name, property] : item.properties) {
            const std::string prefix = ' ' + id + ' ' + EscapeField(name) + ' ';
            switch (property.kind) {
            case Property::Kind::String:
                out += "string" + prefix + EscapeField(property.text) + '\n';
                break;
            case Property::Kind::Int:
                out += "int" + prefix + std::to_string(property.number) + '\n';
                break;
            case Property::Kind::Bool:
                out += "bool" + prefix + (property.number ? "1" : "0") + '\n';
                break;
            }
        }
    }
    out += kEnd;
    out += '\n';
    return out;
}

bool ParseProject(std::string_view text, SavedProject& project, std::string* error) {
    SavedProject read;
    Reader reader(read);
    size_t lineNumber = 0;
    bool ended = false;
    auto fail = [&](const std::string& message) {
        if (error != nullptr)
            *error = "line " + std::to_string(lineNumber) + ": " + message;
        return false;
    };
    while (!text.empty()) {
        const size_t newline = text.find('\n');
        std::string_view line = text.substr(0, newline);
        text = newline == std::string_view::npos ? std::string_view() : text.substr(newline + 1);
        ++lineNumber;
        if (!line.empty() && line.back() == '\r')
            line.remove_suffix(1); // a file that passed through a line-ending conversion
        if (ended) {
            if (!line.empty())
                return fail("text after the end");
            continue;
        }
        if (lineNumber == 1) {
            if (line != kHeader)
                return fail("not a project file (expected \"" + std::string(kHeader) + "\")");
            continue;
        }
        if (line == kEnd) {
            ended = true;
            continue;
        }
        if (const std::string message = reader.Line(line); !message.empty())
            return fail(message);
    }
    if (!ended)
        return fail("the file is cut short (no \"end\")");
    if (read.items.empty())
        return fail("no root item");
    project = std::move(read);
    return true;
}

} // namespace wbhost::project
