#include <carnet/ccarnet.h>

#include <cstring>

#include <carnet/chemin.h>
#include <carnet/lecture.h>
#include <carnet/point.h>
#include <carnet/reference.h>
#include <carnet/station.h>

#include "points/element_access_internal.h"

using carnet_query::PointNumber;

namespace {

// How many elements of the wanted type a named search asks for before it
// reads them. A large book does not fit in the caches and every element of
// the type must be read, so their memory is requested well in advance; the
// type codes alone tell which ones will be needed.
constexpr int kAhead = 16;

// Type codes are examined in blocks of this many, without a branch per code
// (the compiler turns the block into a few vector instructions).
constexpr int kBlock = 16;
alignas(64) constexpr std::uint32_t kBlockBits[kBlock] = {1u << 0,  1u << 1,  1u << 2,  1u << 3, 1u << 4,  1u << 5,
                                                         1u << 6,  1u << 7,  1u << 8,  1u << 9, 1u << 10, 1u << 11,
                                                         1u << 12, 1u << 13, 1u << 14, 1u << 15};

// Bit k set when types[k] is the wanted type, for k from 0 to kBlock - 1.
unsigned int BlockMask(const std::uint32_t* types, std::uint32_t type) {
    std::uint32_t mask = 0;
    for (int k = 0; k < kBlock; ++k) mask |= types[k] == type ? kBlockBits[k] : 0u;
    return mask;
}

// The named search over the elements of one class. A cursor runs ahead
// through the type codes, queues the indexes of the elements of the type and
// prefetches them; the search then reads each queued element in turn. The
// number is read in place through the class itself (no call per element),
// and its length is compared before its bytes.
template <class T>
class NamedScan {
public:
    // The ring is left uninitialised: Queue writes each cell before Dequeue
    // reads it.
    // cppcheck-suppress uninitMemberVar
    NamedScan(const std::uint32_t* types, void* const* elements, unsigned int type, const std::string& wanted)
        : m_types(types), m_elements(elements), m_type(type), m_wanted(wanted.data()), m_size(wanted.size()) {}

    // From first up to last, both included.
    int Forward(int first, int last) {
        int next = first;
        for (;;) {
            while (m_count < kAhead && next <= last) {
                if (last - next + 1 >= kBlock) {
                    for (unsigned int mask = BlockMask(m_types + next, m_type); mask; mask &= mask - 1)
                        Queue(next + __builtin_ctz(mask));
                    next += kBlock;
                } else {
                    if (m_types[next] == m_type) Queue(next);
                    ++next;
                }
            }
            if (m_count == 0) return -1;
            const int i = Dequeue();
            if (Matches(i)) return i;
        }
    }

    // From first down to 0, both included.
    int Backward(int first) {
        int next = first;
        for (;;) {
            while (m_count < kAhead && next >= 0) {
                if (next + 1 >= kBlock) {
                    // The block ends at next; its highest bits come first.
                    const int base = next - kBlock + 1;
                    for (unsigned int mask = BlockMask(m_types + base, m_type); mask;) {
                        const int k = 31 - __builtin_clz(mask);
                        Queue(base + k);
                        mask &= ~(1u << k);
                    }
                    next -= kBlock;
                } else {
                    if (m_types[next] == m_type) Queue(next);
                    --next;
                }
            }
            if (m_count == 0) return -1;
            const int i = Dequeue();
            if (Matches(i)) return i;
        }
    }

private:
    // A block may queue up to kBlock indexes past kAhead.
    static constexpr int kRing = 32;
    static_assert(kRing >= kAhead + kBlock && (kRing & (kRing - 1)) == 0, "a ring of a power of two");

    void Queue(int i) {
        if (const T* e = static_cast<const T*>(m_elements[i])) __builtin_prefetch(&e->Np());
        m_ring[(m_head + m_count++) & (kRing - 1)] = i;
    }

    int Dequeue() {
        const int i = m_ring[m_head];
        m_head = (m_head + 1) & (kRing - 1);
        --m_count;
        return i;
    }

