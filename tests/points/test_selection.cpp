#include <gtest/gtest.h>

#include <climits>
#include <string>
#include <vector>

#include <carnet/carnet.h>

namespace {

// The texts the user sees, in code page 1252.
const char kEmpty[] =
    "La cha\xEEne de s\xE9lection des points est vide.\nVeuillez la renseigner avant de r\xE9" "essayer !";
std::string Radicals(const std::string& g) {
    return "Le groupe " + g + " pr\xE9sent dans la cha\xEEne de s\xE9lection\npr\xE9sente des radicaux diff\xE9rents !";
}
std::string Repeats(const std::string& g) {
    return "Les indice de reprise de stations doivent \xEAtre\nidentiques dans l'intervalle " + g + " !";
}
std::string OneDotted(const std::string& g) {
    return "Un des deux matricules du groupe " + g + " de s\xE9lection\ncontient un point et l'autre pas !";
}

struct Box {
    CWnd* owner;
    std::string text;
    std::string caption;
    unsigned int flags;
};

// Records every box shown and answers with the chosen button.
struct BoxRecorder {
    std::vector<Box> boxes;
    int answer = IDOK;
    MessageBoxHandler previous;
    BoxRecorder() {
        previous = SetMessageBoxHandler([this](CWnd* owner, const char* text, const char* caption, unsigned int f) {
            boxes.push_back({owner, text, caption, f});
            return answer;
        });
    }
    ~BoxRecorder() { SetMessageBoxHandler(previous); }
};

void AddPoint(CCarnet& book, const char* np) { book.append(new CPointGen(np, 1.0, 2.0, ""), 1006); }

}  // namespace

TEST(Selection, ValidationTable) {
    struct Case {
        const char* typed;
        const char* canonical;  // null: refused with the message
        std::string message;
    };
    const Case table[] = {
        {"1-5;8;10-12", "1-5;8;10-12", ""},
        {"P5-P1;P7", "P.1-P.5;P7", ""},
        {"A.1-A.10;B.3", "A.1-A.10;B.3", ""},
        {"1(2)-5(2)", "1(2)-5(2)", ""},
        {"S.1(2)-S.5(2)", "S.1(2)-S.5(2)", ""},
        {"S.5(2)-S.1(2)", "S.1(2)-S.5(2)", ""},
        {"P 7;; P008", "P7;P8", ""},
        {"12(2);15(2)", "12(2);15(2)", ""},
        {"A.1-A.*", "A.*", ""},
        {"*-P5", "P.*", ""},
        {"*-*", "*.*", ""},
        {";P1;", "P1", ""},
        {"0;P1", "P1", ""},
        {"*;*.*", "*;*.*", ""},
        {"P1-P99999999999", "P.1-P.2147483647", ""},  // saturated, not a wildcard
        {"P1-Q5", nullptr, Radicals("P1-Q5")},
        {"P1 - P5", nullptr, Radicals("P1 - P5")},
        {"1;P1-Q5;A.1-A5", nullptr, Radicals("P1-Q5")},  // the first failing group only
        {"1(1)-5(2)", nullptr, Repeats("1(1)-5(2)")},
        {"A.1-A5", nullptr, OneDotted("A.1-A5")},
        {"", nullptr, kEmpty},
        {";;", nullptr, kEmpty},  // names nothing: refused like an empty string
        {" 0 ", nullptr, kEmpty},
    };
    for (const Case& t : table) {
        SCOPED_TRACE(t.typed);
        BoxRecorder rec;
        CString sel(t.typed);
        const int ok = CCarnet::IsValidSelString(sel);
        if (t.canonical) {
            EXPECT_EQ(ok, 1);
            EXPECT_EQ(sel, t.canonical);
            EXPECT_TRUE(rec.boxes.empty());
            // A canonical string is accepted as it stands.
            CString again(sel);
            EXPECT_EQ(CCarnet::IsValidSelString(again), 1);
            EXPECT_EQ(again, sel);
        } else {
            EXPECT_EQ(ok, 0);
            EXPECT_EQ(sel, t.typed);
            ASSERT_EQ(rec.boxes.size(), 1u);
            EXPECT_EQ(rec.boxes[0].text, t.message);
            EXPECT_EQ(rec.boxes[0].owner, nullptr);
            EXPECT_EQ(rec.boxes[0].flags, MB_OK);
        }
    }
}

