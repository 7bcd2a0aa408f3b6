// The critical section on a recursive mutex.
#include "kern/osdep/CqvCS.h"

namespace Bytefair {

bool CqvCS::Lock(uint32_t /*timeoutMs*/) {
    mutex_.lock();
    return true;
}

bool CqvCS::Unlock() {
    mutex_.unlock();
    return true;
}

} // namespace Bytefair
