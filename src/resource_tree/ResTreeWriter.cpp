// The canonical writer: a resource tree back as a resource-tree document.
#include "resource_tree/ResTreeWriter.h"

#include "host/UiLanguage.h"
#include "kern/Collate.h"
#include "kern/Utf8.h"
#include "resource_tree/ListText.h"
#include "resource_tree/LoadContext.h"
#include "resource_tree/LoaderText.h"
#include "resource_tree/TypeRegistry.h"
#include "resource_tree/XmlEscape.h"

#include <expat.h>
#include <map>
#include <unordered_set>
#include <vector>

namespace wbhw {
namespace {

bool IsNameStart(char16_t c) noexcept {
    return (c >= u'a' && c <= u'z') || (c >= u'A' && c <= u'Z') || c == u'_' || c == u':' ||
           (c >= 0xC0 && c != 0xD7 && c != 0xF7 && (c < 0xD800 || c >= 0xF900) && c < 0xFFFE);
}

bool IsNameChar(char16_t c) noexcept {
    return IsNameStart(c) || (c >= u'0' && c <= u'9') || c == u'-' || c == u'.' || c == 0xB7;
}

// The parser's classes of name characters beyond ASCII follow tables of their own; such names
// are checked by letting it read an element of that name.
bool ParserAcceptsName(std::u16string_view name) {
    std::string element(1, '<');
    element += qv::kern::WideToStandardUtf8(name);
    element += "/>";
    XML_Parser parser = XML_ParserCreate("UTF-8");
    if (parser == nullptr)
        return false;
    const bool ok =
        XML_Parse(parser, element.data(), static_cast<int>(element.size()), 1) == XML_STATUS_OK;
    XML_ParserFree(parser);
    return ok;
}

// True when NAME can be an element's tag.
bool IsElementName(std::u16string_view name) {
    if (name.empty() || !IsNameStart(name.front()))
        return false;
    bool ascii = true;
    for (const char16_t c : name) {
        if (!IsNameChar(c))
            return false;
        ascii = ascii && c < 0x80;
    }
    return ascii || ParserAcceptsName(name);
}

// True when the UTF-16 unit at I (with its pair) is a character XML can carry; ADVANCE tells how
// many units it spans.
bool IsXmlChar(std::u16string_view text, size_t i, size_t& advance) noexcept {
    const char16_t c = text[i];
    advance = 1;
    if (c == u'\t' || c == u'\n' || c == u'\r')
        return true;
    if (c < 0x20 || c == 0xFFFE || c == 0xFFFF || (c >= 0xDC00 && c < 0xE000))
        return false;
    if (c >= 0xD800 && c < 0xDC00) {
        if (i + 1 < text.size() && text[i + 1] >= 0xDC00 && text[i + 1] < 0xE000) {
            advance = 2;
            return true;
        }
        return false;
    }
    return true;
}

class Writer {
public:
    Writer(const ResTreeNode& root, std::u16string_view language)
        : root_(root),
          language_(language.empty() ? std::u16string_view(qv::host::UserInterfaceLanguage())
                                     : language) {}

    ResTreeDocument Run() {
        WriteNode(root_, root_.Name(), 0);
        return {std::move(out_), faithful_};
    }

private:
    void Indent(int depth) { out_.append(static_cast<size_t>(depth) * 2, u' '); }

    void Escaped(std::u16string_view text, bool attribute) {
        for (size_t i = 0; i < text.size();) {
            size_t advance = 1;
            if (!IsXmlChar(text, i, advance)) {
                faithful_ = false;
                out_ += u'\uFFFD';
                i += advance;
                continue;
            }
            if (advance == 1)
                AppendXmlEscaped(text[i], attribute, out_);
            else
                out_.append(text.substr(i, advance)); // a surrogate pair needs no escaping
            i += advance;
        }
    }

    void Attribute(std::u16string_view name, std::u16string_view value) {
        out_ += u' ';
        out_ += name;
        out_ += u"=\"";
        Escaped(value, true);
        out_ += u'"';
        scope_.push_back(name);
    }

    // The loader rewrites "#{v}" when v is an attribute of an open element or "document-root".
    bool WouldBeSubstituted(std::u16string_view text) const {
        size_t at = 0;
        for (;;) {
            const size_t open = text.find(u"#{", at);
            if (open == std::u16string_view::npos)
                return false;
            const size_t close = text.find(u'}', open + 2);
            if (close == std::u16string_view::npos)
                return false;
            const std::u16string_view name = TrimBlanks(text.substr(open + 2, close - open - 2));
            if (qv::kern::EqualsNoCase(name, u"document-root"))
                return true;
            for (const std::u16string_view attribute : scope_) {
                if (!qv::kern::EqualsNoCase(attribute, u"name") &&
                    qv::kern::EqualsNoCase(attribute, name))
                    return true;
            }
            at = close + 1;
        }
    }

