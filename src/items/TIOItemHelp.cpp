// Help for a Tangent I/O item: what its resource names, else what the tree names for every
// resource, else the module's own page; always a path below the host's folder.
#include "com/CallGuard.h"
#include "host/HostFolder.h"
#include "host/StatusError.h"
#include "items/TIOInstanceItemUI.h"
#include "items/TIOStrings.h"
#include "kern/CodePage.h"

using qv::com::AllocBstr;
using qv::com::GuardCall;
using qv::host::ResourceNode;

namespace {

// The node of a tree whose help stands for every resource that names none.
constexpr std::u16string_view kDefaultResource = u"IOResourceDefault";
// The module's own help when the tree names none.
constexpr std::u16string_view kDefaultHelpFile = u"wbfpgaconcepts.chm";
constexpr std::u16string_view kDefaultHelpTopic = u"Performing_Basic_I_O.html";
constexpr uint32_t kDefaultHelpKind = 5;

bool Empty(const wbhw::NodeHelp& help) {
    return help.path.empty() && help.topic.empty();
}

// PATH below FOLDER; a PATH that is absolute already stays as it is.
std::u16string JoinToFolder(std::u16string folder, std::u16string_view path) {
    if (!path.empty() && path.front() == u'/')
        return std::u16string(path);
    if (!folder.empty() && folder.back() != u'/')
        folder += u'/';
    return folder + std::u16string(path);
}

// Hands TEXT out in *OUT; frees what was handed out when it cannot be.
void PutOrThrow(const std::u16string& text, BSTR* out) {
    *out = AllocBstr(text);
    if (*out == nullptr)
        throw std::bad_alloc();
}

} // namespace

HRESULT TIOInstanceItemUI::GetHelp(BSTR* path, BSTR* topic, BSTR* localizedContext) {
    if (path == nullptr || topic == nullptr)
        return E_POINTER;
    *path = nullptr;
    *topic = nullptr;
    if (localizedContext != nullptr)
        *localizedContext = nullptr;
    const bool wantContext = localizedContext != nullptr;
    const HRESULT hr = GuardCall([&]() -> HRESULT {
        wbhw::NodeHelp help;
        const ResourceNode root = TreeRoot();
        if (const ResourceNode resource = ResourceNodeOf(root))
            HelpOnNode(resource, help, wantContext);
        if (Empty(help)) {
            const ResourceNode fallback = root ? root.Find(kDefaultResource) : ResourceNode();
            if (!fallback || !HelpOnNode(fallback, help, wantContext))
                help = wbhw::NodeHelp();
        }
        if (Empty(help)) {
            help.path = u"help/" + std::u16string(kDefaultHelpFile);
            help.topic = kDefaultHelpTopic;
        }
        const auto hostFolder = qv::host::AskHostFolder();
        if (!hostFolder)
            return E_FAIL;
        const std::u16string absolute = JoinToFolder(qv::kern::AnsiToWide(*hostFolder), help.path);
        if (wantContext && help.localizedContext.empty())
            help.localizedContext = tio::ModuleString(tio::kStrHelpContext);
        PutOrThrow(absolute, path);
        PutOrThrow(help.topic, topic);
        if (wantContext)
            PutOrThrow(help.localizedContext, localizedContext);
        return S_OK;
    });
    if (FAILED(hr)) {
        for (BSTR* out : {path, topic, localizedContext}) {
            if (out != nullptr) {
                SysFreeString(*out);
                *out = nullptr;
            }
        }
    }
    return hr;
}

HRESULT TIOInstanceItemUI::GetDefaultHelp(BSTR* file, BSTR* topic, uint32_t* kind) {
    if (file == nullptr || topic == nullptr || kind == nullptr)
        return E_POINTER;
    *file = AllocBstr(kDefaultHelpFile);
    *topic = AllocBstr(kDefaultHelpTopic);
    *kind = kDefaultHelpKind;
    if (*file != nullptr && *topic != nullptr)
        return S_OK;
    SysFreeString(*file);
    SysFreeString(*topic);
    *file = nullptr;
    *topic = nullptr;
    return E_OUTOFMEMORY;
}
