#include <gtest/gtest.h>

#include <clocale>
#include <cfloat>
#include <cmath>
#include <cstdlib>

#include <carnet/carnet.h>

#include "load_fixture.h"

namespace {

// Reads one line into a fresh book and returns what the text window got.
struct OneLine {
    CCarnet book;
    CNorvexTxtWnd wnd;
    void* element = nullptr;
    explicit OneLine(const char* line) {
        int index = book.length();
        element = book.ReadLine(&wnd, line, index, 0);
    }
    unsigned int type() const { return book.length() ? book.typAt(0) : 0; }
};

const char kWorkedExample[] =
    "000001  Station          S1                1.550000  12.3456789                    \n"
    "000002  Reference        R1                1.600000   0.0000000 100.1234000 123.456000 borne***a\n"
    "000003  Mesure           M1                         54.3210000                                    \n"
    "000004  Point            P1               1    1000.250000    2000.500000 -999999.000000 arbre\n"
    "000005  Commentaire      Lev\xE9 du 12 mars\n";

}  // namespace

TEST(ReadLine, WordCountsOfEachRecord) {
    struct Case {
        const char* line;
        unsigned int type;  // 0: rejected as incomplete
    };
    const Case cases[] = {
        {"Station S1 1.55", 1001},
        {"Station S1 1.55 12.3 borne", 1001},
        {"Station S1", 0},
        {"Station S1 1 2 3 4", 0},
        {"Reference R1 54.321", 1002},
        {"Reference R1 1.6 54.321", 1002},
        {"Reference R1 1.6 2 3", 0},
        {"Reference R1 1.6 2 3 4", 1002},
        {"Reference R1 1.6 2 3 4 s", 1002},
        {"Reference R1 1.6 2 3 4 s t", 0},
        {"Reference R1", 0},
        {"Mesure M1 1 2 3 4", 1003},
        {"NivLectAR B1 1.234 45.60 rep\xE8re", 1004},
        {"NivLectAR B1 rep\xE8re", 0},
        {"NivLectAV B1 1.2", 1005},
        {"NivLectAV B1 1.2 2.3 3.4 4.5", 0},
        {"ExcentTan 0.1500", 1010},
        {"ExcentTan 0.1500 2", 0},
        {"Appareil 0 0 0.005 0.005 0.05 5 Theodolite T2", 1008},
        {"Appareil 0 0 0.005 0.005 0.05 5", 0},
        {"Commentaire", 0},
        {"Commentaire  x ", 1000},
        {"Commande go", 1009},
        {"Point P1 3", 1006},
        {"Point P1 1", 0},
        {"Point P1", 0},
        {"Point P1 1250 3300", 0},
    };
    for (const Case& c : cases) {
        OneLine r(c.line);
        EXPECT_EQ(r.type(), c.type) << c.line;
        EXPECT_EQ(r.element != nullptr, c.type != 0) << c.line;
        if (!c.type) {
            ASSERT_EQ(r.wnd.Texts().size(), 2u) << c.line;
            EXPECT_EQ(r.wnd.Texts()[1], std::string(" (") + c.line + ")");
        }
    }
}

TEST(ReadLine, FrameAndMessages) {
    OneLine tab("Station\tS1 1.55 12.3");
    ASSERT_EQ(tab.wnd.Texts().size(), 2u);
    EXPECT_EQ(tab.wnd.Texts()[0], "Erreur ligne 1 : commande <Station\tS1> incorrecte !");

    OneLine blanks("   \t ");
    ASSERT_EQ(blanks.wnd.Texts().size(), 2u);
    EXPECT_EQ(blanks.wnd.Texts()[0], "Erreur ligne 1 : ligne incompl\xEAte (pas de commande) !");
    EXPECT_EQ(blanks.wnd.Texts()[1], " (   \t )");

    OneLine number("000012");
    EXPECT_EQ(number.wnd.Texts()[0], "Erreur ligne 1 : ligne incompl\xEAte (pas de commande) !");

    OneLine empty("");
    EXPECT_TRUE(empty.wnd.Texts().empty());

    OneLine incomplete("Station S1");
    EXPECT_EQ(incomplete.wnd.Texts()[0], "Erreur ligne 1 : commande <Station> incompl\xE8te !");

    // Only one number prefix is removed; a percent sign reaches the window as is.
    OneLine twice("12 34 Commande %s%d");
    EXPECT_EQ(twice.wnd.Texts()[0], "Erreur ligne 1 : commande <34> incorrecte !");
    EXPECT_EQ(twice.wnd.Texts()[1], " (12 34 Commande %s%d)");
}

