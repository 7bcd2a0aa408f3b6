// The target's hardware object: which resources fit an I/O interface under a protocol filter.
#include "resources/TargetHardware.h"

#include "com/TaskMem.h"
#include "resources/ResourceService.h"

#include <gtest/gtest.h>

namespace {

std::vector<std::u16string> List(IwbhwTargetResources& hardware, const char16_t* ioInterface,
                                 const char16_t* filter) {
    BSTR* names = nullptr;
    uint32_t count = 0;
    EXPECT_EQ(hardware.ListResourceNames(ioInterface, filter, &names, &count), S_OK);
    std::vector<std::u16string> list;
    for (uint32_t i = 0; i < count; ++i) {
        list.push_back(qv::com::BstrToString(names[i]));
        SysFreeString(names[i]);
    }
    CoTaskMemFree(names);
    return list;
}

TEST(TargetHardware, ListsTheNodesOfTheInterfaceThatPassAFilterOfKeysListsIgnoringUnknownKeys) {
    wbhost::resources::ResourceService service;
    const auto* target = service.LoadTargetText(uR"(<Target>
      <Line name="DIO0"><IOInterface>DigitalLine</IOInterface><Protocols>IOResource</Protocols></Line>
      <Line name="DIO1"><IOInterface>digitalline</IOInterface>
        <Protocols>IOResource, Reserved</Protocols></Line>
      <Line name="AI0"><IOInterface>AnalogInput</IOInterface><Protocols>IOResource</Protocols></Line>
      <Line name="Doc"><IOInterface>DigitalLine</IOInterface></Line>
    </Target>)");
    ASSERT_NE(target, nullptr);
    IwbhwTargetResources& hardware = *target->hardware.Get();
    const char16_t* const standard = u"include_protocols=IOResource,exclude_protocols=";
    EXPECT_EQ(List(hardware, u"DigitalLine", standard),
              (std::vector<std::u16string>{u"/DIO0", u"/DIO1"}));
    EXPECT_EQ(
        List(hardware, u"DigitalLine", u"include_protocols=IOResource,exclude_protocols=reserved"),
        std::vector<std::u16string>{u"/DIO0"});
    EXPECT_EQ(List(hardware, u"", standard).size(), 3u);
    EXPECT_TRUE(List(hardware, u"Counter", standard).empty());
    BSTR* names = nullptr;
    EXPECT_EQ(hardware.ListResourceNames(u"", standard, &names, nullptr), E_POINTER);
    // The filter continues a keys list and ignores unknown keys.
    using wbhost::resources::ProtocolFilter;
    const auto filter =
        ProtocolFilter::Parse(u"include_protocols=A,B,colour=red,exclude_protocols=C");
    EXPECT_EQ(filter.include, (std::vector<std::u16string>{u"A", u"B"}));
    EXPECT_EQ(filter.exclude, std::vector<std::u16string>{u"C"});
    EXPECT_TRUE(filter.Passes({u"b", u"a"}));
    EXPECT_FALSE(filter.Passes({u"A"}));
    EXPECT_FALSE(filter.Passes({u"A", u"B", u"c"}));
    EXPECT_TRUE(ProtocolFilter::Parse(u"").Passes({}));
}

} // namespace
