// Reading drawing-command lines: the field-count rule of each keyword, the
// members each field fills, placement, the save-and-load round trip of every
// kind, and the conversion to a comment and back.
#include <gtest/gtest.h>

#include <functional>
#include <set>
#include <string>
#include <vector>

#include <carnet/carnet.h>

#include "drawing_dump.h"

using drawing_test::Dump;
using drawing_test::DumpAt;
using drawing_test::LineAt;

namespace {

constexpr double U = UNDEF_VALUE;

std::string Incomplete(int line, const std::string& keyword) {
    return "Erreur ligne " + std::to_string(line) + " : commande <" + keyword + "> incompl\xE8te !";
}

enum Outcome { kBuilt, kMessage, kSilent, kUnknown };

struct RuleCase {
    std::string line;
    Outcome outcome;
    unsigned int type;      // when built
    std::string members;    // when built: drawing_test::Dump
};

std::string KeywordOf(const std::string& line) { return line.substr(0, line.find(' ')); }

}  // namespace

TEST(DrawingRead, FieldCountRulesOfEveryKindOfKeyword) {
    const RuleCase cases[] = {
        // At least the code; extra fields ignored.
        {"PT_Sans_Ori", kMessage, 0, ""},
        {"PT_Sans_Ori P1 extra", kBuilt, 1011, "P1"},
        // The crossings take the code alone.
        {"Passage_V\xE9" "lo PV", kBuilt, 1054, "PV"},
        {"Passage_V\xE9" "lo PV X", kMessage, 0, ""},
        {"Passage_Pi\xE9" "ton", kMessage, 0, ""},
        // Symbols with up to two scales.
        {"Sym_sans_Ori S", kBuilt, 1017, "S v1=absent v2=absent"},
        {"Sym_Orient\xE9 S 1.5", kBuilt, 1021, "S v1=1.5 v2=absent"},
        {"Sym_Comp_3 S 1.5 2", kBuilt, 1032, "S v1=1.5 v2=2"},
        {"Inter_Segment S 1 2 3", kMessage, 0, ""},
        // Segment constructions: without their number, dropped quietly.
        {"Perp_Segment PS", kSilent, 0, ""},
        {"Perp_Segment PS 1.5", kBuilt, 1043, "PS v1=1.5 v2=absent"},
        {"Prol_Segment PR 3 0.25", kBuilt, 1045, "PR v1=3 v2=0.25"},
        {"Perp_Segment PS 1 2 3", kMessage, 0, ""},
        // Both distances required, extra ignored.
        {"Inter_Dist ID 5", kMessage, 0, ""},
        {"Inter_Dist ID 5 6 7", kBuilt, 1065, "ID v1=5 v2=6"},
        // One number, optional.
        {"Sym_2Pts ARB", kBuilt, 1025, "ARB v1=absent"},
        {"Sym_2Pts ARB -999999.000", kBuilt, 1025, "ARB v1=absent"},
        {"Sym_2Pts ARB abc", kBuilt, 1025, "ARB v1=0"},
        {"Sym_2Pts ARB 1 2", kMessage, 0, ""},
        {"Liaison", kMessage, 0, ""},
        // The one-field lines of these three build the command without number.
        {"Alignement AL", kBuilt, 1044, "AL v1=absent"},
        {"Alignement AL 1 2", kMessage, 0, ""},
        {"Perp_2Pts P2P", kBuilt, 1063, "P2P v1=absent"},
        {"Sym\xE9" "trique SYM 4 extra", kBuilt, 1064, "SYM v1=4"},
        // Up to three numbers.
        {"Sym_Entr\xE9" "e SE 1 2", kBuilt, 1033, "SE v1=1 v2=2 v3=absent"},
        {"Sym_Entr\xE9" "e SE 1 2 0.3 4", kMessage, 0, ""},
        // Counts.
        {"Sym_Aligne ALG", kMessage, 0, ""},
        {"Sym_Aligne ALG 3", kBuilt, 1034, "ALG n=3"},
        {"Sym_Aligne ALG 3 4", kMessage, 0, ""},
        {"Escalier_1 E1", kBuilt, 1048, "E1 n=0"},
        {"Escalier_3 E3 7 8", kMessage, 0, ""},
        {"Escalier_2 E2 12 0.8", kBuilt, 1049, "E2 n=12 v1=0.8"},
        {"Escalier_2 E2 12 0.8 1", kMessage, 0, ""},
        {"Escalier_4 E4", kBuilt, 1051, "E4 text=<> n=0 v1=absent"},
        {"Escalier_4 E4 L5 12 0.8", kBuilt, 1051, "E4 text=<L5> n=12 v1=0.8"},
        {"Escalier_4 E4 L5 12 0.8 1", kMessage, 0, ""},
        // A linked line and a number.
        {"Cercle_R CER", kBuilt, 1035, "CER text=<> v1=absent"},
        {"Cercle_R CER L12", kBuilt, 1035, "CER text=<L12> v1=absent"},
        {"Cercle_D CED L1 5 x", kMessage, 0, ""},
        {"Parall\xE8" "le PAR", kSilent, 0, ""},
        {"Parall\xE8" "le PAR L1", kBuilt, 1047, "PAR text=<L1> v1=absent"},
        {"Parall\xE8" "le PAR L1 1 2", kMessage, 0, ""},
        // A linked line alone: too many fields are dropped quietly.
        {"Cercle_3Pts C3", kBuilt, 1037, "C3 text=<>"},
        {"Cercle_3Pts C3 L2 X", kSilent, 0, ""},
        {"Carr\xE9" "_Dia", kMessage, 0, ""},
        {"Rect_3Pts_H RH L4 1.5", kBuilt, 1040, "RH text=<L4> v1=1.5 v2=absent"},
        {"Rect_3Pts_D RD L5 1 0.5 9", kMessage, 0, ""},
        {"Accro_Li_Pro ACL", kMessage, 0, ""},
        {"Rappel_Point RP P12 extra", kBuilt, 1062, "RP text=<P12>"},
        // Free texts: everything after the code, inner blanks as written.
        {"Texte_1Pt", kMessage, 0, ""},
        {"Texte_1Pt TXT", kBuilt, 1055, "TXT text=<>"},
        {"Texte_1Pt TXT  Mur  de   cl\xF4ture", kBuilt, 1055, "TXT text=<Mur  de   cl\xF4ture>"},
        {"Ajout_Attrib AAS   H=2", kBuilt, 1058, "AAS text=<H=2>"},
        // Keywords are compared with case.
        {"sym_2Pts ARB 1.5", kUnknown, 0, ""},
    };
    for (const RuleCase& c : cases) {
        SCOPED_TRACE(c.line);
        CCarnet book;
        CNorvexTxtWnd wnd;
        int index = 0;
        void* made = book.ReadLine(&wnd, c.line.c_str(), index, 0);
        switch (c.outcome) {
            case kBuilt:
                ASSERT_NE(made, nullptr);
                ASSERT_EQ(book.length(), 1);
                EXPECT_EQ(book.ptrAt(0), made);
                EXPECT_EQ(book.typAt(0), c.type);
                EXPECT_EQ(DumpAt(book, 0), c.members);
                EXPECT_TRUE(wnd.Texts().empty());
                break;
            case kMessage:
                EXPECT_EQ(made, nullptr);
                EXPECT_EQ(book.length(), 0);
                EXPECT_EQ(wnd.Texts(),
                          (std::vector<std::string>{Incomplete(1, KeywordOf(c.line)), " (" + c.line + ")"}));
                break;
            case kSilent:
                EXPECT_EQ(made, nullptr);
                EXPECT_EQ(book.length(), 0);
                EXPECT_TRUE(wnd.Texts().empty());
                break;
            case kUnknown:
                EXPECT_EQ(made, nullptr);
                ASSERT_EQ(wnd.Texts().size(), 2u);
                EXPECT_EQ(wnd.Texts()[0], "Erreur ligne 1 : commande <" + KeywordOf(c.line) + "> incorrecte !");
                break;
        }
        // Without a window: the same element or none, and nothing to print to.
        CCarnet quiet;
        int at = 0;
        EXPECT_EQ(quiet.ReadLine(nullptr, c.line.c_str(), at, 0) != nullptr, c.outcome == kBuilt);
    }
}

