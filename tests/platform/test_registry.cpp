#include <gtest/gtest.h>

#include <carnet/registry.h>

#include "platform/store_fixture.h"

using store_test::Entries;
using store_test::ReadFile;
using store_test::StoreTest;
using store_test::WriteFile;

namespace {

class Registry : public StoreTest {};

std::string Get(const char* root, const char* key, const char* name, int expectedCode = 0) {
    std::string value = "stale";
    EXPECT_EQ(RegistryGetString(root, key, name, value), expectedCode) << root << "\\" << key << " " << name;
    return value;
}

}  // namespace

TEST_F(Registry, ValuesReadBackExactly) {
    const std::string values[] = {
        "",
        "plain text",
        "with \"quotes\", \\ backslash, = [ ] and %41",
        std::string("\xE9\xFF\x80\x01\t\x7F", 6),
        "two\nlines\r\nand\rmore",
        "  surrounding blanks  ",
        "\"quoted\"",
    };
    int n = 0;
    for (const std::string& v : values) {
        const std::string name = "v" + std::to_string(n++) + " [=\"%\xE9]";
        ASSERT_EQ(RegistrySetString("HKEY_CURRENT_USER", "Software\\Odd ] [ \"key\"\\\xE9t\xE9", name.c_str(),
                                    v.c_str()), 0);
        EXPECT_EQ(Get("HKEY_CURRENT_USER", "Software\\Odd ] [ \"key\"\\\xE9t\xE9", name.c_str()), v);
    }
    // Every value is still there after the later writes.
    n = 0;
    for (const std::string& v : values) {
        const std::string name = "v" + std::to_string(n++) + " [=\"%\xE9]";
        EXPECT_EQ(Get("HKEY_CURRENT_USER", "Software\\Odd ] [ \"key\"\\\xE9t\xE9", name.c_str()), v);
    }
    // The file holds one line per key and per value, in printable ASCII.
    const std::string text = ReadFile(Path("registry/HKEY_CURRENT_USER.txt"));
    EXPECT_EQ(std::count(text.begin(), text.end(), '\n'), 1 + n);
    for (char c : text) EXPECT_TRUE(c == '\n' || (c >= 0x20 && c < 0x7F)) << int(c);
}

TEST_F(Registry, NamesMatchWithoutCase) {
    ASSERT_EQ(RegistrySetString("HKEY_CURRENT_USER", "Software\\Carnet\\Options_\xC9t\xE9", "RayonTerre", "6366"), 0);
    struct Case {
        const char *root, *key, *name;
    } same[] = {
        {"HKEY_CURRENT_USER", "Software\\Carnet\\Options_\xC9t\xE9", "RayonTerre"},
        {"hkey_current_user", "SOFTWARE\\carnet\\options_\xE9T\xC9", "rayonterre"},
        {"HKEY_CURRENT_USER", "Software\\\\Carnet\\Options_\xC9t\xE9\\", "RAYONTERRE"},
    };
    for (const Case& c : same) EXPECT_EQ(Get(c.root, c.key, c.name), "6366") << c.key;
    // Rewriting through another spelling changes the one value.
    ASSERT_EQ(RegistrySetString("hkey_current_user", "software\\CARNET\\options_\xC9t\xE9", "RAYONTERRE", "6400"), 0);
    EXPECT_EQ(Get("HKEY_CURRENT_USER", "Software\\Carnet\\Options_\xC9t\xE9", "RayonTerre"), "6400");
    EXPECT_EQ(ReadFile(Path("registry/HKEY_CURRENT_USER.txt")),
              "[Software\\Carnet\\Options_%C9t%E9]\n\"RayonTerre\"=\"6400\"\n");
}

TEST_F(Registry, MissingRootKeyOrValueReadsAsNotFound) {
    Get("HKEY_CURRENT_USER", "Software\\Carnet", "k", ENOENT);
    ASSERT_EQ(RegistrySetString("HKEY_CURRENT_USER", "Software\\Carnet", "k", "1"), 0);
    struct Case {
        const char *root, *key, *name;
    } missing[] = {
        {"HKEY_LOCAL_MACHINE", "Software\\Carnet", "k"},  // another root
        {"HKEY_CURRENT_USER", "Software\\Carne", "k"},
        {"HKEY_CURRENT_USER", "Software", "k"},
        {"HKEY_CURRENT_USER", "Software\\Carnet\\Sub", "k"},
        {"HKEY_CURRENT_USER", "Software\\Carnet", "k2"},
        {"HKEY_CURRENT_USER", "", "k"},
    };
    for (const Case& c : missing) EXPECT_EQ(Get(c.root, c.key, c.name, ENOENT), "") << c.root << " " << c.key;
    // The root itself holds values too (an empty key path).
    ASSERT_EQ(RegistrySetString("HKEY_CURRENT_USER", "", "top", "t"), 0);
    EXPECT_EQ(Get("HKEY_CURRENT_USER", nullptr, "TOP"), "t");
}

