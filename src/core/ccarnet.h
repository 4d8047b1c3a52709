// The field book: an ordered list of typed elements that it owns.
#pragma once

#include <cassert>
#include <cstdint>
#include <cstdio>
#include <functional>
#include <string_view>

#include <carnet/carray.h>
#include <carnet/cstring.h>
#include <carnet/element_types.h>
#include <carnet/fileio.h>
#include <carnet/txtwnd.h>

class CWnd;

class CCarnet {
public:
    // Data that host code reads or sets directly.
    CString m_FileName;
    CString m_ParamFile;
    // The file as Load read it, unknown otherwise: Save refuses to replace
    // the book's own file when someone else has written it since.
    CarnetFileState m_FileState;

protected:
    CPtrArray m_Elements;
    CDWordArray m_Types;
    CString m_CmdText;
    CString m_MatText;
    CString m_ParText;
    CString m_SymText;

    static int m_DeciXY;
    static int m_DeciZ;
    static int m_DeciAng;

public:
    // ---- Container ----
    explicit CCarnet(int nSize = 0, int nGrowBy = 8);
    ~CCarnet();
    CCarnet(const CCarnet&) = delete;

    int length() const { return m_Elements.GetSize(); }
    int isEmpty() const { return length() < 1 ? 1 : 0; }
    void* ptrAt(int i) const { assert(isValid(i)); return m_Elements.GetAt(i); }
    unsigned int typAt(int i) const { assert(isValid(i)); return m_Types.GetAt(i); }
    void setPtrAt(int i, void* p) { assert(isValid(i)); m_Elements.SetAt(i, p); }
    void setTypAt(int i, unsigned int t) { assert(isValid(i)); m_Types.SetAt(i, t); }
    const void* ptrFirst() const { return ptrAt(0); }
    unsigned int typFirst() const { return typAt(0); }
    const void* ptrLast() const { return ptrAt(length() - 1); }
    unsigned int typLast() const { return typAt(length() - 1); }
    void*& ptrLast() { assert(!isEmpty()); return m_Elements.ElementAt(length() - 1); }
    unsigned int& typLast() { assert(!isEmpty()); return m_Types.ElementAt(length() - 1); }

    int append(void* p, unsigned int t);
    CCarnet& insertAt(int i, void* p, unsigned int t);
    CCarnet& removeAt(int i, int bDelete);
    CCarnet& removeFirst(int bDelete) { return removeAt(0, bDelete); }
    CCarnet& removeLast(int bDelete) { return removeAt(length() - 1, bDelete); }
    CCarnet& removeAll(int bDelete);
    void removeElement(void* p, unsigned int t);
    void swapElements(int i, int j);

    void printAt(CNorvexTxtWnd* w, int i, int n);
    void writeAt(int i, std::FILE* f, int n);
    void Print(CNorvexTxtWnd* w, int n);

    static void setDeciXY(int n) { m_DeciXY = n; }
    static void setDeciZ(int n) { m_DeciZ = n; }
    static void setDeciAng(int n) { m_DeciAng = n; }
    static int DeciXY() { return m_DeciXY; }
    static int DeciZ() { return m_DeciZ; }
    static int DeciAng() { return m_DeciAng; }
    static double formatXY(double v);
    static double formatZ(double v);
    static double formatAng(double v);

    // ---- Element queries ----
    int Find(unsigned int type, const CString& np, int first, int end) const;
    CString cmdAt(int i);
    CString matAt(int i);
    CString symAt(int i);
    CString parAt(int i);
    // Typed values of the element at an index; UNDEF_VALUE for another type.
    double xAt(int i) const;
    double yAt(int i) const;
    double zAt(int i) const;
    double hiAt(int i) const;
    double v0At(int i) const;
    double hpAt(int i) const;
    double ahAt(int i) const;
    double avAt(int i) const;
    double diAt(int i) const;
    double lmAt(int i) const;
    double dhAt(int i) const;
    // Eccentric of the observation at i, searched above index `lower`.
    double findER(int i, int lower) const;
    double findET(int i, int lower) const;
    double findEV(int i, int lower) const;
    // The first point (a CPointGen) of a number, or of the element's number.
    int hasPnt(const CString& np) const;
    int hasPnt(int i) const;
    int hasPnt(const CString& np, double& x, double& y, double& z) const;
    int hasPnt(int i, double& x, double& y, double& z) const;
    int hasXYZ(const CString& np) const;
    int hasXYZ(int i) const;
    int hasXYZ(const CString& np, double& x, double& y, double& z) const;
    int hasXYZ(int i, double& x, double& y, double& z) const;
    int hasXY(const CString& np) const;
    int hasXY(int i) const;
    int hasXY(const CString& np, double& x, double& y) const;
    int hasXY(int i, double& x, double& y) const;
    int hasZ(const CString& np) const;
    int hasZ(int i) const;
    int hasZ(const CString& np, double& z) const;
    int hasZ(int i, double& z) const;
    double zFor(const CString& np) const;
    double zFor(int i) const;
    CAppareil* findAppAt(int i) const;
    int findRepAt(int i, CString& np) const;
    int isObsAltiAt(int i, int bStation) const;