TEST(ReadLine, RecordValues) {
    OneLine st("000012  Station          S1                1.550000  12.3456789");
    auto* s = static_cast<CStation*>(st.element);
    ASSERT_NE(s, nullptr);
    EXPECT_EQ(s->Np(), "S1");
    EXPECT_DOUBLE_EQ(s->Hi(), 1.55);
    EXPECT_DOUBLE_EQ(s->V0(), 12.3456789);
    EXPECT_TRUE(s->Sy().IsEmpty());

    OneLine ref("Reference R2 1.6 54.321");
    auto* r = static_cast<CReference*>(ref.element);
    EXPECT_DOUBLE_EQ(r->Ah(), 1.6);
    EXPECT_EQ(r->Sy(), "54.321");
    EXPECT_TRUE(IsUndef(r->Hp()) && IsUndef(r->Av()) && IsUndef(r->Di()));

    OneLine pt("Point P1 0 -12.500 +3.25 100.0 borne***7 A");
    auto* p = static_cast<CPointGen*>(pt.element);
    EXPECT_EQ(p->m_X, -12.5);
    EXPECT_EQ(p->m_Y, 3.25);
    EXPECT_EQ(p->m_Z, 100.0);
    EXPECT_EQ(p->m_Sy, "borne 7 A");
    EXPECT_EQ(p->m_bXConst + p->m_bZConst, 0);

    OneLine holder("Point P1 3");
    p = static_cast<CPointGen*>(holder.element);
    EXPECT_EQ(p->m_bZConst, 1);
    EXPECT_EQ(p->m_bXConst, 0);
    EXPECT_TRUE(IsUndef(p->m_Z));

    OneLine plan("Point P1 1250.10 3300.25");
    p = static_cast<CPointGen*>(plan.element);
    EXPECT_EQ(p->m_X, 1250.10);
    EXPECT_EQ(p->m_Y, 3300.25);
    EXPECT_TRUE(IsUndef(p->m_Z));

    OneLine height("Point P1 3 12.5");  // one coordinate keeps only the height lock
    p = static_cast<CPointGen*>(height.element);
    EXPECT_EQ(p->m_Z, 12.5);
    EXPECT_EQ(p->m_bXConst, 0);
    EXPECT_EQ(p->m_bZConst, 1);

    OneLine lev("NivLectAR B1 1.234 45.60 rep\xE8re");
    auto* l = static_cast<CLectAR*>(lev.element);
    EXPECT_DOUBLE_EQ(l->Lm(), 1.234);
    EXPECT_DOUBLE_EQ(l->Dh(), 45.6);
    EXPECT_EQ(l->Sy(), "rep\xE8re");

    OneLine lastWord("NivLectAV B1 a 1.5 b");  // the last word that is not a value wins
    auto* f = static_cast<CLectAV*>(lastWord.element);
    EXPECT_DOUBLE_EQ(f->Lm(), 1.5);
    EXPECT_TRUE(IsUndef(f->Dh()));
    EXPECT_EQ(f->Sy(), "b");

    OneLine ex("ExcentVer 0.1500");
    EXPECT_EQ(static_cast<CExcent*>(ex.element)->getTyp(), 2);
    EXPECT_DOUBLE_EQ(static_cast<CExcent*>(ex.element)->getVal(), 0.15);

    OneLine app("Appareil 0.1 0.2 0.005 0.006 0.05 5.0 Leveau  T2   bis");
    CString line;
    static_cast<CAppareil*>(app.element)->Infos(line);
    EXPECT_EQ(line.Right(14), " Leveau T2 bis");

    OneLine com("Commentaire   deux  blancs   ");
    EXPECT_EQ(static_cast<CComment*>(com.element)->Str(), "deux  blancs");
}

TEST(ReadLine, PointNumberTest) {
    struct Case {
        const char* word;
        bool coordinate;
    };
    const Case cases[] = {{"12.50", true},  {"-0.000", true}, {"+3.25", true}, {"12.", false},
                          {"1.2.3", false}, {"12.5a", false}, {"1250", false}, {".5", false},
                          {"1e3", false},   {"--1.0", true}, {"0.5", true},   {"00.5", false}};
    for (const Case& c : cases) {
        // With the height lock, a line without coordinates is still accepted,
        // so the word's fate shows in the symbol.
        OneLine r((std::string("Point P 2 ") + c.word).c_str());
        auto* p = static_cast<CPointGen*>(r.element);
        ASSERT_NE(p, nullptr) << c.word;
        EXPECT_EQ(p->hasZ() != 0, c.coordinate) << c.word;
        EXPECT_EQ(p->m_Sy == c.word, !c.coordinate) << c.word;
    }
}

