// The drawing-command readers of the line reader: the number of fields each
// keyword accepts, and the fields given to the command's members in their
// order.
#include <string>

#include <carnet/drawing.h>
#include <carnet/numconv.h>

#include "file/reader_internal.h"

namespace carnet_reader {
namespace {

using namespace carnet_drawing;

// How many fields may follow a keyword. A line without any field always has
// the "incomplete" message.
struct FieldRule {
    unsigned char fewest;
    unsigned char most;   // kNoLimit: fields beyond the members are ignored
    bool quietWhenFewer;  // a line with 1 .. fewest - 1 fields is dropped without a message
    bool quietWhenMore;   // so is a line with more than `most`
};

constexpr unsigned char kNoLimit = 255;
constexpr FieldRule kAtLeast1{1, kNoLimit, false, false};
constexpr FieldRule kUpTo2{1, 2, false, false};
constexpr FieldRule kUpTo3{1, 3, false, false};
constexpr FieldRule kUpTo4{1, 4, false, false};
// Segment constructions without their number mean nothing: dropped quietly.
constexpr FieldRule kNeeds2Quiet{2, 3, true, false};

// The rule of each drawing command, in the order of the type table (checked
// below, so that a row cannot stand for another command).
struct RuleRow {
    unsigned int code;
    FieldRule rule;
};
template <class T>
constexpr RuleRow Rule(FieldRule rule) {
    return {TypeCode<T>::value, rule};
}
constexpr RuleRow kRules[] = {
    Rule<CPointSansOri>(kAtLeast1),
    Rule<CPointAvecOri>(kAtLeast1),
    Rule<COrientationPT>(kAtLeast1),
    Rule<CRAZOrientPT>(kAtLeast1),
    Rule<COrientationSy>(kAtLeast1),
    Rule<CRAZOrientSy>(kAtLeast1),
    Rule<CSymSansOri>(kUpTo3),
    Rule<CSymCirCenRay>(kUpTo2),
    Rule<CSymCirCenDia>(kUpTo2),
    Rule<CSymCir3Pt>(kAtLeast1),
    Rule<CSymAvecOri>(kUpTo3),
    Rule<CSymOria1>(kUpTo2),
    Rule<CSymCarDia>(kAtLeast1),
    Rule<CSym2Pt11>(kAtLeast1),
    Rule<CSym2Pt>(kUpTo2),
    Rule<CSym2PtD1>(kUpTo2),
    Rule<CSym2PtD2>(kUpTo2),
    Rule<CSym3Pth>(kUpTo3),
    Rule<CSym3PtD>(kUpTo3),
    Rule<CSymComp1>(kUpTo2),
    Rule<CSymComp2>(kUpTo2),
    Rule<CSymComp3>(kUpTo3),
    Rule<CSymEntree>(kUpTo4),
    Rule<CSymAligne>({2, 2, false, false}),  // the count is required
    Rule<CCer1PtR>(kUpTo3),
    Rule<CCer1PtD>(kUpTo3),
    Rule<CCer3Pt>({1, 2, false, true}),
    Rule<CCarreDia>({1, 2, false, true}),
    Rule<CCarre2Pt>(kUpTo3),
    Rule<CRec3Pth>(kUpTo4),
    Rule<CRec3PtD>(kUpTo4),
    Rule<CLiaison>(kUpTo2),
    Rule<CPerpenSegm>(kNeeds2Quiet),
    Rule<CAlignement>(kUpTo2),
    Rule<CProlonSegm>(kNeeds2Quiet),
    Rule<CIntersSegm>(kUpTo3),
    Rule<CParallele>(kNeeds2Quiet),
    Rule<CEscalier1>(kUpTo2),
    Rule<CEscalier2>(kUpTo3),
    Rule<CEscalier3>(kUpTo2),
    Rule<CEscalier4>(kUpTo4),
    Rule<CEscalier5>(kUpTo2),
    Rule<CPassagePieton>({1, 1, false, false}),
    Rule<CPassageVelo>({1, 1, false, false}),
    Rule<CTexte>(kAtLeast1),                // free text
    Rule<CTexteOrient>(kAtLeast1),          // free text
    Rule<CCacheAtt>(kAtLeast1),
    Rule<CAddAttSy>(kAtLeast1),             // free text
    Rule<CAddAttPt>(kAtLeast1),             // free text
    Rule<CAccrProPt>(kAtLeast1),
    Rule<CAccrProLi>({2, kNoLimit, false, false}),
    Rule<CRappelPoint>({2, kNoLimit, false, false}),
    Rule<CPerpen2Pts>(kAtLeast1),
    Rule<CSymetric>(kAtLeast1),
    Rule<CInterDist>({3, kNoLimit, false, false}),
};

constexpr bool RulesInTableOrder() {
    unsigned int code = CARNET_FIRST_DRAWING_TYPE;
    for (const RuleRow& row : kRules)
        if (row.code != code++) return false;
    return code == CARNET_LAST_TYPE + 1;
}
static_assert(RulesInTableOrder(), "one rule per drawing command, in table order");

// The fields of a line; a field the line does not have reads as the member's
// absent value.
class Fields {
public:
    explicit Fields(const ReadContext& ctx) : m_ctx(ctx) {}

