// Refnums as modules use them: QueryInterfaceForWBRefNum with a pointer to the number.
#include "runtime/RefnumTable.h"

#include "TestObjects.h"
#include "runtime/Runtime.h"

#include <cstring>
#include <gtest/gtest.h>

namespace {

using wbhost::runtime::RefnumTable;

TEST(RefnumTable, RefnumsLeadToTheirObjectsUntilRemovedUnknownOnesAreFailures) {
    auto observer = test::NewObserver();
    RefnumTable& table = RefnumTable::Instance();
    const WBRefNum refnum = table.Add(observer.Get());
    ASSERT_NE(refnum, 0u);
    const WBRefNum second = table.Add(observer.Get());
    EXPECT_NE(second, refnum);

    void* object = nullptr;
    EXPECT_EQ(QueryInterfaceForWBRefNum(&refnum, &IwbhwResourceTreeNodeObserver::iid, &object),
              S_OK);
    EXPECT_EQ(object, static_cast<IwbhwResourceTreeNodeObserver*>(observer.Get()));
    static_cast<IUnknown*>(object)->Release();

    // The object answers for itself: an interface it lacks is its own E_NOINTERFACE.
    object = &table;
    EXPECT_EQ(QueryInterfaceForWBRefNum(&refnum, &IwbProjectItem::iid, &object), E_NOINTERFACE);
    EXPECT_EQ(object, nullptr);

    EXPECT_TRUE(table.Remove(refnum));
    EXPECT_FALSE(table.Remove(refnum));
    EXPECT_TRUE(table.Remove(second));
    EXPECT_EQ(QueryInterfaceForWBRefNum(&refnum, &IUnknown::iid, &object), E_INVALIDARG);
    // Only this test's own reference is left.
    EXPECT_EQ(observer->AddRef(), 2u);
    observer->Release();
    // Unknown refnums and unaligned identifiers are failures, never crashes.
    const WBRefNum unknown = 0xDEADBEEFu;
    object = &object;
    EXPECT_EQ(QueryInterfaceForWBRefNum(&unknown, &IUnknown::iid, &object), E_INVALIDARG);
    EXPECT_EQ(object, nullptr);
    // An identifier need not be aligned as a GUID is.
    alignas(8) unsigned char bytes[17] = {};
    std::memcpy(bytes + 1, &IUnknown::iid, sizeof(IID));
    EXPECT_EQ(QueryInterfaceForWBRefNum(&unknown, bytes + 1, &object), E_INVALIDARG);
}

} // namespace
