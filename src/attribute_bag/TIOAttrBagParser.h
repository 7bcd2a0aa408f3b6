// The reader of attribute-bag XML: Expat events turned into sets and attributes.
#pragma once

#include "resource_tree/ExPatHandler.h"

#include <string>

class TIOAttrBag;

// Builds sets and attributes under a target set from AttributeSet, Attribute and Value elements
// (names matched without regard to case). Any element out of place puts the reader in the failed
// state, after which every event is ignored; what was read before stays in the tree.
class TIOAttrBagParser : public wbhw::ExPatHandler {
public:
    // Deepest nesting of AttributeSet elements read; deeper documents fail. Real bags are a few
    // levels deep, and a hostile depth would otherwise exhaust the stack of every recursive walk
    // of the tree (and the indentation of its text grows with the square of the depth).
    static constexpr int kMaxNesting = 256;

    // Reads into TARGET; LASTSET (when given) is set to TARGET now and to each set opened later.
    TIOAttrBagParser(TIOAttrBag& target, TIOAttrBag** lastSet);

    // True once an element out of place was seen.
    bool Failed() const noexcept { return state_ == State::kFailed; }

    void StartElement(const std::u16string& element,
                      const wbhw::XmlAttributes& attributes) override;
    void EndElement(const std::u16string& element) override;
    void CharacterData(std::u16string_view text) override;

private:
    enum class State { kTop, kInside, kInAttribute, kInValue, kFailed };

    // A top-level AttributeSet: names the target, or with "parent" adds a set under it.
    void StartTopSet(const wbhw::XmlAttributes& attributes);
    // A nested AttributeSet: a new child of the current set, which must not hold that name yet.
    void StartNestedSet(const wbhw::XmlAttributes& attributes);
    // Makes SET the current set and reports it as the last one opened.
    void Enter(TIOAttrBag& set);

    TIOAttrBag* current_;
    int depth_ = 0;
    TIOAttrBag** lastSet_;
    std::u16string attributeName_;
    std::u16string text_;
    State state_ = State::kTop;
};
