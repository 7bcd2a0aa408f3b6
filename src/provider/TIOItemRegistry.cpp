// Registration of the module's item types.
#include "provider/TIOItemRegistry.h"

#include "framework/CqxItemUI.h"
#include "items/TIOInstanceItemUI.h"
#include "provider/TIOIdentifiers.h"
#include "provider/TIOInstanceCreateNewWizard.h"
#include "provider/TIOProvider.h"

#include <mutex>

namespace tio {

namespace {

// The framework's generic item as this provider creates it.
using GenericItemInfo = CqxpItemUIInfoT<CqxItemUI, TIOProvider>;
using IOItemInfo = CqxpItemUIInfoT<TIOInstanceItemUI, TIOProvider>;
using WizardInfo = CqxpBindableItemInfoT<TIOInstanceCreateNewWizard, TIOProvider>;

constexpr uint32_t kInfoFlags = 1;

void RegisterItemTypes(CqxItemTypeRegistry& registry) {
    registry.Insert(kGenericItemType, MakeItemInfo<GenericItemInfo>(
                                          GUID_NULL, kInfoFlags, GUID_NULL, u"", kProviderClassId));
    registry.Insert(kIOItemType,
                    MakeItemInfo<IOItemInfo>(GUID_NULL, kInfoFlags, GUID_NULL, u"", GUID_NULL));
    registry.SetTypeNameResource(kIOItemType, 0);
    registry.SetTypeNameLiteral(kIOItemType, u"Tangent IO");
    registry.Insert(kWizardType, MakeItemInfo<WizardInfo>(GUID_NULL, kInfoFlags, GUID_NULL, u"",
                                                          kProviderClassId));
}

} // namespace

CqxItemTypeRegistry& ItemRegistry() {
    static CqxItemTypeRegistry registry;
    // Registration runs on the first provider operation that needs it; once only, even when two
    // threads get there together.
    static std::once_flag registered;
    std::call_once(registered, [] { RegisterItemTypes(registry); });
    return registry;
}

} // namespace tio
