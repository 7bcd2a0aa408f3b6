// `wbhost program`: a host program run through the root object's runner service.
#include "CliTestSupport.h"
#include "cli/ProgramCommand.h"

#include <filesystem>

using clitest::Options;
using clitest::ScratchProject;
using namespace wbhost::cli;

namespace {

int Program(ScratchProject& p, const HostOptions& options, const std::string& file,
            const std::vector<std::string>& inputs) {
    return p.Run([&](std::ostream& out, std::ostream& err) {
        return RunProgram(options, file, inputs, out, err);
    });
}

TEST(CliProgramCommand, InputsReachTheProgram) {
    ScratchProject p;
    auto options = Options();
    options.record = true;
    ASSERT_EQ(Program(p, options, "TIOGenUniqueName.gx", {"0=text:DIO", "1=list:dio|DIO1"}), 0)
        << p.err.str();
    EXPECT_NE(p.out.str().find("4 = \"DIO2\""), std::string::npos) << p.out.str();
    EXPECT_NE(p.out.str().find("-- program runs"), std::string::npos);
}

TEST(CliProgramCommand,
     BadInputsMissingProgramsAndBadAnswersFailBareNamesAreFoundAmongThePrograms) {
    ScratchProject p;
    EXPECT_EQ(Program(p, Options(), "TIOGenUniqueName.gx", {"0:text:x"}), 1);
    EXPECT_NE(p.err.str().find("is not index=value"), std::string::npos);
    EXPECT_EQ(Program(p, Options(), "NoSuch.gx", {}), 1);
    EXPECT_NE(p.err.str().find("0x80070002"), std::string::npos) << p.err.str();
    EXPECT_EQ(Program(p, Options(), p.scratch.Write("x.gx", "behaviour: fly\n"), {}), 1);
    auto answered = Options();
    answered.answers = {"select-resource:0=text"};
    EXPECT_EQ(Program(p, answered, "TIOSelectResourceDialog.gx", {}), 1);
    const std::string found = LocateProgram("TIOGenUniqueName.gx", WBT_MODULE_PATH);
    EXPECT_TRUE(std::filesystem::exists(found)) << found;
    EXPECT_NE(found.find("wbtio/private"), std::string::npos);
    EXPECT_EQ(LocateProgram("NoSuch.gx", WBT_MODULE_PATH), "NoSuch.gx");
    EXPECT_EQ(LocateProgram("./TIOGenUniqueName.gx", WBT_MODULE_PATH), "./TIOGenUniqueName.gx");
}

} // namespace
