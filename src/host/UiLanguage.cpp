// The host's current user-interface language, asked of the host runtime once.
#include "host/UiLanguage.h"

#include "host/HostString.h"
#include "host/binding/HostFunctions.h"

namespace qv::host {

namespace {

// The language code as the host reports it, or "eng" when no host runtime is there to ask (the
// module is not inside a host, or the host lacks the function): asking must never end the
// process the way a missing host function otherwise does.
std::u16string AskHost() {
    GetLangStrFn* const getLangStr = rt::GetLangStr.TryAddress();
    DSDisposeHandleFn* const dispose = rt::DSDisposeHandle.TryAddress();
    if (getLangStr == nullptr || dispose == nullptr) {
        return u"eng";
    }
    WBHandle text = nullptr;
    const WBErr err = getLangStr(kWBLangStrUiLanguage, &text);
    const std::string code = err == kWBNoErr ? ReadHostString(text) : std::string();
    if (text != nullptr) {
        dispose(text);
    }
    // Language codes are plain ASCII; anything else is not a code we can use.
    std::u16string language;
    for (const char c : code) {
        if (static_cast<unsigned char>(c) >= 0x80) {
            return u"eng";
        }
        language.push_back(static_cast<char16_t>(c));
    }
    return language.empty() ? u"eng" : language;
}

} // namespace

const std::u16string& UserInterfaceLanguage() {
    static const std::u16string language = AskHost();
    return language;
}

} // namespace qv::host
