// The built carnet tool, run as a person or a script runs it: a table of
// command lines with their input files and the standard output, standard
// error, exit status and files they must leave behind.
#include <gtest/gtest.h>

#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <cstdio>

#include <algorithm>
#include <cctype>
#include <map>
#include <cstdlib>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "platform/store_fixture.h"

using store_test::Entries;
using store_test::ReadFile;
using store_test::WriteFile;

namespace {

const std::string kExample = std::string(CARNET_SOURCE_DIR) + "/examples/chantier.geo";

// Debian's python3, which sees Debian's python3-ezdxf.
const char kPython[] = "/usr/bin/python3";

struct Outcome {
    int status = -1;
    std::string out, err;
};

std::vector<std::string> Lines(const std::string& text) {
    std::vector<std::string> lines;
    size_t start = 0;
    for (size_t end; (end = text.find('\n', start)) != std::string::npos; start = end + 1)
        lines.push_back(text.substr(start, end - start));
    if (start < text.size()) lines.push_back(text.substr(start));
    return lines;
}

// The numbers of a text, in order.
std::vector<double> Numbers(const std::string& text) {
    std::vector<double> numbers;
    for (const char* at = text.c_str(); *at;) {
        char* end = nullptr;
        const double v = std::strtod(at, &end);
        if (end != at && (std::isdigit(static_cast<unsigned char>(*at)) || *at == '-' || *at == '.')) {
            numbers.push_back(v);
            at = end;
        } else {
            ++at;
        }
    }
    return numbers;
}

std::string Shell(const std::string& command) {
    std::string out;
    if (std::FILE* p = popen(command.c_str(), "r")) {
        char chunk[4096];
        for (size_t n; (n = std::fread(chunk, 1, sizeof chunk, p)) > 0;) out.append(chunk, n);
        pclose(p);
    }
    return out;
}

// What GDAL's ogrinfo reads of a file: each named feature's longitudes and
// latitudes, in order (the height of a point left out).
std::map<std::string, std::vector<double>> OgrPositions(const std::string& file) {
    std::map<std::string, std::vector<double>> read;
    std::string name;
    for (const std::string& line : Lines(Shell("ogrinfo -ro -al -q '" + file + "'"))) {
        const size_t label = line.find("ame (String) = ");
        if (label != std::string::npos && label <= 3) name = line.substr(label + 15);
        const size_t geometry = line.find_first_not_of(' ');
        if (geometry == std::string::npos || name.empty()) continue;
        const std::string kind = line.substr(geometry, line.find(' ', geometry) - geometry);
        if (kind != "POINT" && kind != "LINESTRING" && kind != "MULTILINESTRING") continue;
        std::vector<double> numbers = Numbers(line.substr(line.find('(')));
        if (kind == "POINT") numbers.resize(2);
        read[name] = numbers;
        name.clear();
    }
    return read;
}

std::string Replace(std::string text, const std::string& from, const std::string& to) {
    for (size_t at = 0; (at = text.find(from, at)) != std::string::npos; at += to.size()) text.replace(at, from.size(), to);
    return text;
}

// Whether the lines match the expected ones, where a line "..." stands for
// any number of lines.
bool LinesMatch(const std::vector<std::string>& got, size_t g, const std::vector<std::string>& want, size_t w) {
    if (w == want.size()) return g == got.size();
    if (want[w] == "...") {
        for (size_t k = g; k <= got.size(); ++k)
            if (LinesMatch(got, k, want, w + 1)) return true;
        return false;
    }
    return g < got.size() && got[g] == want[w] && LinesMatch(got, g + 1, want, w + 1);
}

// The example book, code page 1252, and the same in UTF-8.
std::string Example() { return ReadFile(kExample); }

// Code page 1252 as UTF-8, for the bytes that the example holds: the Latin-1
// range and the dash.
std::string ExampleUtf8() {
    std::string utf8;
    for (char ch : Example()) {
        const unsigned char c = static_cast<unsigned char>(ch);
        if (c == 0x97)
            utf8 += "\xE2\x80\x94";
        else if (c >= 0xA0)
            utf8 += {static_cast<char>(0xC0 | (c >> 6)), static_cast<char>(0x80 | (c & 0x3F))};
        else
            utf8 += ch;
    }
    return utf8;
}

// The example with other option lines.
std::string ExampleWithOptions(const std::vector<std::string>& options) {
    std::vector<std::string> lines = Lines(Example());
    std::copy(options.begin(), options.end(), lines.begin());
    std::string text;
    for (const std::string& line : lines) text += line + "\n";
    return text;
}

// The example with three lines broken.
std::string Broken() {
    std::vector<std::string> lines = Lines(Example());
    for (std::string& line : lines) {
        if (line.rfind("000015  ExcentRad", 0) == 0) line.replace(8, 9, "ExcentRod");
        if (line.rfind("000022  Station          S2", 0) == 0) line = "000022  Station          S2";
        if (line.find("Option_Planim") != std::string::npos) line.erase(line.size() - 2);
    }
    std::string text;
    for (const std::string& line : lines) text += line + "\n";
    return text;
}

class Tool : public store_test::StoreTest {
protected:
    void SetUp() override {
        if (std::string(CARNET_TOOL).empty()) GTEST_SKIP() << "the tool is not built";
        StoreTest::SetUp();
        ::mkdir(Path("work").c_str(), 0755);
        ::setenv("LC_ALL", "C", 1);  // texts shown as the file's bytes unless asked otherwise
    }

    // Runs the tool; $EX stands for the example, $W for the work folder.
    Outcome Carnet(const std::string& args) {
        const std::string out = Path("out.txt"), err = Path("err.txt");
        // The arguments may end with redirections of their own, which win.
        const std::string cmd = std::string(CARNET_TOOL) + " >" + out + " 2>" + err + " " + Expand(args);
        const int raw = std::system(cmd.c_str());
        Outcome run;
        run.status = WIFEXITED(raw) ? WEXITSTATUS(raw) : -1;
        run.out = ReadFile(out);
        run.err = ReadFile(err);
        return run;
    }

    // Runs a Python script on a file; its standard output.
    std::string Python(const std::string& script, const std::string& file) {
        WriteFile(Path("check.py"), script);
        const std::string out = Path("py.txt");
        const std::string cmd = std::string(kPython) + " " + Path("check.py") + " " + file + " >" + out + " 2>&1";
        const int raw = std::system(cmd.c_str());
        std::string text = ReadFile(out);
        if (!WIFEXITED(raw) || WEXITSTATUS(raw) != 0) text = "python failed: " + text;
        return text;
    }

