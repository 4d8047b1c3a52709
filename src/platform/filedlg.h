// File-dialog hook: open and save dialogs are asked of the handler, which a
// host (or a test) installs. The default cancels, since there is no one to
// ask on a terminal.
#pragma once

#include <functional>
#include <string>

constexpr unsigned int OFN_OVERWRITEPROMPT = 0x2;
constexpr unsigned int OFN_HIDEREADONLY = 0x4;
constexpr unsigned int OFN_PATHMUSTEXIST = 0x800;
constexpr unsigned int OFN_FILEMUSTEXIST = 0x1000;
constexpr unsigned int OFN_NOREADONLYRETURN = 0x8000;

struct FileDialogRequest {
    bool save;
    std::string title, filter, initialName;
    unsigned int flags;
};

using FileDialogHandler = std::function<bool(const FileDialogRequest&, std::string& chosenPath)>;

// Installs a handler and returns the previous one; an empty handler restores
// the default (cancel).
FileDialogHandler SetFileDialogHandler(FileDialogHandler handler);

// Asks the current handler; true with chosenPath set when confirmed.
bool CallFileDialog(const FileDialogRequest& request, std::string& chosenPath);
