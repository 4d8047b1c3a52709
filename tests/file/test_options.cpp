#include <gtest/gtest.h>

#include <string>
#include <vector>

#include <carnet/carnet.h>

#include "save_fixture.h"

using save_test::OptionLine;
using save_test::Written;
using store_test::ReadFile;
using store_test::WriteFile;

namespace {

class Options : public save_test::BookFileTest {
protected:
    std::string OptionsOf(const std::string& location) {
        CCarnet book;
        book.m_ParamFile = location;
        return Written([&](std::FILE* f) { book.WriteOptions(f); });
    }

    // Reads one line into an empty book with the location; returns what the
    // line stored there, as the profile file holds it.
    std::string Read(const std::string& location, const char* line, int bAppend = 0) {
        CCarnet book;
        book.m_ParamFile = location;
        int index = 0;
        EXPECT_EQ(book.ReadLine(&m_wnd, line, index, bAppend), nullptr);
        EXPECT_EQ(book.length(), 0);
        EXPECT_EQ(index, 0);
        return ReadFile(location);
    }

    CNorvexTxtWnd m_wnd;
};

const std::string kDefaults = OptionLine("Option_Correc", 18, "  1  0.0  0.0  0.000  0.000  0.000  6366.000") +
                              OptionLine("Option_Projec", 20, "Aucune") +
                              OptionLine("Option_Nivell", 18, "  0  0  0.010") +
                              OptionLine("Option_Planim", 18, "  0  0.010  0.010  0.010  0.010  0.010 0.010 0");

}  // namespace

TEST_F(Options, WrittenFromTheStoreWithDefaultsAndClampedValues) {
    ASSERT_EQ(kDefaults.substr(0, 55), std::string(8, ' ') + "Option_Correc" + std::string(23, ' ') + "1  0.0  0.0");
    for (const std::string& location : {std::string(), Path("missing.ini"), std::string("HKEY_CURRENT_USER\\None")})
        EXPECT_EQ(OptionsOf(location), kDefaults) << location;

    const struct {
        const char* profile;
        const char* written[4];
    } cases[] = {
        {"[Options_Corrections]\nCorrAuto=0\nAlterLineaire=-6.44\nCorrNivZero=2.46\nAbsiMoyenne=601250.1234\n"
         "OrdoMoyenne=2428760\nAltiMoyenne=-12.5\nRayonTerre=6500.123\nProjection=Projection Lambert Zone II\n"
         "[Options_Nivellement]\nTypeTolerance=2\nTypeNivel=1\nFermAltimetr=0.015\n"
         "[Options_Tolerances]\nTypeTolerance=1\nTolAngles=0.005\nTolDistances=0.02\nTolAltitudes=0.03\n"
         "FermAngulaire=0.04\nFermPlanimetr=0.05\nFermAltimetr=0.06\nTypeCanevas=3\n",
         {"  0  -6.4  2.5  601250.123  2428760.000  -12.500  6500.123", "Projection Lambert Zone II", "  2  1  0.015",
          "  1  0.005  0.020  0.030  0.040  0.050 0.060 3"}},
        // Each value beyond its range, on either side, or no number at all.
        {"[Options_Corrections]\nCorrAuto=5\nAlterLineaire=-200000\nCorrNivZero=200000\nAbsiMoyenne=-1\n"
         "OrdoMoyenne=1e9\nAltiMoyenne=20000\nRayonTerre=8000\n"
         "[Options_Nivellement]\nTypeTolerance=-3\nTypeNivel=7\nFermAltimetr=0\n"
         "[Options_Tolerances]\nTypeTolerance=9\nTolAngles=500000\nTolDistances=0.0001\nTolAltitudes=abc\n"
         "FermAngulaire=-1\nFermPlanimetr=200000\nFermAltimetr=100000.5\nTypeCanevas=4\n",
         {"  1  -100000.0  100000.0  0.000  90000000.000  10000.000  7000.000", "Aucune", "  0  2  0.001",
          "  2  400000.000  0.001  0.001  0.001  100000.000 100000.000 3"}},
    };
    for (const auto& c : cases) {
        WriteFile(Path("params.ini"), c.profile);
        EXPECT_EQ(OptionsOf(Path("params.ini")),
                  OptionLine("Option_Correc", 18, c.written[0]) + OptionLine("Option_Projec", 20, c.written[1]) +
                      OptionLine("Option_Nivell", 18, c.written[2]) + OptionLine("Option_Planim", 18, c.written[3]));
    }
    EXPECT_TRUE(m_boxes.boxes.empty());
}