    // A "names" value that expands to exactly NAME, or false when there is none.
    static bool NamesValue(std::u16string_view name, std::u16string& value) {
        value = EscapeListText(name, u',');
        bool truncated = false;
        const std::vector<ExpandedName> names = ExpandNames(value, 2, truncated);
        return names.size() == 1 && names.front().name == name;
    }

    void WriteNode(const ResTreeNode& node, std::u16string_view name, int depth) {
        const size_t scopeSize = scope_.size();
        const std::u16string& type = node.Type();
        if (!IsElementName(type))
            faithful_ = false;
        Indent(depth);
        out_ += u'<';
        out_ += type;
        if (qv::kern::EqualsNoCase(type, u":Link")) {
            // A named ":Link" element is a link; "names" keeps it a node.
            std::u16string value;
            if (!NamesValue(name, value))
                faithful_ = false;
            Attribute(u"names", value);
        } else {
            Attribute(u"name", name);
        }
        if (node.IsOrdered() != IsListType(type))
            Attribute(u"ordered", node.IsOrdered() ? u"true" : u"false");
        started_.insert(&node);
        if (node.IsEmpty()) {
            out_ += u"/>\n";
        } else {
            out_ += u">\n";
            // Loading removes an earlier entry of a node's name unless it is a child of the same
            // type and order, so in an ordered node only such repeats can come back.
            std::map<std::u16string_view, const ResTreeEntry*, qv::kern::LessNoCase> first;
            for (ResTreePosition at = node.Begin(); at != node.End(); ++at) {
                const auto [seen, isFirst] = first.emplace(at->Name(), &*at);
                if (!isFirst && at->Kind() == EntryKind::Child && !SameShape(*seen->second, *at))
                    faithful_ = false;
                WriteEntry(node, *at, depth + 1);
            }
            Indent(depth);
            out_ += u"</";
            out_ += type;
            out_ += u">\n";
        }
        scope_.resize(scopeSize);
    }

    static bool SameShape(const ResTreeEntry& earlier, const ResTreeEntry& later) {
        const ResTreeNode* a = earlier.Child();
        const ResTreeNode* b = later.Child();
        return a != nullptr && b != nullptr && qv::kern::EqualsNoCase(a->Type(), b->Type()) &&
               a->IsOrdered() == b->IsOrdered();
    }

    void WriteEntry(const ResTreeNode& holder, const ResTreeEntry& entry, int depth) {
        switch (entry.Kind()) {
        case EntryKind::Child:
            if (entry.Child() != nullptr)
                WriteNode(*entry.Child(), entry.Name(), depth);
            return;
        case EntryKind::Text:
        case EntryKind::LocalizedText:
            WriteText(holder, entry, depth);
            return;
        case EntryKind::Link:
            WriteLink(holder, entry, depth);
            return;
        case EntryKind::Empty:
            faithful_ = false;
            return;
        }
    }

    void WriteText(const ResTreeNode& holder, const ResTreeEntry& entry, int depth) {
        const std::u16string_view name = entry.Name();
        const TagInfo& tag = tags_.ClassifyTag(std::u16string(name));
        if (!IsElementName(name) || tag.isLink || tag.isInclude) {
            // No element can carry this name as a text, but a link that does not resolve
            // becomes exactly such a text, under any name.
            if (WriteUnresolvedLink(holder, entry, depth))
                return;
            faithful_ = false;
        }
        std::u16string_view value = *entry.Text();
        const bool localized = entry.Kind() == EntryKind::LocalizedText;
        if (localized) {
            const size_t nul = value.find(u'\0');
            const std::u16string_view whole =
                nul == std::u16string_view::npos ? value : value.substr(nul + 1);
            if (LocalizeText(whole, language_) != value)
                faithful_ = false;
            value = whole;
        }
        const size_t scopeSize = scope_.size();
        Indent(depth);
        out_ += u'<';
        out_ += name;
        if (tag.isPathText || tag.isReserves)
            Attribute(u"type", u"text");
        if (localized)
            Attribute(u"localize", u"true");
        if (TrimBlanks(value).size() != value.size())
            Attribute(u"xml:space", u"preserve");
        if (WouldBeSubstituted(value))
            faithful_ = false;
        out_ += u'>';
        Escaped(value, false);
        out_ += u"</";
        out_ += name;
        out_ += u">\n";
        scope_.resize(scopeSize);
    }

