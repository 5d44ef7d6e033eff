#pragma once

#include "Document/Arena.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <type_traits>

namespace ovrin_yaml {

/// A growing array of plain values in the arena: what std::vector is, in 16 bytes instead of 24. What it
/// leaves behind when it grows stays in the arena, so reserve where the count is known. At most 2^32 - 1
/// values.
template <class T> class ArenaArray {
    static_assert(std::is_trivially_copyable_v<T> && std::is_trivially_destructible_v<T>);

public:
    ArenaArray() = default;
    /// An empty array with room for `capacity` values in `memory`, which must come from the arena.
    ArenaArray(T* memory, std::size_t capacity)
        : m_Data(memory), m_Capacity(static_cast<std::uint32_t>(capacity)) {}
    ArenaArray(const ArenaArray&) = delete;
    ArenaArray& operator=(const ArenaArray&) = delete;

    std::size_t size() const { return m_Size; }
    std::size_t capacity() const { return m_Capacity; }
    T* data() { return m_Data; }
    const T* data() const { return m_Data; }
    T* begin() { return m_Data; }
    T* end() { return m_Data + m_Size; }
    const T* begin() const { return m_Data; }
    const T* end() const { return m_Data + m_Size; }
    T& operator[](std::size_t index) { return m_Data[index]; }
    const T& operator[](std::size_t index) const { return m_Data[index]; }

    void reserve(std::size_t count) {
        if (count > m_Capacity) MoveTo(count);
    }
    void push_back(const T& value) {
        if (m_Size == m_Capacity)
            Grow(value);
        else
            m_Data[m_Size++] = value;
    }
    /// Appends `count` values that the caller must fill in, and returns the first.
    T* append_blank(std::size_t count) {
        reserve(m_Size + count);
        T* first = end();
        m_Size += static_cast<std::uint32_t>(count);
        return first;
    }
    void erase(std::size_t index) {
        std::copy(m_Data + index + 1, end(), m_Data + index);
        --m_Size;
    }
    template <class Predicate> void erase_if(Predicate predicate) {
        m_Size = static_cast<std::uint32_t>(std::remove_if(begin(), end(), predicate) - begin());
    }
    void clear() { m_Size = 0; }
    void swap(ArenaArray& other) {
        std::swap(m_Data, other.m_Data);
        std::swap(m_Size, other.m_Size);
        std::swap(m_Capacity, other.m_Capacity);
    }

private:
    /// `value` may stand in the array itself.
    void Grow(const T& value) {
        const T copy = value;
        MoveTo(std::max<std::size_t>(2 * std::size_t{m_Capacity}, 4));
        m_Data[m_Size++] = copy;
    }
    void MoveTo(std::size_t capacity) {
        T* memory = static_cast<T*>(ArenaAllocate(capacity * sizeof(T)));
        std::copy(begin(), end(), memory);
        m_Data = memory;
        m_Capacity = static_cast<std::uint32_t>(capacity);
    }

    T* m_Data = nullptr;
    std::uint32_t m_Size = 0;
    std::uint32_t m_Capacity = 0;
};

} // namespace ovrin_yaml
