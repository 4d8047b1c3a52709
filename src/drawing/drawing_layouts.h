// The ten member layouts of the drawing commands (the second part of the
// type table). Every command class is a thin named class over one of the
// templates below; what tells the classes of a layout apart (labels of the display
// text, which fields the file line leaves out, the setVal tolerance, which
// value constructors exist) is given as template arguments where the class is
// declared, in drawing.h.
#pragma once

#include <cstdio>
#include <initializer_list>
#include <tuple>
#include <type_traits>

#include <string>

#include <carnet/code.h>
#include <carnet/cstring.h>
#include <carnet/element_types.h>
#include <carnet/txtwnd.h>
#include <carnet/undef.h>

namespace carnet_drawing {

using ::TypeCode;

// The labels of the display texts; their wording lives in drawing_layouts.cpp.
enum Label : unsigned char {
    kNoLabel,  // no item
    kEch,
    kEchX,
    kEchY,
    kEch1,
    kEch2,
    kSeuil,
    kRayon,
    kDiametre,
    kCote,
    kLiaison,
    kEpaisseur,
    kDeport,
    kProlongement,
    kDistance,
    kDistance1,
    kDistance2,
    kDecalage,
    kDecalage1,
    kDecalage2,
    kRepetition,
    kMarches,
    kLargeur,
    kLargeurMarche,
    kTexte,
    kPoint,
};

// Per-class choices, combined with |.
enum Option : unsigned int {
    // The file line leaves out the fields of a command whose values were not
    // given (absent number, empty text, count not above 0); otherwise they are
    // always written, an absent number as -999999.000.
    kOmitAbsent = 1u << 0,
    // setVal takes a new m_Val1 (a stair width) only when it differs by more
    // than 1e-6.
    kTolerant = 1u << 1,
    // The number item of the display text is shown only after the text item.
    kNested = 1u << 2,
    // The display text shows the text between '<' and '>'.
    kQuoted = 1u << 3,
    // A free text of several words: a file line gives it all that follows the
    // code; Interprete joins every token after the code into it.
    kFreeText = 1u << 4,
    // Interprete cuts the separator after the code even in sign mode, so a
    // sign there is lost.
    kCodeDropsSign = 1u << 5,
    // Interprete succeeds only when every number was typed.
    kNeedsValues = 1u << 6,
    // Interprete succeeds only when the text was typed.
    kNeedsText = 1u << 7,
};

const char* LabelText(Label label);

inline bool Given(double v) { return !IsUndef(v); }

// Display text: "Code = %s", then " , "-separated items.
void BeginParams(CString& out, const CString& code);
void AddNumber(CString& out, Label label, double value);
void AddCount(CString& out, Label label, int count);
void AddText(CString& out, Label label, const CString& text, bool quoted);
// The scale item of the symbol commands: nothing when the first value is
// absent; otherwise every value up to the last present one, each with its
// label, or, when only the first is present, that one under `alone` (nothing
// when `alone` is kNoLabel). One label per value.
void AddScales(CString& out, std::initializer_list<Label> labels, std::initializer_list<double> values, Label alone);

// File line: the keyword of `type` in 16 columns, 18 blanks and the code.
void BeginLine(CString& out, unsigned int type, const CString& code);
void PrintLine(CNorvexTxtWnd* wnd, int n, const CString& line);
void WriteLine(std::FILE* f, int n, const CString& line);

// setVal: each member is replaced only when its new value differs.
bool Update(CString& member, const CString& value);
bool Update(int& member, int value);
bool Update(double& member, double value, bool tolerant = false);
inline bool AnyChanged(std::initializer_list<bool> changes) {
    for (bool c : changes)
        if (c) return true;
    return false;
}

// A code string typed by the user, cut into tokens one member after the
// other. The separator "\xB1" is the sign mode: a token ends before the first
// '+' or '-' (none when the text starts with '-'). With `keep`, that sign
// stays in front of the next token; otherwise, and always outside sign mode,
// one character (the sign, or the first one of the separator) is dropped.
// A separator at the very start of the text does not cut it.
class TypedCode {
public:
    // `code` gives the implied decimals of the numbers; none without an entry.
    TypedCode(const CString& text, const CString& sep, const CCode* code = nullptr);

