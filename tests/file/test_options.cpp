#include <gtest/gtest.h>

#include <string>
#include <vector>

#include <carnet/carnet.h>

#include "file/file_texts_internal.h"
#include "save_fixture.h"

using save_test::OptionLine;
using save_test::Stored;
using save_test::Written;

namespace {

class Options : public save_test::BookFileTest {
protected:
    // One location of each form of store.
    std::vector<std::string> Locations() const {
        return {Path("params.ini"), "HKEY_CURRENT_USER\\Software\\Carnet"};
    }

    std::string OptionsOf(const std::string& location) {
        CCarnet book;
        book.m_ParamFile = location;
        return Written([&](std::FILE* f) { book.WriteOptions(f); });
    }

    // Reads one line into an empty book at the location; the window gets
    // any message.
    void* Read(const std::string& location, const char* line, int bAppend = 0) {
        CCarnet book;
        book.m_ParamFile = location;
        int index = 0;
        void* element = book.ReadLine(&m_wnd, line, index, bAppend);
        EXPECT_EQ(book.length(), 0);
        EXPECT_EQ(index, 0);
        return element;
    }

    CNorvexTxtWnd m_wnd;
};

const std::string kDefaults = OptionLine("Option_Correc", 18, "  1  0.0  0.0  0.000  0.000  0.000  6366.000") +
                              OptionLine("Option_Projec", 20, "Aucune") +
                              OptionLine("Option_Nivell", 18, "  0  0  0.010") +
                              OptionLine("Option_Planim", 18, "  0  0.010  0.010  0.010  0.010  0.010 0.010 0");

}  // namespace

TEST_F(Options, AnEmptyStoreWritesTheDefaults) {
    ASSERT_EQ(kDefaults.substr(0, 55), std::string(8, ' ') + "Option_Correc" + std::string(23, ' ') + "1  0.0  0.0");
    for (const std::string& location : {std::string(), Path("missing.ini"), std::string("HKEY_CURRENT_USER\\None")})
        EXPECT_EQ(OptionsOf(location), kDefaults) << location;
    EXPECT_TRUE(m_boxes.boxes.empty());
}

