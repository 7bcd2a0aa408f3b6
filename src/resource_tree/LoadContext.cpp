// The state shared by one load and every load nested in it (includes, deferred files).
#include "resource_tree/LoadContext.h"

#include "host/UiLanguage.h"
#include "kern/Collate.h"
#include "resource_tree/TypeRegistry.h"

#include <array>
#include <mutex>
#include <utility>

namespace wbhw {
namespace {

thread_local LoadContext* current = nullptr;

std::mutex defaultsLock;
LoaderSettings& Defaults() {
    static LoaderSettings defaults;
    return defaults;
}

constexpr std::array<std::pair<std::u16string_view, LoaderAttribute>, 10> kAttributes{{
    {u"name", LoaderAttribute::Name},
    {u"names", LoaderAttribute::Names},
    {u"prototype", LoaderAttribute::Prototype},
    {u"next", LoaderAttribute::Next},
    {u"ordered", LoaderAttribute::Ordered},
    {u"replace", LoaderAttribute::Replace},
    {u"type", LoaderAttribute::Type},
    {u"xml:space", LoaderAttribute::XmlSpace},
    {u"localize", LoaderAttribute::Localize},
    {u"what", LoaderAttribute::What},
}};

} // namespace

LoaderSettings DefaultLoaderSettings() {
    const std::lock_guard<std::mutex> hold(defaultsLock);
    return Defaults();
}

void SetDefaultLoaderSettings(const LoaderSettings& settings) {
    const std::lock_guard<std::mutex> hold(defaultsLock);
    Defaults() = settings;
}

const TagInfo& LoadContext::ClassifyTag(const std::u16string& tag) {
    if (const TagInfo* known = tags.Find(tag))
        return *known;
    TagInfo info;
    info.isLink = qv::kern::EqualsNoCase(tag, u":Link");
    info.isInclude = qv::kern::EqualsNoCase(tag, u":Include");
    info.isPathText = info.isInclude || EndsWithNoCase(tag, u"Path") || EndsWithNoCase(tag, u"Dir");
    info.isReserves = qv::kern::EqualsNoCase(tag, u"Reserves");
    info.isListType = IsListType(tag);
    return tags.Add(tag, info);
}

LoaderAttribute LoadContext::ClassifyAttribute(const std::u16string& name) {
    if (const LoaderAttribute* known = attributes.Find(name))
        return *known;
    LoaderAttribute kind = LoaderAttribute::Other;
    for (const auto& [word, value] : kAttributes) {
        if (qv::kern::EqualsNoCase(name, word)) {
            kind = value;
            break;
        }
    }
    return attributes.Add(name, kind);
}

LoadScope::LoadScope(const LoaderSettings* settings, bool isLoad)
    : context_(current), isLoad_(isLoad) {
    if (context_ == nullptr) {
        owned_ = std::make_unique<LoadContext>();
        context_ = owned_.get();
        context_->settings = settings != nullptr ? *settings : DefaultLoaderSettings();
        context_->language = context_->settings.language.empty() ? qv::host::UserInterfaceLanguage()
                                                                 : context_->settings.language;
        current = context_;
    }
    if (isLoad_)
        ++context_->runningLoads;
}

LoadScope::~LoadScope() {
    if (isLoad_)
        --context_->runningLoads;
    if (owned_)
        current = nullptr;
}

bool LoadScope::IsTooDeep() const noexcept {
    return context_->runningLoads > context_->settings.maxNestedLoads + 1;
}

} // namespace wbhw
