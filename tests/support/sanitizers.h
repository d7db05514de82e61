#pragma once

// Which sanitizer the program is built with. GCC says it by macros, clang by features.
#if defined(__has_feature)
#define QITRMC_HAS_FEATURE(name) __has_feature(name)
#else
#define QITRMC_HAS_FEATURE(name) 0
#endif

#if defined(__SANITIZE_ADDRESS__) || QITRMC_HAS_FEATURE(address_sanitizer)
#define QITRMC_ADDRESS_SANITIZER
#endif
#if defined(__SANITIZE_THREAD__) || QITRMC_HAS_FEATURE(thread_sanitizer)
#define QITRMC_THREAD_SANITIZER
#endif
