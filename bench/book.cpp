#include "book.h"

#include <unistd.h>

#include <cstdint>
#include <cstdlib>
#include <map>
#include <stdexcept>
#include <vector>

#include <carnet/carnet.h>

namespace bench {
namespace {

// A small deterministic generator: the same book on every run and machine.
class Rng {
public:
    explicit Rng(std::uint64_t seed) : m_s(seed) {}
    std::uint64_t Next() {
        std::uint64_t z = (m_s += 0x9E3779B97F4A7C15ull);
        z = (z ^ (z >> 30)) * 0xBF58476D1CE4E5B9ull;
        z = (z ^ (z >> 27)) * 0x94D049BB133111EBull;
        return z ^ (z >> 31);
    }
    double Uniform(double lo, double hi) { return lo + (hi - lo) * static_cast<double>(Next() >> 11) * 0x1.0p-53; }
    int Below(int n) { return static_cast<int>(Next() % static_cast<std::uint64_t>(n)); }
    bool Chance(int percent) { return Below(100) < percent; }

private:
    std::uint64_t m_s;
};

std::string Text(const char* format, int n) {
    CString s;
    s.Format(format, n);
    return s.str();
}

// Codes of the measured points, as surveyors type them; some hold a blank.
const char* const kMeasureCodes[] = {"arbre", "bord", "mur", "haie", "regard", "borne a", "", "poteau EDF",
                                     "bati", "talus"};

class Builder {
public:
    Builder(CCarnet& book, int target) : m_book(book), m_target(target), m_rng(20240601u + target) {}

    void Run() {
        for (int setUp = 0; !Full(); ++setUp) SetUp(setUp);
    }

private:
    bool Full() const { return m_book.length() >= m_target; }
    void Add(void* p, unsigned int type) {
        if (Full())
            m_book.removeElement(p, type);
        else
            m_book.append(p, type);
    }

    // One set-up of the instrument on a station and what was observed from it.
    void SetUp(int s) {
        if (s % 40 == 0) Add(new CAppareil("TCR 1205", 0.0012, 0.0, 0.0003, 0.0003, 0.002, 2.0), 1008);
        if (s % 25 == 0) Add(new CComment(CString(Text("Lev\xE9 du %d mars, secteur ", 1 + s % 28) +
                                                  std::to_string(s / 25))),
                             1000);
        // Now and then the surveyor comes back to a recent station.
        std::string name;
        if (!m_stations.empty() && m_rng.Chance(10))
            name = m_stations[m_stations.size() - 1 - static_cast<size_t>(m_rng.Below(
                                                           static_cast<int>(std::min<size_t>(m_stations.size(), 30))))];
        else {
            // A new station is set up on a point of known coordinates, so that
            // the computation has something to radiate from.
            name = Text("S%d", ++m_lastStation);
            Add(new CPointGen(name.c_str(), m_rng.Uniform(1000.0, 9000.0), m_rng.Uniform(2000.0, 8000.0),
                              m_rng.Uniform(20.0, 180.0), "station"),
                TypeCode<CPointGen>::value);
        }
        m_stations.push_back(name);
        Add(new CStation(name.c_str(), m_rng.Uniform(1.35, 1.75), m_rng.Uniform(0.0, 399.9), s % 3 ? "" : "borne"),
            1001);

        // A backsight and a foresight on the neighbouring stations.
        const std::string back = m_stations.size() > 1 ? m_stations[m_stations.size() - 2] : Text("S%d", 0);
        for (const std::string& target : {back, Text("S%d", m_lastStation + 1)})
            Add(new CReference(target.c_str(), m_rng.Uniform(1.3, 1.8), m_rng.Uniform(0.0, 399.9),
                               m_rng.Uniform(98.0, 102.0), m_rng.Uniform(80.0, 350.0), "ref"),
                1002);

        const int measures = 8 + m_rng.Below(7);
        for (int k = 0; k < measures; ++k) Measure();

        const int points = 1 + (m_rng.Chance(25) ? 1 : 0);
        for (int k = 0; k < points; ++k) {
            const std::string np = Text("P%d", ++m_lastPoint);
            const double x = m_rng.Uniform(1000.0, 9000.0), y = m_rng.Uniform(2000.0, 8000.0);
            CPointGen* p = m_rng.Chance(20) ? new CPointGen(np.c_str(), x, y, "borne")
                                            : new CPointGen(np.c_str(), x, y, m_rng.Uniform(20.0, 180.0), "borne");
            p->m_bXConst = 1;
            p->m_bZConst = p->hasZ();
            Add(p, 1006);
        }

        if (s % 10 == 5) LevellingRun();
        if (s % 20 == 19) Path(s / 20);
        if (s % 60 == 30) Add(new CCommand(CString(Text("CALCUL AUTO %d", s))), 1009);
    }

