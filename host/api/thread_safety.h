#pragma once

// Names for clang's thread-safety analysis; other compilers see nothing.

#if defined(__clang__)
#define HOST_THREAD_ANNOTATION(x) __attribute__((x))
#else
#define HOST_THREAD_ANNOTATION(x)
#endif

#ifndef GUARDED_BY
#define GUARDED_BY(mutex) HOST_THREAD_ANNOTATION(guarded_by(mutex))
#endif
#ifndef REQUIRES
#define REQUIRES(...) HOST_THREAD_ANNOTATION(requires_capability(__VA_ARGS__))
#endif
#ifndef EXCLUDES
#define EXCLUDES(...) HOST_THREAD_ANNOTATION(locks_excluded(__VA_ARGS__))
#endif
