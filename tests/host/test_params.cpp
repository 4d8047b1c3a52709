#include <gtest/gtest.h>

#include <string>
#include <vector>

#include <carnet/cstring.h>
#include <carnet/msgbox.h>
#include <carnet/params.h>
#include <carnet/profile.h>
#include <carnet/registry.h>

#include "host/params_internal.h"
#include "platform/store_fixture.h"

using store_test::ReadFile;
using store_test::WriteFile;

namespace {

// Every box shown is kept; the store starts with no remembered location.
class Params : public store_test::StoreTest {
protected:
    void SetUp() override {
        StoreTest::SetUp();
        carnet_params::ForgetLastLocation();
        m_previous = SetMessageBoxHandler([this](CWnd* owner, const char* text, const char*, unsigned int flags) {
            EXPECT_EQ(owner, nullptr);
            EXPECT_EQ(flags, 0u);
            m_boxes.push_back(text);
            return IDOK;
        });
    }
    void TearDown() override {
        SetMessageBoxHandler(m_previous);
        StoreTest::TearDown();
    }

    // One location of each form.
    std::vector<std::string> BothForms() const {
        return {Path("params.ini"), "HKEY_CURRENT_USER\\Software\\Carnet"};
    }

    std::vector<std::string> m_boxes;

private:
    MessageBoxHandler m_previous;
};

std::string Missing(const std::string& location) {
    return location + " :\nFichier de param\xE8tres inexistant !\n(Code d'erreur 2)";
}

}  // namespace

TEST_F(Params, LocationChoosesTheStore) {
    struct Case {
        std::string location;
        const char *section, *root, *key;
    } cases[] = {
        {"HKEY_CURRENT_USER", "Options_Corrections", "HKEY_CURRENT_USER", "Options_Corrections"},
        {"hkey_current_user\\Software\\Carnet", "Options_Tolerances", "HKEY_CURRENT_USER",
         "Software\\Carnet\\Options_Tolerances"},
        {"HKEY_LOCAL_MACHINE\\Soft", "", "HKEY_LOCAL_MACHINE", "Soft"},
        {"Hkey_Users\\", "Options_Nivellement", "HKEY_USERS", "Options_Nivellement"},
        {"HKEY_CLASSES_ROOT\\A\\B", "S", "HKEY_CLASSES_ROOT", "A\\B\\S"},
        {"HKEY_PERFORMANCE_DATA", "S", "HKEY_PERFORMANCE_DATA", "S"},
        {"HKEY_CURRENT_CONFIG\\C", "S", "HKEY_CURRENT_CONFIG", "C\\S"},
        {"HKEY_DYN_DATA\\D", "S", "HKEY_DYN_DATA", "D\\S"},
    };
    for (const Case& c : cases) {
        ASSERT_NE(SetParamString(c.location.c_str(), c.section, "Projection", "Aucune"), 0) << c.location;
        std::string value;
        EXPECT_EQ(RegistryGetString(c.root, c.key, "Projection", value), 0) << c.location;
        EXPECT_EQ(value, "Aucune");
    }
    // Anything else is a profile file, even when it names a root further on.
    const std::string profile = Path("HKEY_CURRENT_USER.ini");
    ASSERT_NE(SetParamString(profile.c_str(), "Options_Corrections", "Projection", "Aucune"), 0);
    EXPECT_EQ(ReadFile(profile), "[Options_Corrections]\nProjection=Aucune\n");
    EXPECT_TRUE(m_boxes.empty());
}

TEST_F(Params, RegistryWriteWithoutKeyFailsSilently) {
    for (const char* location : {"HKEY_CURRENT_USER", "HKEY_CURRENT_USER\\"}) {
        EXPECT_EQ(SetParamString(location, "", "k", "v"), 0) << location;
        EXPECT_EQ(SetParamString(location, nullptr, "k", "v"), 0) << location;
        EXPECT_EQ(SetParamDouble(location, "", "k", 1.0), 0) << location;
    }
    WriteFile(Path("plain"), "x");
    SetRegistryFolder(Path("plain/registry").c_str());
    EXPECT_EQ(SetParamString("HKEY_CURRENT_USER", "S", "k", "v"), 0);
    CString value;
    EXPECT_EQ(GetParamString("HKEY_CURRENT_USER", "S", "k", "def", &value), 0);
    EXPECT_EQ(value, "def");
    EXPECT_TRUE(m_boxes.empty());
}

