#include <gtest/gtest.h>

#include <climits>
#include <string>
#include <vector>

#include <carnet/carnet.h>

namespace {

const std::string kEmpty =
    "La cha\xEEne de s\xE9lection des points est vide.\nVeuillez la renseigner avant de r\xE9" "essayer !";
const std::string kRadicals = " pr\xE9sent dans la cha\xEEne de s\xE9lection\npr\xE9sente des radicaux diff\xE9rents !";

struct Box {
    CWnd* owner;
    std::string text, caption;
    unsigned int flags;
};

// Records every box shown and answers with the chosen button.
struct BoxRecorder {
    std::vector<Box> boxes;
    int answer = IDOK;
    MessageBoxHandler previous = SetMessageBoxHandler([this](CWnd* o, const char* t, const char* c, unsigned int f) {
        boxes.push_back({o, t, c, f});
        return answer;
    });
    ~BoxRecorder() { SetMessageBoxHandler(previous); }
};

}  // namespace

TEST(Selection, ValidationTable) {
    struct Case {
        const char* typed;
        const char* canonical;  // null: refused with the message
        std::string message;
    };
    const Case table[] = {
        {"1-5;8;10-12", "1-5;8;10-12", ""}, {"P5-P1;P7", "P.1-P.5;P7", ""}, {"A.1-A.10;B.3", "A.1-A.10;B.3", ""},
        {"1(2)-5(2)", "1(2)-5(2)", ""},     {"S.5(2)-S.1(2)", "S.1(2)-S.5(2)", ""}, {"P 7;; P008", "P7;P8", ""},
        {"12(2);15(2)", "12(2);15(2)", ""}, {"A.1-A.*", "A.*", ""},          {"*-P5", "P.*", ""},
        {"*-*", "*.*", ""},                 {"0;P1;", "P1", ""},
        {"P1-P99999999999", "P.1-P.2147483647", ""},  // saturated, not a wildcard
        {"P1-Q5", nullptr, "Le groupe P1-Q5" + kRadicals},
        {"1;P1 - P5;A.1-A5", nullptr, "Le groupe P1 - P5" + kRadicals},  // the first failing group only
        {"1(1)-5(2)", nullptr,
         "Les indice de reprise de stations doivent \xEAtre\nidentiques dans l'intervalle 1(1)-5(2) !"},
        {"A.1-A5", nullptr, "Un des deux matricules du groupe A.1-A5 de s\xE9lection\ncontient un point et l'autre pas !"},
        {"", nullptr, kEmpty},
        {";; 0", nullptr, kEmpty},  // names nothing: refused like an empty string
    };
    for (const Case& t : table) {
        SCOPED_TRACE(t.typed);
        BoxRecorder rec;
        CString sel(t.typed);
        EXPECT_EQ(CCarnet::IsValidSelString(sel), t.canonical ? 1 : 0);
        EXPECT_EQ(sel, t.canonical ? t.canonical : t.typed);
        if (t.canonical) {
            EXPECT_TRUE(rec.boxes.empty());
            EXPECT_EQ(CCarnet::IsValidSelString(sel), 1);  // canonical stays as it is
            EXPECT_EQ(sel, t.canonical);
        } else {
            ASSERT_EQ(rec.boxes.size(), 1u);
            EXPECT_EQ(rec.boxes[0].text, t.message);
            EXPECT_EQ(rec.boxes[0].owner, nullptr);
            EXPECT_EQ(rec.boxes[0].flags, MB_OK);
        }
    }
}

