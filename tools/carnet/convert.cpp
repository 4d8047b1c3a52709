// The commands that rewrite: a book in the standard layout, a code table in
// the current format, and a typed code as a drawing command.
#include <sys/stat.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <type_traits>
#include <utility>

#include <carnet/carnet.h>

#include "commands.h"
#include "session.h"

namespace carnet_tool {
namespace {

// Makes the backup that must exist before the book's only copy is
// overwritten; false, with the reason, when it cannot be made.
bool BackedUp(CCarnet& book) {
    int err = 0;
    if (book.TryBackUp(&err) >= 0) return true;
    const std::string backup = book.BackUpName().str();
    const std::string why = err == EEXIST   ? "the book's own name is its backup's"
                            : err == ELOOP  ? backup + " is a link"
                            : err == EISDIR ? backup + " is a folder"
                            : err == EINVAL ? backup + " is not a regular file"
                                            : std::string(std::strerror(err));
    Say(book.m_FileName.str(), "cannot back up to " + backup + " (" + why + "); nothing written");
    return false;
}

// Why a code-table line cannot be converted, or nothing. The library takes
// any line; a line without a code or with a kind that is not a whole number
// would come out as an entry that nobody wrote.
std::string Refusal(const std::string& line) {
    const size_t first = line.find(';');
    if (first == 0 || line.find_first_not_of(' ') == first) return "no code before the first \";\"";
    if (first == std::string::npos) return "no kind after the code";
    const size_t end = line.find(';', first + 1);
    std::string kind = line.substr(first + 1, end == std::string::npos ? std::string::npos : end - first - 1);
    const size_t digits = kind.find_first_not_of(' ');
    if (digits == std::string::npos || kind.find_first_not_of("0123456789", digits) != std::string::npos)
        return "the kind \"" + kind + "\" is not a whole number";
    return std::string();
}

// Interpretation of a typed code by the class of a drawing keyword.
struct Interpreted {
    bool usable = false;
    CString line;  // its file line
    CString text;  // its display text
};
using InterpretFn = Interpreted (*)(const CString& text, const CString& sep, const CCode& entry);

// The classes whose numbers take their implied decimals from a code-table entry.
template <class T, class = void>
struct TakesEntry : std::false_type {};
template <class T>
struct TakesEntry<T, std::void_t<decltype(std::declval<T&>().Interprete(CString(), CString(),
                                                                         static_cast<const CCode*>(nullptr)))>>
    : std::true_type {};

template <class T>
Interpreted InterpretAs(const CString& text, const CString& sep, const CCode& entry) {
    T command;
    Interpreted result;
    if constexpr (TakesEntry<T>::value)
        result.usable = command.Interprete(text, sep, &entry);
    else
        result.usable = command.Interprete(text, sep);
    command.Infos(result.line);
    command.Params(result.text);
    return result;
}

// Only the drawing commands interpret typed codes; the survey records of the
// table get no interpreter.
template <class T>
constexpr InterpretFn InterpreterOf() {
    if constexpr (IsDrawingCommand<T>::value)
        return &InterpretAs<T>;
    else
        return nullptr;
}

#define CARNET_TOOL_INTERPRETER(code, cls, ...) InterpreterOf<cls>(),
constexpr InterpretFn kInterpreters[] = {CARNET_ELEMENT_TYPES(CARNET_TOOL_INTERPRETER)};
#undef CARNET_TOOL_INTERPRETER

// The drawing type of a keyword typed at the terminal (case ignored) or of
// its code; 0 when none.
unsigned int DrawingType(const std::string& keyword) {
    const unsigned int code = static_cast<unsigned int>(numconv::Atoi(keyword.c_str()));
    if (code >= CARNET_FIRST_DRAWING_TYPE && code <= CARNET_LAST_TYPE &&
        keyword.find_first_not_of("0123456789") == std::string::npos)
        return code;
    for (unsigned int t = CARNET_FIRST_DRAWING_TYPE; t <= CARNET_LAST_TYPE; ++t)
        if (cp1252::CompareNoCase(CarnetKeyword(t), keyword.c_str()) == 0) return t;
    return 0;
}

}  // namespace

int Format(const std::string& path, const std::string& output, bool backup, const std::string& params) {
    CCarnet& book = FreshBook();
    int rejected = 0;
    const int status = LoadBook(path, book, rejected, true);
    if (status != kOk) return status;
    const std::string target = output.empty() ? path : output;
    CurrentSession().context = target;
    // Another file than the one read has no version to be kept from.
    const CarnetFileState read = book.m_FileState, there = CarnetStateOf(target.c_str());
    if (target != path && (read.device != there.device || read.inode != there.inode)) book.m_FileState = CarnetFileState();
    book.m_FileName = target;
    if (backup && !BackedUp(book)) return kUnreadable;
    if (!params.empty()) book.m_ParamFile = params;
    if (book.Save(target, nullptr, false)) return kOk;
    const CarnetFileState now = CarnetStateOf(target.c_str());
    if (book.m_FileState.IsKnown() && now.IsKnown() && now != book.m_FileState)
        Say(target, "changed since it was read (another program wrote to it); nothing written");
    return kUnreadable;
}

int Codes(const std::string& table, int version, const std::string& output) {
    Input input;
    const int status = ReadInput(table, input);
    if (status != kOk) return status;
    const std::string_view bytes = input.Bytes();
    std::string written;
    long refused = 0, number = 0;
    for (size_t start = 0; start < bytes.size(); ++number) {
        size_t end = bytes.find('\n', start);
        if (end == std::string::npos) end = bytes.size();
        std::string line(bytes.substr(start, end - start));
        start = end + 1;
        if (!line.empty() && line.back() == '\r') line.pop_back();
        if (line.find_first_not_of(" \t") == std::string::npos) continue;
        const std::string why = Refusal(line);
        if (!why.empty()) {
            Say(table + ":" + std::to_string(number + 1), "refused, " + why + ": " + line);
            ++refused;
            continue;
        }
        // A fresh entry each time: initCode keeps what the kind does not set.
        CCode entry;
        entry.initCode(line.c_str(), version);
        CString converted_line;
        entry.getTableLine(converted_line);
        written += converted_line.str() + "\n";
    }
    if (refused > 0) {
        Say(table, Plural(refused, "line") + " refused; nothing written, they would be lost");
        return kRejected;
    }
    if (output.empty()) {
        Put(written);
        return kOk;
    }
    return WriteOutput(output, [&written](std::FILE* f) {
        return std::fwrite(written.data(), 1, written.size(), f) == written.size();
    });
}

int Interpret(const std::string& typedKeyword, const std::string& typedText, const std::string& typedSep,
              int decimals) {
    std::string keyword, text, sep;
    if (!FromTerminal("keyword", typedKeyword, keyword) || !FromTerminal("code", typedText, text) ||
        !FromTerminal("separator", typedSep, sep))
        return kRejected;
    const unsigned int type = DrawingType(keyword);
    if (type == 0) {
        Say("carnet", "no drawing command has the keyword " + keyword +
                          "; carnet interpret --list shows them");
        return kUnreadable;
    }
    CCode entry;
    entry.m_Decimals = decimals;
    const Interpreted result = kInterpreters[type - CARNET_FIRST_TYPE](text, sep, entry);
    Put(result.line.str() + "\n" + result.text.str() + "\n");
    if (result.usable) return kOk;
    Say("carnet", text + " does not make a usable " + CarnetKeyword(type) + " command");
    return kRejected;
}

int ListDrawingKeywords() {
    for (unsigned int t = CARNET_FIRST_DRAWING_TYPE; t <= CARNET_LAST_TYPE; ++t)
        Put(std::to_string(t) + "  " + CarnetKeyword(t) + "\n");
    return kOk;
}

}  // namespace carnet_tool
