// Replaces the global deallocation functions of this test program so that a
// test can tell whether an object's memory was released.
#include "free_tracker.h"

#include <cstdlib>
#include <new>

namespace {
void* g_freed[4096];
size_t g_count = 0;
}  // namespace

void FreeTracker::Reset() { g_count = 0; }

bool FreeTracker::WasFreed(const void* p) {
    for (size_t i = 0; i < g_count; ++i)
        if (g_freed[i] == p) return true;
    return false;
}

static void Record(void* p) {
    if (p && g_count < sizeof g_freed / sizeof g_freed[0]) g_freed[g_count++] = p;
}

void* operator new(size_t n) {
    if (void* p = std::malloc(n ? n : 1)) return p;
    throw std::bad_alloc();
}
void* operator new(size_t n, const std::nothrow_t&) noexcept { return std::malloc(n ? n : 1); }
void operator delete(void* p) noexcept {
    Record(p);
    std::free(p);
}
void operator delete(void* p, size_t) noexcept {
    Record(p);
    std::free(p);
}
void operator delete(void* p, const std::nothrow_t&) noexcept {
    Record(p);
    std::free(p);
}
