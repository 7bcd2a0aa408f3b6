// The registry-driven item factory: walk order, fallbacks, type lists and names.
#include "framework/CqxItemTypeRegistry.h"

#include <gtest/gtest.h>

namespace {

using qv::com::ParseGuid;

constexpr GUID kLow = ParseGuid("10000000-0000-0000-0000-000000000000");
constexpr GUID kMid = ParseGuid("20000000-0000-0000-0000-000000000000");
constexpr GUID kHigh = ParseGuid("F0000000-0000-0000-0000-000000000000");
constexpr GUID kCategory = ParseGuid("30000000-0000-0000-0000-000000000000");

// An information object that answers a fixed status and records the order it was asked in.
class ScriptedInfo : public CqxpItemInfo {
public:
    ScriptedInfo(HRESULT result, std::vector<int>* log, int id, const GUID& category = GUID_NULL,
                 const GUID& parent = GUID_NULL)
        : CqxpItemInfo(category, 1, parent, u"", GUID_NULL), result_(result), log_(log), id_(id) {}
    HRESULT Create(const CqxItemRequest&, IUnknown** item) const override {
        log_->push_back(id_);
        *item = nullptr;
        return result_;
    }

private:
    HRESULT result_;
    std::vector<int>* log_;
    int id_;
};

TEST(CqxItemTypeRegistry,
     RequestsWalkKeyOrderAndTypesAreListedInKeyOrderNamedByLiteralsOrResources) {
    std::vector<int> log;
    CqxItemTypeRegistry registry;
    registry.Insert(kHigh, std::make_unique<ScriptedInfo>(S_OK, &log, 3));
    registry.Insert(kLow, std::make_unique<ScriptedInfo>(E_ACCESSDENIED, &log, 1));
    registry.Insert(kMid, std::make_unique<ScriptedInfo>(S_OK, &log, 2, kCategory));
    IUnknown* item = nullptr;
    EXPECT_EQ(registry.Create(CqxItemRequest{}, &item), S_OK);
    EXPECT_EQ(log, (std::vector<int>{1, 3})); // the other category is not asked

    log.clear();
    CqxItemRequest named;
    named.type = kMid;
    EXPECT_EQ(registry.Create(named, &item), S_OK);
    EXPECT_EQ(log, (std::vector<int>{2}));
    named.type = ParseGuid("99999999-0000-0000-0000-000000000000");
    EXPECT_EQ(registry.Create(named, &item), CLASS_E_CLASSNOTAVAILABLE);
    // When none creates, the last attempt is answered.
    CqxItemTypeRegistry empty;
    EXPECT_EQ(empty.Create(CqxItemRequest{}, &item), CLASS_E_CLASSNOTAVAILABLE);
    empty.Insert(kLow, std::make_unique<ScriptedInfo>(E_ACCESSDENIED, &log, 1));
    empty.Insert(kMid, nullptr); // its information could not be allocated
    EXPECT_EQ(empty.Create(CqxItemRequest{}, &item), E_OUTOFMEMORY);
    empty.Insert(kHigh, std::make_unique<ScriptedInfo>(E_ABORT, &log, 3));
    EXPECT_EQ(empty.Create(CqxItemRequest{}, &item), E_ABORT);
    // Types and parent types are listed in key order.
    CqxItemTypeRegistry listed;
    listed.Insert(kHigh, std::make_unique<ScriptedInfo>(S_OK, &log, 3));
    listed.Insert(kLow, std::make_unique<ScriptedInfo>(S_OK, &log, 1, GUID_NULL, kCategory));
    listed.Insert(GUID_NULL, std::make_unique<ScriptedInfo>(S_OK, &log, 0, GUID_NULL, kMid));
    std::vector<GUID> types;
    listed.ListTypes(types);
    ASSERT_EQ(types.size(), 2u); // a GUID_NULL key with a parent type is left out
    EXPECT_TRUE(IsEqualGUID(types[0], kLow));
    EXPECT_TRUE(IsEqualGUID(types[1], kHigh));
    std::vector<GUID> parents;
    listed.ListParentTypes(parents);
    ASSERT_EQ(parents.size(), 2u);
    EXPECT_TRUE(IsEqualGUID(parents[0], kMid));
    EXPECT_TRUE(IsEqualGUID(parents[1], kCategory));
    // Type names come from literals or string resources.
    CqxItemTypeRegistry names;
    names.SetTypeNameResource(kLow, 0);
    names.SetTypeNameLiteral(kLow, u"Tangent IO");
    names.SetTypeNameResource(kMid, 42);
    const auto load = [](uint32_t id, std::u16string& text) {
        if (id == 42)
            text = u"forty-two";
        return id == 42;
    };
    BSTR name = nullptr;
    ASSERT_EQ(names.TypeName(kLow, load, &name), S_OK);
    EXPECT_EQ(qv::com::UniqueBstr(name).get(), std::u16string_view(u"Tangent IO"));
    ASSERT_EQ(names.TypeName(kMid, load, &name), S_OK);
    EXPECT_EQ(qv::com::UniqueBstr(name).get(), std::u16string_view(u"forty-two"));
    names.SetTypeNameResource(kMid, 43);
    EXPECT_EQ(names.TypeName(kMid, load, &name), E_FAIL);
    EXPECT_EQ(name, nullptr);
    EXPECT_EQ(names.TypeName(kHigh, load, &name), E_FAIL);
}

} // namespace
