// The host's current user-interface language.
#include "host/UiLanguage.h"

namespace qv::host {

const std::u16string& UserInterfaceLanguage() {
    // Until the runtime binding can ask the host, every session reads the English texts.
    static const std::u16string language = u"eng";
    return language;
}

} // namespace qv::host
