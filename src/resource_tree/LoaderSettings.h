// What a resource-tree load may be told beyond its document: language, directories and limits.
#pragma once

#include <cstddef>
#include <string>

namespace wbhw {

// Settings of one load and of every load nested in it (includes, deferred files). Empty texts
// mean "ask the host"; the limits keep hostile or broken documents from exhausting the process.
struct LoaderSettings {
    // The user-interface language that picks localized texts; empty: the host's language.
    std::u16string language;
    // Directory that ":Include" paths are relative to; empty: the host directory.
    std::string includeDirectory;
    // Directory that ":DeferredLoadPath" files are relative to; empty: the executable's directory.
    std::string deferredDirectory;
    // Loads nested inside a load (includes and deferred files) deeper than this are refused.
    int maxNestedLoads = 32;
    // Node elements nested deeper than this stop the load.
    int maxElementDepth = 1000;
    // A "names" value yields at most this many names; the rest are dropped.
    size_t maxNames = 200000;
    // The budget of one load with everything nested in it (names lists, prototype and names
    // copies, includes, deferred files, messages): entries made, and bytes of text held by what
    // it makes (names, values, expanded names, messages) or read from files. Far above any real
    // target description (tens of thousands of entries, a few MB), far below what would take the
    // machine down: a document of a few KB that multiplies itself stops within seconds.
    size_t maxEntries = 1000u * 1000u;
    size_t maxTextBytes = 64u * 1024u * 1024u;
};

// The settings of loads started without settings of their own (including deferred loads that a
// lookup starts outside any load). Thread-safe.
LoaderSettings DefaultLoaderSettings();
// Replaces the default settings (the embedded host sets its directories and language here).
void SetDefaultLoaderSettings(const LoaderSettings& settings);

} // namespace wbhw
