#include <gtest/gtest.h>

#include <carnet/carnet.h>

#include <climits>
#include <cstring>
#include <new>
#include <string>
#include <utility>
#include <vector>

namespace {

const int kLastKind = 70;  // beyond every kind of every list

std::string Line(const CCode& c) {
    CString s("stale");
    EXPECT_TRUE(c.getTableLine(s));
    return s.str();
}

std::string LineAs(CCode c, int kind) {
    c.m_Kind = kind;
    return Line(c);
}

std::string Parsed(const char* line, int version) {
    CCode c;
    EXPECT_TRUE(c.initCode(line, version));
    return Line(c);
}

// Every member away from its initial value, by lines that together select
// every group, plus the two members no line sets.
CCode Populated() {
    static const char* const lines[] = {
        "P;17;T;1;A;127;3;7;B;G3a;31;G3b;9;3",
        "P;22;T;1;A;127;3;7;B;G3a;31;G3b;9",
        "P;30;T;1;A;127;3;7;B;G3a;31;G3b;9;P1;31;P2;6;4",
        "P;16;T;1;A;127;3;7;B;G3a;31;G3b;9;3;1.5;2.25;-3",
        "P;41;T;1;A;127;3;7;B;G4a;G4b;31;G4c;6;2;1",
        "P;48;T;1;A;127;3;7;B;G4a;12;31;G4c;6;2",
        "P;54;T;1;A;127;3;7;B;G5a;15;7;1.5;G5b;8;2.25;-3.125;G5c",
    };
    CCode c;
    for (const char* l : lines) EXPECT_TRUE(c.initCode(l, CCode::CurrentVersion)) << l;
    c.m_G3bBit1 = true;
    c.m_Texts.Add("t1");
    c.m_Texts.Add("t2");
    return c;
}

void ExpectSameEntry(const CCode& a, const CCode& b) {
    for (int k = 0; k <= kLastKind; ++k) EXPECT_EQ(LineAs(a, k), LineAs(b, k)) << "kind " << k;
    EXPECT_EQ(a.m_Kind, b.m_Kind);
    EXPECT_EQ(a.m_G3bBit1, b.m_G3bBit1);
    ASSERT_EQ(a.m_Texts.GetSize(), b.m_Texts.GetSize());
    for (int i = 0; i < a.m_Texts.GetSize(); ++i) EXPECT_EQ(a.m_Texts[i], b.m_Texts[i]);
}

}  // namespace

TEST(Code, ConstructionDefinesEveryMember) {
    alignas(CCode) unsigned char zeroed[sizeof(CCode)];
    alignas(CCode) unsigned char dirty[sizeof(CCode)];
    std::memset(zeroed, 0, sizeof zeroed);
    std::memset(dirty, 0xA5, sizeof dirty);
    CCode* a = new (zeroed) CCode;
    CCode* b = new (dirty) CCode;
    EXPECT_EQ(Line(*b), ";9;");
    EXPECT_EQ(LineAs(*b, 16), ";16;;0;;0;0;0;;;0;;0;0;0.000;0.000;0.000");
    ExpectSameEntry(*a, *b);
    EXPECT_FALSE(b->isAutoRepeat());
    a->~CCode();
    b->~CCode();
}

TEST(Code, KindsMoveToTheCurrentNumbering) {
    struct Case {
        int version, kind, expected;
    };
    const Case cases[] = {
        {0, 25, 25}, {0, 26, 27}, {0, 30, 31}, {0, 31, 34}, {0, 40, 43}, {0, 48, 54}, {0, 55, 61},
        {1, 26, 26}, {1, 32, 34}, {2, 31, 31}, {2, 49, 54}, {3, 50, 50}, {3, 51, 54}, {3, 55, 58},
        {4, 26, 26}, {4, 55, 55}, {5, 60, 60}, {0, 9, 9},
        {-1, 26, 27},             // a version below 0 reads as the oldest
        {0, -5, -5},              // not a kind: left alone rather than wrapped into a valid one
        {0, INT_MAX, INT_MAX},    // no overflow
        {3, INT_MAX - 2, INT_MAX - 2},
    };
    for (const Case& c : cases) {
        CCode code;
        const std::string line = "C;" + std::to_string(c.kind) + ";T";
        ASSERT_TRUE(code.initCode(line.c_str(), c.version));
        EXPECT_EQ(code.m_Kind, c.expected) << "version " << c.version << " kind " << c.kind;
    }
}

