#include <gtest/gtest.h>

#include <sys/stat.h>
#include <unistd.h>

#include <string>
#include <vector>

#include <carnet/carnet.h>

#include "save_fixture.h"

using save_test::Written;
using store_test::Entries;
using store_test::ReadFile;
using store_test::WithFileSizeLimit;
using store_test::WriteFile;

namespace {

// Every survey record kind, a path over two lines, symbols with blanks.
const char kEveryRecord[] =
    "Commentaire Lev\xE9 du 14 mars, temps couvert\n"
    "Appareil 0.0012 0 0.0003 0.0003 0.002 2 Tach\xE9om\xE8tre  TS 06\n"
    "Station S1 1.562 0.0000 borne***OGE\n"
    "Reference S2 1.3 112.4571 99.8712 184.231 clou\n"
    "Reference R100 254.3321\n"
    "ExcentRad 0.1500\n"
    "Mesure 101 1.3 201.2201 100.4150 35.412 arbre***fruitier\n"
    "ExcentTan -0.2500\n"
    "Mesure 102 1.3 231.7712 101.0022 41.118\n"
    "ExcentVer 0.0500\n"
    "Mesure 103 2.0 260.1045 98.4400 22.905 regard\n"
    "NivLectAR S1 1.4321 35.20 rep\xE8re***NGF\n"
    "NivLectAV 101 1.8790 41.75\n"
    "Point S1 3 601234.512 2428765.331 151.874 borne OGE\n"
    "Point R100 1 601890.000 2429012.500\n"
    "Point B7 2 152.310 rep\xE8re\n"
    "CheminEncadre C1 S1-1 S2-1 S3-1 S4-1 S5-1 S6-1 S7-1 S8-1\n"
    "CheminEncadre C1 S9-1 S1-2\n"
    "CheminAntenne C2 S2-1 S10-1\n"
    "Commande Calcul rayonnement %s\n";

class Save : public save_test::BookFileTest {
protected:
    void SetUp() override {
        BookFileTest::SetUp();
        m_params = Path("params.ini");
    }

    // A book read from text, with the test's parameter store.
    void LoadText(CCarnet& book, const std::string& text) {
        const std::string file = Path("source.geo");
        WriteFile(file, text);
        CNorvexTxtWnd wnd;
        book.Load(&wnd, file, m_params, 0, nullptr);
        EXPECT_TRUE(wnd.Texts().empty()) << wnd.Texts()[0];
    }

    // What a save writes, as the book's Write gives it.
    std::string Block(CCarnet& book) {
        return Written([&](std::FILE* f) { book.Write(f, 1); });
    }

    std::string m_params;
};

// Type, point number, symbol and display text of every element.
std::vector<std::string> Describe(CCarnet& book) {
    std::vector<std::string> out;
    for (int i = 0; i < book.length(); ++i)
        out.push_back(std::to_string(book.typAt(i)) + "|" + book.matAt(i).str() + "|" + book.symAt(i).str() + "|" +
                      book.parAt(i).str());
    return out;
}

int ModeOf(const std::string& path) {
    struct stat st;
    return ::stat(path.c_str(), &st) == 0 ? static_cast<int>(st.st_mode & 07777) : -1;
}

}  // namespace

TEST_F(Save, WritesOptionsThenNumberedLinesAndTakesTheName) {
    CCarnet book;
    book.m_ParamFile = m_params;
    book.append(new CStation("S1", 1.55, 12.3456789, ""), 1001);
    book.append(new CComment("Lev\xE9 du 12 mars"), 1000);
    book.append(new CExcent(1, 0.15), 1010);
    const std::string target = Path("chantier.geo");

    ASSERT_EQ(book.Save(target, nullptr, false), 1);
    EXPECT_EQ(book.m_FileName, target);
    const std::string options = Written([&](std::FILE* f) { book.WriteOptions(f); });
    EXPECT_EQ(ReadFile(target), options +
                                    "000001  Station          S1                1.550000  12.3456789" +
                                    std::string(20, ' ') + "\n"
                                    "000002  Commentaire      Lev\xE9 du 12 mars\n"
                                    "000003  ExcentTan       " + std::string(17, ' ') + " 0.1500\n");
    // Unnumbered, the same lines without their prefix.
    const std::string plain = Written([&](std::FILE* f) { book.Write(f, m_params, 0); });
    EXPECT_EQ(plain.substr(options.size(), 16), "Station         ");
    EXPECT_TRUE(m_boxes.boxes.empty());
}

