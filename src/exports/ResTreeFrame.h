// The calling frame shared by the exports that work on one node of a host resource tree: the
// tree from the refnum, the node from the path, the "found" flag, and every failure as a status.
#pragma once

#include "com/ComPtr.h"
#include "host/HostString.h"
#include "host/StatusError.h"
#include "host/binding/HostFunctions.h"
#include "host/contracts/IwbhwResourceTreeAccess.h"
#include "host/errors/HostErrorToHResult.h"
#include "host/errors/WBErrorException.h"
#include "kern/CodePage.h"

#include <cstdint>
#include <new>
#include <string>

namespace qv::exports {

// Runs BODY and turns whatever it throws into a status: host errors through the host-error
// table, a failing host interface call as its own status, the rest as out of memory or general
// failure. Nothing reaches the host.
template <class Body> int32_t AnswerStatus(Body&& body) noexcept {
    try {
        return body();
    } catch (const host::errors::WBErrorException& e) {
        return host::errors::HostErrorToHResult(e.code());
    } catch (const host::StatusError& e) {
        return e.Status();
    } catch (const std::bad_alloc&) {
        return E_OUTOFMEMORY;
    } catch (...) {
        return E_FAIL;
    }
}

// The interface I of the object behind the refnum at REFNUM in OBJECT: the host's status as it
// came when it fails, E_NOINTERFACE for a host that answers success without an object.
template <class I> HRESULT QueryRefnum(const WBRefNum* refnum, com::ComPtr<I>& object) {
    const HRESULT hr = host::rt::QueryInterfaceForWBRefNum(refnum, &I::iid, object.PutVoid());
    if (FAILED(hr))
        return hr;
    return object ? S_OK : E_NOINTERFACE;
}

// The frame: clears *FOUND, gets the tree's IwbhwResourceTreeAccess from the refnum at REFNUM
// (its failing status is returned as it came), finds the node at PATH (a path naming no node
// answers 0 with *FOUND still 0), sets *FOUND and answers WORK(node). A null FOUND answers
// E_POINTER before anything is touched.
template <class Work>
int32_t WithFoundNode(const WBRefNum* refnum, qv::host::HostString path, uint8_t* found,
                      Work&& work) noexcept {
    if (found == nullptr)
        return E_POINTER;
    *found = 0;
    return AnswerStatus([&]() -> int32_t {
        com::ComPtr<IwbhwResourceTreeAccess> tree;
        HRESULT hr = QueryRefnum(refnum, tree);
        if (FAILED(hr))
            return hr;
        const std::u16string nodePath = kern::AnsiToWide(host::ReadHostString(path));
        com::ComPtr<IwbhwResourceTreeAccess> node;
        hr = tree->FindNode(nodePath.c_str(), nullptr, 0, node.Put());
        if (FAILED(hr))
            return hr;
        if (hr == S_FALSE || !node)
            return S_OK;
        *found = 1;
        return work(*node.Get());
    });
}

} // namespace qv::exports