TEST(DrawingRead, MessageNamesThePositionAndShowsTheLineAsPassed) {
    CCarnet book;
    for (int i = 0; i < 3; ++i) book.append(new CPointSansOri("P"), 1011);
    CNorvexTxtWnd wnd;
    int index = 3;
    const char* line = "  000042  Sym_Aligne      ALG  ";
    EXPECT_EQ(book.ReadLine(&wnd, line, index, 0), nullptr);
    EXPECT_EQ(wnd.Texts(), (std::vector<std::string>{Incomplete(4, "Sym_Aligne"), std::string(" (") + line + ")"}));
    EXPECT_EQ(book.length(), 3);
    EXPECT_EQ(index, 3);
}

TEST(DrawingRead, LineNumberFrameAndBlankRunsCarryNoMeaning) {
    CCarnet book;
    int index = 0;
    void* p = book.ReadLine(nullptr, "000007  Rect_3Pts_H                      RH \t L4  1.500 \t2", index, 0);
    ASSERT_NE(p, nullptr);
    EXPECT_EQ(Dump(1040, p), "RH text=<L4> v1=1.5 v2=2");
    // Option-less reading (appending to a book) reads drawing commands all the same.
    index = 1;
    EXPECT_NE(book.ReadLine(nullptr, "Escalier_3 E3 7", index, 1), nullptr);
    EXPECT_EQ(book.length(), 2);
}

