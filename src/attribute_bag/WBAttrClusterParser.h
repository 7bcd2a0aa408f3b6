// The cluster-XML form in which one attribute (a name and a value) crosses the exported interface.
#pragma once

#include "resource_tree/ExPatHandler.h"

#include <cstdint>
#include <string>
#include <string_view>

namespace wbhw {

// The cluster text of one attribute: a host cluster of two strings labelled "name" and "value",
// texts escaped with the three-character rule. Empty NAME or VALUE gives an empty Val element.
std::u16string WriteAttrCluster(std::u16string_view name, std::u16string_view value);

// Reads the name and value of one attribute back from its cluster text. Element names and labels
// are matched without regard to case; the cluster's own Name and NumElts are not checked.
class WBAttrClusterParser : public ExPatHandler {
public:
    // Parses TEXT into NAME and VALUE (both emptied first). Answers 0, or 0x80004005 when the text
    // is not well formed, holds an unpaired surrogate or breaks the cluster layout (the outputs
    // then hold what was gathered so far). Never throws. Use one parser per text.
    int32_t Parse(std::u16string_view text, std::u16string& name, std::u16string& value) noexcept;

    void StartElement(const std::u16string& element, const XmlAttributes& attributes) override;
    void EndElement(const std::u16string& element) override;
    void CharacterData(std::u16string_view text) override;

private:
    enum State : int32_t {
        kFailed = -1,
        kStart = 0,
        kInCluster = 1,
        kInString = 2,
        kInStringName = 3,
        kInStringValue = 4,
    };

    // Chooses the output that the label gathered in the string's Name element selects.
    void ApplyLabel();

    std::u16string* name_ = nullptr;
    std::u16string* value_ = nullptr;
    std::u16string* target_ = nullptr;
    // The label may reach us in several runs of character data (Expat splits at references);
    // it is judged whole when its Name element ends.
    std::u16string label_;
    State state_ = kStart;
};

// Convenience: parses TEXT with a fresh WBAttrClusterParser. Same answers as Parse.
int32_t ParseAttrCluster(std::u16string_view text, std::u16string& name,
                         std::u16string& value) noexcept;

} // namespace wbhw
