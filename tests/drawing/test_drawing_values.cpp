// Members, constructors, setVal/getVal and copies of the 55 drawing commands,
// checked on every class of the type table by what its members are.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <map>
#include <set>
#include <string>
#include <tuple>
#include <type_traits>
#include <utility>

#include <carnet/carnet.h>

namespace {

// ---- What the layouts are: the members of each type, in declaration order
// (C code, T text, N count, 1 2 3 the numbers), and the fewest arguments its
// value constructors take.

std::string ExpectedMembers(unsigned int type) {
    static const std::map<std::string, std::set<unsigned int>> layouts = {
        {"C", {1011, 1012, 1013, 1014, 1015, 1016, 1020, 1023, 1024, 1053, 1054, 1057, 1060}},
        {"C1", {1018, 1019, 1022, 1025, 1026, 1027, 1030, 1031, 1042, 1044, 1052, 1063, 1064}},
        {"C12", {1017, 1021, 1028, 1029, 1032, 1043, 1045, 1046, 1065}},
        {"C123", {1033}},
        {"CN", {1034, 1048, 1050}},
        {"CN1", {1049}},
        {"CT1", {1035, 1036, 1039, 1047}},
        {"CT", {1037, 1038, 1055, 1056, 1058, 1059, 1061, 1062}},
        {"CT12", {1040, 1041}},
        {"CTN1", {1051}},
    };
    for (const auto& [members, types] : layouts)
        if (types.count(type)) return members;
    return "?";
}

int ExpectedMinArgs(unsigned int type) {
    static const std::map<unsigned int, int> notOne = {
        // only the full constructor, or from the text on
        {1034, 2}, {1048, 2}, {1050, 2}, {1049, 3}, {1051, 4}, {1055, 2}, {1056, 2}, {1058, 2}, {1059, 2},
        {1061, 2}, {1062, 2}, {1047, 2},
        // numbers required
        {1044, 2}, {1052, 2}, {1063, 2}, {1064, 2}, {1043, 3}, {1045, 3}, {1065, 3},
    };
    const auto it = notOne.find(type);
    return it == notOne.end() ? 1 : it->second;
}

bool Tolerant(unsigned int type) { return type == 1049 || type == 1051 || type == 1052; }

// ---- Reaching the members of any command class.

#define CARNET_TEST_HAS_MEMBER(name)                                                  \
    template <class T, class = void>                                                  \
    struct Has##name : std::false_type {};                                            \
    template <class T>                                                                \
    struct Has##name<T, std::void_t<decltype(&T::m_##name)>> : std::true_type {};
CARNET_TEST_HAS_MEMBER(Text)
CARNET_TEST_HAS_MEMBER(Num)
CARNET_TEST_HAS_MEMBER(Val1)
CARNET_TEST_HAS_MEMBER(Val2)
CARNET_TEST_HAS_MEMBER(Val3)
#undef CARNET_TEST_HAS_MEMBER

// References to the members, in the canonical order code, text, count,
// numbers (which is every layout's declaration order).
template <class U>
auto Members(U& t) {
    using T = std::remove_const_t<U>;
    auto text = [&] {
        if constexpr (HasText<T>::value) return std::tie(t.m_Text); else return std::tuple<>();
    };
    auto num = [&] {
        if constexpr (HasNum<T>::value) return std::tie(t.m_Num); else return std::tuple<>();
    };
    auto v1 = [&] {
        if constexpr (HasVal1<T>::value) return std::tie(t.m_Val1); else return std::tuple<>();
    };
    auto v2 = [&] {
        if constexpr (HasVal2<T>::value) return std::tie(t.m_Val2); else return std::tuple<>();
    };
    auto v3 = [&] {
        if constexpr (HasVal3<T>::value) return std::tie(t.m_Val3); else return std::tuple<>();
    };
    return std::tuple_cat(std::tie(t.m_Code), text(), num(), v1(), v2(), v3());
}

template <class T>
auto Values(const T& t) {
    return std::apply([](const auto&... m) { return std::make_tuple(m...); }, Members(t));
}

template <class T>
std::string MemberLetters() {
    std::string s = "C";
    if (HasText<T>::value) s += 'T';
    if (HasNum<T>::value) s += 'N';
    if (HasVal1<T>::value) s += '1';
    if (HasVal2<T>::value) s += '2';
    if (HasVal3<T>::value) s += '3';
    return s;
}

// A typical value for member i, and another one.
void Fill(CString& s, size_t i) { s = i == 0 ? "CODE" : "TEXT"; }
void Fill(int& n, size_t) { n = 7; }
void Fill(double& d, size_t i) { d = 0.5 + static_cast<double>(i); }
void Bump(CString& s) { s.MakeLower(); }  // case matters
void Bump(int& n) { n = -n; }
void Bump(double& d) { d += 0.25; }

template <class Tuple, size_t... I>
void FillAll(Tuple& v, std::index_sequence<I...>) {
    (Fill(std::get<I>(v), I), ...);
}

// Typical values of every member of T, as a tuple in member order.
template <class T>
auto TypicalValues() {
    auto v = Values(T());
    FillAll(v, std::make_index_sequence<std::tuple_size_v<decltype(v)>>{});
    return v;
}

template <class F, size_t... I>
void ForEachIndex(F& f, std::index_sequence<I...>) {
    (f(std::integral_constant<size_t, I>{}), ...);
}

template <class T, class Tuple>
bool SetVal(T& t, const Tuple& v) {
    return std::apply([&](const auto&... a) { return t.setVal(a...); }, v);
}

template <class T>
auto GetVal(const T& t) {
    auto out = Values(T());
    if constexpr (std::tuple_size_v<decltype(out)> == 1)
        std::get<0>(out) = t.getVal();
    else
        std::apply([&](auto&... a) { t.getVal(a...); }, out);
    return out;
}

template <class T, class Tuple, size_t... I>
constexpr bool ConstructibleFrom(std::index_sequence<I...>) {
    return std::is_constructible_v<T, const std::tuple_element_t<I, Tuple>&...>;
}

// Builds a T from the first k values when it has that constructor and checks
// that the members not passed are absent.
template <class T, class Tuple, size_t... I>
void CheckConstructor(const Tuple& v, int minArgs, std::index_sequence<I...>) {
    constexpr size_t k = sizeof...(I);
    constexpr bool exists = ConstructibleFrom<T, Tuple>(std::index_sequence<I...>{});
    EXPECT_EQ(exists, static_cast<int>(k) >= minArgs) << "constructor with " << k << " arguments";
    if constexpr (exists) {
        const T t(std::get<I>(v)...);
        auto expected = Values(T());
        ((std::get<I>(expected) = std::get<I>(v)), ...);
        EXPECT_TRUE(Values(t) == expected) << "constructor with " << k << " arguments";
    }
}

template <class T, class Tuple, size_t... K>
void CheckConstructors(const Tuple& v, int minArgs, std::index_sequence<K...>) {
    (CheckConstructor<T>(v, minArgs, std::make_index_sequence<K + 1>{}), ...);
}

// Calls f(type, T()) for every drawing-command class of the type table.
template <unsigned int kType, class T, class F>
void Visit(F& f) {
    if constexpr (kType >= CARNET_FIRST_DRAWING_TYPE) {
        SCOPED_TRACE(testing::Message() << "type " << kType);
        f(kType, T());
    }
}
template <class F>
void ForEachCommand(F f) {
#define CARNET_TEST_VISIT(code, cls, ...) Visit<code, cls>(f);
    CARNET_ELEMENT_TYPES(CARNET_TEST_VISIT)
#undef CARNET_TEST_VISIT
}

const char* Bytes(const void* p) { return static_cast<const char*>(p); }

}  // namespace

