// The drawing-command branch of the line reader (types 1011 to 1065): the
// number of fields each keyword accepts, and the fields given to the
// command's members in their order.
#include <cassert>
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

// In type order, from 1011.
constexpr FieldRule kRules[] = {
    kAtLeast1,                    // 1011 PT_Sans_Ori
    kAtLeast1,                    // 1012 PT_Avec_Ori
    kAtLeast1,                    // 1013 Def_Ori_PT
    kAtLeast1,                    // 1014 Annul_Ori_PT
    kAtLeast1,                    // 1015 Def_Ori_SY
    kAtLeast1,                    // 1016 Annul_Ori_SY
    kUpTo3,                       // 1017 Sym_sans_Ori
    kUpTo2,                       // 1018 Sym_Cir_Ray
    kUpTo2,                       // 1019 Sym_Cir_Dia
    kAtLeast1,                    // 1020 Sym_Cir_3Pt
    kUpTo3,                       // 1021 Sym_Oriente
    kUpTo2,                       // 1022 Sym_Ori_EX
    kAtLeast1,                    // 1023 Sym_Car_Dia
    kAtLeast1,                    // 1024 Sym_Fixe_2Pt
    kUpTo2,                       // 1025 Sym_2Pts
    kUpTo2,                       // 1026 Sym_2Pt_EX
    kUpTo2,                       // 1027 Sym_2Pt_EY
    kUpTo3,                       // 1028 Sym_3Pts_H
    kUpTo3,                       // 1029 Sym_3Pts_D
    kUpTo2,                       // 1030 Sym_Comp_1
    kUpTo2,                       // 1031 Sym_Comp_2
    kUpTo3,                       // 1032 Sym_Comp_3
    kUpTo4,                       // 1033 Sym_Entree
    {2, 2, false, false},         // 1034 Sym_Aligne: the count is required
    kUpTo3,                       // 1035 Cercle_R
    kUpTo3,                       // 1036 Cercle_D
    {1, 2, false, true},          // 1037 Cercle_3Pts
    {1, 2, false, true},          // 1038 Carre_Dia
    kUpTo3,                       // 1039 Carre_2Pts
    kUpTo4,                       // 1040 Rect_3Pts_H
    kUpTo4,                       // 1041 Rect_3Pts_D
    kUpTo2,                       // 1042 Liaison
    kNeeds2Quiet,                 // 1043 Perp_Segment
    kUpTo2,                       // 1044 Alignement
    kNeeds2Quiet,                 // 1045 Prol_Segment
    kUpTo3,                       // 1046 Inter_Segment
    kNeeds2Quiet,                 // 1047 Parallele
    kUpTo2,                       // 1048 Escalier_1
    kUpTo3,                       // 1049 Escalier_2
    kUpTo2,                       // 1050 Escalier_3
    kUpTo4,                       // 1051 Escalier_4
    kUpTo2,                       // 1052 Escalier_5
    {1, 1, false, false},         // 1053 Passage_Pieton
    {1, 1, false, false},         // 1054 Passage_Velo
    kAtLeast1,                    // 1055 Texte_1Pt (free text)
    kAtLeast1,                    // 1056 Texte_Oriente (free text)
    kAtLeast1,                    // 1057 Cache_Attrib
    kAtLeast1,                    // 1058 Ajout_Attrib (free text)
    kAtLeast1,                    // 1059 Attrib_Point (free text)
    kAtLeast1,                    // 1060 Accro_Pt_Pro
    {2, kNoLimit, false, false},  // 1061 Accro_Li_Pro
    {2, kNoLimit, false, false},  // 1062 Rappel_Point
    kAtLeast1,                    // 1063 Perp_2Pts
    kAtLeast1,                    // 1064 Symetrique
    {3, kNoLimit, false, false},  // 1065 Inter_Dist
};
static_assert(sizeof kRules / sizeof kRules[0] == CARNET_LAST_TYPE - CARNET_FIRST_DRAWING_TYPE + 1,
              "one rule per drawing command");

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

template <unsigned int kCode, class T>
void* Make(const Fields& f) {
    if constexpr (kCode >= CARNET_FIRST_DRAWING_TYPE) {
        T* command = new T;
        Fill(*command, f);
        return command;
    } else {
        (void)f;
        return nullptr;
    }
}

void* MakeCommand(unsigned int code, const Fields& f) {
    switch (code) {
#define CARNET_MAKE_COMMAND(type, cls, ...) \
    case type: return Make<type, cls>(f);
        CARNET_ELEMENT_TYPES(CARNET_MAKE_COMMAND)
#undef CARNET_MAKE_COMMAND
        default: return nullptr;
    }
}

}  // namespace

void* ReadDrawingLine(ReadContext& ctx, unsigned int code) {
    assert(code >= CARNET_FIRST_DRAWING_TYPE && code <= CARNET_LAST_TYPE);
    const FieldRule& rule = kRules[code - CARNET_FIRST_DRAWING_TYPE];
    const size_t n = ctx.WordCount();
    if (n == 0) return ctx.Incomplete();
    if (n < rule.fewest) return rule.quietWhenFewer ? nullptr : ctx.Incomplete();
    if (n > rule.most) return rule.quietWhenMore ? nullptr : ctx.Incomplete();
    void* command = MakeCommand(code, Fields(ctx));
    return command ? ctx.Store(command, code) : nullptr;
}

}  // namespace carnet_reader
