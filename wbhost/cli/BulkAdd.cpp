// The work behind `wbhost project add-items`: many Tangent I/O items in one bulk creation.
#include "cli/AttributeSet.h"
#include "cli/HostStringList.h"
#include "cli/HostText.h"
#include "cli/HostedModule.h"
#include "cli/ItemList.h"
#include "cli/NewItemChecks.h"
#include "cli/ProjectCommands.h"
#include "project/AtomicFile.h"
#include "project/HexStatus.h"
#include "resource_tree/ListText.h"
#include "runtime/RefnumTable.h"

#include <ostream>

namespace wbhost::cli {

namespace {

using project::ProjectItem;
using CreateMultipleFn = int32_t(const WBRefNum*, WBHandle*);

// What the list's lines have placed so far: the items' and the folders' paths below the target.
struct ListedPlaces {
    NameSet items;
    NameSet folders;
};

// Why the item at PARTS clashes with an earlier line of the list (an item where a folder goes or
// the reverse); empty when it does not.
std::string ListClash(const std::vector<std::u16string>& parts, ListedPlaces& placed) {
    std::vector<std::u16string> prefix;
    for (size_t i = 0; i + 1 < parts.size(); ++i) {
        prefix.push_back(parts[i]);
        const std::u16string folder = wbhw::JoinListText(prefix, u'/');
        if (placed.items.count(folder) != 0)
            return Quoted(folder) + " is an item of an earlier line, not a folder";
        placed.folders.insert(folder);
    }
    const std::u16string item = wbhw::JoinListText(parts, u'/');
    if (placed.folders.count(item) != 0)
        return Quoted(item) + " is a folder of an earlier line";
    placed.items.insert(item);
    return {};
}

// The attribute-set text of LINE's item in the host's code page, or the reason there is none.
struct LineText {
    std::string text;
    std::string error;
    size_t column = 1;
};

LineText CheckLine(project::Project& project, ProjectItem& target, const ItemLine& line,
                   NameSet& ioNames, ListedPlaces& placed) {
    const size_t resourceColumn = line.name.size() + 2;
    const std::u16string resource = ResourceNodePath(project, target, FromUtf8(line.resource));
    if (resource.empty())
        return {{},
                "target " + Quoted(target.Name()) + " has no resource " +
                    Quoted(FromUtf8(line.resource)),
                resourceColumn};
    const std::u16string place = FromUtf8(line.name);
    const std::vector<std::u16string> parts = PlaceParts(place);
    if (parts.empty())
        return {{}, Quoted(place) + " is no item name (empty name or folder)"};
    std::string why = PlaceConflict(target, parts, ioNames);
    if (why.empty())
        why = ListClash(parts, placed);
    if (!why.empty())
        return {{}, why};
    ioNames.insert(parts.back());
    std::vector<SetAttribute> attributes;
    for (const auto& [name, value] : line.attributes)
        attributes.emplace_back(FromUtf8(name), FromUtf8(value));
    const std::u16string set = NewItemAttributeSet(place, resource, attributes);
    if (const auto lost = CharactersTheHostCannotKeep(set); !lost.empty())
        return {{},
                "the host's code page (" + HostCodePage() + ") cannot represent " +
                    DescribeCharacters(lost)};
    return {ToHostText(ToUtf8(set)), {}};
}

size_t CountIOItems(const ProjectItem& target) {
    return IOItemNames(target).size();
}

} // namespace

int RunAddItems(const HostOptions& options, const std::string& projectPath,
                const std::string& targetName, const std::string& listPath, std::ostream& out,
                std::ostream& err) {
    std::string text;
    std::string error;
    if (!project::ReadWholeFile(listPath, text, &error)) {
        err << "wbhost: " << error << "\n";
        return kProjectFailed;
    }
    std::vector<ItemLine> lines;
    if (const auto bad = ParseItemList(text, lines)) {
        err << listPath << ":" << bad->line << ":" << bad->column << ": error: " << bad->message
            << "\n";
        return kProjectFailed;
    }
    if (lines.empty()) {
        err << listPath << ": error: the list names no item\n";
        return kProjectFailed;
    }
    session::HostSession session;
    ProjectItem* const target = OpenProjectTarget(options, session, projectPath, targetName, err);
    if (target == nullptr)
        return kProjectFailed;
    project::Project& project = *session.Project();
    auto* const create = session.Module()->Find<CreateMultipleFn>("TIO_CreateMultiple");
    if (create == nullptr) {
        err << "wbhost: the loaded module does not export TIO_CreateMultiple\n";
        return kProjectFailed;
    }
    NameSet ioNames = IOItemNames(*target);
    const size_t before = ioNames.size();
    ListedPlaces placed;
    std::vector<std::string> texts;
    for (const ItemLine& line : lines) {
        LineText checked = CheckLine(project, *target, line, ioNames, placed);
        if (!checked.error.empty()) {
            err << listPath << ":" << line.line << ":" << checked.column
                << ": error: " << checked.error << "\n";
            return kProjectFailed;
        }
        texts.push_back(std::move(checked.text));
    }
    HostStringList definitions(texts);
    if (definitions.Handle() == nullptr) {
        err << "wbhost: the host is out of memory for " << texts.size() << " definitions\n";
        return kProjectFailed;
    }
    runtime::RefnumTable& refnums = runtime::RefnumTable::Instance();
    const WBRefNum refnum = refnums.Add(target->Object());
    const int32_t status = create(&refnum, &definitions.Handle());
    refnums.Remove(refnum);
    if (FAILED(status)) {
        err << "wbhost: the module created " << CountIOItems(*target) - before << " of "
            << texts.size() << " items, then failed (status " << HexStatus(status)
            << "); nothing was saved\n";
        return kProjectFailed;
    }
    if (!session.Save(projectPath, &error)) {
        err << "wbhost: " << error << "\n";
        return kProjectFailed;
    }
    out << "added " << texts.size() << " items to target \"" << ToUtf8(target->Name())
        << "\" in one call\n";
    FinishSession(options, session, out);
    return kProjectOk;
}

} // namespace wbhost::cli
