// carnet: command-line access to land-surveying field books.
#include <CLI/CLI.hpp>

#include <carnet/carnet.h>

int main(int argc, char** argv) {
    CLI::App app{"carnet: inspect and maintain land-surveying field books (.geo files)"};
    app.set_version_flag("--version", "carnet 0.1.0");
    app.require_subcommand(0, 1);
    CLI11_PARSE(app, argc, argv);
    if (app.get_subcommands().empty()) {
        std::printf("%s", app.help().c_str());
    }
    return 0;
}
