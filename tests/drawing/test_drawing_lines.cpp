// File lines and display texts of the 55 drawing commands, alone and in a book.
#include <gtest/gtest.h>

#include <cstdio>
#include <functional>
#include <set>
#include <string>
#include <vector>

#include <carnet/carnet.h>

#include "core/dispatch_internal.h"

namespace {

constexpr double U = UNDEF_VALUE;

// A command of one kind, its expected file line and display text.
struct TextCase {
    unsigned int type;
    std::string line;
    std::string params;
    std::function<std::string()> infos;
    std::function<std::string()> display;
    std::function<void*()> make;  // a heap copy, for a book
};

template <class T>
TextCase Case(const T& cmd, std::string line, std::string params) {
    TextCase c;
    c.type = carnet_drawing::TypeCode<T>::value;
    c.line = std::move(line);
    c.params = std::move(params);
    c.infos = [cmd] {
        CString s("left over");
        cmd.Infos(s);
        return s.str();
    };
    c.display = [cmd] {
        CString s("left over");
        cmd.Params(s);
        return s.str();
    };
    c.make = [cmd]() -> void* { return new T(cmd); };
    return c;
}

// The frame of every drawing-command line: keyword in 16 columns, 18 blanks,
// then the code and the fields.
std::string L(const char* keyword, const std::string& rest) {
    std::string s = keyword;
    s.resize(16, ' ');
    return s + std::string(18, ' ') + rest;
}

// Keywords and labels as the file and the host know them (code page 1252).
const char* const kDefOriPT = "D\xE9" "f_Ori_PT";
const char* const kDefOriSY = "D\xE9" "f_Ori_SY";
const char* const kSymOriente = "Sym_Orient\xE9";
const char* const kSymEntree = "Sym_Entr\xE9" "e";
const char* const kCarreDia = "Carr\xE9" "_Dia";
const char* const kCarre2Pts = "Carr\xE9" "_2Pts";
const char* const kParallele = "Parall\xE8" "le";
const char* const kPieton = "Passage_Pi\xE9" "ton";
const char* const kVelo = "Passage_V\xE9" "lo";
const char* const kTexteOriente = "Texte_Orient\xE9";
const char* const kSymetrique = "Sym\xE9" "trique";
const std::string kDiametre = "Diam\xE8" "tre";
const std::string kDeport = "D\xE9" "port";
const std::string kDecalage = "D\xE9" "calage";
const std::string kCote = "Cot\xE9";
const std::string kRepetition = "R\xE9p\xE9" "tition";

// The first case of each type is its typical value set; the others are the
// absent and empty cases its rules tell apart.
std::vector<TextCase> TextCases() {
    const std::string absent = "-999999.000";
    const std::string twoAbsent = "  " + absent + "  " + absent;
    return {
        // Code only.
        Case(CPointSansOri("P1"), L("PT_Sans_Ori", "P1"), "Code = P1"),
        Case(CPointSansOri(), L("PT_Sans_Ori", ""), "Code = "),
        Case(CPointAvecOri("P2"), L("PT_Avec_Ori", "P2"), "Code = P2"),
        Case(COrientationPT("OP"), L(kDefOriPT, "OP"), "Code = OP"),
        Case(CRAZOrientPT("AOP"), L("Annul_Ori_PT", "AOP"), "Code = AOP"),
        Case(COrientationSy("OS"), L(kDefOriSY, "OS"), "Code = OS"),
        Case(CRAZOrientSy("AOS"), L("Annul_Ori_SY", "AOS"), "Code = AOS"),
        Case(CSymCir3Pt("C3P"), L("Sym_Cir_3Pt", "C3P"), "Code = C3P"),
        Case(CSymCarDia("SCD"), L("Sym_Car_Dia", "SCD"), "Code = SCD"),
        Case(CSym2Pt11("S11"), L("Sym_Fixe_2Pt", "S11"), "Code = S11"),
        Case(CPassagePieton("PP"), L(kPieton, "PP"), "Code = PP"),
        Case(CPassageVelo("PV"), L(kVelo, "PV"), "Code = PV"),
        Case(CCacheAtt("CA"), L("Cache_Attrib", "CA"), "Code = CA"),
        Case(CAccrProPt("APP"), L("Accro_Pt_Pro", "APP"), "Code = APP"),

        // One number: always written (absent as -999999.000), shown when given.
        Case(CSymCirCenRay("SCR", 2.5), L("Sym_Cir_Ray", "SCR  2.500"), "Code = SCR , Rayon = 2.500"),
        Case(CSymCirCenRay("SCR"), L("Sym_Cir_Ray", "SCR  " + absent), "Code = SCR"),
        Case(CSymCirCenDia("SCD", 0.0), L("Sym_Cir_Dia", "SCD  0.000"), "Code = SCD , " + kDiametre + " = 0.000"),
        Case(CSymOria1("SOX", -1.25), L("Sym_Ori_EX", "SOX  -1.250"), "Code = SOX , Ech X = -1.250"),
        Case(CSym2Pt("ARB", 1.5), L("Sym_2Pts", "ARB  1.500"), "Code = ARB , Ech = 1.500"),
        Case(CSym2Pt("ARB"), L("Sym_2Pts", "ARB  " + absent), "Code = ARB"),
        Case(CSym2PtD1("S2X", 2.0), L("Sym_2Pt_EX", "S2X  2.000"), "Code = S2X , Ech X = 2.000"),
        Case(CSym2PtD2("S2Y", 3.0), L("Sym_2Pt_EY", "S2Y  3.000"), "Code = S2Y , Ech Y = 3.000"),
        Case(CSymComp1("SC1", 1.1), L("Sym_Comp_1", "SC1  1.100"), "Code = SC1 , Ech = 1.100"),
        Case(CSymComp2("SC2", 1.2), L("Sym_Comp_2", "SC2  1.200"), "Code = SC2 , Ech 1 = 1.200"),
        Case(CLiaison("LI", 0.35), L("Liaison", "LI  0.350"), "Code = LI , Epaisseur = 0.350"),
        Case(CLiaison("LI"), L("Liaison", "LI  " + absent), "Code = LI"),
        Case(CAlignement("AL", 12.0), L("Alignement", "AL  12.000"), "Code = AL , Distance = 12.000"),
        Case(CAlignement("AL", U), L("Alignement", "AL  " + absent), "Code = AL"),
        Case(CEscalier5("E5", 0.3), L("Escalier_5", "E5  0.300"), "Code = E5 , Largeur marche = 0.300"),
        Case(CEscalier5("E5", U), L("Escalier_5", "E5"), "Code = E5"),
        Case(CPerpen2Pts("P2P", 0.5), L("Perp_2Pts", "P2P  0.500"), "Code = P2P , " + kDeport + " = 0.500"),
        Case(CSymetric("SYM", 4.0), L(kSymetrique, "SYM  4.000"), "Code = SYM , Distance = 4.000"),

        // Two numbers: always both written; the display depends on which are given.
        Case(CSymSansOri("SSO", 1.5, 2.0), L("Sym_sans_Ori", "SSO  1.500  2.000"),
             "Code = SSO , Ech X = 1.500 , Ech Y = 2.000"),
        Case(CSymSansOri("SSO", 1.5), L("Sym_sans_Ori", "SSO  1.500  " + absent), "Code = SSO , Ech X = 1.500"),
        Case(CSymSansOri("SSO"), L("Sym_sans_Ori", "SSO" + twoAbsent), "Code = SSO"),
        Case(CSymSansOri("SSO", U, 2.0), L("Sym_sans_Ori", "SSO  " + absent + "  2.000"), "Code = SSO"),
        Case(CSymAvecOri("SAO", 1.5, 2.0), L(kSymOriente, "SAO  1.500  2.000"),
             "Code = SAO , Ech X = 1.500 , Ech Y = 2.000"),
        Case(CSymAvecOri("SAO", 1.5), L(kSymOriente, "SAO  1.500  " + absent), "Code = SAO , Ech = 1.500"),
        Case(CSym3Pth("S3H", 1.0, 0.5), L("Sym_3Pts_H", "S3H  1.000  0.500"),
             "Code = S3H , Ech X = 1.000 , Ech Y = 0.500"),
        Case(CSym3Pth("S3H", 1.0), L("Sym_3Pts_H", "S3H  1.000  " + absent), "Code = S3H , Ech = 1.000"),
        Case(CSym3PtD("S3D", 1.0, 0.5), L("Sym_3Pts_D", "S3D  1.000  0.500"),
             "Code = S3D , Ech X = 1.000 , Ech Y = 0.500"),
        Case(CSym3PtD("S3D", 1.0), L("Sym_3Pts_D", "S3D  1.000  " + absent), "Code = S3D , Ech = 1.000"),
        Case(CSymComp3("SC3", 1.5, 2.5), L("Sym_Comp_3", "SC3  1.500  2.500"),
             "Code = SC3 , Ech 1 = 1.500 , Ech 2 = 2.500"),
        Case(CSymComp3("SC3", 1.5), L("Sym_Comp_3", "SC3  1.500  " + absent), "Code = SC3 , Ech 2 = 1.500"),
        Case(CPerpenSegm("PS", 1.5, 2.0), L("Perp_Segment", "PS  1.500  2.000"),
             "Code = PS , " + kDeport + " = 1.500 , Prolongement = 2.000"),
        Case(CPerpenSegm("PS", 1.5, U), L("Perp_Segment", "PS  1.500  " + absent),
             "Code = PS , " + kDeport + " = 1.500"),
        Case(CPerpenSegm("PS", U, 2.0), L("Perp_Segment", "PS  " + absent + "  2.000"), "Code = PS"),
        Case(CProlonSegm("PRS", 3.0, 0.25), L("Prol_Segment", "PRS  3.000  0.250"),
             "Code = PRS , Prolongement = 3.000 , " + kDeport + " = 0.250"),
        Case(CProlonSegm("PRS", 3.0, U), L("Prol_Segment", "PRS  3.000  " + absent),
             "Code = PRS , Prolongement = 3.000"),
        Case(CIntersSegm("IS", 0.1, 0.2), L("Inter_Segment", "IS  0.100  0.200"),
             "Code = IS , " + kDecalage + " 1 = 0.100 , " + kDecalage + " 2 = 0.200"),
        Case(CIntersSegm("IS", 0.1), L("Inter_Segment", "IS  0.100  " + absent),
             "Code = IS , " + kDecalage + " 1 = 0.100"),
        Case(CInterDist("ID", 5.0, 6.0), L("Inter_Dist", "ID  5.000  6.000"),
             "Code = ID , Distance1 = 5.000 , Distance2 = 6.000"),
        Case(CInterDist("ID", 5.0, U), L("Inter_Dist", "ID  5.000  " + absent), "Code = ID"),
        Case(CInterDist("ID", U, 6.0), L("Inter_Dist", "ID  " + absent + "  6.000"), "Code = ID"),

        // Three numbers: one blank only before the third.
        Case(CSymEntree("SE", 1.0, 2.0, 0.3), L(kSymEntree, "SE  1.000  2.000 0.300"),
             "Code = SE , Ech X = 1.000 , Ech Y = 2.000 , Seuil = 0.300"),
        Case(CSymEntree("SE", 1.0, 2.0), L(kSymEntree, "SE  1.000  2.000 " + absent),
             "Code = SE , Ech X = 1.000 , Ech Y = 2.000"),
        Case(CSymEntree("SE", 1.0), L(kSymEntree, "SE  1.000  " + absent + " " + absent), "Code = SE , Ech = 1.000"),
        Case(CSymEntree("SE", 1.0, U, 0.3), L(kSymEntree, "SE  1.000  " + absent + " 0.300"),
             "Code = SE , Ech X = 1.000 , Ech Y = " + absent + " , Seuil = 0.300"),
        Case(CSymEntree("SE", U, 2.0, 0.3), L(kSymEntree, "SE  " + absent + "  2.000 0.300"), "Code = SE"),

        // A count.
        Case(CSymAligne("ALG", 3), L("Sym_Aligne", "ALG  3"), "Code = ALG , " + kRepetition + " = 3"),
        Case(CSymAligne("ALG", 0), L("Sym_Aligne", "ALG  0"), "Code = ALG , " + kRepetition + " = 0"),
        Case(CSymAligne("ALG", -1), L("Sym_Aligne", "ALG  -1"), "Code = ALG"),
        Case(CEscalier1("E1", 5), L("Escalier_1", "E1  5"), "Code = E1 , Marches = 5"),
        Case(CEscalier1("E1", 0), L("Escalier_1", "E1"), "Code = E1"),
        Case(CEscalier1("E1", -1), L("Escalier_1", "E1"), "Code = E1"),
        Case(CEscalier3("E3", 7), L("Escalier_3", "E3  7"), "Code = E3 , Marches = 7"),
        Case(CEscalier3("E3", 0), L("Escalier_3", "E3"), "Code = E3"),

        // A count and a width.
        Case(CEscalier2("E2", 12, 0.8), L("Escalier_2", "E2  12  0.800"), "Code = E2 , Marches = 12 , Largeur = 0.800"),
        Case(CEscalier2("E2", 0, U), L("Escalier_2", "E2"), "Code = E2"),
        Case(CEscalier2("E2", -1, 0.8), L("Escalier_2", "E2  -1  0.800"), "Code = E2"),
        Case(CEscalier2("E2", 4, U), L("Escalier_2", "E2  4"), "Code = E2 , Marches = 4"),

        // A linked line and a number.
        Case(CCer1PtR("CER", "L12", 2.5), L("Cercle_R", "CER  L12  2.500"),
             "Code = CER , Liaison = L12 , Rayon = 2.500"),
        Case(CCer1PtR("CER", "", 2.5), L("Cercle_R", "CER"), "Code = CER , Rayon = 2.500"),
        Case(CCer1PtR("CER", "L12"), L("Cercle_R", "CER  L12  " + absent), "Code = CER , Liaison = L12"),
        Case(CCer1PtR("CER"), L("Cercle_R", "CER"), "Code = CER"),
        Case(CCer1PtD("CED", "L1", 5.0), L("Cercle_D", "CED  L1  5.000"),
             "Code = CED , Liaison = L1 , " + kDiametre + " = 5.000"),
        Case(CCer1PtD("CED", "", 5.0), L("Cercle_D", "CED"), "Code = CED , " + kDiametre + " = 5.000"),
        Case(CCarre2Pt("CAR", "L2", 1.0), L(kCarre2Pts, "CAR  L2  1.000"),
             "Code = CAR , Liaison = L2 , " + kCote + " = 1.000"),
        Case(CCarre2Pt("CAR", "", 1.0), L(kCarre2Pts, "CAR"), "Code = CAR , " + kCote + " = 1.000"),
        Case(CParallele("PAR", "L1", 1.5), L(kParallele, "PAR  L1  1.500"),
             "Code = PAR , Liaison = L1 , " + kDecalage + " = 1.500"),
        Case(CParallele("PAR", "", 1.5), L(kParallele, "PAR    1.500"), "Code = PAR"),
        Case(CParallele("PAR", "L1"), L(kParallele, "PAR  L1  " + absent), "Code = PAR , Liaison = L1"),

        // A text.
        Case(CCer3Pt("C3", "L2"), L("Cercle_3Pts", "C3  L2"), "Code = C3 , Liaison = L2"),
        Case(CCer3Pt("C3"), L("Cercle_3Pts", "C3"), "Code = C3"),
        Case(CCarreDia("CDI", "L3"), L(kCarreDia, "CDI  L3"), "Code = CDI , Liaison = L3"),
        Case(CCarreDia("CDI"), L(kCarreDia, "CDI"), "Code = CDI"),
        Case(CTexte("TXT", "Mur  de cl\xF4ture"), L("Texte_1Pt", "TXT  Mur  de cl\xF4ture"),
             "Code = TXT , Texte = <Mur  de cl\xF4ture>"),
        Case(CTexte("TXT", ""), L("Texte_1Pt", "TXT  "), "Code = TXT"),
        Case(CTexteOrient("TXO", "Rue"), L(kTexteOriente, "TXO  Rue"), "Code = TXO , Texte = <Rue>"),
        Case(CAddAttSy("AAS", "H=2"), L("Ajout_Attrib", "AAS  H=2"), "Code = AAS , Texte = <H=2>"),
        Case(CAddAttPt("AAP", "50%"), L("Attrib_Point", "AAP  50%"), "Code = AAP , Texte = <50%>"),
        Case(CAccrProLi("ACL", "L3"), L("Accro_Li_Pro", "ACL  L3"), "Code = ACL , Liaison = L3"),
        Case(CAccrProLi("ACL", ""), L("Accro_Li_Pro", "ACL  "), "Code = ACL"),
        Case(CRappelPoint("RP", "P12"), L("Rappel_Point", "RP  P12"), "Code = RP , Point = P12"),
        Case(CRappelPoint("RP", ""), L("Rappel_Point", "RP  "), "Code = RP"),

        // A linked line and two scales: nothing written without the line.
        Case(CRec3Pth("RH", "L4", 1.5, 2.0), L("Rect_3Pts_H", "RH  L4  1.500  2.000"),
             "Code = RH , Liaison = L4 , Ech X = 1.500 , Ech Y = 2.000"),
        Case(CRec3Pth("RH", "", 1.5), L("Rect_3Pts_H", "RH"), "Code = RH , Ech X = 1.500"),
        Case(CRec3Pth("RH", "L4"), L("Rect_3Pts_H", "RH  L4" + twoAbsent), "Code = RH , Liaison = L4"),
        Case(CRec3PtD("RD", "L5", 1.0, 0.5), L("Rect_3Pts_D", "RD  L5  1.000  0.500"),
             "Code = RD , Liaison = L5 , Ech X = 1.000 , Ech Y = 0.500"),
        Case(CRec3PtD("RD", "", U, 0.5), L("Rect_3Pts_D", "RD"), "Code = RD"),

        // A linked line, a count and a width.
        Case(CEscalier4("E4", "L5", 12, 0.8), L("Escalier_4", "E4  L5  12  0.800"),
             "Code = E4 , Liaison = L5 , Marches = 12 , Largeur = 0.800"),
        Case(CEscalier4("E4", "L5", 3, U), L("Escalier_4", "E4  L5  3"), "Code = E4 , Liaison = L5 , Marches = 3"),
        Case(CEscalier4("E4", "L5", 0, 0.8), L("Escalier_4", "E4  L5  0  0.800"), "Code = E4 , Liaison = L5"),
        Case(CEscalier4("E4", "L5", -1, U), L("Escalier_4", "E4  L5  -1"), "Code = E4 , Liaison = L5"),
        Case(CEscalier4("E4", "", 3, 0.8), L("Escalier_4", "E4    3  0.800"), "Code = E4"),
        Case(CEscalier4("E4", "-1", 0, U), L("Escalier_4", "E4"), "Code = E4 , Liaison = -1"),
        Case(CEscalier4("E4", "", 0, U), L("Escalier_4", "E4  "), "Code = E4"),
    };
}

// The typical case of every type, in type order.
std::vector<const TextCase*> Typical(const std::vector<TextCase>& cases) {
    std::vector<const TextCase*> out;
    for (unsigned int t = CARNET_FIRST_DRAWING_TYPE; t <= CARNET_LAST_TYPE; ++t)
        for (const TextCase& c : cases)
            if (c.type == t) {
                out.push_back(&c);
                break;
            }
    return out;
}

std::string ReadAll(std::FILE* f) {
    std::rewind(f);
    std::string s;
    int c;
    while ((c = std::fgetc(f)) != EOF) s += static_cast<char>(c);
    return s;
}

}  // namespace