TEST(Selection, MembershipAndCounts) {
    struct Case {
        const char *np, *sel;
        int in;
    };
    const Case table[] = {
        {"P3", "P.1-P.5", 1},  {"P.3", "P.1-P.5", 1},      {"P6", "P.1-P.5", 0},   {"P1", "P.1-P.5", 1},
        {"Q3", "P.1-P.5", 0},  {"P3", "*", 1},              {"A.3", "*", 0},        {"A.3", "*.*", 1},
        {"A.3", "A.*", 1},     {"A3", "A.*", 0},            {"B.3", "A.*", 0},      {"12(2)", "10(2)-15(2)", 1},
        {"12", "10(2)-15(2)", 0}, {"12(1)", "10-15", 1},    {"12(2)", "10-15", 0},  {"12(3)", "12(2)", 0},
        {"7", "1-5;7", 1},     {"P7", "7", 0},              {"", "1;;2", 0},        {"P3", "", 0},
        {"P99999999999", "P.1-P.5", 0},
    };
    for (const Case& t : table) {
        SCOPED_TRACE(std::string(t.np) + " in " + t.sel);
        EXPECT_EQ(CCarnet::IsPointInSel(t.np, t.sel), t.in);
    }
    const std::pair<const char*, int> counts[] = {
        {"1-5;8;10-12", 9}, {"P.1-P.5;P7", 6},         {"A.*", 1},           {"1(2)-5(2)", 5},   {"", 0},
        {"5-1;;2;", 6},     {"0-2147483647", INT_MAX}, {"0-2147483646;5", INT_MAX}, {"P.0-P.99999999999", INT_MAX},
    };
    for (const auto& t : counts) EXPECT_EQ(CCarnet::GetSelStringCount(t.first), t.second) << t.first;
}

TEST(Selection, DialogField) {
    CWnd dlg;
    dlg.SetDlgItemText(100, "P 007");
    CString np("old"), shown;
    CCarnet::DDX_Mat(&dlg, 100, np);
    dlg.GetDlgItemText(100, shown);
    EXPECT_TRUE(np == "P7" && shown == "P7");
    CCarnet::DDX_Mat(&dlg, 101, np);  // a control never filled reads as empty
    EXPECT_EQ(np, "");

    CCarnet book;
    book.append(new CComment("debut"), 1000);
    book.append(new CStation("S1", 1.5, 0.0, ""), 1001);
    book.append(new CPointGen("P1", 1.0, 2.0, ""), 1006);
    CWnd parent;
    struct Case {
        int index;
        const char* np;
        int answer, result;
        bool asked;
    };
    const Case table[] = {
        {2, "P1", IDNO, 1, false},  {2, "S1", IDYES, 1, true}, {2, "S1", IDNO, 0, true}, {1, "S1", IDNO, 1, false},
        {-1, "P1", IDNO, 0, true},  {2, "p1", IDNO, 1, false},
        {2, "", IDNO, 1, false},  // no number: the comment does not clash with it
    };
    for (const Case& t : table) {
        SCOPED_TRACE(std::string(t.np) + " at " + std::to_string(t.index));
        BoxRecorder rec;
        rec.answer = t.answer;
        EXPECT_EQ(book.DDV_Mat(&parent, t.index, t.np), t.result);
        ASSERT_EQ(rec.boxes.size(), t.asked ? 1u : 0u);
        if (t.asked) {
            EXPECT_EQ(rec.boxes[0].text, "Le matricule '" + std::string(t.np) +
                                             "' est d\xE9j\xE0 utilis\xE9 !\nVoulez-vous quand m\xEAme le conserver ?");
            EXPECT_TRUE(rec.boxes[0].owner == &parent && rec.boxes[0].caption == "NORVEX");
            EXPECT_EQ(rec.boxes[0].flags, 0x24u);
        }
    }
}

// The matcher that reads a selection once answers as IsPointInSel does, on
// numbers and selections drawn from a small alphabet so that they meet.
TEST(Selection, TheMatcherAgreesWithIsPointInSel) {
    const char* const parts[] = {"P", "P.", "A", "*", "1", "2", "7", "12", "(1)", "(2)", "-", "-", ";", ".*", ""};
    unsigned int seed = 12345;
    auto draw = [&seed, &parts](int most) {
        std::string text;
        for (int n = static_cast<int>((seed = seed * 1103515245u + 12345u) >> 16) % most; n >= 0; --n)
            text += parts[((seed = seed * 1103515245u + 12345u) >> 16) % (sizeof parts / sizeof *parts)];
        return text;
    };
    for (int s = 0; s < 400; ++s) {
        const CString sel(draw(12));
        CSelMatcher matcher(sel);
        for (int n = 0; n < 40; ++n) {
            const CString np(draw(4));
            ASSERT_EQ(matcher.Contains(np), CCarnet::IsPointInSel(np, sel)) << np.str() << " in " << sel.str();
        }
    }
}