    void Measure() {
        if (m_rng.Chance(10)) Add(new CExcent(m_rng.Below(2), m_rng.Uniform(0.05, 0.5)), 1010);
        const std::string np = Text("%d", ++m_lastMeasure);
        Add(new CMesure(np.c_str(), m_rng.Uniform(1.3, 2.0), m_rng.Uniform(0.0, 399.9), m_rng.Uniform(95.0, 105.0),
                        m_rng.Uniform(5.0, 150.0), kMeasureCodes[m_rng.Below(10)]),
            1003);
        if (m_rng.Chance(8)) {
            switch (m_rng.Below(3)) {
                case 0: Add(new CPointSansOri(CString("ARB")), 1011); break;
                case 1: Add(new CSymCirCenRay(CString("ARB"), 0.35), 1018); break;
                default: Add(new CLiaison(CString("BOR"), 0.18), 1042); break;
            }
        }
    }

    // A levelling run between two benchmarks, staff readings back and fore.
    void LevellingRun() {
        for (int k = 0; k < 3; ++k) {
            const std::string from = Text("B.%d", ++m_lastBench);
            Add(new CLectAR(from.c_str(), m_rng.Uniform(0.5, 3.5), m_rng.Uniform(10.0, 40.0), "rep\xE8re"), 1004);
            const std::string to = Text("B.%d", m_lastBench + 1);
            Add(new CLectAV(to.c_str(), m_rng.Uniform(0.5, 3.5), m_rng.Uniform(10.0, 40.0), "rep\xE8re"), 1005);
        }
    }

    // A framed traverse through the last twenty stations.
    void Path(int n) {
        CChemin* c = new CChemin(Text("C%d", n).c_str());
        c->setAntenne(0);
        const size_t from = m_stations.size() >= 20 ? m_stations.size() - 20 : 0;
        for (size_t i = from; i < m_stations.size(); ++i) c->add(CString(m_stations[i]), 1);
        Add(c, 1007);
    }