TEST(DrawingValues, LayoutsAndDefaults) {
    int classes = 0;
    ForEachCommand([&](unsigned int type, auto fresh) {
        using T = decltype(fresh);
        ++classes;
        EXPECT_EQ(MemberLetters<T>(), ExpectedMembers(type));
        EXPECT_EQ(carnet_drawing::TypeCode<T>::value, type);
        // Declaration order, seen from the addresses.
        const char* previous = nullptr;
        auto after = [&](const auto& m) {
            EXPECT_TRUE(previous == nullptr || Bytes(&m) > previous);
            previous = Bytes(&m);
        };
        std::apply([&](const auto&... m) { (after(m), ...); }, Members(fresh));

        // After default construction: texts empty, count 0, numbers absent.
        std::apply([](const auto&... m) {
            auto check = [](const auto& x) {
                using M = std::decay_t<decltype(x)>;
                if constexpr (std::is_same_v<M, CString>) {
                    EXPECT_TRUE(x.IsEmpty());
                } else if constexpr (std::is_same_v<M, int>) {
                    EXPECT_EQ(x, 0);
                } else {
                    EXPECT_TRUE(IsUndef(x));
                }
            };
            (check(m), ...);
        }, Members(fresh));
    });
    EXPECT_EQ(classes, 55);
}

