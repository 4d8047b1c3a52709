// Message-box hook. The library never talks to a person directly: every box
// goes through the handler, which a host (or a test) replaces.
#pragma once

#include <functional>

class CWnd;

constexpr unsigned int MB_OK = 0x0;
constexpr unsigned int MB_YESNO = 0x4;
constexpr unsigned int MB_ICONQUESTION = 0x20;
constexpr unsigned int MB_ICONEXCLAMATION = 0x30;
constexpr int IDOK = 1;
constexpr int IDYES = 6;
constexpr int IDNO = 7;

using MessageBoxHandler = std::function<int(CWnd* owner, const char* text, const char* caption, unsigned int flags)>;

// Installs a handler and returns the previous one. An empty handler restores
// the default, which writes the caption and text to standard error and
// answers IDOK, or IDNO for a Yes/No box.
MessageBoxHandler SetMessageBoxHandler(MessageBoxHandler handler);

// Shows a box through the current handler.
int CallMessageBox(CWnd* owner, const char* text, const char* caption, unsigned int flags);
