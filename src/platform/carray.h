// Growable arrays standing in for the framework's array classes.
#pragma once

#include <cassert>
#include <cstdint>
#include <vector>

#include <carnet/cstring.h>

template <class T>
class CArrayT {
public:
    CArrayT() = default;

    int GetSize() const { return static_cast<int>(m_v.size()); }
    int GetCount() const { return GetSize(); }
    int GetUpperBound() const { return GetSize() - 1; }
    bool IsEmpty() const { return m_v.empty(); }
    // growBy is a capacity hint only.
    void SetSize(int n, int growBy = -1) {
        if (growBy > 0 && m_v.capacity() < static_cast<size_t>(n > 0 ? n : 0) + static_cast<size_t>(growBy))
            m_v.reserve(static_cast<size_t>(n > 0 ? n : 0) + static_cast<size_t>(growBy));
        m_v.resize(n > 0 ? static_cast<size_t>(n) : 0, T());
    }
    const T& GetAt(int i) const { assert(i >= 0 && i < GetSize()); return m_v[static_cast<size_t>(i)]; }
    void SetAt(int i, const T& v) { assert(i >= 0 && i < GetSize()); m_v[static_cast<size_t>(i)] = v; }
    T& ElementAt(int i) { assert(i >= 0 && i < GetSize()); return m_v[static_cast<size_t>(i)]; }
    const T& operator[](int i) const { return GetAt(i); }
    T& operator[](int i) { return ElementAt(i); }
    const T* GetData() const { return m_v.data(); }
    T* GetData() { return m_v.data(); }
    int Add(const T& v) {
        m_v.push_back(v);
        return GetSize() - 1;
    }
    // A position beyond the end first extends the array with default values.
    void InsertAt(int i, const T& v, int count = 1) {
        assert(i >= 0);
        if (count <= 0) return;
        if (i > GetSize()) m_v.resize(static_cast<size_t>(i), T());
        m_v.insert(m_v.begin() + i, static_cast<size_t>(count), v);
    }
    void RemoveAt(int i, int count = 1) {
        assert(i >= 0 && count >= 0 && i + count <= GetSize());
        m_v.erase(m_v.begin() + i, m_v.begin() + i + count);
    }
    void RemoveAll() { m_v.clear(); }
    void Reserve(int n) { m_v.reserve(n > 0 ? static_cast<size_t>(n) : 0); }

private:
    std::vector<T> m_v;
};

class CStringArray : public CArrayT<CString> {};
using CPtrArray = CArrayT<void*>;
using CDWordArray = CArrayT<std::uint32_t>;
using CUIntArray = CArrayT<unsigned int>;
using CIntArray = CArrayT<int>;
