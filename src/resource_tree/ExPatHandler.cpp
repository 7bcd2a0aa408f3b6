// The adapter between Expat and wide-string event handlers.
#include "resource_tree/ExPatHandler.h"

#include <cstring>
#include <new>
#include <unicode/ustring.h>

namespace wbhw {

void AppendUtf8AsUtf16(std::string_view utf8, std::u16string& out) {
    // Markup is nearly all ASCII; widen that directly and leave the rest to ICU, which also turns
    // four-byte sequences into surrogate pairs. This runs for every name, value and run of text
    // of a load, mostly a few characters long: one plain loop over them beats a scan followed by
    // a copy.
    const size_t base = out.size();
    const size_t size = utf8.size();
    out.resize(base + size);
    char16_t* const to = out.data() + base;
    const auto* const from = reinterpret_cast<const unsigned char*>(utf8.data());
    size_t ascii = 0;
    // Eight bytes at a time while they are all ASCII: one test for the eight, and a widening
    // the compiler turns into a few vector instructions.
    for (; ascii + 8 <= size; ascii += 8) {
        uint64_t word = 0;
        std::memcpy(&word, from + ascii, sizeof word);
        if ((word & 0x8080808080808080ull) != 0)
            break;
        for (size_t k = 0; k < 8; ++k)
            to[ascii + k] = static_cast<char16_t>(from[ascii + k]);
    }
    for (; ascii < size && from[ascii] < 0x80u; ++ascii)
        to[ascii] = from[ascii];
    if (ascii == size)
        return;
    int32_t written = 0;
    UErrorCode status = U_ZERO_ERROR;
    u_strFromUTF8WithSub(to + ascii, static_cast<int32_t>(size - ascii), &written,
                         utf8.data() + ascii, static_cast<int32_t>(size - ascii), 0xFFFD, nullptr,
                         &status);
    out.resize(base + ascii + (U_SUCCESS(status) ? static_cast<size_t>(written) : 0));
}

ExPatHandler::ExPatHandler() : parser_(XML_ParserCreate("UTF-8")) {
    if (!parser_)
        throw std::bad_alloc();
    XML_Parser p = parser_.get();
    XML_SetUserData(p, this);
    XML_SetElementHandler(p, &OnStart, &OnEnd);
    XML_SetCharacterDataHandler(p, &OnText);
    XML_SetProcessingInstructionHandler(p, &OnPi);
    XML_SetCommentHandler(p, &OnComment);
    XML_SetCdataSectionHandler(p, &OnCdataStart, &OnCdataEnd);
}

ExPatHandler::~ExPatHandler() = default;

template <class Fn> void ExPatHandler::Guarded(Fn&& call) noexcept {
    if (pending_)
        return;
    try {
        call();
    } catch (...) {
        pending_ = std::current_exception();
        XML_StopParser(parser_.get(), XML_FALSE);
    }
}

bool ExPatHandler::Parse(std::string_view utf8, bool isFinal) {
    const XML_Status status =
        XML_Parse(parser_.get(), utf8.data(), static_cast<int>(utf8.size()), isFinal ? 1 : 0);
    if (pending_) {
        std::exception_ptr thrown = nullptr;
        std::swap(thrown, pending_);
        std::rethrow_exception(thrown);
    }
    return status != XML_STATUS_ERROR;
}

XML_Error ExPatHandler::ErrorCode() const noexcept {
    return XML_GetErrorCode(parser_.get());
}

std::string ExPatHandler::ErrorString() const {
    const XML_LChar* text = XML_ErrorString(ErrorCode());
    return text != nullptr ? std::string(text) : std::string();
}

unsigned long ExPatHandler::CurrentLine() const noexcept {
    return XML_GetCurrentLineNumber(parser_.get());
}

unsigned long ExPatHandler::CurrentColumn() const noexcept {
    return XML_GetCurrentColumnNumber(parser_.get());
}

uint64_t ExPatHandler::KeptBytes(uint64_t fed) const noexcept {
    // Between calls Expat's current position is where its next token starts, and that is where
    // it will start scanning again when the next block arrives.
    const XML_Index at = XML_GetCurrentByteIndex(parser_.get());
    if (at < 0 || static_cast<uint64_t>(at) > fed)
        return 0;
    return fed - static_cast<uint64_t>(at);
}

std::string_view ExPatHandler::InputContext(int& offset) const noexcept {
    int size = 0;
    offset = 0;
    const char* context = XML_GetInputContext(parser_.get(), &offset, &size);
    if (context == nullptr || size <= 0)
        return {};
    return {context, static_cast<size_t>(size)};
}

void ExPatHandler::StartElementUtf8(const char* name, const char** attributes) {
    name_.clear();
    AppendUtf8AsUtf16(name, name_);
    attributes_.clear();
    for (const char** a = attributes; a[0] != nullptr; a += 2)
        attributes_.InsertUtf8(a[0], a[1]);
    StartElement(name_, attributes_);
}

void ExPatHandler::EndElementUtf8(const char* name) {
    name_.clear();
    AppendUtf8AsUtf16(name, name_);
    EndElement(name_);
}

void ExPatHandler::CharacterDataUtf8(std::string_view text) {
    text_.clear();
    AppendUtf8AsUtf16(text, text_);
    CharacterData(text_);
}

void XMLCALL ExPatHandler::OnStart(void* self, const XML_Char* name, const XML_Char** atts) {
    auto* h = static_cast<ExPatHandler*>(self);
    h->Guarded([&] { h->StartElementUtf8(name, atts); });
}

void XMLCALL ExPatHandler::OnEnd(void* self, const XML_Char* name) {
    auto* h = static_cast<ExPatHandler*>(self);
    h->Guarded([&] { h->EndElementUtf8(name); });
}

void XMLCALL ExPatHandler::OnText(void* self, const XML_Char* text, int length) {
    auto* h = static_cast<ExPatHandler*>(self);
    h->Guarded([&] { h->CharacterDataUtf8(std::string_view(text, static_cast<size_t>(length))); });
}

void XMLCALL ExPatHandler::OnPi(void* self, const XML_Char* target, const XML_Char* data) {
    auto* h = static_cast<ExPatHandler*>(self);
    h->Guarded([&] {
        std::u16string t;
        std::u16string d;
        AppendUtf8AsUtf16(target, t);
        AppendUtf8AsUtf16(data, d);
        h->ProcessingInstruction(t, d);
    });
}

void XMLCALL ExPatHandler::OnComment(void* self, const XML_Char* text) {
    auto* h = static_cast<ExPatHandler*>(self);
    h->Guarded([&] {
        std::u16string t;
        AppendUtf8AsUtf16(text, t);
        h->Comment(t);
    });
}

void XMLCALL ExPatHandler::OnCdataStart(void* self) {
    auto* h = static_cast<ExPatHandler*>(self);
    h->Guarded([&] { h->StartCdataSection(); });
}

void XMLCALL ExPatHandler::OnCdataEnd(void* self) {
    auto* h = static_cast<ExPatHandler*>(self);
    h->Guarded([&] { h->EndCdataSection(); });
}

} // namespace wbhw
