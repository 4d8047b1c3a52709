#!/usr/bin/env python3
"""Writes the seed inputs of every fuzz target into fuzz/corpus/<target>/.

The seeds come from the bundled examples (examples/*.geo) and from the cases
the test suite checks by hand. Each seed is named seed-<first 16 hex digits
of its SHA-1>, so running this again rewrites the same files; inputs that a
fuzz run found worth keeping (regressions, new coverage) sit beside them
under other names and are left alone.

Usage: fuzz/seeds.py   (from anywhere; paths are taken from this file)
"""
import hashlib
import pathlib

HERE = pathlib.Path(__file__).resolve().parent
ROOT = HERE.parent
CORPUS = HERE / "corpus"


def cp(text):
    """Texts are written here as Python strings and stored in code page 1252."""
    return text.encode("cp1252")


def example_files():
    return sorted((ROOT / "examples").glob("*.geo"))


def example_lines():
    lines = []
    for path in example_files():
        lines += [l for l in path.read_bytes().split(b"\n") if l.strip()]
    return lines


# Record lines: the worked examples and edge cases that the loading tests check.
RECORD_LINES = [
    "000012  Station          S1                1.550000  12.3456789",
    "Station\tS1 1.55 12.3456789",
    "Station S1 1.5",
    "Station S1 1.548 -1.0000000",
    "Station S1 1.5 400.0000000 borne***a",
    "Point P1 3",
    "Point P1 1",
    "Point P1 1250.10 3300.25",
    "Point P1 1250 3300",
    "Point P1 0 -12.500 +3.25 100.0 borne***7 A",
    "Point P1 2 12. 1.2.3 12.5a -0.000",
    "Point ABCDEFGHIJKLMNOPQRST 3 1.0 2.0 3.0",
    "Reference R2 54.3210000",
    "Reference R2 1.6 54.321",
    "Reference R1 1.6 0.0 100.1234 -25.0 borne***a",
    "Reference R1 1.6 0.0 100.1234",
    "Mesure M1 1.3 201.2201 100.4150 35.412 arbre***fruitier",
    "NivLectAR B1 1.234 45.60 rep\xe8re",
    "NivLectAR B1 rep\xe8re",
    "NivLectAV B1 1.234 a 45.60",
    "ExcentTan 0.1500",
    "ExcentTan 0.1500 2",
    "ExcentRad -0.25",
    "ExcentVer 0.05",
    "CheminAntenne C1 S1-1 S2-1",
    "CheminAntenne C1 S3-1",
    "CheminEncadre C2 S1-1",
    "Cheminement C3 S1(2) S2-x S3",
    "Appareil 0.0012 0 0.0003 0.0003 0.002 2 Tach\xe9om\xe8tre  TS 06",
    "Appareil 1 2 3 4 5 6",
    "Commentaire   Lev\xe9 du 12 mars   ",
    "Commentaire",
    "Commande Calcul rayonnement %s %n",
    "000001",
    "   \t  ",
    "Inconnu a b c",
]

# Option lines, current and older keywords, right and wrong counts.
OPTION_LINES = [
    "Option_Correc  1  -6.4  -2.4  601250.000  2428760.000  152.000  6366.000",
    "Option_Correc  1  2",
    "Option_Projec  Projection Lambert Zone II",
    "Option_Projec   \"cit\xe9\"  ",
    "Option_Nivell  1  0  0.015",
    "Option_Planim  1  0.005  0.010  0.020  0.015  0.050 0.020 2",
    "Cal_Cor 2 600000.0 2400000.0 150.0 6366.0",
    "Cal_Cor 9 1 2 3 4",
    "Cor_Dist 1.5 0",
    "Tol_Niv 1 0 15",
    "Tol_Poly 1 2",
    "Tol_Pers 10 20 30 40 50 60",
]

