// Comparing two descriptions given as texts in the default code page, as callers of the module's
// comparison export hand them over. The answer is one of the three results, the same when the
// pair is asked again (from the cache) and when it is explained (a fresh comparison), and a
// description always matches itself.
#include "FuzzCheck.h"
#include "FuzzSupport.h"
#include "resource_tree/ResourceCompare.h"

#include <cstdint>
#include <cstdlib>
#include <string_view>

namespace {

using wbt::fuzz::Check;

} // namespace

// The first byte chooses the limits (as for the other loads); the rest is the two texts,
// separated by the first NUL byte, or halved when there is none.
extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    if (size == 0)
        return 0;
    // The comparison's loads take the default settings, as the host sets them.
    wbhw::SetDefaultLoaderSettings(
        wbhw::fuzz::FuzzSettings(wbhw::fuzz::WantsProductionLimits(data, size)));
    const std::string_view texts(reinterpret_cast<const char*>(data) + 1, size - 1);
    const size_t nul = texts.find('\0');
    const size_t split = nul == std::string_view::npos ? texts.size() / 2 : nul;
    const std::string_view first = texts.substr(0, split);
    const std::string_view second = texts.substr(std::min(texts.size(), split + 1));

    const uint32_t answer = wbhw::CompareResourceTexts(first, second);
    Check(answer <= wbhw::kToleratedDifference);
    Check(wbhw::CompareResourceTexts(first, second) == answer);
    wbhw::CompareExplanation why;
    Check(wbhw::CompareResourceTexts(first, second, &why) == answer);
    Check(why.result == answer);
    Check(why.findings.empty() == (answer == wbhw::kMatch));
    Check(wbhw::CompareResourceTexts(first, first) == wbhw::kMatch);
    return 0;
}
