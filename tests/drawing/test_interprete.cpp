// Interprete: a code string typed in the field, cut with a separator into the
// members of each of the 55 drawing commands.
#include <gtest/gtest.h>

#include <functional>
#include <set>
#include <string>
#include <type_traits>
#include <utility>

#include <carnet/carnet.h>

#include "drawing_dump.h"

namespace {

const char* const kSign = "\xB1";  // the sign mode

template <class T, class = void>
struct TakesCode : std::false_type {};
template <class T>
struct TakesCode<T, std::void_t<decltype(std::declval<T&>().Interprete(CString(), CString(),
                                                                         static_cast<const CCode*>(nullptr)))>>
    : std::true_type {};

using Result = std::pair<bool, std::string>;  // Interprete's result, the members after it

template <class T>
Result Interpret(T& command, const char* text, const char* sep, const CCode* code) {
    bool ok;
    if constexpr (TakesCode<T>::value)
        ok = command.Interprete(text, sep, code);
    else
        ok = command.Interprete(text, sep);
    return {ok, drawing_test::DumpOf(command)};
}

struct Case {
    unsigned int type;
    const char* text;
    const char* sep;
    bool ok;
    std::string members;
    std::function<Result(const CCode*)> run;
};

template <class T>
Case C(const char* text, const char* sep, bool ok, std::string members) {
    Case c{carnet_drawing::TypeCode<T>::value, text, sep, ok, std::move(members), nullptr};
    c.run = [text, sep](const CCode* code) {
        T command;
        return Interpret(command, text, sep, code);
    };
    return c;
}

CCode Decimals(int n) {
    CCode code;
    code.m_Decimals = n;
    return code;
}

}  // namespace

