// carnet: command-line access to land-surveying field books.
//
// Exit status of every command: 0 when all went well, 1 when lines of a book
// were rejected or an input was refused, 2 when a file could not be read or
// written or the command line was wrong.
#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstring>
#include <new>
#include <string>
#include <vector>

#include <CLI/CLI.hpp>

#include <carnet/carnet.h>

#include "commands.h"
#include "session.h"

namespace {

using namespace carnet_tool;

const char kVersion[] =
    "carnet 0.1.0\n"
    "This tool is free software under the GNU General Public License, version 2 or\n"
    "later: it is built with dxflib, which is under that license. The carnet\n"
    "library itself is under the MIT license. There is NO WARRANTY.";

const char kFooter[] =
    "Field books are code page 1252 files; --encoding says how to read them (auto:\n"
    "as UTF-8 when they are valid UTF-8 with characters beyond ASCII). Texts are\n"
    "shown as UTF-8 when the locale says so (--output-encoding). Files are saved\n"
    "in code page 1252; a character that it cannot hold stops the command and\n"
    "nothing is written.\n"
    "\n"
    "Examples (carnet SUBCOMMAND --help tells more):\n"
    "  carnet check chantier.geo\n"
    "  carnet list --numbers chantier.geo\n"
    "  carnet show chantier.geo --type Point --json\n"
    "  carnet find chantier.geo S1\n"
    "  carnet next chantier.geo --type Mesure\n"
    "  carnet select chantier.geo '105-101;S1'\n"
    "  carnet codes old-table.txt --version 3 -o table.txt\n"
    "  carnet interpret Cercle_R CER/L12/250 --decimals 2\n"
    "  carnet options --params options.ini\n"
    "  carnet projection chantier.geo\n"
    "  carnet format --backup chantier.geo\n"
    "  carnet compute chantier.geo\n"
    "  carnet export chantier.geo --to svg -o chantier.svg\n"
    "\n"
    "Exit status: 0 when all went well; 1 when lines of a book were rejected or\n"
    "an input was refused; 2 when a file could not be read or written, or the\n"
    "command line was wrong.";

Encoding EncodingNamed(const std::string& name) {
    if (name == "cp1252") return Encoding::Cp1252;
    if (name == "utf-8" || name == "utf8") return Encoding::Utf8;
    return Encoding::Auto;
}

// A standard stream that the tool was started without is opened on
// /dev/null, read-only: no file the tool opens can then take its number (a
// book written by accident), and what is written to it fails and is
// reported instead of vanishing.
void ReserveStandardStreams() {
    for (int fd = 0; fd <= 2; ++fd) {
        if (::fcntl(fd, F_GETFD) != -1 || errno != EBADF) continue;
        const int opened = ::open("/dev/null", O_RDONLY);
        if (opened >= 0 && opened != fd) {
            ::dup2(opened, fd);
            ::close(opened);
        }
    }
}

// Interrupted, hung up, terminated or writing to a closed pipe: the
// temporary files go, then the signal ends the tool as it would have, without
// a word.
extern "C" void EndOnSignal(int sig) {
    CarnetRemovePendingFiles();
    RemoveScratch();
    ::raise(sig);  // the handler was reset to the default action
}

void EndOnSignals() {
    struct sigaction action {};
    action.sa_handler = EndOnSignal;
    action.sa_flags = SA_RESETHAND;
    sigfillset(&action.sa_mask);
    for (int sig : {SIGINT, SIGTERM, SIGHUP, SIGPIPE}) ::sigaction(sig, &action, nullptr);
}

// Every command ends by checking that what it wrote to standard output got
// there: a full disk or a closed output is a failure, not a silent success.
int Finish(int status) {
    if (FlushOutput()) return status;
    Say("carnet", std::string("cannot write to standard output: ") + std::strerror(CurrentSession().outputError));
    return kUnreadable;
}

CLI::App* Subcommand(CLI::App& app, const char* name, const char* what, const char* example) {
    CLI::App* sub = app.add_subcommand(name, what);
    sub->footer(std::string("Example:\n  ") + example);
    return sub;
}

}  // namespace

