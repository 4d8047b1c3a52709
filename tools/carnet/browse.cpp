// The commands that read a book or a parameter location and show what they
// find.
#include <sys/stat.h>

#include <algorithm>
#include <cstdio>
#include <map>
#include <memory>

#include <carnet/carnet.h>

#include "commands.h"
#include "elements.h"
#include "session.h"

namespace carnet_tool {
namespace {

// A book loaded for reading: the rows can be shown even when some lines were
// rejected, and the status then says so.
struct Loaded {
    CCarnet& book = FreshBook();
    int status = kOk;

    explicit Loaded(const std::string& path) {
        int rejected = 0;
        status = LoadBook(path, book, rejected);
    }
    bool Usable() const { return status != kUnreadable; }
};

std::string Coordinate(const char* label, double v) {
    return IsUndef(v) ? std::string() : numconv::Format(" %s %.6f ", label, v);
}

}  // namespace

int Check(const std::vector<std::string>& files) {
    int status = kOk;
    for (const std::string& path : files) {
        CCarnet& book = FreshBook();
        int rejected = 0;
        const int result = LoadBook(path, book, rejected);
        status = std::max(status, result);
        if (result == kUnreadable)
            std::printf("%s: not read\n", path.c_str());
        else if (result == kRejected && rejected == 0)
            std::printf("%s: refused\n", path.c_str());
        else
            std::printf("%s: %s loaded, %s rejected\n", path.c_str(), Plural(book.length(), "element").c_str(),
                        Plural(rejected, "line").c_str());
        FlushOutput();
    }
    return status;
}

int List(const std::string& path, bool numbers) {
    Loaded in(path);
    if (!in.Usable()) return in.status;
    StreamWnd listing(stdout, CurrentSession().output);
    in.book.Print(&listing, numbers ? 1 : 0);
    return in.status;
}

int Show(const std::string& path, const std::string& type, bool json) {
    unsigned int code = kAnyType;
    if (!type.empty() && !TypeNamed(type, code)) return kUnreadable;
    Loaded in(path);
    if (!in.Usable()) return in.status;
    ElementRows rows(in.book);
    for (int i = 0; i < in.book.length(); ++i)
        if (code == kAnyType || in.book.typAt(i) == code) rows.Add(i);
    if (json)
        rows.PrintJson();
    else
        rows.PrintColumns();
    return in.status;
}

int Find(const std::string& path, const std::string& typed) {
    std::string name;
    if (!FromTerminal("point number", typed, name)) return kRejected;
    Loaded in(path);
    if (!in.Usable()) return in.status;
    CCarnet& book = in.book;
    ElementRows rows(book);
    for (int i = 0; i < book.length(); ++i)
        if (book.matAt(i) == name.c_str()) rows.Add(i);
    if (rows.Empty()) {
        Say(path, "no element bears the point number " + name);
        return kRejected;
    }
    rows.PrintColumns();
    double x = UNDEF_VALUE, y = UNDEF_VALUE, z = UNDEF_VALUE;
    const std::string known = book.hasPnt(CString(name), x, y, z) < 0
                                  ? std::string()
                                  : Coordinate("X", x) + Coordinate("Y", y) + Coordinate("Z", z);
    std::string line = name + ":" + (known.empty() ? std::string(" no known coordinates") : known);
    line.erase(line.find_last_not_of(' ') + 1);
    Put(line + "\n");
    return in.status;
}

int Next(const std::string& path, const std::string& type) {
    unsigned int code = kAnyType;
    if (!type.empty() && !TypeNamed(type, code)) return kUnreadable;
    Loaded in(path);
    if (!in.Usable()) return in.status;
    Put(in.book.nextMat(code).str() + "\n");
    return in.status;
}

int Select(const std::string& path, const std::string& typed) {
    std::string text;
    if (!FromTerminal("selection", typed, text)) return kRejected;
    CurrentSession().context = path;
    CString selection(text);
    if (!CCarnet::IsValidSelString(selection)) return kRejected;
    Loaded in(path);
    if (!in.Usable()) return in.status;
    CCarnet& book = in.book;

    // A selection of station set-ups, such as 10(2)-15(2), names stations by
    // their point number and set-up; count the set-ups in one pass.
    const bool setUps = selection.Find('(') >= 0;
    std::map<std::string, int> setUpsSoFar;
    ElementRows rows(book);
    CSelMatcher matcher(selection);
    for (int i = 0; i < book.length(); ++i) {
        CString name = book.matAt(i);
        if (name.IsEmpty()) continue;
        if (setUps && book.typAt(i) == TypeCode<CStation>::value) name.AppendFormat("(%d)", ++setUpsSoFar[name.str()]);
        if (matcher.Contains(name)) rows.Add(i);
    }
    Put(selection.str() + "\n");
    std::printf("%s named, %s of the book match\n", Plural(CCarnet::GetSelStringCount(selection), "point number").c_str(),
                Plural(rows.Count(), "element").c_str());
    rows.PrintColumns();
    return in.status;
}

int Options(const std::string& location) {
    struct stat st;
    const bool registry = CString(location).Left(5).CompareNoCase("HKEY_") == 0;
    if (!location.empty() && !registry && ::stat(location.c_str(), &st) != 0)
        Say(location, "no such profile file: these are the default options");
    std::unique_ptr<std::FILE, int (*)(std::FILE*)> f(std::tmpfile(), std::fclose);
    if (!f) {
        Say("carnet", "cannot create a temporary file");
        return kUnreadable;
    }
    CCarnet book;
    book.m_ParamFile = location;
    book.WriteOptions(f.get());
    std::rewind(f.get());
    std::string lines;
    char chunk[4096];
    for (size_t n; (n = std::fread(chunk, 1, sizeof chunk, f.get())) > 0;) lines.append(chunk, n);
    Put(lines);
    return kOk;
}

}  // namespace carnet_tool
