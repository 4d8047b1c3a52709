// Interprete of every drawing-command class on an arbitrary code string,
// with an arbitrary separator and implied-decimals count.
//
// Input: one byte for the decimals (a signed count), one byte choosing the
// separator (the sign mode, "/", ";", nothing, or the text up to the next
// '\n' of the input), then the code string.
//
// Properties: the result says what the class's rule says (a code, and for
// some classes every number or the text); every member is set by the call,
// so an object that held another command reads the same text to the same
// members as a new one; a number is either absent or a finite non-zero
// value; the command's line and display text can be made, and its line read
// back without harm; a copy writes the same line.
#include <cmath>
#include <string>
#include <type_traits>
#include <utility>

#include "fuzz_support.h"

namespace {

// The classes whose Interprete reads numbers take the code-table entry.
template <class T, class = void>
struct TakesEntry : std::false_type {};
template <class T>
struct TakesEntry<T, std::void_t<decltype(std::declval<T&>().Interprete(CString(), CString(),
                                                                          static_cast<const CCode*>(nullptr)))>>
    : std::true_type {};

#define CARNET_FUZZ_HAS_MEMBER(name)                                                               \
    template <class T, class = void>                                                               \
    struct Has##name : std::false_type {};                                                         \
    template <class T>                                                                             \
    struct Has##name<T, std::void_t<decltype(std::declval<const T&>().name)>> : std::true_type {};
CARNET_FUZZ_HAS_MEMBER(m_Val1)
CARNET_FUZZ_HAS_MEMBER(m_Val2)
CARNET_FUZZ_HAS_MEMBER(m_Val3)
#undef CARNET_FUZZ_HAS_MEMBER

bool Usable(double v) { return IsUndef(v) || (std::isfinite(v) && v != 0.0); }

template <class T>
bool Interpret(T& command, const CString& text, const CString& sep, const CCode& entry) {
    if constexpr (TakesEntry<T>::value)
        return command.Interprete(text, sep, &entry);
    else
        return command.Interprete(text, sep);
}

// What the rule of the class says the result must be.
template <class T>
bool Expected(const T& c) {
    bool ok = !c.m_Code.IsEmpty();
    if constexpr (std::is_same_v<T, CInterDist>) ok = ok && !IsUndef(c.m_Val1) && !IsUndef(c.m_Val2);
    if constexpr (std::is_same_v<T, CAccrProLi> || std::is_same_v<T, CRappelPoint>) ok = ok && !c.m_Text.IsEmpty();
    return ok;
}

template <class T>
std::string Line(const T& c) {
    CString out;
    c.Infos(out);
    CString shown;
    c.Params(shown);
    return out.str() + "|" + shown.str();
}

template <class T>
void CheckClass(unsigned int type, const CString& text, const CString& sep, const CCode& entry) {
    T command;
    const bool result = Interpret(command, text, sep, entry);
    FUZZ_CHECK(result == Expected(command));
    if constexpr (Hasm_Val1<T>::value) FUZZ_CHECK(Usable(command.m_Val1));
    if constexpr (Hasm_Val2<T>::value) FUZZ_CHECK(Usable(command.m_Val2));
    if constexpr (Hasm_Val3<T>::value) FUZZ_CHECK(Usable(command.m_Val3));
    const std::string line = Line(command);

    // Over a command that held something else, the same members come out.
    T reused;
    Interpret(reused, CString("AUTRE/12/34/56/78"), CString("/"), entry);
    FUZZ_CHECK(Interpret(reused, text, sep, entry) == result);
    FUZZ_CHECK_SAME(Line(reused), line);
    const T copy(command);
    FUZZ_CHECK_SAME(Line(copy), line);

    // Its line, listed and read back into a book.
    CCarnet book;
    book.append(new T(command), type);
    CNorvexTxtWnd wnd;
    book.Print(&wnd, 1);
    CString written;
    command.Infos(written);
    int index = 1;
    book.ReadLine(&wnd, written, index, 1);
    FUZZ_CHECK(book.length() == 1 || (book.length() == 2 && book.typAt(1) == type));
}

// Only the drawing commands of the type table have Interprete.
template <unsigned int kType, class T>
void CheckType(const CString& text, const CString& sep, const CCode& entry) {
    if constexpr (kType >= CARNET_FIRST_DRAWING_TYPE) CheckClass<T>(kType, text, sep, entry);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    carnet_fuzz::Input in(data, size);
    CCode entry;
    entry.m_Decimals = static_cast<signed char>(in.Byte());
    CString sep;
    switch (in.Byte() % 5) {
        case 0: sep = "\xB1"; break;
        case 1: sep = "/"; break;
        case 2: sep = ";"; break;
        case 3: break;
        default: sep = std::string(in.Until('\n')); break;
    }
    const CString text{std::string(in.Rest())};

#define CARNET_FUZZ_CHECK_CLASS(code, cls, ...) CheckType<code, cls>(text, sep, entry);
    CARNET_ELEMENT_TYPES(CARNET_FUZZ_CHECK_CLASS)
#undef CARNET_FUZZ_CHECK_CLASS
    return 0;
}