# One line per drawing keyword with the usual fields, and the edge cases of
# their word counts.
DRAWING_LINES = [
    "PT_Sans_Ori A", "PT_Sans_Ori A B", "PT_Avec_Ori A", "D\xe9f_Ori_PT A", "Annul_Ori_PT A",
    "D\xe9f_Ori_SY A", "Annul_Ori_SY A", "Sym_sans_Ori ARB 1.500 -0.750", "Sym_Cir_Ray C 2.5",
    "Sym_Cir_Dia C 5.0", "Sym_Cir_3Pt C", "Sym_Orient\xe9 S 1 2", "Sym_Ori_EX S 1.5", "Sym_Car_Dia S",
    "Sym_Fixe_2Pt S", "Sym_2Pts ARB -999999.000", "Sym_2Pt_EX S 1.0", "Sym_2Pt_EY S 1.0",
    "Sym_3Pts_H S 1 2", "Sym_3Pts_D S 1", "Sym_Comp_1 S 1", "Sym_Comp_2 S 2", "Sym_Comp_3 S 1 2",
    "Sym_Entr\xe9" "e E 1 2 3", "Sym_Entr\xe9" "e E 1 2 3 4", "Sym_Aligne ALG", "Sym_Aligne ALG 3",
    "Sym_Aligne ALG 3 4", "Cercle_R CER L12 2.500", "Cercle_D CER L12", "Cercle_3Pts A B C",
    "Cercle_3Pts A", "Carr\xe9_Dia C L", "Carr\xe9_2Pts C L 1.0", "Rect_3Pts_H R L 1 2",
    "Rect_3Pts_D R", "Liaison L 0.5", "Perp_Segment PS", "Perp_Segment PS 1.5",
    "Perp_Segment PS 1 2 3", "Alignement A", "Alignement A 2", "Prol_Segment P 1 2",
    "Inter_Segment I 1 2", "Parall\xe8le PAR 1.500", "Parall\xe8le PAR L 1.5", "Escalier_1 E 12",
    "Escalier_2 E 12 0.8", "Escalier_3 E", "Escalier_4 E", "Escalier_4 E L 3 0.5",
    "Escalier_5 E 0.3", "Passage_Pi\xe9ton P", "Passage_V\xe9lo A B", "Texte_1Pt TXT  un  texte  libre",
    "Texte_Orient\xe9 T", "Texte_1Pt", "Cache_Attrib C", "Ajout_Attrib A attribut", "Attrib_Point A x y",
    "Accro_Pt_Pro A", "Accro_Li_Pro A L", "Accro_Li_Pro A", "Rappel_Point R P1", "Perp_2Pts P",
    "Perp_2Pts P 1.5", "Sym\xe9trique S 2.0", "Inter_Dist I 1 2", "Inter_Dist I 1",
]


def read_line_seeds():
    seeds = []
    lines = [cp(l) for l in RECORD_LINES + OPTION_LINES + DRAWING_LINES] + example_lines()
    # Appended one by one, a few at a time, in place, and with options refused.
    for line in lines:
        seeds.append(b"\x00" + line)
    for i in range(0, len(lines), 8):
        seeds.append(b"\n".join(bytes([(k * 37) % 256]) + l for k, l in enumerate(lines[i:i + 8])))
    seeds.append(b"\n".join(b"\x80" + cp(l) for l in OPTION_LINES))
    seeds.append(b"\n".join(b"\x00" + cp(l) for l in ["CheminAntenne C2 S1-1", "CheminAntenne C2 S9-9"]))
    return seeds


WORKED_EXAMPLE = (
    "000001  Station          S1                1.550000  12.3456789\n"
    "000002  Reference        R1                1.600000   0.0000000 100.1234000 123.456000 borne***a\n"
    "000003  Mesure           M1                         54.3210000\n"
    "000004  Point            P1               1    1000.250000    2000.500000 -999999.000000 arbre\n"
    "000005  Commentaire      Lev\xe9 du 12 mars\n"
)


def load_seeds():
    seeds = [p.read_bytes() for p in example_files()]
    seeds.append(cp(WORKED_EXAMPLE))
    seeds.append(cp(WORKED_EXAMPLE.replace("\n", "\r\n")))
    seeds.append(cp(WORKED_EXAMPLE.rstrip("\n")))
    seeds.append(cp("\n".join(OPTION_LINES) + "\n"))
    seeds.append(cp("\n".join(RECORD_LINES) + "\n"))
    seeds.append(cp("\n".join(DRAWING_LINES) + "\n"))
    seeds.append(cp("CheminEncadre C1 S1-1 S2-1 S3-1 S4-1 S5-1 S6-1 S7-1 S8-1\n"
                    "CheminEncadre C1 S9-1 S10-1\nCheminEncadre C1 S11-1\nStation S1 1.5\n"))
    seeds.append(cp("Point P1 2 12.000\nPoint P1 1.000 2.000\nPoint P1 3 1.000 2.000 13.000\n"
                    "Point P2 1.000 2.000 3.000 a\nPoint P2 2 4.000 b\n"))
    seeds.append(b"Station S1 1.5\x00 2.0\nCommentaire a\x00b\n" + b"x" * 300 + b"\n")
    return seeds


CODE_LINES = [
    "ARB;9;Arbre",
    "P;17;T;1;A;127;3;7;B;G3a;31;G3b;9;3",
    "P;22;T;1;A;127;3;7;B;G3a;31;G3b;9",
    "P;30;T;1;A;127;3;7;B;G3a;31;G3b;9;P1;31;P2;6;4",
    "P;16;T;1;A;127;3;7;B;G3a;31;G3b;9;3;1.5;2.25;-3",
    "P;41;T;1;A;127;3;7;B;G4a;G4b;31;G4c;6;2;1",
    "P;48;T;1;A;127;3;7;B;G4a;12;31;G4c;6;2",
    "P;54;T;1;A;127;3;7;B;G5a;15;7;1.5;G5b;8;2.25;-3.125;G5c",
    "P;23;T;1;A;255;3;7;B;G3a;31;G3b;9;0;1",
    "P;62;T;2;",
    "P;26;T",
    "P;55;T;1;A;1;2",
    "P;52;T;A;1;2;3;B",
    ";;;;;;;;;;;;;;;;;;;;;;;;;;;;;;;;;;;;;;;;",
    "X;-5;T",
    "X;2147483647;T",
    "P;16;T;1;A;3;3;7;B;G3a;31;G3b;9;3;1e308;-1e308;1e-9",
]