TEST(Selection, Membership) {
    struct Case {
        const char* np;
        const char* sel;
        int in;
    };
    const Case table[] = {
        {"P3", "P.1-P.5", 1},     {"P.3", "P.1-P.5", 1},     {"P6", "P.1-P.5", 0},      {"P1", "P.1-P.5", 1},
        {"P5", "P.1-P.5", 1},     {"P0", "P.1-P.5", 0},      {"Q3", "P.1-P.5", 0},      {"P3", "*", 1},
        {"A.3", "*", 0},          {"A.3", "*.*", 1},         {"A.3", "A.*", 1},         {"A3", "A.*", 0},
        {"B.3", "A.*", 0},        {"12(2)", "10(2)-15(2)", 1}, {"12", "10(2)-15(2)", 0}, {"12(1)", "10-15", 1},
        {"12(2)", "10-15", 0},    {"16(2)", "10(2)-15(2)", 0}, {"12(2)", "12(2)", 1},    {"12(3)", "12(2)", 0},
        {"7", "1-5;7", 1},        {"P7", "7", 0},            {"7", "1-5;;8", 0},        {"", "1;;2", 0},
        {"P3", "", 0},            {"P99999999999", "P.1-P.5", 0}, {"A.*", "A.*", 1},
    };
    for (const Case& t : table) {
        SCOPED_TRACE(std::string(t.np) + " in " + t.sel);
        EXPECT_EQ(CCarnet::IsPointInSel(t.np, t.sel), t.in);
    }
}

TEST(Selection, Counts) {
    const std::pair<const char*, int> table[] = {
        {"1-5;8;10-12", 9},
        {"P.1-P.5;P7", 6},
        {"A.*", 1},
        {"1(2)-5(2)", 5},
        {"", 0},
        {"5-1", 5},
        {"1;;2;", 2},
        {"0-2147483647", INT_MAX},
        {"1-2147483647;5", INT_MAX},
        {"0-2147483646;5;6", INT_MAX},
        {"P.0-P.99999999999", INT_MAX},
    };
    for (const auto& t : table) {
        SCOPED_TRACE(t.first);
        const CString sel(t.first);
        EXPECT_EQ(CCarnet::GetSelStringCount(sel), t.second);
        EXPECT_EQ(sel, t.first);
    }
}

TEST(Selection, FieldExchangeNormalises) {
    CWnd dlg;
    dlg.SetDlgItemText(100, "P 007");
    CString np("old");
    CCarnet::DDX_Mat(&dlg, 100, np);
    EXPECT_EQ(np, "P7");
    CString shown;
    dlg.GetDlgItemText(100, shown);
    EXPECT_EQ(shown, "P7");

    dlg.SetDlgItemText(101, "A.*");
    CCarnet::DDX_Mat(&dlg, 101, np);
    EXPECT_EQ(np, "A.*");

    CCarnet::DDX_Mat(&dlg, 102, np);  // a control never filled reads as empty
    EXPECT_EQ(np, "");
    dlg.GetDlgItemText(102, shown);
    EXPECT_EQ(shown, "");
}

TEST(Selection, NumberInUseQuestion) {
    CCarnet book;
    book.append(new CComment("debut"), 1000);
    AddPoint(book, "P0");
    book.append(new CStation("S1", 1.5, 0.0, ""), 1001);
    AddPoint(book, "P1");
    CWnd parent;
    const std::string question =
        "Le matricule 'S1' est d\xE9j\xE0 utilis\xE9 !\nVoulez-vous quand m\xEAme le conserver ?";

    struct Case {
        int index;
        const char* np;
        int answer;
        int result;
        bool asked;
    };
    const Case table[] = {
        {3, "P1", IDYES, 1, false},  // its own number
        {3, "P2", IDNO, 1, false},
        {3, "S1", IDYES, 1, true},
        {3, "S1", IDNO, 0, true},
        {2, "S1", IDNO, 1, false},
        {-1, "P1", IDNO, 0, true},  // a new element
        {3, "p1", IDNO, 1, false},
        {3, "", IDNO, 1, false},    // no number: the comment does not clash with it
    };
    for (const Case& t : table) {
        SCOPED_TRACE(std::string(t.np) + " at " + std::to_string(t.index));
        BoxRecorder rec;
        rec.answer = t.answer;
        EXPECT_EQ(book.DDV_Mat(&parent, t.index, t.np), t.result);
        ASSERT_EQ(rec.boxes.size(), t.asked ? 1u : 0u);
        if (t.asked) {
            EXPECT_EQ(rec.boxes[0].owner, &parent);
            EXPECT_EQ(rec.boxes[0].caption, "NORVEX");
            EXPECT_EQ(rec.boxes[0].flags, 0x24u);
            if (std::string(t.np) == "S1") {
                EXPECT_EQ(rec.boxes[0].text, question);
            }
        }
    }
}
