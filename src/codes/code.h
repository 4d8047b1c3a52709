// One entry of a code table: a survey code, its kind, and the settings that
// the kind selects, read from and written to one ";"-separated table line.
#pragma once

#include <carnet/carray.h>
#include <carnet/cstring.h>

class CCode {
public:
    // The table format that getTableLine writes; initCode reads 0 to this.
    static constexpr int CurrentVersion = 5;

    // Kind lists: the first cell holds the number of cells in use, itself
    // included, then the kinds (see isPresent).
    static constexpr int AutoRepeatKinds[] = {
        38, 10, 11, 16, 17, 18, 19, 20, 21, 22, 23, 24, 25, 26, 27, 28, 29, 30, 31, 32, 33, 34, 35, 36, 37,
        38, 39, 40, 41, 47, 48, 49, 50, 51, 52, 53, 54, 55};
    static constexpr int Group2Kinds[] = {
        46, 10, 11, 12, 13, 14, 15, 16, 17, 18, 19, 20, 21, 22, 23, 24, 25, 26, 27, 28, 29, 30, 31, 32,
        33, 34, 35, 36, 37, 38, 39, 40, 41, 46, 47, 48, 49, 50, 51, 52, 53, 54, 55, 56, 57, 58};
    static constexpr int Group2Bit67Kinds[] = {
        45, 10, 12, 13, 14, 15, 16, 17, 18, 19, 20, 21, 22, 23, 24, 25, 26, 27, 28, 29, 30, 31, 32,
        33, 34, 35, 36, 37, 38, 39, 40, 41, 46, 47, 48, 49, 50, 51, 52, 53, 54, 55, 56, 57, 58};
    static constexpr int Group2Bit45Kinds[] = {
        28, 17, 18, 19, 22, 23, 24, 25, 26, 27, 28, 30, 31, 34, 35, 36, 37, 38, 39, 40,
        47, 48, 49, 50, 51, 52, 53, 55};
    static constexpr int Group3Kinds[] = {
        19, 16, 17, 18, 19, 20, 21, 22, 23, 24, 25, 26, 27, 28, 29, 30, 31, 32, 33};
    static constexpr int Group3Bit3Kinds[] = {9, 16, 17, 18, 19, 29, 30, 31, 33};
    static constexpr int Group3Bit1Kinds[] = {6, 22, 24, 26, 27, 28};
    static constexpr int Group3bKinds[] = {5, 29, 30, 31, 32};
    static constexpr int Group4Kinds[] = {10, 41, 46, 47, 48, 49, 50, 51, 52, 53};
    static constexpr int Group4NumberKinds[] = {8, 47, 48, 49, 50, 51, 52, 53};
    static constexpr int Group5Kinds[] = {6, 54, 55, 56, 57, 58};
    static constexpr int DecimalsKinds[] = {
        32, 16, 17, 18, 20, 21, 24, 25, 26, 27, 28, 29, 30, 31, 32, 34, 35,
        38, 39, 40, 41, 42, 43, 44, 45, 46, 48, 50, 51, 62, 63, 64};
    static constexpr int OptionKinds[] = {
        22, 20, 21, 23, 24, 25, 26, 27, 28, 32, 38, 39, 40, 41, 42, 43, 44, 45, 46, 62, 63, 64};

    CString m_Code;
    int m_Kind = 9;
    CString m_Text;
    bool m_bAutoRepeat = false;
    CStringArray m_Texts;  // not part of the line; carried by assignment only

    // Group-2 block. m_G3Bit2 belongs to it although group 3 sets it.
    CString m_G2Text1;
    int m_G2Extra = 0;
    CString m_G2Text2;
    bool m_G2Bit6 = false;
    bool m_G2Bit7 = false;
    bool m_G2Bit0 = false;
    bool m_G2Bit1 = false;
    bool m_G2Bit2 = false;
    bool m_G2Bit3 = false;
    bool m_G2Bit5 = false;
    bool m_G2Bit4 = false;
    bool m_G3Bit2 = false;
    int m_G2Count = 0;

    // Group-3 block.
    bool m_G3Bit3 = false;
    CString m_G3Text1;
    bool m_G3Bit0 = false;
    bool m_G3Bit4 = false;
    bool m_G3Bit1 = false;
    CString m_G3Text2;
    int m_G3Value = 0;

    // Group-3b block, the same shape as group 3 (m_G3bBit1 is never read).
    bool m_G3bBit3 = false;
    CString m_G3bText1;
    bool m_G3bBit0 = false;
    bool m_G3bBit4 = false;
    bool m_G3bBit1 = false;
    CString m_G3bText2;
    int m_G3bValue = 0;

    // Group-4 block.
    CString m_G4Text1;
    CString m_G4Text2;
    bool m_G4Bit0 = false;
    bool m_G4Bit2 = false;
    bool m_G4Bit1 = false;
    bool m_G4Bit3 = false;
    bool m_G4Bit4 = false;
    CString m_G4Text3;
    int m_G4Value = 0;
    int m_G4Number = 0;

    // Group-5 block; its flags are ints holding 0 or 1.
    CString m_G5Text1;
    int m_G5Bit0 = 0;
    int m_G5Bit1 = 0;
    int m_G5Bit3 = 0;
    int m_G5Int1 = 0;
    CString m_G5Text2;
    int m_G5Int2 = 0;
    double m_G5Val1 = 0.0;
    double m_G5Val2 = 0.0;
    double m_G5Val3 = 0.0;
    CString m_G5Text3;
    int m_G5Bit2 = 0;

    bool m_bOption = false;  // group 7
    int m_Decimals = 0;      // group 6: implied decimals of the numbers typed after the code
    double m_Real1 = 0.0;    // group 8
    double m_Real2 = 0.0;
    double m_Real3 = 0.0;

    CCode() = default;
    CCode(const CCode&) = default;
    ~CCode() = default;

    // Both copy every member (the compiler's member-wise copy, so that a new
    // member cannot be forgotten); a null pointer changes nothing.
    CCode& operator=(const CCode& other) = default;
    void operator=(const CCode* other);

    // Parses one table line of format `version`; false only for a null or
    // empty line. Members of groups the kind does not select keep their values.
    bool initCode(const char* line, int version);
    // The entry as a line of the current format, replacing `out`; always true.
    bool getTableLine(CString& out) const;

    bool isAutoRepeat() const { return m_bAutoRepeat; }

    static bool isPresent(const int* list, int kind);
    static bool isUnit(const char* s);
    static bool isBool(const char* s);

    // The extension of the file name in `path`, dot included ("" when none).
    CString getExt(const char* path) const;
};