    std::string Expand(const std::string& text) {
        return Replace(Replace(text, "$EX", kExample), "$W/", Path("work/"));
    }
};

// One command line, the files it finds in the work folder, what it must show
// and exit with, and the files it must leave there ("" for no file at all).
struct Case {
    const char* title;
    std::string args;
    std::vector<std::pair<std::string, std::string>> files;
    int status;
    std::string out;
    std::string err;
    std::vector<std::pair<std::string, std::string>> after;
};

// Two points of Lambert-93 in a book that declares no projection: the
// origin (3 E, 46.5 N) and a point far south of France.
const std::string kLambert93 = "Point A 0 700000.0 6600000.0 100.0 borne\nPoint B 0 700000.0 5000000.0 borne\n";
const std::string kProfile = "[Options_Corrections]\nProjection=Projection Lambert Zone IV\nRayonTerre=8000\n";
const std::string kOldTable = "ARB;9;Arbre\n\nHAIE;30;Haie;1;lib;3;2\r\nMUR;40;Mur;2;1\n";

const Case kCases[] = {
    {"check sums up the example", "check $EX", {}, 0, "$EX: 43 elements loaded, 0 lines rejected\n", "", {}},
    {"check reports each rejected line after the file's name",
     "check $W/broken.geo",
     {{"broken.geo", Broken()}},
     1,
     "$W/broken.geo: 41 elements loaded, 3 lines rejected\n",
     "$W/broken.geo: Erreur ligne 1 : la commande <Option_Planim> n'a pas le bon nombre de param\xE8tres !\n"
     "$W/broken.geo:  (        Option_Planim                       1  0.005  0.010  0.020  0.015  0.050 0.020)\n"
     "$W/broken.geo: Erreur ligne 15 : commande <ExcentRod> incorrecte !\n"
     "$W/broken.geo:  (000015  ExcentRod                         0.1500)\n"
     "$W/broken.geo: Erreur ligne 21 : commande <Station> incompl\xE8te !\n"
     "$W/broken.geo:  (000022  Station          S2)\n",
     {}},
    {"the worst outcome of several files is the status",
     "check $W/absent.geo $EX $W/",
     {},
     2,
     "$W/absent.geo: not read\n$EX: 43 elements loaded, 0 lines rejected\n$W/: not read\n",
     "$W/absent.geo: cannot read: No such file or directory\n$W/: cannot read: Is a directory\n",
     {}},
    {"list shows UTF-8 when asked",
     "--output-encoding utf-8 list $EX",
     {},
     0,
     "Commentaire      Lotissement \xC2\xAB Les Pr\xC3\xA9s Hauts \xC2\xBB \xE2\x80\x94 \xC3\xA9tat des lieux du 14 mars "
     "2023\n...\nCommentaire      Fin du lev\xC3\xA9 \xC3\xA0 16 h 40\n",
     "",
     {}},
    {"show aligns one row per element of a type",
     "show $EX --type Point",
     {},
     0,
     "4  Point  S1     borne OGE   X =  601234.5120 , Y = 2428765.3310 , Z =   151.8740 , CP = 3\n"
     "5  Point  S2     calcul\xE9     X =  601404.5710 , Y = 2428836.1800\n"
     "6  Point  S3     borne OGE   X =  601319.4840 , Y = 2428962.9360 , Z =   153.5180 , CP = 3\n"
     "7  Point  S4     calcul\xE9     X =  601259.4840 , Y = 2429038.2960\n"
     "8  Point  R100   clocher     X =  601890.0000 , Y = 2429012.5000 , CP = 1\n"
     "9  Point  NGF12  rep\xE8re NGF  Z =   150.4120 , CP = 2\n",
     "",
     {}},
    {"show the whole book, positions right-aligned",
     "show $EX",
     {},
     0,
     " 1  Commentaire                         Lotissement \xAB Les Pr\xE9s Hauts \xBB \x97 \xE9tat des lieux du 14 mars "
     "2023\n...\n"
     "15  ExcentRad                           ER =  0.1500\n...\n"
     "43  Commentaire                         Fin du lev\xE9 \xE0 16 h 40\n",
     "",
     {}},
    {"show as JSON, always UTF-8",
     "show $EX --type CheminEncadre --json",
     {},
     0,
     "[\n{\"position\": 36, \"keyword\": \"CheminEncadre\", \"number\": \"C1\", \"code\": \"\", \"text\": \"S1-1 , "
     "S2-1 , S3-1\"},\n"
     "{\"position\": 37, \"keyword\": \"CheminAntenne\", \"number\": \"C2\", \"code\": \"\", \"text\": \"S3-1 , "
     "S4-1\"}\n]\n",
     "",
     {}},
    {"show refuses an unknown type", "show $EX --type 999", {}, 2, "",
     "carnet: no element type is named 999 (a code from 1000 to 1065 or a keyword)\n", {}},
    {"find lists the elements of a number and its coordinates",
     "find $EX S2",
     {},
     0,
     " 5  Point      S2  calcul\xE9  X =  601404.5710 , Y = 2428836.1800\n"
     "13  Reference  S2  clou     HP =   1.3000 , AH =  51.41236 , AV =  99.69610 , DI = 184.1383\n"
     "22  Station    S2           HI =   1.5480\n"
     "28  Reference  S2  clou     HP =   1.3000 , AH = 260.58601 , AV = 100.33488 , DI = 152.5894\n"
     "42  NivLectAV  S2  borne                   LM =  0.3652 , DH =  37.9500\n"
     "S2: X 601404.571000  Y 2428836.180000\n",
     "",
     {}},
    {"find a number without coordinates", "find $EX 105", {}, 0,
     "25  Mesure  105  bordure  HP =   1.3000 , AH =  45.11800 , AV = 100.02100 , DI =  28.4500\n105: no known coordinates\n",
     "", {}},
    {"find a number that nobody bears", "find $EX S9", {}, 1, "", "$EX: no element bears the point number S9\n", {}},
    {"next after the last number of any type", "next $EX", {}, 0, "S5\n", "", {}},
    {"next after the last measure", "next $EX --type Mesure", {}, 0, "110\n", "", {}},
    {"next in an empty book", "next $W/empty.geo --type 1006", {{"empty.geo", ""}}, 0, "1\n", "", {}},
    {"select rewrites, counts and matches",
     "select $EX '105-103;S 4'",
     {},
     0,
     "103-105;S4\n4 point numbers named, 6 elements of the book match\n"
     " 7  Point      S4   calcul\xE9       X =  601259.4840 , Y = 2429038.2960\n"
     "18  Mesure     103  regard EU     HP =   2.0000 , AH = 260.10450 , AV =  98.44000 , DI =  22.9050\n"
     "20  Mesure     104  poteau b\xE9ton  HP =   1.3000 , AH = 288.90200 , AV = 100.88100 , DI =  30.7770\n"
     "25  Mesure     105  bordure       HP =   1.3000 , AH =  45.11800 , AV = 100.02100 , DI =  28.4500\n"
     "30  Reference  S4   piquet        HP =   1.3000 , AH =  55.41468 , AV = 100.38049 , DI =  96.2789\n"
     "32  Station    S4                 HI =   1.5770\n",
     "",
     {}},
    {"select of station set-ups",
     "select $EX 'S2(1)-S3(1)'",
     {},
     0,
     "S.2(1)-S.3(1)\n2 point numbers named, 9 elements of the book match\n...\n",
     "",
     {}},
    {"select refuses a bad selection with its message", "select $EX 'P1-Q5'", {}, 1, "",
     "$EX: Le groupe P1-Q5 pr\xE9sent dans la cha\xEEne de s\xE9lection pr\xE9sente des radicaux diff\xE9rents !\n", {}},
    {"codes upgrades an older table and refuses nothing good",
     "codes $W/old.txt --version 0 -o $W/new.txt",
     {{"old.txt", kOldTable}},
     0,
     "",
     "",
     {{"new.txt", "ARB;9;Arbre\nHAIE;31;Haie;1;lib;3;2;0;;;0;;0;;0;;0;0\nMUR;43;Mur;2;1\n"}}},
    {"codes of the current version reads back what it writes",
     "codes $W/new.txt --version 5",
     {{"new.txt", "ARB;9;Arbre\nHAIE;31;Haie;1;lib;3;2;0;;;0;;0;;0;;0;0\nMUR;43;Mur;2;1\n"}},
     0,
     "ARB;9;Arbre\nHAIE;31;Haie;1;lib;3;2;0;;;0;;0;;0;;0;0\nMUR;43;Mur;2;1\n",
     "",
     {}},
    {"codes reports the lines it refuses and writes nothing",
     "codes $W/bad.txt --version 5 -o $W/new.txt",
     {{"bad.txt", "ARB;9;Arbre\n;9;sans code\nK;abc;Kind\nSEUL\n"}},
     1,
     "",
     "$W/bad.txt:2: refused, no code before the first \";\": ;9;sans code\n"
     "$W/bad.txt:3: refused, the kind \"abc\" is not a whole number: K;abc;Kind\n"
     "$W/bad.txt:4: refused, no kind after the code: SEUL\n"
     "$W/bad.txt: 3 lines refused; nothing written, they would be lost\n",
     {{"new.txt", ""}}},
    {"codes refuses a version beyond the current one", "codes $W/t.txt --version 6", {{"t.txt", "A;9;a\n"}}, 2,
     "", "carnet: --version: Value 6 not in range 0 to 5\n...\n", {}},
    {"interpret in sign mode with implied decimals",
     "interpret Sym_sans_Ori ARB+150-075 --sep '\xB1' --decimals 2",
     {},
     0,
     "Sym_sans_Ori                      ARB  1.500  -0.750\nCode = ARB , Ech X = 1.500 , Ech Y = -0.750\n",
     "",
     {}},
    {"interpret by type code", "interpret 1035 CER/L12/250 --decimals 2", {}, 0,
     "Cercle_R                          CER  L12  2.500\nCode = CER , Liaison = L12 , Rayon = 2.500\n", "", {}},
    {"interpret a UTF-8 keyword, case ignored", "interpret 'PARALL\xC3\x88LE' PAR/L2/15", {}, 0,
     "Parall\xE8le                         PAR  L2  15.000\nCode = PAR , Liaison = L2 , D\xE9" "calage = 15.000\n",
     "", {}},
    {"interpret says when the command is not usable", "interpret Inter_Dist ID/5", {}, 1,
     "Inter_Dist                        ID  5.000  -999999.000\nCode = ID\n",
     "carnet: ID/5 does not make a usable Inter_Dist command\n", {}},
    {"interpret refuses an unknown keyword", "interpret Point P1", {}, 2, "",
     "carnet: no drawing command has the keyword Point; carnet interpret --list shows them\n", {}},
    {"interpret lists the 55 drawing keywords", "interpret --list", {}, 0,
     "1011  PT_Sans_Ori\n...\n1033  Sym_Entr\xE9" "e\n...\n1065  Inter_Dist\n", "", {}},
    {"options of no location are the defaults",
     "options",
     {},
     0,
     "        Option_Correc                       1  0.0  0.0  0.000  0.000  0.000  6366.000\n"
     "        Option_Projec                       Aucune\n"
     "        Option_Nivell                       0  0  0.010\n"
     "        Option_Planim                       0  0.010  0.010  0.010  0.010  0.010 0.010 0\n",
     "",
     {}},
    {"options of a profile file, clamped, the file untouched",
     "options --params $W/params.ini",
     {{"params.ini", kProfile}},
     0,
     "        Option_Correc                       1  0.0  0.0  0.000  0.000  0.000  7000.000\n"
     "        Option_Projec                       Projection Lambert Zone IV\n...\n",
     "",
     {{"params.ini", kProfile}}},
    {"options of a missing profile file say so", "options --params $W/none.ini", {}, 0, "...\n",
     "$W/none.ini: no such profile file: these are the default options\n", {}},
    {"projection of the example: its system and the scale factor at its mean position",
     "projection $EX",
     {},
     0,
     "Projection Lambert Zone II\nsystem: EPSG:27572, NTF (Paris) / Lambert zone II\n"
     "...\n"
     "mean of 5 known points: X 601421.610  Y 2428923.049\n"
     "WGS 84 there: longitude 2.35586878, latitude 48.85864099\n"
     "scale factor there: 1.00052972 (+53.0 cm/km)\nmeridian convergence there: 0.0157 grad\n",
     "",
     {}},
    {"projection of a book that declares none", "projection $W/p.geo", {{"p.geo", "Station S1 1.5\n"}}, 0,
     "Aucune\nsystem: a local grid, with no reference system\n", "", {}},
    {"projection of a name PROJ does not know: a local grid, said", "projection $W/p.geo",
     {{"p.geo", "Option_Projec Rep\xE8re local\n"}}, 0,
     "Rep\xE8re local\nsystem: a local grid, with no reference system\n",
     "$W/p.geo: projection \"Rep\xE8re local\" is not a system PROJ knows (PROJ knows no coordinate system named "
     "\"Rep\xE8re local\"): taken as a local grid\n", {}},
    {"projection --crs names the system of a local grid; the mean outside its area is said",
     "projection $W/p.geo --crs EPSG:2154", {{"p.geo", kLambert93}}, 0,
     "Aucune\nsystem (--crs): EPSG:2154, RGF93 v1 / Lambert-93\n...\nmean of 2 known points: X 700000.000  Y "
     "5800000.000\nWGS 84 there: longitude 3.00000000, latitude 39.31029066\n"
     "scale factor there: 1.00665966 (+666.0 cm/km)\nmeridian convergence there: 0.0000 grad\n",
     "$W/p.geo: the mean position lies outside the system's area of use\n", {}},
    {"projection --crs of a name PROJ does not know", "projection $EX --crs EPSG:999999", {}, 2, "",
     "--crs: PROJ knows no coordinate system named \"EPSG:999999\"\n", {}},
    {"an export in longitude and latitude of a local grid is refused", "export $W/p.geo --to kml -o $W/p.kml",
     {{"p.geo", kLambert93}}, 2, "",
     "$W/p.geo: the book's coordinates are on a local grid (projection \"Aucune\"), and kml holds longitudes and "
     "latitudes: give --crs with the system they are in, such as --crs EPSG:2154; nothing written\n",
     {{"p.kml", ""}}},
    {"an export names the points outside the system's area of use and keeps them",
     "export $W/p.geo --to gpx --crs EPSG:2154", {{"p.geo", kLambert93}}, 0,
     "...\n<wpt lat=\"46.500000000\" lon=\"3.000000000\"><ele>100.000000</ele><name>A</name><desc>borne</desc>"
     "<src>known</src></wpt>\n<wpt lat=\"32.216383772\" lon=\"3.000000000\"><name>B</name><desc>borne</desc>"
     "<src>known</src></wpt>\n</gpx>\n",
     "$W/p.geo: outside the area of use of EPSG:2154: B; written all the same\n", {}},
    {"compute the example: a computation sheet within tolerances", "compute $EX", {}, 0,
     "Computation of $EX\n"
     "Distances: scale +52.9 cm/km, level -2.4 cm/km, factor 1.00050490 (computed: scale of EPSG:27572 at the "
     "stored mean position, level reduction from the mean height)\n"
     "Tolerances: angles 0.00500 gr, distances 0.0100 m, heights 0.0200 m\n\n"
     "Set-up S1 (line 11): known point (line 4)  X 601234.5120  Y 2428765.3310  Z 151.8740  HI 1.5620\n"
     "  V0 23.45651 gr, mean of 2 references weighted by distance\n"
     "  reference       distance m        V0 gr     dev. gr   offset m\n"
     "  R100             700.5405     23.45630    -0.00021    -0.0023\n"
     "  S2               184.2272     23.45730     0.00079     0.0023\n"
     "  5 points computed\n...\n"
     "4 set-ups, 16 observations computed, 0 left out, 0 checks above tolerance\n",
     "", {}},
    {"compute says what it leaves out, and why", "compute $W/b.geo",
     {{"b.geo", "Point A 0 0.0 0.0 0.0 a\nStation A 1.0\nMesure X 1.0 10.0 100.0 5.0 x\n"}}, 1,
     "...\n  unoriented: no reference to a point with coordinates, no V0\n  0 points computed\n\nLeft out\n"
     "  line 3       X            the set-up on A is unoriented\n\n"
     "1 set-up, 0 observations computed, 1 left out, 0 checks above tolerance\n", "", {}},
    {"compute writes the points and the shots as CSV", "compute $W/s.geo --points $W/p.csv --shots $W/s.csv",
     {{"s.geo", "Option_Correc 0 0.0 0.0 0 0 0 6366\nPoint A 0 0.0 0.0 0.0 a\nStation A 1.0 0.0\n"
                "Mesure P 1.0 100.0 100.0 10.0 p\n"}}, 0, "...\n", "",
     {{"p.csv", "name,x,y,z,code,source\nA,0.0000,0.0000,0.0000,a,known\nP,10.0000,0.0000,0.0000,p,radiated\n"},
      {"s.csv", "station,name,x,y,z,code,element\nA,P,10.0000,0.0000,0.0000,p,3\n"}}},
    {"export of the points as CSV",
     "export $EX --to csv",
     {},
     0,
     "name,x,y,z,code,locks,source\n"
     "S1,601234.512000,2428765.331000,151.874000,borne OGE,3,known\n"
     "S2,601404.570737,2428836.181212,153.020809,calcul\xC3\xA9,0,computed\n"
     "S3,601319.484000,2428962.936000,153.518000,borne OGE,3,known\n"
     "S4,601259.484826,2429038.295124,153.246014,calcul\xC3\xA9,0,computed\n"
     "R100,601890.000000,2429012.500000,,clocher,1,known\n"
     "NGF12,,,150.412000,rep\xC3\xA8re NGF,2,known\n"
     "101,601221.120307,2428732.530300,151.905911,angle b\xC3\xA2ti,0,computed\n"
     "...\n"
     "109,601237.838547,2429015.251375,153.032129,haie,0,computed\n",
     "",
     {}},
    {"export quotes CSV fields and breaks a path at a station without position",
     "export $W/q.geo --to csv",
     {{"q.geo", "Point P1 1.0 2.0 a,\"b\"\nStation P1 1.5\nStation P2 1.5\nCheminAntenne C P1-1 P2-1\n"}},
     0,
     "name,x,y,z,code,locks,source\nP1,1.000000,2.000000,,\"a,\"\"b\"\"\",0,known\n",
     "$W/q.geo: path C: no plan position for P2; not drawn\n",
     {}},
    {"format reproduces the example", "format $W/c.geo", {{"c.geo", Example()}}, 0, "", "", {{"c.geo", Example()}}},
    {"format saves a UTF-8 book in code page 1252", "format $W/u.geo -o $W/c.geo", {{"u.geo", ExampleUtf8()}}, 0,
     "", "", {{"c.geo", Example()}}},
    {"a character that code page 1252 cannot hold stops the save",
     "--output-encoding utf-8 format $W/u.geo -o $W/c.geo",
     {{"u.geo", "Commentaire ok\nCommentaire fl\xC3\xA8" "che \xE2\x86\x92 ici\n"}},
     1,
     "",
     "$W/u.geo:2: stopped, nothing written: code page 1252 has no place for the character U+2192 \"\xE2\x86\x92\"\n",
     {{"c.geo", ""}}},
    {"a code page 1252 book is not taken for UTF-8", "--encoding utf-8 check $EX", {}, 1, "$EX: refused\n",
     "$EX:5: not UTF-8 (byte 0xAB); --encoding cp1252 reads a code page 1252 file\n", {}},
    {"--encoding cp1252 keeps UTF-8 bytes as they are",
     "--encoding cp1252 show $W/u.geo",
     {{"u.geo", "Commentaire pr\xC3\xA9" "s\n"}},
     0,
     "1  Commentaire  pr\xC3\xA9" "s\n",
     "",
     {}},
    {"format refuses to lose rejected lines", "format --backup $W/broken.geo", {{"broken.geo", Broken()}}, 1, "",
     "...\n", {{"broken.geo", Broken()}, {"broken.sbk", ""}}},
    {"format writes the options of a location without changing them",
     "format --params $W/params.ini $W/c.geo",
     {{"params.ini", kProfile}, {"c.geo", Example()}},
     0,
     "",
     "",
     {{"params.ini", kProfile},
      {"c.geo", ExampleWithOptions({
                    "        Option_Correc                       1  0.0  0.0  0.000  0.000  0.000  7000.000",
                    "        Option_Projec                       Projection Lambert Zone IV",
                    "        Option_Nivell                       0  0  0.010",
                    "        Option_Planim                       0  0.010  0.010  0.010  0.010  0.010 0.010 0",
                })}}},
    {"format keeps a backup of the file it replaces",
     "format --backup $W/loose.geo -o $W/c.geo",
     {{"loose.geo", "Station   S1 1.562 0\n"}, {"c.geo", "Commentaire avant\n"}},
     0,
     "",
     "",
     {{"c.sbk", "Commentaire avant\n"}}},
    {"format names the file it cannot write",
     "--output-encoding cp1252 format $EX -o $W/absent/c.geo",
     {},
     2,
     "",
     "$W/absent/c.geo: Impossible d'enregistrer la Sitebook sous $W/absent/c.geo !\n",
     {}},
    {"an export that cannot be written leaves nothing", "export $EX --to svg -o $W/absent/c.svg", {}, 2, "",
     "$W/absent/c.svg: cannot write: No such file or directory; nothing written\n", {}},
    {"an export to a full disk says so", "export $EX --to dxf -o /dev/full", {}, 2, "",
     "/dev/full: cannot write: No space left on device; nothing written\n", {}},
    {"check reports a line holding a NUL byte", "check $W/n.geo",
     {{"n.geo", std::string("Commentaire abc\0def\nStation S1 1.5\n", 35)}}, 1,
     "$W/n.geo: 1 element loaded, 1 line rejected\n",
     "$W/n.geo: Erreur ligne 1 : ligne endommag\xE9" "e (octet nul) !\n$W/n.geo:  (Commentaire abc\\0def)\n", {}},
    {"a long rejected line is shown cut, its length said", "check $W/x.geo", {{"x.geo", std::string(300, 'x')}}, 1,
     "...\n",
     "$W/x.geo: Erreur ligne 1 : commande <" + std::string(173, 'x') + "... (341 bytes)\n$W/x.geo:  (" +
         std::string(200, 'x') + "... (300 bytes))\n", {}},
    {"an input without end is refused", "check /dev/zero", {}, 2, "/dev/zero: not read\n",
     "/dev/zero: cannot read: not a regular file, and longer than 256 MiB\n", {}},
    {"the backup of a short name adds .sbk", "format --backup $W/ab", {{"ab", Example()}}, 0, "", "",
     {{"ab", Example()}, {"ab.sbk", Example()}}},
    {"a book named as its own backup is not written", "format --backup $W/x.sbk", {{"x.sbk", Example()}}, 2, "",
     "$W/x.sbk: cannot back up to $W/x.sbk (the book's own name is its backup's); nothing written\n", {}},
    {"a name as long as a file name may be saves", "format $W/" + std::string(251, 'n') + ".geo",
     {{std::string(251, 'n') + ".geo", Example()}}, 0, "", "", {{std::string(251, 'n') + ".geo", Example()}}},
    {"no subcommand prints the help", "", {}, 0, "carnet: inspect, query, convert and export land-surveying field books (.geo files)\n...\n", "", {}},
    {"a usage error", "export $EX --to pdf", {}, 2, "",
     "carnet: --to: pdf not in {csv,geojson,kml,gpx,dxf,svg}\ncarnet --help tells how to use it\n", {}},
    {"a missing argument", "check", {}, 2, "", "carnet: files is required\ncarnet --help tells how to use it\n", {}},
    {"--version names the licenses", "--version", {}, 0,
     "carnet 0.1.0\nThis tool is free software under the GNU General Public License, version 2 or\n...\n", "", {}},
};

}  // namespace

