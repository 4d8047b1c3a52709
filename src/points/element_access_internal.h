// Typed, in-place reading of the elements of a book, shared by the lookups.
#pragma once

#include <carnet/ccarnet.h>
#include <carnet/cstring.h>

#include "core/dispatch_internal.h"

namespace carnet_query {

// The point number of an element, read in place (no copy), or null for a
// type that has none (only types 1001 to 1007 carry one) or a null element.
inline const CString* PointNumber(const void* p, unsigned int code) {
    if (code < 1001 || code > 1007 || !p) return nullptr;
    const ElementOps* ops = ElementOpsFor(code);
    return ops && ops->np ? ops->np(p) : nullptr;
}

// The element at index i as a T when its type code is `code`, else null.
template <class T>
const T* ElementAs(const CCarnet& book, int i, unsigned int code) {
    return book.typAt(i) == code ? static_cast<const T*>(book.ptrAt(i)) : nullptr;
}

}  // namespace carnet_query