TEST(DrawingRead, PlacementAppendsOrWritesInPlace) {
    CCarnet book;
    book.append(new CLiaison("L1", 0.5), 1042);
    book.append(new CTexte("T", "x"), 1055);
    auto* old = static_cast<CTexte*>(book.ptrAt(1));

    int index = 1;
    void* made = book.ReadLine(nullptr, "Cercle_D CED L1 5", index, 0);
    ASSERT_NE(made, nullptr);
    ASSERT_EQ(book.length(), 2);
    EXPECT_EQ(book.ptrAt(1), made);
    EXPECT_EQ(book.typAt(1), 1036u);
    EXPECT_EQ(DumpAt(book, 0), "L1 v1=0.5");
    // The replaced element is the caller's.
    EXPECT_EQ(old->m_Text, "x");
    delete old;

    index = 2;
    made = book.ReadLine(nullptr, "Sym_Cir_Ray SCR 2.5", index, 0);
    ASSERT_EQ(book.length(), 3);
    EXPECT_EQ(book.ptrAt(2), made);
    EXPECT_EQ(book.typAt(2), 1018u);
}

namespace {

// A book of every kind with values, and further commands of the kinds whose
// lines leave out fields: all of these load back with the same members.
void FillEveryKind(CCarnet& book) {
    const auto add = [&book](auto* command) {
        book.append(command, carnet_drawing::TypeCode<std::remove_pointer_t<decltype(command)>>::value);
    };
    add(new CPointSansOri("P1"));
    add(new CPointAvecOri("P2"));
    add(new COrientationPT("OP"));
    add(new CRAZOrientPT("AOP"));
    add(new COrientationSy("OS"));
    add(new CRAZOrientSy("AOS"));
    add(new CSymSansOri("SSO", 1.5, -2.25));
    add(new CSymCirCenRay("SCR", 2.5));
    add(new CSymCirCenDia("SCD", 0.125));
    add(new CSymCir3Pt("C3P"));
    add(new CSymAvecOri("SAO", 1.5, 2.0));
    add(new CSymOria1("SOX", -1.25));
    add(new CSymCarDia("SCD"));
    add(new CSym2Pt11("S11"));
    add(new CSym2Pt("ARB", 1.5));
    add(new CSym2PtD1("S2X", 2.0));
    add(new CSym2PtD2("S2Y", 3.0));
    add(new CSym3Pth("S3H", 1.0, 0.5));
    add(new CSym3PtD("S3D", 1.0, 0.5));
    add(new CSymComp1("SC1", 1.1));
    add(new CSymComp2("SC2", 1.2));
    add(new CSymComp3("SC3", 1.5, 2.5));
    add(new CSymEntree("SE", 1.0, 2.0, 0.3));
    add(new CSymAligne("ALG", 3));
    add(new CCer1PtR("CER", "L12", 2.5));
    add(new CCer1PtD("CED", "L1", 5.0));
    add(new CCer3Pt("C3", "L2"));
    add(new CCarreDia("CDI", "L3"));
    add(new CCarre2Pt("CAR", "L2", 1.0));
    add(new CRec3Pth("RH", "L4", 1.5, 2.0));
    add(new CRec3PtD("RD", "L5", 1.0, 0.5));
    add(new CLiaison("LI", 0.35));
    add(new CPerpenSegm("PS", 1.5, 2.0));
    add(new CAlignement("AL", 12.0));
    add(new CProlonSegm("PRS", 3.0, 0.25));
    add(new CIntersSegm("IS", 0.1, 0.2));
    add(new CParallele("PAR", "L1", -1.5));
    add(new CEscalier1("E1", 5));
    add(new CEscalier2("E2", 12, 0.8));
    add(new CEscalier3("E3", 7));
    add(new CEscalier4("E4", "L5", 12, 0.8));
    add(new CEscalier5("E5", 0.3));
    add(new CPassagePieton("PP"));
    add(new CPassageVelo("PV"));
    add(new CTexte("TXT", "Mur  de cl\xF4ture"));
    add(new CTexteOrient("TXO", "Rue du Moulin"));
    add(new CCacheAtt("CA"));
    add(new CAddAttSy("AAS", "H=2 m"));
    add(new CAddAttPt("AAP", "50%"));
    add(new CAccrProPt("APP"));
    add(new CAccrProLi("ACL", "L3"));
    add(new CRappelPoint("RP", "P12"));
    add(new CPerpen2Pts("P2P", 0.5));
    add(new CSymetric("SYM", 4.0));
    add(new CInterDist("ID", 5.0, 6.0));
    // Absent numbers written as -999999.000, and fields that are left out.
    add(new CSym2Pt("ARB", U));
    add(new CSymSansOri("SSO", U, 2.0));
    add(new CSymEntree("SE", 1.0, U, 0.3));
    add(new CEscalier5("E5", U));
    add(new CEscalier1("E1", 0));
    add(new CEscalier2("E2", 4, U));
    add(new CEscalier2("E2", 0, U));
    add(new CEscalier4("E4", "L5", 3, U));
    add(new CEscalier4("E4", "L5", 0, 0.8));
    add(new CEscalier4("E4", "", 0, U));
    add(new CCer1PtR("CER", "", U));
    add(new CCer3Pt("C3", ""));
    add(new CRec3Pth("RH", "L4", U, U));
    add(new CRec3Pth("RH", "", U, U));
    add(new CParallele("PAR", "L1", U));
    add(new CSymAligne("ALG", -1));
    add(new CTexte("TXT", ""));
}

}  // namespace