TEST_F(Options, EachKeywordStoresItsValuesInOrder) {
    const struct {
        const char *line, *stored;
    } cases[] = {
        // Words stored as texts stay as they stand, numbers or not.
        {"Option_Correc 1 -6.4 x 601250.000 2428760 152.000 6366.000",
         "[Options_Corrections]\nCorrAuto=1\nAlterLineaire=-6.4\nCorrNivZero=x\nAbsiMoyenne=601250.000\n"
         "OrdoMoyenne=2428760\nAltiMoyenne=152.000\nRayonTerre=6366.000\n"},
        {"Cal_Cor 2 600000 2200000 150 6366",
         "[Options_Corrections]\nCorrAuto=0\nProjection=Projection Lambert Zone III\nAbsiMoyenne=600000\n"
         "OrdoMoyenne=2200000\nAltiMoyenne=150\nRayonTerre=6366\n"},
        // Tenths: both corrections take ten times the first word.
        {"Cor_Dist 1.5 3", "[Options_Corrections]\nAlterLineaire=15.000000\nCorrNivZero=15.000000\n"},
        {"Option_Projec Projection  Lambert \xE9tendue ",
         "[Options_Corrections]\nProjection=Projection  Lambert \xE9tendue\n"},
        {"Option_Nivell 1 2 0.0155", "[Options_Nivellement]\nTypeTolerance=1\nTypeNivel=2\nFermAltimetr=0.015500\n"},
        // Thousandths.
        {"Tol_Niv 1 2 15", "[Options_Nivellement]\nTypeTolerance=1\nTypeNivel=2\nFermAltimetr=0.015000\n"},
        {"Option_Planim 1 0.005 0.010 0.020 0.015 0.050 0.020 2",
         "[Options_Tolerances]\nTypeTolerance=1\nTolAngles=0.005\nTolDistances=0.010\nTolAltitudes=0.020\n"
         "FermAngulaire=0.015\nFermPlanimetr=0.050\nFermAltimetr=0.020\nTypeCanevas=2\n"},
        {"Tol_Poly 2 3", "[Options_Tolerances]\nTypeTolerance=2\nTypeCanevas=3\n"},
        {"Tol_Pers 5 10 20 15 50 20",
         "[Options_Tolerances]\nTolAngles=0.005000\nTolDistances=0.010000\nTolAltitudes=0.020000\n"
         "FermAngulaire=0.015000\nFermPlanimetr=0.050000\nFermAltimetr=0.020000\n"},
    };
    int n = 0;
    for (const auto& c : cases) EXPECT_EQ(Read(Path(std::to_string(n++) + ".ini"), c.line), c.stored) << c.line;

    // The zone of an older corrections line names the projection.
    const struct {
        const char *zone, *projection;
    } zones[] = {{"0", "Projection Lambert Zone I"}, {"1", "Projection Lambert Zone II"},
                 {"3", "Projection Lambert Zone IV"}, {"7", "Aucune"}, {"-1", "Aucune"}, {"99999999999", "Aucune"}};
    for (const auto& z : zones) {
        const std::string line = "Cal_Cor " + std::string(z.zone) + " 1 2 3 4";
        Read(Path("zone.ini"), line.c_str());
        EXPECT_EQ(save_test::Stored(Path("zone.ini"), "Options_Corrections", "Projection"), z.projection) << z.zone;
    }
    // The registry form stores the same values.
    const std::string key = "HKEY_CURRENT_USER\\Software\\Carnet";
    Read(key, "Tol_Niv 1 2 15");
    EXPECT_EQ(save_test::Stored(key, "Options_Nivellement", "FermAltimetr"), "0.015000");
    EXPECT_TRUE(m_wnd.Texts().empty());
    EXPECT_TRUE(m_boxes.boxes.empty());
}