TEST_F(Options, StoredValuesAreWrittenClampedIntoTheirRanges) {
    struct Value {
        const char *section, *key, *text;
    };
    const Value inRange[] = {
        {"Options_Corrections", "CorrAuto", "0"},        {"Options_Corrections", "AlterLineaire", "-6.44"},
        {"Options_Corrections", "CorrNivZero", "2.46"},   {"Options_Corrections", "AbsiMoyenne", "601250.1234"},
        {"Options_Corrections", "OrdoMoyenne", "2428760"}, {"Options_Corrections", "AltiMoyenne", "-12.5"},
        {"Options_Corrections", "RayonTerre", "6500.123"}, {"Options_Corrections", "Projection", "Projection Lambert Zone II"},
        {"Options_Nivellement", "TypeTolerance", "2"},    {"Options_Nivellement", "TypeNivel", "1"},
        {"Options_Nivellement", "FermAltimetr", "0.015"}, {"Options_Tolerances", "TypeTolerance", "1"},
        {"Options_Tolerances", "TolAngles", "0.005"},     {"Options_Tolerances", "TolDistances", "0.02"},
        {"Options_Tolerances", "TolAltitudes", "0.03"},   {"Options_Tolerances", "FermAngulaire", "0.04"},
        {"Options_Tolerances", "FermPlanimetr", "0.05"},  {"Options_Tolerances", "FermAltimetr", "0.06"},
        {"Options_Tolerances", "TypeCanevas", "3"},
    };
    const Value outOfRange[] = {
        {"Options_Corrections", "CorrAuto", "5"},          {"Options_Corrections", "AlterLineaire", "-200000"},
        {"Options_Corrections", "CorrNivZero", "200000"},   {"Options_Corrections", "AbsiMoyenne", "-1"},
        {"Options_Corrections", "OrdoMoyenne", "1e9"},      {"Options_Corrections", "AltiMoyenne", "20000"},
        {"Options_Corrections", "RayonTerre", "8000"},      {"Options_Nivellement", "TypeTolerance", "-3"},
        {"Options_Nivellement", "TypeNivel", "7"},          {"Options_Nivellement", "FermAltimetr", "0"},
        {"Options_Tolerances", "TypeTolerance", "9"},       {"Options_Tolerances", "TolAngles", "500000"},
        {"Options_Tolerances", "TolDistances", "0.0001"},   {"Options_Tolerances", "TolAltitudes", "abc"},
        {"Options_Tolerances", "FermAngulaire", "-1"},      {"Options_Tolerances", "FermPlanimetr", "200000"},
        {"Options_Tolerances", "FermAltimetr", "100000.5"}, {"Options_Tolerances", "TypeCanevas", "4"},
    };
    const std::string wantInRange =
        OptionLine("Option_Correc", 18, "  0  -6.4  2.5  601250.123  2428760.000  -12.500  6500.123") +
        OptionLine("Option_Projec", 20, "Projection Lambert Zone II") + OptionLine("Option_Nivell", 18, "  2  1  0.015") +
        OptionLine("Option_Planim", 18, "  1  0.005  0.020  0.030  0.040  0.050 0.060 3");
    const std::string wantClamped =
        OptionLine("Option_Correc", 18, "  1  -100000.0  100000.0  0.000  90000000.000  10000.000  7000.000") +
        OptionLine("Option_Projec", 20, "Aucune") + OptionLine("Option_Nivell", 18, "  0  2  0.001") +
        OptionLine("Option_Planim", 18, "  2  400000.000  0.001  0.001  0.001  100000.000 100000.000 3");
    for (const std::string& location : Locations()) {
        for (const Value& v : inRange) SetParamString(location.c_str(), v.section, v.key, v.text);
        EXPECT_EQ(OptionsOf(location), wantInRange) << location;
        SetParamString(location.c_str(), "Options_Corrections", "Projection", "Aucune");
        for (const Value& v : outOfRange) SetParamString(location.c_str(), v.section, v.key, v.text);
        EXPECT_EQ(OptionsOf(location), wantClamped) << location;
    }
    EXPECT_TRUE(m_boxes.boxes.empty());
}

