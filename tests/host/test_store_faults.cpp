// The parameter stores when their file is not a file or may not be touched:
// reads give the defaults, writes fail with their report, and the file or
// device named keeps what it was.
#include <gtest/gtest.h>

#include <filesystem>
#include <string>
#include <vector>

#include <carnet/cstring.h>
#include <carnet/msgbox.h>
#include <carnet/params.h>
#include <carnet/profile.h>
#include <carnet/registry.h>

#include "file/fault_fixture.h"
#include "host/params_internal.h"
#include "platform/store_fixture.h"

using fault_test::Device;
using fault_test::IsDevice;
using fault_test::MakeDevice;
using fault_test::WithoutPrivileges;
using store_test::ReadFile;
using store_test::WriteFile;

namespace {

class StoreFaults : public store_test::StoreTest {
protected:
    void SetUp() override {
        StoreTest::SetUp();
        ASSERT_EQ(::chmod(Dir().c_str(), 0755), 0);
        carnet_params::ForgetLastLocation();
        m_previous = SetMessageBoxHandler([this](CWnd*, const char* text, const char*, unsigned int) {
            m_boxes.push_back(text);
            return IDOK;
        });
    }
    void TearDown() override {
        SetMessageBoxHandler(m_previous);
        StoreTest::TearDown();
    }

    std::vector<std::string> m_boxes;

private:
    MessageBoxHandler m_previous;
};

double StoredRadius(const std::string& location) {
    double value = 0.0;
    GetParamDouble(location.c_str(), "Options_Corrections", "RayonTerre", 6366.0, 6000.0, 7000.0, &value);
    return value;
}

}  // namespace

TEST_F(StoreFaults, ADeviceIsNeitherReadNorReplaced) {
    const struct {
        const char* name;
        Device device;
    } devices[] = {{"null.ini", Device::Null}, {"zero.ini", Device::Zero}, {"full.ini", Device::Full}};
    for (const auto& d : devices) {
        SCOPED_TRACE(d.name);
        const std::string location = Path(d.name);
        if (!MakeDevice(location, d.device)) GTEST_SKIP() << "no device node can be made here";
        // Reading /dev/zero would never end; the default comes at once.
        EXPECT_EQ(StoredRadius(location), 6366.0);
        std::string value = "stale";
        EXPECT_FALSE(ProfileReadString(location.c_str(), "S", "k", value));
        EXPECT_EQ(value, "");
        EXPECT_EQ(ProfileWriteString(location.c_str(), "S", "k", "v"), EINVAL);
        m_boxes.clear();
        EXPECT_EQ(SetParamDouble(location.c_str(), "Options_Corrections", "RayonTerre", 6400.0), 0);
        EXPECT_EQ(m_boxes, std::vector<std::string>{location + " :\nSauvegarde des param\xE8tres imposssible !\n"
                                                               "(Code d'erreur 22)"});
        EXPECT_TRUE(IsDevice(location));
    }
    EXPECT_EQ(store_test::Entries(Dir()), (std::vector<std::string>{"full.ini", "null.ini", "zero.ini"}));
}

TEST_F(StoreFaults, ARegistryRootThatIsNoFileGivesTheDefaultsAtOnce) {
    // A pipe would block the read, /dev/zero never end it.
    std::filesystem::create_directories(RegistryFolder());
    ASSERT_EQ(::mkfifo((RegistryFolder() + "/HKEY_CURRENT_USER.txt").c_str(), 0600), 0);
    ASSERT_EQ(::symlink("/dev/zero", (RegistryFolder() + "/HKEY_USERS.txt").c_str()), 0);
    for (const std::string root : {"HKEY_CURRENT_USER", "HKEY_USERS"}) {
        SCOPED_TRACE(root);
        EXPECT_EQ(StoredRadius(root + "\\Software\\Carnet"), 6366.0);
        EXPECT_EQ(SetParamDouble((root + "\\Software\\Carnet").c_str(), "Options_Corrections", "RayonTerre", 6400.0), 0);
    }
    struct stat st;
    EXPECT_TRUE(::stat((RegistryFolder() + "/HKEY_CURRENT_USER.txt").c_str(), &st) == 0 && S_ISFIFO(st.st_mode));
    EXPECT_TRUE(::lstat((RegistryFolder() + "/HKEY_USERS.txt").c_str(), &st) == 0 && S_ISLNK(st.st_mode));
    EXPECT_TRUE(m_boxes.empty());
}

TEST_F(StoreFaults, StoresThatMayNotBeTouchedKeepTheirBytes) {
    const std::string profile = Path("params.ini");
    const std::string text = "[Options_Corrections]\nRayonTerre=6400.000000\n";
    WriteFile(profile, text);
    ASSERT_EQ(RegistrySetString("HKEY_CURRENT_USER", "Options_Corrections", "RayonTerre", "6400.000000"), 0);
    const std::string registry = RegistryFolder() + "/HKEY_CURRENT_USER.txt";
    const std::string registryText = ReadFile(registry);
    ASSERT_EQ(::chmod(profile.c_str(), 0), 0);
    ASSERT_EQ(::chmod(registry.c_str(), 0), 0);
    ASSERT_EQ(::chmod(RegistryFolder().c_str(), 0755), 0);

    // Unreadable: the defaults. Unwritable: a failure, reported for the
    // profile only, as every registry failure is silent.
    const int failures = WithoutPrivileges([&] {
        int bits = 0;
        if (StoredRadius(profile) != 6366.0) bits |= 1;
        if (StoredRadius("HKEY_CURRENT_USER") != 6366.0) bits |= 2;
        if (SetParamString(profile.c_str(), "Options_Corrections", "RayonTerre", "6500") != 0) bits |= 4;
        if (SetParamString("HKEY_CURRENT_USER", "Options_Corrections", "RayonTerre", "6500") != 0) bits |= 8;
        const std::string report = profile + " :\nSauvegarde des param\xE8tres imposssible !\n(Code d'erreur 13)";
        if (m_boxes != std::vector<std::string>{report}) bits |= 16;
        return bits;
    });
    EXPECT_EQ(failures, 0);
    EXPECT_EQ(ReadFile(profile), text);
    EXPECT_EQ(ReadFile(registry), registryText);
    EXPECT_EQ(store_test::Entries(Dir()), (std::vector<std::string>{"params.ini", "registry"}));
}