    bool Matches(int i) const {
        const T* e = static_cast<const T*>(m_elements[i]);
        if (!e) return false;
        // Numbers of a run share their beginning: the last byte tells most
        // of them apart before the others are compared.
        const std::string& np = e->Np().str();
        if (np.size() != m_size) return false;
        return m_size == 0 || (np[m_size - 1] == m_wanted[m_size - 1] && std::memcmp(np.data(), m_wanted, m_size) == 0);
    }

    const std::uint32_t* m_types;
    void* const* m_elements;
    unsigned int m_type;
    const char* m_wanted;
    size_t m_size;
    int m_ring[kRing];
    int m_head = 0;
    int m_count = 0;
};

template <class T>
int Scan(const std::uint32_t* types, void* const* elements, const std::string& wanted, int first, int last,
         bool backwards) {
    NamedScan<T> scan(types, elements, TypeCode<T>::value, wanted);
    return backwards ? scan.Backward(first) : scan.Forward(first, last);
}

// A type without a point number matches no name.
int NoNamedScan(const std::uint32_t*, void* const*, const std::string&, int, int, bool) { return -1; }

using ScanFn = int (*)(const std::uint32_t* types, void* const* elements, const std::string& wanted, int first,
                       int last, bool backwards);

template <class T>
constexpr ScanFn ScanOf() {
    if constexpr (carnet_traits::HasNp<T>::value)
        return &Scan<T>;
    else
        return &NoNamedScan;
}

// The named search of each type code, built from the type table.
#define CARNET_SCAN_ROW(code, cls, ...) ScanOf<cls>(),
constexpr ScanFn kScans[] = {CARNET_ELEMENT_TYPES(CARNET_SCAN_ROW)};
#undef CARNET_SCAN_ROW

}  // namespace

int CCarnet::Find(unsigned int type, const CString& np, int first, int end) const {
    const bool backwards = end < 0;
    const int last = backwards ? 0 : (end == 0 ? length() - 1 : end);
    if (backwards ? first < 0 : first > last) return -1;
    assert(backwards ? first < length() : first >= 0 && last < length());
    const std::uint32_t* types = m_Types.GetData();
    void* const* elements = m_Elements.GetData();

    if (np.IsEmpty()) {
        // Every element of the type matches: only the type codes are read.
        if (backwards) {
            for (int i = first; i >= 0; --i)
                if (types[i] == type) return i;
        } else {
            for (int i = first; i <= last; ++i)
                if (types[i] == type) return i;
        }
        return -1;
    }
    if (!CarnetTypeInfo(type)) return -1;
    return kScans[type - CARNET_FIRST_TYPE](types, elements, np.str(), first, last, backwards);
}

CString CCarnet::cmdAt(int i) {
    assert(isValid(i));
    m_CmdText.Empty();
    const unsigned int code = m_Types.GetAt(i);
    const ElementOps* ops = ElementOpsFor(code);
    const void* p = m_Elements.GetAt(i);
    if (ops && ops->keyword && p)
        m_CmdText = ops->keyword(p);
    else if (const char* kw = CarnetKeyword(code))
        m_CmdText = kw;
    return m_CmdText;
}

CString CCarnet::matAt(int i) {
    assert(isValid(i));
    m_MatText.Empty();
    if (const CString* np = PointNumber(m_Elements.GetAt(i), m_Types.GetAt(i))) m_MatText = *np;
    return m_MatText;
}

CString CCarnet::symAt(int i) {
    assert(isValid(i));
    m_SymText.Empty();
    const ElementOps* ops = ElementOpsFor(m_Types.GetAt(i));
    const void* p = m_Elements.GetAt(i);
    if (ops && ops->sy && p) m_SymText = *ops->sy(p);
    return m_SymText;
}

CString CCarnet::parAt(int i) {
    assert(isValid(i));
    m_ParText.Empty();
    const ElementOps* ops = ElementOpsFor(m_Types.GetAt(i));
    void* p = m_Elements.GetAt(i);
    if (ops && ops->params && p) ops->params(p, m_ParText);
    return m_ParText;
}
