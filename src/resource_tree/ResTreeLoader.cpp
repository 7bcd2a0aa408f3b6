// Loading resource-tree documents into nodes: whole texts, files in blocks, deferred files.
#include "kern/Utf8.h"
#include "resource_tree/ConfinedPath.h"
#include "resource_tree/ListText.h"
#include "resource_tree/ParseStack.h"

#include <cerrno>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

namespace wbhw {
namespace {

constexpr int32_t kOk = 0;
constexpr int32_t kFail = static_cast<int32_t>(0x80004005u);
constexpr size_t kBlockSize = 4096;

// Observers hear of a whole load once, at its end, with what was pending before it.
class DeferredDelivery {
public:
    explicit DeferredDelivery(ResTreeNode& node) : node_(node) {
        node_.BeginDeferral();
        remembered_ = node_.TakePendingChanges();
    }
    ~DeferredDelivery() {
        node_.RaiseChanges(remembered_);
        node_.EndDeferral();
    }
    DeferredDelivery(const DeferredDelivery&) = delete;
    DeferredDelivery& operator=(const DeferredDelivery&) = delete;

private:
    ResTreeNode& node_;
    uint32_t remembered_ = 0;
};

class FileDescriptor {
public:
    explicit FileDescriptor(int fd) noexcept : fd_(fd) {}
    ~FileDescriptor() {
        if (fd_ >= 0)
            close(fd_);
    }
    FileDescriptor(const FileDescriptor&) = delete;
    FileDescriptor& operator=(const FileDescriptor&) = delete;
    int get() const noexcept { return fd_; }

private:
    int fd_;
};

// Fills BUFFER as far as the file allows; a short answer means the end (or a read error).
size_t ReadBlock(int fd, char* buffer, size_t size) {
    size_t filled = 0;
    while (filled < size) {
        const ssize_t n = read(fd, buffer + filled, size - filled);
        if (n < 0 && errno == EINTR)
            continue;
        if (n <= 0)
            break;
        filled += static_cast<size_t>(n);
    }
    return filled;
}

// Runs one load of NODE: FEED hands the document to the stack and answers Expat's verdict.
template <class Feed>
int32_t RunLoad(ResTreeNode& node, LoadScope& scope, bool asChild, ResTreeNode** out,
                std::u16string filePath, Feed&& feed) {
    LoadContext& context = scope.Context();
    DeferredDelivery delivery(node);
    ParseStack* const outer = context.innermost;
    struct Restore {
        LoadContext& context;
        ParseStack* outer;
        ~Restore() { context.innermost = outer; }
    } restore{context, outer};
    ParseStack stack(node, asChild, context, std::move(filePath));
    context.innermost = &stack;
    bool parsed = false;
    try {
        parsed = feed(stack);
    } catch (const LoadAborted&) {
        if (!scope.IsOutermost())
            throw;
        return kFail;
    }
    if (!parsed) {
        stack.AddError(node, FromUtf8Lenient(stack.ErrorString()));
        return kFail;
    }
    if (out != nullptr)
        *out = asChild ? stack.DocumentRoot() : &node;
    return kOk;
}

// A refused file is reported where the load that asked for it writes its messages, or, for a
// deferred load that a lookup started, in the node itself.
void ReportRefusal(ResTreeNode& node, LoadScope& scope, std::u16string_view message) {
    if (ParseStack* outer = scope.Context().innermost) {
        outer->AddError(node, message);
        return;
    }
    std::u16string text = u"Error: ";
    text += message;
    text += u"\n";
    const ResTreeNode::Position found = node.Find(u"XMLParseErrors");
    if (found != node.End() && IsTextKind(found->Kind()))
        node.AppendTextAt(found, text);
    else
        node.AddText(node.End(), u"XMLParseErrors", text);
}

// A load nested too deeply is refused with a message at the place that asked for it.
int32_t RefuseTooDeep(ResTreeNode& node, LoadScope& scope, std::u16string_view what) {
    std::u16string message = u"Loads are nested deeper than " +
                             DecimalText(scope.Context().settings.maxNestedLoads) +
                             u" levels; not loaded: ";
    message += what;
    ReportRefusal(node, scope, message);
    return kFail;
}

} // namespace

int32_t ResTreeNode::ParseText(std::u16string_view text, bool asChild, ResTreeNode** out,
                               const LoaderSettings* settings) {
    return ParseUtf8(qv::kern::WideToStandardUtf8(text), asChild, out, settings);
}

int32_t ResTreeNode::ParseUtf8(std::string_view utf8, bool asChild, ResTreeNode** out,
                               const LoaderSettings* settings) {
    if (out != nullptr)
        *out = nullptr;
    LoadScope scope(settings, true);
    if (scope.IsTooDeep())
        return RefuseTooDeep(*this, scope, u"text");
    return RunLoad(*this, scope, asChild, out, std::u16string(),
                   [utf8](ParseStack& stack) { return stack.Parse(utf8, true); });
}

int32_t ResTreeNode::ParseFile(const std::string& path, bool asChild, ResTreeNode** out,
                               const LoaderSettings* settings) {
    if (out != nullptr)
        *out = nullptr;
    LoadScope scope(settings, true);
    if (scope.IsTooDeep())
        return RefuseTooDeep(*this, scope, FromUtf8Lenient(path));
    // Only regular files: a FIFO or device named by a document would block or never end.
    FileDescriptor file(open(path.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC));
    struct stat info {};
    if (file.get() < 0 || fstat(file.get(), &info) != 0 || !S_ISREG(info.st_mode))
        return kFail;
    // A file that a description named is not the caller's own text: its bytes count against the
    // load's budget, and its lines stay out of messages until it has shown itself a description.
    const bool nested = !scope.IsOutermost();
    return RunLoad(*this, scope, asChild, out, FromUtf8Lenient(path), [&](ParseStack& stack) {
        if (nested)
            stack.HideInputUntilDocument();
        std::vector<char> block(kBlockSize);
        uint64_t fed = 0;
        for (;;) {
            const size_t n = ReadBlock(file.get(), block.data(), block.size());
            if (nested)
                stack.CountInput(n);
            const bool last = n < block.size();
            if (!stack.Parse(std::string_view(block.data(), n), last))
                return false;
            if (last)
                return true;
            fed += n;
            // Expat scans a token that a block cut off again from its start with every further
            // block. A block at least as large as what it keeps makes each scan cover at least
            // half new bytes, so a huge token (a name or a value of megabytes) costs linear time
            // instead of quadratic.
            const uint64_t kept = stack.KeptBytes(fed);
            if (kept > block.size())
                block.resize(static_cast<size_t>(kept));
        }
    });
}

int32_t ResTreeNode::LoadDeferred() {
    if (!MayHoldDeferredContent())
        return kOk;
    const Position found = Find(u":DeferredLoadPath");
    if (found == End() || !IsTextKind(found->Kind()))
        return kOk;
    const std::vector<std::u16string> pieces = SplitListText(*found->Text(), u',', true);
    // Removed first, so that each node loads its deferred content at most once.
    RemoveAt(found);
    LoadScope scope(nullptr, false);
    const std::string directory = scope.Context().settings.deferredDirectory.empty()
                                      ? DeferredDirectory()
                                      : scope.Context().settings.deferredDirectory;
    for (const std::u16string& piece : pieces) {
        if (piece == u"..") {
            if (parent_ != nullptr)
                parent_->LoadDeferred();
            continue;
        }
        const ConfinedFile file = ResolveConfined(directory, qv::kern::WideToStandardUtf8(piece));
        if (!file.refusal.empty()) {
            ReportRefusal(*this, scope, file.refusal);
            return kFail;
        }
        if (file.path.empty())
            return kFail;
        const int32_t result = ParseFile(file.path, false);
        if (result != kOk)
            return result;
    }
    return kOk;
}

} // namespace wbhw