    bool AtEnd() const { return m_Rest.empty(); }
    // The next token as it stands (empty at the end).
    CString Text(bool keep);
    // The next token read as an integer; 0 (not typed) gives -1.
    int Count(bool keep);
    // The next token, with the sign in front of it in sign mode, read as a
    // number and divided by 10 to the implied decimals; 0 (not typed) and a
    // number beyond the double range give UNDEF_VALUE.
    double Number(bool keep);

private:
    std::string Token(bool keep);

    std::string m_Rest;
    std::string m_Sep;
    bool m_bSign;
    double m_Scale;
};

// Enables the value constructors taking `args` arguments when a class has
// them: some classes lack the shorter ones.
template <int MinArgs, int args>
using Takes = std::enable_if_t<(args >= MinArgs), int>;

// Print and Write, shared by every layout: both send the class's Infos line.
template <class Self>
class CommandOutput {
    static_assert(IsDrawingCommand<Self>::value, "a drawing command of the type table");

public:
    void Print(CNorvexTxtWnd* wnd, int n) const {
        if (wnd) PrintLine(wnd, n, Line());
    }
    void Write(std::FILE* f, int n) const { WriteLine(f, n, Line()); }

protected:
    static constexpr unsigned int kType = TypeCode<Self>::value;

private:
    CString Line() const {
        CString line;
        static_cast<const Self&>(*this).Infos(line);
        return line;
    }
};

// L1: m_Code.
template <class Self>
class CodeCommand : public CommandOutput<Self> {
public:
    using Layout = CodeCommand;  // lets a command class inherit the constructors

    CString m_Code;

    CodeCommand() = default;
    explicit CodeCommand(const CString& code) : m_Code(code) {}

    bool setVal(const CString& code) { return Update(m_Code, code); }
    CString getVal() const { return m_Code; }

    void Params(CString& out) const { BeginParams(out, m_Code); }
    void Infos(CString& out) const { BeginLine(out, this->kType, m_Code); }

    bool Interprete(CString text, CString sep) {
        TypedCode typed(text, sep);
        m_Code = typed.Text(true);
        return !m_Code.IsEmpty();
    }
};

// L2: m_Code, m_Val1. Options: kOmitAbsent, kTolerant.
template <class Self, Label kLabel, unsigned int kOptions = 0, int kMinArgs = 1>
class OneValueCommand : public CommandOutput<Self> {
public:
    using Layout = OneValueCommand;  // lets a command class inherit the constructors

    CString m_Code;
    double m_Val1 = UNDEF_VALUE;

    OneValueCommand() = default;
    template <int M = kMinArgs, Takes<M, 1> = 0>
    explicit OneValueCommand(const CString& code) : m_Code(code) {}
    OneValueCommand(const CString& code, double val1) : m_Code(code), m_Val1(val1) {}

    bool setVal(const CString& code, double val1) {
        return AnyChanged({Update(m_Code, code), Update(m_Val1, val1, (kOptions & kTolerant) != 0)});
    }
    void getVal(CString& code, double& val1) const { std::tie(code, val1) = std::tie(m_Code, m_Val1); }

    void Params(CString& out) const {
        BeginParams(out, m_Code);
        if (Given(m_Val1)) AddNumber(out, kLabel, m_Val1);
    }
    void Infos(CString& out) const {
        BeginLine(out, this->kType, m_Code);
        if (!(kOptions & kOmitAbsent) || Given(m_Val1)) out.AppendFormat("  %.3f", m_Val1);
    }

    bool Interprete(CString text, CString sep, const CCode* code) {
        TypedCode typed(text, sep, code);
        m_Code = typed.Text(!(kOptions & kCodeDropsSign));
        m_Val1 = typed.Number(true);
        return !m_Code.IsEmpty();
    }
};

// L3: m_Code, m_Val1, m_Val2. The display shows both values under kLabel1 and
// kLabel2 when m_Val2 is given, else m_Val1 alone under kAlone. Options:
// kNeedsValues.
template <class Self, Label kLabel1, Label kLabel2, Label kAlone, unsigned int kOptions = 0, int kMinArgs = 1>
class TwoValueCommand : public CommandOutput<Self> {
public:
    using Layout = TwoValueCommand;  // lets a command class inherit the constructors

