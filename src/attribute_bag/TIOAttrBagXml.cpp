// The attribute bag's text forms: its XML document and the cluster texts of single attributes.
#include "attribute_bag/TIOAttrBag.h"
#include "attribute_bag/TIOAttrBagParser.h"
#include "attribute_bag/WBAttrClusterParser.h"
#include "attribute_bag/XmlText.h"
#include "resource_tree/ListText.h"

void TIOAttrBag::WriteXml(std::u16string& out, std::u16string_view indent) const {
    std::u16string inner(indent);
    inner += u"   ";

    out += indent;
    out += u"<AttributeSet name=\"";
    wbhw::AppendEscapedAttribute(name_, out);
    out += u"\">\n";
    for (const auto& [name, value] : attributes_) {
        out += inner;
        out += u"<Attribute name=\"";
        wbhw::AppendEscapedAttribute(name, out);
        out += u"\">\n";
        out += inner;
        out += u"<Value>";
        wbhw::AppendEscapedText(wbhw::TrimBlanks(value), out);
        out += u"</Value>\n";
        out += inner;
        out += u"</Attribute>\n";
    }
    for (const auto& [name, child] : children_)
        child->WriteXml(out, inner);
    out += indent;
    out += u"</AttributeSet>\n";
}

int32_t TIOAttrBag::ReadXml(std::u16string_view document, TIOAttrBag& target,
                            TIOAttrBag** lastSet) {
    TIOAttrBagParser parser(target, lastSet);
    // One stray control character in a stored value must not make the whole bag unreadable, so
    // what XML cannot carry reads as "?" instead of failing the document.
    const std::string utf8 = wbhw::ToXmlUtf8Lenient(document);
    if (!parser.Parse(utf8, true) || parser.Failed())
        return wbhw::kXmlReadFailed;
    return 0;
}

void TIOAttrBag::ExportClusterStrings(std::vector<std::u16string>& out,
                                      const NameSet* exclude) const {
    for (const Entry& entry : VisibleAttributes()) {
        if (exclude != nullptr && exclude->contains(*entry.name))
            continue;
        out.push_back(wbhw::WriteAttrCluster(*entry.name, *entry.value));
    }
}

std::u16string TIOAttrBag::ExportClusterString(const Entry& entry, bool withPath) const {
    if (!entry)
        return {};
    if (!withPath)
        return wbhw::WriteAttrCluster(*entry.name, *entry.value);
    return wbhw::WriteAttrCluster(GetPath() + *entry.name, *entry.value);
}

int32_t TIOAttrBag::ImportClusterStrings(const std::vector<std::u16string>& texts) {
    std::u16string name;
    std::u16string value;
    for (const std::u16string& text : texts) {
        const int32_t status = wbhw::ParseAttrCluster(text, name, value);
        if (status != 0)
            return status;
        SetValue(name, value);
    }
    return 0;
}
