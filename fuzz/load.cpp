// Load of an arbitrary file, then the round trip: the loaded book is saved,
// the saved file loaded into a second book and saved again.
//
// Properties: the two saves are byte for byte the same; the second book has
// as many elements as the first, with the same type codes in the same order;
// the saved file loads without a single rejected line; a book loaded in
// append mode after the first one holds both; and every element can be
// listed, written and queried.
#include <string>
#include <vector>

#include "fuzz_support.h"
#include "platform/storefile_internal.h"

namespace {

std::vector<unsigned int> Types(const CCarnet& book) {
    std::vector<unsigned int> types;
    for (int i = 0; i < book.length(); ++i) types.push_back(book.typAt(i));
    return types;
}

std::string Saved(CCarnet& book, const std::string& path) {
    FUZZ_CHECK(book.Save(path, nullptr, false) == 1);
    std::string bytes;
    FUZZ_CHECK(carnet_storefile::ReadAll(path, bytes) == 0);
    return bytes;
}

// The load messages, except the duplicate-point warning: a point that
// conflicts with an earlier one is kept, and warned about again each time.
std::vector<std::string> Rejections(const CNorvexTxtWnd& wnd) {
    std::vector<std::string> out;
    for (const std::string& text : wnd.Texts())
        if (text.rfind("Attention : ", 0) != 0) out.push_back(text);
    return out;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    auto& scratch = carnet_fuzz::Scratch::Get();
    scratch.ResetStores();
    const std::string params = scratch.Path("params.ini");
    const std::string source = scratch.File("source.geo", data, size);
    const std::string first = scratch.Path("first.geo");
    const std::string second = scratch.Path("second.geo");

    CCarnet book;
    CNorvexTxtWnd wnd;
    const int loaded = book.Load(&wnd, source, params, 0, nullptr);
    FUZZ_CHECK(loaded == (book.length() > 0 ? 1 : 0));
    FUZZ_CHECK(book.m_FileName == CString(source));
    carnet_fuzz::QueryEveryElement(book);

    const std::string saved = Saved(book, first);
    CCarnet again;
    CNorvexTxtWnd wndAgain;
    again.Load(&wndAgain, first, params, 0, nullptr);
    const std::vector<std::string> rejected = Rejections(wndAgain);
    FUZZ_CHECK_SAME(rejected.empty() ? std::string() : rejected.front(), std::string());
    FUZZ_CHECK(Types(again) == Types(book));
    FUZZ_CHECK_SAME(Saved(again, second), saved);

    // Appending the saved file to the book loaded from it doubles it, unless
    // the book ends with the path that the file begins with: that line then
    // continues the path.
    const int n = again.length();
    const bool continues =
        n > 0 && again.typAt(0) == 1007 && again.typAt(n - 1) == 1007 && again.matAt(0) == again.matAt(n - 1);
    CNorvexTxtWnd wndAppend;
    FUZZ_CHECK(again.Load(&wndAppend, first, 1, nullptr) == (n > 0 ? 1 : 0));
    if (!continues) {
        std::vector<unsigned int> twice = Types(book);
        twice.insert(twice.end(), twice.begin(), twice.end());
        FUZZ_CHECK(Types(again) == twice);
    }
    return 0;
}