TEST(DrawingLines, EveryTypeHasItsLineAndDisplayText) {
    const std::vector<TextCase> cases = TextCases();
    std::set<unsigned int> seen;
    for (const TextCase& c : cases) {
        SCOPED_TRACE(testing::Message() << "type " << c.type << ", line " << c.line);
        EXPECT_EQ(c.infos(), c.line);
        EXPECT_EQ(c.display(), c.params);
        seen.insert(c.type);
    }
    EXPECT_EQ(seen.size(), 55u);
    EXPECT_EQ(*seen.begin(), 1011u);
    EXPECT_EQ(*seen.rbegin(), 1065u);
}

TEST(DrawingLines, LongestKeywordsFitTheColumn) {
    const std::string blanks18(18, ' ');
    CString s;
    CPassagePieton("PP").Infos(s);
    EXPECT_EQ(s.str(), "Passage_Pi\xE9" "ton  " + blanks18 + "PP");
    CIntersSegm("IS", 1.0, 2.0).Infos(s);
    EXPECT_EQ(s.str(), "Inter_Segment   " + blanks18 + "IS  1.000  2.000");
    CTexteOrient("TO", "a b").Infos(s);
    EXPECT_EQ(s.str(), "Texte_Orient\xE9   " + blanks18 + "TO  a b");
    // Blanks inside the code and the text are written as they stand.
    CCer3Pt("C 3", "L 1").Infos(s);
    EXPECT_EQ(s.str(), "Cercle_3Pts     " + blanks18 + "C 3  L 1");
}

