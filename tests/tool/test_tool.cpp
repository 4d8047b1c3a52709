// The built carnet tool, run on the bundled example book and on broken
// copies of it.
#include <gtest/gtest.h>

#include <sys/wait.h>

#include <cstdlib>
#include <string>
#include <vector>

#include "platform/store_fixture.h"

using store_test::Entries;
using store_test::ReadFile;
using store_test::WriteFile;

namespace {

const std::string kExample = std::string(CARNET_SOURCE_DIR) + "/examples/chantier.geo";

struct Outcome {
    int status = -1;
    std::string out, err;
};

// Splits a text into its lines, without their newlines.
std::vector<std::string> Lines(const std::string& text) {
    std::vector<std::string> lines;
    size_t start = 0;
    for (size_t end; (end = text.find('\n', start)) != std::string::npos; start = end + 1)
        lines.push_back(text.substr(start, end - start));
    if (start < text.size()) lines.push_back(text.substr(start));
    return lines;
}

class Tool : public store_test::StoreTest {
protected:
    void SetUp() override {
        if (std::string(CARNET_TOOL).empty()) GTEST_SKIP() << "the tool is not built";
        StoreTest::SetUp();
        ::mkdir(Path("work").c_str(), 0755);
        m_example = ReadFile(kExample);
        ASSERT_FALSE(m_example.empty());
    }

    // Runs the tool with the arguments (paths without quotes or blanks).
    Outcome Carnet(const std::string& args) {
        const std::string out = Path("out.txt"), err = Path("err.txt");
        const std::string cmd = std::string(CARNET_TOOL) + " " + args + " >" + out + " 2>" + err;
        const int raw = std::system(cmd.c_str());
        Outcome run;
        run.status = WIFEXITED(raw) ? WEXITSTATUS(raw) : -1;
        run.out = ReadFile(out);
        run.err = ReadFile(err);
        return run;
    }

    // A copy of the example in the work folder.
    std::string Copy(const std::string& name, const std::string& bytes) {
        const std::string path = Path("work/" + name);
        WriteFile(path, bytes);
        return path;
    }

    // The example with some of its lines replaced.
    std::string Broken() const {
        std::vector<std::string> lines = Lines(m_example);
        for (std::string& line : lines) {
            if (line.rfind("000013  ExcentRad", 0) == 0) line.replace(8, 9, "ExcentRod");
            if (line.rfind("000020  Station          S2", 0) == 0) line = "000020  Station          S2";
            if (line.find("Option_Planim") != std::string::npos) line.erase(line.size() - 2);
        }
        std::string text;
        for (const std::string& line : lines) text += line + "\n";
        return text;
    }

    std::string m_example;
};

}  // namespace

TEST_F(Tool, CheckSumsUpTheExampleAndItsBrokenCopy) {
    Outcome run = Carnet("check " + kExample);
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(run.out, kExample + ": 41 elements loaded, 0 lines rejected\n");
    EXPECT_EQ(run.err, "");

    const std::string broken = Copy("broken.geo", Broken());
    run = Carnet("--encoding cp1252 check " + broken);
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(run.out, broken + ": 39 elements loaded, 3 lines rejected\n");
    EXPECT_EQ(Lines(run.err), (std::vector<std::string>{
                                  broken + ": Erreur ligne 1 : la commande <Option_Planim> n'a pas le bon nombre de "
                                           "param\xE8tres !",
                                  broken + ":  (        Option_Planim                       1  0.005  0.010  0.020  "
                                           "0.015  0.050 0.020)",
                                  broken + ": Erreur ligne 13 : commande <ExcentRod> incorrecte !",
                                  broken + ":  (000013  ExcentRod                         0.1500)",
                                  broken + ": Erreur ligne 19 : commande <Station> incompl\xE8te !",
                                  broken + ":  (000020  Station          S2)",
                              }));

    // Every file is summed up; the worst outcome is the status.
    const std::string missing = Path("work/absent.geo");
    run = Carnet("check " + missing + " " + broken + " " + kExample + " " + Path("work"));
    EXPECT_EQ(run.status, 2);
    EXPECT_EQ(Lines(run.out), (std::vector<std::string>{
                                  missing + ": not read",
                                  broken + ": 39 elements loaded, 3 lines rejected",
                                  kExample + ": 41 elements loaded, 0 lines rejected",
                                  Path("work") + ": not read",
                              }));
    EXPECT_EQ(Lines(run.err).front(), "carnet: cannot read " + missing + ": No such file or directory");
    EXPECT_EQ(Lines(run.err).back(), "carnet: cannot read " + Path("work") + ": Is a directory");
}

