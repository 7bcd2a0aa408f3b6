// Attribute-set texts: written for new items, read back for listings.
#include "cli/AttributeSet.h"

#include "cli/HostText.h"
#include "kern/Collate.h"
#include "resource_tree/ExPatHandler.h"
#include "resource_tree/XmlEscape.h"

#include <algorithm>

namespace wbhost::cli {
namespace {

void AppendEscaped(std::u16string_view text, bool attribute, std::u16string& out) {
    for (const char16_t c : text)
        wbhw::AppendXmlEscaped(c, attribute, out);
}

void AppendAttribute(std::u16string_view name, std::u16string_view value, std::u16string& out) {
    out += u"   <Attribute name=\"";
    AppendEscaped(name, true, out);
    out += u"\">\n   <Value>";
    AppendEscaped(value, false, out);
    out += u"</Value>\n   </Attribute>\n";
}

// Collects "Attribute" elements with their "Value" text, prefixed by the path of the enclosing
// sets; anything unexpected fails the read.
class SetReader : public wbhw::ExPatHandler {
public:
    // As deep as the module's own reader goes; a set nested deeper fails the read. Each level
    // keeps its whole path, so an unbounded depth costs memory by the square of it.
    static constexpr size_t kMaxNesting = 256;

    void StartElement(const std::u16string& name, const wbhw::XmlAttributes& attrs) override {
        if (failed_)
            return;
        if (qv::kern::EqualsNoCase(name, u"AttributeSet")) {
            if (sets_.size() >= kMaxNesting) {
                failed_ = true;
                return;
            }
            // The root set has no path of its own; nested sets add "/name".
            sets_.push_back(sets_.empty()
                                ? std::u16string()
                                : sets_.back() + u"/" + std::u16string(attrs.Get(u"name")));
        } else if (qv::kern::EqualsNoCase(name, u"Attribute") && !sets_.empty()) {
            attribute_ = std::u16string(attrs.Get(u"name"));
        } else if (qv::kern::EqualsNoCase(name, u"Value") && attribute_) {
            value_.clear();
            inValue_ = true;
        } else {
            failed_ = true;
        }
    }
    void EndElement(const std::u16string& name) override {
        if (failed_)
            return;
        if (qv::kern::EqualsNoCase(name, u"AttributeSet") && !sets_.empty()) {
            sets_.pop_back();
        } else if (qv::kern::EqualsNoCase(name, u"Value") && attribute_) {
            const std::u16string& set = sets_.back();
            found_.emplace_back(set.empty() ? *attribute_ : set + u"/" + *attribute_, value_);
            inValue_ = false;
        } else if (qv::kern::EqualsNoCase(name, u"Attribute")) {
            attribute_.reset();
        }
    }
    void CharacterData(std::u16string_view text) override {
        if (inValue_)
            value_ += text;
    }
    bool Failed() const noexcept { return failed_; }
    std::vector<SetAttribute> Found() && { return std::move(found_); }

private:
    std::vector<std::u16string> sets_;
    std::optional<std::u16string> attribute_;
    std::u16string value_;
    bool inValue_ = false;
    bool failed_ = false;
    std::vector<SetAttribute> found_;
};

} // namespace

std::u16string NewItemAttributeSet(std::u16string_view name, std::u16string_view resource,
                                   const std::vector<SetAttribute>& more) {
    std::vector<SetAttribute> all = more;
    all.emplace_back(u"name", name);
    all.emplace_back(u"resource", resource);
    // Written in name order, as the module writes its own sets.
    std::stable_sort(all.begin(), all.end(), [](const SetAttribute& a, const SetAttribute& b) {
        return qv::kern::LessNoCase()(a.first, b.first);
    });
    std::u16string text = u"<AttributeSet name=\"\">\n";
    for (const auto& [attribute, value] : all)
        AppendAttribute(attribute, value, text);
    return text + u"</AttributeSet>\n";
}

std::optional<std::vector<SetAttribute>> ReadAttributeSet(std::u16string_view text) {
    SetReader reader;
    try {
        if (!reader.Parse(ToUtf8(text), true) || reader.Failed())
            return std::nullopt;
    } catch (const std::exception&) {
        return std::nullopt;
    }
    return std::move(reader).Found();
}

} // namespace wbhost::cli
