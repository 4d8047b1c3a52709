#include <gtest/gtest.h>

#include <carnet/carray.h>
#include <carnet/cp1252.h>
#include <carnet/cstring.h>
#include <carnet/cwnd.h>
#include <carnet/filedlg.h>
#include <carnet/msgbox.h>
#include <carnet/txtwnd.h>
#include <carnet/undef.h>

TEST(CString, ConstructionFromNullAndCounts) {
    EXPECT_TRUE(CString(static_cast<const char*>(nullptr)).IsEmpty());
    EXPECT_EQ(CString('?', 16), "????????????????");
    EXPECT_TRUE(CString('x', -3).IsEmpty());
    EXPECT_EQ(CString("abcdef", 3), "abc");
    CString s("abc");
    s = static_cast<const char*>(nullptr);
    EXPECT_TRUE(s.IsEmpty());
}

TEST(CString, ExtractionClampsCounts) {
    CString s("Station");
    EXPECT_EQ(s.Left(3), "Sta");
    EXPECT_EQ(s.Left(99), "Station");
    EXPECT_EQ(s.Left(-1), "");
    EXPECT_EQ(s.Mid(4), "ion");
    EXPECT_EQ(s.Mid(40), "");
    EXPECT_EQ(s.Mid(-2, 3), "Sta");
    EXPECT_EQ(s.Mid(5, 10), "on");
    EXPECT_EQ(s.Right(2), "on");
    EXPECT_EQ(s.Right(50), "Station");
    EXPECT_EQ(s.Right(-5), "");
}

TEST(CString, FindAndReverseFind) {
    CString s("S1-2-3");
    EXPECT_EQ(s.Find('-'), 2);
    EXPECT_EQ(s.Find('-', 3), 4);
    EXPECT_EQ(s.Find('-', 100), -1);
    EXPECT_EQ(s.Find("-3"), 4);
    EXPECT_EQ(s.Find("zz"), -1);
    EXPECT_EQ(s.Find(static_cast<const char*>(nullptr)), -1);
    EXPECT_EQ(s.ReverseFind('-'), 4);
    EXPECT_EQ(s.ReverseFind('x'), -1);
}

TEST(CString, ReplaceRemoveInsertDelete) {
    CString s("borne a b");
    EXPECT_EQ(s.Replace(" ", "***"), 2);
    EXPECT_EQ(s, "borne***a***b");
    EXPECT_EQ(s.Replace("***", " "), 2);
    EXPECT_EQ(s, "borne a b");
    EXPECT_EQ(s.Replace("", "x"), 0);
    EXPECT_EQ(s.Replace('b', 'B'), 2);
    EXPECT_EQ(s, "Borne a B");
    EXPECT_EQ(s.Remove(' '), 2);
    EXPECT_EQ(s, "BorneaB");
    s.Insert(0, '[');
    s.Insert(100, "]");
    EXPECT_EQ(s, "[BorneaB]");
    s.Delete(1, 5);
    EXPECT_EQ(s, "[aB]");
    s.Delete(2, 100);
    EXPECT_EQ(s, "[a");
}

TEST(CString, TrimUsesTheControlSpaces) {
    CString s("\t\r\n  Levé du 12 mars \x0B\x0C");
    s.Trim();
    EXPECT_EQ(s, "Levé du 12 mars");
    CString t("xxabcxx");
    t.TrimLeft('x');
    EXPECT_EQ(t, "abcxx");
    t.TrimRight('x');
    EXPECT_EQ(t, "abc");
}

TEST(CString, CaseAndComparisonAreCp1252Bytes) {
    CString s("d\xE9" "f");
    s.MakeUpper();
    EXPECT_EQ(s, "D\xC9" "F");
    s.MakeLower();
    EXPECT_EQ(s, "d\xE9" "f");
    EXPECT_EQ(CString("P\xE9").CompareNoCase("p\xC9"), 0);
    // Unsigned bytes: é (0xE9) sorts after every ASCII letter.
    EXPECT_GT(CString("\xE9").Compare("z"), 0);
    EXPECT_LT(CString("P1"), CString("P2"));
    EXPECT_NE(CString("P1"), "p1");
    EXPECT_EQ(CString("ab") + 'c' + "d" + CString("e"), "abcde");
}

TEST(CString, FormatGrowsWithoutLimit) {
    CString s;
    std::string big(10000, 'z');
    s.Format("<%s>", big.c_str());
    EXPECT_EQ(s.GetLength(), 10002);
    s.AppendFormat("%d%%", 50);
    EXPECT_EQ(s.Right(3), "50%");
    s.Format("%.4f", 1234.56789);
    EXPECT_EQ(s, "1234.5679");
}