    CString m_Code;
    double m_Val1 = UNDEF_VALUE;
    double m_Val2 = UNDEF_VALUE;

    TwoValueCommand() = default;
    template <int M = kMinArgs, Takes<M, 1> = 0>
    explicit TwoValueCommand(const CString& code) : m_Code(code) {}
    template <int M = kMinArgs, Takes<M, 2> = 0>
    TwoValueCommand(const CString& code, double val1) : m_Code(code), m_Val1(val1) {}
    TwoValueCommand(const CString& code, double val1, double val2) : m_Code(code), m_Val1(val1), m_Val2(val2) {}

    bool setVal(const CString& code, double val1, double val2) {
        return AnyChanged({Update(m_Code, code), Update(m_Val1, val1), Update(m_Val2, val2)});
    }
    void getVal(CString& code, double& val1, double& val2) const {
        std::tie(code, val1, val2) = std::tie(m_Code, m_Val1, m_Val2);
    }

    void Params(CString& out) const {
        BeginParams(out, m_Code);
        AddScales(out, {kLabel1, kLabel2}, {m_Val1, m_Val2}, kAlone);
    }
    void Infos(CString& out) const {
        BeginLine(out, this->kType, m_Code);
        out.AppendFormat("  %.3f  %.3f", m_Val1, m_Val2);
    }

    bool Interprete(CString text, CString sep, const CCode* code) {
        TypedCode typed(text, sep, code);
        m_Code = typed.Text(true);
        m_Val1 = typed.Number(true);
        m_Val2 = typed.Number(true);
        return !m_Code.IsEmpty() && (!(kOptions & kNeedsValues) || (Given(m_Val1) && Given(m_Val2)));
    }
};

// L4: m_Code, m_Val1, m_Val2, m_Val3; displayed like L3, up to the last
// value given.
template <class Self, Label kLabel1, Label kLabel2, Label kLabel3, Label kAlone>
class ThreeValueCommand : public CommandOutput<Self> {
public:
    using Layout = ThreeValueCommand;  // lets a command class inherit the constructors

    CString m_Code;
    double m_Val1 = UNDEF_VALUE;
    double m_Val2 = UNDEF_VALUE;
    double m_Val3 = UNDEF_VALUE;

    ThreeValueCommand() = default;
    explicit ThreeValueCommand(const CString& code) : m_Code(code) {}
    ThreeValueCommand(const CString& code, double val1) : m_Code(code), m_Val1(val1) {}
    ThreeValueCommand(const CString& code, double val1, double val2) : m_Code(code), m_Val1(val1), m_Val2(val2) {}
    ThreeValueCommand(const CString& code, double val1, double val2, double val3)
        : m_Code(code), m_Val1(val1), m_Val2(val2), m_Val3(val3) {}

    bool setVal(const CString& code, double val1, double val2, double val3) {
        return AnyChanged({Update(m_Code, code), Update(m_Val1, val1), Update(m_Val2, val2), Update(m_Val3, val3)});
    }
    void getVal(CString& code, double& val1, double& val2, double& val3) const {
        std::tie(code, val1, val2, val3) = std::tie(m_Code, m_Val1, m_Val2, m_Val3);
    }

    void Params(CString& out) const {
        BeginParams(out, m_Code);
        AddScales(out, {kLabel1, kLabel2, kLabel3}, {m_Val1, m_Val2, m_Val3}, kAlone);
    }
    // One blank only before the third value: the line has always been so.
    void Infos(CString& out) const {
        BeginLine(out, this->kType, m_Code);
        out.AppendFormat("  %.3f  %.3f %.3f", m_Val1, m_Val2, m_Val3);
    }

