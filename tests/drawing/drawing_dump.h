// Every member of a drawing command as one text, whatever its layout, so that
// tests can compare commands of any kind member by member.
#pragma once

#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <string>
#include <type_traits>
#include <utility>

#include <carnet/carnet.h>

namespace drawing_test {

#define DRAWING_TEST_HAS(member)                                                               \
    template <class T, class = void>                                                           \
    struct Has_##member : std::false_type {};                                                  \
    template <class T>                                                                         \
    struct Has_##member<T, std::void_t<decltype(std::declval<T&>().member)>> : std::true_type {};
DRAWING_TEST_HAS(m_Text)
DRAWING_TEST_HAS(m_Num)
DRAWING_TEST_HAS(m_Val1)
DRAWING_TEST_HAS(m_Val2)
DRAWING_TEST_HAS(m_Val3)
#undef DRAWING_TEST_HAS

inline std::string Value(double v) { return IsUndef(v) ? "absent" : numconv::Format("%g", v); }

// "code" then, for the members the class has: "text=<...>", "n=", "v1=" ...
template <class T>
std::string DumpOf(const T& c) {
    std::string s = c.m_Code.str();
    if constexpr (Has_m_Text<T>::value) s += " text=<" + c.m_Text.str() + ">";
    if constexpr (Has_m_Num<T>::value) s += " n=" + std::to_string(c.m_Num);
    if constexpr (Has_m_Val1<T>::value) s += " v1=" + Value(c.m_Val1);
    if constexpr (Has_m_Val2<T>::value) s += " v2=" + Value(c.m_Val2);
    if constexpr (Has_m_Val3<T>::value) s += " v3=" + Value(c.m_Val3);
    return s;
}

template <unsigned int kCode, class T>
std::string DumpAs(const void* p) {
    if constexpr (kCode >= CARNET_FIRST_DRAWING_TYPE) {
        return DumpOf(*static_cast<const T*>(p));
    } else {
        (void)p;
        return "not a drawing command";
    }
}

// The members of the element p of type `type`.
inline std::string Dump(unsigned int type, const void* p) {
    if (!p) return "null";
    switch (type) {
#define DRAWING_TEST_DUMP(code, cls, ...) \
    case code: return DumpAs<code, cls>(p);
        CARNET_ELEMENT_TYPES(DRAWING_TEST_DUMP)
#undef DRAWING_TEST_DUMP
        default: return "unknown type";
    }
}

inline std::string DumpAt(CCarnet& book, int i) { return Dump(book.typAt(i), book.ptrAt(i)); }

// The file line of the element at i, as a save writes it (without number).
inline std::string LineAt(CCarnet& book, int i) {
    char* buffer = nullptr;
    size_t size = 0;
    std::FILE* f = open_memstream(&buffer, &size);
    if (!f) return "no stream";
    book.writeAt(i, f, 0);
    std::fclose(f);
    std::string line(buffer, size);
    std::free(buffer);
    if (!line.empty() && line.back() == '\n') line.pop_back();
    return line;
}

// A scratch folder, removed with its files.
class ScratchDir {
public:
    ScratchDir() {
        char tmpl[] = "/tmp/carnet-drawing-XXXXXX";
        const char* made = mkdtemp(tmpl);
        m_path = made ? made : "";
    }
    ~ScratchDir() {
        if (!m_path.empty()) std::system(("rm -rf '" + m_path + "'").c_str());
    }
    bool ok() const { return !m_path.empty(); }
    std::string File(const char* name) const { return m_path + "/" + name; }

private:
    std::string m_path;
};

}  // namespace drawing_test
