#include <carnet/element_types.h>

namespace {

#define CARNET_TYPE_ROW(code, cls, ...) {code, #cls, {__VA_ARGS__}},
const CarnetElementType kTypes[] = {CARNET_ELEMENT_TYPES(CARNET_TYPE_ROW)};
#undef CARNET_TYPE_ROW

// The rows are looked up by code - CARNET_FIRST_TYPE: the codes must run on
// without a gap, the drawing commands right after the records.
#define CARNET_TYPE_CODE_ONLY(code, cls, ...) code,
constexpr unsigned int kCodes[] = {CARNET_ELEMENT_TYPES(CARNET_TYPE_CODE_ONLY)};
constexpr unsigned int kRecordCodes[] = {CARNET_RECORD_TYPES(CARNET_TYPE_CODE_ONLY)};
#undef CARNET_TYPE_CODE_ONLY

constexpr bool CodesRunOn() {
    for (unsigned int i = 0; i < sizeof kCodes / sizeof kCodes[0]; ++i)
        if (kCodes[i] != CARNET_FIRST_TYPE + i) return false;
    return true;
}
static_assert(CodesRunOn(), "one row per type code, in code order");
static_assert(sizeof kTypes / sizeof kTypes[0] == CARNET_LAST_TYPE - CARNET_FIRST_TYPE + 1, "a row per code");
static_assert(sizeof kRecordCodes / sizeof kRecordCodes[0] == CARNET_FIRST_DRAWING_TYPE - CARNET_FIRST_TYPE,
              "the drawing commands follow the records");
static_assert(CARNET_ANY_TYPE < CARNET_FIRST_TYPE, "every type is asked for by a code outside the table");

}  // namespace

const CarnetElementType* CarnetTypeInfo(unsigned int code) {
    if (code < CARNET_FIRST_TYPE || code > CARNET_LAST_TYPE) return nullptr;
    return &kTypes[code - CARNET_FIRST_TYPE];
}

const char* CarnetKeyword(unsigned int code) {
    const CarnetElementType* row = CarnetTypeInfo(code);
    return row ? row->keywords[0] : nullptr;
}
