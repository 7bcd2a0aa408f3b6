// Variant attributes as the I/O name control reads and writes them, refnums as modules use them
// (QueryInterfaceForWBRefNum with a pointer to the number), and the host objects of the runtime
// (target items).
#include "TestObjects.h"
#include "VariantText.h"
#include "runtime/HostObjects.h"
#include "runtime/HostStrings.h"
#include "runtime/RefnumTable.h"
#include "runtime/Runtime.h"
#include "runtime/VariantTable.h"

#include <cstring>
#include <gtest/gtest.h>

namespace {

using wbhost::runtime::ReadHostString;
using wbhost::runtime::StoreHostString;

using varianttext::GetText;
using varianttext::Name;
using varianttext::SetText;

TEST(RuntimeVariant, OneNameOneAttributeOfAnyKindNestedOnesReadAsCopies) {
    const size_t live = wbhost::runtime::VariantTable::Instance().LiveCount();
    WBVariant data = WbVariantCreate();
    WBVariant tdData = WbVariantCreate();
    ASSERT_EQ(SetText(tdData, "IOInterface", "DigitalLine"), kWBNoErr);
    ASSERT_EQ(WbVariantPStrSetWbVariantAttr(data, Name("tdData").get(), tdData), kWBNoErr);
    // The holder keeps what tdData was when it was set.
    ASSERT_EQ(SetText(tdData, "IOInterface", "Changed"), kWBNoErr);
    ASSERT_EQ(WbVariantDestroy(tdData), kWBNoErr);

    WBVariant read = nullptr;
    ASSERT_EQ(WbVariantPStrGetWbVariantAttr(data, Name("tdData").get(), &read), kWBNoErr);
    EXPECT_EQ(GetText(read, "IOInterface"), "DigitalLine");
    ASSERT_EQ(SetText(read, "IOInterface", "Mine"), kWBNoErr);
    WBVariant again = nullptr;
    ASSERT_EQ(WbVariantPStrGetWbVariantAttr(data, Name("tdData").get(), &again), kWBNoErr);
    EXPECT_EQ(GetText(again, "IOInterface"), "DigitalLine");

    // A variant may hold a copy of itself.
    ASSERT_EQ(WbVariantPStrSetWbVariantAttr(read, Name("self").get(), read), kWBNoErr);
    EXPECT_EQ(WbVariantDestroy(read), kWBNoErr);
    EXPECT_EQ(WbVariantDestroy(again), kWBNoErr);
    EXPECT_EQ(WbVariantDestroy(data), kWBNoErr);
    EXPECT_EQ(wbhost::runtime::VariantTable::Instance().LiveCount(), live);
    // One name holds one attribute of any kind.
    WBVariant element = WbVariantCreate();
    ASSERT_EQ(SetText(element, "n", "Connector0/DIO0"), kWBNoErr);
    // A string is read into a host string of the caller's, which grows to fit.
    WBHandle value = DSNewHandle(259);
    ASSERT_EQ(StoreHostString(&value, ""), kWBNoErr);
    ASSERT_EQ(WbVariantPStrGetStringAttr(element, Name("n").get(), &value), kWBNoErr);
    EXPECT_EQ(ReadHostString(value), "Connector0/DIO0");
    DSDisposeHandle(value);

    uint32_t flag = 0;
    EXPECT_EQ(WbVariantPStrGetUI32Attr(element, Name("n").get(), &flag), kWBAttrMissing);
    ASSERT_EQ(WbVariantPStrSetUI32Attr(element, Name("f").get(), 1), kWBNoErr);
    EXPECT_EQ(WbVariantPStrGetUI32Attr(element, Name("f").get(), &flag), kWBNoErr);
    EXPECT_EQ(flag, 1u);
    EXPECT_EQ(GetText(element, "f", kWBAttrMissing), "<none>");
    EXPECT_EQ(GetText(element, "oldValue", kWBAttrMissing), "<none>");
    WBVariant none = element;
    EXPECT_EQ(WbVariantPStrGetWbVariantAttr(element, Name("n").get(), &none), kWBAttrMissing);
    EXPECT_EQ(none, nullptr);
    ASSERT_EQ(SetText(element, "f", "replaced"), kWBNoErr);
    EXPECT_EQ(GetText(element, "f"), "replaced");
    WbVariantDestroy(element);
}

TEST(RuntimeVariant, ElementsOfAZeroFilledArrayAreVariantsOnFirstUseLyingOnesGetHostErrors) {
    const size_t live = wbhost::runtime::VariantTable::Instance().LiveCount();
    // A name list as modules prepare it: a count, padding, then one variant slot per element.
    WBHandle list = DSNewHClr(8 + 8 * 2);
    ASSERT_NE(list, nullptr);
    auto slot = [&](int i) {
        return reinterpret_cast<WBVariant>(static_cast<char*>(*list) + 8 + 8 * i);
    };
    // What the host keeps in a slot: the variant the slot stands for once it is in use.
    auto stored = [&](int i) {
        WBVariant value = nullptr;
        std::memcpy(&value, static_cast<const char*>(*list) + 8 + 8 * i, sizeof value);
        return value;
    };
    EXPECT_EQ(GetText(slot(0), "n", kWBArgErr), "<none>"); // reading does not create
    ASSERT_EQ(SetText(slot(0), "n", "DIO0"), kWBNoErr);
    ASSERT_EQ(WbVariantPStrSetUI32Attr(slot(1), Name("f").get(), 1), kWBNoErr);
    EXPECT_EQ(GetText(slot(0), "n"), "DIO0");
    EXPECT_EQ(GetText(stored(0), "n"), "DIO0");
    // A slot past the block, or straddling its end, is not a variant.
    EXPECT_EQ(SetText(reinterpret_cast<WBVariant>(static_cast<char*>(*list) + 20), "n", "x"),
              kWBArgErr);
    EXPECT_EQ(WbVariantDestroy(slot(0)), kWBNoErr);
    EXPECT_EQ(WbVariantDestroy(slot(1)), kWBNoErr);
    EXPECT_EQ(stored(0), nullptr);
    EXPECT_EQ(WbVariantDestroy(slot(0)), kWBArgErr);
    DSDisposeHandle(list);
    EXPECT_EQ(wbhost::runtime::VariantTable::Instance().LiveCount(), live);
    // Lying strings and stale handles get host errors.
    WBVariant variant = WbVariantCreate();
    const Name name("n");
    WBHandle value = nullptr;
    StoreHostString(&value, "x");
    EXPECT_EQ(WbVariantPStrSetStringAttr(variant, Name("").get(), value), kWBArgErr);
    // A host string whose count claims more than its block holds is refused, not over-read.
    const int32_t lie = 1000;
    std::memcpy(*value, &lie, sizeof lie);
    EXPECT_EQ(WbVariantPStrSetStringAttr(variant, name.get(), value), kWBArgErr);
    DSDisposeHandle(value);
    EXPECT_EQ(WbVariantPStrSetStringAttr(variant, name.get(), value), kWBArgErr);
    ASSERT_EQ(WbVariantDestroy(variant), kWBNoErr);
    EXPECT_EQ(WbVariantDestroy(variant), kWBArgErr);
    EXPECT_EQ(WbVariantPStrSetUI32Attr(variant, name.get(), 1), kWBArgErr);
}

TEST(RuntimeHostObjects, TargetItemsComeFromTheProjectOnly) {
    void* item = &item;
    EXPECT_EQ(TargetItemFromAppRef(7, &item), kWBGenericErr);
    EXPECT_EQ(item, nullptr);
    EXPECT_EQ(TargetItemFromAppRef(7, nullptr), kWBArgErr);

    auto target = test::NewItem();
    wbhost::runtime::SetTargetItemResolver([&](WBRefNum appRef, void** out) -> WBErr {
        if (appRef != 7) {
            *out = target.Get(); // a resolver that fails must not hand anything out
            return kWBArgErr;
        }
        target->AddRef();
        *out = static_cast<IwbProjectItem*>(target.Get());
        return kWBNoErr;
    });
    ASSERT_EQ(TargetItemFromAppRef(7, &item), kWBNoErr);
    EXPECT_EQ(item, static_cast<IwbProjectItem*>(target.Get()));
    static_cast<IUnknown*>(item)->Release();
    EXPECT_EQ(TargetItemFromAppRef(8, &item), kWBArgErr);
    EXPECT_EQ(item, nullptr);
    wbhost::runtime::SetTargetItemResolver(nullptr);
}

TEST(RefnumTable, RefnumsLeadToTheirObjectsUntilRemovedUnknownOnesAreFailures) {
    auto observer = test::NewObserver();
    auto& table = wbhost::runtime::RefnumTable::Instance();
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
