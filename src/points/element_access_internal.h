// Typed, in-place reading of the elements of a book, shared by the lookups.
#pragma once

#include <carnet/ccarnet.h>
#include <carnet/cstring.h>

#include "core/dispatch_internal.h"

namespace carnet_query {

// Whether the elements of a type code carry a point number.
inline bool HasPointNumber(unsigned int code) {
    const ElementOps* ops = ElementOpsFor(code);
    return ops && ops->np;
}

// The point number of an element, read in place (no copy), or null for a
// type that has none or a null element.
inline const CString* PointNumber(const void* p, unsigned int code) {
    const ElementOps* ops = p ? ElementOpsFor(code) : nullptr;
    return ops && ops->np ? ops->np(p) : nullptr;
}

// The element at index i as a T when it is of T's type, else null.
template <class T>
const T* ElementAs(const CCarnet& book, int i) {
    return book.typAt(i) == TypeCode<T>::value ? static_cast<const T*>(book.ptrAt(i)) : nullptr;
}

}  // namespace carnet_query
