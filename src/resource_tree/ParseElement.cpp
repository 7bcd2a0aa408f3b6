// The resource-tree builder: what a pending element becomes (node, text, link, include, capture).
#include "kern/Utf8.h"
#include "kern/osdep/OSException.h"
#include "resource_tree/ConfinedPath.h"
#include "resource_tree/ListText.h"
#include "resource_tree/ParseStack.h"

namespace wbhw {
namespace {

bool Equals(const std::u16string* value, std::u16string_view word) noexcept {
    return value != nullptr && qv::kern::EqualsNoCase(*value, word);
}

} // namespace

void ParseStack::Capture(Frame& frame) {
    ++frame.captureDepth;
    std::u16string tag = u"<";
    tag += frame.pendingName;
    // Attribute values go in as they are, unescaped, as stored captures always held them.
    for (const auto& [key, value] : frame.pendingAttributes) {
        tag += u' ';
        tag += key;
        tag += u"=\"";
        tag += value;
        tag += u'"';
    }
    tag += u'>';
    CountText(tag.size());
    frame.node->AppendTextAt(frame.position, tag);
    frame.hasPending = false;
    frame.pendingName.clear();
    frame.text.clear();
}

ParseStack::Frame* ParseStack::ProcessPending(Frame& frame, bool container) {
    if (frame.capturing) {
        // Nested markup is captured completely: the child that made this element a container
        // becomes pending in the same frame and is written when its turn comes.
        Capture(frame);
        return &frame;
    }
    const Steering steering = ReadSteering(frame.pendingAttributes);
    const TagInfo& tag = context_.ClassifyTag(frame.pendingName);
    ResTreeNode& node = *frame.node;
    // The name lives in the frame (its tag, an attribute or the first of its names) for as long
    // as the element is processed; one copy less per element.
    const std::u16string* name = &frame.pendingName;
    bool isNode = false;
    if (steering.names != nullptr) {
        bool truncated = false;
        const size_t spent = context_.textBytes / sizeof(char16_t);
        const size_t budget = context_.settings.maxTextBytes / sizeof(char16_t);
        frame.pendingNames = ExpandNames(*steering.names, context_.settings.maxNames, truncated,
                                         budget > spent ? budget - spent : 0);
        CountText(TextUnits(frame.pendingNames));
        if (truncated) {
            AddError(node, u"The names list yields more than " +
                               DecimalText(context_.settings.maxNames) +
                               u" names; the rest are left out: " + *steering.names);
        }
        if (frame.pendingNames.empty()) {
            AddError(node,
                     u"The names list yields no name; the element is skipped: " + *steering.names);
            frame.hasPending = false;
            frame.text.clear();
            // The child that was seen and the element's own end tag.
            frame.ignoreDepth = container ? 2 : 0;
            return nullptr;
        }
        name = &frame.pendingNames.front().name;
        isNode = true;
    } else if (steering.name != nullptr) {
        name = steering.name;
        isNode = !tag.isLink;
    } else {
        isNode = steering.prototype != nullptr || container;
    }
    if (isNode)
        return ProcessNode(frame, container, *name, steering, tag);
    if (container) {
        // A named link whose element holds markup: the markup is no path and must not end the
        // enclosing node's frame, so it is passed over and the link's own text is its path.
        if (!frame.linkChildrenReported)
            AddError(node, u"Child elements of a :Link element are ignored: " + *name);
        frame.linkChildrenReported = true;
        frame.ignoreDepth = 1;
        return nullptr;
    }
    ProcessText(frame, *name, steering, tag);
    return nullptr;
}

ResTreePosition ParseStack::InsertPosition(ResTreeNode& node, const Steering& steering) {
    if (steering.next == nullptr)
        return node.End();
    return node.FindLoading(*steering.next);
}

ParseStack::Frame* ParseStack::ProcessNode(Frame& frame, bool container, const std::u16string& name,
                                           const Steering& steering, const TagInfo& tag) {
    ResTreeNode& node = *frame.node;
    if (Equals(steering.type, u"xml")) {
        ResTreePosition at = node.IsOrdered() ? node.End() : node.Find(name);
        if (at == node.End()) {
            CountEntry(name.size());
            at = node.AddText(InsertPosition(node, steering), name, WString()).position;
        }
        frame.capturing = true;
        frame.position = at;
        frame.captureDepth = 1;
        // A childless element ends here; leaving it pending would capture its next sibling.
        frame.hasPending = false;
        frame.text.clear();
        return container ? &frame : nullptr;
    }
    const bool ordered =
        steering.ordered != nullptr ? IsTrueWord(*steering.ordered) : tag.isListType;
    // "replace" rules this element and what is made inside it, not its later siblings.
    const bool overwrite =
        steering.replace != nullptr ? !IsTrueWord(*steering.replace) : frame.overwrite;
    // The tag stays in the frame until this element is done.
    const std::u16string& tagName = frame.pendingName;
    frame.hasPending = false;

    if (frame.documentType.empty()) {
        if (node.Type().empty()) {
            node.SetNameAndType(name, tagName);
            node.SetOrdered(ordered);
        }
        frame.documentType = node.Type();
        if (frames_[0]->documentRoot == nullptr)
            frames_[0]->documentRoot = &node;
        frame.pendingNames.clear();
        return container ? &Push(node, frame, overwrite) : nullptr;
    }

    ResTreeNode* prototype = nullptr;
    if (steering.prototype != nullptr) {
        prototype = node.ResolvePath(*steering.prototype, OuterDocumentRoot());
        if (prototype == nullptr)
            AddError(node, u"Unable to find prototype node: " + *steering.prototype);
    }
    const bool hadPrototype = prototype != nullptr;
    const ResTreePosition place =
        MergeOrReplace(node, name, tagName, ordered, overwrite, &prototype);
    CountEntry(name.size() + tagName.size());
    // A sorted node inserts where MergeOrReplace looked, without a second lookup; a "next"
    // attribute is still looked up (which may load deferred content) as in an ordered node.
    const auto made = node.IsOrdered() || steering.next != nullptr
                          ? node.AddChild(InsertPosition(node, steering), name, tagName, ordered)
                          : node.AddChildAt(place, name, tagName, ordered);
    if (hadPrototype && prototype == nullptr)
        AddError(node, u"Unable to find prototype node: " + *steering.prototype);
    if (prototype != nullptr &&
        (IsAncestorOrSelf(prototype, made.node) || IsAncestorOrSelf(made.node, prototype))) {
        // Copying a node into itself or into a node below it never ends.
        AddError(node, u"The prototype node contains the node being built or lies inside it: " +
                           *steering.prototype);
        prototype = nullptr;
    }
    if (prototype != nullptr) {
        NodeInUse keep(prototype);
        CopyEntries(*prototype, *made.node, overwrite, 0);
        SubstituteInSubtree(*made.node, ContextVariables(), 0);
    }
    if (frames_[0]->documentRoot == nullptr)
        frames_[0]->documentRoot = made.node;
    if (frame.pendingNames.size() >= 2) {
        frame.namesTemplate = made.node;
        frame.templatePosition = made.position;
        frame.namesOverwrite = overwrite;
    }
    return container ? &Push(*made.node, frame, overwrite) : nullptr;
}

void ParseStack::ProcessText(Frame& frame, const std::u16string& name, const Steering& steering,
                             const TagInfo& tag) {
    ResTreeNode& node = *frame.node;
    frame.hasPending = false;
    std::u16string_view gathered = frame.text;
    if (!Equals(steering.xmlSpace, u"preserve"))
        gathered = TrimBlanks(gathered);
    std::u16string text(gathered);
    // The frame keeps its buffer for the next element.
    frame.text.clear();
    const bool isPath = steering.type != nullptr ? Equals(steering.type, u"path") : tag.isPathText;
    const bool isReferenceList =
        steering.type != nullptr ? Equals(steering.type, u"ref-list") : tag.isReserves;
    if (isPath && !IsPlatformPathText(text))
        text = PlatformPathText(text);
    if (tag.isLink) {
        ProcessLink(frame, name, text, steering);
        return;
    }
    if (tag.isInclude) {
        ProcessInclude(frame, text, steering);
        return;
    }
    if (text.find(u"#{") != std::u16string::npos)
        SubstituteVariables(text, ContextVariables());
    if (isReferenceList)
        text = RewriteReferenceList(node, text);
    EntryKind kind = EntryKind::Text;
    if (steering.localize != nullptr && IsTrueWord(*steering.localize)) {
        text = LocalizeText(text, context_.language);
        kind = EntryKind::LocalizedText;
    }
    CountEntry(name.size() + text.size());
    node.AddOrSetText(InsertPosition(node, steering), name, WString(std::move(text)), kind,
                      frame.overwrite);
}

std::u16string ParseStack::RewriteReferenceList(ResTreeNode& node,
                                                const std::u16string& text) const {
    // One relative reference with nothing to unescape comes out as it went in, trimmed; most
    // lists are of that kind, and splitting and joining them costs more than the rest of the text.
    const std::u16string_view trimmed = TrimBlanks(text);
    if (trimmed.find_first_of(u",\\") == std::u16string_view::npos &&
        (trimmed.empty() || trimmed.front() != u'/'))
        return std::u16string(trimmed);
    std::vector<std::u16string> pieces = SplitListText(text, u',', true);
    WString base;
    for (std::u16string& piece : pieces) {
        if (piece.empty() || piece.front() != u'/')
            continue;
        if (base.empty())
            base = node.Path();
        piece = RelativeResourcePath(base, piece);
    }
    return JoinListText(pieces, u',');
}

void ParseStack::ProcessLink(Frame& frame, const std::u16string& name, const std::u16string& path,
                             const Steering& steering) {
    ResTreeNode& node = *frame.node;
    ResTreeNode* target = node.ResolvePath(path, OuterDocumentRoot());
    CountEntry(name.size() + path.size());
    if (target == nullptr) {
        node.AddText(InsertPosition(node, steering), name, u"UNRESOLVED LINK: " + path);
        return;
    }
    const WString linkName = steering.name != nullptr ? WString(name) : target->Name();
    const std::u16string linkText = RelativeResourcePath(node.Path(), target->Path());
    const auto added = node.AddLink(InsertPosition(node, steering), linkName, linkText);
    if (!added.inserted && frame.overwrite && IsTextKind(added.position->Kind()))
        node.SetTextAt(added.position, linkText);
}

void ParseStack::ProcessInclude(Frame& frame, const std::u16string& path,
                                const Steering& steering) {
    ResTreeNode& node = *frame.node;
    const std::string& directory = context_.settings.includeDirectory.empty()
                                       ? HostDirectory()
                                       : context_.settings.includeDirectory;
    const ConfinedFile file = ResolveConfined(directory, qv::kern::WideToStandardUtf8(path));
    if (!file.refusal.empty()) {
        AddError(node, file.refusal);
        return;
    }
    const bool asChild = !Equals(steering.what, u"children");
    ParseStack* const outer = context_.innermost;
    try {
        ResTreeNode* included = nullptr;
        if (!file.path.empty())
            node.ParseFile(file.path, asChild, &included);
        context_.innermost = outer;
        if (included != nullptr)
            SubstituteInSubtree(*included, ContextVariables(), 0);
        else
            AddError(node, u"Unable to find include file node: " +
                               FromUtf8Lenient(
                                   JoinFilePath(directory, qv::kern::WideToStandardUtf8(path))));
    } catch (const qv::kern::osdep::OSException&) {
        context_.innermost = outer;
        AddError(node, u"Encountered an OS exception.");
    }
}

} // namespace wbhw
