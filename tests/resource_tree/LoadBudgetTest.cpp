// Documents of a few KB that multiply themselves stop at the load's budget with a message. The
// entry budget is a tenth of the production one here, to keep the suite quick under the
// sanitizers; the text budget is the production one (hostile_load_bench runs all of them under
// the production limits).
#include "TreeTestSupport.h"
#include "resource_tree/LoaderText.h"

#include <functional>
#include <gtest/gtest.h>

namespace wbhw {
namespace {
using namespace test;

constexpr int32_t kFail = static_cast<int32_t>(0x80004005u);

size_t CountEntries(const ResTreeNode& node) {
    size_t count = 0;
    for (ResTreePosition at = node.Begin(); at != node.End(); ++at) {
        ++count;
        if (at->Child() != nullptr)
            count += CountEntries(*at->Child());
    }
    return count;
}

std::u16string Repeat(int times, const std::function<std::string(int)>& line) {
    std::string x = "<Target name='T'>\n";
    for (int i = 0; i < times; ++i)
        x += line(i) + "\n";
    return FromUtf8Lenient(x + "</Target>");
}

void ExpectStopped(std::u16string_view document, std::u16string_view message) {
    LoaderSettings limits;
    limits.maxEntries = 100000;
    int32_t result = 0;
    auto root = Load(document, &limits, &result);
    EXPECT_EQ(result, kFail);
    const std::u16string errors = TextOf(*root, u"XMLParseErrors");
    EXPECT_NE(errors.find(message), std::u16string::npos);
    EXPECT_LE(CountEntries(*root), limits.maxEntries + 2);
}

TEST(LoadBudget, SelfMultiplyingDocumentsStopWithTheirMessage) {
    const std::u16string entries = u"The load was stopped: it would make more than 100000 entries.";
    // Names lists inside names lists: 200,000 copies of a node holding 200,000 nodes.
    ExpectStopped(u"<Target name='T'><X names=\"A[i=0..199999]\"><Y names=\"B[j=0..199999]\"/>"
                  u"</X></Target>",
                  entries);
    // Each prototype copies the previous one twice.
    ExpectStopped(Repeat(60,
                         [](int i) {
                             if (i == 0)
                                 return std::string("<P0 name='P0'><V>x</V></P0>");
                             const std::string me = std::to_string(i);
                             const std::string was = std::to_string(i - 1);
                             return "<P" + me + " name='P" + me + "'><A prototype='/P" + was +
                                    "'/><B prototype='/P" + was + "'/></P" + me + ">";
                         }),
                  entries);
    // Siblings each naming 200,000 copies.
    ExpectStopped(Repeat(60,
                         [](int i) {
                             return "<S" + std::to_string(i) + " names='N" + std::to_string(i) +
                                    "_[k=0..199999]'/>";
                         }),
                  entries);
    // Few names, but long ones: the text they would hold stops the load before they are made.
    ExpectStopped(u"<Target name='T'><L names='" + std::u16string(2000, u'n') +
                      u"[i=0..199999]'/></Target>",
                  u"The load was stopped: it would hold more than 67108864 bytes of text.");
}

} // namespace
} // namespace wbhw
