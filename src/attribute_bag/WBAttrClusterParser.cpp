// The cluster-XML form of one attribute: its writer and its reader.
#include "attribute_bag/WBAttrClusterParser.h"

#include "attribute_bag/XmlText.h"
#include "kern/Collate.h"

#include <new>

namespace wbhw {
namespace {

using qv::kern::EqualsNoCase;

void AppendStringElement(std::u16string_view label, std::u16string_view text, std::u16string& out) {
    out += u"<String><Name>";
    AppendEscapedText(label, out);
    out += u"</Name><Val>";
    AppendEscapedText(text, out);
    out += u"</Val></String>";
}

} // namespace

std::u16string WriteAttrCluster(std::u16string_view name, std::u16string_view value) {
    std::u16string out = u"<Cluster><Name></Name><NumElts>2</NumElts>";
    AppendStringElement(u"name", name, out);
    AppendStringElement(u"value", value, out);
    out += u"</Cluster>";
    return out;
}

int32_t WBAttrClusterParser::Parse(std::u16string_view text, std::u16string& name,
                                   std::u16string& value) noexcept {
    name.clear();
    value.clear();
    name_ = &name;
    value_ = &value;
    target_ = nullptr;
    state_ = kStart;
    try {
        std::string utf8;
        if (!ToUtf8Strict(text, utf8))
            return kXmlReadFailed;
        if (!ExPatHandler::Parse(utf8, true) || state_ == kFailed)
            return kXmlReadFailed;
        return 0;
    } catch (...) {
        // Nothing may leave the parser; an allocation failure is just a failed read here.
        return kXmlReadFailed;
    }
}

void WBAttrClusterParser::StartElement(const std::u16string& element, const XmlAttributes&) {
    switch (state_) {
    case kStart:
        state_ = EqualsNoCase(element, u"Cluster") ? kInCluster : kFailed;
        return;
    case kInCluster:
        if (EqualsNoCase(element, u"String")) {
            target_ = nullptr;
            state_ = kInString;
        } else if (!EqualsNoCase(element, u"Name") && !EqualsNoCase(element, u"NumElts")) {
            state_ = kFailed;
        }
        return;
    case kInString:
        if (EqualsNoCase(element, u"Name")) {
            label_.clear();
            state_ = kInStringName;
        } else if (EqualsNoCase(element, u"Val")) {
            state_ = kInStringValue;
        } else {
            state_ = kFailed;
        }
        return;
    default:
        // Starts inside a label or a value leave the state as it is; their ends fail below.
        return;
    }
}

void WBAttrClusterParser::EndElement(const std::u16string& element) {
    switch (state_) {
    case kInString:
        state_ = EqualsNoCase(element, u"String") ? kInCluster : kFailed;
        return;
    case kInStringName:
        if (!EqualsNoCase(element, u"Name")) {
            state_ = kFailed;
            return;
        }
        ApplyLabel();
        return;
    case kInStringValue:
        state_ = EqualsNoCase(element, u"Val") ? kInString : kFailed;
        return;
    default:
        return;
    }
}

void WBAttrClusterParser::CharacterData(std::u16string_view text) {
    if (state_ == kInStringName) {
        label_ += text;
        return;
    }
    if (state_ != kInStringValue)
        return;
    if (target_ == nullptr) {
        state_ = kFailed;
        return;
    }
    target_->append(text);
}

void WBAttrClusterParser::ApplyLabel() {
    state_ = kInString;
    // A Name element without any text selects nothing; a value that follows it then fails.
    if (label_.empty())
        return;
    if (EqualsNoCase(label_, u"name")) {
        target_ = name_;
    } else if (EqualsNoCase(label_, u"value")) {
        target_ = value_;
    } else {
        state_ = kFailed;
        return;
    }
    target_->clear();
}

int32_t ParseAttrCluster(std::u16string_view text, std::u16string& name,
                         std::u16string& value) noexcept {
    try {
        WBAttrClusterParser parser;
        return parser.Parse(text, name, value);
    } catch (...) {
        name.clear();
        value.clear();
        return kXmlReadFailed;
    }
}

} // namespace wbhw
