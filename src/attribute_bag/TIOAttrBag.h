// The attribute bag: a tree of named attribute sets in which each set inherits its ancestors'
// attributes. Items persist it as XML and hand single attributes out as cluster texts.
#pragma once

#include "kern/Collate.h"

#include <cstdint>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

// One attribute set; a bag is a root set with its descendants. Attribute names and child names
// are keys compared without regard to case (two names differing only in case are one key), and
// every map iterates in that order. Lookups answer "absent" (null, false) instead of throwing.
class TIOAttrBag {
public:
    using AttributeMap = std::map<std::u16string, std::u16string, qv::kern::LessNoCase>;
    using ChildMap = std::map<std::u16string, std::unique_ptr<TIOAttrBag>, qv::kern::LessNoCase>;
    using NameSet = std::set<std::u16string, qv::kern::LessNoCase>;

    // Told by NotifyChanges that a set (or one of its ancestors) changed.
    class ChangeObserver {
    public:
        // SET changed (WASDIRTY: its own attributes did; FORCED: an ancestor's did). A negative
        // answer stops the notification and is passed on.
        virtual int32_t OnAttrBagChanged(TIOAttrBag& set, bool wasDirty, bool forced) = 0;

    protected:
        ~ChangeObserver() = default;
    };

    // An attribute as visible from some set: the set that holds it, and its name and value.
    struct Entry {
        const TIOAttrBag* holder = nullptr;
        const std::u16string* name = nullptr;
        const std::u16string* value = nullptr;
        explicit operator bool() const noexcept { return name != nullptr; }
    };

    // An empty set named NAME (may be empty): no attributes, no children, no parent, no observer.
    explicit TIOAttrBag(std::u16string name = {});
    // Destroys the children after unlinking them from this set.
    ~TIOAttrBag();
    TIOAttrBag(const TIOAttrBag&) = delete;
    TIOAttrBag& operator=(const TIOAttrBag&) = delete;

    // The set's name (may be empty).
    const std::u16string& Name() const noexcept { return name_; }
    // Renames a set that has no parent (a child's name is its key in the parent: answers false
    // and changes nothing for a child whose parent already holds a sibling of the new name).
    bool SetName(std::u16string name);
    // The set whose attributes this one inherits; null for a root.
    TIOAttrBag* Parent() const noexcept { return parent_; }
    // Follows the parent links to the set that has none (this set when it is a root).
    TIOAttrBag& Root() noexcept;
    const TIOAttrBag& Root() const noexcept;
    // "/" for a root, else the parent's path, the name and "/" (/A/B/ for B under A).
    std::u16string GetPath() const;

    // The own attributes, in name order.
    const AttributeMap& Attributes() const noexcept { return attributes_; }
    // The children, in name order.
    const ChildMap& Children() const noexcept { return children_; }
    // Set when an own attribute was added, changed or removed; cleared by NotifyChanges.
    bool IsDirty() const noexcept { return dirty_; }
    // The observer told of changes (not owned; null for none).
    ChangeObserver* Observer() const noexcept { return observer_; }
    void SetObserver(ChangeObserver* observer) noexcept { observer_ = observer; }

    // The child named NAME, or null.
    TIOAttrBag* FindChild(std::u16string_view name) const noexcept;
    // The child named NAME, created empty (with this set as parent) when there is none.
    TIOAttrBag& GetOrCreateChild(std::u16string_view name);
    // Takes CHILD into the children and answers it with true. Answers (existing child, false) and
    // leaves CHILD with the caller when a child of that name exists, and (null, false) when CHILD
    // is null or already has a parent. On an allocation failure CHILD stays with the caller.
    std::pair<TIOAttrBag*, bool> AdoptChild(std::unique_ptr<TIOAttrBag>& child);
    // Destroys the child named NAME; false when there is none.
    bool RemoveChild(std::u16string_view name);
    // Destroys every child.
    void ClearChildren() noexcept;