TEST_F(Tool, CommandLines) {
    for (const Case& c : kCases) {
        SCOPED_TRACE(c.title);
        ASSERT_EQ(std::system(("rm -rf " + Path("work") + " && mkdir " + Path("work")).c_str()), 0);
        for (const auto& file : c.files) WriteFile(Path("work/" + file.first), file.second);
        const Outcome run = Carnet(c.args);
        EXPECT_EQ(run.status, c.status);
        EXPECT_TRUE(LinesMatch(Lines(run.out), 0, Lines(Expand(c.out)), 0)) << run.out;
        EXPECT_TRUE(LinesMatch(Lines(run.err), 0, Lines(Expand(c.err)), 0)) << run.err;
        for (const auto& file : c.after) {
            struct stat st;
            const bool exists = ::stat(Path("work/" + file.first).c_str(), &st) == 0;
            EXPECT_EQ(exists, !file.second.empty()) << file.first;
            if (exists) {
                EXPECT_EQ(ReadFile(Path("work/" + file.first)), file.second) << file.first;
            }
        }
        // Nothing is left behind but what the case expects: no temporary file.
        std::set<std::string> expected;
        for (const auto& file : c.files) expected.insert(file.first);
        for (const auto& file : c.after)
            if (!file.second.empty()) expected.insert(file.first);
        EXPECT_EQ(Entries(Path("work")), std::vector<std::string>(expected.begin(), expected.end()));
    }
}

