// The resource-tree builder: events, frames and the messages written to "XMLParseErrors".
#include "resource_tree/ParseStack.h"

#include <utility>

namespace wbhw {
namespace {

constexpr std::u16string_view kParseErrors = u"XMLParseErrors";

size_t NodeDepth(const ResTreeNode& node) noexcept {
    size_t depth = 0;
    for (const ResTreeNode* at = node.Parent(); at != nullptr; at = at->Parent())
        ++depth;
    return depth;
}

} // namespace

bool IsAncestorOrSelf(const ResTreeNode* ancestor, const ResTreeNode* node) noexcept {
    for (const ResTreeNode* at = node; at != nullptr; at = at->Parent()) {
        if (at == ancestor)
            return true;
    }
    return false;
}

ParseStack::ParseStack(ResTreeNode& node, bool asChild, LoadContext& context,
                       std::u16string filePath)
    : context_(context), filePath_(std::move(filePath)) {
    frames_.push_back(std::make_unique<Frame>());
    depth_ = 1;
    Frame& outer = *frames_[0];
    outer.node = &node;
    if (asChild)
        outer.documentType = node.Type();
    node.MarkInUse();
}

ParseStack::~ParseStack() {
    while (depth_ > 0) {
        frames_[depth_ - 1]->node->UnmarkInUse();
        --depth_;
    }
}

ResTreeNode* ParseStack::DocumentRoot() const noexcept {
    return frames_[0]->documentRoot;
}

ParseStack::Frame& ParseStack::Push(ResTreeNode& node, const Frame& enclosing, bool overwrite) {
    if (NodeDepth(node) > static_cast<size_t>(context_.settings.maxElementDepth)) {
        Abort(u"Elements are nested deeper than " + DecimalText(context_.settings.maxElementDepth) +
              u" levels.");
    }
    if (frames_.size() == depth_)
        frames_.push_back(std::make_unique<Frame>());
    Frame& frame = *frames_[depth_];
    frame.node = &node;
    frame.documentRoot = nullptr;
    frame.capturing = false;
    frame.captureDepth = 0;
    frame.documentType = enclosing.documentType;
    frame.hasPending = false;
    frame.pendingName.clear();
    frame.pendingAttributes.clear();
    frame.text.clear();
    frame.pendingNames.clear();
    frame.namesTemplate = nullptr;
    frame.overwrite = overwrite;
    frame.ignoreDepth = 0;
    node.MarkInUse();
    ++depth_;
    return frame;
}

void ParseStack::Pop() noexcept {
    Frame& frame = Top();
    frame.node->UnmarkInUse();
    frame.node = nullptr;
    --depth_;
}

void ParseStack::SetPending(Frame& frame, const char* name, const char** attributes) {
    frame.hasPending = true;
    frame.text.clear();
    frame.pendingNames.clear();
    frame.linkChildrenReported = false;
    frame.pendingName.clear();
    AppendUtf8AsUtf16(name, frame.pendingName);
    frame.pendingAttributes.clear();
    for (const char** a = attributes; a[0] != nullptr; a += 2)
        frame.pendingAttributes.InsertUtf8(a[0], a[1]);
}

ParseStack::Frame* ParseStack::FrameForStart() {
    Frame& frame = Top();
    if (frame.ignoreDepth > 0) {
        ++frame.ignoreDepth;
        return nullptr;
    }
    if (!frame.hasPending)
        return &frame;
    return ProcessPending(frame, true);
}

// Expat's events reach this handler only through the UTF-8 hooks below, which keep names and
// texts in the frames' own buffers; the wide events of the adapter are never called.
void ParseStack::StartElement(const std::u16string&, const XmlAttributes&) {}
void ParseStack::EndElement(const std::u16string&) {}
void ParseStack::CharacterData(std::u16string_view) {}

void ParseStack::StartElementUtf8(const char* name, const char** attributes) {
    if (Frame* target = FrameForStart())
        SetPending(*target, name, attributes);
}

void ParseStack::EndElementUtf8(const char* name) {
    Frame& frame = Top();
    if (frame.ignoreDepth > 0) {
        --frame.ignoreDepth;
        return;
    }
    const bool hadPending = frame.hasPending;
    if (hadPending)
        ProcessPending(frame, false);
    if (frame.capturing) {
        if (frame.captureDepth >= 2) {
            std::u16string closing = u"</";
            AppendUtf8AsUtf16(name, closing);
            closing += u">";
            CountText(closing.size());
            frame.node->AppendTextAt(frame.position, closing);
            --frame.captureDepth;
        } else {
            frame.capturing = false;
        }
    } else if (!hadPending && depth_ > 1 && frame.node->Parent() != nullptr) {
        Pop();
    }
    Frame& top = Top();
    if (top.pendingNames.size() >= 2)
        MakeNameCopies(top);
    top.pendingNames.clear();
}

// Text counts only inside a pending element: what stands between elements (mostly line breaks
// and indentation) would be dropped when the next element starts, so it is not gathered.
void ParseStack::CharacterDataUtf8(std::string_view text) {
    Frame& frame = Top();
    if (frame.hasPending && frame.ignoreDepth == 0)
        AppendUtf8AsUtf16(text, frame.text);
}

ParseStack::Steering ParseStack::ReadSteering(const XmlAttributes& attributes) {
    Steering steering;
    for (const auto& [key, value] : attributes) {
        switch (context_.ClassifyAttribute(key)) {
        case LoaderAttribute::Name:
            steering.name = &value;
            break;
        case LoaderAttribute::Names:
            steering.names = &value;
            break;
        case LoaderAttribute::Prototype:
            steering.prototype = &value;
            break;
        case LoaderAttribute::Next:
            steering.next = &value;
            break;
        case LoaderAttribute::Ordered:
            steering.ordered = &value;
            break;
        case LoaderAttribute::Replace:
            steering.replace = &value;
            break;
        case LoaderAttribute::Type:
            steering.type = &value;
            break;
        case LoaderAttribute::XmlSpace:
            steering.xmlSpace = &value;
            break;
        case LoaderAttribute::Localize:
            steering.localize = &value;
            break;
        case LoaderAttribute::What:
            steering.what = &value;
            break;
        case LoaderAttribute::Other:
            break;
        }
    }
    return steering;
}

void ParseStack::CountEntry(size_t textUnits) {
    Spend(1, textUnits * sizeof(char16_t));
}

void ParseStack::CountText(size_t textUnits) {
    Spend(0, textUnits * sizeof(char16_t));
}

void ParseStack::CountInput(size_t bytes) {
    Spend(0, bytes);
}

void ParseStack::Spend(size_t entries, size_t bytes) {
    const LoaderSettings& limits = context_.settings;
    context_.entriesMade += entries;
    context_.textBytes += bytes;
    if (context_.entriesMade > limits.maxEntries) {
        Abort(u"The load was stopped: it would make more than " + DecimalText(limits.maxEntries) +
              u" entries.");
    }
    if (context_.textBytes > limits.maxTextBytes) {
        Abort(u"The load was stopped: it would hold more than " + DecimalText(limits.maxTextBytes) +
              u" bytes of text.");
    }
}

void ParseStack::Abort(std::u16string_view message) {
    // A stopped load is the load's problem: the message goes where syntax errors go. It is not
    // charged: the budget is spent already.
    AppendError(*frames_[0]->node, message);
    throw LoadAborted{};
}

std::u16string ParseStack::InputAroundPosition() {
    if (hideInput_ && DocumentRoot() == nullptr)
        return {};
    int offset = 0;
    const std::string_view held = InputContext(offset);
    if (held.empty())
        return {};
    const size_t at = std::min(static_cast<size_t>(std::max(offset, 0)), held.size());
    // From the second newline before the position to the second newline after it: the line
    // before, the current line and the line after.
    size_t begin = 0;
    int newlines = 0;
    for (size_t i = at; i > 0; --i) {
        if (held[i - 1] == '\n' && ++newlines == 2) {
            begin = i - 1;
            break;
        }
    }
    size_t end = held.size();
    newlines = 0;
    for (size_t i = at; i < held.size(); ++i) {
        if (held[i] == '\n' && ++newlines == 2) {
            end = i + 1;
            break;
        }
    }
    return FromUtf8Lenient(held.substr(begin, end - begin));
}

void ParseStack::AddError(ResTreeNode& node, std::u16string_view message) {
    context_.textBytes += AppendError(node, message) * sizeof(char16_t);
}

size_t ParseStack::AppendError(ResTreeNode& node, std::u16string_view message) {
    std::u16string text = u"Error on line " + DecimalText(CurrentLine()) + u" at column " +
                          DecimalText(CurrentColumn());
    if (!filePath_.empty())
        text += u" of file " + filePath_;
    text += u"\n   ";
    text += message;
    text += u"\n   ";
    text += InputAroundPosition();
    text += u"\n";
    const size_t units = text.size();
    const ResTreePosition found = node.Find(kParseErrors);
    if (found != node.End() && IsTextKind(found->Kind()))
        node.AppendTextAt(found, text);
    else
        node.AddText(node.End(), kParseErrors, WString(std::move(text)));
    return units;
}

} // namespace wbhw
