// A node of a resource tree: a named, typed set of entries (texts, links, child nodes).
#pragma once

#include "kern/Collate.h"
#include "kern/StringBase.h"
#include "resource_tree/LoaderSettings.h"
#include "resource_tree/NameStore.h"
#include "resource_tree/ResTreeNodeChangeObserver.h"
#include "resource_tree/TreeArena.h"

#include <cstdint>
#include <list>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <vector>

namespace wbhw {

using qv::kern::WString;

// What an entry holds.
enum class EntryKind : uint32_t {
    Empty = 0,        // being built or cleared
    Text = 1,         // a plain text property
    Child = 2,        // a child node owned by the entry
    Link = 3,         // a path to another node, relative to the node holding the link
    LocalizedText = 4 // the chosen text, a NUL, then the whole language list as read
};

// True for the kinds that hold a text property.
inline bool IsTextKind(EntryKind kind) noexcept {
    return kind == EntryKind::Text || kind == EntryKind::LocalizedText;
}

// Destroys a child node and gives its block back to its tree's arena.
struct ChildNodeDeleter {
    void operator()(ResTreeNode* node) const noexcept;
};
using ChildNodePtr = std::unique_ptr<ResTreeNode, ChildNodeDeleter>;

// One named entry of a node. Entries are changed only through their node.
class ResTreeEntry {
public:
    // An entry named NAME (of its tree's name store), counted as one use of it.
    ResTreeEntry(NameStore::Name& name, EntryKind kind) noexcept;
    ~ResTreeEntry();
    ResTreeEntry(const ResTreeEntry&) = delete;
    ResTreeEntry& operator=(const ResTreeEntry&) = delete;

    // The entry's name.
    const WString& Name() const noexcept { return name_->spelling; }
    // The order key of the name (qv::kern::NameOrderKey), made once with the entry: sorted
    // nodes and the comparison walk order most pairs of entries by it alone.
    uint64_t NameKey() const noexcept { return keyAndKind_ & ~qv::kern::kOrderKeyFreeBits; }
    // The entry's kind.
    EntryKind Kind() const noexcept {
        return static_cast<EntryKind>(keyAndKind_ & qv::kern::kOrderKeyFreeBits);
    }
    // The string of a Text, LocalizedText or Link entry; null for other kinds.
    const WString* Text() const noexcept;
    // The child node of a Child entry; null for other kinds.
    ResTreeNode* Child() const noexcept { return child_.get(); }

private:
    friend class ResTreeNode;
    void SetKind(EntryKind kind) const noexcept {
        keyAndKind_ = NameKey() | static_cast<uint64_t>(kind);
    }

    NameStore::Name* name_;
    // Unordered nodes keep entries in a set keyed by name, whose elements are const; the value
    // is not part of the key, so it stays changeable. The kind shares a word with the name's
    // order key (in the bits the key leaves free), which keeps an entry in its block size.
    mutable uint64_t keyAndKind_;
    mutable WString text_;
    mutable ChildNodePtr child_;
};

// -1, 0 or 1 as the names of two entries collate, without regard to case, in the user's locale.
inline int CompareEntryNames(const ResTreeEntry& a, const ResTreeEntry& b) noexcept {
    return qv::kern::CompareNoCaseKeyed(a.Name(), a.NameKey(), b.Name(), b.NameKey());
}

// A name looked up among sorted entries, with its order key made once for the whole descent.
struct EntryNameProbe {
    explicit EntryNameProbe(std::u16string_view n) noexcept
        : name(n), key(qv::kern::NameOrderKey(n)) {}
    std::u16string_view name;
    uint64_t key;
};

// Orders entries by name without regard to case, in the user's locale.
struct EntryNameLess {
    using is_transparent = void;
    bool operator()(const ResTreeEntry& a, const ResTreeEntry& b) const noexcept {
        return CompareEntryNames(a, b) < 0;
    }
    bool operator()(const ResTreeEntry& a, const EntryNameProbe& b) const noexcept {
        return qv::kern::CompareNoCaseKeyed(a.Name(), a.NameKey(), b.name, b.key) < 0;
    }
    bool operator()(const EntryNameProbe& a, const ResTreeEntry& b) const noexcept {
        return qv::kern::CompareNoCaseKeyed(a.name, a.key, b.Name(), b.NameKey()) < 0;
    }
};

// The entry containers of ordered and sorted nodes. Their elements come from the arena of their
// tree: a load makes one for nearly every element of a document.
using EntryList = std::list<ResTreeEntry, ArenaAllocator<ResTreeEntry>>;
using EntrySet = std::set<ResTreeEntry, EntryNameLess, ArenaAllocator<ResTreeEntry>>;

// A position among a node's entries; equal to the node's End() when it names no entry.
class ResTreePosition {
public:
    using ListIt = EntryList::iterator;
    using SetIt = EntrySet::iterator;