TEST(DrawingLines, PrintAndWriteSendTheLineWithItsNumber) {
    const CSym2Pt cmd("A%sB", 1.5);  // a '%' in the code must print as itself
    const std::string line = L("Sym_2Pts", "A%sB  1.500");
    CNorvexTxtWnd wnd;
    cmd.Print(&wnd, 0);
    cmd.Print(&wnd, 12);
    cmd.Print(&wnd, -3);
    cmd.Print(nullptr, 5);
    ASSERT_EQ(wnd.Texts().size(), 3u);
    EXPECT_EQ(wnd.Texts()[0], line);
    EXPECT_EQ(wnd.Texts()[1], "000012  " + line);
    EXPECT_EQ(wnd.Texts()[2], line);

    std::FILE* f = std::tmpfile();
    ASSERT_NE(f, nullptr);
    cmd.Write(f, 0);
    cmd.Write(f, 1234567);
    EXPECT_EQ(ReadAll(f), line + "\n1234567  " + line + "\n");
    std::fclose(f);
}

TEST(DrawingLines, ABookOfEveryKindListsWritesCopiesAndFreesThem) {
    const std::vector<TextCase> cases = TextCases();
    const std::vector<const TextCase*> typical = Typical(cases);
    ASSERT_EQ(typical.size(), 55u);

    CCarnet book;
    for (const TextCase* c : typical) book.append(c->make(), c->type);
    // Codes longer than any short-string buffer: a destructor that did not
    // run would leak them under the sanitizers.
    book.append(new CSymEntree("a code long enough to live on the heap", 1.0, 2.0, 3.0), 1033);
    book.append(new CEscalier4("another long code for the heap check", "a long linked line name", 3, 0.5), 1051);

    std::string listing;
    for (int i = 0; i < 55; ++i)
        listing += numconv::Format("%06d  ", i + 1) + typical[static_cast<size_t>(i)]->line + "\n";

    CNorvexTxtWnd wnd;
    book.Print(&wnd, 1);
    ASSERT_EQ(wnd.Texts().size(), 57u);
    std::string printed;
    for (int i = 0; i < 55; ++i) printed += wnd.Texts()[static_cast<size_t>(i)] + "\n";
    EXPECT_EQ(printed, listing);

    std::FILE* f = std::tmpfile();
    ASSERT_NE(f, nullptr);
    for (int i = 0; i < 55; ++i) book.writeAt(i, f, i + 1);
    EXPECT_EQ(ReadAll(f), listing);
    std::fclose(f);

    // The display texts through the dispatch, and copies of every kind.
    for (int i = 0; i < 55; ++i) {
        const ElementOps* ops = ElementOpsFor(book.typAt(i));
        ASSERT_NE(ops, nullptr);
        ASSERT_NE(ops->params, nullptr);
        CString text;
        ops->params(book.ptrAt(i), text);
        EXPECT_EQ(text.str(), typical[static_cast<size_t>(i)]->params);
        EXPECT_EQ(ops->np, nullptr);
        EXPECT_EQ(ops->sy, nullptr);
    }
    CCarnet copy;
    copy = book;
    ASSERT_EQ(copy.length(), book.length());
    for (int i = 0; i < book.length(); ++i) EXPECT_NE(copy.ptrAt(i), book.ptrAt(i));
    CNorvexTxtWnd copied;
    copy.Print(&copied, 1);
    EXPECT_EQ(copied.Texts(), wnd.Texts());

    void* one = book.copyElement(56, 0);
    ASSERT_NE(one, nullptr);
    EXPECT_EQ(book.typAt(0), 1051u);
    EXPECT_EQ(static_cast<CEscalier4*>(one)->m_Text, "a long linked line name");
    book.removeAt(0, 1);
    book.removeAt(3, 1);
    EXPECT_EQ(book.length(), 56);
}