TEST_F(Tool, EverySubcommandHelpHasAnExample) {
    for (const char* sub : {"check", "list", "show", "find", "next", "select", "codes", "interpret", "options",
                            "projection", "format", "compute", "export"}) {
        SCOPED_TRACE(sub);
        const Outcome run = Carnet(std::string(sub) + " --help");
        EXPECT_EQ(run.status, 0);
        const size_t example = run.out.find("Example:\n  carnet " + std::string(sub) + " ");
        EXPECT_NE(example, std::string::npos) << run.out;
    }
}

// The exports opened by the readers of other programs.
TEST_F(Tool, ExportsOpenInTheirReaders) {
    for (const char* format : {"geojson", "kml", "gpx", "dxf", "svg"})
        ASSERT_EQ(Carnet("export $EX --to " + std::string(format) + " -o $W/c." + format).status, 0) << format;

    // The computation as JSON, read by Python's.
    const Outcome json = Carnet("compute $EX --json");
    EXPECT_EQ(json.status, 0);
    WriteFile(Path("work/c.json"), json.out);
    EXPECT_EQ(Python("import json, sys\n"
                     "d = json.load(open(sys.argv[1], encoding='utf-8'))\n"
                     "print(len(d['setups']), len(d['shots']), len(d['points']), d['clean'],\n"
                     "      [p['source'] for p in d['points'] if p['name'] in ('S1', 'S2', '101')])\n",
                     Path("work/c.json")),
              "4 16 15 True ['known', 'mean', 'radiated']\n");

    // GeoJSON as RFC 7946 has it: longitude, latitude and height; the book's
    // own coordinates and its system beside them.
    EXPECT_EQ(Python("import json, sys\n"
                     "d = json.load(open(sys.argv[1], encoding='utf-8'))\n"
                     "print(d['type'], d['name'], d['projection'], d['source_crs'], d['source_crs_name'])\n"
                     "for f in d['features']:\n"
                     "    g = f['geometry']\n"
                     "    p = f['properties']\n"
                     "    print(g and g['type'], g and len(g['coordinates']), p['name'], p.get('code'),\n"
                     "          p.get('x'), p.get('y'), p.get('z'), p.get('locks'), p.get('station'), p.get('source'),\n"
                     "          p.get('kind'),"
                     " p.get('stations'))\n",
                     Path("work/c.geojson")),
              "FeatureCollection chantier.geo Projection Lambert Zone II EPSG:27572 NTF (Paris) / Lambert zone II\n"
              "Point 3 S1 borne OGE 601234.512 2428765.331 151.874 3 True known None None\n"
              "Point 3 S2 calcul\xC3\xA9 601404.570737 2428836.181212 153.020809 0 True computed None None\n"
              "Point 3 S3 borne OGE 601319.484 2428962.936 153.518 3 True known None None\n"
              "Point 3 S4 calcul\xC3\xA9 601259.484826 2429038.295124 153.246014 0 True computed None None\n"
              "Point 2 R100 clocher 601890.0 2429012.5 None 1 False known None None\n"
              "None None NGF12 rep\xC3\xA8re NGF None None 150.412 2 False known None None\n"
              "Point 3 101 angle b\xC3\xA2ti 601221.120307 2428732.5303 151.905911 0 False computed None None\n"
              "Point 3 102 arbre 601203.023947 2428738.631854 151.489616 0 False computed None None\n"
              "Point 3 103 regard EU 601212.425731 2428759.239007 151.997685 0 False computed None None\n"
              "Point 3 104 poteau b\xC3\xA9ton 601204.300739 2428771.270622 151.760744 0 False computed None None\n"
              "Point 3 105 bordure 601420.070843 2428812.305854 153.260016 0 False computed None None\n"
              "Point 3 106 bordure 601415.242232 2428804.808562 153.276272 0 False computed None None\n"
              "Point 3 107 avaloir 601301.323739 2428957.659905 153.461745 0 False computed None None\n"
              "Point 3 108 arbre 601249.401288 2429016.373665 153.398112 0 False computed None None\n"
              "Point 3 109 haie 601237.838547 2429015.251375 153.032129 0 False computed None None\n"
              "LineString 3 C1 None None None None None None None framed ['S1-1', 'S2-1', 'S3-1']\n"
              "LineString 2 C2 None None None None None None None antenna ['S3-1', 'S4-1']\n");

    // GDAL reads each of the three where PROJ's cs2cs puts the points of the
    // CSV export, and the paths through their stations.
    ASSERT_EQ(Carnet("export $EX --to csv -o $W/c.csv").status, 0);
    std::map<std::string, std::string> grid;  // name -> "x y"
    for (const std::string& row : Lines(ReadFile(Path("work/c.csv")))) {
        const std::vector<double> n = Numbers(row.substr(row.find(',')));
        if (row.rfind("name,", 0) != 0 && row.find(",,,") == std::string::npos)
            grid[row.substr(0, row.find(','))] = std::to_string(n.at(0)) + " " + std::to_string(n.at(1));
    }
    std::map<std::string, std::vector<std::string>> placed = {{"C1", {"S1", "S2", "S3"}}, {"C2", {"S3", "S4"}}};
    for (const auto& [name, xy] : grid) placed[name] = {name};
    std::map<std::string, std::vector<double>> expected;
    for (const auto& [name, stations] : placed)
        for (const std::string& station : stations) {
            const std::vector<double> latLon =
                Numbers(Shell("echo " + grid.at(station) + " | cs2cs -f %.10f EPSG:27572 EPSG:4326"));
            ASSERT_GE(latLon.size(), 2u) << station;
            expected[name].push_back(latLon[1]);
            expected[name].push_back(latLon[0]);
        }
    ASSERT_EQ(expected.size(), 16u);
    for (const char* format : {"geojson", "kml", "gpx"}) {
        SCOPED_TRACE(format);
        const auto read = OgrPositions(Path(std::string("work/c.") + format));
        ASSERT_EQ(read.size(), expected.size()) << Shell("ogrinfo -ro -al -q " + Path(std::string("work/c.") + format));
        for (const auto& [name, numbers] : expected) {
            ASSERT_EQ(read.count(name), 1u) << name;
            ASSERT_EQ(read.at(name).size(), numbers.size()) << name;
            for (size_t k = 0; k < numbers.size(); ++k) EXPECT_NEAR(read.at(name)[k], numbers[k], 2e-9) << name;
        }
    }

    EXPECT_EQ(Python("import sys, ezdxf\n"
                     "doc = ezdxf.readfile(sys.argv[1])\n"
                     "msp = doc.modelspace()\n"
                     "print(sorted(l.dxf.name for l in doc.layers))\n"
                     "for p in msp.query('POINT'):\n"
                     "    print('point', p.dxf.layer, tuple(round(v, 3) for v in p.dxf.location))\n"
                     "for t in msp.query('TEXT'):\n"
                     "    print('text', t.dxf.layer, t.dxf.text)\n"
                     "for l in msp.query('LWPOLYLINE POLYLINE'):\n"
                     "    print('line', l.dxf.layer, [tuple(round(c, 3) for c in v[:2]) for v in l.get_points()])\n",
                     Path("work/c.dxf")),
              "['0', 'CHEMINS', 'Defpoints', 'angle b\xC3\xA2ti', 'arbre', 'avaloir', 'bordure', 'borne OGE', "
              "'calcul\xC3\xA9', 'clocher', 'haie', 'poteau b\xC3\xA9ton', 'regard EU']\n"
              "point borne OGE (601234.512, 2428765.331, 151.874)\n"
              "point calcul\xC3\xA9 (601404.571, 2428836.181, 153.021)\n"
              "point borne OGE (601319.484, 2428962.936, 153.518)\n"
              "point calcul\xC3\xA9 (601259.485, 2429038.295, 153.246)\n"
              "point clocher (601890.0, 2429012.5, 0.0)\n"
              "point angle b\xC3\xA2ti (601221.12, 2428732.53, 151.906)\n"
              "point arbre (601203.024, 2428738.632, 151.49)\n"
              "point regard EU (601212.426, 2428759.239, 151.998)\n"
              "point poteau b\xC3\xA9ton (601204.301, 2428771.271, 151.761)\n"
              "point bordure (601420.071, 2428812.306, 153.26)\n"
              "point bordure (601415.242, 2428804.809, 153.276)\n"
              "point avaloir (601301.324, 2428957.66, 153.462)\n"
              "point arbre (601249.401, 2429016.374, 153.398)\n"
              "point haie (601237.839, 2429015.251, 153.032)\n"
              "text borne OGE S1\ntext calcul\xC3\xA9 S2\ntext borne OGE S3\ntext calcul\xC3\xA9 S4\ntext clocher R100\n"
              "text angle b\xC3\xA2ti 101\ntext arbre 102\ntext regard EU 103\ntext poteau b\xC3\xA9ton 104\n"
              "text bordure 105\ntext bordure 106\ntext avaloir 107\ntext arbre 108\ntext haie 109\n"
              "line CHEMINS [(601234.512, 2428765.331), (601404.571, 2428836.181), (601319.484, 2428962.936)]\n"
              "line CHEMINS [(601319.484, 2428962.936), (601259.485, 2429038.295)]\n");

    // The plot: every mark inside the page, north up (S3 lies north of S1),
    // the scale bar's length as drawn matching its label.
    EXPECT_EQ(Python("import sys, re, xml.etree.ElementTree as ET\n"
                     "ns = {'s': 'http://www.w3.org/2000/svg'}\n"
                     "root = ET.parse(sys.argv[1]).getroot()\n"
                     "print(root.get('viewBox'), root.find('s:title', ns).text)\n"
                     "marks = {}\n"
                     "for t in root.find(\"s:g[@id='labels']\", ns):\n"
                     "    marks[t.text] = (float(t.get('x')), float(t.get('y')))\n"
                     "print(sorted(marks), all(0 < x < 297 and 0 < y < 210 for x, y in marks.values()))\n"
                     "print(marks['S3'][1] < marks['S1'][1], marks['R100'][0] > marks['S1'][0])\n"
                     "print(len(root.findall(\".//s:path[@class='station']\", ns)),\n"
                     "      len(root.findall(\".//s:circle[@class='point']\", ns)),\n"
                     "      len(root.findall(\".//s:g[@id='paths']/s:polyline\", ns)))\n"
                     "bar = root.find(\"s:g[@id='scale']\", ns)\n"
                     "width = float(re.search(r'h ([0-9.]+)', bar.find('s:path', ns).get('d')).group(1))\n"
                     "metres = float(bar.find('s:text', ns).text.split()[0])\n"
                     "s1, s3 = marks['S1'], marks['S3']\n"
                     "page = ((s1[0] - s3[0]) ** 2 + (s1[1] - s3[1]) ** 2) ** 0.5\n"
                     "print(round(page / (width / metres), 1))\n",
                     Path("work/c.svg")),
              "0 0 297 210 chantier.geo \xE2\x80\x94 Projection Lambert Zone II\n"
              "['101', '102', '103', '104', '105', '106', '107', '108', '109', 'R100', 'S1', 'S2', 'S3', 'S4'] True\n"
              "True True\n4 10 2\n215.1\n");
}

