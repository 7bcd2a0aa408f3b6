// Drives host strings and string arrays with a script read from the input: writes, resizes,
// element reads and writes, blocks with arbitrary counts. Every result is checked against a plain
// model, and every host handle must be given back at the end.
#include "FuzzCheck.h"
#include "host/HostStringArray.h"
#include "host/errors/WBErrorException.h"
#include "runtime/HandleTable.h"
#include "runtime/Runtime.h"

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

namespace {

using namespace qv::host;

class Script {
public:
    Script(const uint8_t* data, size_t size) : data_(data), size_(size) {}
    bool More() const { return pos_ < size_; }
    uint8_t Byte() { return pos_ < size_ ? data_[pos_++] : 0; }
    int32_t Small() { return static_cast<int8_t>(Byte()) % 20; }
    std::string Text() {
        const size_t length = Byte() % 48;
        std::string text;
        while (text.size() < length && More()) {
            text.push_back(static_cast<char>(Byte()));
        }
        return text;
    }

private:
    const uint8_t* data_;
    size_t size_;
    size_t pos_ = 0;
};

using wbt::fuzz::Check;

template <class Action> bool Raises(Action action) {
    try {
        action();
    } catch (const qv::host::errors::WBErrorException&) {
        return true;
    }
    return false;
}

// A host string block whose count field is arbitrary but never claims more bytes than it holds.
void ReadRawString(Script& script) {
    const std::string bytes = script.Text();
    const auto claimed = static_cast<int32_t>(static_cast<int8_t>(script.Byte()));
    const int32_t count =
        claimed > static_cast<int32_t>(bytes.size()) ? static_cast<int32_t>(bytes.size()) : claimed;
    HostString raw = DSNewHandle(4 + bytes.size());
    std::memcpy(*raw, &count, sizeof count);
    std::memcpy(static_cast<char*>(*raw) + 4, bytes.data(), bytes.size());
    Check(ReadHostString(raw) == (count > 0 ? bytes.substr(0, count) : std::string()));
    DSDisposeHandle(raw);
}

void Step(Script& script, HostString& text, std::string& textModel, HostStringArray& array,
          std::vector<std::string>& model) {
    switch (script.Byte() % 6) {
    case 0:
        textModel = script.Text();
        WriteHostString(text, textModel);
        Check(ReadHostString(text) == textModel);
        break;
    case 1: {
        const int32_t size = script.Small();
        const bool raised = Raises([&] { ResizeHostStringArray(array, size); });
        Check(raised == (size < 0));
        if (!raised) {
            model.resize(static_cast<size_t>(size));
        }
        break;
    }
    case 2: {
        const int32_t index = script.Small();
        const std::string value = script.Text();
        const bool inside = index >= 0 && index < static_cast<int32_t>(model.size());
        Check(Raises([&] { WriteHostStringArrayElement(array, index, value); }) == !inside);
        if (inside) {
            model[static_cast<size_t>(index)] = value;
        }
        break;
    }
    case 3: {
        const int32_t index = script.Small();
        const bool inside = index >= 0 && index < static_cast<int32_t>(model.size());
        std::string read;
        Check(Raises([&] { read = ReadHostStringArrayElement(array, index); }) == !inside);
        Check(!inside || read == model[static_cast<size_t>(index)]);
        break;
    }
    case 4:
        ReadRawString(script);
        break;
    default: {
        // A whole-array write, then the array must read back as written.
        std::vector<std::string> texts(static_cast<size_t>(script.Byte() % 6));
        for (std::string& t : texts) {
            t = script.Text();
        }
        WriteHostStringArray(array, texts);
        model = texts;
        break;
    }
    }
    Check(ReadHostStringArray(array) == model);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const size_t liveBefore = wbhost::runtime::HandleTable::Instance().LiveCount();
    Script script(data, size);
    HostString text = nullptr;
    std::string textModel;
    HostStringArray array = nullptr;
    std::vector<std::string> model;
    while (script.More()) {
        Step(script, text, textModel, array, model);
    }
    if (array != nullptr) {
        ResizeHostStringArray(array, 0);
        DSDisposeHandle(array);
    }
    if (text != nullptr) {
        DSDisposeHandle(text);
    }
    Check(wbhost::runtime::HandleTable::Instance().LiveCount() == liveBefore);
    return 0;
}
