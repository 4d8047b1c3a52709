#include <carnet/code.h>

#include <carnet/cp1252.h>
#include <carnet/numconv.h>

#include <climits>
#include <cstring>
#include <string>

namespace {

template <size_t N>
constexpr bool CountsItself(const int (&list)[N]) {
    return list[0] == static_cast<int>(N);
}
static_assert(CountsItself(CCode::AutoRepeatKinds) && CountsItself(CCode::Group2Kinds) &&
                  CountsItself(CCode::Group2Bit67Kinds) && CountsItself(CCode::Group2Bit45Kinds) &&
                  CountsItself(CCode::Group3Kinds) && CountsItself(CCode::Group3Bit3Kinds) &&
                  CountsItself(CCode::Group3Bit1Kinds) && CountsItself(CCode::Group3bKinds) &&
                  CountsItself(CCode::Group4Kinds) && CountsItself(CCode::Group4NumberKinds) &&
                  CountsItself(CCode::Group5Kinds) && CountsItself(CCode::DecimalsKinds) &&
                  CountsItself(CCode::OptionKinds),
              "a kind list's first cell must count the cells in use");

// Takes the fields of a table line from the front, one ";" at a time.
class FieldReader {
public:
    explicit FieldReader(const char* line) : m_line(line) {}

    // Without a ";" left, a plain field is empty and leaves the rest for the
    // next field, while a closing field takes the whole rest.
    CString Plain() { return Next(false); }
    CString Closing() { return Next(true); }
    int PlainInt() { return numconv::Atoi(Plain()); }
    int ClosingInt() { return numconv::Atoi(Closing()); }
    double PlainReal() { return numconv::Atof(Plain()); }
    double ClosingReal() { return numconv::Atof(Closing()); }

private:
    CString Next(bool closing) {
        const size_t end = m_line.find(';', m_pos);
        if (end == std::string::npos && !closing) return CString();
        const size_t stop = end == std::string::npos ? m_line.size() : end;
        CString field(m_line.substr(m_pos, stop - m_pos));
        m_pos = end == std::string::npos ? stop : end + 1;
        return field;
    }

    std::string m_line;
    size_t m_pos = 0;
};

bool Bit(int flags, int n) { return ((static_cast<unsigned>(flags) >> n) & 1u) != 0; }

// Later formats inserted kinds into the numbering; a kind read from an older
// table moves up past each insertion made after its version. A negative kind
// belongs to no numbering and stays as it is, and no kind moves past INT_MAX.
int CurrentKind(int kind, int version) {
    struct Insertion {
        int lastOlderVersion;
        int from;
        int by;
    };
    static const Insertion insertions[] = {{0, 26, 1}, {2, 32, 2}, {3, 51, 3}};
    if (kind < 0) return kind;
    for (const Insertion& ins : insertions)
        if (version <= ins.lastOlderVersion && kind >= ins.from && kind <= INT_MAX - ins.by) kind += ins.by;
    return kind;
}

int Flag(bool on, int value) { return on ? value : 0; }

// Groups 3 and 3b share their four fields; only group 3b closes each one.
// Returns the flags field.
int ReadGroup3(FieldReader& f, bool closingFields, CString& text1, CString& text2, int& value) {
    text1 = closingFields ? f.Closing() : f.Plain();
    const int flags = closingFields ? f.ClosingInt() : f.PlainInt();
    text2 = closingFields ? f.Closing() : f.Plain();
    value = f.ClosingInt();
    return flags;
}

}  // namespace

void CCode::operator=(const CCode* other) {
    if (other) *this = *other;
}