TEST(Code, LinesOfEveryGroupAndVersion) {
    struct Case {
        int version;
        const char* line;
        const char* expected;  // written back in the current format
    };
    const Case cases[] = {
        {5, "ARB;9;Arbre;x;y", "ARB;9;Arbre"},
        {5, "ARB", ";0;ARB"},  // plain fields stay empty until a ";" ends them
        {5, "ARB;9", "ARB;0;9"},
        {5, "C;x16;T", "C;0;T"},
        {5, ";;", ";0;"},
        // group 2: bits 6/7 and 4/5 only for their kinds; three fields before version 2
        {5, "C;10;T;1;A;255;3;7;B", "C;10;T;1;A;79;3;7;B"},
        {1, "C;10;T;2;A;3;4;X;Y", "C;10;T;0;A;3;4;0;"},
        {5, "C;11;T;1;A;64;0;0;", "C;11;T;1;A;0;0;0;"},
        {5, "C;12;T;A;128;1;2;B", "C;12;T;A;0;1;2;B"},
        {5, "C;17;T;0;A;48;1;2;B;X;0;Y;5;2", "C;17;T;0;A;48;1;2;B;X;0;Y;5;2"},
        // groups 3 and 8
        {5, "C;16;T;1;A;128;2;0;;G3a;31;G3b;9;3;1.5;2.25;-3", "C;16;T;1;A;128;2;0;;G3a;29;G3b;9;3;1.500;2.250;-3.000"},
        {1, "C;16;T;1;A;192;2;G3a;31;G3b;9;3;1.5;2.25;-3", "C;16;T;1;A;64;2;0;;G3a;29;G3b;9;3;0.000;0.000;0.000"},
        {5, "C;16;T;1", "C;16;T;1;;0;0;0;;;0;;0;0;0.000;0.000;0.000"},
        {5, "C;22;T;1;A;0;0;0;;X;31;Y;5", "C;22;T;1;A;0;0;0;;X;23;Y;5"},
        // group 3b: closing fields throughout
        {5, "C;30;T;1;A;0;0;0;;X;8;Y;5;P;31;Q;6;4", "C;30;T;1;A;0;0;0;;X;8;Y;5;P;25;Q;6;4"},
        {0, "C;29;T;1;A;0;0;X;8;Y;5;P;31;Q;6;4", "C;30;T;1;A;0;0;0;;X;8;Y;5;P;25;Q;6;4"},
        {5, "C;30;T;1;A;0;0;0;;X;8;Y;5;P", "C;30;T;1;A;0;0;0;;X;8;Y;5;P;0;;0;0"},
        // kind 23: a 0 stands where the decimals would, and is skipped on reading
        {5, "C;23;T;1;A;0;0;0;;X;0;Y;5;0;1", "C;23;T;1;A;0;0;0;;X;0;Y;5;0;1"},
        {5, "C;23;T;1;A;0;0;0;;X;0;Y;5;1;0", "C;23;T;1;A;0;0;0;;X;0;Y;5;0;0"},
        // group 7: an empty field means true, anything but 1 false
        {5, "C;20;T;1;A;0;0;0;;X;0;Y;5;2;", "C;20;T;1;A;0;0;0;;X;0;Y;5;2;1"},
        {5, "C;20;T;1;A;0;0;0;;X;0;Y;5;2", "C;20;T;1;A;0;0;0;;X;0;Y;5;2;1"},
        {5, "C;20;T;1;A;0;0;0;;X;0;Y;5;2;0", "C;20;T;1;A;0;0;0;;X;0;Y;5;2;0"},
        {5, "C;20;T;1;A;0;0;0;;X;0;Y;5;2;2", "C;20;T;1;A;0;0;0;;X;0;Y;5;2;0"},
        // group 4: the second field is a number for some kinds from version 4
        {5, "C;41;T;1;A;0;0;0;;G4a;G4b;63;G4c;6;2;1", "C;41;T;1;A;0;0;0;;G4a;G4b;31;G4c;6;2;1"},
        {5, "C;48;T;1;A;0;0;0;;G4a;12;3;G4c;6;2", "C;48;T;1;A;0;0;0;;G4a;12;3;G4c;6;2"},
        {3, "C;48;T;1;A;0;0;0;;G4a;12;3;G4c;6;2", "C;48;T;1;A;0;0;0;;G4a;0;3;G4c;6;2"},
        // kinds 52 and 53 gained their auto-repeat field in version 5
        {4, "C;52;T;A;0;0;0;;G4a;12;3;G4c;6", "C;52;T;0;A;0;0;0;;G4a;12;3;G4c;6"},
        {5, "C;52;T;A;0;0;0;;G4a;12;3;G4c;6", "C;52;T;0;0;0;0;0;G4a;12;3;0;;6"},
        // group 5: each kind writes only its own flags
        {5, "C;54;T;1;A;0;0;0;;G5a;15;7;1.5;G5b;8;2.25;-3.125;G5c",
         "C;54;T;1;A;0;0;0;;G5a;9;7;1.500000;G5b;8;2.250000;-3.125000;G5c"},
        {5, "C;55;T;1;A;0;0;0;;G5a;15;7;1.5;G5b;8;2.25;-3.125;G5c",
         "C;55;T;1;A;0;0;0;;G5a;3;7;1.500000;G5b;8;2.250000;-3.125000;G5c"},
        {5, "C;57;T;A;0;0;0;;G5a;15;7;1.5;G5b;8;2.25;-3.125;G5c",
         "C;57;T;A;0;0;0;;G5a;5;7;1.500000;G5b;8;2.250000;-3.125000;G5c"},
        {5, "C;56;T;A;0;0;0;;G5a;15;7;1.5;G5b;8;2.25;-3.125;G5c",
         "C;56;T;A;0;0;0;;G5a;1;7;1.500000;G5b;8;2.250000;-3.125000;G5c"},
    };
    for (const Case& c : cases) EXPECT_EQ(Parsed(c.line, c.version), c.expected) << c.line << " v" << c.version;
}