TEST_F(Save, EverySurveyRecordLoadsBackAndSavesToTheSameBytes) {
    SetParamString(m_params.c_str(), "Options_Corrections", "Projection", "Projection Lambert Zone II");
    SetParamString(m_params.c_str(), "Options_Tolerances", "TolAngles", "0.005");
    CCarnet first;
    LoadText(first, kEveryRecord);
    ASSERT_EQ(first.length(), 19);
    // Taken before saving: writers mark the blanks of some symbols in place.
    const std::vector<std::string> loaded = Describe(first);
    const std::string a = Path("a.geo"), b = Path("b.geo");
    ASSERT_EQ(first.Save(a, nullptr, false), 1);

    // Loaded with a fresh store: the options come back from the file.
    m_params = Path("other.ini");
    CCarnet second;
    CNorvexTxtWnd wnd;
    ASSERT_EQ(second.Load(&wnd, a, m_params, 0, nullptr), 1);
    EXPECT_TRUE(wnd.Texts().empty());
    EXPECT_EQ(Describe(second), loaded);
    ASSERT_EQ(second.Save(b, nullptr, false), 1);
    EXPECT_EQ(ReadFile(b), ReadFile(a));
    EXPECT_NE(ReadFile(a).find("Projection Lambert Zone II\n"), std::string::npos);
    EXPECT_NE(ReadFile(a).find("000019  Commande         Calcul rayonnement %s\n"), std::string::npos);
}

TEST_F(Save, AppendingAddsACompleteNumberedCopyEachTime) {
    CCarnet book;
    LoadText(book, "Station S1 1.5\nMesure M1 54.321\n");
    const std::string block = Block(book);
    const std::string target = Path("journal.geo");
    WriteFile(target, "ancien contenu sans fin de ligne");
    ASSERT_EQ(book.Save(target, nullptr, true), 1);
    ASSERT_EQ(book.Save(target, nullptr, true), 1);
    EXPECT_EQ(ReadFile(target), "ancien contenu sans fin de ligne" + block + block);
    EXPECT_NE(block.find("000002  Mesure"), std::string::npos);

    // A file that does not exist yet is created by the first append.
    const std::string fresh = Path("fresh.geo");
    ASSERT_EQ(book.Save(fresh, nullptr, true), 1);
    ASSERT_EQ(book.Save(fresh, nullptr, true), 1);
    EXPECT_EQ(ReadFile(fresh), block + block);
    EXPECT_EQ(Entries(Dir()), (std::vector<std::string>{"fresh.geo", "journal.geo", "source.geo"}));
}

