// The stored parameters of the host: named values kept in a profile file or
// under a registry key, addressed by (location, section, key).
//
// A location that begins with a registry root name ("HKEY_CURRENT_USER", ...,
// in any case), optionally followed by a backslash and a key path, names that
// key; the section is a sub-key of it and the key a string value. Any other
// location is the name of a profile file (relative to the current folder),
// the section one of its sections and the key one of its entries. A null
// location is a profile without a file: reads give the defaults and writes
// fail.
//
// Reads never fail visibly: a missing store, section or key gives the
// default. A profile write that fails is reported in a warning box, once for
// a run of failures on the same location; registry writes fail silently.
#pragma once

class CString;

// The stored text converted to an integer, or the default, then raised to
// the minimum and lowered to the maximum. Returns 1 when a non-empty text
// was obtained (stored or default), else 0.
int GetParamInt(const char* location, const char* section, const char* key, int def, int min, int max, int* value);
// The same for a double.
int GetParamDouble(const char* location, const char* section, const char* key, double def, double min, double max,
                   double* value);
// The stored text, or the default. Returns 1 for a profile; 1 for the
// registry when the value was read, 0 when the default was given.
int GetParamString(const char* location, const char* section, const char* key, const char* def, CString* value);

// Stores the text; returns non-zero when it was written.
int SetParamString(const char* location, const char* section, const char* key, const CString& value);
int SetParamString(const char* location, const char* section, const char* key, const char* value);
// Stores the double as text with six decimals ("%f").
int SetParamDouble(const char* location, const char* section, const char* key, double value);