TEST(Code, FieldsLandInTheirMembers) {
    CCode c;
    ASSERT_TRUE(c.initCode("C;16;T;1;A;2;3;7;B;G3a;20;G3b;9;2;1.5;2.25;-3", 5));
    EXPECT_EQ(c.m_Code, "C");
    EXPECT_EQ(c.m_Text, "T");
    EXPECT_TRUE(c.isAutoRepeat());
    EXPECT_EQ(c.m_G2Text1, "A");
    EXPECT_TRUE(c.m_G2Bit1 && !c.m_G2Bit0 && !c.m_G2Bit2 && !c.m_G2Bit3);
    EXPECT_EQ(c.m_G2Count, 3);
    EXPECT_EQ(c.m_G2Extra, 7);
    EXPECT_EQ(c.m_G2Text2, "B");
    EXPECT_EQ(c.m_G3Text1, "G3a");
    EXPECT_TRUE(c.m_G3Bit2 && c.m_G3Bit4 && !c.m_G3Bit0);
    EXPECT_EQ(c.m_G3Text2, "G3b");
    EXPECT_EQ(c.m_G3Value, 9);
    EXPECT_EQ(c.m_Decimals, 2);
    EXPECT_EQ(c.m_Real1, 1.5);
    EXPECT_EQ(c.m_Real3, -3.0);
    EXPECT_EQ(Line(c), "C;16;T;1;A;2;3;7;B;G3a;16;G3b;9;2;1.500;2.250;-3.000");  // flag 4 needs flag 1

    ASSERT_TRUE(c.initCode("C;48;T;0;A;0;0;0;;G4a;12;10;G4c;6;2", 5));
    EXPECT_EQ(c.m_G4Text1, "G4a");
    EXPECT_EQ(c.m_G4Number, 12);
    EXPECT_TRUE(c.m_G4Bit1 && c.m_G4Bit3 && !c.m_G4Bit0);
    EXPECT_EQ(c.m_G4Text3, "G4c");
    EXPECT_EQ(c.m_G4Value, 6);

    ASSERT_TRUE(c.initCode("C;54;T;1;A;0;0;0;;G5a;6;7;1.5;G5b;8;2.25;-3.125;G5c", 5));
    EXPECT_EQ(c.m_G5Text1, "G5a");
    EXPECT_EQ(c.m_G5Bit0 + 2 * c.m_G5Bit1 + 4 * c.m_G5Bit2 + 8 * c.m_G5Bit3, 6);
    EXPECT_EQ(c.m_G5Int1, 7);
    EXPECT_EQ(c.m_G5Val1, 1.5);
    EXPECT_EQ(c.m_G5Text2, "G5b");
    EXPECT_EQ(c.m_G5Int2, 8);
    EXPECT_EQ(c.m_G5Val2, 2.25);
    EXPECT_EQ(c.m_G5Val3, -3.125);
    EXPECT_EQ(c.m_G5Text3, "G5c");
}

