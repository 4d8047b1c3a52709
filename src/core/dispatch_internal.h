// Per-type operations of the element classes, built once from the type table.
// Every place that must act on an element by its type code goes through here.
#pragma once

#include <cstdio>
#include <type_traits>
#include <utility>

#include <carnet/cstring.h>
#include <carnet/element_types.h>
#include <carnet/txtwnd.h>

// What an element class offers, read from its members: the operations below
// are built from these, and so are the typed lookups (find.cpp).
namespace carnet_traits {

template <class T, class = void>
struct HasParams : std::false_type {};
template <class T>
struct HasParams<T, std::void_t<decltype(std::declval<T&>().Params(std::declval<CString&>()))>> : std::true_type {};

// A point number, read in place.
template <class T, class = void>
struct HasNp : std::false_type {};
template <class T>
struct HasNp<T, std::void_t<decltype(static_cast<const CString&>(std::declval<const T&>().Np()))>> : std::true_type {};

// A code (symbol), read in place.
template <class T, class = void>
struct HasSy : std::false_type {};
template <class T>
struct HasSy<T, std::void_t<decltype(static_cast<const CString&>(std::declval<const T&>().Sy()))>> : std::true_type {};

// A keyword that depends on the record (the table gives the others).
template <class T, class = void>
struct HasFileKeyword : std::false_type {};
template <class T>
struct HasFileKeyword<T, std::void_t<decltype(std::declval<const T&>().FileKeyword())>> : std::true_type {};

// A file text of one line (a traverse path has several).
template <class T, class = void>
struct HasLineInfos : std::false_type {};
template <class T>
struct HasLineInfos<T, std::void_t<decltype(std::declval<T&>().Infos(std::declval<CString&>()))>>
    : std::true_type {};

}  // namespace carnet_traits

struct ElementOps {
    void (*destroy)(void* p);
    void (*print)(void* p, CNorvexTxtWnd* wnd, int n);
    void (*write)(void* p, std::FILE* f, int n);
    void* (*copy)(const void* p);        // a new object built as a copy
    void* (*assignNew)(const void* p);   // a new default object, then assigned
    void (*params)(void* p, CString& out);     // null: the type has no display text
    const CString* (*np)(const void* p);       // null: the type has no point number
    const CString* (*sy)(const void* p);       // null: the type has no code
    const char* (*keyword)(const void* p);     // null: the table's keyword
    void (*infos)(void* p, CString& out);      // null: no one-line file text
};

// The operations of a type code, or null for a code outside the table.
const ElementOps* ElementOpsFor(unsigned int code);

// Frees an element as its type code says: its destructor runs when the code
// is known, otherwise only its memory is released. A null pointer is ignored.
void DestroyElement(void* p, unsigned int code);