// A large generated book goes through the reading and writing commands.
TEST_F(Tool, LargeGeneratedBook) {
    const int kStations = 20000;  // ten elements each: 200 000 elements
    std::string book;
    for (int s = 1; s <= kStations; ++s) {
        book += "Point S" + std::to_string(s) + " 3 " + std::to_string(600000 + s) + ".125 " +
                std::to_string(2400000 + (s * 7) % 5000) + ".250 " + std::to_string(100 + s % 50) + ".500 borne\n";
        book += "Station S" + std::to_string(s) + " 1.550000 12.3456789\n";
        for (int m = 1; m <= 6; ++m)
            book += "Mesure " + std::to_string(s * 10 + m) + " 1.300000 201.2201000 100.4150000 35.412000 arbre\n";
        book += "Commentaire d\xE9tail " + std::to_string(s) + "\n";
        book += "CheminAntenne C" + std::to_string(s) + " S" + std::to_string(s) + "-1 S" +
                std::to_string(s % kStations + 1) + "-1\n";
    }
    WriteFile(Path("work/big.geo"), book);

    Outcome run = Carnet("check $W/big.geo");
    EXPECT_EQ(run.out, Path("work/big.geo") + ": 200000 elements loaded, 0 lines rejected\n");
    run = Carnet("show $W/big.geo --type Station");
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(Lines(run.out).size(), static_cast<size_t>(kStations));
    EXPECT_EQ(Lines(run.out).back(), "199992  Station  S20000  HI =   1.5500 , V0 =  12.34568");
    EXPECT_EQ(Carnet("next $W/big.geo --type Mesure").out, "200007\n");
    EXPECT_EQ(Lines(Carnet("find $W/big.geo S20000").out).back(), "S20000: X 620000.125000  Y 2400000.250000  Z 100.500000");
    EXPECT_EQ(Lines(Carnet("select $W/big.geo '11-16;200001-200006;S7'").out)[1],
              "13 point numbers named, 14 elements of the book match");
    EXPECT_EQ(Lines(Carnet("list $W/big.geo").out).size(), static_cast<size_t>(200000));
    EXPECT_EQ(Carnet("format $W/big.geo -o $W/big2.geo").status, 0);
    EXPECT_EQ(Carnet("check $W/big2.geo").out, Path("work/big2.geo") + ": 200000 elements loaded, 0 lines rejected\n");
    for (const char* format : {"csv", "geojson", "dxf", "svg"}) {
        run = Carnet("export $W/big.geo --crs EPSG:27572 --to " + std::string(format) + " -o $W/big." + format);
        EXPECT_EQ(run.status, 0) << format << run.err;
        EXPECT_EQ(run.err, "") << format;
    }
    // Each station's known point and the six points it measures.
    EXPECT_EQ(Lines(ReadFile(Path("work/big.csv"))).size(), static_cast<size_t>(7 * kStations + 1));
    EXPECT_EQ(Python("import json, sys\n"
                     "d = json.load(open(sys.argv[1]))\n"
                     "print(sum(f['geometry']['type'] == 'Point' for f in d['features']),\n"
                     "      sum(f['geometry']['type'] == 'LineString' for f in d['features']))\n",
                     Path("work/big.geojson")),
              "140000 20000\n");
    const std::string dxf = ReadFile(Path("work/big.dxf"));
    EXPECT_EQ(dxf.substr(dxf.size() - 4), "EOF\n");
}