    // Looks NAME up in this set, then in each ancestor; an empty Entry when no set defines it.
    Entry FindVisible(std::u16string_view name) const noexcept;
    // The value visible under NAME, or null when no set in the chain defines it.
    const std::u16string* FindValue(std::u16string_view name) const noexcept;
    // The value visible under NAME, or the empty text when absent.
    std::u16string GetValue(std::u16string_view name) const;
    // Changes the visible attribute NAME where it is defined (possibly an ancestor), marking that
    // set dirty, unless the values are equal ignoring case; inserts it here when not visible.
    void SetValue(std::u16string_view name, std::u16string_view value);
    // Inserts NAME here, marking this set dirty, unless some set of the chain defines it.
    void AddIfAbsent(std::u16string_view name, std::u16string_view value);
    // Inserts NAME here unless this set's own attributes hold it (the old value stays); marks
    // dirty only when inserted. Answers whether it was inserted.
    bool InsertOwn(std::u16string_view name, std::u16string_view value);
    // Removes the own attribute NAME and marks this set dirty; false when this set does not own it.
    bool RemoveAttribute(std::u16string_view name);

    // Every attribute visible from this set, each name once at its nearest definition: this set's
    // own in name order, then the parent's not yet seen, and so on. OWNONLY stops after this set.
    std::vector<Entry> VisibleAttributes(bool ownOnly = false) const;
    // ENTRY's holder path, its name and "/" (/A/B/Mode/); "" for an empty entry.
    static std::u16string EntryPath(const Entry& entry);

    // Resolves a "/"-separated PATH from index START: a leading "/" (at START 0) starts at the
    // root, each segment names a child, a trailing "/" is optional. Answers null when a segment
    // names no child; with REMAINDER, answers the deepest set found instead and stores the
    // unresolved rest of the path there (emptied when everything resolved). START past the end
    // gives this set.
    TIOAttrBag* ResolvePath(std::u16string_view path, size_t start = 0,
                            std::u16string* remainder = nullptr);

    // Tells the observers of every changed set and of all its descendants (FORCED: as if this set
    // had changed), in name order, and clears the dirty flags. Answers 0, or the first negative
    // observer answer (sets not visited yet keep their flags).
    int32_t NotifyChanges(bool forced = false);

    // Appends this set and its descendants as attribute-bag XML to OUT, each line starting with
    // INDENT (the root is written with an empty one) and ending with a line feed.
    void WriteXml(std::u16string& out, std::u16string_view indent = {}) const;
    // Reads attribute-bag XML into TARGET: the document element renames TARGET, nested sets become
    // its children. LASTSET (when given) receives TARGET, then each set opened. Answers 0, or
    // 0x80004005 for a malformed or unexpected document (what was read before stays). Allocation
    // failures propagate.
    static int32_t ReadXml(std::u16string_view document, TIOAttrBag& target,
                           TIOAttrBag** lastSet = nullptr);

    // Appends one cluster text per visible attribute to OUT, in visible order, leaving out the
    // names in EXCLUDE (null leaves out none).
    void ExportClusterStrings(std::vector<std::u16string>& out,
                              const NameSet* exclude = nullptr) const;
    // The cluster text of ENTRY; with WITHPATH its name is this set's path followed by the name
    // (also for an inherited entry), else the bare name. "" for an empty entry.
    std::u16string ExportClusterString(const Entry& entry, bool withPath) const;
    // Parses each cluster text in order and applies SetValue with its name and value. Stops at the
    // first text that does not parse and answers that status (texts before it stay applied);
    // answers 0 when all were applied.
    int32_t ImportClusterStrings(const std::vector<std::u16string>& texts);

private:
    // The own entry of NAME, or null.
    std::u16string* FindOwn(std::u16string_view name) noexcept;
    void MarkDirty() noexcept { dirty_ = true; }

    std::u16string name_;
    AttributeMap attributes_;
    bool dirty_ = false;
    ChangeObserver* observer_ = nullptr;
    TIOAttrBag* parent_ = nullptr;
    ChildMap children_;
};
