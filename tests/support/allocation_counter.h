// Counts how often the program asks the heap for memory. For one source file of a program only.
#pragma once

#include <cstddef>

// The sanitizers bring their own allocator, which cannot be counted from here.
#if defined(__has_feature)
#if __has_feature(address_sanitizer) || __has_feature(thread_sanitizer)
#define __SANITIZE_ADDRESS__ 1
#endif
#endif
#if defined(__GLIBC__) && !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
constexpr bool kAllocationsCount = true;
#else
constexpr bool kAllocationsCount = false;
#endif

static int gAllocations = 0;

#if defined(__GLIBC__) && !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
// These stand before the C library's own; operator new comes here too.
extern "C" {
void* __libc_malloc(size_t size);
void* __libc_calloc(size_t count, size_t size);
void* __libc_realloc(void* old, size_t size);

void* malloc(size_t size) noexcept
{
    gAllocations++;
    return __libc_malloc(size);
}

void* calloc(size_t count, size_t size) noexcept
{
    gAllocations++;
    return __libc_calloc(count, size);
}

void* realloc(void* old, size_t size) noexcept
{
    gAllocations++;
    return __libc_realloc(old, size);
}
}
#endif