    // ---- Point numbers and selection strings ----
    static void extrMat(const CString& np, CString& radical, int& number, int& dotted, int dropDots);
    static void extrMat(const CString& np, CString& radical, int& number);
    static void formMat(const CString& radical, int number, int& dotted, CString& out);
    static void formMat(CString& np, CString& radical, int& number, int& dotted, int keepStars);
    static void formMat(const CString& np, CString& out);
    static void formMat(CString& np);
    static void extrStaRep(const CString& ref, CString& radical, int& number, int& rep, int& dotted, int dropDots);
    int extrStaRep(const CString& ref, CString& station, int& rep) const;
    int findStaRep(const CString& station, int rep) const;
    int findMat(const CString& np);
    int lastInd(const CString& radical);
    CString lastMat(unsigned int type, int& index);
    CString lastMat(unsigned int type);
    CString nextMat(const CString& np);
    CString nextMat(unsigned int type, int& index);
    CString nextMat(unsigned int type);
    static int IsValidSelString(CString& sel);
    static int IsPointInSel(const CString& np, const CString& sel);
    static int GetSelStringCount(const CString& sel);
    static void DDX_Mat(CWnd* dlg, int id, CString& np);
    int DDV_Mat(CWnd* parent, int index, const CString& np);

    // ---- Loading and validation ----
    int Load(CNorvexTxtWnd* pWnd, const CString& fileName, int bAppend, CWnd* pParent);
    int Load(CNorvexTxtWnd* pWnd, const CString& fileName, const CString& paramFile, int bAppend, CWnd* pParent);
    // Loads bytes held in memory as Load loads a file's (same reader, rules
    // and messages), with the options going to paramFile; m_FileName is
    // unchanged. `released`, when given, is told every few megabytes the
    // offset before which the bytes are no longer needed. 1 when the book
    // then holds an element, else 0.
    int LoadBytes(CNorvexTxtWnd* pWnd, std::string_view bytes, const CString& paramFile, int bAppend,
                  const std::function<void(size_t)>& released = nullptr);
    int FileOpen(const CString& initialName, CWnd* pParent);
    void* ReadLine(CNorvexTxtWnd* pWnd, CString line, int& index, int bAppend);
    CStation* validStation(CNorvexTxtWnd* pWnd, CStation* p, int line);
    CReference* validReference(CNorvexTxtWnd* pWnd, CReference* p, int line);
    CMesure* validMesure(CNorvexTxtWnd* pWnd, CMesure* p, int line);
    CPointGen* validPoint(CNorvexTxtWnd* pWnd, CPointGen* p, int line);
    void validComment(const char* fmt, const CString& a, const CString& b);

    // ---- Comment and object conversion ----
    void changeObjectIntoComment(CNorvexTxtWnd* pWnd, int i);
    void changeCommentIntoObject(CNorvexTxtWnd* pWnd, int i);

    // ---- Saving, backup and options ----
    int Save(const CString& fileName, CWnd* pParent, bool bAppend);
    int FileSave(const CString& initialName);
    void Write(std::FILE* f, int n);
    void Write(std::FILE* f, const CString& paramFile, int n);
    void BackUp();
    // BackUp that says how it went: 1 when the copy was made, 0 when there
    // was no file to copy, -1 when it failed (error, when given, receives
    // the errno: ELOOP, EISDIR or EINVAL for a backup name that is a link, a
    // folder or not a regular file, EEXIST when it is the book's own name).
    int TryBackUp(int* error = nullptr);
    // The backup's name: m_FileName with the last three characters of its
    // file name made "sbk", or ".sbk" added to a file name of fewer.
    CString BackUpName() const;
    void WriteOptions(std::FILE* f);

    // ---- Projection lookup and face reduction ----
    void Projection(const CString& fileName, CString& name);
    // The projection that the lines of a book held in memory declare, as
    // Projection finds it in a file; empty when none.
    static void ProjectionOfBytes(std::string_view bytes, CString& name);
    static double avCD(double av);
    static double ahCD(double ah, double av);
    static int setCD(double& ah, double& av);

    // ---- Element copy and assignment ----
    void* copyElement(int from, int to);
    const CCarnet& operator=(const CCarnet& other);

protected:
    int isValid(int i) const { return i >= 0 && i < length() ? 1 : 0; }
};
