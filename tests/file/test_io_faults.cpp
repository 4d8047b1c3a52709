// Loading, saving and backing up when the file system says no or the file
// is not what a field book should be: each gives its documented result and
// message, and leaves the book and the files it did not mean to write as
// they were.
#include <gtest/gtest.h>

#include <sys/stat.h>
#include <unistd.h>

#include <filesystem>
#include <functional>
#include <string>
#include <vector>

#include <carnet/carnet.h>

#include "fault_fixture.h"
#include "save_fixture.h"

using fault_test::Device;
using fault_test::IsDevice;
using fault_test::MakeDevice;
using fault_test::WithoutPrivileges;
using save_test::Written;
using store_test::Entries;
using store_test::ReadFile;
using store_test::WriteFile;

namespace {

class IoFaults : public save_test::BookFileTest {
protected:
    void SetUp() override {
        BookFileTest::SetUp();
        m_params = Path("params.ini");
        // "nobody" must reach the files: only their own modes may refuse.
        ASSERT_EQ(::chmod(Dir().c_str(), 0755), 0);
    }

    // A book of two elements that was loaded from before.geo.
    void Fill(CCarnet& book) {
        WriteFile(Path("before.geo"), "Station S1 1.5 0.0\nMesure M1 54.321\n");
        ASSERT_EQ(book.Load(nullptr, Path("before.geo"), m_params, 0, nullptr), 1);
        ASSERT_EQ(book.length(), 2);
    }

    std::string Block(CCarnet& book) {
        return Written([&](std::FILE* f) { book.Write(f, 1); });
    }

    static std::string CannotOpen(const std::string& path) {
        return "|Impossible d'ouvrir la Sitebook :\n" + path + " !";
    }
    static std::string CannotSave(const std::string& path) {
        return "|Impossible d'enregistrer la Sitebook sous\n" + path + " !";
    }

    std::string m_params;
};

const char* CommentText(const CCarnet& book, int i) {
    return static_cast<const CComment*>(book.ptrAt(i))->Str().GetString();
}

}  // namespace

TEST_F(IoFaults, AFileThatCannotBeOpenedLeavesTheBookAsItWas) {
    WriteFile(Path("plain"), "x");
    std::filesystem::create_directory(Path("dossier.geo"));
    std::filesystem::create_symlink(Path("absent.geo"), Path("dangling.geo"));
    std::filesystem::create_symlink(Path("loop.geo"), Path("loop.geo"));
    const std::string refused[] = {Path("dossier.geo"), Path("absent.geo"), Path("plain/chantier.geo"),
                                   Path("dangling.geo"), Path("loop.geo")};
    for (const std::string& path : refused) {
        for (int append : {0, 1}) {
            SCOPED_TRACE(path + (append ? " appended" : ""));
            CCarnet book;
            Fill(book);
            const std::string before = Block(book);
            m_boxes.boxes.clear();
            CNorvexTxtWnd wnd;
            EXPECT_EQ(book.Load(&wnd, path, append, nullptr), 0);
            EXPECT_EQ(Block(book), before);
            EXPECT_EQ(book.m_FileName, Path("before.geo"));
            EXPECT_EQ(m_boxes.boxes, std::vector<std::string>{CannotOpen(path)});
            EXPECT_TRUE(wnd.Texts().empty());
        }
    }
}

TEST_F(IoFaults, AnUnreadableFileIsOneThatCannotBeOpened) {
    const std::string file = Path("secret.geo");
    WriteFile(file, "Station S9 1.5\n");
    ASSERT_EQ(::chmod(file.c_str(), 0), 0);
    // The child reports each failed expectation as a bit of its result.
    const int failures = WithoutPrivileges([&] {
        CCarnet book;
        book.append(new CComment("gard\xE9"), 1000);
        const int loaded = book.Load(nullptr, file, 0, nullptr);
        return (loaded != 0 ? 1 : 0) | (book.length() != 1 ? 2 : 0) |
               (m_boxes.boxes != std::vector<std::string>{CannotOpen(file)} ? 4 : 0);
    });
    EXPECT_EQ(failures, 0);
    EXPECT_EQ(ReadFile(file), "Station S9 1.5\n");
}

TEST_F(IoFaults, ALineHoldingANulByteIsDamaged) {
    static const char kBytes[] = "Station S1 1.5\0 9.9 fin\nCommentaire a\0b\n\0\nStation S2 1.5\nMesure M2 54.321\n";
    const std::string bytes(kBytes, sizeof kBytes - 1);
    WriteFile(Path("nul.geo"), bytes);
    CCarnet book;
    CNorvexTxtWnd wnd;
    EXPECT_EQ(book.Load(&wnd, Path("nul.geo"), m_params, 0, nullptr), 1);
    ASSERT_EQ(book.length(), 2);
    EXPECT_EQ(book.typAt(0), 1001u);
    EXPECT_EQ(book.typAt(1), 1003u);
    EXPECT_EQ(wnd.Texts(), (std::vector<std::string>{
                               "Erreur ligne 1 : ligne endommag\xE9" "e (octet nul) !", " (Station S1 1.5\\0 9.9 fin)",
                               "Erreur ligne 1 : ligne endommag\xE9" "e (octet nul) !", " (Commentaire a\\0b)",
                               "Erreur ligne 1 : ligne endommag\xE9" "e (octet nul) !", " (\\0)"}));
}

