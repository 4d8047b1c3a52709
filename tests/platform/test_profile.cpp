#include <gtest/gtest.h>

#include <sys/stat.h>

#include <carnet/profile.h>

#include "platform/store_fixture.h"

using store_test::Entries;
using store_test::ReadFile;
using store_test::StoreTest;
using store_test::WriteFile;

namespace {

std::string Joined(const std::vector<std::string>& lines, const std::string& eol) {
    std::string text;
    for (const std::string& line : lines) text += line + eol;
    return text;
}

class Profile : public StoreTest {};

}  // namespace

TEST_F(Profile, ReadsEntriesWhateverTheLineEnds) {
    const std::vector<std::string> lines = {
        "; settings",
        "[ Options_Corrections ]",
        "  RayonTerre =  6366.5  ",
        "Projection = \"Projection Lambert Zone I\"",
        "Single='a b'",
        "Mixed=\"abc'",
        "Empty=",
        "Dup=first",
        "dup=second",
        "Eq=a=b",
        "NoEquals",
        "[options_corrections]",
        "Other=x",
        "[Accents\xE9]",
        "Cl\xE9=\xE9t\xE9",
    };
    struct Case {
        const char *section, *key;
        bool found;
        const char* value;
    } cases[] = {
        {"options_corrections", "RAYONTERRE", true, "6366.5"},
        {" Options_Corrections ", " RayonTerre ", true, "6366.5"},
        {"Options_Corrections", "Projection", true, "Projection Lambert Zone I"},
        {"Options_Corrections", "Single", true, "a b"},
        {"Options_Corrections", "Mixed", true, "\"abc'"},
        {"Options_Corrections", "Empty", true, ""},
        {"Options_Corrections", "DUP", true, "first"},
        {"Options_Corrections", "Eq", true, "a=b"},
        {"Options_Corrections", "NoEquals", false, ""},
        {"Options_Corrections", "Other", false, ""},
        {"Options_Corrections", "; settings", false, ""},
        {"ACCENTS\xC9", "CL\xC9", true, "\xE9t\xE9"},
        {"Missing", "RayonTerre", false, ""},
    };
    for (const char* eol : {"\n", "\r\n", "\r"}) {
        const std::string file = Path("read.ini");
        WriteFile(file, Joined(lines, eol));
        for (const Case& c : cases) {
            std::string value = "stale";
            EXPECT_EQ(ProfileReadString(file.c_str(), c.section, c.key, value), c.found)
                << c.section << "/" << c.key << " eol " << int(eol[0]) << int(eol[1]);
            EXPECT_EQ(value, c.value) << c.section << "/" << c.key;
        }
    }
    // The last line without a line end is read whole.
    WriteFile(Path("tail.ini"), "[S]\nk=last");
    std::string value;
    EXPECT_TRUE(ProfileReadString(Path("tail.ini").c_str(), "S", "k", value));
    EXPECT_EQ(value, "last");
}

TEST_F(Profile, MissingFileOrNameGivesNothing) {
    std::string value = "stale";
    EXPECT_FALSE(ProfileReadString(Path("absent.ini").c_str(), "S", "k", value));
    EXPECT_EQ(value, "");
    EXPECT_FALSE(ProfileReadString(nullptr, "S", "k", value));
    EXPECT_FALSE(ProfileReadString("", "S", "k", value));
    EXPECT_FALSE(ProfileReadString(Dir().c_str(), "S", "k", value));
}

TEST_F(Profile, WriteChangesOnlyTheAffectedLine) {
    struct Case {
        const char* name;
        std::string before;
        const char *section, *key, *value;
        std::string after;
    } cases[] = {
        {"value replaced in place", "[S]\r\n  k = old  \r\nz=1\r\n", "S", "k", "new",
         "[S]\r\n  k = new  \r\nz=1\r\n"},
        {"names matched without case", "[Sec]\nKey=1\n", "SEC", "key", "2", "[Sec]\nKey=2\n"},
        {"first duplicate changed", "[A]\nk=1\nk=2\n[a]\nk=3\n", "a", "K", "9", "[A]\nk=9\nk=2\n[a]\nk=3\n"},
        {"new key after the last entry", "[A]\nx=1\n\n; about B\n[B]\ny=2\n", "A", "k", "v",
         "[A]\nx=1\nk=v\n\n; about B\n[B]\ny=2\n"},
        {"new key in an empty section", "[A]\n[B]\n", "A", "k", "v", "[A]\nk=v\n[B]\n"},
        {"new key after a last line without line end", "[A]\nx=1", "A", "k", "v", "[A]\nx=1\nk=v\n"},
        {"new section at the end", "[A]\nx=1", "B", "k", "v", "[A]\nx=1\n[B]\nk=v\n"},
        {"CRLF kept for new lines", "[A]\r\nx=1\r\n", "B", "k", "v", "[A]\r\nx=1\r\n[B]\r\nk=v\r\n"},
        {"CR kept for new lines", "[A]\rx=1\r", "A", "k", "v", "[A]\rx=1\rk=v\r"},
        {"other bytes kept", "\xEF;x\n[A]\n\xE9=\xFF\x80 \t\nk=1\n", "A", "k", "2",
         "\xEF;x\n[A]\n\xE9=\xFF\x80 \t\nk=2\n"},
        {"quoted old value replaced", "[A]\nk=\"a b\"\n", "A", "k", "c", "[A]\nk=c\n"},
        {"surrounding blanks quoted", "", "A", "k", " padded ", "[A]\nk=\" padded \"\n"},
        {"quotes at both ends quoted", "[A]\n", "A", "k", "'q'", "[A]\nk=\"'q'\"\n"},
        {"names written trimmed", "", " A ", " k ", "v", "[A]\nk=v\n"},
    };
    for (const Case& c : cases) {
        const std::string file = Path("write.ini");
        std::remove(file.c_str());
        if (!c.before.empty()) WriteFile(file, c.before);
        EXPECT_EQ(ProfileWriteString(file.c_str(), c.section, c.key, c.value), 0) << c.name;
        EXPECT_EQ(ReadFile(file), c.after) << c.name;
    }
}

