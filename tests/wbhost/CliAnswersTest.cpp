// `wbhost program` (a host program run through the root object's runner service), the answers for
// dialog programs as the command line takes them, and the printed run log.
#include "CliTestSupport.h"
#include "cli/Answers.h"
#include "cli/ProgramCommand.h"

#include <filesystem>
#include <gtest/gtest.h>
#include <sstream>

using clitest::Options;
using clitest::ScratchProject;
using projecttest::ScratchFolder;
using wbhost::cli::AddAnswer;
using wbhost::cli::ApplyAnswers;
using wbhost::cli::LoadAnswerFile;
using wbhost::runner::ProgramSession;
using wbhost::runner::ProgramValue;

namespace {

TEST(CliAnswers, RefusesMalformedTextsAndBadFileLinesWithoutSettingAnythingSinglesOverride) {
    ProgramSession session;
    std::string error;
    // A behaviour nobody runs would be accepted by the session and never used.
    EXPECT_FALSE(AddAnswer("select-resorce:0=1", session, error));
    EXPECT_EQ(error, "answer \"select-resorce:0=1\": no program behaviour has that name");
    // Terminals run from 0 to 15: an answer for output 200 would be printed and never read.
    for (const char* bad : {"select-resource", "select-resource:0", ":0=1", "select-resource:x=1",
                            "select-resource:=1", "select-resource:1=2x", "select-resource=1:2",
                            "select-resource:0=maybe", "select-resource:0=", "select-resource:16=1",
                            "select-resource:200=1", "select-resource:0=text:\xFF\xFE",
                            "select-resource:0=list:a|b\xC3"}) {
        error.clear();
        EXPECT_FALSE(AddAnswer(bad, session, error)) << bad;
        EXPECT_FALSE(error.empty()) << bad;
    }
    EXPECT_TRUE(session.AnswersFor("select-resource").empty());

    // Only the first "=" ends the index: a text may hold more of them, and colons.
    ASSERT_TRUE(AddAnswer("new-item-wizard:2=text:a=b:c", session, error)) << error;
    EXPECT_EQ(session.AnswersFor("new-item-wizard").at(2), ProgramValue(std::u16string(u"a=b:c")));
    ASSERT_TRUE(AddAnswer("new-item-wizard:3=list:a|b", session, error)) << error;
    EXPECT_EQ(session.AnswersFor("new-item-wizard").at(3),
              ProgramValue(std::vector<std::u16string>{u"a", u"b"}));
    // Terminal text is standard UTF-8, four-byte sequences included.
    ASSERT_TRUE(AddAnswer("new-item-wizard:4=text:\xF0\x9F\x98\x80", session, error)) << error;
    EXPECT_EQ(session.AnswersFor("new-item-wizard").at(4),
              ProgramValue(std::u16string(u"\U0001F600")));
    // Files skip comments and blanks and name the bad line; single answers override them.
    ScratchFolder scratch;
    const std::string good =
        scratch.Write("good.txt", "# answers for the wizard\r\n\r\n  new-item-wizard:0=0  \r\n"
                                  "select-resource:1=text:Connector0/DIO1\n");
    ASSERT_TRUE(LoadAnswerFile(good, session, error)) << error;
    EXPECT_EQ(session.AnswersFor("new-item-wizard").at(0), ProgramValue(0));
    // The carriage return of a Windows line end is not part of the text.
    EXPECT_EQ(session.AnswersFor("select-resource").at(1),
              ProgramValue(std::u16string(u"Connector0/DIO1")));

    // A byte-order mark is no part of the first answer; a bad line is named by its number and
    // its reason, never echoed (the file may be anything the user named).
    const std::string bad =
        scratch.Write("bad.txt", "\xEF\xBB\xBF"
                                 "explain-error:0=1\n# fine so far\nexplain-error secret=1\n");
    EXPECT_FALSE(LoadAnswerFile(bad, session, error));
    EXPECT_EQ(error, bad + ": line 3: not of the form behaviour:index=value");
    EXPECT_EQ(session.AnswersFor("explain-error").at(0), ProgramValue(1));

    EXPECT_FALSE(LoadAnswerFile(scratch.File("missing.txt"), session, error));
    EXPECT_NE(error.find("cannot read the answer file"), std::string::npos);
    EXPECT_FALSE(LoadAnswerFile(scratch.Path(), session, error));
    EXPECT_NE(error.find("it is a folder"), std::string::npos) << error;
    EXPECT_FALSE(LoadAnswerFile("/dev/zero", session, error));
    EXPECT_NE(error.find("not a regular file"), std::string::npos) << error;
    // Single answers override the files.
    const std::string file = scratch.Write("a.txt", "properties:0=1\nproperties:2=5\n");
    ASSERT_TRUE(ApplyAnswers({file}, {"properties:0=0"}, session, error)) << error;
    EXPECT_EQ(session.AnswersFor("properties").at(0), ProgramValue(0));
    EXPECT_EQ(session.AnswersFor("properties").at(2), ProgramValue(5));
    EXPECT_FALSE(ApplyAnswers({}, {"properties:0=0", "nope"}, session, error));
}

TEST(CliAnswers, RunLogShowsEveryKindOfValueOnItsOwnLine) {
    ProgramSession session;
    std::ostringstream none;
    wbhost::cli::PrintRuns(session, none);
    EXPECT_EQ(none.str(), "no programs ran\nhost references: 0 made, 0 still open\n");

    session.Record({"/x/private/TIOPropertyMain.gx",
                    "properties",
                    {{9, std::vector<std::u16string>{u"a\"b", u"two\nlines"}},
                     {11, wbhost::runner::HostReference{42}}},
                    {{0, 1}, {1, std::u16string(u"back\\slash")}}});
    std::ostringstream log;
    wbhost::cli::PrintRuns(session, log);
    EXPECT_EQ(log.str(), "TIOPropertyMain.gx (properties)\n"
                         "  inputs:\n"
                         "    9 = [\"a\\\"b\", \"two\\nlines\"]\n"
                         "    11 = ref 42\n"
                         "  outputs:\n"
                         "    0 = 1\n"
                         "    1 = \"back\\\\slash\"\n"
                         "host references: 0 made, 0 still open\n");
}

int Program(ScratchProject& p, const wbhost::cli::HostOptions& options, const std::string& file,
            const std::vector<std::string>& inputs) {
    return p.Run([&](std::ostream& out, std::ostream& err) {
        return wbhost::cli::RunProgram(options, file, inputs, out, err);
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
    const std::string found = wbhost::cli::LocateProgram("TIOGenUniqueName.gx", WBT_MODULE_PATH);
    EXPECT_TRUE(std::filesystem::exists(found)) << found;
    EXPECT_NE(found.find("wbtio/private"), std::string::npos);
    EXPECT_EQ(wbhost::cli::LocateProgram("NoSuch.gx", WBT_MODULE_PATH), "NoSuch.gx");
    EXPECT_EQ(wbhost::cli::LocateProgram("./TIOGenUniqueName.gx", WBT_MODULE_PATH),
              "./TIOGenUniqueName.gx");
}

} // namespace
