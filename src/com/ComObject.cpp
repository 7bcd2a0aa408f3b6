// The process-wide count of live COM objects.
#include "com/ComObject.h"

namespace qv::com {

namespace {
std::atomic<long> liveObjects{0};
}

long LiveObjectCount() {
    return liveObjects.load(std::memory_order_relaxed);
}

namespace detail {
void CountObject(int delta) {
    liveObjects.fetch_add(delta, std::memory_order_relaxed);
}
} // namespace detail

} // namespace qv::com
