// FPGA host descriptions in a target's resource tree: a host is an "FPGAHost" node whose
// attributes each hold a comma list of values. A tree that defines hosts keeps them under
// "FPGAHostSet"; a node that restricts the hosts it works with lists them under
// "SupportedFPGAHostList". These work on the host's trees (IwbhwResourceTreeNode).
#pragma once

#include "host/ResourceNode.h"
#include "kern/Collate.h"

#include <map>
#include <set>
#include <string>

namespace wbhw {

// Attribute name -> its values; names and values compared without regard to case.
using HostDefinition =
    std::map<std::u16string, std::set<std::u16string, qv::kern::LessNoCase>, qv::kern::LessNoCase>;

// Adds to DEFINITION the values of every attribute of the "FPGAHost" node HOST (split at ","
// and trimmed). 0, or the first failing status of the node.
HRESULT ReadHostDefinition(const qv::host::ResourceNode& host, HostDefinition& definition) noexcept;

// The definition of the host whose "GUID" attribute equals GUID (case aside) in the
// "FPGAHostSet" below TREE: 0 found, 1 when there is no such set or host (or the set's children
// cannot be had), a failing status of reading a host's "GUID" or its definition.
HRESULT FindHostDefinition(const qv::host::ResourceNode& tree, std::u16string_view guid,
                           HostDefinition& definition) noexcept;

// Whether the node at PATH below TREE admits the host REQUIRED: true when there is no such node,
// when it has no "SupportedFPGAHostList", when one of that list's hosts is satisfied by REQUIRED,
// and when anything on the way fails (a damaged description never blocks an item).
bool IsHostSupported(const HostDefinition& required, const qv::host::ResourceNode& tree,
                     std::u16string_view path) noexcept;

// Whether REQUIRED meets OFFERED: for each attribute of OFFERED, REQUIRED has it with a value
// and either holds "All" or shares a value with it. Attributes only REQUIRED has do not count.
bool Satisfies(const HostDefinition& required, const HostDefinition& offered);

} // namespace wbhw