    // The node PATH leads to from FROM, following links, without loading deferred content.
    const ResTreeNode* Resolve(const ResTreeNode* from, std::u16string_view path, int hops) const {
        if (hops > 64)
            return nullptr;
        const ResTreeNode* current = from;
        std::u16string_view rest = path;
        if (path.substr(0, 2) == u"#{") {
            const size_t close = path.find(u'}', 2);
            if (close != std::u16string_view::npos) {
                if (qv::kern::EqualsNoCase(path.substr(2, close - 2), u"document-root"))
                    current = &root_;
                rest = close + 2 <= path.size() ? path.substr(close + 2) : std::u16string_view();
            }
        } else if (!path.empty() && path.front() == u'/') {
            while (current->Parent() != nullptr)
                current = current->Parent();
            rest = path.substr(1);
        }
        for (const std::u16string& piece : SplitListText(rest, u'/', false)) {
            if (current == nullptr)
                return nullptr;
            if (piece == u"..") {
                current = current->Parent();
                continue;
            }
            if (piece == u".")
                continue;
            const ResTreePosition at = current->Find(piece);
            if (at == current->End())
                return nullptr;
            if (at->Kind() == EntryKind::Child)
                current = at->Child();
            else if (at->Kind() == EntryKind::Link && !at->Text()->empty())
                current = Resolve(current, *at->Text(), hops + 1);
            else
                return nullptr;
        }
        return current;
    }

    bool WriteUnresolvedLink(const ResTreeNode& holder, const ResTreeEntry& entry, int depth) {
        constexpr std::u16string_view kUnresolved = u"UNRESOLVED LINK: ";
        const std::u16string_view value = *entry.Text();
        if (entry.Kind() != EntryKind::Text || value.substr(0, kUnresolved.size()) != kUnresolved)
            return false;
        const std::u16string_view path = value.substr(kUnresolved.size());
        if (Resolve(&holder, path, 0) != nullptr)
            return false;
        LinkElement(entry.Name(), path, depth);
        return true;
    }

    void LinkElement(std::u16string_view name, std::u16string_view path, int depth) {
        Indent(depth);
        out_ += u"<:Link";
        const size_t scopeSize = scope_.size();
        Attribute(u"name", name);
        if (TrimBlanks(path).size() != path.size())
            Attribute(u"xml:space", u"preserve");
        out_ += u'>';
        Escaped(path, false);
        out_ += u"</:Link>\n";
        scope_.resize(scopeSize);
    }

    void WriteLink(const ResTreeNode& holder, const ResTreeEntry& entry, int depth) {
        const std::u16string_view path = *entry.Text();
        const ResTreeNode* target = Resolve(&holder, path, 0);
        // Loading resolves the path again, against what has been loaded so far, and stores the
        // path from the holder to the target.
        if (target == nullptr || !started_.contains(target) ||
            RelativeResourcePath(holder.Path(), target->Path()) != path)
            faithful_ = false;
        LinkElement(entry.Name(), path, depth);
    }

    const ResTreeNode& root_;
    std::u16string_view language_;
    std::u16string out_;
    bool faithful_ = true;
    LoadContext tags_;
    std::vector<std::u16string_view> scope_;
    std::unordered_set<const ResTreeNode*> started_;
};

bool Differ(std::u16string* difference, const ResTreeNode& at, std::u16string_view what) {
    if (difference != nullptr)
        *difference = at.Path() + u": " + std::u16string(what);
    return false;
}

} // namespace

ResTreeDocument WriteResTree(const ResTreeNode& node, std::u16string_view language) {
    return Writer(node, language).Run();
}

bool EqualResTrees(const ResTreeNode& a, const ResTreeNode& b, std::u16string* difference) {
    if (a.Name() != b.Name())
        return Differ(difference, a, u"names differ: " + a.Name() + u" / " + b.Name());
    if (a.Type() != b.Type())
        return Differ(difference, a, u"types differ: " + a.Type() + u" / " + b.Type());
    if (a.IsOrdered() != b.IsOrdered())
        return Differ(difference, a, u"ordered flags differ");
    if (a.EntryCount() != b.EntryCount())
        return Differ(difference, a, u"entry counts differ");
    for (ResTreePosition x = a.Begin(), y = b.Begin(); x != a.End(); ++x, ++y) {
        if (x->Name() != y->Name())
            return Differ(difference, a, u"entry names differ: " + x->Name() + u" / " + y->Name());
        if (x->Kind() != y->Kind())
            return Differ(difference, a, u"kinds differ at " + x->Name());
        if (x->Kind() == EntryKind::Child) {
            if ((x->Child() == nullptr) != (y->Child() == nullptr))
                return Differ(difference, a, u"child missing at " + x->Name());
            if (x->Child() != nullptr && !EqualResTrees(*x->Child(), *y->Child(), difference))
                return false;
        } else if (x->Text() != nullptr && *x->Text() != *y->Text()) {
            return Differ(difference, a, u"texts differ at " + x->Name());
        }
    }
    return true;
}

} // namespace wbhw
