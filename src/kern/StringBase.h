// The library's string class in its narrow (char) and wide (UTF-16, char16_t) forms.
#pragma once

#include "kern/exception/Exception.h"

#include <string>
#include <string_view>

namespace qv::kern {

// A std::basic_string whose substring operation reports a bad offset with the library's own
// exception: a start beyond the length raises OutOfRange2("String offset out of range"); a
// length running past the end is cut at the end.
template <class CharT> class StringBase : public std::basic_string<CharT> {
public:
    using Base = std::basic_string<CharT>;
    using Base::Base;
    using Base::npos;
    StringBase() = default;
    StringBase(const Base& s) : Base(s) {}
    StringBase(Base&& s) noexcept : Base(std::move(s)) {}
    explicit StringBase(std::basic_string_view<CharT> s) : Base(s) {}

    StringBase substr(typename Base::size_type offset,
                      typename Base::size_type count = npos) const {
        if (offset > this->size()) {
            QV_THROW(exception::OutOfRange2("String offset out of range"));
        }
        return StringBase(Base::substr(offset, count));
    }
};

using NString = StringBase<char>;
using WString = StringBase<char16_t>;

} // namespace qv::kern