TEST(Interprete, EveryClassWithTwoDecimals) {
    const Case cases[] = {
        // Code only, read with the keep flag.
        C<CPointSansOri>("P1+X", kSign, true, "P1"),
        C<CPointAvecOri>("", kSign, false, ""),
        C<COrientationPT>("-OP+1", kSign, true, "-OP+1"),
        C<CRAZOrientPT>("AOP/1", "/", true, "AOP"),
        C<COrientationSy>("OS", "/", true, "OS"),
        C<CRAZOrientSy>("/OS", "/", true, "/OS"),
        C<CSymCir3Pt>("C3P", kSign, true, "C3P"),
        C<CSymCarDia>("SCD", "/", true, "SCD"),
        C<CSym2Pt11>("S11+2", kSign, true, "S11"),
        C<CPassagePieton>("PP", "/", true, "PP"),
        C<CPassageVelo>("", "/", false, ""),
        C<CCacheAtt>("CA", kSign, true, "CA"),
        C<CAccrProPt>("APP", kSign, true, "APP"),
        // One number: the sign after the code stays with it.
        C<CSymCirCenRay>("SCR/250", "/", true, "SCR v1=2.5"),
        C<CSymCirCenDia>("SCD+0", kSign, true, "SCD v1=absent"),
        C<CSymOria1>("SOX+125", kSign, true, "SOX v1=1.25"),
        C<CSym2Pt>("-ARB+150", kSign, true, "-ARB+150 v1=absent"),
        C<CSym2PtD1>("S2X/200", "/", true, "S2X v1=2"),
        C<CSym2PtD2>("S2Y+300", kSign, true, "S2Y v1=3"),
        C<CSymComp1>("SC1+110", kSign, true, "SC1 v1=1.1"),
        C<CSymComp2>("SC2-120", kSign, true, "SC2 v1=-1.2"),
        C<CLiaison>("LI+035", kSign, true, "LI v1=0.35"),
        C<CAlignement>("AL+1200", kSign, true, "AL v1=12"),
        C<CPerpen2Pts>("P2P+050", kSign, true, "P2P v1=0.5"),
        C<CSymetric>("SYM/400", "/", true, "SYM v1=4"),
        C<CLiaison>("", "/", false, " v1=absent"),
        // The stair width loses the sign typed after its code.
        C<CEscalier5>("E5-30", kSign, true, "E5 v1=0.3"),
        // Two and three numbers.
        C<CSymSansOri>("ARB+150-075", kSign, true, "ARB v1=1.5 v2=-0.75"),
        C<CSymAvecOri>("SAO-150+000", kSign, true, "SAO v1=-1.5 v2=absent"),
        C<CSym3Pth>("S3H+100+050", kSign, true, "S3H v1=1 v2=0.5"),
        C<CSym3PtD>("S3D/100", "/", true, "S3D v1=1 v2=absent"),
        C<CSymComp3>("SC3+150+250", kSign, true, "SC3 v1=1.5 v2=2.5"),
        C<CPerpenSegm>("PS+150", kSign, true, "PS v1=1.5 v2=absent"),
        C<CProlonSegm>("PRS+300+025", kSign, true, "PRS v1=3 v2=0.25"),
        C<CIntersSegm>("IS-010-020", kSign, true, "IS v1=-0.1 v2=-0.2"),
        C<CSymEntree>("SE+100-200+030", kSign, true, "SE v1=1 v2=-2 v3=0.3"),
        C<CSymEntree>("SE/100", "/", true, "SE v1=1 v2=absent v3=absent"),
        // Both distances are needed.
        C<CInterDist>("ID+500+600", kSign, true, "ID v1=5 v2=6"),
        C<CInterDist>("ID+500", kSign, false, "ID v1=5 v2=absent"),
        C<CInterDist>("ID+0+600", kSign, false, "ID v1=absent v2=6"),
        // Counts: the separator after the code is dropped; 0 means not typed.
        C<CSymAligne>("ALG+3", kSign, true, "ALG n=3"),
        C<CSymAligne>("ALG+0", kSign, true, "ALG n=-1"),
        C<CEscalier1>("E1+5", kSign, true, "E1 n=5"),
        C<CEscalier3>("E3", kSign, true, "E3 n=-1"),
        C<CEscalier2>("ESC+12+80", kSign, true, "ESC n=12 v1=0.8"),
        C<CEscalier2>("E2+000+0", kSign, true, "E2 n=-1 v1=absent"),
        C<CEscalier4>("E4+L5+12+80", kSign, true, "E4 text=<L5> n=12 v1=0.8"),
        C<CEscalier4>("E4/L5", "/", true, "E4 text=<L5> n=-1 v1=absent"),
        // A linked line and numbers.
        C<CCer1PtR>("CER/L12/250", "/", true, "CER text=<L12> v1=2.5"),
        C<CCer1PtD>("CED+L1+500", kSign, true, "CED text=<L1> v1=5"),
        C<CCarre2Pt>("CAR/L2/100", "/", true, "CAR text=<L2> v1=1"),
        C<CParallele>("PAR/L1/-150", "/", true, "PAR text=<L1> v1=-1.5"),
        C<CRec3Pth>("RH+L4+150+200", kSign, true, "RH text=<L4> v1=1.5 v2=2"),
        C<CRec3PtD>("RD/L5/100", "/", true, "RD text=<L5> v1=1 v2=absent"),
        C<CRec3PtD>("", "/", false, " text=<> v1=absent v2=absent"),
        // A text.
        C<CCer3Pt>("C3/L2", "/", true, "C3 text=<L2>"),
        C<CCarreDia>("CDI", "/", true, "CDI text=<>"),
        C<CAccrProLi>("ACL/L3", "/", true, "ACL text=<L3>"),
        C<CAccrProLi>("ACL", "/", false, "ACL text=<>"),
        C<CRappelPoint>("RP+P12", kSign, true, "RP text=<P12>"),
        C<CRappelPoint>("RP", kSign, false, "RP text=<>"),
        // Free texts: the tokens after the code, joined without their separators.
        C<CTexte>("TXT/Mur/de/cl\xF4ture", "/", true, "TXT text=<Murdecl\xF4ture>"),
        C<CTexteOrient>("TXO+a-b", kSign, true, "TXO text=<ab>"),
        C<CAddAttSy>("AAS", "/", true, "AAS text=<>"),
        C<CAddAttPt>("/AAP/x", "/", true, "/AAP/x text=<>"),
        C<CAddAttPt>("AAP//x", "/", true, "AAP text=</x>"),
    };
    std::set<unsigned int> kinds;
    const CCode two = Decimals(2);
    for (const Case& c : cases) {
        SCOPED_TRACE(testing::Message() << "type " << c.type << ", text " << c.text);
        const Result r = c.run(&two);
        EXPECT_EQ(r.first, c.ok);
        EXPECT_EQ(r.second, c.members);
        kinds.insert(c.type);
    }
    EXPECT_EQ(kinds.size(), 55u);
}