    // Every number keeps its sign, as in L3.
    bool Interprete(CString text, CString sep, const CCode* code) {
        TypedCode typed(text, sep, code);
        m_Code = typed.Text(true);
        m_Val1 = typed.Number(true);
        m_Val2 = typed.Number(true);
        m_Val3 = typed.Number(true);
        return !m_Code.IsEmpty();
    }
};

// L5: m_Code, m_Num. With kOmitAbsent the count is shown and written only when
// above 0; otherwise it is shown unless -1 (not typed) and always written.
template <class Self, Label kLabel, unsigned int kOptions = 0>
class CountCommand : public CommandOutput<Self> {
public:
    using Layout = CountCommand;  // lets a command class inherit the constructors

    CString m_Code;
    int m_Num = 0;

    CountCommand() = default;
    CountCommand(const CString& code, int n) : m_Code(code), m_Num(n) {}

    bool setVal(const CString& code, int n) { return AnyChanged({Update(m_Code, code), Update(m_Num, n)}); }
    void getVal(CString& code, int& n) const { std::tie(code, n) = std::tie(m_Code, m_Num); }

    void Params(CString& out) const {
        BeginParams(out, m_Code);
        if (kOptions & kOmitAbsent ? m_Num > 0 : m_Num != -1) AddCount(out, kLabel, m_Num);
    }
    void Infos(CString& out) const {
        BeginLine(out, this->kType, m_Code);
        if (!(kOptions & kOmitAbsent) || m_Num > 0) out.AppendFormat("  %d", m_Num);
    }

    bool Interprete(CString text, CString sep) {
        TypedCode typed(text, sep);
        m_Code = typed.Text(false);
        m_Num = typed.Count(true);
        return !m_Code.IsEmpty();
    }
};

// L6: m_Code, m_Num, m_Val1. The number is shown only after a count above 0,
// and written only when given; the count is written when the number is or
// when it is above 0. Options: kTolerant.
template <class Self, Label kNumLabel, Label kValLabel, unsigned int kOptions = 0>
class CountValueCommand : public CommandOutput<Self> {
public:
    using Layout = CountValueCommand;  // lets a command class inherit the constructors

    CString m_Code;
    int m_Num = 0;
    double m_Val1 = UNDEF_VALUE;

    CountValueCommand() = default;
    CountValueCommand(const CString& code, int n, double val1) : m_Code(code), m_Num(n), m_Val1(val1) {}

    bool setVal(const CString& code, int n, double val1) {
        return AnyChanged(
            {Update(m_Code, code), Update(m_Num, n), Update(m_Val1, val1, (kOptions & kTolerant) != 0)});
    }
    void getVal(CString& code, int& n, double& val1) const {
        std::tie(code, n, val1) = std::tie(m_Code, m_Num, m_Val1);
    }

    void Params(CString& out) const {
        BeginParams(out, m_Code);
        if (m_Num <= 0) return;
        AddCount(out, kNumLabel, m_Num);
        if (Given(m_Val1)) AddNumber(out, kValLabel, m_Val1);
    }
    void Infos(CString& out) const {
        BeginLine(out, this->kType, m_Code);
        if (Given(m_Val1))
            out.AppendFormat("  %d  %.3f", m_Num, m_Val1);
        else if (m_Num > 0)
            out.AppendFormat("  %d", m_Num);
    }

    bool Interprete(CString text, CString sep, const CCode* code) {
        TypedCode typed(text, sep, code);
        m_Code = typed.Text(false);
        m_Num = typed.Count(true);
        m_Val1 = typed.Number(true);
        return !m_Code.IsEmpty();
    }
};

// L7: m_Code, m_Text (the linked line), m_Val1. With kOmitAbsent the line has
// no field when the text is empty; with kNested the number is shown only after
// the text.
template <class Self, Label kLabel, unsigned int kOptions = 0, int kMinArgs = 1>
class TextValueCommand : public CommandOutput<Self> {
public:
    using Layout = TextValueCommand;  // lets a command class inherit the constructors

    CString m_Code;
    CString m_Text;
    double m_Val1 = UNDEF_VALUE;

