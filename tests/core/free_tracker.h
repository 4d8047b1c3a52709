#pragma once

struct FreeTracker {
    static void Reset();
    static bool WasFreed(const void* p);
};
