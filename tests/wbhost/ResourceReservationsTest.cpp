// Reservations of resource nodes by project items.
#include "TestObjects.h"
#include "com/TaskMem.h"
#include "host/contracts/IwbhwResourceReservation.h"
#include "host/contracts/IwbhwResourceTreeAccess.h"
#include "resources/ResourceService.h"

#include <gtest/gtest.h>

namespace {

using qv::com::ComPtr;

class ReservationTest : public ::testing::Test {
protected:
    void SetUp() override {
        target_ = service_.LoadTargetText(
            u"<Target><DigitalLine name=\"DIO0\"><Protocols>IOResource, DigitalLine</Protocols>"
            u"</DigitalLine></Target>");
        ASSERT_NE(target_, nullptr);
        ASSERT_EQ(target_->tree->NodeObject(target_->tree->Find(u"DIO0"), line_.Put()), S_OK);
    }
    std::vector<IwbProjectItem*> Others(IwbProjectItem* except) {
        uint32_t count = 0;
        IwbProjectItem** items = nullptr;
        EXPECT_EQ(line_->GetReservingItems(except, &count, &items), S_OK);
        std::vector<IwbProjectItem*> list(items, items + count);
        for (IwbProjectItem* item : list)
            item->Release();
        CoTaskMemFree(items);
        return list;
    }
    uint32_t IsReserved(const char16_t* protocol) {
        uint32_t reserved = 99;
        EXPECT_EQ(line_.As<IwbhwResourceReservation>()->IsReserved(protocol, 0, &reserved), S_OK);
        return reserved;
    }

    wbhost::resources::ResourceService service_;
    wbhost::resources::Target* target_ = nullptr;
    ComPtr<IwbhwResourceTreeNode> line_;
};

TEST_F(ReservationTest, TheFirstItemHoldsItTheNextTakesOverUntilTheNodeGoesOnlySharedModeNoNulls) {
    const auto first = test::NewItem();
    const auto second = test::NewItem();
    auto observer = test::NewObserver();
    ASSERT_EQ(line_->AddObserver(observer.Get(), 0x40, 1), S_OK);
    EXPECT_EQ(IsReserved(nullptr), 0u);

    EXPECT_EQ(line_->Reserve(first.Get(), 3), S_OK);
    EXPECT_EQ(line_->Reserve(second.Get(), 3), S_FALSE);
    EXPECT_EQ(line_->Reserve(first.Get(), 3), S_OK); // asking again changes nothing
    EXPECT_EQ(line_->QueryReservation(first.Get()), S_OK);
    EXPECT_EQ(line_->QueryReservation(second.Get()), S_FALSE);
    EXPECT_EQ(Others(first.Get()), std::vector<IwbProjectItem*>{second.Get()});
    EXPECT_EQ(Others(nullptr), (std::vector<IwbProjectItem*>{first.Get(), second.Get()}));
    EXPECT_EQ(IsReserved(nullptr), 1u);
    EXPECT_EQ(IsReserved(u"digitalline"), 1u);
    EXPECT_EQ(IsReserved(u"AnalogInput"), 0u); // not a protocol of this node
    EXPECT_EQ(observer->heard.size(), 2u);

    EXPECT_EQ(line_->ReleaseReservation(first.Get()), S_OK);
    EXPECT_EQ(line_->ReleaseReservation(first.Get()), S_FALSE);
    EXPECT_EQ(line_->QueryReservation(second.Get()), S_OK);
    EXPECT_EQ(observer->heard.back().events, 0x40u);
    EXPECT_EQ(line_->ReleaseReservation(second.Get()), S_OK);
    EXPECT_EQ(IsReserved(nullptr), 0u);
    auto item = test::NewItem();
    EXPECT_EQ(line_->Reserve(item.Get(), 1), E_NOTIMPL);
    EXPECT_EQ(line_->Reserve(nullptr, 3), E_POINTER);
    EXPECT_EQ(line_->QueryReservation(item.Get()), S_FALSE);
    EXPECT_EQ(line_.As<IwbhwResourceReservation>()->IsReserved(nullptr, 0, nullptr), E_POINTER);
    // Removing the node lets its holders go.
    item = test::NewItem();
    ASSERT_EQ(line_->Reserve(item.Get(), 3), S_OK);
    IwbProjectItem* raw = item.Get();
    raw->AddRef();
    item.Reset();
    ComPtr<IwbhwResourceTreeNode> root;
    ASSERT_EQ(line_->GetParent(root.Put()), S_OK);
    ASSERT_EQ(root.As<IwbhwResourceTreeAccess>()->RemoveSubTree(u"DIO0"), S_OK);
    EXPECT_EQ(raw->Release(), 0u); // the tree no longer holds the item
    const auto another = test::NewItem();
    EXPECT_EQ(line_->Reserve(another.Get(), 3), E_FAIL); // the node is gone
}

} // namespace
