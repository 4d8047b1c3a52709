#include "core/dispatch_internal.h"

#include <new>

#include <carnet/carnet.h>

namespace {

using namespace carnet_traits;

template <class T>
constexpr ElementOps MakeOps() {
    ElementOps ops{};
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
    return ops;
}

#define CARNET_OPS_ROW(code, cls, ...) MakeOps<cls>(),
constexpr ElementOps kOps[] = {CARNET_ELEMENT_TYPES(CARNET_OPS_ROW)};
#undef CARNET_OPS_ROW

}  // namespace

const ElementOps* ElementOpsFor(unsigned int code) {
    if (code < CARNET_FIRST_TYPE || code > CARNET_LAST_TYPE) return nullptr;
    return &kOps[code - CARNET_FIRST_TYPE];
}

void DestroyElement(void* p, unsigned int code) {
    if (!p) return;
    if (const ElementOps* ops = ElementOpsFor(code))
        ops->destroy(p);
    else
        ::operator delete(p);
}
