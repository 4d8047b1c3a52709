// A host program built against the installed package.
#include <carnet/carnet.h>
#include <carnet/survey/crs.h>

#include <cstdio>
#include <cstring>

int main() {
    CCarnet book;
    book.append(new CPointGen("P1", 1000.25, 2000.5, "arbre"), 1006);
    CNorvexTxtWnd wnd;
    book.Print(&wnd, 1);
    if (wnd.Texts().size() != 1) return 1;
    const char* expected =
        "000001  Point            P1               0    1000.250000    2000.500000 -999999.000000 arbre";
    if (std::strcmp(wnd.Texts()[0].c_str(), expected) != 0) {
        std::fprintf(stderr, "unexpected line: %s\n", wnd.Texts()[0].c_str());
        return 1;
    }
    if (carnet::survey::Crs::FromBookName("Projection Lambert Zone II").Code() != "EPSG:27572") {
        std::fprintf(stderr, "the survey library does not know zone II\n");
        return 1;
    }
    std::puts("consumer ok");
    return 0;
}
