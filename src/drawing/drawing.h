// The drawing commands of the type table: one class per kind, each
// over the template of its member layout (drawing_layouts.h) with its own
// display labels and rules as template arguments. The type code and keyword
// of each class come from the type table.
#pragma once

#include <carnet/drawing_layouts.h>

// A using-declaration of constructors takes the access of the constructors it
// names, so the classes below need no access specifier.

// ---- L1: m_Code.

class CPointSansOri : public carnet_drawing::CodeCommand<CPointSansOri> {
public:
    using Layout::Layout;
    CPointSansOri() = default;
    CPointSansOri(const CPointSansOri&) = default;
    // Its assignment has always handed back a const reference.
    const CPointSansOri& operator=(const CPointSansOri& other) {
        Layout::operator=(other);
        return *this;
    }
};
class CPointAvecOri : public carnet_drawing::CodeCommand<CPointAvecOri> {
    using Layout::Layout;
};
class COrientationPT : public carnet_drawing::CodeCommand<COrientationPT> {
    using Layout::Layout;
};
class CRAZOrientPT : public carnet_drawing::CodeCommand<CRAZOrientPT> {
    using Layout::Layout;
};
class COrientationSy : public carnet_drawing::CodeCommand<COrientationSy> {
    using Layout::Layout;
};
class CRAZOrientSy : public carnet_drawing::CodeCommand<CRAZOrientSy> {
    using Layout::Layout;
};
class CSymCir3Pt : public carnet_drawing::CodeCommand<CSymCir3Pt> {
    using Layout::Layout;
};
class CSymCarDia : public carnet_drawing::CodeCommand<CSymCarDia> {
    using Layout::Layout;
};
class CSym2Pt11 : public carnet_drawing::CodeCommand<CSym2Pt11> {
    using Layout::Layout;
};
class CPassagePieton : public carnet_drawing::CodeCommand<CPassagePieton> {
    using Layout::Layout;
};
class CPassageVelo : public carnet_drawing::CodeCommand<CPassageVelo> {
    using Layout::Layout;
};
class CCacheAtt : public carnet_drawing::CodeCommand<CCacheAtt> {
    using Layout::Layout;
};
class CAccrProPt : public carnet_drawing::CodeCommand<CAccrProPt> {
    using Layout::Layout;
};

// ---- L2: m_Code, m_Val1. Arguments: label of m_Val1, options, fewest constructor arguments.

class CSymCirCenRay : public carnet_drawing::OneValueCommand<CSymCirCenRay, carnet_drawing::kRayon> {
    using Layout::Layout;
};
class CSymCirCenDia : public carnet_drawing::OneValueCommand<CSymCirCenDia, carnet_drawing::kDiametre> {
    using Layout::Layout;
};
class CSymOria1 : public carnet_drawing::OneValueCommand<CSymOria1, carnet_drawing::kEchX> {
    using Layout::Layout;
};
class CSym2Pt : public carnet_drawing::OneValueCommand<CSym2Pt, carnet_drawing::kEch> {
    using Layout::Layout;
};
class CSym2PtD1 : public carnet_drawing::OneValueCommand<CSym2PtD1, carnet_drawing::kEchX> {
    using Layout::Layout;
};
class CSym2PtD2 : public carnet_drawing::OneValueCommand<CSym2PtD2, carnet_drawing::kEchY> {
    using Layout::Layout;
};
class CSymComp1 : public carnet_drawing::OneValueCommand<CSymComp1, carnet_drawing::kEch> {
    using Layout::Layout;
};
class CSymComp2 : public carnet_drawing::OneValueCommand<CSymComp2, carnet_drawing::kEch1> {
    using Layout::Layout;
};
class CLiaison : public carnet_drawing::OneValueCommand<CLiaison, carnet_drawing::kEpaisseur> {
    using Layout::Layout;
};
class CAlignement : public carnet_drawing::OneValueCommand<CAlignement, carnet_drawing::kDistance, 0, 2> {
    using Layout::Layout;
};
class CEscalier5 : public carnet_drawing::OneValueCommand<CEscalier5, carnet_drawing::kLargeurMarche,
                                                          carnet_drawing::kOmitAbsent | carnet_drawing::kTolerant |
                                                              carnet_drawing::kCodeDropsSign,
                                                          2> {
    using Layout::Layout;
};
class CPerpen2Pts : public carnet_drawing::OneValueCommand<CPerpen2Pts, carnet_drawing::kDeport, 0, 2> {
    using Layout::Layout;
};
class CSymetric : public carnet_drawing::OneValueCommand<CSymetric, carnet_drawing::kDistance, 0, 2> {
    using Layout::Layout;
};

