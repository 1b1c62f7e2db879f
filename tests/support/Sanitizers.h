// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

// Whether this is a sanitizer build, which each compiler reports in its own way. An instrumented
// program has its own heap and uses more memory.

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
