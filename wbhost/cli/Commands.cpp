// The work behind wbhost's subcommands.
#include "cli/Commands.h"

#include "cli/HostText.h"
#include "cli/HostedModule.h"
#include "host/binding/runtime_api.h"
#include "kern/CodePage.h"
#include "project/HexStatus.h"
#include "resources/ResourceService.h"

#include <cstdint>
#include <fstream>
#include <optional>
#include <ostream>
#include <sstream>

namespace wbhost::cli {
namespace {

using DumpFn = int32_t(const WBRefNum*, WBHandle, WBHandle, uint8_t*);
using CompareFn = uint32_t(const char*, const char*);

// The whole file PATH, or nothing when it cannot be read.
std::optional<std::string> ReadFile(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    if (!in)
        return std::nullopt;
    std::ostringstream content;
    content << in.rdbuf();
    if (in.bad())
        return std::nullopt;
    return content.str();
}

// Host programs hand the module multibyte text in the system's code page; descriptions and
// command lines are UTF-8.
std::string ToHostText(const std::string& utf8) {
    return qv::kern::WideToAnsi(FromUtf8(utf8));
}

} // namespace

int RunTree(const std::string& modulePath, const std::string& file, const std::string& path,
            std::ostream& out, std::ostream& err) {
    HostedModule module(modulePath);
    if (!module.Loaded()) {
        err << "wbhost: " << module.Error() << "\n";
        return kTreeFailed;
    }
    auto* dump = module.Find<DumpFn>("TIOResTree_Dump");
    if (dump == nullptr) {
        err << "wbhost: the module does not export TIOResTree_Dump\n";
        return kTreeFailed;
    }
    resources::ResourceService service;
    const resources::Target* target = service.LoadTargetFile(file);
    if (target == nullptr) {
        err << "wbhost: cannot read the target description " << file << "\n";
        return kTreeFailed;
    }
    for (const auto& problem : target->problems)
        err << file << ": " << ToUtf8(problem.path) << ": " << ToUtf8(problem.message) << "\n";

    const OwnedHandle pathText = NewHostString(ToHostText(path));
    const OwnedHandle dumpText = NewHostString("");
    if (!pathText || !dumpText) {
        err << "wbhost: out of host memory\n";
        return kTreeFailed;
    }
    uint8_t found = 0;
    const int32_t status = dump(&target->refnum, pathText.get(), dumpText.get(), &found);
    if (status < 0) {
        err << "wbhost: TIOResTree_Dump failed with status " << HexStatus(status) << "\n";
        return kTreeFailed;
    }
    if (found == 0) {
        err << "wbhost: no node at \"" << path << "\" in " << file << "\n";
        return kTreeFailed;
    }
    out << ToUtf8(qv::kern::AnsiToWide(HostStringBytes(dumpText.get())));
    return target->problems.empty() ? kTreeOk : kTreeFailed;
}

int RunCompare(const std::string& modulePath, const std::string& required,
               const std::string& offered, std::ostream& out, std::ostream& err) {
    HostedModule module(modulePath);
    if (!module.Loaded()) {
        err << "wbhost: " << module.Error() << "\n";
        return kCompareFailed;
    }
    auto* compare = module.Find<CompareFn>("TIO_CompareTwoResourceTrees");
    if (compare == nullptr) {
        err << "wbhost: the module does not export TIO_CompareTwoResourceTrees\n";
        return kCompareFailed;
    }
    const auto first = ReadFile(required);
    const auto second = ReadFile(offered);
    if (!first || !second) {
        err << "wbhost: cannot read " << (first ? offered : required) << "\n";
        return kCompareFailed;
    }
    const uint32_t result = compare(ToHostText(*first).c_str(), ToHostText(*second).c_str());
    switch (result) {
    case 0:
        out << "match\n";
        return 0;
    case 2:
        out << "tolerated difference\n";
        return 2;
    default:
        out << "not satisfied\n";
        return 1;
    }
}

} // namespace wbhost::cli