TEST_F(Options, EachKeywordStoresItsValues) {
    struct Stores {
        const char *section, *key, *text;
    };
    struct Case {
        const char* line;
        std::vector<Stores> stored;
    };
    const Case cases[] = {
        {"Option_Correc 1 -6.4 -2.4 601250.000 2428760.000 152.000 6366.000",
         {{"Options_Corrections", "CorrAuto", "1"},
          {"Options_Corrections", "AlterLineaire", "-6.4"},
          {"Options_Corrections", "CorrNivZero", "-2.4"},
          {"Options_Corrections", "AbsiMoyenne", "601250.000"},
          {"Options_Corrections", "OrdoMoyenne", "2428760.000"},
          {"Options_Corrections", "AltiMoyenne", "152.000"},
          {"Options_Corrections", "RayonTerre", "6366.000"}}},
        // Texts are stored as they stand, even when they are no number.
        {"Option_Correc x 1,5 0 0 0 0 9999",
         {{"Options_Corrections", "CorrAuto", "x"},
          {"Options_Corrections", "AlterLineaire", "1,5"},
          {"Options_Corrections", "RayonTerre", "9999"}}},
        {"Cal_Cor 2 600000 2200000 150 6366",
         {{"Options_Corrections", "CorrAuto", "0"},
          {"Options_Corrections", "Projection", "Projection Lambert Zone III"},
          {"Options_Corrections", "AbsiMoyenne", "600000"},
          {"Options_Corrections", "OrdoMoyenne", "2200000"},
          {"Options_Corrections", "AltiMoyenne", "150"},
          {"Options_Corrections", "RayonTerre", "6366"}}},
        {"Cal_Cor 0 1 2 3 4", {{"Options_Corrections", "Projection", "Projection Lambert Zone I"}}},
        {"Cal_Cor 1 1 2 3 4", {{"Options_Corrections", "Projection", "Projection Lambert Zone II"}}},
        {"Cal_Cor 3 1 2 3 4", {{"Options_Corrections", "Projection", "Projection Lambert Zone IV"}}},
        {"Cal_Cor 7 1 2 3 4", {{"Options_Corrections", "Projection", "Aucune"}}},
        {"Cal_Cor -1 1 2 3 4", {{"Options_Corrections", "Projection", "Aucune"}}},
        {"Cal_Cor 99999999999 1 2 3 4", {{"Options_Corrections", "Projection", "Aucune"}}},
        // Tenths: both corrections take ten times the first word.
        {"Cor_Dist 1.5 3",
         {{"Options_Corrections", "AlterLineaire", "15.000000"}, {"Options_Corrections", "CorrNivZero", "15.000000"}}},
        {"Option_Projec Projection  Lambert \xE9tendue",
         {{"Options_Corrections", "Projection", "Projection  Lambert \xE9tendue"}}},
        {"Option_Nivell 1 2 0.015",
         {{"Options_Nivellement", "TypeTolerance", "1"},
          {"Options_Nivellement", "TypeNivel", "2"},
          {"Options_Nivellement", "FermAltimetr", "0.015000"},
          {"Options_Tolerances", "TypeTolerance", "<none>"}}},
        // Thousandths.
        {"Tol_Niv 1 2 15",
         {{"Options_Nivellement", "TypeTolerance", "1"},
          {"Options_Nivellement", "TypeNivel", "2"},
          {"Options_Nivellement", "FermAltimetr", "0.015000"}}},
        {"Option_Planim 1 0.005 0.010 0.020 0.015 0.050 0.020 2",
         {{"Options_Tolerances", "TypeTolerance", "1"},
          {"Options_Tolerances", "TolAngles", "0.005"},
          {"Options_Tolerances", "TolDistances", "0.010"},
          {"Options_Tolerances", "TolAltitudes", "0.020"},
          {"Options_Tolerances", "FermAngulaire", "0.015"},
          {"Options_Tolerances", "FermPlanimetr", "0.050"},
          {"Options_Tolerances", "FermAltimetr", "0.020"},
          {"Options_Tolerances", "TypeCanevas", "2"},
          {"Options_Nivellement", "FermAltimetr", "<none>"}}},
        {"Tol_Poly 2 3",
         {{"Options_Tolerances", "TypeTolerance", "2"},
          {"Options_Tolerances", "TypeCanevas", "3"},
          {"Options_Tolerances", "TolAngles", "<none>"},
          {"Options_Nivellement", "TypeTolerance", "<none>"}}},
        {"Tol_Pers 5 10 20 15 50 20",
         {{"Options_Tolerances", "TolAngles", "0.005000"},
          {"Options_Tolerances", "TolDistances", "0.010000"},
          {"Options_Tolerances", "TolAltitudes", "0.020000"},
          {"Options_Tolerances", "FermAngulaire", "0.015000"},
          {"Options_Tolerances", "FermPlanimetr", "0.050000"},
          {"Options_Tolerances", "FermAltimetr", "0.020000"},
          {"Options_Tolerances", "TypeTolerance", "<none>"}}},
    };
    int n = 0;
    for (const Case& c : cases) {
        for (const std::string& base : Locations()) {
            const std::string location = base + std::to_string(n);
            EXPECT_EQ(Read(location, c.line), nullptr) << c.line;
            for (const Stores& s : c.stored) EXPECT_EQ(Stored(location, s.section, s.key), s.text) << c.line << " " << s.key;
        }
        ++n;
    }
    EXPECT_TRUE(m_wnd.Texts().empty());
    EXPECT_TRUE(m_boxes.boxes.empty());
}

