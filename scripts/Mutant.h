// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

// Included first into every source of the build of scripts/mutants.py, whose mutated sources
// contain all their mutants and ask here which of them is active.

#include <atomic>
#include <cstdlib>
#include <fcntl.h>
#include <sys/mman.h>
#include <sys/syscall.h>
#include <unistd.h>

// VELOCOR_MUTANT: the number of the active mutant. VELOCOR_MUTANT_REACHED: a file with one byte for
// each number, set once the program gets there; mapped, so that it holds for processes that fork or
// are killed, and opened by a system call, because some tests make open() fail or record it.
struct VelocorMutants
{
    long active = 0;
    std::atomic<char>* reached = nullptr;

    VelocorMutants()
    {
        char const* number = std::getenv("VELOCOR_MUTANT");
        active = number ? std::atol(number) : 0;
        char const* name = std::getenv("VELOCOR_MUTANT_REACHED");
        const long file = name ? syscall(SYS_openat, AT_FDCWD, name, O_RDWR | O_CLOEXEC) : -1;
        if (file < 0)
            return;
        const long size = syscall(SYS_lseek, file, 0L, SEEK_END);
        const long start =
            syscall(SYS_mmap, nullptr, size, PROT_READ | PROT_WRITE, MAP_SHARED, file, 0L);
        if (start != -1)
            reached = reinterpret_cast<std::atomic<char>*>(start);
        syscall(SYS_close, file);
    }
};

inline bool velocor_mutant(int number)
{
    static const VelocorMutants mutants;
    if (mutants.reached)
        mutants.reached[number].store(1, std::memory_order_relaxed);
    return mutants.active == number;
}

// In place of a mutex: one that no other thread knows.
template <class Mutex>
Mutex& velocor_private(Mutex&)
{
    thread_local Mutex other;
    return other;
}

template <class Mutex>
Mutex* velocor_private(Mutex*)
{
    thread_local Mutex other;
    return &other;
}
