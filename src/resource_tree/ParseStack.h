// The resource-tree builder: turns the events of one document into entries of a node.
#pragma once

#include "resource_tree/ExPatHandler.h"
#include "resource_tree/LoadContext.h"
#include "resource_tree/LoaderText.h"
#include "resource_tree/ResTreeNode.h"

#include <memory>
#include <string>
#include <vector>

namespace wbhw {

// Builds a node's entries from one document. One frame per node being filled; a frame's pending
// element is the one whose start was seen but which is not yet known to be a node or a text.
class ParseStack final : public ExPatHandler {
public:
    // Fills NODE; ASCHILD makes the document element a new child of NODE. FILEPATH (may be empty)
    // is named in messages.
    ParseStack(ResTreeNode& node, bool asChild, LoadContext& context, std::u16string filePath);
    ~ParseStack() override;

    // The node the document element became (null until then).
    ResTreeNode* DocumentRoot() const noexcept;
    // Appends MESSAGE to NODE's "XMLParseErrors" with the parser's line, column and context.
    // The message is charged to the load's text budget; the next entry made checks it.
    void AddError(ResTreeNode& node, std::u16string_view message);
    // Charges BYTES read from a file to the load's text budget; past it the load stops.
    void CountInput(size_t bytes);
    // Leaves the input out of messages: a file that is not yet known to be a description (an
    // include or deferred file) must not have its lines copied into a message.
    void HideInputUntilDocument() noexcept { hideInput_ = true; }

protected:
    // Names, attributes and texts go from Expat's UTF-8 straight into the frame that keeps them;
    // the wide events are not used.
    void StartElement(const std::u16string& name, const XmlAttributes& attributes) override;
    void EndElement(const std::u16string& name) override;
    void CharacterData(std::u16string_view text) override;
    void StartElementUtf8(const char* name, const char** attributes) override;
    void EndElementUtf8(const char* name) override;
    void CharacterDataUtf8(std::string_view text) override;

private:
    struct Frame {
        ResTreeNode* node = nullptr;
        ResTreeNode* documentRoot = nullptr;
        ResTreePosition position;
        bool capturing = false;
        int captureDepth = 0;
        std::u16string documentType;
        bool hasPending = false;
        std::u16string pendingName;
        XmlAttributes pendingAttributes;
        std::u16string text;
        std::vector<ExpandedName> pendingNames;
        ResTreeNode* namesTemplate = nullptr;
        ResTreePosition templatePosition;
        bool namesOverwrite = true;
        bool overwrite = true;
        int ignoreDepth = 0;
        bool linkChildrenReported = false;
    };

    // The attributes of the pending element that steer the loader; null when absent.
    struct Steering {
        const std::u16string* name = nullptr;
        const std::u16string* names = nullptr;
        const std::u16string* prototype = nullptr;
        const std::u16string* next = nullptr;
        const std::u16string* ordered = nullptr;
        const std::u16string* replace = nullptr;
        const std::u16string* type = nullptr;
        const std::u16string* xmlSpace = nullptr;
        const std::u16string* localize = nullptr;
        const std::u16string* what = nullptr;
    };

    Frame& Top() noexcept { return *frames_[depth_ - 1]; }
    Frame& Push(ResTreeNode& node, const Frame& enclosing, bool overwrite);
    void Pop() noexcept;
    // Makes the element NAME with ATTRIBUTES (Expat's UTF-8) the pending element of FRAME.
    static void SetPending(Frame& frame, const char* name, const char** attributes);
    // The frame in which a starting element becomes pending (after the pending element there is
    // processed as a container); null when the element is to be ignored.
    Frame* FrameForStart();
    Steering ReadSteering(const XmlAttributes& attributes);
    ResTreeNode* OuterDocumentRoot() const noexcept { return frames_[0]->documentRoot; }

    // Element processing (ParseElement.cpp). Answers the frame in which the child element that
    // made the pending element a container becomes pending; null when it is to be ignored.
    Frame* ProcessPending(Frame& frame, bool container);
    Frame* ProcessNode(Frame& frame, bool container, const std::u16string& name,
                       const Steering& steering, const TagInfo& tag);
    void ProcessText(Frame& frame, const std::u16string& name, const Steering& steering,
                     const TagInfo& tag);
    void ProcessLink(Frame& frame, const std::u16string& name, const std::u16string& path,
                     const Steering& steering);
    void ProcessInclude(Frame& frame, const std::u16string& path, const Steering& steering);
    void Capture(Frame& frame);
    ResTreePosition InsertPosition(ResTreeNode& node, const Steering& steering);
    std::u16string RewriteReferenceList(ResTreeNode& node, const std::u16string& text) const;

    // Copies and variables (TreeCopy.cpp). MergeOrReplace answers where in NODE the name now
    // stands or would go (End() when it removed the entry), for AddChildAt.
    ResTreePosition MergeOrReplace(ResTreeNode& node, const std::u16string& name,
                                   const std::u16string& type, bool ordered, bool overwrite,
                                   ResTreeNode** guarded);
    void CopyEntries(ResTreeNode& source, ResTreeNode& destination, bool overwrite, int depth);
    void MakeNameCopies(Frame& frame);
    void SubstituteInSubtree(ResTreeNode& node, const VariableMap& variables, int depth);
    VariableMap ContextVariables() const;

    // Counts one entry made holding TEXTUNITS units of text (name, type, value); past the
    // load's budget the load stops with a message.
    void CountEntry(size_t textUnits);
    // Counts TEXTUNITS units of text made without a new entry (captures, substitutions).
    void CountText(size_t textUnits);
    void Spend(size_t entries, size_t bytes);
    [[noreturn]] void Abort(std::u16string_view message);
    // Writes the message; answers the units written.
    size_t AppendError(ResTreeNode& node, std::u16string_view message);
    std::u16string InputAroundPosition();

    LoadContext& context_;
    std::u16string filePath_;
    // Frames are reused from one element to the next so that their buffers keep their capacity.
    std::vector<std::unique_ptr<Frame>> frames_;
    size_t depth_ = 0;
    bool hideInput_ = false;
};

// True when ANCESTOR is NODE or one of NODE's ancestors.
bool IsAncestorOrSelf(const ResTreeNode* ancestor, const ResTreeNode* node) noexcept;

} // namespace wbhw
