#include <gtest/gtest.h>

#include <random>

#include <carnet/carnet.h>

// Find on a book long enough for its block and look-ahead paths, checked
// against a plain scan of typAt/matAt in every direction and range.
TEST(FindScan, AgreesWithAPlainScanOnALongBook) {
    CCarnet book;
    std::mt19937 rng(7);
    const int n = 5000;
    for (int i = 0; i < n; ++i) {
        const std::string name = (rng() % 3 ? "P" : "S") + std::to_string(rng() % 40);
        switch (rng() % 4) {
            case 0: book.append(new CPointGen(name.c_str(), 1.0, 2.0, ""), 1006); break;
            case 1: book.append(new CStation(name.c_str(), 1.5, 10.0, ""), 1001); break;
            case 2: book.append(new CMesure(name.c_str(), 12.5, ""), 1003); break;
            default: book.append(new CComment(name.c_str()), 1000); break;
        }
    }
    auto plain = [&](unsigned type, const CString& np, int first, int end) {
        const bool back = end < 0;
        const int last = end == 0 ? n - 1 : end;
        if (back ? first < 0 : first > last) return -1;
        for (int i = first; back ? i >= 0 : i <= last; back ? --i : ++i)
            if (book.typAt(i) == type && (np.IsEmpty() || book.matAt(i) == np)) return i;
        return -1;
    };
    const unsigned types[] = {1000, 1001, 1003, 1006};
    for (int k = 0; k < 3000; ++k) {
        const unsigned type = types[rng() % 4];
        const CString np = rng() % 10 == 0 ? CString() : CString(("P" + std::to_string(rng() % 45)).c_str());
        const int first = static_cast<int>(rng() % n);
        const int mode = static_cast<int>(rng() % 3);
        const int end = mode == 0 ? -1 : mode == 1 ? 0 : first + static_cast<int>(rng() % (n - first));
        ASSERT_EQ(book.Find(type, np, first, end), plain(type, np, first, end))
            << type << " " << np.GetString() << " " << first << " " << end;
    }
}
