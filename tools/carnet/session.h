// What every command of one run shares: the encodings, the scratch folder,
// the diagnostics on standard error, reading books and tables once in the
// input encoding, and writing outputs whole or not at all.
#pragma once

#include <cstdio>
#include <functional>
#include <string>
#include <string_view>

#include <carnet/ccarnet.h>
#include <carnet/fileio.h>

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
    int outputError = 0;                  // of the first write to standard output that failed
    // The book of the command. It outlives the command and is never freed:
    // the system takes its memory back at once when the tool ends, where
    // freeing a million elements one by one takes a sixth of a check.
    CCarnet* book = nullptr;
};

Session& CurrentSession();

// A new empty book for the command, the previous one freed.
CCarnet& FreshBook();

// Flushes standard output; false when it has failed, now or before (the
// errno of the first failure is kept in the session).
bool FlushOutput();

// A message on standard error after "CONTEXT: "; `text` is code page 1252,
// shown in the output encoding, its line breaks made blanks; `shown` follows
// it as it is, already in the output encoding.
void Say(const std::string& context, std::string_view text, std::string_view shown = {});

std::string Plural(long n, const char* word);

// Shows a code page 1252 text on standard output, in the output encoding.
void Put(const std::string& cp1252);

// A book or a table read once, as code page 1252: the file's own bytes, or
// their conversion from UTF-8 when the input encoding says so.
class Input {
public:
    std::string_view Bytes() const { return m_file.View(); }
    // The bytes before offset are no longer needed.
    void Release(size_t offset) { m_file.Release(offset); }
    // The file as it was read.
    const CarnetFileState& State() const { return m_file.State(); }

private:
    friend int ReadInput(const std::string& path, Input& input);
    CarnetFileBytes m_file;  // converted in place from UTF-8 when need be
};

// Reads a book or a table. kOk; kRejected, with a message, on bytes that are
// not UTF-8 when UTF-8 was asked for, or on a character that code page 1252
// cannot hold; kUnreadable when the file cannot be read.
int ReadInput(const std::string& path, Input& input);

// An argument typed at the terminal, as code page 1252: converted when it is
// valid UTF-8 with characters beyond ASCII, whatever --encoding says of the
// books. False, with a message, when it holds a
// character that code page 1252 cannot hold.
bool FromTerminal(const std::string& what, const std::string& arg, std::string& cp1252);

// Loads a book, its diagnostics on standard error, each after the file's
// name. Its option lines go to the scratch folder when `keepOptions` (to be
// saved or exported), else nowhere. kOk, kRejected when lines were rejected
// (or the input is refused), kUnreadable when the file cannot be read.
int LoadBook(const std::string& path, CCarnet& book, int& rejected, bool keepOptions = false);

// Writes an output whole or not at all: to `target` through the library's
// writer, or to standard output when `target` is empty (made first in an
// unnamed temporary file). kOk or kUnreadable (with a message).
int WriteOutput(const std::string& target, const std::function<bool(std::FILE*)>& write);

}  // namespace carnet_tool