    ResTreePosition() = default;
    explicit ResTreePosition(ListIt it) : ordered_(true), list_(it) {}
    explicit ResTreePosition(SetIt it) : ordered_(false), set_(it) {}

    const ResTreeEntry& operator*() const noexcept { return ordered_ ? *list_ : *set_; }
    const ResTreeEntry* operator->() const noexcept { return &**this; }
    ResTreePosition& operator++() noexcept;
    ResTreePosition operator++(int) noexcept {
        ResTreePosition before = *this;
        ++*this;
        return before;
    }
    bool operator==(const ResTreePosition& other) const noexcept {
        return ordered_ ? list_ == other.list_ : set_ == other.set_;
    }

private:
    friend class ResTreeNode;
    bool ordered_ = true;
    ListIt list_{};
    SetIt set_{};
};

// A resource-tree node. It owns its child nodes; the parent pointer never owns. Lookups report
// absence with End() or null and never throw. Not locked: one thread uses a tree at a time.
class ResTreeNode : private ResTreeNodeChangeObserver {
    friend struct ChildNodeDeleter;

public:
    using Position = ResTreePosition;

    struct AddResult {
        Position position; // the new entry, or the existing one of that name
        bool inserted;     // false when an unordered node already held the name
    };
    struct AddChildResult {
        Position position; // the new or existing entry
        ResTreeNode* node; // its child node; null when the existing entry is not a child
        bool created;      // true when a new child was made
    };

    // A root node; ORDERED chooses a sequence (true) or a name-sorted map (false) of entries.
    ResTreeNode(std::u16string_view name, std::u16string_view type, bool ordered);
    // A child node of PARENT (the caller's entry in PARENT owns it).
    ResTreeNode(std::u16string_view name, std::u16string_view type, bool ordered,
                ResTreeNode* parent);
    // Unregisters from the nodes it watches, tells its watchers, then deletes its subtree.
    ~ResTreeNode() override;
    ResTreeNode(const ResTreeNode&) = delete;
    ResTreeNode& operator=(const ResTreeNode&) = delete;

    // The node's name, the last piece of its path.
    const WString& Name() const noexcept { return name_->spelling; }
    // The node's type (the tag that declared it).
    const WString& Type() const noexcept { return type_->spelling; }
    // True when entries keep their insertion order (duplicates allowed), false when sorted.
    bool IsOrdered() const noexcept { return ordered_; }
    // The parent node; null for a root.
    ResTreeNode* Parent() const noexcept { return parent_; }
    // The topmost ancestor (the node itself for a root).
    ResTreeNode& Root() noexcept;
    // The number of entries.
    size_t EntryCount() const noexcept { return ordered_ ? list_.size() : set_.size(); }
    // True when the node has no entries.
    bool IsEmpty() const noexcept { return EntryCount() == 0; }

    // A load lays a node out in its tree's memory right before its entries and what lies below
    // them, in document order. A reader about to go through a large subtree that is not in the
    // cache calls this first, so that the first few kilobytes arrive together instead of one
    // line after another as each pointer is followed.
    void PrefetchSubtree() const noexcept;

    // The first entry in container order; End() when there is none.
    Position Begin() const noexcept;
    // The position past the last entry: what lookups answer when nothing is found.
    Position End() const noexcept;
    // The (first) entry named NAME, ignoring case, without loading deferred content; End() if none.
    Position Find(std::u16string_view name) const noexcept;
    // Where NAME stands without loading deferred content: FOUND and the (first) entry of that name,
    // or not FOUND and, in a sorted node, the entry NAME would go before (End() when it would go
    // last; End() in an ordered node). One lookup then serves both the check for an existing entry
    // and the insertion that follows it (AddChildAt).
    struct Place {
        Position position;
        bool found;
    };
    Place Locate(std::u16string_view name) const noexcept;
    // Find; on a miss, loads the deferred content and looks again.
    Position FindLoading(std::u16string_view name);
    // The node an entry stands for: the child, or a link's target; null for End and other kinds.
    ResTreeNode* NodeAt(Position position);
    // The string of the text entry found by FindLoading(NAME); null when absent or not a text.
    const WString* TextAt(std::u16string_view name);

