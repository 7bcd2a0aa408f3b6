// The compile configuration of a Tangent I/O item: a text that changes exactly when code
// compiled against the item must change.
#include "attribute_bag/ItemResourceContext.h"
#include "com/CallGuard.h"
#include "host/StatusError.h"
#include "items/TIOInstanceItemUI.h"
#include "items/TIOItemProperties.h"
#include "items/TIOSignatures.h"
#include "kern/Collate.h"
#include "resource_tree/ListText.h"
#include "resource_tree/LoaderText.h"

#include <string>

using qv::host::ResourceNode;
using qv::kern::EqualsNoCase;

namespace {

// A name as one piece of a node path: "/" and "\" inside it escaped.
std::u16string PathPiece(std::u16string_view name) {
    std::u16string piece;
    for (const char16_t c : name) {
        if (c == u'/' || c == u'\\')
            piece += u'\\';
        piece += c;
    }
    return piece;
}

// Whether the definition of attribute NAME below DEFINITIONS says it does not affect code.
bool LeftOutOfCompilation(const ResourceNode& definitions, std::u16string_view name) {
    if (!definitions)
        return false;
    const ResourceNode definition = definitions.Find(PathPiece(name));
    if (!definition)
        return false;
    const auto mark = definition.Attribute(u"DoesNotAffectCompilation");
    return mark && (mark->empty() || wbhw::IsTrueWord(*mark));
}

// One method or property: its element, its attributes but the signatures, its children's values.
void AppendMember(const ResourceNode& member, std::u16string& out) {
    const std::u16string type = member.ElementType();
    out += u";<" + type + u" name=\"" + member.Name() + u"\">";
    for (const auto& [name, value] : member.Attributes()) {
        if (EqualsNoCase(name, tio::kSignature) || EqualsNoCase(name, tio::kLastSignature))
            continue;
        out += u"<" + name + u">" + value + u"</" + name + u">";
    }
    for (const ResourceNode& child : member.Children())
        out += child.Value();
    out += u"</" + type + u">";
}

// The type that PATH (below METHOD, "/"-separated) names: the attribute named by its last piece
// on the node the rest names, else the value of the node the whole path names.
std::optional<std::u16string> MethodType(const ResourceNode& method, std::u16string_view path) {
    const std::u16string_view relative = path.substr(path.find_first_not_of(u'/'));
    const size_t slash = relative.rfind(u'/');
    if (slash != std::u16string_view::npos) {
        if (const ResourceNode holder = method.Find(relative.substr(0, slash)))
            if (auto type = holder.Attribute(relative.substr(slash + 1)))
                return type;
    }
    if (const ResourceNode node = method.Find(relative))
        return node.Value();
    return std::nullopt;
}

void AppendMethodType(const ResourceNode& resource, std::u16string_view method,
                      std::u16string_view typePath, std::u16string_view label,
                      std::u16string& out) {
    const ResourceNode node = resource.Find(method);
    if (!node)
        return;
    if (const auto type = MethodType(node, typePath))
        out += std::u16string(u";") + std::u16string(label) + u"=" + *type;
}

} // namespace

void TIOInstanceItemUI::BuildCompileConfiguration(std::u16string& out) {
    if (BeingRemoved() || workingSet_ == nullptr)
        return;
    const ResourceNode root = TreeRoot();
    const ResourceNode resource = ResourceNodeOf(root);
    const ResourceNode definitions = resource ? resource.Find(u"AttributeSet") : ResourceNode();
    for (const auto& [name, value] : workingSet_->Attributes()) {
        if (LeftOutOfCompilation(definitions, name))
            continue;
        out += name + u"=" + std::u16string(wbhw::TrimBlanks(value)) + u";";
    }
    int32_t status = tio::status::kMissing;
    if (HostItem() != nullptr) {
        qv::com::ComPtr<IwbProjectPropertyBag> properties;
        if (SUCCEEDED(HostItem()->GetPropertyBag(properties.Put())) && properties &&
            properties->GetInt(tio::kStatusProperty, &status) != S_OK)
            status = tio::status::kMissing;
    }
    for (const char c : std::to_string(status))
        out += static_cast<char16_t>(c);
    if (!resource)
        return;
    for (const ResourceNode& member : tio::CollectMembers(resource).members)
        if (member.Attribute(tio::kSignature))
            AppendMember(member, out);
    AppendMethodType(resource, u"MethodSet/Read", u"/ReturnValue/Type", u"ReadMethodType", out);
    AppendMethodType(resource, u"MethodSet/Write", u"/ParameterList/Value/Type", u"WriteMethodType",
                     out);
}

HRESULT TIOInstanceItemUI::GetCompileConfiguration(BSTR* text) {
    if (text == nullptr)
        return E_POINTER;
    *text = nullptr;
    std::u16string built;
    // Always answers: a tree that cannot be read leaves the text built so far.
    try {
        BuildCompileConfiguration(built);
    } catch (...) {
    }
    *text = qv::com::AllocBstr(built);
    return *text != nullptr ? S_OK : E_OUTOFMEMORY;
}