// Every command that writes to standard output fails, with a message, when
// the output is full or closed.
TEST_F(Tool, AFullOrClosedOutputIsAFailure) {
    for (const char* command : {"check $EX", "list $EX", "show $EX", "find $EX S1", "next $EX", "select $EX S1",
                                "options", "projection $EX", "interpret Cercle_R CER/L12/250"}) {
        for (const auto& [output, reason] : {std::pair<const char*, const char*>{">/dev/full", "No space left on device"},
                                             {">&-", "Bad file descriptor"}}) {
            SCOPED_TRACE(std::string(command) + " " + output);
            const Outcome run = Carnet(std::string(command) + " " + output);
            EXPECT_EQ(run.status, 2);
            EXPECT_EQ(run.err, std::string("carnet: cannot write to standard output: ") + reason + "\n");
        }
    }
}

namespace {

// The entries of a folder whose names begin so.
size_t Named(const std::string& folder, const std::string& prefix) {
    size_t n = 0;
    for (const std::string& name : Entries(folder)) n += name.compare(0, prefix.size(), prefix) == 0;
    return n;
}

// Starts the tool on its own; its pid.
pid_t Start(const std::vector<std::string>& args) {
    const pid_t pid = ::fork();
    if (pid == 0) {
        std::vector<char*> argv{const_cast<char*>(CARNET_TOOL)};
        for (const std::string& a : args) argv.push_back(const_cast<char*>(a.c_str()));
        argv.push_back(nullptr);
        ::freopen("/dev/null", "w", stderr);
        ::execv(CARNET_TOOL, argv.data());
        ::_exit(127);
    }
    return pid;
}

// Waits until the folder holds the temporary file of a save (10 s at most).
bool SaveUnderWay(const std::string& folder) {
    for (int i = 0; i < 20000 && Named(folder, ".carnet.") == 0; ++i) ::usleep(500);
    return Named(folder, ".carnet.") > 0;
}

std::string Lines(int n, const char* text) {
    std::string lines;
    for (int i = 0; i < n; ++i) lines += text + std::to_string(i) + "\n";
    return lines;
}

}  // namespace

