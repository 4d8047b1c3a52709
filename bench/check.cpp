#include "check.h"

#include <cstdio>
#include <cstdint>
#include <vector>

#include <carnet/carnet.h>

#include "book.h"

namespace bench {
namespace {

// Find as its rule says it: a plain scan in the direction of the search.
int PlainFind(CCarnet& book, unsigned int type, const CString& np, int first, int end) {
    auto matches = [&](int i) { return book.typAt(i) == type && (np.IsEmpty() || book.matAt(i) == np); };
    if (end < 0) {
        for (int i = first; i >= 0; --i)
            if (matches(i)) return i;
        return -1;
    }
    const int last = end == 0 ? book.length() - 1 : end;
    for (int i = first; i <= last; ++i)
        if (matches(i)) return i;
    return -1;
}

}  // namespace

bool CheckLookups() {
    CCarnet book;
    GenerateBook(book, 20000);
    // Elements without an object, as a host may leave them, count for their
    // type only.
    for (int i = 37; i < book.length(); i += 1009) {
        book.removeElement(book.ptrAt(i), book.typAt(i));
        book.setPtrAt(i, nullptr);
    }
    std::uint64_t state = 12345;
    auto next = [&state](int n) {
        state = state * 6364136223846793005ull + 1442695040888963407ull;
        return static_cast<int>((state >> 33) % static_cast<std::uint64_t>(n));
    };
    const int count = book.length();
    for (int k = 0; k < 4000; ++k) {
        const unsigned int type = 1000 + static_cast<unsigned int>(next(12));
        const int at = next(count);
        CString np = k % 5 == 0 ? CString() : book.matAt(at);
        if (k % 7 == 0) np = "absent";
        const int first = next(count);
        const int end = k % 3 == 0 ? -1 : (k % 3 == 1 ? 0 : first + next(count - first));
        const int got = book.Find(type, np, first, end);
        const int want = PlainFind(book, type, np, first, end);
        if (got != want) {
            std::fprintf(stderr, "Find(%u, \"%s\", %d, %d) gives %d instead of %d\n", type, np.GetString(), first, end,
                         got, want);
            return false;
        }
    }
    return true;
}

}  // namespace bench