TEST(Code, UnselectedGroupsKeepTheirValues) {
    CCode c = Populated();
    const CCode before = c;
    ASSERT_TRUE(c.initCode("ARB;9;Arbre", 5));
    EXPECT_EQ(c.m_Code, "ARB");
    EXPECT_EQ(c.m_Kind, 9);
    EXPECT_EQ(c.m_Text, "Arbre");
    EXPECT_TRUE(c.m_Real1 == 0.0 && c.m_Real2 == 0.0 && c.m_Real3 == 0.0);  // cleared for every kind
    c.m_Code = before.m_Code;
    c.m_Kind = before.m_Kind;
    c.m_Text = before.m_Text;
    c.m_Real1 = before.m_Real1;
    c.m_Real2 = before.m_Real2;
    c.m_Real3 = before.m_Real3;
    ExpectSameEntry(c, before);

    // An old group-2 line clears m_G2Extra but keeps m_G2Text2; bits 4/5 stay for kind 16.
    ASSERT_TRUE(c.initCode("C;16;T;1;A;0;3", 1));
    EXPECT_EQ(c.m_G2Extra, 0);
    EXPECT_EQ(c.m_G2Text2, "B");
    EXPECT_TRUE(c.m_G2Bit4 && c.m_G2Bit5 && c.m_G3Bit1);
}

TEST(Code, NullOrEmptyLineChangesNothing) {
    CCode c = Populated();
    const CCode before = c;
    EXPECT_FALSE(c.initCode(nullptr, 5));
    EXPECT_FALSE(c.initCode("", 5));
    ExpectSameEntry(c, before);
}

TEST(Code, WrittenLinesReadBackTheSame) {
    const CCode patterns[] = {CCode(), Populated()};
    for (const CCode& pattern : patterns) {
        for (int k = 0; k <= kLastKind; ++k) {
            const std::string line = LineAs(pattern, k);
            CCode back;
            ASSERT_TRUE(back.initCode(line.c_str(), CCode::CurrentVersion));
            EXPECT_EQ(back.m_Kind, k);
            EXPECT_EQ(Line(back), line);
        }
    }
}