bool CCode::initCode(const char* line, int version) {
    if (!line || !*line) return false;
    FieldReader f(line);
    m_Code = f.Plain();
    m_Kind = CurrentKind(f.PlainInt(), version);
    m_Text = f.Closing();
    const int kind = m_Kind;

    // Before version 5, kinds 52 and 53 had no auto-repeat field.
    if (isPresent(AutoRepeatKinds, kind) && !(version < 5 && (kind == 52 || kind == 53)))
        m_bAutoRepeat = f.ClosingInt() == 1;

    if (isPresent(Group2Kinds, kind)) {
        m_G2Text1 = f.Plain();
        const int flags = f.PlainInt();
        m_G2Count = f.ClosingInt();
        if (version > 1) {
            m_G2Extra = f.ClosingInt();
            m_G2Text2 = f.Closing();
        } else {
            m_G2Extra = 0;
        }
        m_G2Bit0 = Bit(flags, 0);
        m_G2Bit1 = Bit(flags, 1);
        m_G2Bit2 = Bit(flags, 2);
        m_G2Bit3 = Bit(flags, 3);
        if (isPresent(Group2Bit45Kinds, kind)) {
            m_G2Bit5 = Bit(flags, 5);
            m_G2Bit4 = Bit(flags, 4);
        }
        const bool bits67 = isPresent(Group2Bit67Kinds, kind);
        m_G2Bit6 = bits67 && Bit(flags, 6);
        m_G2Bit7 = bits67 && !Bit(flags, 6) && isPresent(Group3Kinds, kind) && Bit(flags, 7);
    }

    if (isPresent(Group3Kinds, kind)) {
        const int flags = ReadGroup3(f, false, m_G3Text1, m_G3Text2, m_G3Value);
        m_G3Bit0 = Bit(flags, 0);
        m_G3Bit4 = Bit(flags, 4);
        m_G3Bit3 = isPresent(Group3Bit3Kinds, kind) && Bit(flags, 3);
        m_G3Bit2 = Bit(flags, 2);
        if (isPresent(Group3Bit1Kinds, kind)) m_G3Bit1 = Bit(flags, 1);

        if (isPresent(Group3bKinds, kind)) {
            const int flagsB = ReadGroup3(f, true, m_G3bText1, m_G3bText2, m_G3bValue);
            m_G3bBit0 = Bit(flagsB, 0);
            m_G3bBit4 = Bit(flagsB, 4);
            m_G3bBit3 = Bit(flagsB, 3);
        }
    }

    if (isPresent(Group4Kinds, kind)) {
        m_G4Text1 = f.Plain();
        if (isPresent(Group4NumberKinds, kind) && version > 3)
            m_G4Number = f.PlainInt();
        else
            m_G4Text2 = f.Plain();
        const int flags = f.PlainInt();
        m_G4Text3 = f.Plain();
        m_G4Value = f.ClosingInt();
        m_G4Bit0 = Bit(flags, 0);
        m_G4Bit1 = Bit(flags, 1);
        m_G4Bit2 = Bit(flags, 2);
        m_G4Bit3 = Bit(flags, 3);
        m_G4Bit4 = Bit(flags, 4);
    }

    if (isPresent(Group5Kinds, kind)) {
        m_G5Text1 = f.Plain();
        const int flags = f.PlainInt();
        m_G5Bit0 = Bit(flags, 0) ? 1 : 0;
        m_G5Bit1 = Bit(flags, 1) ? 1 : 0;
        m_G5Bit2 = Bit(flags, 2) ? 1 : 0;
        m_G5Bit3 = Bit(flags, 3) ? 1 : 0;
        m_G5Int1 = f.PlainInt();
        m_G5Val1 = f.PlainReal();
        m_G5Text2 = f.Plain();
        m_G5Int2 = f.PlainInt();
        m_G5Val2 = f.PlainReal();
        m_G5Val3 = f.PlainReal();
        m_G5Text3 = f.Closing();
    }

    if (isPresent(DecimalsKinds, kind)) m_Decimals = f.ClosingInt();

    if (isPresent(OptionKinds, kind)) {
        if (kind == 23) f.Plain();  // the 0 written where other kinds have their decimals
        const CString option = f.Closing();
        m_bOption = option.IsEmpty() || numconv::Atoi(option) == 1;
    }

    m_Real1 = m_Real2 = m_Real3 = 0.0;
    if (version > 1 && kind == 16) {
        m_Real1 = f.ClosingReal();
        m_Real2 = f.ClosingReal();
        m_Real3 = f.ClosingReal();
    }
    return true;
}

