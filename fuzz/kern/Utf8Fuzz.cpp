// UTF-8 decoding on arbitrary bytes: either InvalidSequence or a result that encodes back to the
// same bytes (the decoder accepts exactly the encoder's output forms).
#include "kern/Utf8.h"
#include "kern/exception/Exception.h"

#include <cstdint>
#include <cstdlib>
#include <string_view>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const std::string_view bytes(reinterpret_cast<const char*>(data), size);
    try {
        const std::u16string wide = qv::kern::Utf8ToWide(bytes);
        if (qv::kern::WideToUtf8(wide) != bytes)
            std::abort();
    } catch (const qv::kern::exception::InvalidSequence&) {
    }
    return 0;
}