int Run(int argc, char** argv) {
    CLI::App app{"carnet: inspect, query, convert and export land-surveying field books (.geo files)"};
    app.set_version_flag("--version", kVersion);
    app.require_subcommand(0, 1);
    app.fallthrough();
    app.footer(kFooter);
    const auto encodings = CLI::IsMember({"auto", "cp1252", "utf-8", "utf8"});
    std::string input = "auto", output = "auto";
    app.add_option("--encoding", input, "Encoding of the books and tables read")
        ->check(encodings)
        ->capture_default_str();
    app.add_option("--output-encoding", output, "Encoding of the texts shown; auto follows the locale")
        ->check(encodings)
        ->capture_default_str();

    std::vector<std::string> files;
    std::string file, type, name, text, target, params, format, crs, shotsFile;
    bool numbers = false, json = false, backup = false, list = false;
    int version = CCode::CurrentVersion, decimals = 0;
    std::string sep = "/";

    CLI::App* check = Subcommand(app, "check", "Load each book, report every rejected line and sum up",
                                 "carnet check chantier.geo other.geo");
    check->add_option("files", files, "Field-book files")->required();

    CLI::App* listing = Subcommand(app, "list", "Print the lines of a book", "carnet list --numbers chantier.geo");
    listing->add_option("file", file, "Field-book file")->required();
    listing->add_flag("-n,--numbers", numbers, "Number the lines as a saved file does");

    CLI::App* show = Subcommand(app, "show",
                                "One row per element: position, keyword, point number, code, display text",
                                "carnet show chantier.geo --type Station --json");
    show->add_option("file", file, "Field-book file")->required();
    show->add_option("--type", type, "Only the elements of this type (a code such as 1006, or a keyword)");
    show->add_flag("--json", json, "A JSON array of objects instead of columns");

    CLI::App* find = Subcommand(app, "find", "The elements that bear a point number, and the point's coordinates",
                                "carnet find chantier.geo S3");
    find->add_option("file", file, "Field-book file")->required();
    find->add_option("number", name, "Point number")->required();

    CLI::App* next = Subcommand(app, "next", "The next point number to use",
                                "carnet next chantier.geo --type Mesure");
    next->add_option("file", file, "Field-book file")->required();
    next->add_option("--type", type, "After the last number of this type (a code or a keyword); any type by default");

    CLI::App* select = Subcommand(app, "select",
                                  "Check and rewrite a selection string, count its point numbers, show what matches",
                                  "carnet select chantier.geo '105-101;S1'");
    select->add_option("file", file, "Field-book file")->required();
    select->add_option("selection", text, "Selection string, such as 1-5;8;P.1-P.20;A.*")->required();

    CLI::App* codes = Subcommand(app, "codes",
                                 "Rewrite a code table in the current format, upgrading an older one",
                                 "carnet codes old-table.txt --version 3 -o table.txt");
    codes->add_option("table", file, "Code-table file, one entry a line")->required();
    codes->add_option("--version", version, "Format version of the table read (0 to 5)")
        ->required()
        ->check(CLI::Range(0, CCode::CurrentVersion));
    codes->add_option("-o,--output", target, "Write here (code page 1252) instead of showing it");

    CLI::App* interpret = Subcommand(app, "interpret",
                                     "Build a drawing command from a typed code: its file line and display text",
                                     "carnet interpret Sym_sans_Ori 'ARB+150-075' --sep '\xC2\xB1' --decimals 2");
    interpret->add_option("keyword", name, "Drawing keyword (such as Cercle_R) or its type code (1011 to 1065)");
    interpret->add_option("code", text, "The typed code, such as CER/L12/250");
    interpret->add_option("--sep", sep, "Separator between the fields; \xC2\xB1 splits before each sign")
        ->capture_default_str();
    interpret->add_option("--decimals", decimals, "Implied decimals of the typed numbers")->capture_default_str();
    interpret->add_flag("--list", list, "List the drawing keywords and their codes");

    CLI::App* options = Subcommand(app, "options", "Print the option lines of a parameter location",
                                   "carnet options --params 'HKEY_CURRENT_USER\\Software\\Carnet'");
    options->add_option("--params", params,
                        "A profile file, or a registry key such as HKEY_CURRENT_USER\\Software\\Carnet; the "
                        "defaults without it");

    CLI::App* projection = Subcommand(app, "projection",
                                      "The book's coordinate system: its name, area of use, and the scale factor "
                                      "at the book's mean position",
                                      "carnet projection chantier.geo");
    projection->add_option("file", file, "Field-book file")->required();
    projection->add_option("--crs", crs, "A system PROJ knows, such as EPSG:2154, instead of the book's");

    CLI::App* formatting = Subcommand(app, "format",
                                      "Load a book and save it again in the standard layout, its options first",
                                      "carnet format --backup chantier.geo");
    formatting->add_option("file", file, "Field-book file")->required();
    formatting->add_option("-o,--output", target, "Write here instead of over the file");
    formatting->add_flag("--backup", backup, "Copy the file to be overwritten to its .sbk backup first");
    formatting->add_option("--params", params,
                           "Write the options stored at this parameter location (a profile file or a registry "
                           "key) instead of the book's own");

    CLI::App* computing = Subcommand(app, "compute",
                                     "The coordinates of every observed point: set-ups, orientations, radiation, "
                                     "with the checks against the book's tolerances",
                                     "carnet compute chantier.geo --points points.csv");
    computing->add_option("file", file, "Field-book file")->required();
    computing->add_flag("--json", json, "The result as JSON");
    computing->add_option("--points", target, "Write every point with coordinates here, as CSV");
    computing->add_option("--shots", shotsFile, "Write every computed observation here, as CSV");

    CLI::App* exporting = Subcommand(app, "export",
                                     "The points with known coordinates and the traverse paths, for other programs",
                                     "carnet export chantier.geo --to geojson -o chantier.geojson");
    exporting->add_option("file", file, "Field-book file")->required();
    exporting->add_option("--to", format,
                          "csv (points), dxf or svg (an A4 plot) in the book's metres; geojson, kml (globe viewers) "
                          "or gpx (handheld receivers) in WGS 84")
        ->required()
        ->check(CLI::IsMember({"csv", "geojson", "kml", "gpx", "dxf", "svg"}));
    exporting->add_option("-o,--output", target, "Write here instead of standard output");
    exporting->add_option("--crs", crs,
                          "The system the book's coordinates are in, such as EPSG:2154, instead of its projection");

    try {
        app.parse(argc, argv);
    } catch (const CLI::Success& e) {
        return app.exit(e);  // --help, --version
    } catch (const CLI::ParseError& e) {
        std::fprintf(stderr, "carnet: %s\ncarnet --help tells how to use it\n", e.what());
        return kUnreadable;
    }

    Session& session = CurrentSession();
    session.input = EncodingNamed(input);
    session.output = EncodingNamed(output) == Encoding::Auto ? EncodingOfLocale() : EncodingNamed(output);
    SetMessageBoxHandler([](CWnd*, const char* message, const char*, unsigned int flags) {
        Say(CurrentSession().context, message);
        return (flags & MB_YESNO) ? IDNO : IDOK;
    });

    if (app.get_subcommands().empty()) {
        std::printf("%s", app.help().c_str());
        return kOk;
    }
    if (check->parsed()) return Check(files);
    if (listing->parsed()) return List(file, numbers);
    if (show->parsed()) return Show(file, type, json);
    if (find->parsed()) return Find(file, name);
    if (next->parsed()) return Next(file, type);
    if (select->parsed()) return Select(file, text);
    if (codes->parsed()) return Codes(file, version, target);
    if (interpret->parsed()) {
        if (list) return ListDrawingKeywords();
        if (name.empty() || text.empty()) {
            Say("carnet", "interpret needs a keyword and a code, or --list");
            return kUnreadable;
        }
        return Interpret(name, text, sep, decimals);
    }
    if (options->parsed()) return Options(params);
    if (projection->parsed()) return ShowProjection(file, crs);
    if (computing->parsed()) return Compute(file, json, target, shotsFile);
    if (exporting->parsed()) return Export(file, format, target, crs);
    return Format(file, target, backup, params);
}

int main(int argc, char** argv) {
    ReserveStandardStreams();
    EndOnSignals();
    int status = kUnreadable;
    try {
        status = Run(argc, argv);
    } catch (const std::bad_alloc&) {
        Say("carnet", "out of memory");
    } catch (const std::exception& e) {
        Say("carnet", e.what());
    }
    return Finish(status);
}