    // Inserts a Text or LocalizedText entry before POSITION (ordered) or by name (unordered; an
    // existing name is kept and its position answered). Raises ValueAdded when inserted.
    AddResult AddText(Position position, std::u16string_view name, WString text,
                      EntryKind kind = EntryKind::Text);
    // AddText, and when the name exists (unordered) and OVERWRITE, sets its text (and for a
    // LocalizedText its kind) as SetTextAt does.
    AddResult AddOrSetText(Position position, std::u16string_view name, WString text,
                           EntryKind kind, bool overwrite);
    // The same for a Link entry holding PATH. Raises ChildAdded when inserted.
    AddResult AddLink(Position position, std::u16string_view name, WString path);
    // Inserts a new child node, or (unordered) answers the existing entry of that name as is.
    // Raises ChildAdded when created.
    AddChildResult AddChild(Position position, std::u16string_view name, std::u16string_view type,
                            bool ordered);
    // AddChild, where a sorted node starts from POSITION (End() or an entry of this node) instead
    // of its root: with what Locate(NAME) answered, and no entry removed since, the insertion costs
    // two comparisons of names, not a second descent; another place only costs the descent. An
    // ordered node inserts before POSITION, as AddChild does.
    AddChildResult AddChildAt(Position position, std::u16string_view name, std::u16string_view type,
                              bool ordered);
    // Replaces the string of a text entry; false (and no change) for End and other kinds.
    bool SetTextAt(Position position, WString text);
    // Appends TEXT to the string of a text entry; false (and no change) for End and other kinds.
    bool AppendTextAt(Position position, std::u16string_view text);
    // Sets the text NAME, adding a Text entry at the end when it is absent.
    bool SetText(std::u16string_view name, WString text);
    // Changes the kind of a text entry between Text and LocalizedText; false for other entries.
    bool SetTextKindAt(Position position, EntryKind kind);
    // Removes the entry at POSITION (a child is told Detaching, emptied, told Detached, deleted).
    // False when POSITION is End or the child is in use by a running load (then nothing changes).
    bool RemoveAt(Position position);
    // Removes the first entry named NAME; nothing happens when there is none.
    void RemoveByName(std::u16string_view name);
    // Removes every child entry (texts and links stay).
    void RemoveAllChildren();

    // The absolute path: "/" for a root, else the parent's path, "/", the name escaped for "/".
    WString Path() const;
    // The node that PATH names, from this node; absolute paths start at the root, "#{...}"
    // anchors at DOCUMENTROOT when the anchor is "document-root". Null when the walk falls off.
    ResTreeNode* ResolvePath(std::u16string_view path, ResTreeNode* documentRoot = nullptr);
    // The nodes named by the "Reserves" entry, in list order; missing ones are left out.
    std::vector<ResTreeNode*> ReservedNodes(bool noLoad);

    // Registers OBSERVER for the changes in MASK; COOKIE is handed back with each delivery.
    void AddObserver(ResTreeNodeChangeObserver* observer, uint32_t mask, uint32_t cookie);
    // Removes OBSERVER's registrations with COOKIE (all of them for kAnyCookie).
    void RemoveObserver(ResTreeNodeChangeObserver* observer, uint32_t cookie);
    // Delivers the pending changes within MASK to the registered observers.
    void NotifyChanges(uint32_t mask = kAllChanges);
    // Changes raised and not yet delivered.
    uint32_t PendingChanges() const noexcept { return pendingChanges_; }
    // Answers the pending changes and clears them without delivering.
    uint32_t TakePendingChanges() noexcept {
        const uint32_t changes = pendingChanges_;
        pendingChanges_ = 0;
        return changes;
    }
    // ORs CHANGES into the pending set and delivers them unless delivery is deferred.
    void RaiseChanges(uint32_t changes);
    // Defers delivery until the matching EndDeferral (calls nest).
    void BeginDeferral() noexcept { ++deferDepth_; }
    // Ends one deferral; delivers the pending changes when the last one ends.
    void EndDeferral();

    // Loads a resource-tree document held in TEXT. ASCHILD false: the document element describes
    // this node; true: it becomes a new child. Answers 0, or 0x80004005 on failure (problems are
    // written to "XMLParseErrors"). OUT, when given, receives this node or the new child, or null.
    int32_t ParseText(std::u16string_view text, bool asChild, ResTreeNode** out = nullptr,
                      const LoaderSettings* settings = nullptr);
    // ParseText for a document already in UTF-8: Expat reads the bytes as they are.
    int32_t ParseUtf8(std::string_view utf8, bool asChild, ResTreeNode** out = nullptr,
                      const LoaderSettings* settings = nullptr);
    // The same for the document in the file PATH, read in blocks of 4096 bytes (larger while a
    // token spans blocks, which keeps a huge token linear); a file that
    // cannot be opened answers 0x80004005 without a message.
    int32_t ParseFile(const std::string& path, bool asChild, ResTreeNode** out = nullptr,
                      const LoaderSettings* settings = nullptr);
    // Loads the files named by the ":DeferredLoadPath" entry (once: the entry is removed).
    int32_t LoadDeferred();
    // False when no entry of this node can be named ":DeferredLoadPath" (told cheaply from each
    // name as it is inserted), so that the lookup can be spared; true says only "look it up".
    bool MayHoldDeferredContent() const noexcept { return mayDefer_; }

