// The exception tree of the foundation library: every failure inside the module is one of these,
// carrying the raise site (file, line), a text and a 32-bit error code.
#pragma once

#include <cstdint>
#include <exception>
#include <string>

namespace qv::kern::exception {

// Root of the tree. what() is "unspecified exception", the code 0xFFFFFFFF.
class Exception : public std::exception {
public:
    Exception() = default;
    Exception(const Exception&) = default;
    Exception& operator=(const Exception&) = default;
    ~Exception() override = default;

    const char* what() const noexcept override { return "unspecified exception"; }
    // The 32-bit error code of the class (or of the instance, for host and OS errors).
    virtual uint32_t GetErrorCode() const noexcept { return 0xFFFFFFFFu; }

    // Source line of the raise site, 0 when not set.
    uint32_t line() const noexcept { return line_; }
    // Source file of the raise site, null when not set.
    const char* file() const noexcept { return file_; }
    void SetLocation(const char* file, uint32_t line) noexcept {
        file_ = file;
        line_ = line;
    }

private:
    uint32_t line_ = 0;
    const char* file_ = nullptr;
};

// Declares a class of the tree whose text and code are constants.
#define QV_KERN_FIXED_EXCEPTION(Name, Base, Text, Code)                                            \
    class Name : public Base {                                                                     \
    public:                                                                                        \
        const char* what() const noexcept override { return Text; }                                \
        uint32_t GetErrorCode() const noexcept override { return Code; }                           \
    }

QV_KERN_FIXED_EXCEPTION(OutOfRange, Exception, "Out of range", 0x8ABC7007u);
QV_KERN_FIXED_EXCEPTION(InvalidArgument, Exception, "Invalid argument(s)", 0x8ABC700Fu);
QV_KERN_FIXED_EXCEPTION(InitializationFailure, Exception, "Initialization failed", 0x8ABC7010u);
QV_KERN_FIXED_EXCEPTION(BufferOverflow, Exception, "Buffer overflowed", 0x8ABC7017u);
QV_KERN_FIXED_EXCEPTION(InvalidLocale, Exception, "Invalid locale", 0x8ABC7024u);
QV_KERN_FIXED_EXCEPTION(InvalidSequence, Exception, "Invalid UTF8 encoding sequence", 0x8ABC7030u);
QV_KERN_FIXED_EXCEPTION(BadGuidString, Exception, "Badly formatted Guid string.", 0x8ABC7032u);
QV_KERN_FIXED_EXCEPTION(UnableToConvert, Exception, "Unable to convert.", 0x8ABC7034u);
QV_KERN_FIXED_EXCEPTION(NotImplemented, Exception, "Not implemented", 0x80004001u);

#undef QV_KERN_FIXED_EXCEPTION

// "Out of range: " followed by a detail text (the string class's bad substring offset).
class OutOfRange2 : public OutOfRange {
public:
    explicit OutOfRange2(const std::string& detail) : message_("Out of range: " + detail) {}
    const char* what() const noexcept override { return message_.c_str(); }

private:
    std::string message_;
};

// Records the raise site in the exception and throws a copy of it.
template <class E> [[noreturn]] void Raise(E ex, const char* file, uint32_t line) {
    ex.SetLocation(file, line);
    throw ex;
}

} // namespace qv::kern::exception

// Throws EX (an exception of the tree) with the current source location.
#define QV_THROW(ex) ::qv::kern::exception::Raise((ex), __FILE__, __LINE__)
