// AEArray<T>: the runtime's growable array. Holds its elements by value; copying it copies them. No locking: one thread
// at a time, or several that only read. A position outside the array is an assertion failure.
#pragma once

#include <cassert>
#include <cstddef>
#include <type_traits>
#include <utility>
#include <vector>

template <class T>
class AEArray {
    static_assert(!std::is_same<T, bool>::value, "elements are handed out by reference");

public:
    AEArray() {}
    explicit AEArray(size_t initialCapacity) { m_elements.reserve(initialCapacity); }

    size_t size() const { return m_elements.size(); }
    bool empty() const { return m_elements.empty(); }

    T& operator[](size_t index)
    {
        assert(index < size());
        return m_elements[index];
    }
    const T& operator[](size_t index) const
    {
        assert(index < size());
        return m_elements[index];
    }

    // Puts the value before the element at index; index == size() appends.
    void InsertAt(size_t index, T value)
    {
        assert(index <= size());
        m_elements.insert(m_elements.begin() + static_cast<std::ptrdiff_t>(index), std::move(value));
    }

    void Append(T value) { m_elements.push_back(std::move(value)); }

    void RemoveAt(size_t index)
    {
        assert(index < size());
        m_elements.erase(m_elements.begin() + static_cast<std::ptrdiff_t>(index));
    }

    // Empties the array and keeps its capacity.
    void RemoveAll() { m_elements.clear(); }

    T* begin() { return m_elements.data(); }
    T* end() { return m_elements.data() + size(); }
    const T* begin() const { return m_elements.data(); }
    const T* end() const { return m_elements.data() + size(); }

private:
    std::vector<T> m_elements;
};
