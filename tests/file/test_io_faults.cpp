// Loading, saving and backing up when the file system says no or the file
// is not what a field book should be: each gives its documented result and
// message, and leaves the book and the files it did not mean to write as
// they were.
#include <gtest/gtest.h>

#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>

#include <filesystem>
#include <functional>
#include <string>
#include <vector>

#include <carnet/carnet.h>
#include <carnet/fileio.h>

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

TEST_F(IoFaults, WhatStandsAtTheBackupNameIsNeverFollowedNorWrittenTo) {
    CCarnet book;
    book.m_FileName = Path("chantier.geo");
    WriteFile(book.m_FileName.str(), "Station S1 1.5\n");
    WriteFile(Path("autre.txt"), "autre\n");
    const struct {
        const char* what;
        std::function<bool(const std::string&)> make;
        int error;
    } cases[] = {
        {"a folder", [](const std::string& p) { return ::mkdir(p.c_str(), 0755) == 0; }, EISDIR},
        {"a pipe", [](const std::string& p) { return ::mkfifo(p.c_str(), 0644) == 0; }, EINVAL},
        {"a device", [](const std::string& p) { return MakeDevice(p, Device::Zero); }, EINVAL},
        {"a link to /dev/zero", [](const std::string& p) { return ::symlink("/dev/zero", p.c_str()) == 0; }, ELOOP},
        {"a link to a file", [this](const std::string& p) { return ::symlink(Path("autre.txt").c_str(), p.c_str()) == 0; },
         ELOOP},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.what);
        std::filesystem::remove_all(Path("chantier.sbk"));
        if (!c.make(Path("chantier.sbk"))) continue;  // no device node here
        int error = 0;
        EXPECT_EQ(book.TryBackUp(&error), -1);
        EXPECT_EQ(error, c.error);
        book.BackUp();
        struct stat st;
        ASSERT_EQ(::lstat(Path("chantier.sbk").c_str(), &st), 0);
        EXPECT_FALSE(S_ISREG(st.st_mode));
    }
    EXPECT_EQ(ReadFile(book.m_FileName.str()), "Station S1 1.5\n");
    EXPECT_EQ(ReadFile(Path("autre.txt")), "autre\n");

    // The name rule stays within the file name; a book named as its own
    // backup gets none.
    const std::pair<const char*, const char*> names[] = {{"d/ab", "d/ab.sbk"}, {"d/x", "d/x.sbk"}, {"d/abc", "d/sbk"},
                                                         {"d/x.sbk", nullptr}};
    std::filesystem::create_directory(Path("d"));
    for (const auto& [name, backup] : names) {
        book.m_FileName = Path(name);
        WriteFile(Path(name), "Station S2 1.5\n");
        int error = 0;
        EXPECT_EQ(book.TryBackUp(&error), backup ? 1 : -1) << name;
        if (backup) {
            EXPECT_EQ(ReadFile(Path(backup)), "Station S2 1.5\n");
        } else {
            EXPECT_EQ(error, EEXIST);
        }
    }
    EXPECT_EQ(Entries(Path("d")), (std::vector<std::string>{"ab", "ab.sbk", "abc", "sbk", "x", "x.sbk"}));

    // Where permissions count, a folder that refuses the new file.
    book.m_FileName = Path("chantier.geo");
    std::filesystem::remove_all(Path("chantier.sbk"));
    ASSERT_EQ(::chmod(Dir().c_str(), 0555), 0);
    const int made = WithoutPrivileges([&] { return book.TryBackUp() + 1; });
    ASSERT_EQ(::chmod(Dir().c_str(), 0755), 0);
    EXPECT_EQ(made, 0);
    EXPECT_FALSE(std::filesystem::exists(Path("chantier.sbk")));
    EXPECT_TRUE(m_boxes.boxes.empty());
}

TEST_F(IoFaults, NoWriterFollowsALinkThatAnotherUserPlantedInAStickyFolder) {
    // A shared folder, a file of the user "nobody" elsewhere, and links to it
    // that a third user planted in the folder under the names nobody writes.
    const std::string shared = Path("partage"), home = Path("maison"), victim = home + "/victime.txt";
    ASSERT_EQ(::mkdir(shared.c_str(), 0755), 0);
    ASSERT_EQ(::chmod(shared.c_str(), 01777), 0);
    ASSERT_EQ(::mkdir(home.c_str(), 0755), 0);
    WriteFile(victim, "a moi\n");
    WriteFile(shared + "/chantier.geo", "Station S1 1.5\n");
    for (const std::string& file : {home, victim, shared + "/chantier.geo"})
        ASSERT_EQ(::chown(file.c_str(), 65534, 65534), 0);
    for (const char* name : {"chantier.sbk", "sortie.geo", "params.ini", "brut.txt"}) {
        const std::string link = shared + "/" + name;
        ASSERT_EQ(::symlink(victim.c_str(), link.c_str()), 0);
        ASSERT_EQ(::lchown(link.c_str(), 12345, 12345), 0);
    }
    // A link that nobody planted is followed.
    ASSERT_EQ(::symlink(victim.c_str(), (shared + "/mien.txt").c_str()), 0);
    ASSERT_EQ(::lchown((shared + "/mien.txt").c_str(), 65534, 65534), 0);
    const int failures = WithoutPrivileges([&] {
        CCarnet book;
        book.m_FileName = shared + "/chantier.geo";
        int bits = book.TryBackUp() != -1 ? 1 : 0;
        bits |= book.Save(shared + "/sortie.geo", nullptr, false) != 0 ? 2 : 0;
        bits |= SetParamString((shared + "/params.ini").c_str(), "S", "k", "v") != 0 ? 4 : 0;
        auto fill = [](std::FILE* f) { return std::fputs("pris\n", f) >= 0 ? 0 : EIO; };
        bits |= CarnetWriteFile((shared + "/brut.txt").c_str(), fill) != EACCES ? 8 : 0;
        bits |= ReadFile(victim) != "a moi\n" ? 16 : 0;
        bits |= CarnetWriteFile((shared + "/mien.txt").c_str(), fill) != 0 ? 32 : 0;
        return bits;
    });
    EXPECT_EQ(failures, 0);
    EXPECT_EQ(ReadFile(victim), "pris\n");
}

TEST_F(IoFaults, ABookFileThatSomeoneWroteSinceItWasReadIsNotReplaced) {
    CCarnet book;
    Fill(book);
    const std::string file = book.m_FileName.str();
    // Another program appends a line: the save is refused, the line kept.
    const std::string appended = ReadFile(file) + "Commentaire ajout\n";
    WriteFile(file, appended);
    EXPECT_EQ(book.Save(file, nullptr, false), 0);
    EXPECT_EQ(m_boxes.boxes, std::vector<std::string>{CannotSave(file)});
    EXPECT_EQ(ReadFile(file), appended);
    // Loaded again, saved twice: each save stands for the file it wrote.
    ASSERT_EQ(book.Load(nullptr, file, m_params, 0, nullptr), 1);
    EXPECT_EQ(book.Save(file, nullptr, false), 1);
    EXPECT_EQ(book.Save(file, nullptr, true), 1);
    // Another file than the book's own has no version to keep from.
    EXPECT_EQ(book.Save(Path("copie.geo"), nullptr, false), 1);
    // A name that fills the file name's limit still saves.
    const std::string longest = Path(std::string(251, 'n') + ".geo");
    EXPECT_EQ(book.Save(longest, nullptr, false), 1);
    EXPECT_EQ(ReadFile(longest), ReadFile(Path("copie.geo")));
}