bool CCode::getTableLine(CString& out) const {
    const int kind = m_Kind;
    out.Format("%s;%d;%s", m_Code.GetString(), kind, m_Text.GetString());
    if (isPresent(AutoRepeatKinds, kind)) out.AppendFormat(";%d", m_bAutoRepeat ? 1 : 0);

    if (isPresent(Group2Kinds, kind)) {
        int flags = Flag(m_G2Bit0, 1) | Flag(m_G2Bit1, 2) | Flag(m_G2Bit2, 4) | Flag(m_G2Bit3, 8);
        if (isPresent(Group2Bit67Kinds, kind)) {
            if (m_G2Bit6)
                flags |= 64;
            else if (isPresent(Group3Kinds, kind) && m_G2Bit7)
                flags |= 128;
        }
        if (isPresent(Group2Bit45Kinds, kind)) flags |= Flag(m_G2Bit5, 32) | Flag(m_G2Bit4, 16);
        out.AppendFormat(";%s;%d;%d;%d;%s", m_G2Text1.GetString(), flags, m_G2Count, m_G2Extra,
                         m_G2Text2.GetString());
    }

    if (isPresent(Group3Kinds, kind)) {
        // Flag 4 only means something together with flag 1.
        int flags = m_G3Bit0 ? 1 | Flag(m_G3Bit2, 4) : 0;
        flags |= Flag(m_G3Bit4, 16);
        if (isPresent(Group3Bit3Kinds, kind)) flags |= Flag(m_G3Bit3, 8);
        if (isPresent(Group3Bit1Kinds, kind)) flags |= Flag(m_G3Bit1, 2);
        out.AppendFormat(";%s;%d;%s;%d", m_G3Text1.GetString(), flags, m_G3Text2.GetString(), m_G3Value);
        if (isPresent(Group3bKinds, kind)) {
            const int flagsB = Flag(m_G3bBit0, 1) | Flag(m_G3bBit3, 8) | Flag(m_G3bBit4, 16);
            out.AppendFormat(";%s;%d;%s;%d", m_G3bText1.GetString(), flagsB, m_G3bText2.GetString(),
                             m_G3bValue);
        }
    }

    if (isPresent(Group4Kinds, kind)) {
        const int flags = Flag(m_G4Bit0, 1) | Flag(m_G4Bit1, 2) | Flag(m_G4Bit2, 4) | Flag(m_G4Bit3, 8) |
                          Flag(m_G4Bit4, 16);
        if (isPresent(Group4NumberKinds, kind))
            out.AppendFormat(";%s;%d;%d;%s;%d", m_G4Text1.GetString(), m_G4Number, flags,
                             m_G4Text3.GetString(), m_G4Value);
        else
            out.AppendFormat(";%s;%s;%d;%s;%d", m_G4Text1.GetString(), m_G4Text2.GetString(), flags,
                             m_G4Text3.GetString(), m_G4Value);
    }

    if (isPresent(Group5Kinds, kind)) {
        const int flags = Flag(m_G5Bit0 != 0, 1) | Flag(kind == 55 && m_G5Bit1, 2) |
                          Flag((kind == 57 || kind == 58) && m_G5Bit2, 4) | Flag(kind == 54 && m_G5Bit3, 8);
        out.AppendFormat(";%s;%d;%d;%f;%s;%d;%f;%f", m_G5Text1.GetString(), flags, m_G5Int1, m_G5Val1,
                         m_G5Text2.GetString(), m_G5Int2, m_G5Val2, m_G5Val3);
        out += ';';
        out += m_G5Text3;
    }

    if (isPresent(DecimalsKinds, kind))
        out.AppendFormat(";%d", m_Decimals);
    else if (kind == 23)
        out += ";0";
    if (isPresent(OptionKinds, kind)) out.AppendFormat(";%d", m_bOption ? 1 : 0);
    if (kind == 16) out.AppendFormat(";%.3f;%.3f;%.3f", m_Real1, m_Real2, m_Real3);
    return true;
}

bool CCode::isPresent(const int* list, int kind) {
    if (!list) return false;
    for (int i = 1; i < list[0]; ++i)
        if (list[i] == kind) return true;
    return false;
}

bool CCode::isUnit(const char* s) {
    if (!s || !*s) return false;
    for (const char* unit : {"mm", "cm", "dm", "m"})
        if (cp1252::CompareNoCase(s, unit) == 0) return true;
    return false;
}

bool CCode::isBool(const char* s) {
    if (!s || !*s) return false;
    return cp1252::CompareNoCase(s, "true") == 0 || cp1252::CompareNoCase(s, "false") == 0;
}

CString CCode::getExt(const char* path) const {
    if (!path) return CString();
    // Like the runtime's path splitting: after an optional drive and the
    // last directory separator, the extension starts at the last dot.
    const char* name = path[0] && path[1] == ':' ? path + 2 : path;
    for (const char* p = name; *p; ++p)
        if (*p == '\\' || *p == '/') name = p + 1;
    const char* dot = std::strrchr(name, '.');
    return dot ? CString(dot) : CString();
}