    // Replaces the entry container by one of the other kind, keeping the entries (an unordered
    // node keeps the first of several same-named entries).
    void SetOrdered(bool ordered);
    // Renames the node and sets its type (the loader does this for an untyped root only).
    void SetNameAndType(std::u16string_view name, std::u16string_view type);
    // True while a running load holds this node or one below it; such nodes are not removed.
    bool IsInUse() const noexcept { return useCount_ != 0; }
    // Marks this node and its ancestors as used by a load; UnmarkInUse undoes it.
    void MarkInUse() noexcept;
    void UnmarkInUse() noexcept;

private:
    struct Registration {
        ResTreeNodeChangeObserver* observer;
        uint32_t cookie;
        uint32_t mask;
        uint32_t state; // 0 active, 1 removed during a delivery, 2 added during a delivery
    };
    // Observer bookkeeping; most nodes never have observers, so it lives apart.
    struct Observers {
        std::vector<Registration> registrations;
        std::vector<ResTreeNode*> watching; // nodes this node is registered with
        std::vector<ResTreeNode*> watchers; // nodes registered with this node
        uint64_t pass = 0;                  // the delivery pass running on this node, 0 if none
    };

    void OnNodeChanged(ResTreeNode* node, uint32_t changes, uint32_t cookie) override;
    // NotifyChanges; the first pass carries the identity INHERITED when it is not 0 (a change
    // forwarded from a pass being delivered), every other pass a fresh one.
    void Deliver(uint32_t mask, uint64_t inherited);
    Observers& EnsureObservers();
    bool HasActiveRegistration(uint32_t bit) const noexcept;
    void Watch(ResTreeNode& other);
    void Unwatch(ResTreeNode& other);
    void StopWatchingAll() noexcept;
    bool IsWatching(const ResTreeNode& other) const noexcept;
    // Inserts a new entry (an unordered node keeps an existing one of that name and answers it);
    // a sorted node looks for the place from POSITION when HINTED, else from its root.
    Position InsertEntry(Position position, std::u16string_view name, EntryKind kind,
                         bool& inserted, bool hinted = false);
    AddChildResult MakeChild(Position position, std::u16string_view name, std::u16string_view type,
                             bool ordered, bool hinted);
    void EraseEntry(Position position) noexcept;
    // Raises the changes of a new value in the text entry ENTRY of this node.
    void RaiseValueChanged(const ResTreeEntry& entry);
    void IndexInserted(EntryList::iterator entry, bool atEnd);
    void IndexErasing(EntryList::iterator entry);
    // The first entry of each name in a large ordered node, and how many entries have the name;
    // without it every lookup, and so every element loaded into a long list, scans the list.
    // The count spares the scan for the next entry of a name when its only entry goes (a list
    // that replaces every name of an earlier one would otherwise scan the list per name).
    struct IndexedName {
        EntryList::iterator first;
        size_t count = 1;
    };
    using NameIndex = std::map<std::u16string_view, IndexedName, qv::kern::LessNoCase>;

    // In the tree's name store, as entry names are: a node's name is its entry's, and a few
    // types serve a whole description.
    NameStore::Name* name_ = nullptr;
    NameStore::Name* type_ = nullptr;
    bool ordered_;
    bool mayDefer_ = false;
    bool notifying_ = false;
    uint32_t pendingChanges_ = 0;
    int32_t deferDepth_ = 0;
    uint32_t useCount_ = 0;
    ResTreeNode* parent_;
    // The memory of a tree's entries and their names; the root owns it, every node uses it.
    struct TreeMemory {
        TreeArena arena;
        NameStore names;
    };
    std::unique_ptr<TreeMemory> ownMemory_;
    TreeMemory* memory_;
    mutable EntryList list_;
    mutable EntrySet set_;
    std::unique_ptr<Observers> observers_;
    mutable std::unique_ptr<NameIndex> index_;
};

// Keeps a node (and so its ancestors) from being removed while a load works on it.
class NodeInUse {
public:
    explicit NodeInUse(ResTreeNode* node) noexcept : node_(node) {
        if (node_ != nullptr)
            node_->MarkInUse();
    }
    ~NodeInUse() {
        if (node_ != nullptr)
            node_->UnmarkInUse();
    }
    NodeInUse(const NodeInUse&) = delete;
    NodeInUse& operator=(const NodeInUse&) = delete;

private:
    ResTreeNode* node_;
};

} // namespace wbhw
