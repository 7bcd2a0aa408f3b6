// A module's provider as the maker of the project's item objects.
#pragma once

#include "com/ComPtr.h"
#include "framework/IqxProvider.h"
#include "project/Project.h"

namespace wbhost::project {

// Makes the objects of PROVIDER's item types: a new item through CreateItem, a reloaded one
// through CreateItemFromState with its property bag as the saved state; the object is then
// bound to its item when it offers IqxBindable. Items of types the provider does not list get
// no object. A null PROVIDER gives a factory that makes none.
Project::ObjectFactory ProviderFactory(qv::com::ComPtr<IqxProvider> provider);

} // namespace wbhost::project
