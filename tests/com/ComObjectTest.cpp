// Reference counting and interface queries of the COM object templates.
#include "com/ComObject.h"

#include "com/ComPtr.h"

#include <gtest/gtest.h>
#include <stdexcept>
#include <thread>
#include <vector>

namespace {

using qv::com::ComPtr;
using qv::com::InterfaceList;
using qv::com::ParseGuid;

struct IAlpha : IUnknown {
    static constexpr IID iid = ParseGuid("11111111-0000-0000-0000-000000000001");
    virtual int Alpha() = 0;
};
struct IAlpha2 : IAlpha {
    using BaseInterface = IAlpha;
    static constexpr IID iid = ParseGuid("11111111-0000-0000-0000-000000000002");
    virtual int Alpha2() = 0;
};
struct IBeta : IUnknown {
    static constexpr IID iid = ParseGuid("11111111-0000-0000-0000-000000000003");
    virtual int Beta() = 0;
};
constexpr IID kUnknownIid = ParseGuid("11111111-0000-0000-0000-0000000000FF");

class Sample : public IAlpha2, public IBeta {
public:
    using Interfaces = InterfaceList<IAlpha2, IBeta>;
    explicit Sample(int value = 7) : value_(value) {}
    int Alpha() override { return value_; }
    int Alpha2() override { return value_ * 2; }
    int Beta() override { return value_ * 3; }

private:
    int value_;
};

class FailingInit : public IBeta {
public:
    using Interfaces = InterfaceList<IBeta>;
    HRESULT FinalConstruct() { return E_ACCESSDENIED; }
    int Beta() override { return 0; }
};

class ThrowingCtor : public IBeta {
public:
    using Interfaces = InterfaceList<IBeta>;
    explicit ThrowingCtor(bool noMemory) {
        if (noMemory) {
            throw std::bad_alloc();
        }
        throw std::runtime_error("broken");
    }
    int Beta() override { return 0; }
};

// The count an object reports after one more AddRef/Release pair: its current count.
uint32_t CountOf(IUnknown* p) {
    p->AddRef();
    return p->Release();
}

TEST(ComObject, QueriesAnswerEveryInterfaceWithOneIdentityAndFailedCreationsLeaveNothing) {
    const long before = qv::com::LiveObjectCount();
    CQVComObject<Sample>* raw = nullptr;
    ASSERT_EQ(CQVComObject<Sample>::CreateInstance(&raw, 5), S_OK);
    auto object = ComPtr<IAlpha2>::Adopt(raw);
    EXPECT_EQ(qv::com::LiveObjectCount(), before + 1);
    EXPECT_EQ(CountOf(object.Get()), 1u);

    auto alpha = object.As<IAlpha>(); // an earlier version answered by the newer interface
    auto beta = object.As<IBeta>();
    ASSERT_TRUE(alpha && beta);
    EXPECT_EQ(alpha->Alpha(), 5);
    EXPECT_EQ(beta->Beta(), 15);
    EXPECT_EQ(static_cast<void*>(alpha.Get()), static_cast<void*>(object.Get()));

    auto unknownFromAlpha = alpha.As<IUnknown>();
    auto unknownFromBeta = beta.As<IUnknown>();
    EXPECT_EQ(unknownFromAlpha.Get(), unknownFromBeta.Get());
    EXPECT_EQ(CountOf(object.Get()), 5u);

    void* none = reinterpret_cast<void*>(1);
    EXPECT_EQ(object->QueryInterface(kUnknownIid, &none), E_NOINTERFACE);
    EXPECT_EQ(none, nullptr);
    EXPECT_EQ(object->QueryInterface(IBeta::iid, nullptr), E_POINTER);

    unknownFromAlpha.Reset();
    unknownFromBeta.Reset();
    alpha.Reset();
    beta.Reset();
    EXPECT_EQ(CountOf(object.Get()), 1u);
    object.Reset();
    EXPECT_EQ(qv::com::LiveObjectCount(), before);
    // A failed creation leaves nothing behind.
    CQVComObject<FailingInit>* failing = reinterpret_cast<CQVComObject<FailingInit>*>(8);
    EXPECT_EQ(CQVComObject<FailingInit>::CreateInstance(&failing), E_ACCESSDENIED);
    EXPECT_EQ(failing, nullptr);
    CQVComObject<ThrowingCtor>* throwing = nullptr;
    EXPECT_EQ(CQVComObject<ThrowingCtor>::CreateInstance(&throwing, true), E_OUTOFMEMORY);
    EXPECT_EQ(CQVComObject<ThrowingCtor>::CreateInstance(&throwing, false), E_FAIL);
    EXPECT_EQ(CQVComObject<Sample>::CreateInstance(nullptr), E_POINTER);
    EXPECT_EQ(qv::com::LiveObjectCount(), before);
}

TEST(ComObject, CountsStayExactUnderConcurrentUse) {
    const long before = qv::com::LiveObjectCount();
    CQVComObject<Sample>* raw = nullptr;
    ASSERT_EQ(CQVComObject<Sample>::CreateInstance(&raw), S_OK);
    std::vector<std::thread> threads;
    for (int t = 0; t < 4; ++t) {
        threads.emplace_back([raw] {
            for (int i = 0; i < 10000; ++i) {
                IBeta* beta = nullptr;
                raw->QueryInterface(IBeta::iid, reinterpret_cast<void**>(&beta));
                beta->Release();
            }
        });
    }
    for (auto& t : threads) {
        t.join();
    }
    EXPECT_EQ(CountOf(raw->GetUnknown()), 1u);
    EXPECT_TRUE(raw->TryAddRef());
    EXPECT_EQ(raw->Release(), 1u);
    EXPECT_EQ(raw->Release(), 0u);
    EXPECT_EQ(qv::com::LiveObjectCount(), before);
}

// An outer object that aggregates a Sample and hands out its IAlpha as its own.
class Outer : public IBeta {
public:
    using Interfaces = InterfaceList<IBeta>;
    HRESULT FinalConstruct() {
        auto* self = static_cast<IUnknown*>(static_cast<IBeta*>(this));
        CQVComPolyObject<Sample>* inner = nullptr;
        const HRESULT hr = CQVComPolyObject<Sample>::CreateInstance(self, &inner, 2);
        inner_ = ComPtr<IUnknown>::Adopt(inner);
        return hr;
    }
    void* QueryOtherInterface(const IID& iid) {
        void* p = nullptr;
        if (inner_ && SUCCEEDED(inner_->QueryInterface(iid, &p))) {
            // The inner query referenced the outer object; the caller adds its own reference.
            static_cast<IUnknown*>(static_cast<IBeta*>(this))->Release();
        }
        return p;
    }
    int Beta() override { return -1; }

private:
    ComPtr<IUnknown> inner_;
};

TEST(ComPolyObject, StandsAloneWithItsOwnIdentityAggregatedCountsOnTheOuterObject) {
    const long before = qv::com::LiveObjectCount();
    CQVComPolyObject<Sample>* raw = nullptr;
    ASSERT_EQ(CQVComPolyObject<Sample>::CreateInstance(nullptr, &raw, 4), S_OK);
    auto poly = ComPtr<IUnknown>::Adopt(raw);
    auto beta = poly.As<IBeta>();
    ASSERT_TRUE(beta);
    EXPECT_EQ(beta->Beta(), 12);
    EXPECT_EQ(beta.As<IUnknown>().Get(), poly.Get());
    EXPECT_EQ(CountOf(poly.Get()), 2u);
    poly.Reset();
    EXPECT_EQ(beta->Beta(), 12); // the interface keeps the whole object alive
    beta.Reset();
    EXPECT_EQ(qv::com::LiveObjectCount(), before);
    // Aggregated, its interfaces count on the outer object.
    CQVComObject<Outer>* made = nullptr;
    ASSERT_EQ(CQVComObject<Outer>::CreateInstance(&made), S_OK);
    auto outer = ComPtr<IBeta>::Adopt(made);
    auto alpha = outer.As<IAlpha>();
    ASSERT_TRUE(alpha);
    EXPECT_EQ(alpha->Alpha(), 2);
    EXPECT_EQ(CountOf(outer.Get()), 2u);
    EXPECT_EQ(alpha.As<IUnknown>().Get(), outer.As<IUnknown>().Get());
    EXPECT_EQ(alpha.As<IBeta>()->Beta(), -1);
    alpha.Reset();
    EXPECT_EQ(CountOf(outer.Get()), 1u);
    outer.Reset();
    EXPECT_EQ(qv::com::LiveObjectCount(), before);
}

} // namespace