TEST_F(Save, TheDialogChoosesTheNameOrCancels) {
    CCarnet book;
    LoadText(book, "Station S1 1.5\n");
    book.m_FileName = Path("ancien.geo");
    {
        // No dialog answer: the default cancels; nothing is written or shown.
        EXPECT_EQ(book.Save("", nullptr, false), 0);
        EXPECT_EQ(book.FileSave("x.geo"), 0);
        EXPECT_EQ(book.m_FileName, Path("ancien.geo"));
    }
    {
        DialogAnswer cancel(false, "");
        EXPECT_EQ(book.Save("", nullptr, false), 0);
        ASSERT_EQ(cancel.requests.size(), 1u);
        const FileDialogRequest& r = cancel.requests[0];
        EXPECT_TRUE(r.save);
        EXPECT_EQ(r.title, "Enregistrer la Sitebook sous");
        EXPECT_EQ(r.filter, "Sitebook NORVEX (*.geo)|*.geo||");
        EXPECT_EQ(r.initialName, Path("ancien.geo"));
        EXPECT_EQ(r.flags, OFN_HIDEREADONLY | OFN_OVERWRITEPROMPT | OFN_PATHMUSTEXIST);
    }
    {
        DialogAnswer confirm(true, Path("choisi"));
        EXPECT_EQ(book.Save("", nullptr, false), 1);
        EXPECT_EQ(book.m_FileName, Path("choisi"));  // no extension added
        EXPECT_EQ(ReadFile(Path("choisi")), Block(book));
    }
    {
        // A refused save leaves the book naming its earlier file.
        DialogAnswer confirm(true, Path("absent/choisi.geo"));
        EXPECT_EQ(book.Save("", nullptr, false), 0);
        EXPECT_EQ(book.m_FileName, Path("choisi"));
        ASSERT_EQ(m_boxes.boxes.size(), 1u);
        EXPECT_EQ(m_boxes.boxes[0], "|Impossible d'enregistrer la Sitebook sous\n" + Path("absent/choisi.geo") + " !");
    }
    EXPECT_EQ(Entries(Dir()), (std::vector<std::string>{"choisi", "source.geo"}));
}

TEST_F(Save, ARefusedPathOrAFullDiskShowsTheWarningAndCreatesNothing) {
    CCarnet book;
    LoadText(book, "Station S1 1.5\n");
    book.m_FileName = Path("source.geo");
    WriteFile(Path("plain"), "x");
    for (const std::string& path : {Path("absent/chantier.geo"), Path("plain/chantier.geo"), Dir(),
                                    std::string("/dev/full")}) {
        m_boxes.boxes.clear();
        EXPECT_EQ(book.Save(path, nullptr, false), 0) << path;
        EXPECT_EQ(book.Save(path, nullptr, true), 0) << path;
        EXPECT_EQ(book.m_FileName, Path("source.geo"));
        const std::string warning = "|Impossible d'enregistrer la Sitebook sous\n" + path + " !";
        EXPECT_EQ(m_boxes.boxes, std::vector<std::string>(2, warning));
    }
    EXPECT_EQ(Entries(Dir()), (std::vector<std::string>{"plain", "source.geo"}));
    // A device is written to, never replaced.
    EXPECT_EQ(book.Save("/dev/null", nullptr, false), 1);
    struct stat st;
    ASSERT_EQ(::stat("/dev/null", &st), 0);
    EXPECT_TRUE(S_ISCHR(st.st_mode));
}

TEST_F(Save, AWriteStoppedHalfwayLeavesThePreviousFileAsItWas) {
    CCarnet book;
    LoadText(book, "Station S1 1.5\nMesure M1 54.321\n");
    const std::string target = Path("chantier.geo");
    const std::string previous = "000001  Commentaire      version pr\xE9" "c\xE9" "dente\n";
    for (bool append : {false, true}) {
        WriteFile(target, previous);
        // The limit lets the old bytes be read but not the new file be written.
        const int status = WithFileSizeLimit(previous.size() + 10, [&] {
            const int saved = book.Save(target, nullptr, append);
            return saved == 0 && m_boxes.boxes.size() == 1 ? 0 : 1;
        });
        EXPECT_EQ(status, 0) << append;
        EXPECT_EQ(ReadFile(target), previous) << append;
        EXPECT_EQ(Entries(Dir()), (std::vector<std::string>{"chantier.geo", "source.geo"}));
    }
}

