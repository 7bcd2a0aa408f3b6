// The work behind wbhost's subcommands.
#include "cli/Commands.h"

#include "cli/CompareReport.h"
#include "cli/ExitStatus.h"
#include "cli/HostOptions.h"
#include "cli/HostText.h"
#include "cli/HostedModule.h"
#include "cli/ProblemLines.h"
#include "host/binding/runtime_api.h"
#include "kern/CodePage.h"
#include "project/HexStatus.h"
#include "resource_tree/ResTreeWriter.h"
#include "resource_tree/ResourceCompare.h"
#include "resources/InputFile.h"
#include "resources/ResourceService.h"

#include <cstdint>
#include <mutex>
#include <optional>
#include <ostream>

namespace wbhost::cli {
namespace {

using DumpFn = int32_t(const WBRefNum*, WBHandle, WBHandle, uint8_t*);
using CompareFn = uint32_t(const char*, const char*);
using InfoFn = int32_t();

// The export NAME of MODULE; null, with the reason on ERR, when the module did not load or
// does not export it.
template <class Fn>
Fn* FindExport(const HostedModule& module, const char* name, std::ostream& err) {
    if (!module.Loaded()) {
        err << "wbhost: " << module.Error() << "\n";
        return nullptr;
    }
    Fn* const function = module.Find<Fn>(name);
    if (function == nullptr)
        err << "wbhost: the module does not export " << name << "\n";
    return function;
}

// The problems TARGET's load recorded, one line each.
std::vector<ProblemLine> ProblemsOf(const resources::Target& target, const std::string& file) {
    std::vector<ProblemLine> lines;
    for (const auto& problem : target.problems) {
        auto split = SplitProblems(ToUtf8(problem.message), file);
        lines.insert(lines.end(), split.begin(), split.end());
    }
    return lines;
}

// Names on ERR the characters of TARGET's tree that the host's code page cannot represent, and
// so that a dump handed over in it shows as "?".
void WarnOfLostCharacters(resources::Target& target, const std::string& file, std::ostream& err) {
    const wbhw::ResTreeDocument document = [&] {
        const std::lock_guard hold(target.tree->Mutex());
        return wbhw::WriteResTree(target.tree->Root());
    }();
    const std::vector<char32_t> lost = CharactersTheHostCannotKeep(document.xml);
    if (!lost.empty())
        err << "warning: " << file << ": the host's code page (" << HostCodePage()
            << ") cannot represent " << DescribeCharacters(lost) << "; the dump shows \"?\"\n";
}

// The description in FILE, decoded as the loader decodes a file; nothing, with the reason on
// ERR, when it cannot be read or holds characters the host's code page cannot represent (the
// module would compare "?" with "?" and answer as if they were the same).
std::optional<std::string> ReadDescriptionForModule(const std::string& file, std::ostream& err) {
    std::string bytes;
    std::string error;
    if (!resources::ReadInputFile(file, bytes, error)) {
        err << "wbhost: cannot read " << error << "\n";
        return std::nullopt;
    }
    const std::u16string text = resources::DecodeDocument(bytes);
    const std::vector<char32_t> lost = CharactersTheHostCannotKeep(text);
    if (!lost.empty()) {
        err << "wbhost: " << file << ": the host's code page (" << HostCodePage()
            << ") cannot represent " << DescribeCharacters(lost)
            << "; the module would compare them as \"?\", so there is no answer\n";
        return std::nullopt;
    }
    return qv::kern::WideToAnsi(text);
}

} // namespace

int RunTree(const std::string& modulePath, const std::string& file, const std::string& path,
            std::ostream& out, std::ostream& err) {
    const HostedModule module(modulePath);
    auto* const dump = FindExport<DumpFn>(module, "TIOResTree_Dump", err);
    if (dump == nullptr)
        return kExitFailed;
    std::string error;
    resources::ResourceService service;
    resources::Target* const target =
        resources::CheckInputFile(file, error) ? service.LoadTargetFile(file) : nullptr;
    if (target == nullptr) {
        err << "wbhost: cannot read the target description " << (error.empty() ? file : error)
            << "\n";
        return kExitFailed;
    }
    for (const ProblemLine& problem : ProblemsOf(*target, file))
        err << FormatProblem(problem, false);

    const OwnedHandle pathText = NewHostString(ToHostText(path));
    const OwnedHandle dumpText = NewHostString("");
    if (!pathText || !dumpText) {
        err << "wbhost: out of host memory\n";
        return kExitFailed;
    }
    uint8_t found = 0;
    const int32_t status = dump(&target->refnum, pathText.get(), dumpText.get(), &found);
    if (status < 0) {
        err << "wbhost: TIOResTree_Dump failed with status " << HexStatus(status) << "\n";
        return kExitFailed;
    }
    if (found == 0) {
        err << "wbhost: no node at \"" << path << "\" in " << file << "\n";
        return kExitFailed;
    }
    out << ToUtf8(qv::kern::AnsiToWide(HostStringBytes(dumpText.get())));
    WarnOfLostCharacters(*target, file, err);
    return target->problems.empty() ? kExitOk : kExitFailed;
}

int RunTreeCheck(const std::vector<std::string>& files, bool context, std::ostream& out,
                 std::ostream& err) {
    size_t problems = 0;
    size_t unreadable = 0;
    for (const std::string& file : files) {
        std::string error;
        resources::ResourceService service;
        const resources::Target* const target =
            resources::CheckInputFile(file, error) ? service.LoadTargetFile(file) : nullptr;
        if (target == nullptr) {
            err << "wbhost: cannot read the target description " << (error.empty() ? file : error)
                << "\n";
            ++unreadable;
            continue;
        }
        for (const ProblemLine& problem : ProblemsOf(*target, file)) {
            out << FormatProblem(problem, context);
            ++problems;
        }
    }
    out << problems << (problems == 1 ? " problem" : " problems") << " in " << files.size()
        << (files.size() == 1 ? " file" : " files");
    if (unreadable > 0)
        out << ", " << unreadable << " not read";
    out << "\n";
    if (unreadable > 0)
        return kExitTolerated;
    return problems == 0 ? kExitOk : kExitFailed;
}

int RunCompare(const std::string& modulePath, const std::string& required,
               const std::string& offered, bool explain, std::ostream& out, std::ostream& err) {
    const auto first = ReadDescriptionForModule(required, err);
    const auto second = first ? ReadDescriptionForModule(offered, err) : std::nullopt;
    if (!first || !second)
        return kExitCannotRun;
    uint32_t answer = 0;
    wbhw::CompareExplanation why;
    if (explain) {
        // The module's export answers with a number only. The host carries the same comparison
        // (built from the same sources); one walk of it gives the answer and what decided it,
        // so the two cannot disagree.
        answer = wbhw::CompareResourceTexts(*first, *second, &why);
    } else {
        const HostedModule module(modulePath);
        auto* const compare = FindExport<CompareFn>(module, "TIO_CompareTwoResourceTrees", err);
        if (compare == nullptr)
            return kExitCannotRun;
        answer = compare(first->c_str(), second->c_str());
    }
    out << AnswerText(answer) << "\n";
    if (explain)
        WriteExplanation(why, out);
    return AnswerStatus(answer);
}

int RunVersion(const std::string& version, const std::string& modulePath, std::ostream& out,
               std::ostream& err) {
    out << "wbhost " << version << "\n";
    const HostedModule module(modulePath);
    auto* const info = FindExport<InfoFn>(module, "GetInfo", err);
    if (info == nullptr)
        return kExitFailed;
    out << "module " << AbsolutePath(modulePath) << " (GetInfo " << info() << ")\n";
    return kExitOk;
}

} // namespace wbhost::cli
