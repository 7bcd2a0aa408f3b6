// Exceptions to statuses at interface boundaries.
#include "com/CallGuard.h"

#include <exception>

namespace qv::com {

HRESULT StatusFromCurrentException() noexcept {
    try {
        throw;
    } catch (const std::bad_alloc&) {
        return E_OUTOFMEMORY;
    } catch (const kern::exception::Exception& e) {
        const auto code = static_cast<HRESULT>(e.GetErrorCode());
        return FAILED(code) ? code : E_FAIL;
    } catch (...) {
        return E_FAIL;
    }
}

} // namespace qv::com
