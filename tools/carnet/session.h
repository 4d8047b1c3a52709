// What every command of one run shares: the encodings, the scratch folder,
// the diagnostics on standard error, reading books and tables in the input
// encoding, and writing outputs whole or not at all.
#pragma once

#include <cstdio>
#include <functional>
#include <string>
#include <string_view>

#include <carnet/ccarnet.h>

#include "terminal.h"

namespace carnet_tool {

// Exit statuses.
constexpr int kOk = 0;
constexpr int kRejected = 1;    // lines of a book refused, or bad input
constexpr int kUnreadable = 2;  // a file not read or not written, or a usage error

struct Session {
    Encoding input = Encoding::Auto;      // of the books and tables read
    Encoding output = Encoding::Cp1252;   // of the texts shown
    ScratchStore store;
    std::string context = "carnet";       // what the library's messages are about
};

Session& CurrentSession();

// A message on standard error after "CONTEXT: "; `text` is code page 1252,
// shown in the output encoding, its line breaks made blanks; `shown` follows
// it as it is, already in the output encoding.
void Say(const std::string& context, std::string_view text, std::string_view shown = {});

std::string Plural(long n, const char* word);

// Whether the file can be opened for reading, with the reason when not.
bool Readable(const std::string& path);

// The bytes of a text file in code page 1252, converted from UTF-8 when the
// input encoding says so. kRejected, with a message, on bytes that are not
// UTF-8 when UTF-8 was asked for, or on a character that code page 1252
// cannot hold; kUnreadable when the file cannot be read.
int ReadInput(const std::string& path, std::string& cp1252, bool& converted);

// An argument typed at the terminal, as code page 1252: converted when it is
// valid UTF-8 with characters beyond ASCII, whatever --encoding says of the
// books. False, with a message, when it holds a
// character that code page 1252 cannot hold.
bool FromTerminal(const std::string& what, const std::string& arg, std::string& cp1252);

// The file to hand to the library for `path`: the file itself, or its code
// page 1252 copy in the scratch folder when it was read as UTF-8. A status
// as ReadInput gives.
int SourceOf(const std::string& path, std::string& source);

// Loads a book, its diagnostics on standard error, each after the file's
// name. kOk, kRejected when lines were rejected (or the input is refused),
// kUnreadable when the file cannot be read.
int LoadBook(const std::string& path, CCarnet& book, int& rejected);

// Writes an output through a temporary file that `write` fills and that then
// replaces `target`, or goes to standard output when `target` is empty. The
// target is untouched unless all went well. kOk or kUnreadable (with a
// message).
int WriteOutput(const std::string& target, const std::function<bool(const std::string& path)>& write);

}  // namespace carnet_tool
