// What the resource-tree fuzz targets share: turning bytes into a document, the settings of a load
// and a scratch directory with a few files to include.
#pragma once

#include "resource_tree/LoaderSettings.h"
#include "resource_tree/LoaderText.h"
#include "resource_tree/ResTreeNode.h"

#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>

namespace wbhw::fuzz {

// The first byte chooses how the rest is read: as UTF-8 (bad bytes replaced) or as raw UTF-16
// units, so that lone surrogates and every code unit reach the loader too.
inline std::u16string DocumentFromBytes(const uint8_t* data, size_t size) {
    if (size == 0)
        return {};
    const std::string_view rest(reinterpret_cast<const char*>(data) + 1, size - 1);
    if ((data[0] & 1) == 0)
        return FromUtf8Lenient(rest);
    std::u16string units(rest.size() / 2, u'\0');
    for (size_t i = 0; i < units.size(); ++i)
        units[i] = static_cast<char16_t>(static_cast<uint8_t>(rest[2 * i]) |
                                         (static_cast<uint8_t>(rest[2 * i + 1]) << 8));
    return units;
}

// A scratch directory made once per process, holding documents that include each other and
// deferred files, so that the loader's file paths are exercised without touching anything else.
inline const std::string& ScratchDirectory() {
    static const std::string directory = [] {
        std::string pattern =
            (std::filesystem::temp_directory_path() / "restree-fuzz-XXXXXX").string();
        if (mkdtemp(pattern.data()) == nullptr)
            std::abort();
        const auto write = [&pattern](const char* name, const char* text) {
            std::ofstream(pattern + "/" + name) << text;
        };
        write("a.xml", "<A><:Include what='children'>b.xml</:Include><X>#{v}</X></A>");
        write("b.xml", "<B><:Include>a.xml</:Include><Y name='#{v}'/></B>");
        write("child.xml", "<Module name='inc'><Where>#{site}</Where>"
                           "<:DeferredLoadPath>late.xml,..</:DeferredLoadPath></Module>");
        write("late.xml", "<Module><Late>1</Late><Group names='L[i=0..3]'><I>#{i}</I></Group>"
                          "</Module>");
        write("bad.xml", "<Top><Unclosed></Top>");
        return pattern;
    }();
    return directory;
}

// Whether the input asks for the production limits: bit 1 of the first byte (DocumentFromBytes
// reads bit 0). Small limits keep most runs quick, so the fuzzer explores more documents; the
// production ones are what a hostile description meets, so the budget's own stops are reached.
inline bool WantsProductionLimits(const uint8_t* data, size_t size) {
    return size != 0 && (data[0] & 2) != 0;
}

// The settings of a fuzzed load: the production limits, or ones small enough that a run stays
// in the millisecond range.
inline LoaderSettings FuzzSettings(bool production) {
    LoaderSettings settings;
    settings.language = u"deu";
    settings.includeDirectory = ScratchDirectory();
    settings.deferredDirectory = ScratchDirectory();
    if (production)
        return settings;
    settings.maxNames = 2000;
    settings.maxEntries = 200000;
    settings.maxElementDepth = 200;
    settings.maxNestedLoads = 8;
    return settings;
}

// Entries of NODE and every node below it, counted up to just past LIMIT.
inline size_t CountEntries(const ResTreeNode& node, size_t limit) {
    size_t count = 0;
    for (ResTreePosition at = node.Begin(); at != node.End() && count <= limit; ++at) {
        ++count;
        if (at->Kind() == EntryKind::Child && at->Child() != nullptr)
            count += CountEntries(*at->Child(), limit - count + 1);
    }
    return count;
}

// Trees larger than this are checked by their size only: walking or writing a tree of a million
// entries under the sanitizers takes minutes, and shows nothing a smaller tree does not.
inline constexpr size_t kLargestWalkedTree = 20000;

// Aborts when a load made more entries than its budget allows (the root's own and the message
// entry may come on top).
inline size_t CheckWithinBudget(const ResTreeNode& root, const LoaderSettings& settings) {
    const size_t count = CountEntries(root, settings.maxEntries + 2);
    if (count > settings.maxEntries + 2)
        std::abort();
    return count;
}

} // namespace wbhw::fuzz