TEST_F(Params, NumbersAreClampedDefaultsInBothForms) {
    struct Case {
        const char* stored;  // null: not stored
        int def, min, max;
        int value, result;
    } ints[] = {
        {nullptr, 1, 0, 1, 1, 1},  {"abc", 1, 0, 2, 0, 1},  {"5", 0, 0, 2, 2, 1},
        {"-3", 0, 0, 2, 0, 1},     {" 2 ", 0, 0, 2, 2, 1},  {"", 1, 0, 2, 0, 0},
        {nullptr, 9, 0, 2, 2, 1},  {"1", 0, 3, 2, 2, 1},    {"99999999999999", 0, 0, 2147483647, 2147483647, 1},
    };
    struct DCase {
        const char* stored;
        double def, min, max;
        double value;
        int result;
    } doubles[] = {
        {nullptr, 6366.0, 6000.0, 7000.0, 6366.0, 1}, {"5000", 6366.0, 6000.0, 7000.0, 6000.0, 1},
        {"8000", 6366.0, 6000.0, 7000.0, 7000.0, 1},  {"6500.123", 6366.0, 6000.0, 7000.0, 6500.123, 1},
        {"6500,5", 6366.0, 6000.0, 7000.0, 6500.0, 1}, {"", 0.01, 0.001, 100000.0, 0.001, 0},
        {"1e999", 0.0, -10.0, 10.0, 10.0, 1},         {"nan", 0.5, -1.0, 1.0, 0.0, 1},
    };
    for (const std::string& location : BothForms()) {
        const char* loc = location.c_str();
        for (const Case& c : ints) {
            if (c.stored) {
                ASSERT_NE(SetParamString(loc, "Options_Nivellement", "TypeNivel", c.stored), 0);
            }
            int value = -42;
            EXPECT_EQ(GetParamInt(loc, c.stored ? "Options_Nivellement" : "Absent", "TypeNivel", c.def, c.min,
                                  c.max, &value),
                      c.result)
                << loc << " " << (c.stored ? c.stored : "missing");
            EXPECT_EQ(value, c.value) << loc << " " << (c.stored ? c.stored : "missing");
        }
        for (const DCase& c : doubles) {
            if (c.stored) {
                ASSERT_NE(SetParamString(loc, "Options_Corrections", "RayonTerre", c.stored), 0);
            }
            double value = -42.0;
            EXPECT_EQ(GetParamDouble(loc, c.stored ? "Options_Corrections" : "Absent", "RayonTerre", c.def, c.min,
                                     c.max, &value),
                      c.result)
                << loc << " " << (c.stored ? c.stored : "missing");
            EXPECT_DOUBLE_EQ(value, c.value) << loc << " " << (c.stored ? c.stored : "missing");
        }
    }
    EXPECT_TRUE(m_boxes.empty());
}

TEST_F(Params, TextsAndDoublesAreStoredAsText) {
    for (const std::string& location : BothForms()) {
        const char* loc = location.c_str();
        const bool registry = location.rfind("HKEY_", 0) == 0;
        CString value = "stale";
        // A missing text gives the default; only the registry says it was not read.
        EXPECT_EQ(GetParamString(loc, "Options_Corrections", "Projection", "Aucune", &value), registry ? 0 : 1);
        EXPECT_EQ(value, "Aucune");
        EXPECT_EQ(GetParamString(loc, "Options_Corrections", "Projection", nullptr, &value), registry ? 0 : 1);
        EXPECT_EQ(value, "");

        const CString name("Projection Lambert Zone \xC9t\xE9");
        EXPECT_NE(SetParamString(loc, "Options_Corrections", "Projection", name), 0);
        EXPECT_EQ(GetParamString(loc, "options_corrections", "PROJECTION", "Aucune", &value), 1);
        EXPECT_EQ(value, name);
        EXPECT_NE(SetParamString(loc, "Options_Corrections", "Projection", " Aucune "), 0);
        EXPECT_EQ(GetParamString(loc, "Options_Corrections", "Projection", "x", &value), 1);
        EXPECT_EQ(value, " Aucune ");

        EXPECT_NE(SetParamDouble(loc, "Options_Tolerances", "TolAngles", 0.015), 0);
        EXPECT_NE(SetParamDouble(loc, "Options_Tolerances", "FermAltimetr", -6500.1234567), 0);
        EXPECT_EQ(GetParamString(loc, "Options_Tolerances", "TolAngles", "", &value), 1);
        EXPECT_EQ(value, "0.015000");
        EXPECT_EQ(GetParamString(loc, "Options_Tolerances", "FermAltimetr", "", &value), 1);
        EXPECT_EQ(value, "-6500.123457");
        double d = 0.0;
        EXPECT_EQ(GetParamDouble(loc, "Options_Tolerances", "TolAngles", 0.01, 0.001, 400000.0, &d), 1);
        EXPECT_DOUBLE_EQ(d, 0.015);
        // No place for the result: only the result code.
        EXPECT_EQ(GetParamDouble(loc, "Options_Tolerances", "TolAngles", 0.01, 0.001, 400000.0, nullptr), 1);
        EXPECT_EQ(GetParamInt(loc, "Options_Tolerances", "Absent", 0, 0, 2, nullptr), 1);
        EXPECT_EQ(GetParamString(loc, "Options_Tolerances", "Absent", "d", nullptr), registry ? 0 : 1);
    }
    std::string text;
    EXPECT_TRUE(ProfileReadString(Path("params.ini").c_str(), "Options_Tolerances", "TolAngles", text));
    EXPECT_EQ(text, "0.015000");
    EXPECT_TRUE(m_boxes.empty());
}

