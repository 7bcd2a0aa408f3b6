// The framework's root object.
#include "session/RootObject.h"

namespace wbhost::session {

HRESULT RootObjectImpl::CreateInstance(const CLSID& clsid, const IID& iid, void** object) {
    if (!object)
        return E_POINTER;
    *object = nullptr;
    if (!service_)
        return E_UNEXPECTED;
    return service_->CreateInstance(clsid, iid, object);
}

} // namespace wbhost::session