    TextValueCommand() = default;
    template <int M = kMinArgs, Takes<M, 1> = 0>
    explicit TextValueCommand(const CString& code) : m_Code(code) {}
    TextValueCommand(const CString& code, const CString& text) : m_Code(code), m_Text(text) {}
    TextValueCommand(const CString& code, const CString& text, double val1)
        : m_Code(code), m_Text(text), m_Val1(val1) {}

    bool setVal(const CString& code, const CString& text, double val1) {
        return AnyChanged({Update(m_Code, code), Update(m_Text, text), Update(m_Val1, val1)});
    }
    void getVal(CString& code, CString& text, double& val1) const {
        std::tie(code, text, val1) = std::tie(m_Code, m_Text, m_Val1);
    }

    void Params(CString& out) const {
        BeginParams(out, m_Code);
        const bool linked = !m_Text.IsEmpty();
        if (linked) AddText(out, kLiaison, m_Text, false);
        if ((linked || !(kOptions & kNested)) && Given(m_Val1)) AddNumber(out, kLabel, m_Val1);
    }
    void Infos(CString& out) const {
        BeginLine(out, this->kType, m_Code);
        if (!(kOptions & kOmitAbsent) || !m_Text.IsEmpty())
            out.AppendFormat("  %s  %.3f", m_Text.GetString(), m_Val1);
    }

    bool Interprete(CString text, CString sep, const CCode* code) {
        TypedCode typed(text, sep, code);
        m_Code = typed.Text(false);
        m_Text = typed.Text(true);
        m_Val1 = typed.Number(true);
        return !m_Code.IsEmpty();
    }
};

// L8: m_Code, m_Text. With kOmitAbsent an empty text is not written; kQuoted
// shows the text between '<' and '>'. Options: kFreeText, kNeedsText.
template <class Self, Label kLabel, unsigned int kOptions = 0, int kMinArgs = 2>
class TextCommand : public CommandOutput<Self> {
public:
    using Layout = TextCommand;  // lets a command class inherit the constructors

    CString m_Code;
    CString m_Text;

    TextCommand() = default;
    template <int M = kMinArgs, Takes<M, 1> = 0>
    explicit TextCommand(const CString& code) : m_Code(code) {}
    TextCommand(const CString& code, const CString& text) : m_Code(code), m_Text(text) {}

    bool setVal(const CString& code, const CString& text) {
        return AnyChanged({Update(m_Code, code), Update(m_Text, text)});
    }
    void getVal(CString& code, CString& text) const { std::tie(code, text) = std::tie(m_Code, m_Text); }

    void Params(CString& out) const {
        BeginParams(out, m_Code);
        if (!m_Text.IsEmpty()) AddText(out, kLabel, m_Text, (kOptions & kQuoted) != 0);
    }
    void Infos(CString& out) const {
        BeginLine(out, this->kType, m_Code);
        if (!(kOptions & kOmitAbsent) || !m_Text.IsEmpty()) out.AppendFormat("  %s", m_Text.GetString());
    }

    bool Interprete(CString text, CString sep) {
        TypedCode typed(text, sep);
        m_Code = typed.Text(false);
        if (kOptions & kFreeText) {
            m_Text.Empty();
            while (!typed.AtEnd()) m_Text += typed.Text(false);
        } else {
            m_Text = typed.Text(true);
        }
        return !m_Code.IsEmpty() && (!(kOptions & kNeedsText) || !m_Text.IsEmpty());
    }
};

// L9: m_Code, m_Text (the linked line), m_Val1, m_Val2. The text and the
// scales are shown independently; the line has no field without a text.
template <class Self, Label kLabel1, Label kLabel2, Label kAlone>
class TextTwoValueCommand : public CommandOutput<Self> {
public:
    using Layout = TextTwoValueCommand;  // lets a command class inherit the constructors

    CString m_Code;
    CString m_Text;
    double m_Val1 = UNDEF_VALUE;
    double m_Val2 = UNDEF_VALUE;

