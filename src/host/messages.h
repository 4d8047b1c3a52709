// Warning and question boxes shown to the user through the message-box hook
// of the platform layer.
#pragma once

class CWnd;

// Shows the format filled with the values, as printf does. With a parent the
// box belongs to it, is captioned "NORVEX" and has the exclamation icon and
// an OK button; without one it is the application's own box with an OK
// button. Returns the box's result (IDOK).
int ShowWarning(CWnd* pParent, const char* format, ...) __attribute__((format(printf, 2, 3)));

// The same with the given message-box flags (buttons and icon), for a
// question; returns the button chosen (IDYES, IDNO, ...).
int ShowMessage(CWnd* pParent, unsigned int flags, const char* format, ...) __attribute__((format(printf, 3, 4)));