TEST_F(Tool, ListPrintsTheBooksLines) {
    // The saved file's element lines, with or without their numbers.
    std::vector<std::string> numbered = Lines(m_example);
    ASSERT_GT(numbered.size(), 4u);
    numbered.erase(numbered.begin(), numbered.begin() + 4);
    std::vector<std::string> plain;
    for (const std::string& line : numbered) plain.push_back(line.substr(8));

    Outcome run = Carnet("--encoding cp1252 list --numbers " + kExample);
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(Lines(run.out), numbered);
    EXPECT_EQ(run.err, "");
    run = Carnet("list " + kExample + " --encoding cp1252");
    EXPECT_EQ(Lines(run.out), plain);

    // UTF-8 for a terminal that wants it, the dash of code page 1252 included.
    run = Carnet("--encoding utf8 list " + kExample);
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(Lines(run.out).front(),
              "Commentaire      Lotissement \xC2\xAB Les Pr\xC3\xA9s Hauts \xC2\xBB \xE2\x80\x94 \xC3\xA9tat des lieux "
              "du 14 mars 2023");

    // A broken book is listed without its rejected lines.
    run = Carnet("list " + Copy("broken.geo", Broken()));
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(Lines(run.out).size(), plain.size() - 2);
    EXPECT_EQ(Carnet("list " + Path("work/absent.geo")).status, 2);
}

TEST_F(Tool, FormatReproducesTheExampleAndKeepsABackup) {
    const std::string book = Copy("chantier.geo", m_example);
    Outcome run = Carnet("format " + book);
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(run.out + run.err, "");
    EXPECT_EQ(ReadFile(book), m_example);

    // From a loosely typed book with older option lines, to another file.
    const std::string loose = Copy("saisie.geo",
                                   "Cal_Cor 1 601250 2428760 152 6366\n"
                                   "Tol_Niv 1 0 15\n"
                                   "Station   S1 1.562 0\n"
                                   "Mesure 101 1.3 201.2201 100.415 35.412 angle***b\xE2ti\n");
    const std::string out = Path("work/propre.geo");
    run = Carnet("format " + loose + " -o " + out);
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(Lines(ReadFile(out)),
              (std::vector<std::string>{
                  "        Option_Correc                       0  0.0  0.0  601250.000  2428760.000  152.000  6366.000",
                  "        Option_Projec                       Projection Lambert Zone II",
                  "        Option_Nivell                       1  0  0.015",
                  "        Option_Planim                       0  0.010  0.010  0.010  0.010  0.010 0.010 0",
                  "000001  Station          S1                1.562000   0.0000000                    ",
                  "000002  Mesure           101               1.300000 201.2201000 100.4150000  35.412000 "
                  "angle***b\xE2ti",
              }));

    // The backup holds the file as it was before.
    run = Carnet("format --backup " + loose + " -o " + book);
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(ReadFile(Path("work/chantier.sbk")), m_example);
    EXPECT_EQ(ReadFile(book), ReadFile(out));
    EXPECT_EQ(Entries(Path("work")),
              (std::vector<std::string>{"chantier.geo", "chantier.sbk", "propre.geo", "saisie.geo"}));
}

TEST_F(Tool, FormatTakesTheOptionsOfALocationWithoutChangingThem) {
    const std::string profile = Path("params.ini");
    const std::string settings = "[Options_Corrections]\nProjection=Projection Lambert Zone IV\nCorrAuto=0\n";
    WriteFile(profile, settings);
    const std::string book = Copy("chantier.geo", m_example);
    Outcome run = Carnet("format --params " + profile + " " + book);
    EXPECT_EQ(run.status, 0);
    const std::vector<std::string> lines = Lines(ReadFile(book));
    ASSERT_GT(lines.size(), 2u);
    EXPECT_EQ(lines[0], "        Option_Correc                       0  0.0  0.0  0.000  0.000  0.000  6366.000");
    EXPECT_EQ(lines[1], "        Option_Projec                       Projection Lambert Zone IV");
    EXPECT_EQ(ReadFile(profile), settings);
    EXPECT_EQ(Entries(Dir()), (std::vector<std::string>{"err.txt", "out.txt", "params.ini", "work"}));
}

TEST_F(Tool, FormatRefusesToLoseLinesAndReportsAFailedSave) {
    const std::string broken = Copy("broken.geo", Broken());
    Outcome run = Carnet("format --backup " + broken);
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(Lines(run.err).back(), "carnet: " + broken + ": 3 lines rejected; nothing written, they would be lost");
    EXPECT_EQ(ReadFile(broken), Broken());
    EXPECT_EQ(Entries(Path("work")), std::vector<std::string>{"broken.geo"});

    const std::string refused = Path("work/absent/chantier.geo");
    run = Carnet("--encoding cp1252 format " + kExample + " -o " + refused);
    EXPECT_EQ(run.status, 2);
    EXPECT_EQ(run.err, "carnet: Impossible d'enregistrer la Sitebook sous\n" + refused + " !\n");
    run = Carnet("format " + kExample + " -o /dev/full");
    EXPECT_EQ(run.status, 2);
    EXPECT_NE(run.err.find("Impossible d'enregistrer"), std::string::npos);
    EXPECT_NE(Carnet("check").status, 0);  // no file given
}