TEST(ReadLine, StoresInPlaceOrAppends) {
    CCarnet book;
    std::vector<CComment*> old;
    for (int i = 0; i < 5; ++i) {
        old.push_back(new CComment("c"));
        book.append(old.back(), 1000);
    }
    CNorvexTxtWnd wnd;
    int index = 2;
    void* p = book.ReadLine(&wnd, "Station S1 1.5", index, 0);
    EXPECT_EQ(book.length(), 5);
    EXPECT_EQ(book.ptrAt(2), p);
    EXPECT_EQ(book.typAt(2), 1001u);
    EXPECT_EQ(old[2]->Str(), "c");  // still ours, alive
    delete old[2];

    // A new path is always appended, even when the position says otherwise.
    index = 1;
    void* path = book.ReadLine(&wnd, "CheminEncadre C1 S1-1 S2-1", index, 0);
    EXPECT_EQ(book.length(), 6);
    EXPECT_EQ(book.ptrAt(5), path);
    EXPECT_EQ(book.cmdAt(5), "CheminEncadre");
    EXPECT_EQ(book.typAt(1), 1000u);
}

TEST(ReadLine, PathContinuations) {
    CCarnet book;
    CNorvexTxtWnd wnd;
    int index = 0;
    void* first = book.ReadLine(&wnd, "CheminAntenne C1 S1-1 S2-1", index, 0);
    ASSERT_NE(first, nullptr);
    ++index;
    EXPECT_EQ(book.ReadLine(&wnd, "CheminAntenne C1 S3-2", index, 0), first);
    EXPECT_EQ(index, 0);  // made up for the loader's increment
    ++index;
    ASSERT_EQ(book.length(), 1);
    auto* path = static_cast<CChemin*>(first);
    ASSERT_EQ(path->length(), 3);
    EXPECT_EQ(path->matAt(2), "S3");
    EXPECT_EQ(path->repAt(2), 2);

    EXPECT_EQ(book.ReadLine(&wnd, "CheminAntenne C1", index, 0), nullptr);  // continuation needs a station
    EXPECT_EQ(book.ReadLine(&wnd, "Cheminement C2 A-1", index, 0), nullptr);  // a new path needs two
    ASSERT_EQ(wnd.Texts().size(), 4u);
    EXPECT_EQ(wnd.Texts()[2], "Erreur ligne 2 : commande <Cheminement> incompl\xE8te !");
    void* second = book.ReadLine(&wnd, "Cheminement C2 A-1 B-1", index, 0);
    ASSERT_NE(second, nullptr);
    EXPECT_EQ(static_cast<CChemin*>(second)->isAntenne(), 1);
}

TEST(Load, WorkedExampleAndLineNumbers) {
    TempDir dir;
    std::string path = dir.File("ex.geo", std::string("Bogus first\nPoint P9\n") + kWorkedExample +
                                              "CheminAntenne C1 S1-1 S2-1\nCheminAntenne C1 S3-1\n\n"
                                              "Mauvais\n");
    CCarnet book;
    CNorvexTxtWnd wnd;
    EXPECT_EQ(book.Load(&wnd, path.c_str(), 0, nullptr), 1);
    ASSERT_EQ(book.length(), 6);
    EXPECT_EQ(book.m_FileName, path.c_str());
    const unsigned int types[] = {1001, 1002, 1003, 1006, 1000, 1007};
    for (int i = 0; i < 6; ++i) EXPECT_EQ(book.typAt(i), types[i]);
    EXPECT_EQ(book.symAt(1), "borne a");
    EXPECT_EQ(book.parAt(4), "Lev\xE9 du 12 mars");
    auto* p = static_cast<CPointGen*>(book.ptrAt(3));
    EXPECT_EQ(p->m_bXConst, 1);
    EXPECT_TRUE(IsUndef(p->m_Z));
    const std::vector<std::string>& t = wnd.Texts();
    ASSERT_EQ(t.size(), 6u);
    // Rejected lines do not advance the number; the line after the path is 7.
    EXPECT_EQ(t[0].substr(0, 16), "Erreur ligne 1 :");
    EXPECT_EQ(t[2].substr(0, 16), "Erreur ligne 1 :");
    EXPECT_EQ(t[4], "Erreur ligne 7 : commande <Mauvais> incorrecte !");

    const std::vector<std::string> first = t;

    // The same file appended to a book of 6: messages start at line 7.
    wnd.Clear();
    EXPECT_EQ(book.Load(&wnd, path.c_str(), 1, nullptr), 1);
    EXPECT_EQ(book.length(), 12);
    EXPECT_EQ(wnd.Texts()[0].substr(0, 16), "Erreur ligne 7 :");

    // The same bytes held in memory load the same, the book's file name kept.
    std::FILE* f = std::fopen(path.c_str(), "rb");
    std::string bytes(4096, '\0');
    bytes.resize(std::fread(&bytes[0], 1, bytes.size(), f));
    std::fclose(f);
    CCarnet again;
    CNorvexTxtWnd againWnd;
    EXPECT_EQ(again.LoadBytes(&againWnd, bytes, "", 0), 1);
    EXPECT_EQ(again.m_FileName, "Sitebook.geo");
    EXPECT_EQ(againWnd.Texts(), first);
    for (int i = 0; i < 6; ++i) EXPECT_EQ(again.parAt(i), book.parAt(i));
}

