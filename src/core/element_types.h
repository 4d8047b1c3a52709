// The one table of element types: type code, class and the keyword(s) that
// open the element's line in the field-book file. Everything that depends on
// the type of an element (dispatch, reading, lookups, cmdAt) is built from
// it; no other file spells a type code.
#pragma once

#include <type_traits>

// X(code, class, keyword[, more keywords]) for the 66 element types, in code
// order: the survey records, then the drawing commands. Accented keywords are
// code-page-1252 bytes; a literal is split after each \xNN escape so that the
// next letter is not read as a hex digit.
#define CARNET_RECORD_TYPES(X)                                                \
    X(1000, CComment, "Commentaire")                                          \
    X(1001, CStation, "Station")                                              \
    X(1002, CReference, "Reference")                                          \
    X(1003, CMesure, "Mesure")                                                \
    X(1004, CLectAR, "NivLectAR")                                             \
    X(1005, CLectAV, "NivLectAV")                                             \
    X(1006, CPointGen, "Point")                                               \
    X(1007, CChemin, "CheminAntenne", "CheminEncadre", "Cheminement")         \
    X(1008, CAppareil, "Appareil")                                            \
    X(1009, CCommand, "Commande")                                             \
    X(1010, CExcent, "ExcentRad", "ExcentTan", "ExcentVer")

#define CARNET_DRAWING_TYPES(X)                                               \
    X(1011, CPointSansOri, "PT_Sans_Ori")                                     \
    X(1012, CPointAvecOri, "PT_Avec_Ori")                                     \
    X(1013, COrientationPT, "D\xE9" "f_Ori_PT")                               \
    X(1014, CRAZOrientPT, "Annul_Ori_PT")                                     \
    X(1015, COrientationSy, "D\xE9" "f_Ori_SY")                               \
    X(1016, CRAZOrientSy, "Annul_Ori_SY")                                     \
    X(1017, CSymSansOri, "Sym_sans_Ori")                                      \
    X(1018, CSymCirCenRay, "Sym_Cir_Ray")                                     \
    X(1019, CSymCirCenDia, "Sym_Cir_Dia")                                     \
    X(1020, CSymCir3Pt, "Sym_Cir_3Pt")                                        \
    X(1021, CSymAvecOri, "Sym_Orient\xE9")                                    \
    X(1022, CSymOria1, "Sym_Ori_EX")                                          \
    X(1023, CSymCarDia, "Sym_Car_Dia")                                        \
    X(1024, CSym2Pt11, "Sym_Fixe_2Pt")                                        \
    X(1025, CSym2Pt, "Sym_2Pts")                                              \
    X(1026, CSym2PtD1, "Sym_2Pt_EX")                                          \
    X(1027, CSym2PtD2, "Sym_2Pt_EY")                                          \
    X(1028, CSym3Pth, "Sym_3Pts_H")                                           \
    X(1029, CSym3PtD, "Sym_3Pts_D")                                           \
    X(1030, CSymComp1, "Sym_Comp_1")                                          \
    X(1031, CSymComp2, "Sym_Comp_2")                                          \
    X(1032, CSymComp3, "Sym_Comp_3")                                          \
    X(1033, CSymEntree, "Sym_Entr\xE9" "e")                                   \
    X(1034, CSymAligne, "Sym_Aligne")                                         \
    X(1035, CCer1PtR, "Cercle_R")                                             \
    X(1036, CCer1PtD, "Cercle_D")                                             \
    X(1037, CCer3Pt, "Cercle_3Pts")                                           \
    X(1038, CCarreDia, "Carr\xE9" "_Dia")                                     \
    X(1039, CCarre2Pt, "Carr\xE9" "_2Pts")                                    \
    X(1040, CRec3Pth, "Rect_3Pts_H")                                          \
    X(1041, CRec3PtD, "Rect_3Pts_D")                                          \
    X(1042, CLiaison, "Liaison")                                              \
    X(1043, CPerpenSegm, "Perp_Segment")                                      \
    X(1044, CAlignement, "Alignement")                                        \
    X(1045, CProlonSegm, "Prol_Segment")                                      \
    X(1046, CIntersSegm, "Inter_Segment")                                     \
    X(1047, CParallele, "Parall\xE8" "le")                                    \
    X(1048, CEscalier1, "Escalier_1")                                         \
    X(1049, CEscalier2, "Escalier_2")                                         \
    X(1050, CEscalier3, "Escalier_3")                                         \
    X(1051, CEscalier4, "Escalier_4")                                         \
    X(1052, CEscalier5, "Escalier_5")                                         \
    X(1053, CPassagePieton, "Passage_Pi\xE9" "ton")                           \
    X(1054, CPassageVelo, "Passage_V\xE9" "lo")                               \
    X(1055, CTexte, "Texte_1Pt")                                              \
    X(1056, CTexteOrient, "Texte_Orient\xE9")                                 \
    X(1057, CCacheAtt, "Cache_Attrib")                                        \
    X(1058, CAddAttSy, "Ajout_Attrib")                                        \
    X(1059, CAddAttPt, "Attrib_Point")                                        \
    X(1060, CAccrProPt, "Accro_Pt_Pro")                                       \
    X(1061, CAccrProLi, "Accro_Li_Pro")                                       \
    X(1062, CRappelPoint, "Rappel_Point")                                     \
    X(1063, CPerpen2Pts, "Perp_2Pts")                                         \
    X(1064, CSymetric, "Sym\xE9" "trique")                                    \
    X(1065, CInterDist, "Inter_Dist")

#define CARNET_ELEMENT_TYPES(X) CARNET_RECORD_TYPES(X) CARNET_DRAWING_TYPES(X)

#define CARNET_DECLARE_ELEMENT_CLASS(code, cls, ...) class cls;
CARNET_ELEMENT_TYPES(CARNET_DECLARE_ELEMENT_CLASS)
#undef CARNET_DECLARE_ELEMENT_CLASS

// The type code of an element class: TypeCode<CPointGen>::value.
template <class T>
struct TypeCode;
#define CARNET_TYPE_CODE(code, cls, ...) \
    template <>                          \
    struct TypeCode<cls> : std::integral_constant<unsigned int, code> {};
CARNET_ELEMENT_TYPES(CARNET_TYPE_CODE)
#undef CARNET_TYPE_CODE

// Whether an element class is a drawing command (the second part of the table).
template <class T>
struct IsDrawingCommand : std::false_type {};
#define CARNET_IS_DRAWING(code, cls, ...) \
    template <>                           \
    struct IsDrawingCommand<cls> : std::true_type {};
CARNET_DRAWING_TYPES(CARNET_IS_DRAWING)
#undef CARNET_IS_DRAWING

// The bounds of the table, in code order.
constexpr unsigned int CARNET_FIRST_TYPE = TypeCode<CComment>::value;
constexpr unsigned int CARNET_LAST_TYPE = TypeCode<CInterDist>::value;
constexpr unsigned int CARNET_FIRST_DRAWING_TYPE = TypeCode<CPointSansOri>::value;
// Not a type: asks lastMat and nextMat for the elements of every type.
constexpr unsigned int CARNET_ANY_TYPE = 999;

// One row of the table.
struct CarnetElementType {
    unsigned int code;
    const char* className;
    const char* keywords[3];  // the first is the one written; unused slots are null
};

// The row of a type code, or null outside 1000 .. 1065.
const CarnetElementType* CarnetTypeInfo(unsigned int code);
// The written keyword of a type code ("CheminAntenne" and "ExcentRad" for the
// types whose keyword depends on the record), or null outside the table.
const char* CarnetKeyword(unsigned int code);