TEST_F(Options, WrongCountsAreReportedAndStoreNothing) {
    const struct {
        const char *line, *keyword;
    } cases[] = {
        {"Option_Correc 1 0 0 0 0 0", "Option_Correc"},      {"Option_Correc 1 0 0 0 0 0 0 0", "Option_Correc"},
        {"Cal_Cor 2 600000 2200000 150", "Cal_Cor"},          {"Cor_Dist 1", "Cor_Dist"},
        {"Cor_Dist 1 2 3", "Cor_Dist"},                      {"Option_Projec", "Option_Projec"},
        {"   Option_Projec   ", "Option_Projec"},            {"Option_Nivell 1 2", "Option_Nivell"},
        {"Tol_Niv 1 2 15 4", "Tol_Niv"},                     {"Option_Planim 1 0.005 0.010 0.020 0.015 0.050 0.020", "Option_Planim"},
        {"Tol_Poly 2", "Tol_Poly"},                          {"Tol_Pers 5 10 20 15 50", "Tol_Pers"},
    };
    const std::string location = Path("params.ini");
    for (const auto& c : cases) {
        m_wnd.Clear();
        EXPECT_EQ(Read(location, c.line), nullptr);
        ASSERT_EQ(m_wnd.Texts().size(), 2u) << c.line;
        EXPECT_EQ(m_wnd.Texts()[0], "Erreur ligne 1 : la commande <" + std::string(c.keyword) +
                                        "> n'a pas le bon nombre de param\xE8tres !");
        EXPECT_EQ(m_wnd.Texts()[1], " (" + std::string(c.line) + ")");
    }
    EXPECT_EQ(store_test::ReadFile(location), "");
    EXPECT_TRUE(m_boxes.boxes.empty());
}

TEST_F(Options, OptionsAreUnknownWhileAppendingAndOtherKeywordsStayUnknown) {
    const std::string location = Path("params.ini");
    const struct {
        const char* line;
        int bAppend;
    } cases[] = {
        {"Option_Correc 1 -6.4 -2.4 601250.000 2428760.000 152.000 6366.000", 1},
        {"Option_Projec Projection Lambert Zone II", 1},
        {"Tol_Pers 5 10 20 15 50 20", 2},
        {"Option_Autre 1 2", 0},
        {"option_projec Aucune", 0},
    };
    for (const auto& c : cases) {
        m_wnd.Clear();
        EXPECT_EQ(Read(location, c.line, c.bAppend), nullptr);
        ASSERT_EQ(m_wnd.Texts().size(), 2u) << c.line;
        const std::string keyword = std::string(c.line).substr(0, std::string(c.line).find(' '));
        EXPECT_EQ(m_wnd.Texts()[0], "Erreur ligne 1 : commande <" + keyword + "> incorrecte !");
    }
    EXPECT_EQ(store_test::ReadFile(location), "");
}

TEST_F(Options, WrittenOptionsReadBackToTheSameLines) {
    for (const std::string& location : Locations()) {
        SetParamString(location.c_str(), "Options_Corrections", "AlterLineaire", "-6.44");
        SetParamString(location.c_str(), "Options_Corrections", "RayonTerre", "6371.0006");
        SetParamString(location.c_str(), "Options_Corrections", "Projection", "Projection Lambert Zone IV");
        SetParamString(location.c_str(), "Options_Nivellement", "FermAltimetr", "0.0126");
        SetParamString(location.c_str(), "Options_Tolerances", "TypeCanevas", "2");
        const std::string written = OptionsOf(location);

        // Loaded into a fresh store, the lines give back the same store.
        const std::string file = Path("options.geo");
        store_test::WriteFile(file, written);
        const std::string other = location + "-copy";
        CCarnet book;
        EXPECT_EQ(book.Load(&m_wnd, file, other, 0, nullptr), 0);  // no element
        EXPECT_EQ(book.length(), 0);
        EXPECT_EQ(OptionsOf(other), written) << location;
        EXPECT_EQ(Stored(other, "Options_Nivellement", "FermAltimetr"), "0.013000");
        EXPECT_EQ(Stored(other, "Options_Corrections", "RayonTerre"), "6371.001");
    }
    EXPECT_TRUE(m_wnd.Texts().empty());
}
