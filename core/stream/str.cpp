#include "core/stream/str.h"

#include <cstdlib>
#include <cstring>

#include "core/geom/chunk_alloc.h"
#include "core/player/limits.h"

namespace {
// Stands before the characters of every string, so that the bytes alive can be counted exactly
// whatever its owner writes into it.
struct StrHead {
    size_t bytes;
};

// What the heap takes for a string beside its characters, the head included.
constexpr size_t kHeapBytes = 32;

// Instance names and most values are short, and sprites come and go in every frame: short strings,
// head included, come from a pool of their own.
constexpr size_t kShortBytes = 40;
ChunkAlloc shortStrings(kShortBytes, 256, 1, 0x77777777);

size_t liveBytes = 0;

bool IsShort(size_t n)
{
    return sizeof(StrHead) + n + 1 <= kShortBytes;
}

U8 Fold(char c)
{
    const U8 byte = static_cast<U8>(c);
    return byte >= 'a' && byte <= 'z' ? static_cast<U8>(byte - ('a' - 'A')) : byte;
}

// Room for n bytes, the terminating zero behind them set.
char* NewStr(size_t n)
{
    const size_t bytes = n + 1 + kHeapBytes;
    if (!ReserveStrBytes(bytes))
        return nullptr;
    auto* head = static_cast<StrHead*>(IsShort(n) ? shortStrings.Alloc()
                                                  : std::malloc(sizeof(StrHead) + n + 1));
    if (!head) {
        ReturnStrBytes(bytes);
        return nullptr;
    }
    head->bytes = bytes;
    char* copy = reinterpret_cast<char*>(head + 1);
    copy[n] = 0;
    return copy;
}
} // namespace

int StrLength(const char* s)
{
    const void* end = std::memchr(s, 0, gLimits.stringBytes);
    return end ? static_cast<int>(static_cast<const char*>(end) - s)
               : static_cast<int>(gLimits.stringBytes);
}

char* CreateStr(const char* s)
{
    return s ? CreateStr(s, StrLength(s)) : nullptr;
}

char* CreateStr(const char* s, int n)
{
    return s ? JoinStr(s, n, s, 0) : nullptr;
}

char* JoinStr(const char* s, int n, const char* t, int m)
{
    const size_t first = n > 0 ? static_cast<size_t>(n) : 0;
    const size_t second = m > 0 ? static_cast<size_t>(m) : 0;
    char* copy = NewStr(first + second);
    if (!copy)
        return nullptr;
    std::memcpy(copy, s, first);
    std::memcpy(copy + first, t, second);
    return copy;
}

void FreeStr(char* s)
{
    if (!s)
        return;
    StrHead* head = reinterpret_cast<StrHead*>(s) - 1;
    ReturnStrBytes(head->bytes);
    if (IsShort(head->bytes - 1 - kHeapBytes))
        shortStrings.Free(head);
    else
        std::free(head);
}

bool ReserveStrBytes(size_t bytes)
{
    if (bytes > gLimits.allStringBytes || liveBytes > gLimits.allStringBytes - bytes)
        return false;
    liveBytes += bytes;
    return true;
}

void ReturnStrBytes(size_t bytes)
{
    liveBytes -= bytes;
}

bool StrEqual(const char* a, const char* b)
{
    if (!a || !b)
        return false;
    const char* rest = SkipPrefix(a, b);
    return rest && *rest == 0;
}

int StrCommon(const char* a, const char* b)
{
    const int most = static_cast<int>(gLimits.stringBytes);
    int n = 0;
    while (n < most && a[n] && Fold(a[n]) == Fold(b[n]))
        n++;
    return n;
}

const char* SkipPrefix(const char* s, const char* prefix)
{
    if (!s || !prefix)
        return nullptr;
    for (; *prefix; s++, prefix++) {
        if (Fold(*s) != Fold(*prefix))
            return nullptr;
    }
    return s;
}

U32 StrHash(const char* s)
{
    U32 hash = 2166136261u;
    for (; *s; s++)
        hash = (hash ^ Fold(*s)) * 16777619u;
    // So far the low bits, which choose a place in an index, depend on the low bits alone.
    hash = (hash ^ hash >> 16) * 0x85EBCA6Bu;
    hash = (hash ^ hash >> 13) * 0xC2B2AE35u;
    return hash ^ hash >> 16;
}

S32 ToInt(const char* s)
{
    U32 value = 0;
    for (; s && *s >= '0' && *s <= '9'; s++)
        value = value * 10 + static_cast<U32>(*s - '0');
    return static_cast<S32>(value);
}