TEST(Load, SavedLinesLoadBackAsWritten) {
    // What a save writes for each record comes back with the same line.
    TempDir dir;
    std::string path = dir.File("ex.geo", kWorkedExample);
    CCarnet book;
    ASSERT_EQ(book.Load(nullptr, path.c_str(), 0, nullptr), 1);
    book.append(new CStation("S2", 1.4, UNDEF_VALUE, "sans ori"), 1001);
    book.append(new CLectAV("B1", 1.2345, UNDEF_VALUE, "mire a"), 1005);
    book.append(new CExcent(0, 0.25), 1010);
    book.append(new CAppareil("T2 bis", 0.1, 0.2, 0.005, 0.006, 0.05, 5.0), 1008);
    std::FILE* f = std::fopen((dir.path() + "/out.geo").c_str(), "w");
    for (int i = 0; i < book.length(); ++i) book.writeAt(i, f, i + 1);
    std::fclose(f);
    CCarnet again;
    ASSERT_EQ(again.Load(nullptr, (dir.path() + "/out.geo").c_str(), 0, nullptr), 1);
    ASSERT_EQ(again.length(), book.length());
    for (int i = 0; i < book.length(); ++i) {
        EXPECT_EQ(again.typAt(i), book.typAt(i)) << i;
        EXPECT_EQ(again.parAt(i), book.parAt(i)) << i;
        // Writing marked the blanks of some symbols in the records themselves.
        CString sy = book.symAt(i);
        sy.Replace("***", " ");
        EXPECT_EQ(again.symAt(i), sy) << i;
    }
    // The station without orientation is still a valid station without one.
    auto* s = static_cast<CStation*>(again.ptrAt(5));
    EXPECT_TRUE(IsUndef(s->V0()));
    EXPECT_EQ(s->isOk(), 1);
}

TEST(Load, WholeLinesAndLastLineWithoutNewline) {
    TempDir dir;
    std::string longText(600, 'x');
    std::string path = dir.File("long.geo", "Commentaire " + longText + "\r\nCommande fin");
    CCarnet book;
    CNorvexTxtWnd wnd;
    ASSERT_EQ(book.Load(&wnd, path.c_str(), 0, nullptr), 1);
    ASSERT_EQ(book.length(), 2);
    EXPECT_EQ(book.parAt(0), longText.c_str());
    EXPECT_EQ(book.parAt(1), "fin");
    EXPECT_TRUE(wnd.Texts().empty());
}

