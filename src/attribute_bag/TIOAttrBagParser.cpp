// The reader of attribute-bag XML.
#include "attribute_bag/TIOAttrBagParser.h"

#include "attribute_bag/TIOAttrBag.h"
#include "kern/Collate.h"
#include "resource_tree/ListText.h"

#include <memory>

using qv::kern::EqualsNoCase;

TIOAttrBagParser::TIOAttrBagParser(TIOAttrBag& target, TIOAttrBag** lastSet)
    : current_(&target), lastSet_(lastSet) {
    if (lastSet_ != nullptr)
        *lastSet_ = &target;
}

void TIOAttrBagParser::Enter(TIOAttrBag& set) {
    ++depth_;
    current_ = &set;
    if (lastSet_ != nullptr)
        *lastSet_ = &set;
    state_ = State::kInside;
}

void TIOAttrBagParser::StartTopSet(const wbhw::XmlAttributes& attributes) {
    if (current_ == nullptr) {
        state_ = State::kFailed;
        return;
    }
    const std::u16string* parent = attributes.Find(u"parent");
    const std::u16string name(attributes.Get(u"name"));
    if (parent == nullptr) {
        // The document element names the set it is read into.
        if (!current_->SetName(name)) {
            state_ = State::kFailed;
            return;
        }
        Enter(*current_);
        return;
    }
    // The path only has to resolve; the new set goes under the current set, replacing a child
    // of the same name.
    if (current_->ResolvePath(*parent) == nullptr) {
        state_ = State::kFailed;
        return;
    }
    auto set = std::make_unique<TIOAttrBag>(name);
    current_->RemoveChild(name);
    // The target itself counts as the first level, so what is read here writes out (from the
    // target) no deeper than the reader accepts.
    ++depth_;
    Enter(*current_->AdoptChild(set).first);
}

void TIOAttrBagParser::StartNestedSet(const wbhw::XmlAttributes& attributes) {
    if (depth_ >= kMaxNesting) {
        state_ = State::kFailed;
        return;
    }
    auto set = std::make_unique<TIOAttrBag>(std::u16string(attributes.Get(u"name")));
    const auto [adopted, inserted] = current_->AdoptChild(set);
    if (!inserted) {
        state_ = State::kFailed;
        return;
    }
    Enter(*adopted);
}

void TIOAttrBagParser::StartElement(const std::u16string& element,
                                    const wbhw::XmlAttributes& attributes) {
    switch (state_) {
    case State::kTop:
        if (EqualsNoCase(element, u"AttributeSet"))
            StartTopSet(attributes);
        else
            state_ = State::kFailed;
        return;
    case State::kInside:
        if (EqualsNoCase(element, u"Attribute")) {
            attributeName_ = attributes.Get(u"name");
            // An Attribute without a Value reads as empty, never as an earlier attribute's text.
            text_.clear();
            state_ = State::kInAttribute;
        } else if (EqualsNoCase(element, u"AttributeSet")) {
            StartNestedSet(attributes);
        } else {
            state_ = State::kFailed;
        }
        return;
    case State::kInAttribute:
        if (EqualsNoCase(element, u"Value")) {
            text_.clear();
            state_ = State::kInValue;
        } else {
            state_ = State::kFailed;
        }
        return;
    case State::kInValue:
        text_.clear();
        return;
    case State::kFailed:
        return;
    }
}

void TIOAttrBagParser::EndElement(const std::u16string& element) {
    switch (state_) {
    case State::kTop:
        state_ = State::kFailed;
        return;
    case State::kInside:
        if (!EqualsNoCase(element, u"AttributeSet")) {
            state_ = State::kFailed;
            return;
        }
        --depth_;
        current_ = current_->Parent();
        state_ = current_ == nullptr ? State::kTop : State::kInside;
        return;
    case State::kInAttribute:
        current_->InsertOwn(attributeName_, wbhw::TrimBlanks(text_));
        state_ = EqualsNoCase(element, u"Attribute") ? State::kInside : State::kFailed;
        return;
    case State::kInValue:
        state_ = EqualsNoCase(element, u"Value") ? State::kInAttribute : State::kFailed;
        return;
    case State::kFailed:
        return;
    }
}

void TIOAttrBagParser::CharacterData(std::u16string_view text) {
    if (state_ == State::kInValue)
        text_ += text;
}