// ---- L3: m_Code, m_Val1, m_Val2. Arguments: labels of m_Val1 and m_Val2, label of m_Val1 shown alone, options,
// fewest constructor arguments.

class CSymSansOri : public carnet_drawing::TwoValueCommand<CSymSansOri, carnet_drawing::kEchX, carnet_drawing::kEchY,
                                                           carnet_drawing::kEchX> {
    using Layout::Layout;
};
class CSymAvecOri : public carnet_drawing::TwoValueCommand<CSymAvecOri, carnet_drawing::kEchX, carnet_drawing::kEchY,
                                                           carnet_drawing::kEch> {
    using Layout::Layout;
};
class CSym3Pth : public carnet_drawing::TwoValueCommand<CSym3Pth, carnet_drawing::kEchX, carnet_drawing::kEchY,
                                                        carnet_drawing::kEch> {
    using Layout::Layout;
};
class CSym3PtD : public carnet_drawing::TwoValueCommand<CSym3PtD, carnet_drawing::kEchX, carnet_drawing::kEchY,
                                                        carnet_drawing::kEch> {
    using Layout::Layout;
};
class CSymComp3 : public carnet_drawing::TwoValueCommand<CSymComp3, carnet_drawing::kEch1, carnet_drawing::kEch2,
                                                         carnet_drawing::kEch2> {
    using Layout::Layout;
};
class CPerpenSegm : public carnet_drawing::TwoValueCommand<CPerpenSegm, carnet_drawing::kDeport,
                                                           carnet_drawing::kProlongement, carnet_drawing::kDeport, 0,
                                                           3> {
    using Layout::Layout;
};
class CProlonSegm : public carnet_drawing::TwoValueCommand<CProlonSegm, carnet_drawing::kProlongement,
                                                           carnet_drawing::kDeport, carnet_drawing::kProlongement, 0,
                                                           3> {
    using Layout::Layout;
};
class CIntersSegm : public carnet_drawing::TwoValueCommand<CIntersSegm, carnet_drawing::kDecalage1,
                                                           carnet_drawing::kDecalage2, carnet_drawing::kDecalage1> {
    using Layout::Layout;
};
class CInterDist : public carnet_drawing::TwoValueCommand<CInterDist, carnet_drawing::kDistance1,
                                                          carnet_drawing::kDistance2, carnet_drawing::kNoLabel,
                                                          carnet_drawing::kNeedsValues, 3> {
    using Layout::Layout;
};

// ---- L4: m_Code, m_Val1, m_Val2, m_Val3. Arguments: the three labels, label of m_Val1 shown alone.

class CSymEntree : public carnet_drawing::ThreeValueCommand<CSymEntree, carnet_drawing::kEchX, carnet_drawing::kEchY,
                                                            carnet_drawing::kSeuil, carnet_drawing::kEch> {
    using Layout::Layout;
};

// ---- L5: m_Code, m_Num. Arguments: label of m_Num, options.

class CSymAligne : public carnet_drawing::CountCommand<CSymAligne, carnet_drawing::kRepetition> {
    using Layout::Layout;
};
class CEscalier1 : public carnet_drawing::CountCommand<CEscalier1, carnet_drawing::kMarches,
                                                       carnet_drawing::kOmitAbsent> {
    using Layout::Layout;
};
class CEscalier3 : public carnet_drawing::CountCommand<CEscalier3, carnet_drawing::kMarches,
                                                       carnet_drawing::kOmitAbsent> {
    using Layout::Layout;
};

// ---- L6: m_Code, m_Num, m_Val1. Arguments: labels of m_Num and m_Val1, options.

