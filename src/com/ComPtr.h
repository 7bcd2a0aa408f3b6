// An owning interface pointer. Taking a pointer in is always explicit: Adopt takes over a
// reference the caller already owns, Share adds one of its own.
#pragma once

#include "com/IUnknown.h"

#include <utility>

namespace qv::com {

template <class I> class ComPtr {
public:
    ComPtr() = default;
    ComPtr(std::nullptr_t) {}
    ~ComPtr() { Reset(); }
    ComPtr(const ComPtr& other) : p_(other.p_) { AddRefIfAny(); }
    ComPtr(ComPtr&& other) noexcept : p_(std::exchange(other.p_, nullptr)) {}
    ComPtr& operator=(const ComPtr& other) {
        ComPtr copy(other);
        Swap(copy);
        return *this;
    }
    ComPtr& operator=(ComPtr&& other) noexcept {
        ComPtr moved(std::move(other));
        Swap(moved);
        return *this;
    }

    // Takes over a reference the caller owns (from a creation or an out-parameter); null is fine.
    static ComPtr Adopt(I* p) {
        ComPtr result;
        result.p_ = p;
        return result;
    }
    // Holds P with a reference of its own; null gives an empty pointer.
    static ComPtr Share(I* p) {
        ComPtr result;
        result.p_ = p;
        result.AddRefIfAny();
        return result;
    }

    // Releases the held reference, if any.
    void Reset() {
        if (I* p = std::exchange(p_, nullptr)) {
            p->Release();
        }
    }
    // The slot for an out-parameter: releases what is held and lets the callee fill it.
    I** Put() {
        Reset();
        return &p_;
    }
    // The slot as void** for QueryInterface-style calls.
    void** PutVoid() { return reinterpret_cast<void**>(Put()); }
    // Hands the reference to the caller (for an out-parameter); leaves this empty.
    I* Detach() { return std::exchange(p_, nullptr); }
    // Copies the pointer into an out-parameter with a reference of its own; null OUT is ignored.
    void CopyTo(I** out) const {
        if (out) {
            *out = p_;
            if (p_) {
                p_->AddRef();
            }
        }
    }

    I* Get() const { return p_; }
    I* operator->() const { return p_; }
    explicit operator bool() const { return p_ != nullptr; }
    void Swap(ComPtr& other) noexcept { std::swap(p_, other.p_); }

    // Asks the held object for interface Q; an empty result when this is empty or the object
    // does not offer it.
    template <class Q> ComPtr<Q> As() const {
        ComPtr<Q> result;
        if (p_) {
            p_->QueryInterface(Q::iid, result.PutVoid());
        }
        return result;
    }

private:
    void AddRefIfAny() {
        if (p_) {
            p_->AddRef();
        }
    }
    I* p_ = nullptr;
};

// Asks SOURCE (may be null) for interface Q.
template <class Q> ComPtr<Q> QueryAs(IUnknown* source) {
    ComPtr<Q> result;
    if (source) {
        source->QueryInterface(Q::iid, result.PutVoid());
    }
    return result;
}

} // namespace qv::com
