// A growing array of plain records that reports an exhausted heap instead of ending the program.
#pragma once

#include <cstdlib>
#include <cstring>
#include <type_traits>

#include "core/geom/types.h"

// Elements are moved by realloc and never constructed or destroyed. Pointers into the buffer hold
// until the next Reserve, Push or Resize.
template <typename T> class GrowBuffer {
    static_assert(std::is_trivially_copyable_v<T>);

public:
    GrowBuffer() = default;
    ~GrowBuffer() { std::free(items); }
    GrowBuffer(const GrowBuffer&) = delete;
    GrowBuffer& operator=(const GrowBuffer&) = delete;

    // Makes room for n elements in all. False, with nothing changed, when the heap is exhausted.
    bool Reserve(size_t n)
    {
        if (n <= capacity)
            return true;
        if (n > kMaxItems)
            return false;
        size_t wanted = capacity < kMaxItems / 2 ? capacity * 2 : kMaxItems;
        wanted = wanted < 8 ? 8 : wanted;
        wanted = wanted < n ? n : wanted;
        void* grown = std::realloc(static_cast<void*>(items), wanted * sizeof(T));
        if (!grown)
            return false;
        items = static_cast<T*>(grown);
        capacity = wanted;
        return true;
    }

    // Appends a copy; false when the heap is exhausted.
    bool Push(T item)
    {
        if (count == capacity && !Reserve(count + 1))
            return false;
        items[count++] = item;
        return true;
    }

    // Makes the size n; elements gained are zero bytes. False, with nothing changed, when the heap
    // is exhausted.
    bool Resize(size_t n)
    {
        if (!Reserve(n))
            return false;
        if (n > count)
            std::memset(static_cast<void*>(items + count), 0, (n - count) * sizeof(T));
        count = n;
        return true;
    }

    // Drops all elements past the first n.
    void Truncate(size_t n) { count = n < count ? n : count; }
    // Drops all elements and keeps the memory.
    void Clear() { count = 0; }
    // Drops all elements and the memory.
    void Release()
    {
        std::free(items);
        items = nullptr;
        count = capacity = 0;
    }

    T* data() { return items; }
    const T* data() const { return items; }
    size_t size() const { return count; }
    T& operator[](size_t i) { return items[i]; }
    const T& operator[](size_t i) const { return items[i]; }
    // The last element; there must be one.
    T& Back() { return items[count - 1]; }
    const T& Back() const { return items[count - 1]; }
    T* begin() { return items; }
    T* end() { return items + count; }
    const T* begin() const { return items; }
    const T* end() const { return items + count; }

private:
    static constexpr size_t kMaxItems = (static_cast<size_t>(-1) / 2) / sizeof(T);

    T* items = nullptr;
    size_t count = 0;    // elements held
    size_t capacity = 0; // elements there is room for
};