TEST(Cp1252, SpaceDigitAndSearch) {
    for (unsigned c : {0x09u, 0x0Au, 0x0Bu, 0x0Cu, 0x0Du, 0x20u}) EXPECT_TRUE(cp1252::IsSpace(c)) << c;
    EXPECT_FALSE(cp1252::IsSpace(0xA0));
    EXPECT_FALSE(cp1252::IsSpace(0x08));
    EXPECT_TRUE(cp1252::IsDigit('7'));
    EXPECT_FALSE(cp1252::IsDigit(0xB2));  // superscript two is not a digit
    EXPECT_EQ(cp1252::Compare(nullptr, ""), 0);
    EXPECT_STREQ(cp1252::FindChar("ARB\xB1" "150", 0xB1), "\xB1" "150");
    EXPECT_EQ(cp1252::FindText("abc", "x"), nullptr);
}

TEST(CArray, InsertBeyondEndExtendsAndRemoveShifts) {
    CStringArray a;
    EXPECT_TRUE(a.IsEmpty());
    EXPECT_EQ(a.Add("a"), 0);
    EXPECT_EQ(a.Add("b"), 1);
    a.InsertAt(4, "e");
    ASSERT_EQ(a.GetSize(), 5);
    EXPECT_EQ(a[2], "");
    EXPECT_EQ(a[4], "e");
    a.RemoveAt(0);
    EXPECT_EQ(a.GetAt(0), "b");
    a.SetAt(0, "B");
    a.ElementAt(1) = "x";
    EXPECT_EQ(a[0], "B");
    EXPECT_EQ(a[1], "x");
    a.SetSize(2, 16);
    EXPECT_EQ(a.GetCount(), 2);
    a.RemoveAll();
    EXPECT_EQ(a.GetSize(), 0);
}

TEST(Undef, ComparedBitForBit) {
    EXPECT_TRUE(IsUndef(-999999.0));
    EXPECT_TRUE(IsUndef(UNDEF_VALUE));
    EXPECT_FALSE(IsUndef(0.0));
    EXPECT_FALSE(IsUndef(-999999.0000001));
    EXPECT_FALSE(IsUndef(-999998.9999999));
}

TEST(TextWindow, KeepsTextsInOrderAndEchoes) {
    std::FILE* f = std::tmpfile();
    ASSERT_NE(f, nullptr);
    CNorvexTxtWnd w(f);
    w.Printf(1, "Erreur ligne %d : %s", 3, "x");
    w.Printf(1, "%s", "100%");
    ASSERT_EQ(w.Texts().size(), 2u);
    EXPECT_EQ(w.Texts()[0], "Erreur ligne 3 : x");
    EXPECT_EQ(w.Texts()[1], "100%");
    std::rewind(f);
    char buf[64] = {};
    size_t n = std::fread(buf, 1, sizeof buf - 1, f);
    EXPECT_EQ(std::string(buf, n), "Erreur ligne 3 : x\n100%\n");
    std::fclose(f);
    w.Clear();
    EXPECT_TRUE(w.Texts().empty());
}

TEST(Hooks, MessageBoxAndFileDialogHandlersChain) {
    CWnd owner;
    std::string seen;
    MessageBoxHandler previous = SetMessageBoxHandler([&](CWnd* o, const char* text, const char* caption, unsigned f) {
        seen = std::string(caption) + "|" + text;
        EXPECT_EQ(o, &owner);
        return (f & MB_YESNO) ? IDYES : IDOK;
    });
    EXPECT_EQ(CallMessageBox(&owner, "Continuer ?", "NORVEX", MB_YESNO | MB_ICONQUESTION), IDYES);
    EXPECT_EQ(seen, "NORVEX|Continuer ?");
    SetMessageBoxHandler(previous);

    std::string path = "unchanged";
    EXPECT_FALSE(CallFileDialog(FileDialogRequest{false, "t", "f", "i", OFN_FILEMUSTEXIST}, path));
    EXPECT_EQ(path, "unchanged");
    FileDialogHandler before = SetFileDialogHandler([](const FileDialogRequest& r, std::string& out) {
        out = r.initialName + ".geo";
        return true;
    });
    EXPECT_TRUE(CallFileDialog(FileDialogRequest{true, "t", "f", "book", 0}, path));
    EXPECT_EQ(path, "book.geo");
    SetFileDialogHandler(before);
}

TEST(CWnd, ControlTexts) {
    CWnd w;
    CString out("x");
    EXPECT_EQ(w.GetDlgItemText(7, out), 0);
    EXPECT_TRUE(out.IsEmpty());
    w.SetDlgItemText(7, "P12");
    EXPECT_EQ(w.GetDlgItemText(7, out), 3);
    EXPECT_EQ(out, "P12");
}