SELECTIONS = [
    "1-5;8;10-12", "P5-P1;P7", "A.1-A.10;B.3", "1(2)-5(2)", "S.1(2)-S.5(2)", "P 7;; P008",
    "12(2);15(2)", "A.1-A.*", "*-P5", "P1-Q5", "P1 - P5", "1(1)-5(2)", "A.1-A5", "", ";;",
    "*;*.*;A.*", "10(2)-15(2)", "10-15", "1-5;7", "99999999999-1", "P.1-P.5\nP3",
    "P.1-P.5\nP.3", "*\nA.3", "*.*\nA.3", "10(2)-15(2)\n12(2)", "10-15\n12(1)", "7\nP7",
]

POINT_NUMBERS = [
    "P12", "12", "P", "P007", "A.12", "A.", "A.1.2", "A.12B", "A.*", "A.1*", "12.5", ".12", "*",
    "P*12", "", "P 12", "P-12", "P;12", "A.007", "A.B12", "A.0", "007", "0", "S1(2)", "S1-3",
    "S1(4)", "S1", " S12 (2)", "99999999999", "A.99999999999", "**", ".*",
]

PROFILE = (
    "; r\xe9glages\n[Options_Corrections]\nCorrAuto=1\nProjection = \"Projection Lambert Zone II\"\n"
    "[Options_Tolerances]\r\nTolAngles=0.005\r\nTolAngles=9\r\n[options_tolerances]\nTypeCanevas=2\n"
)
REGISTRY = (
    "[Options_Corrections]\n\"CorrAuto\"=\"1\"\n\"Projection\"=\"Lambert%20II\"\n"
    "[Options_Tolerances]\n\"TolAngles\"=\"0.005\"\n[A\\B\\\\C]\n\"x\"=\"%ZZ%4\"\n"
)


def stores_seeds():
    seeds = []
    names = [("Options_Tolerances", "TolAngles", "0.01"), ("Options_Corrections", "Projection", "  cit\xe9  "),
             ("Nouvelle", "Cl\xe9", "\"q\""), ("options_tolerances ", " TOLANGLES", "7"),
             ("A\\B\\C", "x", "y"), ("", "k", "v"), ("S]", "k=", "v")]
    for choice, contents in ((0, PROFILE), (1, REGISTRY)):
        for section, key, value in names:
            seeds.append(bytes([choice]) + cp(section + "\n" + key + "\n" + value + "\n" + contents))
    return seeds


# Code strings typed in the field: (implied decimals, separator, text); the
# separator is the sign mode "\xb1", "/", ";", "" or any other text.
TYPED_CODES = [
    (2, "\xb1", "ARB+150-075"), (2, "\xb1", "ESC+12+80"), (2, "/", "CER/L12/250"), (2, "\xb1", "-ARB+150"),
    (2, "/", "CER//250"), (2, "/", "/CER/1"), (0, "\xb1", "S+0+000"), (3, "--", "A--1--2--3"),
    (1, "", "TXT"), (2, ";", "T;un;texte;libre"), (-3, "/", "E/3/2/1"), (40, "\xb1", "E+1e308+5"),
    (2, "/", "E4/L/0/80"), (0, "\xb1", "P+-+-"),
]


def drawing_seeds():
    choices = {"\xb1": 0, "/": 1, ";": 2, "": 3}
    seeds = []
    for decimals, sep, text in TYPED_CODES:
        head = bytes([decimals & 0xFF])
        if sep in choices:
            seeds.append(head + bytes([choices[sep]]) + cp(text))
        else:
            seeds.append(head + bytes([4]) + cp(sep + "\n" + text))
    return seeds


def write(target, seeds):
    folder = CORPUS / target
    folder.mkdir(parents=True, exist_ok=True)
    for old in folder.glob("seed-*"):
        old.unlink()
    for seed in seeds:
        (folder / ("seed-" + hashlib.sha1(seed).hexdigest()[:16])).write_bytes(seed)


def main():
    write("read_line", read_line_seeds())
    write("load", load_seeds())
    write("code", [cp(l) for l in CODE_LINES])
    write("selection", [cp(s) for s in SELECTIONS])
    write("matricule", [cp(s) for s in POINT_NUMBERS])
    write("drawing", drawing_seeds())
    write("stores", stores_seeds())


if __name__ == "__main__":
    main()
