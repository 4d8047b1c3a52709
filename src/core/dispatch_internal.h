// Per-type operations of the element classes, built once from the type table.
// Every place that must act on an element by its type code goes through here.
#pragma once

#include <cstdio>

#include <carnet/cstring.h>
#include <carnet/txtwnd.h>

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

// The operations of a type code, or null for a code outside the table or a
// class that is not part of the build.
const ElementOps* ElementOpsFor(unsigned int code);

// Frees an element as its type code says: its destructor runs when the code
// is known, otherwise only its memory is released. A null pointer is ignored.
void DestroyElement(void* p, unsigned int code);
