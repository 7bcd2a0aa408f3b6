// Item-information objects: what the provider's registry knows about one item type and how it
// makes the type's objects.
#pragma once

#include "com/ComObject.h"
#include "framework/IqxProvider.h"

#include <concepts>
#include <memory>
#include <new>
#include <string>

// One request to create an item object.
struct CqxItemRequest {
    GUID type = GUID_NULL;           // the item type asked for; GUID_NULL: any that accepts
    GUID category = GUID_NULL;       // the category the framework asks in
    IUnknown* outer = nullptr;       // the aggregating object, or null
    IUnknown* savedState = nullptr;  // the saved state of a reloaded item, or null
    IqxProvider* provider = nullptr; // the provider that creates (no reference)
};

class CqxpItemInfo {
public:
    CqxpItemInfo(const GUID& category, uint32_t flags, const GUID& parentType, std::u16string name,
                 const CLSID& classId)
        : category_(category), flags_(flags), parentType_(parentType), name_(std::move(name)),
          classId_(classId) {}
    virtual ~CqxpItemInfo() = default;
    CqxpItemInfo(const CqxpItemInfo&) = delete;
    CqxpItemInfo& operator=(const CqxpItemInfo&) = delete;

    // Whether this type takes a request that names no type: when the categories match.
    virtual bool Accepts(const CqxItemRequest& request) const {
        return IsEqualGUID(request.category, category_);
    }
    // Creates an object of this type for REQUEST into *item (with one reference).
    virtual HRESULT Create(const CqxItemRequest& request, IUnknown** item) const = 0;

    const GUID& category() const { return category_; }
    uint32_t flags() const { return flags_; }
    // The type an item of this type must be placed under; GUID_NULL for none.
    const GUID& parentType() const { return parentType_; }
    const std::u16string& name() const { return name_; }
    const CLSID& classId() const { return classId_; }

private:
    GUID category_;
    uint32_t flags_;
    GUID parentType_;
    std::u16string name_;
    CLSID classId_;
};

// Objects that receive the creating provider after construction.
template <class T>
concept TakesProvider = requires(T* t, IqxProvider* p) {
    t->AttachProvider(p);
};

// Items: plain objects (they are never aggregated).
template <class TItem, class TProvider> class CqxpItemUIInfoT final : public CqxpItemInfo {
    static_assert(TakesProvider<TItem>, "items keep their provider");

public:
    using CqxpItemInfo::CqxpItemInfo;
    HRESULT Create(const CqxItemRequest& request, IUnknown** item) const override {
        if (!item) {
            return E_POINTER;
        }
        *item = nullptr;
        if (request.outer) {
            return CLASS_E_NOAGGREGATION;
        }
        CQVComObject<TItem>* object = nullptr;
        const HRESULT hr = CQVComObject<TItem>::CreateInstance(&object);
        if (FAILED(hr)) {
            return hr;
        }
        object->AttachProvider(request.provider);
        *item = object->GetUnknown();
        return S_OK;
    }
};

// Bindable objects (wizards): poly objects, so the framework may aggregate them.
template <class TBindable, class TProvider>
class CqxpBindableItemInfoT final : public CqxpItemInfo {
    static_assert(TakesProvider<TBindable>, "wizards keep their provider");

public:
    using CqxpItemInfo::CqxpItemInfo;
    HRESULT Create(const CqxItemRequest& request, IUnknown** item) const override {
        if (!item) {
            return E_POINTER;
        }
        *item = nullptr;
        CQVComPolyObject<TBindable>* object = nullptr;
        const HRESULT hr = CQVComPolyObject<TBindable>::CreateInstance(request.outer, &object);
        if (FAILED(hr)) {
            return hr;
        }
        object->Object()->AttachProvider(request.provider);
        *item = object;
        return S_OK;
    }
};

// An information object, or null when it cannot be allocated (the registry keeps a null entry
// and reports E_OUTOFMEMORY for that type).
template <class Info, class... Args> std::unique_ptr<CqxpItemInfo> MakeItemInfo(Args&&... args) {
    try {
        return std::make_unique<Info>(std::forward<Args>(args)...);
    } catch (const std::bad_alloc&) {
        return nullptr;
    }
}
