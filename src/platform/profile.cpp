#include <carnet/profile.h>

#include <sys/stat.h>

#include <cerrno>
#include <vector>

#include <carnet/cp1252.h>

#include "platform/storefile_internal.h"

namespace {

struct Span {
    size_t begin = 0, end = 0;
    bool empty() const { return begin >= end; }
};

bool IsBlank(char c) { return cp1252::IsSpace(static_cast<unsigned char>(c)); }

Span Trim(const std::string& text, Span s) {
    while (s.begin < s.end && IsBlank(text[s.begin])) ++s.begin;
    while (s.end > s.begin && IsBlank(text[s.end - 1])) --s.end;
    return s;
}

bool SameName(const std::string& text, Span s, const std::string& name) {
    return cp1252::CompareNoCase(text.substr(s.begin, s.end - s.begin).c_str(), name.c_str()) == 0;
}

enum class Kind { Blank, Comment, Section, Entry, Other };

// One line of the file: its text [text.begin, text.end) and the start of the
// next line (after the line end, if any).
struct Line {
    Span text;
    size_t next = 0;
    Kind kind = Kind::Blank;
    Span name;   // section or key name, trimmed
    Span value;  // entry value, trimmed (quotes still on)
};

Line ClassifyLine(const std::string& text, Line line) {
    Span t = Trim(text, line.text);
    if (t.empty()) {
        line.kind = Kind::Blank;
    } else if (text[t.begin] == ';') {
        line.kind = Kind::Comment;
    } else if (text[t.begin] == '[') {
        line.kind = Kind::Section;
        size_t close = text.find(']', t.begin + 1);
        line.name = Trim(text, {t.begin + 1, close < t.end ? close : t.end});
    } else {
        size_t eq = text.find('=', t.begin);
        if (eq >= t.end) {
            line.kind = Kind::Other;
        } else {
            line.kind = Kind::Entry;
            line.name = Trim(text, {t.begin, eq});
            line.value = Trim(text, {eq + 1, t.end});
        }
    }
    return line;
}

std::vector<Line> SplitLines(const std::string& text) {
    std::vector<Line> lines;
    size_t pos = 0;
    while (pos < text.size()) {
        Line line;
        size_t stop = text.find_first_of("\r\n", pos);
        if (stop == std::string::npos) stop = text.size();
        line.text = {pos, stop};
        if (stop < text.size()) stop += text[stop] == '\r' && stop + 1 < text.size() && text[stop + 1] == '\n' ? 2 : 1;
        line.next = stop;
        lines.push_back(ClassifyLine(text, line));
        pos = stop;
    }
    return lines;
}

// Where an entry is, or would go.
struct Place {
    int section = -1;    // header line of the first section of that name
    int key = -1;        // line of the first entry of that name in it
    int lastEntry = -1;  // last non-blank, non-comment line of the section
};

Place Locate(const std::string& text, const std::vector<Line>& lines, const std::string& section,
             const std::string& key) {
    Place place;
    bool inside = false;
    for (int i = 0; i < static_cast<int>(lines.size()); ++i) {
        const Line& line = lines[static_cast<size_t>(i)];
        if (line.kind == Kind::Section) {
            if (inside) break;
            if (SameName(text, line.name, section)) {
                inside = true;
                place.section = place.lastEntry = i;
            }
        } else if (inside && line.kind != Kind::Blank && line.kind != Kind::Comment) {
            place.lastEntry = i;
            if (place.key < 0 && line.kind == Kind::Entry && SameName(text, line.name, key)) place.key = i;
        }
    }
    return place;
}

std::string Trimmed(const char* s) {
    std::string text(s ? s : "");
    Span t = Trim(text, {0, text.size()});
    return text.substr(t.begin, t.end - t.begin);
}

bool IsQuote(char c) { return c == '"' || c == '\''; }

std::string Unquoted(const std::string& text, Span v) {
    if (v.end - v.begin >= 2 && IsQuote(text[v.begin]) && text[v.end - 1] == text[v.begin]) {
        ++v.begin;
        --v.end;
    }
    return text.substr(v.begin, v.end - v.begin);
}

// The value as it must appear in the file to read back unchanged.
std::string Stored(const std::string& value) {
    if (value.empty()) return value;
    bool quote = IsBlank(value.front()) || IsBlank(value.back()) ||
                 (value.size() >= 2 && IsQuote(value.front()) && value.back() == value.front());
    return quote ? "\"" + value + "\"" : value;
}

bool HasLineBreak(const std::string& s) { return s.find_first_of("\r\n") != std::string::npos; }

// New lines follow the line ends the file already uses.
std::string LineEndOf(const std::string& text) {
    size_t at = text.find_first_of("\r\n");
    if (at == std::string::npos) return "\n";
    if (text[at] == '\n') return "\n";
    return at + 1 < text.size() && text[at + 1] == '\n' ? "\r\n" : "\r";
}

bool EndsWithLineEnd(const std::string& text) {
    return !text.empty() && (text.back() == '\n' || text.back() == '\r');
}

// A profile is a regular file, or no file yet. Anything else named as one
// is neither read (a device such as /dev/zero never ends) nor replaced (that
// would remove a device such as /dev/null): 0, or the errno of the refusal.
int RefusedStore(const std::string& path) {
    struct stat st;
    if (::stat(path.c_str(), &st) != 0 || S_ISREG(st.st_mode)) return 0;
    return S_ISDIR(st.st_mode) ? EISDIR : EINVAL;
}

}  // namespace

bool ProfileReadString(const char* file, const char* section, const char* key, std::string& value) {
    value.clear();
    std::string text;
    const std::string path(file ? file : "");
    if (RefusedStore(path) != 0 || carnet_storefile::ReadAll(path, text) != 0) return false;
    std::vector<Line> lines = SplitLines(text);
    Place place = Locate(text, lines, Trimmed(section), Trimmed(key));
    if (place.key < 0) return false;
    value = Unquoted(text, lines[static_cast<size_t>(place.key)].value);
    return true;
}

int ProfileWriteString(const char* file, const char* section, const char* key, const char* value) {
    const std::string path(file ? file : "");
    const std::string sectionName = Trimmed(section), keyName = Trimmed(key);
    const std::string newValue(value ? value : "");
    if (path.empty()) return ENOENT;
    if (sectionName.empty() || keyName.empty() || HasLineBreak(sectionName) || HasLineBreak(keyName) ||
        HasLineBreak(newValue) || sectionName.find(']') != std::string::npos ||
        keyName.find('=') != std::string::npos || keyName[0] == '[' || keyName[0] == ';')
        return EINVAL;

    if (int refused = RefusedStore(path)) return refused;
    std::string text;
    int err = carnet_storefile::ReadAll(path, text);
    if (err && err != ENOENT) return err;
    const std::vector<Line> lines = SplitLines(text);
    const Place place = Locate(text, lines, sectionName, keyName);
    const std::string eol = LineEndOf(text);
    const std::string entry = keyName + "=" + Stored(newValue);

    if (place.key >= 0) {
        Span v = lines[static_cast<size_t>(place.key)].value;
        text.replace(v.begin, v.end - v.begin, Stored(newValue));
    } else if (place.section >= 0) {
        const Line& after = lines[static_cast<size_t>(place.lastEntry)];
        text.insert(after.next, (after.next == after.text.end ? eol : std::string()) + entry + eol);
    } else {
        if (!text.empty() && !EndsWithLineEnd(text)) text += eol;
        text += "[" + sectionName + "]" + eol + entry + eol;
    }
    return carnet_storefile::ReplaceAtomically(path, text, 0666);
}
