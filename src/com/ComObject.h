// The reference-counted object templates: a plain object, a contained (delegating) object and a
// poly object that works alone or aggregated inside an outer object.
#pragma once

#include "com/InterfaceList.h"

#include <atomic>
#include <concepts>
#include <new>
#include <utility>

namespace qv::com {

// Number of COM objects of the templates below alive in the process (tests check for leaks).
long LiveObjectCount();

namespace detail {
void CountObject(int delta);

// Runs T's explicit initialise step, when it has one, after construction.
template <class T> HRESULT RunFinalConstruct(T* object) {
    if constexpr (requires {
                      { object->FinalConstruct() } -> std::same_as<HRESULT>;
                  }) {
        return object->FinalConstruct();
    } else {
        return S_OK;
    }
}

// new without exceptions: null for an allocation failure and for a constructor that throws.
template <class Obj, class... Args> Obj* NewObject(HRESULT& hr, Args&&... args) {
    try {
        Obj* object = new (std::nothrow) Obj(std::forward<Args>(args)...);
        hr = object ? S_OK : E_OUTOFMEMORY;
        return object;
    } catch (const std::bad_alloc&) {
        hr = E_OUTOFMEMORY;
    } catch (...) {
        hr = E_FAIL;
    }
    return nullptr;
}

// Answers a query of OBJECT from T's interface list: the interface with a reference added
// through OBJECT's own AddRef, E_POINTER for a null slot, E_NOINTERFACE when T lacks it.
template <class T, class Obj> HRESULT AnswerQuery(Obj* object, const IID& iid, void** out) {
    if (!out) {
        return E_POINTER;
    }
    *out = FindInterface<T>(object, iid);
    if (!*out) {
        return E_NOINTERFACE;
    }
    object->AddRef();
    return S_OK;
}
} // namespace detail

// T with an atomic reference count and a QueryInterface generated from T::Interfaces. T itself
// stays abstract (it declares no IUnknown bodies), so T never exists outside a template.
template <class T> class CQVComObject final : public T {
public:
    template <class... Args>
    explicit CQVComObject(Args&&... args) : T(std::forward<Args>(args)...) {
        detail::CountObject(1);
    }
    ~CQVComObject() { detail::CountObject(-1); }
    CQVComObject(const CQVComObject&) = delete;
    CQVComObject& operator=(const CQVComObject&) = delete;

    // Creates an object with one reference, owned by the caller in *out. Allocation failure
    // gives E_OUTOFMEMORY, a failing FinalConstruct its status; *out is null on failure.
    template <class... Args> static HRESULT CreateInstance(CQVComObject** out, Args&&... args) {
        if (!out) {
            return E_POINTER;
        }
        *out = nullptr;
        HRESULT hr = S_OK;
        CQVComObject* object = detail::NewObject<CQVComObject>(hr, std::forward<Args>(args)...);
        if (!object) {
            return hr;
        }
        object->refs_.store(1, std::memory_order_relaxed);
        hr = detail::RunFinalConstruct<T>(object);
        if (FAILED(hr)) {
            object->Release();
            return hr;
        }
        *out = object;
        return S_OK;
    }

    // Answers T's interfaces (its list, then QueryOtherInterface) with a reference.
    HRESULT QueryInterface(const IID& iid, void** object) {
        return detail::AnswerQuery<T>(this, iid, object);
    }
    // Adds a reference; answers the new count.
    uint32_t AddRef() { return refs_.fetch_add(1, std::memory_order_relaxed) + 1; }
    // Drops a reference and deletes the object at zero; answers the new count.
    uint32_t Release() {
        const uint32_t left = refs_.fetch_sub(1, std::memory_order_acq_rel) - 1;
        if (left == 0) {
            delete this;
        }
        return left;
    }
    // The object's identity (no reference added).
    IUnknown* GetUnknown() { return T::Interfaces::Identity(this); }
    // Adds a reference unless the count already reached zero (the object is being destroyed):
    // lets a registry that holds plain pointers hand out only live objects.
    bool TryAddRef() {
        uint32_t count = refs_.load(std::memory_order_relaxed);
        while (count != 0) {
            if (refs_.compare_exchange_weak(count, count + 1, std::memory_order_acq_rel)) {
                return true;
            }
        }
        return false;
    }

private:
    std::atomic<uint32_t> refs_{0};
};

// T inside another object: every IUnknown call goes to the outer object, which owns it.
template <class T> class CQVComContainedObject final : public T {
public:
    template <class... Args>
    explicit CQVComContainedObject(IUnknown* outer, Args&&... args)
        : T(std::forward<Args>(args)...), outer_(outer) {}
    CQVComContainedObject(const CQVComContainedObject&) = delete;
    CQVComContainedObject& operator=(const CQVComContainedObject&) = delete;

    // Every IUnknown call is the outer object's.
    HRESULT QueryInterface(const IID& iid, void** object) {
        return outer_->QueryInterface(iid, object);
    }
    uint32_t AddRef() { return outer_->AddRef(); }
    uint32_t Release() { return outer_->Release(); }

    // The query the outer object forwards here: T's own interfaces, referenced through the
    // outer object.
    HRESULT InnerQueryInterface(const IID& iid, void** object) {
        return detail::AnswerQuery<T>(this, iid, object);
    }
    // The object that owns this one.
    IUnknown* Outer() const { return outer_; }

private:
    IUnknown* const outer_;
};

// An object that can stand alone or be aggregated: its own IUnknown counts references, and T
// lives inside it as a contained object whose outer is the aggregating object, or this one.
template <class T> class CQVComPolyObject final : public IUnknown {
public:
    template <class... Args>
    explicit CQVComPolyObject(IUnknown* outer, Args&&... args)
        : contained_(outer ? outer : this, std::forward<Args>(args)...) {
        detail::CountObject(1);
    }
    ~CQVComPolyObject() { detail::CountObject(-1); }
    CQVComPolyObject(const CQVComPolyObject&) = delete;
    CQVComPolyObject& operator=(const CQVComPolyObject&) = delete;

    // Creates the object with one reference on its own IUnknown, owned by the caller in *out.
    // An aggregating OUTER keeps that reference as the inner object's owner.
    template <class... Args>
    static HRESULT CreateInstance(IUnknown* outer, CQVComPolyObject** out, Args&&... args) {
        if (!out) {
            return E_POINTER;
        }
        *out = nullptr;
        HRESULT hr = S_OK;
        CQVComPolyObject* object =
            detail::NewObject<CQVComPolyObject>(hr, outer, std::forward<Args>(args)...);
        if (!object) {
            return hr;
        }
        object->refs_.store(1, std::memory_order_relaxed);
        hr = detail::RunFinalConstruct<T>(&object->contained_);
        if (FAILED(hr)) {
            object->Release();
            return hr;
        }
        *out = object;
        return S_OK;
    }

    // The non-delegating query: IUnknown is this object itself, the rest T's interfaces.
    HRESULT QueryInterface(const IID& iid, void** object) override {
        if (!object) {
            return E_POINTER;
        }
        if (IsEqualGUID(iid, IUnknown::iid)) {
            *object = static_cast<IUnknown*>(this);
            AddRef();
            return S_OK;
        }
        return contained_.InnerQueryInterface(iid, object);
    }
    uint32_t AddRef() override { return refs_.fetch_add(1, std::memory_order_relaxed) + 1; }
    uint32_t Release() override {
        const uint32_t left = refs_.fetch_sub(1, std::memory_order_acq_rel) - 1;
        if (left == 0) {
            delete this;
        }
        return left;
    }

    // The object inside (no reference added).
    T* Object() { return &contained_; }

private:
    std::atomic<uint32_t> refs_{0};
    CQVComContainedObject<T> contained_;
};

} // namespace qv::com

using qv::com::CQVComContainedObject;
using qv::com::CQVComObject;
using qv::com::CQVComPolyObject;