TEST(DrawingRead, ASavedBookOfEveryKindLoadsBackTheSame) {
    drawing_test::ScratchDir dir;
    ASSERT_TRUE(dir.ok());
    const std::string path = dir.File("every.geo");
    const CString params = dir.File("params.ini").c_str();

    CCarnet book;
    FillEveryKind(book);
    std::set<unsigned int> kinds;
    for (int i = 0; i < book.length(); ++i) kinds.insert(book.typAt(i));
    ASSERT_EQ(kinds.size(), 55u);
    book.m_ParamFile = params;
    ASSERT_EQ(book.Save(path.c_str(), nullptr, false), 1);

    CCarnet again;
    CNorvexTxtWnd wnd;
    ASSERT_EQ(again.Load(&wnd, path.c_str(), params, 0, nullptr), 1);
    EXPECT_TRUE(wnd.Texts().empty()) << wnd.Texts()[0];
    ASSERT_EQ(again.length(), book.length());
    for (int i = 0; i < book.length(); ++i) {
        SCOPED_TRACE(LineAt(book, i));
        EXPECT_EQ(again.typAt(i), book.typAt(i));
        EXPECT_EQ(DumpAt(again, i), DumpAt(book, i));
        EXPECT_EQ(LineAt(again, i), LineAt(book, i));
    }
}

