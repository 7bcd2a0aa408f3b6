// A node of a resource tree: entries, lookups, insertion and removal.
#include "resource_tree/ResTreeNode.h"

#include "kern/Collate.h"

#include <memory>
#include <utility>

namespace wbhw {
namespace {

constexpr std::u16string_view kDisplayName = u"DisplayName";

// Links may point at links; a chain that loops back would otherwise recurse without end.
constexpr int kMaxLinkHops = 64;
thread_local int linkHops = 0;

// Ordered nodes up to this size are scanned; larger ones keep a name index.
constexpr size_t kIndexFrom = 24;

constexpr std::u16string_view kDeferredLoadPath = u":DeferredLoadPath";

// True when NAME might compare equal to ":DeferredLoadPath". A name that starts with an ASCII
// letter or digit starts with that character's weight, never the colon's, unless the locale
// ignores the colon altogether; anything else (punctuation, an ignorable control, a character
// outside ASCII) is left to the lookup.
bool MayNameDeferredContent(std::u16string_view name) noexcept {
    static const bool colonCounts =
        !qv::kern::EqualsNoCase(kDeferredLoadPath.substr(1), kDeferredLoadPath);
    if (name.empty() || !colonCounts)
        return true;
    const char16_t c = name.front();
    return !((c >= u'0' && c <= u'9') || (c >= u'A' && c <= u'Z') || (c >= u'a' && c <= u'z'));
}

} // namespace

// A load makes one entry per element, and a comparison walks and frees them all again: every
// byte of an entry is paid for in cache misses.
static_assert(sizeof(ResTreeEntry) <= sizeof(WString) + 24, "an entry stays in its block size");
static_assert(sizeof(ResTreeNode) <= TreeArena::kMaxBlock, "child nodes come from the arena");

ResTreeEntry::ResTreeEntry(NameStore::Name& name, EntryKind kind) noexcept
    : name_(&name), keyAndKind_(name.key | static_cast<uint64_t>(kind)) {
    NameStore::AddUse(name);
}

ResTreeEntry::~ResTreeEntry() {
    NameStore::Release(*name_);
}

const WString* ResTreeEntry::Text() const noexcept {
    return (IsTextKind(Kind()) || Kind() == EntryKind::Link) ? &text_ : nullptr;
}

ResTreePosition& ResTreePosition::operator++() noexcept {
    if (ordered_)
        ++list_;
    else
        ++set_;
    return *this;
}

ResTreeNode::ResTreeNode(std::u16string_view name, std::u16string_view type, bool ordered)
    : ResTreeNode(name, type, ordered, nullptr) {}

ResTreeNode::ResTreeNode(std::u16string_view name, std::u16string_view type, bool ordered,
                         ResTreeNode* parent)
    : ordered_(ordered), parent_(parent),
      ownMemory_(parent != nullptr ? nullptr : std::make_unique<TreeMemory>()),
      memory_(parent != nullptr ? parent->memory_ : ownMemory_.get()),
      list_(ArenaAllocator<ResTreeEntry>(&memory_->arena)),
      set_(EntryNameLess(), ArenaAllocator<ResTreeEntry>(&memory_->arena)) {
    SetNameAndType(name, type);
}

void ChildNodeDeleter::operator()(ResTreeNode* node) const noexcept {
    ArenaAllocator<ResTreeNode> arena(&node->memory_->arena);
    std::destroy_at(node);
    arena.deallocate(node, 1);
}

ResTreeNode::~ResTreeNode() {
    index_.reset();
    StopWatchingAll();
    parent_ = nullptr;
    // The whole tree goes: its blocks go with the arena, none waits for reuse.
    if (ownMemory_)
        ownMemory_->arena.Close();
    // Children unregister from this node while it is still whole.
    list_.clear();
    set_.clear();
    NameStore::Release(*name_);
    NameStore::Release(*type_);
}

ResTreeNode& ResTreeNode::Root() noexcept {
    ResTreeNode* node = this;
    while (node->parent_ != nullptr)
        node = node->parent_;
    return *node;
}

void ResTreeNode::PrefetchSubtree() const noexcept {
    // A resource of a target description takes about three kilobytes; more than that would
    // only crowd out the cache for the next one.
    constexpr size_t kAhead = 3 * 1024;
    if (!WBT_TREE_ARENA_BYPASS)
        TreeArena::Prefetch(this, kAhead);
}

ResTreeNode::Position ResTreeNode::Begin() const noexcept {
    return ordered_ ? Position(list_.begin()) : Position(set_.begin());
}

ResTreeNode::Position ResTreeNode::End() const noexcept {
    return ordered_ ? Position(list_.end()) : Position(set_.end());
}

ResTreeNode::Position ResTreeNode::Find(std::u16string_view name) const noexcept {
    if (!ordered_)
        return Position(set_.find(EntryNameProbe(name)));
    if (list_.size() > kIndexFrom) {
        if (!index_) {
            index_ = std::make_unique<NameIndex>();
            for (auto it = list_.begin(); it != list_.end(); ++it)
                ++index_->try_emplace(std::u16string_view(it->Name()), IndexedName{it, 0})
                      .first->second.count;
        }
        const auto found = index_->find(name);
        return found == index_->end() ? End() : Position(found->second.first);
    }
    for (auto it = list_.begin(); it != list_.end(); ++it) {
        if (qv::kern::EqualsNoCase(it->Name(), name))
            return Position(it);
    }
    return End();
}

ResTreeNode::Place ResTreeNode::Locate(std::u16string_view name) const noexcept {
    if (ordered_) {
        const Position found = Find(name);
        return {found, found != End()};
    }
    const EntryNameProbe probe(name);
    const auto at = set_.lower_bound(probe);
    return {Position(at), at != set_.end() && !EntryNameLess()(probe, *at)};
}

ResTreeNode::Position ResTreeNode::FindLoading(std::u16string_view name) {
    Position found = Find(name);
    if (found != End())
        return found;
    if (!mayDefer_ || Find(kDeferredLoadPath) == End())
        return found;
    LoadDeferred();
    return Find(name);
}

ResTreeNode* ResTreeNode::NodeAt(Position position) {
    if (position == End())
        return nullptr;
    if (position->Kind() == EntryKind::Child)
        return position->Child();
    if (position->Kind() != EntryKind::Link || position->text_.empty())
        return nullptr;
    if (linkHops >= kMaxLinkHops)
        return nullptr;
    ++linkHops;
    struct Hop {
        ~Hop() { --linkHops; }
    } hop;
    return ResolvePath(position->text_, nullptr);
}

const WString* ResTreeNode::TextAt(std::u16string_view name) {
    const Position found = FindLoading(name);
    if (found == End() || !IsTextKind(found->Kind()))
        return nullptr;
    return &found->text_;
}

ResTreeNode::Position ResTreeNode::InsertEntry(Position position, std::u16string_view spelling,
                                               EntryKind kind, bool& inserted, bool hinted) {
    mayDefer_ = mayDefer_ || MayNameDeferredContent(spelling);
    NameStore::Name& name = memory_->names.Intern(spelling);
    if (ordered_) {
        inserted = true;
        const auto before = position.ordered_ ? position.list_ : list_.end();
        const auto made = list_.emplace(before, name, kind);
        if (index_)
            IndexInserted(made, before == list_.end());
        return Position(made);
    }
    if (hinted) {
        // From a place the caller has just looked up, the set checks the neighbours and inserts
        // there; only a wrong place costs a descent. (A position of the list is no place here.)
        const size_t before = set_.size();
        const auto at =
            set_.emplace_hint(position.ordered_ ? set_.end() : position.set_, name, kind);
        inserted = set_.size() != before;
        return Position(at);
    }
    // One descent of the tree both finds the place and tells whether the name is taken; a lookup
    // first and an insertion at its hint would compare the name a few more times (and names
    // compare in the user's locale).
    const auto [at, isNew] = set_.emplace(name, kind);
    inserted = isNew;
    return Position(at);
}

ResTreeNode::AddResult ResTreeNode::AddText(Position position, std::u16string_view name,
                                            WString text, EntryKind kind) {
    return AddOrSetText(position, name, std::move(text), kind, false);
}

ResTreeNode::AddResult ResTreeNode::AddLink(Position position, std::u16string_view name,
                                            WString path) {
    bool inserted = false;
    const Position at = InsertEntry(position, name, EntryKind::Link, inserted);
    if (inserted) {
        at->text_ = std::move(path);
        RaiseChanges(kChildAdded);
    }
    return {at, inserted};
}

ResTreeNode::AddChildResult ResTreeNode::AddChild(Position position, std::u16string_view name,
                                                  std::u16string_view type, bool ordered) {
    return MakeChild(position, name, type, ordered, false);
}

ResTreeNode::AddChildResult ResTreeNode::AddChildAt(Position position, std::u16string_view name,
                                                    std::u16string_view type, bool ordered) {
    return MakeChild(position, name, type, ordered, true);
}

ResTreeNode::AddChildResult ResTreeNode::MakeChild(Position position, std::u16string_view name,
                                                   std::u16string_view type, bool ordered,
                                                   bool hinted) {
    bool inserted = false;
    const Position at = InsertEntry(position, name, EntryKind::Child, inserted, hinted);
    if (!inserted)
        return {at, at->child_.get(), false};
    // Child nodes live in the tree's arena beside the entries, in the order the load makes them:
    // a walk or a teardown goes from an entry to its node and on to the node's entries.
    ArenaAllocator<ResTreeNode> arena(&memory_->arena);
    ResTreeNode* const child = arena.allocate(1);
    try {
        std::construct_at(child, name, type, ordered, this);
    } catch (...) {
        arena.deallocate(child, 1);
        throw;
    }
    at->child_.reset(child);
    RaiseChanges(kChildAdded);
    return {at, at->child_.get(), true};
}

ResTreeNode::AddResult ResTreeNode::AddOrSetText(Position position, std::u16string_view name,
                                                 WString text, EntryKind kind, bool overwrite) {
    if (!IsTextKind(kind))
        kind = EntryKind::Text;
    bool inserted = false;
    const Position at = InsertEntry(position, name, kind, inserted);
    if (inserted) {
        at->text_ = std::move(text);
        RaiseChanges(kValueAdded);
    } else if (overwrite && SetTextAt(at, std::move(text)) && kind == EntryKind::LocalizedText) {
        at->SetKind(kind);
    }
    return {at, inserted};
}

bool ResTreeNode::SetTextAt(Position position, WString text) {
    if (position == End() || !IsTextKind(position->Kind()))
        return false;
    position->text_ = std::move(text);
    RaiseValueChanged(*position);
    return true;
}

bool ResTreeNode::AppendTextAt(Position position, std::u16string_view text) {
    if (position == End() || !IsTextKind(position->Kind()))
        return false;
    position->text_ += text;
    RaiseValueChanged(*position);
    return true;
}

void ResTreeNode::RaiseValueChanged(const ResTreeEntry& entry) {
    RaiseChanges(kValueChanged);
    // The display name is what the parent shows for this node, so the parent hears of it too.
    if (qv::kern::EqualsNoCase(entry.Name(), kDisplayName)) {
        RaiseChanges(kDisplayNameChanged);
        if (parent_ != nullptr)
            parent_->RaiseChanges(kChildDisplayNameChanged);
    }
}

bool ResTreeNode::SetText(std::u16string_view name, WString text) {
    const Position found = FindLoading(name);
    if (found == End()) {
        AddText(End(), name, std::move(text), EntryKind::Text);
        return true;
    }
    return SetTextAt(found, std::move(text));
}

bool ResTreeNode::SetTextKindAt(Position position, EntryKind kind) {
    if (position == End() || !IsTextKind(position->Kind()) || !IsTextKind(kind))
        return false;
    position->SetKind(kind);
    return true;
}

void ResTreeNode::IndexInserted(EntryList::iterator entry, bool atEnd) {
    const auto [at, isNew] =
        index_->emplace(std::u16string_view(entry->Name()), IndexedName{entry});
    if (isNew)
        return;
    ++at->second.count;
    if (atEnd)
        return;
    // Inserted before some entry: it is the first of its name if the old first follows it.
    for (auto it = std::next(entry); it != list_.end(); ++it) {
        if (it == at->second.first) {
            // The key views the first entry's name, so it is replaced along with it.
            const size_t count = at->second.count;
            index_->erase(at);
            index_->emplace(std::u16string_view(entry->Name()), IndexedName{entry, count});
            return;
        }
    }
}

void ResTreeNode::IndexErasing(EntryList::iterator entry) {
    const auto at = index_->find(std::u16string_view(entry->Name()));
    if (at == index_->end())
        return;
    const size_t left = at->second.count - 1;
    if (at->second.first != entry) {
        at->second.count = left;
        return;
    }
    index_->erase(at);
    if (left == 0)
        return;
    for (auto it = std::next(entry); it != list_.end(); ++it) {
        if (qv::kern::EqualsNoCase(it->Name(), entry->Name())) {
            index_->emplace(std::u16string_view(it->Name()), IndexedName{it, left});
            return;
        }
    }
}

void ResTreeNode::EraseEntry(Position position) noexcept {
    if (ordered_ && index_) {
        try {
            IndexErasing(position.list_);
        } catch (...) {
            index_.reset(); // rebuilt on the next lookup
        }
    }
    if (ordered_)
        list_.erase(position.list_);
    else
        set_.erase(position.set_);
}

bool ResTreeNode::RemoveAt(Position position) {
    if (position == End())
        return false;
    const EntryKind kind = position->Kind();
    ResTreeNode* child = position->child_.get();
    if (child != nullptr) {
        // A load still fills this child (or a node below it); deleting it would pull the node
        // out from under the load.
        if (child->IsInUse())
            return false;
        child->RaiseChanges(kDetaching);
        child->RemoveAllChildren();
        child->RaiseChanges(kDetached);
    }
    position->child_.reset();
    position->text_.clear();
    position->SetKind(EntryKind::Empty);
    EraseEntry(position);
    if (kind == EntryKind::Child || kind == EntryKind::Link)
        RaiseChanges(kChildRemoved);
    else if (IsTextKind(kind))
        RaiseChanges(kValueRemoved);
    return true;
}

void ResTreeNode::RemoveByName(std::u16string_view name) {
    const Position found = Find(name);
    if (found != End())
        RemoveAt(found);
}

void ResTreeNode::RemoveAllChildren() {
    std::vector<Position> children;
    for (Position it = Begin(); it != End(); ++it) {
        if (it->Kind() == EntryKind::Child && it->Child() != nullptr)
            children.push_back(it);
    }
    if (ordered_) {
        for (auto it = children.rbegin(); it != children.rend(); ++it)
            RemoveAt(*it);
        return;
    }
    for (const Position& child : children)
        RemoveAt(child);
}

void ResTreeNode::SetOrdered(bool ordered) {
    if (ordered == ordered_)
        return;
    index_.reset();
    if (ordered) {
        while (!set_.empty()) {
            auto handle = set_.extract(set_.begin());
            ResTreeEntry& entry = handle.value();
            auto& moved = list_.emplace_back(*entry.name_, entry.Kind());
            moved.text_ = std::move(entry.text_);
            moved.child_ = std::move(entry.child_);
        }
    } else {
        while (!list_.empty()) {
            ResTreeEntry& entry = list_.front();
            auto [at, inserted] = set_.emplace(*entry.name_, entry.Kind());
            if (inserted) {
                at->text_ = std::move(entry.text_);
                at->child_ = std::move(entry.child_);
            }
            list_.pop_front();
        }
    }
    ordered_ = ordered;
}

void ResTreeNode::SetNameAndType(std::u16string_view name, std::u16string_view type) {
    // Both are taken before the old ones go: either may be spelled by the old ones.
    NameStore::Name& newName = memory_->names.Intern(name);
    NameStore::AddUse(newName);
    NameStore::Name& newType = memory_->names.Intern(type);
    NameStore::AddUse(newType);
    if (name_ != nullptr)
        NameStore::Release(*name_);
    if (type_ != nullptr)
        NameStore::Release(*type_);
    name_ = &newName;
    type_ = &newType;
}

void ResTreeNode::MarkInUse() noexcept {
    for (ResTreeNode* node = this; node != nullptr; node = node->parent_)
        ++node->useCount_;
}

void ResTreeNode::UnmarkInUse() noexcept {
    for (ResTreeNode* node = this; node != nullptr; node = node->parent_)
        --node->useCount_;
}

} // namespace wbhw