TEST_F(Save, SavingOverAFileKeepsItsPermissionsAndLinks) {
    CCarnet book;
    LoadText(book, "Station S1 1.5\n");
    const std::string target = Path("chantier.geo");
    WriteFile(target, "ancien\n");
    ASSERT_EQ(::chmod(target.c_str(), 0640), 0);
    ASSERT_EQ(book.Save(target, nullptr, false), 1);
    EXPECT_EQ(ModeOf(target), 0640);
    ASSERT_EQ(book.Save(target, nullptr, true), 1);
    EXPECT_EQ(ModeOf(target), 0640);
    EXPECT_EQ(ReadFile(target), Block(book) + Block(book));

    // Through a link, the linked file is replaced and the link stays.
    const std::string link = Path("lien.geo");
    ASSERT_EQ(::symlink(target.c_str(), link.c_str()), 0);
    ASSERT_EQ(book.Save(link, nullptr, false), 1);
    struct stat st;
    ASSERT_EQ(::lstat(link.c_str(), &st), 0);
    EXPECT_TRUE(S_ISLNK(st.st_mode));
    EXPECT_EQ(ReadFile(target), Block(book));
    EXPECT_EQ(ModeOf(target), 0640);

    // A new file gets the usual permissions less the umask.
    const mode_t mask = ::umask(022);
    ASSERT_EQ(book.Save(Path("nouveau.geo"), nullptr, false), 1);
    ::umask(mask);
    EXPECT_EQ(ModeOf(Path("nouveau.geo")), 0644);
}

TEST_F(Save, BackUpCopiesEveryByteBesideTheFile) {
    struct Case {
        const char* name;
        const char* backup;
    } cases[] = {{"chantier.geo", "chantier.sbk"}, {"chantier", "chantsbk"}, {"lev\xE9.GEO", "lev\xE9.sbk"}};
    std::string bytes = std::string(1000, 'x') + "\n\r\n" + std::string(1, '\0') + "\xFF\x80%s%n\n";
    bytes += std::string(300, '\xE9');  // a last line without a newline
    for (const Case& c : cases) {
        CCarnet book;
        book.m_FileName = Path(c.name);
        WriteFile(book.m_FileName.str(), bytes);
        ASSERT_EQ(::chmod(book.m_FileName.GetString(), 0600), 0);
        book.BackUp();
        EXPECT_EQ(ReadFile(Path(c.backup)), bytes) << c.name;
        EXPECT_EQ(ModeOf(Path(c.backup)), 0600);
        // A second backup replaces the first, with the book's permissions.
        WriteFile(book.m_FileName.str(), "nouveau\n");
        ASSERT_EQ(::chmod(book.m_FileName.GetString(), 0640), 0);
        ASSERT_EQ(::chmod(Path(c.backup).c_str(), 0666), 0);
        book.BackUp();
        EXPECT_EQ(ReadFile(Path(c.backup)), "nouveau\n") << c.name;
        EXPECT_EQ(ModeOf(Path(c.backup)), 0640);
    }
    EXPECT_EQ(Entries(Dir()).size(), 6u);
}

TEST_F(Save, AFailedBackUpChangesNothing) {
    CCarnet book;
    ::mkdir(Path("dossier.geo").c_str(), 0755);
    for (const std::string& name : {Path("absent.geo"), Path("dossier.geo"), std::string("")}) {
        book.m_FileName = name;
        book.BackUp();
    }
    // A backup name that is a folder, or a write stopped halfway, leave the
    // earlier backup as it was.
    WriteFile(Path("bloque.geo"), "texte\n");
    ::mkdir(Path("bloque.sbk").c_str(), 0755);
    book.m_FileName = Path("bloque.geo");
    book.BackUp();
    const std::string older = "000001  Commentaire      ancienne copie\n";
    WriteFile(Path("chantier.sbk"), older);
    book.m_FileName = Path("chantier.geo");
    WriteFile(book.m_FileName.str(), std::string(4000, 'y') + "\n");
    EXPECT_EQ(WithFileSizeLimit(1000, [&] {
                  book.BackUp();
                  return 0;
              }),
              0);
    EXPECT_EQ(ReadFile(Path("chantier.sbk")), older);
    EXPECT_EQ(Entries(Dir()), (std::vector<std::string>{"bloque.geo", "bloque.sbk", "chantier.geo", "chantier.sbk",
                                                        "dossier.geo"}));
    EXPECT_TRUE(m_boxes.boxes.empty());
}
