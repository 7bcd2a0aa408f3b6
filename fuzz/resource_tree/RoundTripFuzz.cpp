// Load, write, load: whenever the writer says its document loads back the same, the two trees
// must be equal, and writing the second gives the same document.
#include "FuzzSupport.h"
#include "kern/Utf8.h"
#include "resource_tree/ResTreeNode.h"
#include "resource_tree/ResTreeWriter.h"

#include <cstdint>
#include <cstdio>
#include <cstdlib>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const std::u16string text = wbhw::fuzz::DocumentFromBytes(data, size);
    wbhw::LoaderSettings settings =
        wbhw::fuzz::FuzzSettings(wbhw::fuzz::WantsProductionLimits(data, size));
    // Files would load differently the second time (deferred entries are used up).
    settings.includeDirectory = "/nonexistent";
    settings.deferredDirectory = "/nonexistent";
    wbhw::ResTreeNode first(wbhw::WString(), wbhw::WString(), false);
    first.ParseText(text, false, nullptr, &settings);
    if (wbhw::fuzz::CheckWithinBudget(first, settings) > wbhw::fuzz::kLargestWalkedTree)
        return 0;
    const wbhw::ResTreeDocument written = wbhw::WriteResTree(first, settings.language);
    if (!written.faithful)
        return 0;
    wbhw::ResTreeNode second(wbhw::WString(), wbhw::WString(), false);
    if (second.ParseText(written.xml, false, nullptr, &settings) != 0) {
        std::fprintf(stderr, "written document does not load:\n%s\n",
                     qv::kern::WideToStandardUtf8(written.xml).c_str());
        std::abort();
    }
    std::u16string difference;
    if (!wbhw::EqualResTrees(first, second, &difference)) {
        std::fprintf(stderr, "%s\n%s\n", qv::kern::WideToStandardUtf8(difference).c_str(),
                     qv::kern::WideToStandardUtf8(written.xml).c_str());
        std::abort();
    }
    if (wbhw::WriteResTree(second, settings.language).xml != written.xml)
        std::abort();
    return 0;
}