    CString Text(size_t i) const { return Has(i) ? m_ctx.Word(i) : CString(); }
    int Count(size_t i) const { return Has(i) ? numconv::Atoi(std::string(m_ctx.WordAt(i)).c_str()) : 0; }
    double Number(size_t i) const { return Has(i) ? m_ctx.Number(i) : UNDEF_VALUE; }
    // Everything after the first field and the white space after it, inner
    // blanks included.
    CString FreeText() const {
        if (!Has(1)) return CString();
        const std::string_view rest = m_ctx.cut.rest;
        return CString(std::string(rest.substr(static_cast<size_t>(m_ctx.WordAt(1).data() - rest.data()))));
    }

private:
    bool Has(size_t i) const { return i < m_ctx.WordCount(); }

    const ReadContext& m_ctx;
};

// One filler per layout: the fields in member order.
template <class S>
void Fill(CodeCommand<S>& c, const Fields& f) {
    c.m_Code = f.Text(0);
}
template <class S, Label L, unsigned int O, int M>
void Fill(OneValueCommand<S, L, O, M>& c, const Fields& f) {
    c.m_Code = f.Text(0);
    c.m_Val1 = f.Number(1);
}
template <class S, Label L1, Label L2, Label A, unsigned int O, int M>
void Fill(TwoValueCommand<S, L1, L2, A, O, M>& c, const Fields& f) {
    c.m_Code = f.Text(0);
    c.m_Val1 = f.Number(1);
    c.m_Val2 = f.Number(2);
}
template <class S, Label L1, Label L2, Label L3, Label A>
void Fill(ThreeValueCommand<S, L1, L2, L3, A>& c, const Fields& f) {
    c.m_Code = f.Text(0);
    c.m_Val1 = f.Number(1);
    c.m_Val2 = f.Number(2);
    c.m_Val3 = f.Number(3);
}
template <class S, Label L, unsigned int O>
void Fill(CountCommand<S, L, O>& c, const Fields& f) {
    c.m_Code = f.Text(0);
    c.m_Num = f.Count(1);
}
template <class S, Label LN, Label LV, unsigned int O>
void Fill(CountValueCommand<S, LN, LV, O>& c, const Fields& f) {
    c.m_Code = f.Text(0);
    c.m_Num = f.Count(1);
    c.m_Val1 = f.Number(2);
}
template <class S, Label L, unsigned int O, int M>
void Fill(TextValueCommand<S, L, O, M>& c, const Fields& f) {
    c.m_Code = f.Text(0);
    c.m_Text = f.Text(1);
    c.m_Val1 = f.Number(2);
}
template <class S, Label L, unsigned int O, int M>
void Fill(TextCommand<S, L, O, M>& c, const Fields& f) {
    c.m_Code = f.Text(0);
    c.m_Text = O & kFreeText ? f.FreeText() : f.Text(1);
}
template <class S, Label L1, Label L2, Label A>
void Fill(TextTwoValueCommand<S, L1, L2, A>& c, const Fields& f) {
    c.m_Code = f.Text(0);
    c.m_Text = f.Text(1);
    c.m_Val1 = f.Number(2);
    c.m_Val2 = f.Number(3);
}
template <class S, Label LN, Label LV, unsigned int O>
void Fill(TextCountValueCommand<S, LN, LV, O>& c, const Fields& f) {
    c.m_Code = f.Text(0);
    c.m_Text = f.Text(1);
    c.m_Num = f.Count(2);
    c.m_Val1 = f.Number(3);
}

// A command of class T: the fields its keyword accepts, then its members.
template <class T>
void* ReadCommand(ReadContext& ctx) {
    constexpr unsigned int code = TypeCode<T>::value;
    const FieldRule& rule = kRules[code - CARNET_FIRST_DRAWING_TYPE].rule;
    const size_t n = ctx.WordCount();
    if (n == 0) return ctx.Incomplete();
    if (n < rule.fewest) return rule.quietWhenFewer ? nullptr : ctx.Incomplete();
    if (n > rule.most) return rule.quietWhenMore ? nullptr : ctx.Incomplete();
    T* command = new T;
    Fill(*command, Fields(ctx));
    return ctx.Store(command, code);
}

}  // namespace

#define CARNET_DRAWING_READER(code, cls, ...) \
    void* ReadElement(ReadContext& ctx, ElementTag<cls>) { return ReadCommand<cls>(ctx); }
CARNET_DRAWING_TYPES(CARNET_DRAWING_READER)
#undef CARNET_DRAWING_READER

}  // namespace carnet_reader
