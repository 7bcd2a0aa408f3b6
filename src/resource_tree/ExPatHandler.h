// The adapter between Expat and wide-string event handlers.
#pragma once

#include "resource_tree/XmlAttributes.h"

#include <cstdint>
#include <exception>
#include <expat.h>
#include <memory>
#include <string>
#include <string_view>

namespace wbhw {

// Owns one Expat parser (encoding "utf-8") and turns its callbacks into calls of the virtual
// operations below, with every name, text and attribute value converted to UTF-16. A handler
// that throws never unwinds through Expat's C frames: the exception is stored, the parser is
// stopped, and Parse rethrows it once Expat has returned.
class ExPatHandler {
public:
    ExPatHandler();
    virtual ~ExPatHandler();
    ExPatHandler(const ExPatHandler&) = delete;
    ExPatHandler& operator=(const ExPatHandler&) = delete;

    // An element starts; ATTRIBUTES are keyed by name without regard to case.
    virtual void StartElement(const std::u16string& name, const XmlAttributes& attributes) = 0;
    // An element ends.
    virtual void EndElement(const std::u16string& name) = 0;
    // A run of character data (Expat may split one text into several runs).
    virtual void CharacterData(std::u16string_view text) = 0;
    // A processing instruction; ignored unless overridden.
    virtual void ProcessingInstruction(const std::u16string& /*target*/,
                                       const std::u16string& /*data*/) {}
    // A comment; ignored unless overridden.
    virtual void Comment(const std::u16string& /*text*/) {}
    // A CDATA section starts; ignored unless overridden.
    virtual void StartCdataSection() {}
    // A CDATA section ends; ignored unless overridden.
    virtual void EndCdataSection() {}

    // Feeds the next bytes of the document; IS_FINAL ends it. Answers false when Expat reports an
    // error (see ErrorCode and friends). Rethrows what a handler threw during this call.
    bool Parse(std::string_view utf8, bool isFinal);

    // Expat's error code for the last failed Parse (XML_ERROR_NONE when none).
    XML_Error ErrorCode() const noexcept;
    // Expat's description of ErrorCode(), or "" when there is none.
    std::string ErrorString() const;
    // The parser's current line, counted from 1.
    unsigned long CurrentLine() const noexcept;
    // The parser's current column, counted from 0.
    unsigned long CurrentColumn() const noexcept;
    // How many of the FED bytes handed over so far Expat still keeps unparsed: the start of a
    // token that the last block cut off. 0 when Expat reports no position.
    uint64_t KeptBytes(uint64_t fed) const noexcept;
    // The bytes of the input that Expat still holds around the current position, and in OFFSET
    // the position within them; empty when Expat keeps no context.
    std::string_view InputContext(int& offset) const noexcept;
    // The underlying parser, for callers that need more of Expat's state.
    XML_Parser Parser() const noexcept { return parser_.get(); }

protected:
    // The element, end and text events in the UTF-8 that Expat hands over (ATTRIBUTES: name,
    // value, ..., null). These convert into the adapter's buffers and call the operations above;
    // a handler that keeps buffers of its own overrides them and converts straight into those.
    virtual void StartElementUtf8(const char* name, const char** attributes);
    virtual void EndElementUtf8(const char* name);
    virtual void CharacterDataUtf8(std::string_view text);

private:
    struct ParserFree {
        void operator()(XML_Parser p) const noexcept { XML_ParserFree(p); }
    };

    static void XMLCALL OnStart(void* self, const XML_Char* name, const XML_Char** atts);
    static void XMLCALL OnEnd(void* self, const XML_Char* name);
    static void XMLCALL OnText(void* self, const XML_Char* text, int length);
    static void XMLCALL OnPi(void* self, const XML_Char* target, const XML_Char* data);
    static void XMLCALL OnComment(void* self, const XML_Char* text);
    static void XMLCALL OnCdataStart(void* self);
    static void XMLCALL OnCdataEnd(void* self);

    // Runs one handler call, catching what it throws so that it can cross Expat later.
    template <class Fn> void Guarded(Fn&& call) noexcept;

    std::unique_ptr<std::remove_pointer_t<XML_Parser>, ParserFree> parser_;
    std::exception_ptr pending_;
    // Reused conversion buffers: the handlers are called once per event, and allocating for
    // every name and text would dominate a load.
    std::u16string name_;
    std::u16string text_;
    XmlAttributes attributes_;
};

// Appends the UTF-16 form of the UTF-8 text (as Expat delivers it, always well formed) to OUT.
void AppendUtf8AsUtf16(std::string_view utf8, std::u16string& out);

} // namespace wbhw