TEST(Interprete, SeparatorEdgeCases) {
    const Case cases[] = {
        // A separator at the start of what is left does not cut it.
        C<CCer1PtR>("CER//250", "/", true, "CER text=</250> v1=absent"),
        C<CCer1PtR>("/CER/L1", "/", true, "/CER/L1 text=<> v1=absent"),
        // A separator of several characters cuts at its first occurrence and
        // drops only its first character.
        C<CCer1PtR>("CER::L12::250", "::", true, "CER text=<:L12> v1=absent"),
        C<CCer1PtR>("CER::L12:250", "::", true, "CER text=<:L12:250> v1=absent"),
        // An empty separator never cuts.
        C<CCer1PtR>("CER/L1", "", true, "CER/L1 text=<> v1=absent"),
        // Only the one byte 0xB1 is the sign mode: '+' cuts like any separator,
        // and the two-byte form of the sign is a separator of two characters.
        C<CSymSansOri>("ARB+150-075", "+", true, "ARB v1=1.5 v2=absent"),
        C<CSym2Pt>("ARB+150", "\xC2\xB1", true, "ARB+150 v1=absent"),
        // A '+' at the start cuts nothing, but a later '-' still cuts.
        C<CSym2Pt>("+ARB-150", kSign, true, "+ARB v1=-1.5"),
        C<CSym2Pt>("+ARB", kSign, true, "+ARB v1=absent"),
        // Signs inside the linked line: with the keep flag the sign starts the number.
        C<CCer1PtR>("CER+L-100+250", kSign, true, "CER text=<L> v1=-1"),
    };
    const CCode two = Decimals(2);
    for (const Case& c : cases) {
        SCOPED_TRACE(testing::Message() << "text " << c.text << ", separator " << c.sep);
        const Result r = c.run(&two);
        EXPECT_EQ(r.first, c.ok);
        EXPECT_EQ(r.second, c.members);
    }
}

TEST(Interprete, ImpliedDecimalsOfTheCodeEntry) {
    struct Dec {
        const CCode* code;
        const char* text;
        std::string members;
    };
    const CCode zero = Decimals(0), three = Decimals(3), minusOne = Decimals(-1), huge = Decimals(400),
                tiny = Decimals(-400);
    const Dec cases[] = {
        {&zero, "ARB+150", "ARB v1=150"},
        {&three, "ARB+150", "ARB v1=0.15"},
        {&minusOne, "ARB+15", "ARB v1=150"},
        {&three, "ARB+1.5", "ARB v1=0.0015"},
        // No entry: no implied decimals.
        {nullptr, "ARB+150", "ARB v1=150"},
        // Decimal counts that take the value beyond the double range either
        // way: not a number.
        {&huge, "ARB+150", "ARB v1=absent"},
        {&tiny, "ARB+150", "ARB v1=absent"},
        {&tiny, "ARB+0", "ARB v1=absent"},
    };
    for (const Dec& d : cases) {
        SCOPED_TRACE(d.text);
        CSym2Pt command;
        EXPECT_TRUE(command.Interprete(d.text, kSign, d.code));
        EXPECT_EQ(drawing_test::DumpOf(command), d.members);
    }
}

TEST(Interprete, EveryMemberIsAssignedAtEachCall) {
    const CCode two = Decimals(2);
    CRec3Pth rect("old", "L9", 9.0, 9.0);
    EXPECT_TRUE(rect.Interprete("RH+L4+150+200", kSign, &two));
    EXPECT_FALSE(rect.Interprete("", kSign, &two));
    EXPECT_EQ(drawing_test::DumpOf(rect), " text=<> v1=absent v2=absent");

    CEscalier4 stairs("old", "L9", 7, 9.0);
    EXPECT_TRUE(stairs.Interprete("E4", "/", &two));
    EXPECT_EQ(drawing_test::DumpOf(stairs), "E4 text=<> n=-1 v1=absent");

    CTexte text("old", "old text");
    EXPECT_TRUE(text.Interprete("TXT", "/"));
    EXPECT_EQ(drawing_test::DumpOf(text), "TXT text=<>");

    // The text may be the command's own member: it is read before it changes.
    CSymSansOri sym;
    sym.m_Code = "ARB+150-075";
    EXPECT_TRUE(sym.Interprete(sym.m_Code, kSign, &two));
    EXPECT_EQ(drawing_test::DumpOf(sym), "ARB v1=1.5 v2=-0.75");
}
