#include "records/record_internal.h"

#include <carnet/element_types.h>
#include <carnet/numconv.h>

namespace carnet_record {

CString& LineBuffer() {
    thread_local CString line;
    return line;
}

void AppendItem(CString& out, const char* label, int decimals, int extraWidth, double v) {
    const int d = numconv::SafeDecimals(decimals);
    if (!out.IsEmpty()) out += " , ";
    out.AppendFormat("%s = %*.*f", label, d + extraWidth, d, v);
}

void StartLine(CString& out, unsigned int typeCode, const CString& np) {
    out.Empty();
    carnet_line::AppendKeyword(out, CarnetKeyword(typeCode));
    out += ' ';
    carnet_line::AppendName(out, np);
}

void AppendBlanks(CString& out, int count) {
    if (count > 0) out.str().append(static_cast<size_t>(count), ' ');
}

void AppendColumn(CString& out, double v, int width, int precision, int blanksIfAbsent) {
    out += ' ';
    if (IsUndef(v))
        AppendBlanks(out, blanksIfAbsent);
    else
        out.AppendFormat("%*.*f", width, precision, v);
}

}  // namespace carnet_record
