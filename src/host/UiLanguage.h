// The host's current user-interface language, asked once and kept.
#pragma once

#include <string>

namespace qv::host {

// The language code of the host's user interface (for example "eng" or "deu"), asked of the host
// runtime on first use and kept; "eng" when no host runtime can be asked.
const std::u16string& UserInterfaceLanguage();

} // namespace qv::host
