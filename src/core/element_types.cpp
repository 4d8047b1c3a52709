#include <carnet/element_types.h>

namespace {

#define CARNET_TYPE_ROW(code, cls, ...) {code, #cls, {__VA_ARGS__}},
const CarnetElementType kTypes[] = {CARNET_ELEMENT_TYPES(CARNET_TYPE_ROW)};
#undef CARNET_TYPE_ROW

static_assert(sizeof kTypes / sizeof kTypes[0] == CARNET_LAST_TYPE - CARNET_FIRST_TYPE + 1,
              "one row per type code, in code order");

}  // namespace

const CarnetElementType* CarnetTypeInfo(unsigned int code) {
    if (code < CARNET_FIRST_TYPE || code > CARNET_LAST_TYPE) return nullptr;
    return &kTypes[code - CARNET_FIRST_TYPE];
}

const char* CarnetKeyword(unsigned int code) {
    const CarnetElementType* row = CarnetTypeInfo(code);
    return row ? row->keywords[0] : nullptr;
}
