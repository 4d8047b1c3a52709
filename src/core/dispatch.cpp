#include "core/dispatch_internal.h"

#include <new>
#include <type_traits>
#include <utility>

#include <carnet/carnet.h>

namespace {

// A type table row whose class is not in the build yet is handled like an
// unknown code; this tells the two apart at compile time.
template <class T, class = void>
struct IsComplete : std::false_type {};
template <class T>
struct IsComplete<T, std::void_t<decltype(sizeof(T))>> : std::true_type {};

template <class T, class = void>
struct HasParams : std::false_type {};
template <class T>
struct HasParams<T, std::void_t<decltype(std::declval<T&>().Params(std::declval<CString&>()))>> : std::true_type {};

template <class T, class = void>
struct HasNp : std::false_type {};
template <class T>
struct HasNp<T, std::void_t<decltype(static_cast<const CString&>(std::declval<const T&>().Np()))>> : std::true_type {};

template <class T, class = void>
struct HasSy : std::false_type {};
template <class T>
struct HasSy<T, std::void_t<decltype(static_cast<const CString&>(std::declval<const T&>().Sy()))>> : std::true_type {};

template <class T, class = void>
struct HasFileKeyword : std::false_type {};
template <class T>
struct HasFileKeyword<T, std::void_t<decltype(std::declval<const T&>().FileKeyword())>> : std::true_type {};

template <class T, class = void>
struct HasLineInfos : std::false_type {};
template <class T>
struct HasLineInfos<T, std::void_t<decltype(std::declval<T&>().Infos(std::declval<CString&>()))>>
    : std::true_type {};

template <class T>
ElementOps MakeOps() {
    ElementOps ops{};
    if constexpr (IsComplete<T>::value) {
        ops.destroy = [](void* p) { delete static_cast<T*>(p); };
        ops.print = [](void* p, CNorvexTxtWnd* w, int n) { static_cast<T*>(p)->Print(w, n); };
        ops.write = [](void* p, std::FILE* f, int n) { static_cast<T*>(p)->Write(f, n); };
        ops.copy = [](const void* p) -> void* { return new (std::nothrow) T(*static_cast<const T*>(p)); };
        ops.assignNew = [](const void* p) -> void* {
            T* t = new (std::nothrow) T();
            if (t) *t = *static_cast<const T*>(p);
            return t;
        };
        if constexpr (HasParams<T>::value)
            ops.params = [](void* p, CString& out) { static_cast<T*>(p)->Params(out); };
        if constexpr (HasNp<T>::value)
            ops.np = [](const void* p) -> const CString* { return &static_cast<const T*>(p)->Np(); };
        if constexpr (HasSy<T>::value)
            ops.sy = [](const void* p) -> const CString* { return &static_cast<const T*>(p)->Sy(); };
        if constexpr (HasLineInfos<T>::value)
            ops.infos = [](void* p, CString& out) { static_cast<T*>(p)->Infos(out); };
        if constexpr (HasFileKeyword<T>::value)
            ops.keyword = [](const void* p) -> const char* { return static_cast<const T*>(p)->FileKeyword(); };
    }
    return ops;
}

struct OpsTable {
    ElementOps ops[CARNET_LAST_TYPE - CARNET_FIRST_TYPE + 1];
    OpsTable() {
        size_t i = 0;
#define CARNET_OPS_ROW(code, cls, ...) ops[i++] = MakeOps<cls>();
        CARNET_ELEMENT_TYPES(CARNET_OPS_ROW)
#undef CARNET_OPS_ROW
    }
};

const OpsTable& Table() {
    static const OpsTable table;
    return table;
}

}  // namespace

const ElementOps* ElementOpsFor(unsigned int code) {
    if (code < CARNET_FIRST_TYPE || code > CARNET_LAST_TYPE) return nullptr;
    const ElementOps* ops = &Table().ops[code - CARNET_FIRST_TYPE];
    return ops->destroy ? ops : nullptr;
}

void DestroyElement(void* p, unsigned int code) {
    if (!p) return;
    if (const ElementOps* ops = ElementOpsFor(code))
        ops->destroy(p);
    else
        ::operator delete(p);
}
