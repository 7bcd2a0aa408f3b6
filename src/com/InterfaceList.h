// QueryInterface generated from the list of interfaces a class implements, instead of macros.
#pragma once

#include "com/IUnknown.h"

#include <concepts>

namespace qv::com {

// True for an interface that extends an earlier version of itself.
template <class I>
concept ExtendsInterface = requires {
    typename I::BaseInterface;
};

namespace detail {

// Answers the pointer to interface I (or to one of its earlier versions) of SELF when IID names
// it; null otherwise.
template <class I, class Self> void* FindInChain(Self* self, const IID& iid) {
    I* const asI = static_cast<I*>(self);
    if (IsEqualGUID(iid, I::iid)) {
        return asI;
    }
    if constexpr (ExtendsInterface<I>) {
        return FindInChain<typename I::BaseInterface>(asI, iid);
    } else {
        return nullptr;
    }
}

} // namespace detail

// The interfaces a class implements, first one first. The first interface also stands for the
// object's identity (its IUnknown). A derived class extends its base's list with Append.
template <class First, class... Rest> struct InterfaceList {
    template <class... More> using Append = InterfaceList<First, Rest..., More...>;

    // The object's IUnknown: always the same pointer, whatever interface it is asked through.
    template <class Self> static IUnknown* Identity(Self* self) {
        return static_cast<IUnknown*>(static_cast<First*>(self));
    }

    // The pointer for IID (no reference added); null when SELF implements no such interface.
    template <class Self> static void* Find(Self* self, const IID& iid) {
        if (IsEqualGUID(iid, IUnknown::iid)) {
            return Identity(self);
        }
        void* found = detail::FindInChain<First>(self, iid);
        if (!found) {
            (void)(((found = detail::FindInChain<Rest>(self, iid)) != nullptr) || ...);
        }
        return found;
    }
};

// A class may answer identifiers beyond its list (one interface part standing for two
// identifiers, say) by defining QueryOtherInterface(iid) -> void*.
template <class T>
concept AnswersOtherInterfaces = requires(T* t, const IID& iid) {
    { t->QueryOtherInterface(iid) } -> std::same_as<void*>;
};

// The pointer that T's lists (and its QueryOtherInterface, if any) give for IID; null if none.
template <class T> void* FindInterface(T* self, const IID& iid) {
    if (void* p = T::Interfaces::Find(self, iid)) {
        return p;
    }
    if constexpr (AnswersOtherInterfaces<T>) {
        return self->QueryOtherInterface(iid);
    } else {
        return nullptr;
    }
}

} // namespace qv::com