TEST(Code, KindListsHoldTheirRanges) {
    using Ranges = std::vector<std::pair<int, int>>;
    const std::pair<const int*, Ranges> lists[] = {
        {CCode::AutoRepeatKinds, {{10, 11}, {16, 41}, {47, 55}}},
        {CCode::Group2Kinds, {{10, 41}, {46, 58}}},
        {CCode::Group2Bit67Kinds, {{10, 10}, {12, 41}, {46, 58}}},
        {CCode::Group2Bit45Kinds, {{17, 19}, {22, 28}, {30, 31}, {34, 40}, {47, 53}, {55, 55}}},
        {CCode::Group3Kinds, {{16, 33}}},
        {CCode::Group3Bit3Kinds, {{16, 19}, {29, 31}, {33, 33}}},
        {CCode::Group3Bit1Kinds, {{22, 22}, {24, 24}, {26, 28}}},
        {CCode::Group3bKinds, {{29, 32}}},
        {CCode::Group4Kinds, {{41, 41}, {46, 53}}},
        {CCode::Group4NumberKinds, {{47, 53}}},
        {CCode::Group5Kinds, {{54, 58}}},
        {CCode::DecimalsKinds, {{16, 18}, {20, 21}, {24, 32}, {34, 35}, {38, 46}, {48, 48}, {50, 51}, {62, 64}}},
        {CCode::OptionKinds, {{20, 21}, {23, 28}, {32, 32}, {38, 46}, {62, 64}}},
    };
    for (const auto& [list, ranges] : lists) {
        int count = 1;
        for (const auto& [lo, hi] : ranges) count += hi - lo + 1;
        EXPECT_EQ(list[0], count);
        for (int k = -1; k <= kLastKind; ++k) {
            bool inRange = false;
            for (const auto& [lo, hi] : ranges) inRange = inRange || (k >= lo && k <= hi);
            EXPECT_EQ(CCode::isPresent(list, k), inRange) << "kind " << k << " list of " << list[0];
        }
    }
    const int none[] = {1, 5};  // the 5 lies beyond the count
    const int broken[] = {-3, 5};
    EXPECT_FALSE(CCode::isPresent(none, 5));
    EXPECT_FALSE(CCode::isPresent(broken, 5));
    EXPECT_FALSE(CCode::isPresent(nullptr, 5));
}

TEST(Code, UnitsAndBooleans) {
    for (const char* s : {"mm", "CM", "dM", "m", "M"}) EXPECT_TRUE(CCode::isUnit(s)) << s;
    for (const char* s : {"km", "", "mmm", " m", "true"}) EXPECT_FALSE(CCode::isUnit(s)) << s;
    EXPECT_FALSE(CCode::isUnit(nullptr));
    for (const char* s : {"true", "False", "TRUE"}) EXPECT_TRUE(CCode::isBool(s)) << s;
    for (const char* s : {"", "1", "truex", "fals", "m"}) EXPECT_FALSE(CCode::isBool(s)) << s;
    EXPECT_FALSE(CCode::isBool(nullptr));
}

TEST(Code, ExtensionOfTheFileName) {
    const std::string longExt = "." + std::string(400, 'x');
    const std::string longPath = "C:\\d\\f" + longExt;
    const std::pair<const char*, std::string> cases[] = {
        {"C:\\relev\\carnet.geo", ".geo"}, {"relev/carnet.tab", ".tab"}, {"carnet", ""},
        {"rel.ev\\carnet", ""},            {"rel.ev/carnet", ""},        {"a.b.c", ".c"},
        {"carnet.", "."},                  {".geo", ".geo"},             {"C:x.y", ".y"},
        {"", ""},                          {"d\xE9j\xE0.g\xE9o", ".g\xE9o"},
        {longPath.c_str(), longExt},
    };
    CCode c;
    for (const auto& [path, ext] : cases) EXPECT_EQ(c.getExt(path).str(), ext) << path;
    EXPECT_EQ(c.getExt(nullptr).str(), "");
    // Each result is its own text: an earlier one is not overwritten by a later call.
    const CString first = c.getExt("a.one");
    EXPECT_EQ(c.getExt("b.two"), ".two");
    EXPECT_EQ(first, ".one");
}

TEST(Code, BothAssignmentFormsCopyEveryMember) {
    const CCode source = Populated();
    CCode byRef, byPtr;
    for (const char* t : {"x", "y", "z"}) byRef.m_Texts.Add(t), byPtr.m_Texts.Add(t);
    byRef = source;
    byPtr = &source;
    ExpectSameEntry(byRef, source);
    ExpectSameEntry(byPtr, source);

    CCode self = source;
    const CCode& alias = self;
    self = alias;
    self = &alias;
    ExpectSameEntry(self, source);  // the texts are not lost on the way

    byPtr = static_cast<const CCode*>(nullptr);
    ExpectSameEntry(byPtr, source);
}