TEST_F(IoFaults, AMegabyteLineIsReadWhole) {
    const std::string text(1 << 20, 'x');
    WriteFile(Path("long.geo"), "Commentaire " + text + "\nInconnu " + text + "\nStation S1 1.5\n");
    CCarnet book;
    CNorvexTxtWnd wnd;
    EXPECT_EQ(book.Load(&wnd, Path("long.geo"), m_params, 0, nullptr), 1);
    ASSERT_EQ(book.length(), 2);
    EXPECT_EQ(std::string(CommentText(book, 0)), text);
    ASSERT_EQ(wnd.Texts().size(), 2u);
    EXPECT_EQ(wnd.Texts()[1], " (Inconnu " + text + ")");

    // Saved and loaded again, the long line comes back the same.
    ASSERT_EQ(book.Save(Path("again.geo"), nullptr, false), 1);
    CCarnet again;
    EXPECT_EQ(again.Load(nullptr, Path("again.geo"), m_params, 0, nullptr), 1);
    EXPECT_EQ(Block(again), Block(book));
}

TEST_F(IoFaults, AMillionLines) {
    const int lines = 1000000;
    std::string bytes;
    bytes.reserve(static_cast<size_t>(lines) * 17 + 16);
    for (int i = 0; i < lines; ++i) bytes += i % 2 ? "ExcentRad 0.1500\n" : "ExcentVer 0.0500\n";
    bytes += "Inconnu\n";
    WriteFile(Path("million.geo"), bytes);
    CCarnet book;
    CNorvexTxtWnd wnd;
    EXPECT_EQ(book.Load(&wnd, Path("million.geo"), m_params, 0, nullptr), 1);
    EXPECT_EQ(book.length(), lines);
    EXPECT_EQ(book.typAt(lines - 1), 1010u);
    EXPECT_EQ(wnd.Texts(), (std::vector<std::string>{"Erreur ligne 1000001 : commande <Inconnu> incorrecte !",
                                                     " (Inconnu)"}));
}

TEST_F(IoFaults, FailedSavesTouchNoFile) {
    CCarnet book;
    Fill(book);
    WriteFile(Path("before.sbk"), "copie\n");
    WriteFile(Path("plain"), "x");
    std::filesystem::create_directory(Path("dossier.geo"));
    std::vector<std::string> refused = {Path("absent/chantier.geo"), Path("plain/chantier.geo"), Path("dossier.geo"),
                                        "/dev/full"};
    if (MakeDevice(Path("full.geo"), Device::Full)) refused.push_back(Path("full.geo"));
    const std::vector<std::string> files = Entries(Dir());
    for (const std::string& path : refused) {
        for (bool append : {false, true}) {
            SCOPED_TRACE(path + (append ? " appended" : ""));
            m_boxes.boxes.clear();
            EXPECT_EQ(book.Save(path, nullptr, append), 0);
            EXPECT_EQ(m_boxes.boxes, std::vector<std::string>{CannotSave(path)});
            EXPECT_EQ(book.m_FileName, Path("before.geo"));
            EXPECT_EQ(Entries(Dir()), files);
        }
    }
    EXPECT_EQ(ReadFile(Path("before.geo")), "Station S1 1.5 0.0\nMesure M1 54.321\n");
    EXPECT_EQ(ReadFile(Path("before.sbk")), "copie\n");
    if (refused.size() == 5) {
        EXPECT_TRUE(IsDevice(Path("full.geo")));
    }

    // Where permissions count, a folder that may not be written refuses the
    // save of a file in it, present or new, and the file keeps its bytes.
    WriteFile(Path("lecture.geo"), "ancien\n");
    ASSERT_EQ(::chmod(Path("lecture.geo").c_str(), 0444), 0);
    const int failures = WithoutPrivileges([&] {
        m_boxes.boxes.clear();
        const int saved = book.Save(Path("lecture.geo"), nullptr, false) + book.Save(Path("neuf.geo"), nullptr, true);
        return (saved != 0 ? 1 : 0) | (m_boxes.boxes.size() != 2 ? 2 : 0);
    });
    EXPECT_EQ(failures, 0);
    EXPECT_EQ(ReadFile(Path("lecture.geo")), "ancien\n");
    EXPECT_FALSE(std::filesystem::exists(Path("neuf.geo")));
}

TEST_F(IoFaults, AFailedBackUpSaysNothingAndKeepsEveryFile) {
    CCarnet book;
    book.m_FileName = Path("chantier.geo");
    WriteFile(book.m_FileName.str(), "Station S1 1.5\n");
    if (!MakeDevice(Path("chantier.sbk"), Device::Full)) GTEST_SKIP() << "no device node can be made here";
    // The backup goes to a device: written to, never replaced; a full one
    // refuses the bytes.
    book.BackUp();
    EXPECT_TRUE(IsDevice(Path("chantier.sbk")));
    EXPECT_EQ(ReadFile(book.m_FileName.str()), "Station S1 1.5\n");

    // A backup where permissions count: the folder refuses the new file.
    std::filesystem::remove(Path("chantier.sbk"));
    ASSERT_EQ(::chmod(Dir().c_str(), 0555), 0);
    const int failures = WithoutPrivileges([&] {
        book.BackUp();
        return 0;
    });
    ASSERT_EQ(::chmod(Dir().c_str(), 0755), 0);
    EXPECT_EQ(failures, 0);
    EXPECT_EQ(Entries(Dir()), std::vector<std::string>{"chantier.geo"});
    EXPECT_TRUE(m_boxes.boxes.empty());
}
