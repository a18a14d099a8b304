// An array of plain records that grows by doubling and reports a full heap by its return value. It
// replaces std::vector where nothing may throw and where a frame reuses the memory of the last one.
#pragma once

#include <cstdlib>
#include <cstring>
#include <type_traits>

#include "core/geom/types.h"

template <typename T> class GrowBuffer {
    static_assert(std::is_trivially_copyable_v<T>, "items are moved by realloc");

public:
    GrowBuffer() = default;
    ~GrowBuffer() { std::free(items); }
    GrowBuffer(const GrowBuffer&) = delete;
    GrowBuffer& operator=(const GrowBuffer&) = delete;

    // Room for at least n items. False, and nothing changes, when the heap is exhausted.
    bool Reserve(size_t n)
    {
        if (n <= capacity)
            return true;
        const size_t most = static_cast<size_t>(-1) / 2 / sizeof(T);
        if (n > most)
            return false;
        size_t grown = capacity < 8 ? 8 : capacity > most / 2 ? most : capacity * 2;
        grown = grown < n ? n : grown;
        T* moved = static_cast<T*>(std::realloc(static_cast<void*>(items), grown * sizeof(T)));
        if (moved == nullptr)
            return false;
        items = moved;
        capacity = grown;
        return true;
    }

    // Appends a copy; false when the heap is exhausted.
    bool Push(T value)
    {
        if (count == capacity && !Reserve(count + 1))
            return false;
        items[count++] = value;
        return true;
    }

    // Makes the size n, new items as zero bytes; false, and nothing changes, when the heap is
    // exhausted.
    bool Resize(size_t n)
    {
        if (!Reserve(n))
            return false;
        if (n > count)
            std::memset(static_cast<void*>(items + count), 0, (n - count) * sizeof(T));
        count = n;
        return true;
    }

    // Drops the items from n on (a larger n changes nothing); Clear drops all. Both keep the
    // memory.
    void Truncate(size_t n) { count = n < count ? n : count; }
    void Clear() { count = 0; }

    size_t size() const { return count; }
    bool empty() const { return count == 0; }
    T* data() { return items; }
    const T* data() const { return items; }
    T& operator[](size_t i) { return items[i]; }
    const T& operator[](size_t i) const { return items[i]; }
    T& Back() { return items[count - 1]; }
    const T& Back() const { return items[count - 1]; }
    T* begin() { return items; }
    T* end() { return items + count; }
    const T* begin() const { return items; }
    const T* end() const { return items + count; }

private:
    T* items = nullptr;
    size_t count = 0;
    size_t capacity = 0;
};
