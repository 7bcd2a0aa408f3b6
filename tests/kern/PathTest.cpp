// Path texts: joining, the trailing separator and the Windows long-path form.
#include "kern/Path.h"

#include "kern/exception/Exception.h"

#include <gtest/gtest.h>

using qv::kern::AddTrailingSeparator;
using qv::kern::JoinPath;
using qv::kern::ToLongPathForm;
using qv::kern::exception::InvalidArgument;

TEST(Path, JoinsAndEndsWithOneSeparatorOnlyWhereMissing) {
    EXPECT_EQ(JoinPath("/opt/wb", "wbtio"), "/opt/wb/wbtio");
    EXPECT_EQ(JoinPath("/opt/wb/", "wbtio"), "/opt/wb/wbtio");
    EXPECT_EQ(JoinPath("", "wbtio"), "wbtio");
    EXPECT_EQ(JoinPath("/opt", ""), "/opt");
    EXPECT_EQ(JoinPath("/opt", "/etc/x"), "/etc/x");
    EXPECT_EQ(AddTrailingSeparator("/opt/wb"), "/opt/wb/");
    EXPECT_EQ(AddTrailingSeparator("/opt/wb/"), "/opt/wb/");
    EXPECT_EQ(AddTrailingSeparator("/"), "/");
    EXPECT_THROW(AddTrailingSeparator(""), InvalidArgument);
}

TEST(Path, LongFormOfDriveNetworkAndRelativePathsLeavingPrefixedAndEmptyOnesAlone) {
    const std::u16string_view cwd = u"C:\\work\\proj";
    EXPECT_EQ(ToLongPathForm(u"D:\\a\\b\\..\\c.gx", cwd), u"\\\\?\\D:\\a\\c.gx");
    EXPECT_EQ(ToLongPathForm(u"//server/share/dir/name.gx", cwd),
              u"\\\\?\\UNC\\server\\share\\dir\\name.gx");
    // ".." never climbs above the share or the drive.
    EXPECT_EQ(ToLongPathForm(u"\\\\server\\share\\..\\..\\x", cwd),
              u"\\\\?\\UNC\\server\\share\\x");
    EXPECT_EQ(ToLongPathForm(u"C:\\..\\..\\x", cwd), u"\\\\?\\C:\\x");
    EXPECT_EQ(ToLongPathForm(u"C:/a/./b//c/", cwd), u"\\\\?\\C:\\a\\b\\c\\");
    EXPECT_EQ(ToLongPathForm(u"C:\\a\\..", cwd), u"\\\\?\\C:\\");
    // Relative paths resolve against the current directory.
    EXPECT_EQ(ToLongPathForm(u"sub\\x.gx", cwd), u"\\\\?\\C:\\work\\proj\\sub\\x.gx");
    EXPECT_EQ(ToLongPathForm(u"..\\x.gx", cwd), u"\\\\?\\C:\\work\\x.gx");
    EXPECT_EQ(ToLongPathForm(u".", cwd), u"\\\\?\\C:\\work\\proj");
    EXPECT_EQ(ToLongPathForm(u"\\top\\x", cwd), u"\\\\?\\C:\\top\\x");
    EXPECT_EQ(ToLongPathForm(u"c:x", cwd), u"\\\\?\\C:\\work\\proj\\x");
    EXPECT_EQ(ToLongPathForm(u"E:x", cwd), u"\\\\?\\E:\\x");
    EXPECT_EQ(ToLongPathForm(u"x", u"\\\\srv\\share\\d"), u"\\\\?\\UNC\\srv\\share\\d\\x");
    EXPECT_EQ(ToLongPathForm(u"\\x", u"\\\\srv\\share\\d"), u"\\\\?\\UNC\\srv\\share\\x");
    EXPECT_THROW(ToLongPathForm(u"x", u"relative\\dir"), InvalidArgument);
    EXPECT_EQ(ToLongPathForm(u"\\\\?\\C:\\a\\..\\b", u"C:\\"), u"\\\\?\\C:\\a\\..\\b");
    EXPECT_EQ(ToLongPathForm(u"\\\\.\\COM1", u"C:\\"), u"\\\\.\\COM1");
    EXPECT_EQ(ToLongPathForm(u"", u"C:\\"), u"");
}
