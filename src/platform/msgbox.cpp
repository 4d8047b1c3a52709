#include <carnet/msgbox.h>

#include <cstdio>
#include <utility>

namespace {

int DefaultMessageBox(CWnd*, const char* text, const char* caption, unsigned int flags) {
    if (caption && *caption) std::fprintf(stderr, "%s: ", caption);
    std::fprintf(stderr, "%s\n", text ? text : "");
    return (flags & 0xF) == MB_YESNO ? IDNO : IDOK;
}

MessageBoxHandler& Current() {
    static MessageBoxHandler handler = DefaultMessageBox;
    return handler;
}

}  // namespace

MessageBoxHandler SetMessageBoxHandler(MessageBoxHandler handler) {
    MessageBoxHandler previous = std::move(Current());
    Current() = handler ? std::move(handler) : MessageBoxHandler(DefaultMessageBox);
    return previous;
}

int CallMessageBox(CWnd* owner, const char* text, const char* caption, unsigned int flags) {
    return Current()(owner, text ? text : "", caption ? caption : "", flags);
}
