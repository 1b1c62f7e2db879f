// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

// Whether this is built for a sanitizer, which each compiler says in its own way. A watched program
// has a heap of its own and takes more memory.

#if defined(__has_feature)
#if __has_feature(address_sanitizer)
#define TEST_UNDER_ADDRESS_SANITIZER
#endif
#if __has_feature(thread_sanitizer)
#define TEST_UNDER_THREAD_SANITIZER
#endif
#endif

#if defined(__SANITIZE_ADDRESS__)
#define TEST_UNDER_ADDRESS_SANITIZER
#endif
#if defined(__SANITIZE_THREAD__)
#define TEST_UNDER_THREAD_SANITIZER
#endif