class CEscalier2 : public carnet_drawing::CountValueCommand<CEscalier2, carnet_drawing::kMarches,
                                                            carnet_drawing::kLargeur, carnet_drawing::kTolerant> {
    using Layout::Layout;
};

// ---- L7: m_Code, m_Text, m_Val1. Arguments: label of m_Val1, options, fewest constructor arguments.

class CCer1PtR : public carnet_drawing::TextValueCommand<CCer1PtR, carnet_drawing::kRayon,
                                                         carnet_drawing::kOmitAbsent> {
    using Layout::Layout;
};
class CCer1PtD : public carnet_drawing::TextValueCommand<CCer1PtD, carnet_drawing::kDiametre,
                                                         carnet_drawing::kOmitAbsent> {
    using Layout::Layout;
};
class CCarre2Pt : public carnet_drawing::TextValueCommand<CCarre2Pt, carnet_drawing::kCote,
                                                          carnet_drawing::kOmitAbsent> {
    using Layout::Layout;
};
class CParallele : public carnet_drawing::TextValueCommand<CParallele, carnet_drawing::kDecalage,
                                                           carnet_drawing::kNested, 2> {
    using Layout::Layout;
};

// ---- L8: m_Code, m_Text. Arguments: label of m_Text, options, fewest constructor arguments.

class CCer3Pt : public carnet_drawing::TextCommand<CCer3Pt, carnet_drawing::kLiaison, carnet_drawing::kOmitAbsent,
                                                   1> {
    using Layout::Layout;
};
class CCarreDia : public carnet_drawing::TextCommand<CCarreDia, carnet_drawing::kLiaison, carnet_drawing::kOmitAbsent,
                                                     1> {
    using Layout::Layout;
};
class CTexte : public carnet_drawing::TextCommand<CTexte, carnet_drawing::kTexte,
                                                  carnet_drawing::kQuoted | carnet_drawing::kFreeText> {
    using Layout::Layout;
};
class CTexteOrient : public carnet_drawing::TextCommand<CTexteOrient, carnet_drawing::kTexte,
                                                        carnet_drawing::kQuoted | carnet_drawing::kFreeText> {
    using Layout::Layout;
};
class CAddAttSy : public carnet_drawing::TextCommand<CAddAttSy, carnet_drawing::kTexte,
                                                     carnet_drawing::kQuoted | carnet_drawing::kFreeText> {
    using Layout::Layout;
};
class CAddAttPt : public carnet_drawing::TextCommand<CAddAttPt, carnet_drawing::kTexte,
                                                     carnet_drawing::kQuoted | carnet_drawing::kFreeText> {
    using Layout::Layout;
};
class CAccrProLi : public carnet_drawing::TextCommand<CAccrProLi, carnet_drawing::kLiaison,
                                                     carnet_drawing::kNeedsText> {
    using Layout::Layout;
};
class CRappelPoint : public carnet_drawing::TextCommand<CRappelPoint, carnet_drawing::kPoint,
                                                       carnet_drawing::kNeedsText> {
    using Layout::Layout;
};

// ---- L9: m_Code, m_Text, m_Val1, m_Val2. Arguments: labels of m_Val1 and m_Val2, label of m_Val1 shown alone.

class CRec3Pth : public carnet_drawing::TextTwoValueCommand<CRec3Pth, carnet_drawing::kEchX, carnet_drawing::kEchY,
                                                            carnet_drawing::kEchX> {
    using Layout::Layout;
};
class CRec3PtD : public carnet_drawing::TextTwoValueCommand<CRec3PtD, carnet_drawing::kEchX, carnet_drawing::kEchY,
                                                            carnet_drawing::kEchX> {
    using Layout::Layout;
};

// ---- L10: m_Code, m_Text, m_Num, m_Val1. Arguments: labels of m_Num and m_Val1, options.

class CEscalier4 : public carnet_drawing::TextCountValueCommand<CEscalier4, carnet_drawing::kMarches,
                                                                carnet_drawing::kLargeur, carnet_drawing::kTolerant> {
    using Layout::Layout;
};
