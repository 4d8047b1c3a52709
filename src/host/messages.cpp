#include <carnet/messages.h>

#include <cstdarg>

#include <carnet/cstring.h>
#include <carnet/msgbox.h>

namespace {

const char kCaption[] = "NORVEX";

int Show(CWnd* pParent, unsigned int flags, const char* format, va_list args) {
    CString text;
    text.FormatV(format ? format : "", args);
    // Without a parent the application's own box is used: no owner, and the
    // caption the application gives its boxes.
    return CallMessageBox(pParent, text, pParent ? kCaption : "", flags);
}

}  // namespace

int ShowWarning(CWnd* pParent, const char* format, ...) {
    va_list args;
    va_start(args, format);
    int result = Show(pParent, pParent ? MB_ICONEXCLAMATION | MB_OK : MB_OK, format, args);
    va_end(args);
    return result;
}

int ShowMessage(CWnd* pParent, unsigned int flags, const char* format, ...) {
    va_list args;
    va_start(args, format);
    int result = Show(pParent, flags, format, args);
    va_end(args);
    return result;
}