TEST_F(Profile, WrittenValuesReadBackExactly) {
    const std::string file = Path("round.ini");
    const char* values[] = {"", " a ", "\"x\"", "'y'", "\"z'", "\xE9\xE8\xFF", "a=b;c [d]", "6366.000000", "\t"};
    int n = 0;
    for (const char* v : values) {
        std::string key = "k" + std::to_string(n++);
        ASSERT_EQ(ProfileWriteString(file.c_str(), "S", key.c_str(), v), 0) << v;
        ASSERT_EQ(ProfileWriteString(file.c_str(), "S", key.c_str(), v), 0) << v;  // rewrite in place
        std::string back;
        EXPECT_TRUE(ProfileReadString(file.c_str(), "S", key.c_str(), back));
        EXPECT_EQ(back, v);
    }
    // A null value is an empty text, not a deletion.
    EXPECT_EQ(ProfileWriteString(file.c_str(), "S", "k0", nullptr), 0);
    std::string back = "stale";
    EXPECT_TRUE(ProfileReadString(file.c_str(), "S", "k0", back));
    EXPECT_EQ(back, "");
}

TEST_F(Profile, RefusesWhatNoLineCouldHold) {
    const std::string file = Path("guard.ini");
    const std::string before = "[S]\nk=1\n";
    WriteFile(file, before);
    struct Case {
        const char *section, *key, *value;
    } cases[] = {
        {"S", "k", "two\nlines"}, {"S", "k", "cr\rhere"}, {"S", "a=b", "v"}, {"S[x]", "k", "v"},
        {"S", "", "v"},           {"", "k", "v"},         {"S", nullptr, "v"}, {"S", "[k", "v"},
        {"S", ";k", "v"},         {"S\n[T]", "k", "v"},
    };
    for (const Case& c : cases) {
        EXPECT_EQ(ProfileWriteString(file.c_str(), c.section, c.key, c.value), EINVAL)
            << (c.section ? c.section : "null") << "/" << (c.key ? c.key : "null");
        EXPECT_EQ(ReadFile(file), before);
    }
}

TEST_F(Profile, FailuresGiveTheSystemErrorCode) {
    WriteFile(Path("plain"), "x");
    std::filesystem::create_directory(Path("folder.ini"));
    EXPECT_EQ(ProfileWriteString(Path("missing/p.ini").c_str(), "S", "k", "v"), ENOENT);
    EXPECT_EQ(ProfileWriteString(Path("plain/p.ini").c_str(), "S", "k", "v"), ENOTDIR);
    EXPECT_EQ(ProfileWriteString(Path("folder.ini").c_str(), "S", "k", "v"), EISDIR);
    EXPECT_EQ(ProfileWriteString("", "S", "k", "v"), ENOENT);
    EXPECT_EQ(ProfileWriteString(nullptr, "S", "k", "v"), ENOENT);
    EXPECT_EQ(Entries(Dir()), (std::vector<std::string>{"folder.ini", "plain"}));
}

TEST_F(Profile, InterruptedWriteLeavesThePreviousFile) {
    const std::string file = Path("big.ini");
    std::string before = "[S]\n";
    for (int i = 0; i < 200; ++i) before += "key" + std::to_string(i) + "=" + std::string(40, 'a') + "\n";
    WriteFile(file, before);
    // The new content cannot be written whole: the write stops with EFBIG.
    int err = store_test::WithFileSizeLimit(4096, [&] {
        return ProfileWriteString(file.c_str(), "S", "key0", "changed");
    });
    EXPECT_EQ(err, EFBIG);
    EXPECT_EQ(ReadFile(file), before);
    EXPECT_EQ(Entries(Dir()), std::vector<std::string>{"big.ini"});
}

TEST_F(Profile, ReplacementKeepsModeAndSymbolicLinks) {
    const std::string file = Path("target.ini"), link = Path("link.ini");
    WriteFile(file, "[S]\nk=1\n");
    ASSERT_EQ(::chmod(file.c_str(), 0640), 0);
    std::filesystem::create_symlink(file, link);
    EXPECT_EQ(ProfileWriteString(link.c_str(), "S", "k", "2"), 0);
    EXPECT_TRUE(std::filesystem::is_symlink(link));
    EXPECT_EQ(ReadFile(file), "[S]\nk=2\n");
    struct stat st;
    ASSERT_EQ(::stat(file.c_str(), &st), 0);
    EXPECT_EQ(st.st_mode & 07777, 0640u);
    EXPECT_EQ(Entries(Dir()), (std::vector<std::string>{"link.ini", "target.ini"}));
}

TEST_F(Profile, RelativeNamesAreInTheCurrentFolder) {
    const std::filesystem::path before = std::filesystem::current_path();
    std::filesystem::current_path(Dir());
    int err = ProfileWriteString("relative.ini", "S", "k", "v");
    std::string value;
    bool found = ProfileReadString("relative.ini", "S", "k", value);
    std::filesystem::current_path(before);
    EXPECT_EQ(err, 0);
    EXPECT_TRUE(found);
    EXPECT_EQ(ReadFile(Path("relative.ini")), "[S]\nk=v\n");
}