TEST_F(Options, WrongCountsAndAppendModeAreReportedAndStoreNothing) {
    const struct {
        const char* line;
        int bAppend;
        const char* message;
    } cases[] = {
        {"Option_Correc 1 0 0 0 0 0", 0, "la commande <Option_Correc> n'a pas le bon nombre de param\xE8tres !"},
        {"Option_Correc 1 0 0 0 0 0 0 0", 0, "la commande <Option_Correc> n'a pas le bon nombre de param\xE8tres !"},
        {"Cal_Cor 2 600000 2200000 150", 0, "la commande <Cal_Cor> n'a pas le bon nombre de param\xE8tres !"},
        {"Cor_Dist 1", 0, "la commande <Cor_Dist> n'a pas le bon nombre de param\xE8tres !"},
        {"   Option_Projec   ", 0, "la commande <Option_Projec> n'a pas le bon nombre de param\xE8tres !"},
        {"Option_Nivell 1 2", 0, "la commande <Option_Nivell> n'a pas le bon nombre de param\xE8tres !"},
        {"Tol_Niv 1 2 15 4", 0, "la commande <Tol_Niv> n'a pas le bon nombre de param\xE8tres !"},
        {"Option_Planim 1 0.005 0.010 0.020 0.015 0.050 0.020", 0,
         "la commande <Option_Planim> n'a pas le bon nombre de param\xE8tres !"},
        {"Tol_Poly 2", 0, "la commande <Tol_Poly> n'a pas le bon nombre de param\xE8tres !"},
        {"Tol_Pers 5 10 20 15 50", 0, "la commande <Tol_Pers> n'a pas le bon nombre de param\xE8tres !"},
        // No option line while appending; unknown keywords stay unknown.
        {"Option_Projec Projection Lambert Zone II", 1, "commande <Option_Projec> incorrecte !"},
        {"Tol_Pers 5 10 20 15 50 20", 2, "commande <Tol_Pers> incorrecte !"},
        {"option_projec Aucune", 0, "commande <option_projec> incorrecte !"},
    };
    for (const auto& c : cases) {
        m_wnd.Clear();
        EXPECT_EQ(Read(Path("params.ini"), c.line, c.bAppend), "") << c.line;
        EXPECT_EQ(m_wnd.Texts(), (std::vector<std::string>{"Erreur ligne 1 : " + std::string(c.message),
                                                            " (" + std::string(c.line) + ")"}));
    }
    EXPECT_TRUE(m_boxes.boxes.empty());
}

TEST_F(Options, WrittenOptionsReadBackToTheSameLines) {
    WriteFile(Path("params.ini"),
              "[Options_Corrections]\nAlterLineaire=-6.44\nRayonTerre=6371.0006\n"
              "Projection=Projection Lambert Zone IV\n"
              "[Options_Nivellement]\nFermAltimetr=0.0126\n[Options_Tolerances]\nTypeCanevas=2\n");
    const std::string written = OptionsOf(Path("params.ini"));
    WriteFile(Path("options.geo"), written);
    CCarnet book;
    EXPECT_EQ(book.Load(&m_wnd, Path("options.geo"), Path("copy.ini"), 0, nullptr), 0);  // no element
    EXPECT_EQ(OptionsOf(Path("copy.ini")), written);
    EXPECT_EQ(save_test::Stored(Path("copy.ini"), "Options_Nivellement", "FermAltimetr"), "0.013000");
    EXPECT_TRUE(m_wnd.Texts().empty());
}