// A signal ends a save with its temporary files removed; a save after one
// that was killed removes what it left; a reader that stops reading ends
// the tool quietly.
TEST_F(Tool, SignalsLeaveNoTemporaryFile) {
    const std::string book = Lines(1000000, "Station S1 1.5 "), file = Path("work/big.geo");
    WriteFile(file, book);
    ::mkdir(Path("tmp").c_str(), 0755);
    ::setenv("TMPDIR", Path("tmp").c_str(), 1);
    for (int sig : {SIGINT, SIGTERM, SIGHUP, SIGKILL}) {
        SCOPED_TRACE(sig);
        const pid_t pid = Start({"format", file});
        ASSERT_TRUE(SaveUnderWay(Path("work")));
        ::kill(pid, sig);
        int status = 0;
        ASSERT_EQ(::waitpid(pid, &status, 0), pid);
        EXPECT_TRUE(WIFSIGNALED(status) && WTERMSIG(status) == sig);
        EXPECT_EQ(Named(Path("work"), ".carnet."), sig == SIGKILL ? 1u : 0u);
        EXPECT_EQ(Entries(Path("tmp")).size(), sig == SIGKILL ? 1u : 0u);
    }
    EXPECT_EQ(ReadFile(file), book);
    ::usleep(20000);  // the leftovers are older than the next run
    EXPECT_EQ(Carnet("format --backup $W/big.geo").status, 0);
    EXPECT_EQ(Entries(Path("work")), (std::vector<std::string>{"big.geo", "big.sbk"}));
    EXPECT_TRUE(Entries(Path("tmp")).empty());
    // The reader of a listing or an export goes away after one line.
    for (const char* command : {" list ", " show "}) {
        const std::string cmd = std::string(CARNET_TOOL) + command + file + " 2>" + Path("err.txt") + " | head -1 >/dev/null";
        EXPECT_EQ(std::system(cmd.c_str()), 0);
        EXPECT_EQ(ReadFile(Path("err.txt")), "") << command;
        EXPECT_TRUE(Entries(Path("tmp")).empty()) << command;
    }
    ::unsetenv("TMPDIR");
}