TEST_F(Registry, EachRootIsItsOwnFile) {
    ASSERT_EQ(RegistrySetString("HKEY_CURRENT_USER", "K", "v", "user"), 0);
    ASSERT_EQ(RegistrySetString("hkey_local_machine", "K", "v", "machine"), 0);
    EXPECT_EQ(Get("HKEY_CURRENT_USER", "K", "v"), "user");
    EXPECT_EQ(Get("HKEY_LOCAL_MACHINE", "K", "v"), "machine");
    EXPECT_EQ(Entries(Path("registry")),
              (std::vector<std::string>{"HKEY_CURRENT_USER.txt", "HKEY_LOCAL_MACHINE.txt"}));
    // Only plain names: nothing can be read or written outside the folder.
    for (const char* root : {"", "../HKEY_CURRENT_USER", "a/b", ".", "HKEY CURRENT USER"}) {
        std::string value;
        EXPECT_EQ(RegistrySetString(root, "K", "v", "x"), EINVAL) << root;
        EXPECT_EQ(RegistryGetString(root, "K", "v", value), EINVAL) << root;
    }
    EXPECT_EQ(RegistrySetString(nullptr, "K", "v", "x"), EINVAL);
    EXPECT_EQ(Entries(Dir()), std::vector<std::string>{"registry"});
}

TEST_F(Registry, DefaultFolderFollowsTheEnvironment) {
    SetRegistryFolder(nullptr);
    ::setenv("XDG_CONFIG_HOME", Path("config").c_str(), 1);
    EXPECT_EQ(RegistryFolder(), Path("config") + "/carnet/registry");
    ::setenv("XDG_CONFIG_HOME", "relative/config", 1);
    EXPECT_EQ(RegistryFolder(), Path("home") + "/.config/carnet/registry");
    ::unsetenv("XDG_CONFIG_HOME");
    EXPECT_EQ(RegistryFolder(), Path("home") + "/.config/carnet/registry");
    // The folder is made on the first write.
    ASSERT_EQ(RegistrySetString("HKEY_CURRENT_USER", "K", "v", "x"), 0);
    EXPECT_EQ(ReadFile(Path("home/.config/carnet/registry/HKEY_CURRENT_USER.txt")), "[K]\n\"v\"=\"x\"\n");
    SetRegistryFolder(Path("chosen").c_str());
    EXPECT_EQ(RegistryFolder(), Path("chosen"));
    SetRegistryFolder("");
    EXPECT_EQ(RegistryFolder(), Path("home") + "/.config/carnet/registry");
}

TEST_F(Registry, ForeignLinesAreSkippedAndFirstNamesWin) {
    std::filesystem::create_directory(Path("registry"));
    WriteFile(Path("registry/HKEY_USERS.txt"),
              "\"orphan\"=\"1\"\r\n; note\r\n[A]\r\n\"v\"=\"first\"\r\n\"V\"=\"second\"\r\nrubbish\r\n\"w\"=unquoted\r\n"
              "\"x\"=\"%4\"\r\n[a]\r\n\"y\"=\"%41%zz\"\r\n");
    EXPECT_EQ(Get("HKEY_USERS", "A", "v"), "first");
    EXPECT_EQ(Get("HKEY_USERS", "A", "x"), "%4");
    EXPECT_EQ(Get("HKEY_USERS", "a", "y"), "A%zz");
    Get("HKEY_USERS", "A", "w", ENOENT);
    Get("HKEY_USERS", "", "orphan", ENOENT);
}

TEST_F(Registry, InterruptedWriteLeavesThePreviousFile) {
    std::string big(6000, 'b');
    ASSERT_EQ(RegistrySetString("HKEY_CURRENT_USER", "K", "big", big.c_str()), 0);
    const std::string before = ReadFile(Path("registry/HKEY_CURRENT_USER.txt"));
    int err = store_test::WithFileSizeLimit(4096, [] {
        return RegistrySetString("HKEY_CURRENT_USER", "K", "new", "value");
    });
    EXPECT_EQ(err, EFBIG);
    EXPECT_EQ(ReadFile(Path("registry/HKEY_CURRENT_USER.txt")), before);
    EXPECT_EQ(Entries(Path("registry")), std::vector<std::string>{"HKEY_CURRENT_USER.txt"});
    EXPECT_EQ(Get("HKEY_CURRENT_USER", "K", "big"), big);
}