TEST(Load, OpenFailuresAndDialog) {
    TempDir dir;
    BoxCapture boxes;
    CCarnet book;
    book.append(new CComment("keep"), 1000);
    CWnd parent;
    std::string missing = dir.path() + "/none.geo";
    EXPECT_EQ(book.Load(nullptr, missing.c_str(), 0, &parent), 0);
    EXPECT_EQ(book.Load(nullptr, dir.path().c_str(), 0, nullptr), 0);  // a folder
    ASSERT_EQ(boxes.boxes.size(), 2u);
    EXPECT_EQ(boxes.boxes[0], "NORVEX|Impossible d'ouvrir la Sitebook :\n" + missing + " !");
    EXPECT_EQ(book.length(), 1);

    {
        DialogAnswer cancel(false, "");
        EXPECT_EQ(book.Load(nullptr, "", 0, nullptr), 0);
        ASSERT_EQ(cancel.requests.size(), 1u);
        EXPECT_EQ(cancel.requests[0].title, "S\xE9lectionnez la Sitebook \xE0 charger :");
        EXPECT_EQ(cancel.requests[0].filter, "Sitebook NORVEX (*.geo)|*.geo||");
        EXPECT_EQ(cancel.requests[0].flags, OFN_FILEMUSTEXIST | OFN_NOREADONLYRETURN);
        EXPECT_EQ(cancel.requests[0].initialName, "Sitebook.geo");
        EXPECT_FALSE(cancel.requests[0].save);
    }
    EXPECT_EQ(book.length(), 1);
    EXPECT_EQ(boxes.boxes.size(), 2u);

    {
        // The chosen file vanished: warned, nothing loaded, name kept.
        DialogAnswer gone(true, missing);
        book.m_FileName = dir.File("prev.geo", "Commande ancienne\n").c_str();
        EXPECT_EQ(book.Load(nullptr, "", 0, nullptr), 0);
        EXPECT_EQ(book.length(), 1);
        EXPECT_EQ(boxes.boxes.size(), 3u);
        EXPECT_EQ(book.m_FileName, (dir.path() + "/prev.geo").c_str());
    }
    {
        std::string chosen = dir.File("chosen.geo", "Commande ici\n");
        DialogAnswer pick(true, chosen);
        EXPECT_EQ(book.Load(nullptr, "", CString("params.ini"), 0, nullptr), 1);
        EXPECT_EQ(book.m_FileName, chosen.c_str());
        EXPECT_EQ(book.m_ParamFile, "params.ini");
        EXPECT_EQ(book.parAt(0), "ici");
    }
    // A file that yields no element loads as an empty book and returns 0.
    EXPECT_EQ(book.Load(nullptr, dir.File("bad.geo", "x\n\n").c_str(), 0, nullptr), 0);
    EXPECT_EQ(book.length(), 0);
}

TEST(Load, NumbersDoNotDependOnTheLocale) {
    TempDir dir;
    const std::string cmd = "localedef -i fr_FR -f UTF-8 " + dir.path() + "/fr_FR.UTF-8 >/dev/null 2>&1";
    ASSERT_EQ(std::system(cmd.c_str()), 0) << "localedef must be able to build fr_FR.UTF-8";
    setenv("LOCPATH", dir.path().c_str(), 1);
    ASSERT_NE(std::setlocale(LC_ALL, "fr_FR.UTF-8"), nullptr);
    char probe[16];
    std::snprintf(probe, sizeof probe, "%.1f", 1.5);
    EXPECT_STREQ(probe, "1,5");  // the locale really uses a decimal comma

    OneLine st("Station S1 1.55 12.3456789");
    CString line;
    static_cast<CStation*>(st.element)->Infos(line);
    OneLine pt("Point P1 0 1000.25 2000.5 3.0 a");
    CString pline, params;
    static_cast<CPointGen*>(pt.element)->Infos(pline);
    static_cast<CPointGen*>(pt.element)->Params(params);
    double rounded = CCarnet::formatXY(1234.56789);

    std::setlocale(LC_ALL, "C");
    unsetenv("LOCPATH");
    EXPECT_EQ(line, "Station          S1                1.550000  12.3456789                    ");
    EXPECT_EQ(pline, "Point            P1               0    1000.250000    2000.500000     3.000000 a");
    EXPECT_EQ(params, "X =    1000.2500 , Y =    2000.5000 , Z =     3.0000");
    EXPECT_DOUBLE_EQ(rounded, 1234.5679);
}

TEST(Load, NonDecimalNumbersReadAsZero) {
    struct Case {
        const char* line;
        double hi;
    };
    const Case cases[] = {{"Station S inf", 0.0},   {"Station S nan", 0.0},     {"Station S 0x1A", 0.0},
                          {"Station S 1e2", 100.0}, {"Station S -2.5x", -2.5}, {"Station S 1e999", DBL_MAX}};
    for (const Case& c : cases) {
        OneLine r(c.line);
        ASSERT_NE(r.element, nullptr) << c.line;
        EXPECT_EQ(static_cast<CStation*>(r.element)->Hi(), c.hi) << c.line;
    }
}