    CCarnet& m_book;
    int m_target;
    Rng m_rng;
    std::vector<std::string> m_stations;
    int m_lastStation = 0, m_lastMeasure = 1000, m_lastPoint = 0, m_lastBench = 0;
};

// " %W.Pf", or the blanks that stand for an absent value.
void Column(std::FILE* f, double v, int width, int precision, int blanks) {
    if (IsUndef(v))
        std::fprintf(f, " %*s", blanks, "");
    else
        std::fprintf(f, " %*.*f", width, precision, v);
}

// The symbol as the line shows it: each blank as "***".
const char* Marked(const CString& sy, std::string& scratch) {
    if (sy.Find(' ') < 0) return sy.GetString();
    scratch.clear();
    for (char c : sy.str()) scratch += c == ' ' ? std::string("***") : std::string(1, c);
    return scratch.c_str();
}

const char* Name(const CString& np) { return np.IsEmpty() ? "????????????????" : np.GetString(); }

// Both levelling readings share one layout; only the keyword differs.
template <class R>
void Reading(std::FILE* f, int n, const char* kw, const R& r, std::string& mark) {
    std::fprintf(f, "%06d  %-16.16s %-16s", n, kw, Name(r.Np()));
    Column(f, r.Lm(), 9, 6, 7);
    Column(f, r.Dh(), 10, 6, 8);
    std::fprintf(f, " %s\n", Marked(r.Sy(), mark));
}

class TempFolder {
public:
    TempFolder() {
        const char* base = std::getenv("TMPDIR");
        std::string pattern = std::string(base && *base ? base : "/tmp") + "/carnet-bench-XXXXXX";
        if (!::mkdtemp(&pattern[0])) throw std::runtime_error("cannot create a temporary folder");
        m_path = pattern;
    }
    ~TempFolder() {
        for (const std::string& f : m_files) ::unlink(f.c_str());
        ::rmdir(m_path.c_str());
    }
    std::string File(const std::string& name) {
        m_files.push_back(m_path + "/" + name);
        return m_files.back();
    }

private:
    std::string m_path;
    std::vector<std::string> m_files;
};

TempFolder& Folder() {
    static TempFolder folder;
    return folder;
}

}  // namespace

void GenerateBook(CCarnet& book, int elements) { Builder(book, elements).Run(); }

void WriteWithFprintf(const CCarnet& book, const std::string& optionLines, std::FILE* f) {
    std::fputs(optionLines.c_str(), f);
    std::string mark;
    const int count = book.length();
    for (int i = 0; i < count; ++i) {
        const int n = i + 1;
        const unsigned int type = book.typAt(i);
        const void* p = book.ptrAt(i);
        const char* kw = CarnetKeyword(type);
        switch (type) {
            case 1000:
                std::fprintf(f, "%06d  %-16.16s %s\n", n, kw, static_cast<const CComment*>(p)->Str().GetString());
                break;
            case 1009:
                std::fprintf(f, "%06d  %-16.16s %s\n", n, kw, static_cast<const CCommand*>(p)->getCmd().GetString());
                break;
            case 1008: {
                const CAppareil* a = static_cast<const CAppareil*>(p);
                // The generator names every instrument alike.
                std::fprintf(f, "%06d  %-16.16s %.6f %.6f %.6f %.6f %.6f %.1f %s\n", n, kw, a->CollVert(),
                             a->CstePrism(), a->SigmaAh(), a->SigmaAv(), a->SigmaDi(), a->SigmaPpm(), "TCR 1205");
                break;
            }
            case 1001: {
                const CStation* s = static_cast<const CStation*>(p);
                std::fprintf(f, "%06d  %-16.16s %-16s %9.6f %11.7f%20s%s\n", n, kw, Name(s->Np()), s->Hi(), s->V0(),
                             "", Marked(s->Sy(), mark));
                break;
            }
            case 1002:
            case 1003: {
                const CReference* r = static_cast<const CReference*>(p);
                std::fprintf(f, "%06d  %-16.16s %-16s", n, kw, Name(r->Np()));
                Column(f, r->Hp(), 9, 6, 8);
                Column(f, r->Ah(), 11, 7, 9);
                Column(f, r->Av(), 11, 7, 9);
                Column(f, r->Di(), 10, 6, 8);
                std::fprintf(f, " %s\n", Marked(r->Sy(), mark));
                break;
            }
            case 1004: Reading(f, n, kw, *static_cast<const CLectAR*>(p), mark); break;
            case 1005: Reading(f, n, kw, *static_cast<const CLectAV*>(p), mark); break;
            case 1006: {
                const CPointGen* q = static_cast<const CPointGen*>(p);
                std::fprintf(f, "%06d  %-16.16s %-16s %1.1d %14.6f %14.6f %12.6f %s\n", n, kw, Name(q->m_Np),
                             q->LockCode(), q->m_X, q->m_Y, q->m_Z, Marked(q->m_Sy, mark));
                break;
            }
            case 1007: {
                const CChemin* c = static_cast<const CChemin*>(p);
                for (int k = 0; k < c->length(); ++k) {
                    if (k % 8 == 0) std::fprintf(f, "%06d  %-16.16s %-16s", n, c->FileKeyword(), Name(c->Np()));
                    std::fprintf(f, " %s-%d", c->matAt(k).GetString(), c->repAt(k));
                    if (k % 8 == 7 || k == c->length() - 1) std::fputc('\n', f);
                }
                break;
            }
            case 1010: {
                const CExcent* e = static_cast<const CExcent*>(p);
                std::fprintf(f, "%06d  %-16.16s%17s%7.4f\n", n, e->FileKeyword(), "", e->getVal());
                break;
            }
            case 1011:
                std::fprintf(f, "%06d  %-16.16s%18s%s\n", n, kw, "",
                             static_cast<const CPointSansOri*>(p)->m_Code.GetString());
                break;
            case 1018: {
                const CSymCirCenRay* c = static_cast<const CSymCirCenRay*>(p);
                std::fprintf(f, "%06d  %-16.16s%18s%s  %.3f\n", n, kw, "", c->m_Code.GetString(), c->m_Val1);
                break;
            }
            case 1042: {
                const CLiaison* c = static_cast<const CLiaison*>(p);
                std::fprintf(f, "%06d  %-16.16s%18s%s  %.3f\n", n, kw, "", c->m_Code.GetString(), c->m_Val1);
                break;
            }
            default: throw std::logic_error("the generator made a type the reference writer does not know");
        }
    }
}

std::string ToMemory(const std::function<void(std::FILE*)>& write) {
    char* buffer = nullptr;
    size_t size = 0;
    std::FILE* f = ::open_memstream(&buffer, &size);
    if (!f) throw std::runtime_error("open_memstream failed");
    write(f);
    std::fclose(f);
    std::string out(buffer, size);
    std::free(buffer);
    return out;
}

std::string OptionLines(CCarnet& book) {
    return ToMemory([&](std::FILE* f) { book.WriteOptions(f); });
}

std::string TempPath(const std::string& name) { return Folder().File(name); }

void WriteFile(const std::string& path, const std::string& data) {
    std::FILE* f = std::fopen(path.c_str(), "wb");
    if (!f || std::fwrite(data.data(), 1, data.size(), f) != data.size() || std::fclose(f) != 0)
        throw std::runtime_error("cannot write " + path);
}

BookFile& Book(int elements) {
    static std::map<int, BookFile> books;
    BookFile& b = books[elements];
    if (b.book) return b;
    b.elements = elements;
    b.book = std::make_unique<CCarnet>();
    GenerateBook(*b.book, elements);
    b.optionLines = OptionLines(*b.book);
    const std::string text = ToMemory([&](std::FILE* f) { b.book->Write(f, 1); });
    // The reference writer must print exactly the library's bytes, or the
    // comparison would be meaningless.
    if (ToMemory([&](std::FILE* f) { WriteWithFprintf(*b.book, b.optionLines, f); }) != text)
        throw std::logic_error("the fprintf reference writer does not give the library's lines");
    b.path = TempPath("book-" + std::to_string(elements) + ".geo");
    WriteFile(b.path, text);
    b.bytes = static_cast<long long>(text.size());
    for (char c : text) b.lines += c == '\n';
    return b;
}

}  // namespace bench
