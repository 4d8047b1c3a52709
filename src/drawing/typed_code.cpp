// Cutting a code string typed in the field into the members of a drawing
// command (the Interprete members of drawing_layouts.h).
#include <carnet/drawing_layouts.h>

#include <cmath>

#include <carnet/numconv.h>

namespace carnet_drawing {

namespace {

// The separator that means "cut before a sign": a plus-minus sign.
constexpr char kSignMode = '\xB1';

bool IsSign(char c) { return c == '+' || c == '-'; }

}  // namespace

TypedCode::TypedCode(const CString& text, const CString& sep, const CCode* code)
    : m_Rest(text.str()),
      m_Sep(sep.str()),
      m_bSign(m_Sep.size() == 1 && m_Sep[0] == kSignMode),
      m_Scale(std::pow(10.0, code ? code->m_Decimals : 0)) {}

std::string TypedCode::Token(bool keep) {
    constexpr size_t npos = std::string::npos;
    size_t cut = npos;
    if (m_bSign) {
        // A text that starts with '-' is one token; otherwise the first sign
        // after the start cuts it.
        const size_t plus = m_Rest.find('+');
        const size_t minus = m_Rest.find('-');
        if (minus != 0)
            for (size_t at : {plus, minus})
                if (at != npos && at > 0 && (cut == npos || at < cut)) cut = at;
    } else {
        // An empty separator is found at 0 and so cuts nothing.
        cut = m_Rest.find(m_Sep);
        if (cut == 0) cut = npos;
    }
    std::string token;
    if (cut == npos) {
        token.swap(m_Rest);
        return token;
    }
    token.assign(m_Rest, 0, cut);
    m_Rest.erase(0, m_bSign && keep ? cut : cut + 1);
    return token;
}

CString TypedCode::Text(bool keep) { return CString(Token(keep)); }

int TypedCode::Count(bool keep) {
    const int n = numconv::Atoi(Token(keep).c_str());
    return n == 0 ? -1 : n;
}

double TypedCode::Number(bool keep) {
    std::string number;
    if (m_bSign && !m_Rest.empty() && IsSign(m_Rest[0])) {
        number = m_Rest[0];
        m_Rest.erase(0, 1);
    }
    number += Token(keep);
    const double value = numconv::Atof(number) / m_Scale;
    // A decimal count far out of range would leave an infinity or NaN that
    // no line could write back: not a number then.
    if (value == 0.0 || !std::isfinite(value)) return UNDEF_VALUE;
    return value;
}

}  // namespace carnet_drawing
