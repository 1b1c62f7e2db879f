// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// A program's own definitions, and those of a preloaded library, take precedence over those of the
// C library. The operators new of the C++ library end up here, too.

#include "reliability/ScarceMemory.h"

#include <atomic>
#include <cerrno>
#include <cstddef>
#include <cstdint>

namespace {

// Plain data without constructors: the first calls come before any of them has run.
std::atomic<bool> s_isCounting{false};
std::atomic<long> s_count{0};
std::atomic<bool> s_reached{false};
long s_step;
bool s_lasts;

bool Fails()
{
    if (!s_isCounting)
        return false;
    const long number = ++s_count;
    if (s_step == 0 || number < s_step || (number > s_step && !s_lasts))
        return false;
    s_reached = true;
    errno = ENOMEM;
    return true;
}

} // namespace

void ScarceMemory::failAt(long step, Duration duration)
{
    s_step = step;
    s_lasts = duration == FromThereOn;
    s_count = 0;
    s_reached = false;
    s_isCounting = true;
}

void ScarceMemory::mend()
{
    s_isCounting = false;
}

long ScarceMemory::count()
{
    return s_count;
}

bool ScarceMemory::reached()
{
    return s_reached;
}

extern "C" {

void* __libc_malloc(std::size_t size);
void* __libc_calloc(std::size_t count, std::size_t size);
void* __libc_realloc(void* block, std::size_t size);
void* __libc_memalign(std::size_t alignment, std::size_t size);

void* malloc(std::size_t size) noexcept
{
    return Fails() ? nullptr : __libc_malloc(size);
}

void* calloc(std::size_t count, std::size_t size) noexcept
{
    return Fails() ? nullptr : __libc_calloc(count, size);
}

void* realloc(void* block, std::size_t size) noexcept
{
    return Fails() ? nullptr : __libc_realloc(block, size);
}

void* reallocarray(void* block, std::size_t count, std::size_t size) noexcept
{
    if (size != 0 && count > SIZE_MAX / size) {
        errno = ENOMEM;
        return nullptr;
    }
    return realloc(block, count * size);
}

void* memalign(std::size_t alignment, std::size_t size) noexcept
{
    return Fails() ? nullptr : __libc_memalign(alignment, size);
}

void* aligned_alloc(std::size_t alignment, std::size_t size) noexcept
{
    return memalign(alignment, size);
}

int posix_memalign(void** block, std::size_t alignment, std::size_t size) noexcept
{
    void* const found = memalign(alignment, size);
    if (found)
        *block = found;
    return found ? 0 : ENOMEM;
}

} // extern "C"