TEST(DrawingRead, LinesThatCannotLoadBackAsWritten) {
    struct Case {
        std::function<void*()> make;
        unsigned int type;
        std::string members;  // after reading back; empty: refused with a message
    };
    const std::string dropped = "(dropped without a message)";
    const Case cases[] = {
        // An empty text written between two blanks vanishes: the next field takes its place.
        {[] { return new CParallele("PAR", "", 1.5); }, 1047, "PAR text=<1.500> v1=absent"},
        {[] { return new CEscalier4("E4", "", 3, 0.8); }, 1051, "E4 text=<3> n=0 v1=absent"},
        // Fields left out read back as missing fields.
        {[] { return new CCer1PtR("CER", "", 2.5); }, 1035, "CER text=<> v1=absent"},
        {[] { return new CRec3PtD("RD", "", 1.0, 0.5); }, 1041, "RD text=<> v1=absent v2=absent"},
        {[] { return new CEscalier1("E1", -1); }, 1048, "E1 n=0"},
        {[] { return new CEscalier2("E2", -1, U); }, 1049, "E2 n=0 v1=absent"},
        {[] { return new CEscalier4("E4", "-1", 0, U); }, 1051, "E4 text=<> n=0 v1=absent"},
        // The frame is trimmed, and so is the end of a free text.
        {[] { return new CTexte("TXT", "fin  "); }, 1055, "TXT text=<fin>"},
        // A blank inside the code makes one field more.
        {[] { return new CSym2Pt("A B", 1.5); }, 1025, ""},
        {[] { return new CCer3Pt("C 3", "L1"); }, 1037, dropped},
        {[] { return new CTexte("T X", "a"); }, 1055, "T text=<X  a>"},
        // An empty code leaves no field at all; so does an empty linked point.
        {[] { return new CPointSansOri(""); }, 1011, ""},
        {[] { return new CRappelPoint("RP", ""); }, 1062, ""},
    };
    for (const Case& c : cases) {
        CCarnet book;
        book.append(c.make(), c.type);
        const std::string line = LineAt(book, 0);
        SCOPED_TRACE(line);
        int index = 1;
        CNorvexTxtWnd wnd;
        void* p = book.ReadLine(&wnd, line.c_str(), index, 0);
        if (c.members == dropped) {
            EXPECT_EQ(p, nullptr);
            EXPECT_EQ(book.length(), 1);
            EXPECT_TRUE(wnd.Texts().empty());
        } else if (c.members.empty()) {
            EXPECT_EQ(p, nullptr);
            EXPECT_EQ(book.length(), 1);
            ASSERT_EQ(wnd.Texts().size(), 2u);
            EXPECT_EQ(wnd.Texts()[0].substr(0, 30), "Erreur ligne 2 : commande <" + line.substr(0, 3));
        } else {
            ASSERT_NE(p, nullptr);
            EXPECT_EQ(book.typAt(1), c.type);
            EXPECT_EQ(Dump(c.type, p), c.members);
        }
    }
}

TEST(DrawingRead, CommandTurnsIntoACommentAndBack) {
    CCarnet book;
    book.append(new CPointGen("P1", 1.0, 2.0, "arbre"), 1006);
    book.append(new CRec3PtD("RD", "L5", 1.25, -0.5), 1041);
    book.append(new CTexteOrient("TXO", "Rue  du Moulin"), 1056);
    book.append(new CEscalier4("E4", "L5", 12, 0.8), 1051);
    book.append(new CSymEntree("SE", 1.0, U, 0.3), 1033);
    book.append(new CSym2Pt("A B", 1.5), 1025);  // its line does not read back
    for (int i = 1; i < book.length(); ++i) {
        SCOPED_TRACE(i);
        const unsigned int type = book.typAt(i);
        const std::string members = DumpAt(book, i);
        const std::string line = LineAt(book, i);
        CNorvexTxtWnd wnd;
        book.changeObjectIntoComment(&wnd, i);
        ASSERT_EQ(book.typAt(i), 1000u);
        EXPECT_EQ(book.parAt(i), CString(line.c_str()));
        book.changeCommentIntoObject(&wnd, i);
        if (i == book.length() - 1) {
            EXPECT_EQ(book.typAt(i), 1000u);
            ASSERT_EQ(wnd.Texts().size(), 2u);
            EXPECT_EQ(wnd.Texts()[0], Incomplete(i + 1, "Sym_2Pts"));
            continue;
        }
        EXPECT_TRUE(wnd.Texts().empty());
        ASSERT_EQ(book.typAt(i), type);
        EXPECT_EQ(DumpAt(book, i), members);
        EXPECT_EQ(LineAt(book, i), line);
    }
    EXPECT_EQ(book.length(), 6);
    EXPECT_EQ(book.typAt(0), 1006u);
}