TEST_F(Params, NullOrEmptyLocationGivesDefaults) {
    for (const char* location : {static_cast<const char*>(nullptr), ""}) {
        int i = 0;
        EXPECT_EQ(GetParamInt(location, "Options_Corrections", "CorrAuto", 1, 0, 1, &i), 1);
        EXPECT_EQ(i, 1);
        CString text;
        EXPECT_EQ(GetParamString(location, "Options_Corrections", "Projection", "Aucune", &text), 1);
        EXPECT_EQ(text, "Aucune");
    }
}

TEST_F(Params, FailedWriteIsReportedOnceInARow) {
    const std::string missing = Path("missing/params.ini");
    const std::string upper = Path("MISSING/PARAMS.INI");
    EXPECT_EQ(SetParamString(missing.c_str(), "S", "k", "v"), 0);
    EXPECT_EQ(SetParamDouble(missing.c_str(), "S", "k", 1.0), 0);
    EXPECT_EQ(SetParamString(upper.c_str(), "S", "k", CString("v")), 0);  // same location without case
    ASSERT_EQ(m_boxes, std::vector<std::string>{Missing(missing)});

    // Another location in between makes the next failure a new run.
    std::filesystem::create_directory(Path("folder.ini"));
    EXPECT_EQ(SetParamString(Path("folder.ini").c_str(), "S", "k", "v"), 0);
    EXPECT_EQ(SetParamString(missing.c_str(), "S", "k", "v"), 0);
    WriteFile(Path("plain"), "x");
    EXPECT_EQ(SetParamString(Path("plain/p.ini").c_str(), "S", "k", "v"), 0);
    EXPECT_EQ(m_boxes, (std::vector<std::string>{
                           Missing(missing),
                           Path("folder.ini") + " :\nSauvegarde des param\xE8tres imposssible !\n(Code d'erreur 21)",
                           Missing(missing),
                           Path("plain/p.ini") + " :\nFichier de param\xE8tres inexistant !\n(Code d'erreur 20)",
                       }));
}

TEST_F(Params, SuccessSilencesTheNextFailureOnTheSameLocation) {
    const std::string file = Path("params.ini");
    EXPECT_NE(SetParamString(file.c_str(), "S", "k", "v"), 0);
    // The file becomes a folder: writing it now fails.
    std::filesystem::remove(file);
    std::filesystem::create_directory(file);
    EXPECT_EQ(SetParamString(file.c_str(), "S", "k", "v"), 0);
    EXPECT_TRUE(m_boxes.empty());
    EXPECT_EQ(SetParamString(Path("missing/p.ini").c_str(), "S", "k", "v"), 0);
    EXPECT_EQ(SetParamString(file.c_str(), "S", "k", "v"), 0);
    EXPECT_EQ(m_boxes.size(), 2u);
    // A registry write changes nothing in the reports.
    EXPECT_NE(SetParamString("HKEY_CURRENT_USER", "S", "k", "v"), 0);
    EXPECT_EQ(SetParamString(file.c_str(), "S", "k", "v"), 0);
    EXPECT_EQ(m_boxes.size(), 2u);
}

TEST_F(Params, NamelessLocationsAreReportedAfterAnotherOne) {
    // At start the remembered location is empty: a nameless failure is silent.
    EXPECT_EQ(SetParamString(nullptr, "S", "k", "v"), 0);
    EXPECT_EQ(SetParamString("", "S", "k", "v"), 0);
    EXPECT_TRUE(m_boxes.empty());

    const std::string missing = Path("missing/p.ini");
    EXPECT_EQ(SetParamString(missing.c_str(), "S", "k", "v"), 0);
    EXPECT_EQ(SetParamString(nullptr, "S", "k", "v"), 0);
    EXPECT_EQ(SetParamString("", "S", "k", "v"), 0);  // the same empty text: silent
    EXPECT_EQ(SetParamString(missing.c_str(), "S", "k", "v"), 0);
    EXPECT_EQ(SetParamString("", "S", "k", "v"), 0);
    EXPECT_EQ(m_boxes, (std::vector<std::string>{
                           Missing(missing),
                           "Pointeur nul pour le fichier de param\xE8tres !\n(Code d'erreur 2)",
                           Missing(missing),
                           "Pas de nom pour le fichier de param\xE8tres !\n(Code d'erreur 2)",
                       }));
}
