// Profile files: text files of "[section]" headers and "key=value" entries,
// the parameter store of hosts that keep their settings in a file.
//
// Reading: section and key names match without regard to case, around
// blanks; the value is the text after the first '=', without its surrounding
// blanks and without one pair of matching quotes (" or '). LF, CRLF and CR
// line ends are all read; lines beginning with ';' are comments. When a name
// occurs twice, the first occurrence is the one used.
//
// Writing changes one line of the file and keeps every other byte: the value
// of an existing entry is replaced in place; a new entry goes after the last
// entry of its section; a new section goes at the end of the file. The file is
// created when its folder exists, and it is always replaced as a whole, never
// rewritten in place, so a crash cannot leave half of it.
#pragma once

#include <string>

// Sets value and returns true when the file holds the entry; returns false
// (value empty) when the file cannot be read or the section or the key is
// missing. A null name reads as an empty one. A name that is neither a
// regular file nor missing (a folder, a device, a pipe) is not read.
bool ProfileReadString(const char* file, const char* section, const char* key, std::string& value);

// Writes the entry. Returns 0, or the errno of the failure; EINVAL for a
// name or value that no line could hold (an empty name, a line break, a '='
// in a key, a ']' in a section) and for a device or a pipe, which is never
// replaced (EISDIR for a folder). A value that would not read back as written
// (surrounding blanks, or quotes at both ends) is written between quotes.
int ProfileWriteString(const char* file, const char* section, const char* key, const char* value);
