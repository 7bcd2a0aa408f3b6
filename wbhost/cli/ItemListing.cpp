// The project's item tree as the command line prints it.
#include "cli/ItemListing.h"

#include "cli/AttributeSet.h"
#include "cli/HostText.h"
#include "cli/ItemStates.h"
#include "kern/GuidText.h"
#include "project/HexStatus.h"
#include "provider/TIOIdentifiers.h"

#include <ostream>

namespace wbhost::cli {
namespace {

constexpr std::u16string_view kAttrBag = u"tioAttrBag";
constexpr std::u16string_view kResourceStatus = u"tioResourceStatus";

// A text on one line: line breaks and tabs shown as escapes, so a listing stays one item a line.
std::string OneLine(std::u16string_view text) {
    std::string line;
    for (const char c : ToUtf8(text)) {
        if (c == '\n')
            line += "\\n";
        else if (c == '\r')
            line += "\\r";
        else if (c == '\t')
            line += "\\t";
        else
            line += c;
    }
    return line;
}

void PrintBag(const std::u16string& text, const std::string& indent, std::ostream& out) {
    const auto attributes = ReadAttributeSet(text);
    if (!attributes) {
        out << indent << "tioAttrBag (not an attribute set): " << OneLine(text) << "\n";
        return;
    }
    out << indent << "tioAttrBag:";
    if (attributes->empty())
        out << " (empty)";
    for (const auto& [name, value] : *attributes)
        out << " " << OneLine(name) << "=" << OneLine(value);
    out << "\n";
}

void PrintProperty(const std::u16string& name, const project::Property& property,
                   const std::string& indent, std::ostream& out) {
    using Kind = project::Property::Kind;
    if (name == kAttrBag && property.kind == Kind::String) {
        PrintBag(property.text, indent, out);
        return;
    }
    out << indent << OneLine(name) << ": ";
    if (name == kResourceStatus && property.kind == Kind::Int)
        out << ResourceStatusText(property.number) << "\n";
    else if (property.kind == Kind::String)
        out << "\"" << OneLine(property.text) << "\"\n";
    else if (property.kind == Kind::Bool)
        out << (property.number != 0 ? "true" : "false") << "\n";
    else
        out << property.number << "\n";
}

} // namespace

std::string ItemTypeName(const GUID& type) {
    if (IsEqualGUID(type, project::kProjectType))
        return "project";
    if (IsEqualGUID(type, project::kTargetType))
        return "target";
    if (IsEqualGUID(type, wbproj::kFolderType))
        return "folder";
    if (IsEqualGUID(type, tio::kIOItemType))
        return "Tangent I/O item";
    return "item of type " + qv::kern::GuidToNarrowString(type);
}

std::string ResourceStatusText(int32_t status) {
    if (status == 2)
        return "held by another item";
    const std::string_view word = StatusWord(status);
    return word.empty() ? "status " + std::to_string(status) : std::string(word);
}

void PrintItemTree(const project::ProjectItem& item, std::ostream& out, int depth) {
    const std::string indent(static_cast<size_t>(depth) * 2, ' ');
    out << indent << ItemTypeName(item.Type()) << " \"" << OneLine(item.Name()) << "\" "
        << qv::kern::GuidToNarrowString(item.Id());
    if ((item.Flags() & wbproj::kShownFlag) == 0)
        out << " hidden";
    if (!item.DescriptionFile().empty())
        out << " from " << item.DescriptionFile();
    if (FAILED(item.BindStatus()))
        out << " (its object did not bind: status " << HexStatus(item.BindStatus()) << ")";
    out << "\n";
    const auto& properties = item.Bag().Properties();
    const bool isIOItem = IsEqualGUID(item.Type(), tio::kIOItemType);
    for (const auto& [name, property] : properties)
        PrintProperty(name, property, indent + "    ", out);
    // An item that has not told its status yet says so, rather than looking bound by silence.
    if (isIOItem && properties.find(std::u16string(kResourceStatus)) == properties.end())
        out << indent << "    tioResourceStatus: not reported yet\n";
    for (const auto& child : item.Children())
        PrintItemTree(*child.Get(), out, depth + 1);
}

} // namespace wbhost::cli
