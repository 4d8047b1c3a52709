// Traverse-path lines: a path written over several lines is rebuilt as one
// element when its lines follow each other.
#include <memory>

#include <carnet/chemin.h>

#include "file/reader_internal.h"

namespace carnet_reader {

void* ReadElement(ReadContext& ctx, ElementTag<CChemin>) {
    CCarnet& book = ctx.book;
    const size_t n = ctx.WordCount();
    if (!book.isEmpty() && book.typLast() == TypeCode<CChemin>::value && book.ptrLast()) {
        auto* last = static_cast<CChemin*>(const_cast<void*>(static_cast<const CCarnet&>(book).ptrLast()));
        if (n >= 1 && last->Np().str() == ctx.WordAt(0)) {
            if (n < 2) return ctx.Incomplete();
            for (size_t i = 1; i < n; ++i) last->add(ctx.Word(i));
            // No new element: the loader's increment is made up for here.
            --ctx.index;
            return last;
        }
    }
    if (n < 3) return ctx.Incomplete();
    auto path = std::make_unique<CChemin>(ctx.Word(0));
    path->setAntenne(ctx.cut.keyword == CarnetTypeInfo(TypeCode<CChemin>::value)->keywords[1] ? 0 : 1);
    for (size_t i = 1; i < n; ++i) path->add(ctx.Word(i));
    // A word that add refuses (one that begins with a hyphen) is no station:
    // a path of fewer than two would be saved as a line that cannot load.
    if (path->length() < 2) return ctx.Incomplete();
    book.append(path.get(), TypeCode<CChemin>::value);
    return path.release();
}

}  // namespace carnet_reader
