// The parameter stores on arbitrary file contents: a profile file, or the
// file of a registry root, holding any bytes, read and then written through.
//
// Input: one choice byte (bit 0: registry rather than profile), then a
// section, a key and a value separated by '\n', then the file contents.
//
// Properties: reading takes any file; a value written reads back exactly
// (or the write is refused and the file keeps every byte); an entry of the
// options read before the write changes only if it is the entry written,
// named another way; the typed getters clamp into their range.
#include <string>

#include "fuzz_support.h"
#include "platform/storefile_internal.h"

namespace {

// The store as the parameter functions see it.
struct Store {
    bool registry;
    std::string location;  // what GetParam* and SetParam* take
    std::string file;      // where its bytes are

    bool Read(const std::string& section, const std::string& key, std::string& value) const {
        if (!registry) return ProfileReadString(file.c_str(), section.c_str(), key.c_str(), value);
        return RegistryGetString("HKEY_CURRENT_USER", section.c_str(), key.c_str(), value) == 0;
    }
    int Write(const std::string& section, const std::string& key, const std::string& value) const {
        if (!registry) return ProfileWriteString(file.c_str(), section.c_str(), key.c_str(), value.c_str());
        return RegistrySetString("HKEY_CURRENT_USER", section.c_str(), key.c_str(), value.c_str());
    }
};

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    auto& scratch = carnet_fuzz::Scratch::Get();
    scratch.ResetStores();
    carnet_fuzz::Input in(data, size);
    const bool registry = (in.Byte() & 1) != 0;
    // Names and values are C strings at the interface: they end at a NUL.
    const std::string section(std::string(in.Until('\n')).c_str());
    const std::string key(std::string(in.Until('\n')).c_str());
    const std::string value(std::string(in.Until('\n')).c_str());
    const std::string contents(in.Rest());

    Store store{registry, registry ? "HKEY_CURRENT_USER" : scratch.Path("params.ini"),
                registry ? scratch.Path("registry/HKEY_CURRENT_USER.txt") : scratch.Path("params.ini")};
    if (registry) FUZZ_CHECK(carnet_storefile::MakeFolders(scratch.Path("registry"), 0700) == 0);
    FUZZ_CHECK(carnet_storefile::ReplaceAtomically(store.file, contents, 0600) == 0);

    // An entry of the options, read before the write.
    std::string found, other;
    const std::string otherSection = "Options_Tolerances", otherKey = "TolAngles";
    const bool hadOther = store.Read(otherSection, otherKey, other);
    store.Read(section, key, found);

    int number = 0;
    GetParamInt(store.location.c_str(), section.c_str(), key.c_str(), 5, -3, 7, &number);
    FUZZ_CHECK(number >= -3 && number <= 7);
    double real = 0.0;
    GetParamDouble(store.location.c_str(), section.c_str(), key.c_str(), 1.5, -2.0, 2.0, &real);
    FUZZ_CHECK(real >= -2.0 && real <= 2.0);
    CString text;
    GetParamString(store.location.c_str(), section.c_str(), key.c_str(), "d\xE9" "faut", &text);

    if (store.Write(section, key, value) != 0) {
        std::string now;
        FUZZ_CHECK(carnet_storefile::ReadAll(store.file, now) == 0);
        FUZZ_CHECK_SAME(now, contents);
        return 0;
    }
    std::string back;
    FUZZ_CHECK(store.Read(section, key, back));
    FUZZ_CHECK_SAME(back, value);
    // The other entry changed only if it is the one written, named another way.
    std::string otherNow;
    const bool hasOther = store.Read(otherSection, otherKey, otherNow);
    if (hasOther != hadOther || otherNow != other) {
        FUZZ_CHECK(hasOther);
        FUZZ_CHECK_SAME(otherNow, value);
    }

    // Through the parameter functions, as the option lines store a number.
    if (SetParamDouble(store.location.c_str(), section.c_str(), key.c_str(), 0.25)) {
        GetParamDouble(store.location.c_str(), section.c_str(), key.c_str(), 1.5, -2.0, 2.0, &real);
        FUZZ_CHECK(real == 0.25);
    }
    return 0;
}