    TextTwoValueCommand() = default;
    explicit TextTwoValueCommand(const CString& code) : m_Code(code) {}
    TextTwoValueCommand(const CString& code, const CString& text) : m_Code(code), m_Text(text) {}
    TextTwoValueCommand(const CString& code, const CString& text, double val1)
        : m_Code(code), m_Text(text), m_Val1(val1) {}
    TextTwoValueCommand(const CString& code, const CString& text, double val1, double val2)
        : m_Code(code), m_Text(text), m_Val1(val1), m_Val2(val2) {}

    bool setVal(const CString& code, const CString& text, double val1, double val2) {
        return AnyChanged({Update(m_Code, code), Update(m_Text, text), Update(m_Val1, val1), Update(m_Val2, val2)});
    }
    void getVal(CString& code, CString& text, double& val1, double& val2) const {
        std::tie(code, text, val1, val2) = std::tie(m_Code, m_Text, m_Val1, m_Val2);
    }

    void Params(CString& out) const {
        BeginParams(out, m_Code);
        if (!m_Text.IsEmpty()) AddText(out, kLiaison, m_Text, false);
        AddScales(out, {kLabel1, kLabel2}, {m_Val1, m_Val2}, kAlone);
    }
    void Infos(CString& out) const {
        BeginLine(out, this->kType, m_Code);
        if (!m_Text.IsEmpty()) out.AppendFormat("  %s  %.3f  %.3f", m_Text.GetString(), m_Val1, m_Val2);
    }

    bool Interprete(CString text, CString sep, const CCode* code) {
        TypedCode typed(text, sep, code);
        m_Code = typed.Text(false);
        m_Text = typed.Text(true);
        m_Val1 = typed.Number(true);
        m_Val2 = typed.Number(true);
        return !m_Code.IsEmpty();
    }
};

// L10: m_Code, m_Text (the linked line), m_Num, m_Val1. The display is a
// chain: text, then count above 0, then number. The line stops after the last
// field that carries something: a given number, a count other than 0, a text
// other than "-1". Options: kTolerant.
template <class Self, Label kNumLabel, Label kValLabel, unsigned int kOptions = 0>
class TextCountValueCommand : public CommandOutput<Self> {
public:
    using Layout = TextCountValueCommand;  // lets a command class inherit the constructors

    CString m_Code;
    CString m_Text;
    int m_Num = 0;
    double m_Val1 = UNDEF_VALUE;

    TextCountValueCommand() = default;
    TextCountValueCommand(const CString& code, const CString& text, int n, double val1)
        : m_Code(code), m_Text(text), m_Num(n), m_Val1(val1) {}

    bool setVal(const CString& code, const CString& text, int n, double val1) {
        return AnyChanged({Update(m_Code, code), Update(m_Text, text), Update(m_Num, n),
                           Update(m_Val1, val1, (kOptions & kTolerant) != 0)});
    }
    void getVal(CString& code, CString& text, int& n, double& val1) const {
        std::tie(code, text, n, val1) = std::tie(m_Code, m_Text, m_Num, m_Val1);
    }

    void Params(CString& out) const {
        BeginParams(out, m_Code);
        if (m_Text.IsEmpty()) return;
        AddText(out, kLiaison, m_Text, false);
        if (m_Num <= 0) return;
        AddCount(out, kNumLabel, m_Num);
        if (Given(m_Val1)) AddNumber(out, kValLabel, m_Val1);
    }
    void Infos(CString& out) const {
        BeginLine(out, this->kType, m_Code);
        if (Given(m_Val1))
            out.AppendFormat("  %s  %d  %.3f", m_Text.GetString(), m_Num, m_Val1);
        else if (m_Num != 0)
            out.AppendFormat("  %s  %d", m_Text.GetString(), m_Num);
        else if (m_Text != "-1")
            out.AppendFormat("  %s", m_Text.GetString());
    }

    bool Interprete(CString text, CString sep, const CCode* code) {
        TypedCode typed(text, sep, code);
        m_Code = typed.Text(false);
        m_Text = typed.Text(false);
        m_Num = typed.Count(true);
        m_Val1 = typed.Number(true);
        return !m_Code.IsEmpty();
    }
};

}  // namespace carnet_drawing
