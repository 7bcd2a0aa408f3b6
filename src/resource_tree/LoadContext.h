// The state shared by one load and every load nested in it (includes, deferred files).
#pragma once

#include "resource_tree/LoaderSettings.h"
#include "resource_tree/SpellingTable.h"

#include <cstdint>
#include <memory>
#include <string>

namespace wbhw {

class ParseStack;

// What the loader needs to know about an element tag; worked out once per tag and load.
struct TagInfo {
    bool isLink = false;     // ":Link"
    bool isInclude = false;  // ":Include"
    bool isPathText = false; // ends with "Path" or "Dir", or is ":Include"
    bool isReserves = false; // "Reserves"
    bool isListType = false; // a list type by the type registry
};

// The attributes that steer the loader.
enum class LoaderAttribute : uint8_t {
    Other,
    Name,
    Names,
    Prototype,
    Next,
    Ordered,
    Replace,
    Type,
    XmlSpace,
    Localize,
    What
};

// Raised to stop a load and every load around it once a limit is passed; the message has
// already been written to the node.
struct LoadAborted {};

struct LoadContext {
    LoaderSettings settings;
    std::u16string language;
    int runningLoads = 0;
    size_t entriesMade = 0;
    size_t textBytes = 0;
    ParseStack* innermost = nullptr;
    // Names compare without regard to case in the user's locale, which is not cheap; a document
    // repeats a handful of tags and attribute names, so each spelling is classified once.
    SpellingTable<TagInfo> tags;
    SpellingTable<LoaderAttribute> attributes;

    const TagInfo& ClassifyTag(const std::u16string& tag);
    LoaderAttribute ClassifyAttribute(const std::u16string& name);
};

// Joins the load running on this thread, or starts a new context for an outermost one.
class LoadScope {
public:
    // SETTINGS apply when no load is running; nested loads keep the outer settings. ISLOAD tells
    // whether the scope counts as a nested load (a parse) or only needs the context.
    LoadScope(const LoaderSettings* settings, bool isLoad);
    ~LoadScope();
    LoadScope(const LoadScope&) = delete;
    LoadScope& operator=(const LoadScope&) = delete;

    LoadContext& Context() noexcept { return *context_; }
    // True for the scope that made the context.
    bool IsOutermost() const noexcept { return owned_ != nullptr; }
    // True when this load is nested deeper than the settings allow.
    bool IsTooDeep() const noexcept;

private:
    LoadContext* context_;
    std::unique_ptr<LoadContext> owned_;
    bool isLoad_;
};

} // namespace wbhw
