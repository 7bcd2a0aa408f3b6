// Collecting a resource's methods and properties.
#include "items/TIOSignatures.h"

namespace tio {

ResourceMembers CollectMembers(const qv::host::ResourceNode& resource) {
    ResourceMembers found;
    found.methodSet = resource.Find(u"MethodSet");
    found.propertySet = resource.Find(u"PropertySet");
    if (found.methodSet)
        found.members = found.methodSet.ChildrenOfType(u"Method");
    if (found.propertySet)
        for (auto& property : found.propertySet.ChildrenOfType(u"Property"))
            found.members.push_back(std::move(property));
    return found;
}

} // namespace tio
