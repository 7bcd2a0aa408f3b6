// The attribute bag: sets, inheritance, paths and change notification.
#include "attribute_bag/TIOAttrBag.h"

#include <utility>

using qv::kern::EqualsNoCase;

TIOAttrBag::TIOAttrBag(std::u16string name) : name_(std::move(name)) {}

TIOAttrBag::~TIOAttrBag() {
    ClearChildren();
}

bool TIOAttrBag::SetName(std::u16string name) {
    if (parent_ == nullptr) {
        name_ = std::move(name);
        return true;
    }
    // The parent's key must follow the name, or lookups and paths would disagree.
    ChildMap& siblings = parent_->children_;
    const auto clash = siblings.find(name);
    if (clash != siblings.end() && clash->second.get() != this)
        return false;
    auto node = siblings.extract(name_);
    node.key() = name;
    name_ = std::move(name);
    siblings.insert(std::move(node));
    return true;
}

TIOAttrBag& TIOAttrBag::Root() noexcept {
    TIOAttrBag* set = this;
    while (set->parent_ != nullptr)
        set = set->parent_;
    return *set;
}

const TIOAttrBag& TIOAttrBag::Root() const noexcept {
    return const_cast<TIOAttrBag*>(this)->Root();
}

std::u16string TIOAttrBag::GetPath() const {
    if (parent_ == nullptr)
        return u"/";
    std::u16string path = parent_->GetPath();
    path += name_;
    path += u'/';
    return path;
}

TIOAttrBag* TIOAttrBag::FindChild(std::u16string_view name) const noexcept {
    const auto it = children_.find(name);
    return it == children_.end() ? nullptr : it->second.get();
}

TIOAttrBag& TIOAttrBag::GetOrCreateChild(std::u16string_view name) {
    if (TIOAttrBag* existing = FindChild(name))
        return *existing;
    auto child = std::make_unique<TIOAttrBag>(std::u16string(name));
    TIOAttrBag& result = *child;
    child->parent_ = this;
    children_.emplace(std::u16string(name), std::move(child));
    return result;
}

std::pair<TIOAttrBag*, bool> TIOAttrBag::AdoptChild(std::unique_ptr<TIOAttrBag>& child) {
    if (child == nullptr || child->parent_ != nullptr)
        return {nullptr, false};
    if (TIOAttrBag* existing = FindChild(child->name_))
        return {existing, false};
    // The key is copied before the set moves, so a failed insertion leaves CHILD untouched.
    std::u16string key = child->name_;
    const auto [it, inserted] = children_.try_emplace(std::move(key), nullptr);
    (void)inserted;
    child->parent_ = this;
    it->second = std::move(child);
    return {it->second.get(), true};
}

bool TIOAttrBag::RemoveChild(std::u16string_view name) {
    const auto it = children_.find(name);
    if (it == children_.end())
        return false;
    std::unique_ptr<TIOAttrBag> child = std::move(it->second);
    children_.erase(it);
    child->parent_ = nullptr;
    return true;
}

void TIOAttrBag::ClearChildren() noexcept {
    for (auto& [key, child] : children_)
        child->parent_ = nullptr;
    children_.clear();
}

TIOAttrBag::Entry TIOAttrBag::FindVisible(std::u16string_view name) const noexcept {
    for (const TIOAttrBag* set = this; set != nullptr; set = set->parent_) {
        const auto it = set->attributes_.find(name);
        if (it != set->attributes_.end())
            return Entry{set, &it->first, &it->second};
    }
    return {};
}

const std::u16string* TIOAttrBag::FindValue(std::u16string_view name) const noexcept {
    return FindVisible(name).value;
}

std::u16string TIOAttrBag::GetValue(std::u16string_view name) const {
    const std::u16string* value = FindValue(name);
    return value != nullptr ? *value : std::u16string();
}

std::u16string* TIOAttrBag::FindOwn(std::u16string_view name) noexcept {
    const auto it = attributes_.find(name);
    return it == attributes_.end() ? nullptr : &it->second;
}

void TIOAttrBag::SetValue(std::u16string_view name, std::u16string_view value) {
    for (TIOAttrBag* set = this; set != nullptr; set = set->parent_) {
        std::u16string* own = set->FindOwn(name);
        if (own == nullptr)
            continue;
        if (!EqualsNoCase(*own, value)) {
            own->assign(value);
            set->MarkDirty();
        }
        return;
    }
    attributes_.emplace(std::u16string(name), std::u16string(value));
    MarkDirty();
}

void TIOAttrBag::AddIfAbsent(std::u16string_view name, std::u16string_view value) {
    if (FindVisible(name))
        return;
    attributes_.emplace(std::u16string(name), std::u16string(value));
    MarkDirty();
}

bool TIOAttrBag::InsertOwn(std::u16string_view name, std::u16string_view value) {
    if (FindOwn(name) != nullptr)
        return false;
    attributes_.emplace(std::u16string(name), std::u16string(value));
    MarkDirty();
    return true;
}

bool TIOAttrBag::RemoveAttribute(std::u16string_view name) {
    const auto it = attributes_.find(name);
    if (it == attributes_.end())
        return false;
    attributes_.erase(it);
    MarkDirty();
    return true;
}

std::vector<TIOAttrBag::Entry> TIOAttrBag::VisibleAttributes(bool ownOnly) const {
    std::vector<Entry> entries;
    for (const TIOAttrBag* set = this; set != nullptr; set = ownOnly ? nullptr : set->parent_) {
        for (const auto& [name, value] : set->attributes_) {
            // Only the nearest definition of a name is visible; deeper ones are shadowed.
            if (FindVisible(name).holder == set)
                entries.push_back(Entry{set, &name, &value});
        }
    }
    return entries;
}

std::u16string TIOAttrBag::EntryPath(const Entry& entry) {
    if (!entry)
        return {};
    std::u16string path = entry.holder->GetPath();
    path += *entry.name;
    path += u'/';
    return path;
}

TIOAttrBag* TIOAttrBag::ResolvePath(std::u16string_view path, size_t start,
                                    std::u16string* remainder) {
    TIOAttrBag* set = this;
    if (start == 0 && !path.empty() && path.front() == u'/') {
        set = &Root();
        start = 1;
    }
    // Each pass consumes one segment; the loop is the tail recursion of a segment-wise walk.
    while (start < path.size()) {
        const size_t slash = path.find(u'/', start);
        const size_t end = slash == std::u16string_view::npos ? path.size() : slash;
        TIOAttrBag* child = set->FindChild(path.substr(start, end - start));
        if (child == nullptr) {
            if (remainder == nullptr)
                return nullptr;
            remainder->assign(path.substr(start));
            return set;
        }
        set = child;
        start = end + 1;
    }
    if (remainder != nullptr)
        remainder->clear();
    return set;
}

int32_t TIOAttrBag::NotifyChanges(bool forced) {
    const bool changed = dirty_ || forced;
    if (changed && observer_ != nullptr) {
        const int32_t status = observer_->OnAttrBagChanged(*this, dirty_, forced);
        if (status < 0)
            return status;
    }
    // An observer may reshape the tree while it is told; walk by name so that a child it removed
    // is skipped instead of being visited through a dangling entry.
    std::vector<std::u16string> names;
    names.reserve(children_.size());
    for (const auto& [name, child] : children_)
        names.push_back(name);
    for (const std::u16string& name : names) {
        TIOAttrBag* child = FindChild(name);
        if (child == nullptr)
            continue;
        const int32_t status = child->NotifyChanges(changed);
        if (status < 0)
            return status;
    }
    dirty_ = false;
    return 0;
}