TEST(DrawingValues, ValueConstructorsOfEachClass) {
    ForEachCommand([](unsigned int type, auto fresh) {
        using T = decltype(fresh);
        const auto v = TypicalValues<T>();
        constexpr size_t n = std::tuple_size_v<decltype(v)>;
        CheckConstructors<T>(v, ExpectedMinArgs(type), std::make_index_sequence<n>{});
        EXPECT_TRUE(std::is_default_constructible_v<T>);
    });
}

TEST(DrawingValues, SetValReplacesOnlyWhatDiffers) {
    ForEachCommand([](unsigned int, auto t) {
        using T = decltype(t);
        const auto v = TypicalValues<T>();
        constexpr size_t n = std::tuple_size_v<decltype(v)>;

        EXPECT_TRUE(SetVal(t, v));
        EXPECT_TRUE(GetVal(t) == v);
        EXPECT_FALSE(SetVal(t, v));  // the same values again
        EXPECT_TRUE(Values(t) == v);

        // Each member alone: reported and stored, the others untouched.
        auto one = [&](auto index) {
            auto changed = v;
            Bump(std::get<decltype(index)::value>(changed));
            T u = t;
            EXPECT_TRUE(SetVal(u, changed)) << "member " << index;
            EXPECT_TRUE(Values(u) == changed) << "member " << index;
        };
        ForEachIndex(one, std::make_index_sequence<n>{});
    });
}

TEST(DrawingValues, WidthToleranceOfTheStairs) {
    ForEachCommand([](unsigned int type, auto t) {
        using T = decltype(t);
        if constexpr (HasVal1<T>::value) {
            auto v = TypicalValues<T>();
            constexpr size_t n = std::tuple_size_v<decltype(v)>;
            auto& width = std::get<n - (HasVal2<T>::value ? (HasVal3<T>::value ? 3 : 2) : 1)>(v);
            width = 0.8;
            SetVal(t, v);
            const bool tolerant = Tolerant(type);

            for (double d : {1e-7, -1e-7}) {
                width = 0.8 + d;
                EXPECT_EQ(SetVal(t, v), !tolerant) << d;
                EXPECT_EQ(t.m_Val1, tolerant ? 0.8 : 0.8 + d) << d;
                width = 0.8;
                SetVal(t, v);
            }
            for (double d : {2e-6, -2e-6}) {
                width = 0.8 + d;
                EXPECT_TRUE(SetVal(t, v)) << d;
                EXPECT_EQ(t.m_Val1, 0.8 + d) << d;
                width = 0.8;
                SetVal(t, v);
            }
            // The bound itself does not count: 0 and 1e-6 differ by exactly 1e-6.
            width = 0.0;
            SetVal(t, v);
            width = 1e-6;
            EXPECT_EQ(SetVal(t, v), !tolerant);
            // Without tolerance a NaN always counts as a change.
            if (!tolerant) {
                width = std::numeric_limits<double>::quiet_NaN();
                EXPECT_TRUE(SetVal(t, v));
                EXPECT_TRUE(SetVal(t, v));
                EXPECT_TRUE(std::isnan(t.m_Val1));
            }
        }
    });
}

TEST(DrawingValues, CopiesAreIndependentAndAssignmentReturnsTheObject) {
    ForEachCommand([](unsigned int, auto t) {
        using T = decltype(t);
        const auto v = TypicalValues<T>();
        SetVal(t, v);

        T copy(t);
        EXPECT_TRUE(Values(copy) == v);
        copy.m_Code = "other";
        EXPECT_EQ(t.m_Code, "CODE");

        T assigned;
        EXPECT_EQ(&(assigned = t), &assigned);
        EXPECT_TRUE(Values(assigned) == v);
        using Result = decltype(assigned = t);
        if constexpr (std::is_same_v<T, CPointSansOri>) {
            EXPECT_TRUE((std::is_same_v<Result, const T&>));
        } else {
            EXPECT_TRUE((std::is_same_v<Result, T&>));
        }
    });
}

TEST(DrawingValues, AbsentValuesAndNegativeCountsArePlainValues) {
    CLiaison li("LI", 0.3);
    EXPECT_TRUE(li.setVal("LI", UNDEF_VALUE));
    EXPECT_TRUE(IsUndef(li.m_Val1));
    EXPECT_FALSE(li.setVal("LI", UNDEF_VALUE));

    CEscalier2 e2("E2", 3, UNDEF_VALUE);
    EXPECT_TRUE(e2.setVal("E2", 3, 0.8));  // absent to present, tolerance or not
    EXPECT_TRUE(e2.setVal("E2", -1, 0.8));
    EXPECT_EQ(e2.m_Num, -1);
}