// Another program appends to the book while it is formatted: the save is
// refused, or made before the lines come; none is lost.
TEST_F(Tool, AWriterAppendingMeanwhileLosesNothing) {
    const std::string file = Path("work/w.geo"), book = Lines(500000, "Commentaire ligne ");
    WriteFile(file, book);
    const pid_t appender = ::fork();
    if (appender == 0) {
        const bool started = SaveUnderWay(Path("work"));
        for (int i = 0; started && i < 20; ++i) {
            std::FILE* f = std::fopen(file.c_str(), "a");
            if (f) std::fprintf(f, "Commentaire ajout %d\n", i);
            if (f) std::fclose(f);
        }
        ::_exit(started ? 0 : 1);
    }
    const Outcome run = Carnet("format $W/w.geo");
    int status = 0;
    ASSERT_EQ(::waitpid(appender, &status, 0), appender);
    ASSERT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0);
    const std::string after = ReadFile(file);
    for (int i = 0; i < 20; ++i) EXPECT_NE(after.find("Commentaire ajout " + std::to_string(i) + "\n"), std::string::npos);
    if (run.status != 0) {
        EXPECT_EQ(run.status, 2);
        EXPECT_NE(run.err.find(file + ": changed since it was read (another program wrote to it); nothing written"),
                  std::string::npos)
            << run.err;
        EXPECT_EQ(after.substr(0, book.size()), book);
    }
}

// Memory that runs out is a message, not an abort.
TEST_F(Tool, OutOfMemoryIsAMessage) {
#if defined(__SANITIZE_ADDRESS__)
    GTEST_SKIP() << "the sanitizers need more address space than the limit leaves";
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
    GTEST_SKIP() << "the sanitizers need more address space than the limit leaves";
#endif
#endif
    WriteFile(Path("work/big.geo"), Lines(2000000, "Commentaire ligne "));
    const std::string cmd = "ulimit -v 150000; " + std::string(CARNET_TOOL) + " check " + Path("work/big.geo") +
                            " >/dev/null 2>" + Path("err.txt");
    const int raw = std::system(cmd.c_str());
    EXPECT_TRUE(WIFEXITED(raw) && WEXITSTATUS(raw) == 2);
    EXPECT_EQ(ReadFile(Path("err.txt")), "carnet: out of memory\n");
}

// Without PROJ's database the exports in longitude and latitude stop, saying
// why, and write nothing; those in the book's metres need no database.
TEST_F(Tool, WithoutProjDatabase) {
    const char* saved = std::getenv("PROJ_DATA");
    const std::string keep = saved ? saved : "";
    setenv("PROJ_DATA", "/nonexistent-carnet", 1);
    const Outcome geo = Carnet("export $EX --to geojson -o $W/c.geojson");
    const Outcome csv = Carnet("export $EX --to csv -o $W/c.csv");
    saved ? setenv("PROJ_DATA", keep.c_str(), 1) : unsetenv("PROJ_DATA");
    EXPECT_EQ(geo.status, 2);
    EXPECT_EQ(geo.err, kExample + ": PROJ's database (proj.db) cannot be found; install Debian's proj-data or set "
                                  "PROJ_DATA to the folder that holds it\n" + kExample + ": nothing written\n");
    EXPECT_EQ(Entries(Path("work")), std::vector<std::string>{"c.csv"});
    EXPECT_EQ(csv.status, 0);
}
