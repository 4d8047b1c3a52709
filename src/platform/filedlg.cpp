#include <carnet/filedlg.h>

#include <utility>

namespace {

bool DefaultFileDialog(const FileDialogRequest&, std::string&) { return false; }

FileDialogHandler& Current() {
    static FileDialogHandler handler = DefaultFileDialog;
    return handler;
}

}  // namespace

FileDialogHandler SetFileDialogHandler(FileDialogHandler handler) {
    FileDialogHandler previous = std::move(Current());
    Current() = handler ? std::move(handler) : FileDialogHandler(DefaultFileDialog);
    return previous;
}

bool CallFileDialog(const FileDialogRequest& request, std::string& chosenPath) {
    return Current()(request, chosenPath);
}
