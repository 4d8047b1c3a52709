// Code-table entries: an arbitrary line read with every format version,
// written back in the current format, and that line read and written again.
//
// Properties: only an empty line is refused; the written line reads back,
// into a new entry or into the same one, to an entry that writes exactly the
// same line; a copy writes it too; isUnit, isBool and getExt accept anything.
#include <string>

#include "fuzz_support.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    // The entry reads a C string: the line stops at a NUL byte, as it would.
    const std::string line(reinterpret_cast<const char*>(data), size);
    const char* text = line.c_str();

    for (int version = 0; version <= CCode::CurrentVersion; ++version) {
        CCode entry;
        FUZZ_CHECK(entry.initCode(text, version) == (text[0] != '\0'));
        CString written;
        FUZZ_CHECK(entry.getTableLine(written));

        CCode fresh;
        FUZZ_CHECK(fresh.initCode(written, CCode::CurrentVersion));
        CString rewritten;
        fresh.getTableLine(rewritten);
        FUZZ_CHECK_SAME(rewritten.str(), written.str());

        // Read over the same entry, the members the line does not give are
        // the ones it wrote, so the line stays the same too.
        FUZZ_CHECK(entry.initCode(written, CCode::CurrentVersion));
        entry.getTableLine(rewritten);
        FUZZ_CHECK_SAME(rewritten.str(), written.str());

        CCode copy;
        copy = &entry;
        copy.getTableLine(rewritten);
        FUZZ_CHECK_SAME(rewritten.str(), written.str());
    }

    CCode::isUnit(text);
    CCode::isBool(text);
    CCode().getExt(text);
    return 0;
}
