// The framework's item base.
#include "framework/CqxItemUI.h"

#include "com/CallGuard.h"
#include "com/TaskMem.h"

using qv::com::AllocBstr;
using qv::com::ComPtr;
using qv::com::GuardCall;

HRESULT CqxItemUI::Initialize() {
    return S_OK;
}

HRESULT CqxItemUI::GetIconName(BSTR* name) {
    if (!name) {
        return E_POINTER;
    }
    *name = AllocBstr(iconName_);
    return *name ? S_OK : E_OUTOFMEMORY;
}

HRESULT CqxItemUI::GetOptionWord(uint32_t* options) {
    if (!options) {
        return E_POINTER;
    }
    *options = options_;
    return S_OK;
}

// Frees the texts of the first COUNT records and the array.
static void FreeMenu(QxMenuEntry* entries, size_t count) {
    for (size_t i = 0; i < count; ++i) {
        SysFreeString(entries[i].text);
    }
    CoTaskMemFree(entries);
}

HRESULT CqxItemUI::GetContextMenu(uint32_t* count, QxMenuEntry** entries) {
    if (!count || !entries) {
        return E_POINTER;
    }
    *count = 0;
    *entries = nullptr;
    return GuardCall([&] {
        std::vector<CqxMenuEntry> built;
        AddMenuEntries(built);
        std::vector<QxMenuEntry> records(built.size());
        HRESULT hr = qv::com::CopyToTaskMem(records, entries, count);
        for (size_t i = 0; SUCCEEDED(hr) && i < built.size(); ++i) {
            const CqxMenuEntry& e = built[i];
            (*entries)[i] =
                QxMenuEntry{AllocBstr(e.text), e.flags, e.kind, e.group, e.position, e.command};
            if (!(*entries)[i].text) {
                FreeMenu(*entries, i);
                *entries = nullptr;
                *count = 0;
                hr = E_OUTOFMEMORY;
            }
        }
        return hr;
    });
}

HRESULT CqxItemUI::ExecuteCommand(const GUID&) {
    return S_FALSE;
}

HRESULT CqxItemUI::IsValid() {
    return S_OK;
}

HRESULT CqxItemUI::Remove() {
    return S_OK;
}

HRESULT CqxItemUI::GetHelp(BSTR* path, BSTR* topic, BSTR* localizedContext) {
    if (!path || !topic) {
        return E_POINTER;
    }
    *path = nullptr;
    *topic = nullptr;
    if (localizedContext) {
        *localizedContext = nullptr;
    }
    return S_FALSE;
}

HRESULT CqxItemUI::GetDefaultHelp(BSTR* file, BSTR* topic, uint32_t* kind) {
    if (!file || !topic || !kind) {
        return E_POINTER;
    }
    *file = nullptr;
    *topic = nullptr;
    *kind = 0;
    return S_FALSE;
}

HRESULT CqxItemUI::Bind(IwbProjectItem* item) {
    if (!item) {
        return E_INVALIDARG;
    }
    hostItem_ = ComPtr<IwbProjectItem>::Share(item);
    return S_OK;
}

HRESULT CqxItemUI::ValidateAgainst(IUnknown* provider) {
    if (!provider || !provider_) {
        return S_FALSE;
    }
    // Identity is the IUnknown each object answers, whatever interface it was handed through.
    const auto theirs = qv::com::QueryAs<IUnknown>(provider);
    const auto ours = provider_.As<IUnknown>();
    return theirs && theirs.Get() == ours.Get() ? S_OK : S_FALSE;
}

void CqxItemUI::AttachProvider(IqxProvider* provider) {
    if (provider) {
        provider_ = ComPtr<IqxProvider>::Share(provider);
    }
}

void CqxItemUI::AddMenuEntries(std::vector<CqxMenuEntry>&) {}
