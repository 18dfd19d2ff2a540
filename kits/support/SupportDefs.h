// The basic types, limits and atomic operations that every kit builds on.
#pragma once

#include <Errors.h>

#include <inttypes.h>
#include <stddef.h>
#include <stdint.h>
#include <sys/types.h>

typedef int8_t int8;
typedef uint8_t uint8;
typedef int16_t int16;
typedef uint16_t uint16;
typedef int32_t int32;
typedef uint32_t uint32;
typedef int64_t int64;
typedef uint64_t uint64;

typedef volatile int8 vint8;
typedef volatile uint8 vuint8;
typedef volatile int16 vint16;
typedef volatile uint16 vuint16;
typedef volatile int32 vint32;
typedef volatile uint32 vuint32;
typedef volatile int64 vint64;
typedef volatile uint64 vuint64;

typedef unsigned char uchar;
typedef unsigned short unichar;

// A time or a span of time in microseconds.
typedef int64 bigtime_t;
// Four characters that name the type of a piece of data, see <TypeConstants.h>.
typedef uint32 type_code;
// The code of a Perform() call.
typedef uint32 perform_code;
typedef uintptr_t addr_t;

typedef int (*sort_func)(const void* first, const void* second);

#ifndef FALSE
#define FALSE 0
#endif
#ifndef TRUE
#define TRUE 1
#endif

#define min_c(a, b) ((a) > (b) ? (b) : (a))
#define max_c(a, b) ((a) > (b) ? (a) : (b))

// printf formats of the types whose length differs between machines.
#define B_PRId32 PRId32
#define B_PRIu32 PRIu32
#define B_PRIx32 PRIx32
#define B_PRId64 PRId64
#define B_PRIu64 PRIu64
#define B_PRIx64 PRIx64
#define B_PRIdBIGTIME PRId64

inline constexpr char B_UTF8_ELLIPSIS[] = "\xE2\x80\xA6";
inline constexpr char B_UTF8_OPEN_QUOTE[] = "\xE2\x80\x9C";
inline constexpr char B_UTF8_CLOSE_QUOTE[] = "\xE2\x80\x9D";
inline constexpr char B_UTF8_COPYRIGHT[] = "\xC2\xA9";
inline constexpr char B_UTF8_REGISTERED[] = "\xC2\xAE";
inline constexpr char B_UTF8_TRADEMARK[] = "\xE2\x84\xA2";
inline constexpr char B_UTF8_SMILING_FACE[] = "\xE2\x98\xBB";
inline constexpr char B_UTF8_HIROSHI[] = "\xE5\xBC\x98";

inline constexpr const char* B_EMPTY_STRING = "";

// Sequentially consistent operations on plain integers. All but atomic_set answer the value before the
// change.
inline void atomic_set(vint32* value, int32 newValue) {
    __atomic_store_n(value, newValue, __ATOMIC_SEQ_CST);
}
inline int32 atomic_get_and_set(vint32* value, int32 newValue) {
    return __atomic_exchange_n(value, newValue, __ATOMIC_SEQ_CST);
}
// Stores `newValue` when the value equals `testAgainst`; answers the value that was found.
inline int32 atomic_test_and_set(vint32* value, int32 newValue, int32 testAgainst) {
    __atomic_compare_exchange_n(value, &testAgainst, newValue, false, __ATOMIC_SEQ_CST, __ATOMIC_SEQ_CST);
    return testAgainst;
}
inline int32 atomic_add(vint32* value, int32 addValue) {
    return __atomic_fetch_add(value, addValue, __ATOMIC_SEQ_CST);
}
inline int32 atomic_and(vint32* value, int32 andValue) {
    return __atomic_fetch_and(value, andValue, __ATOMIC_SEQ_CST);
}
inline int32 atomic_or(vint32* value, int32 orValue) {
    return __atomic_fetch_or(value, orValue, __ATOMIC_SEQ_CST);
}
inline int32 atomic_get(vint32* value) {
    return __atomic_load_n(value, __ATOMIC_SEQ_CST);
}

inline void atomic_set64(vint64* value, int64 newValue) {
    __atomic_store_n(value, newValue, __ATOMIC_SEQ_CST);
}
inline int64 atomic_get_and_set64(vint64* value, int64 newValue) {
    return __atomic_exchange_n(value, newValue, __ATOMIC_SEQ_CST);
}
inline int64 atomic_test_and_set64(vint64* value, int64 newValue, int64 testAgainst) {
    __atomic_compare_exchange_n(value, &testAgainst, newValue, false, __ATOMIC_SEQ_CST, __ATOMIC_SEQ_CST);
    return testAgainst;
}
inline int64 atomic_add64(vint64* value, int64 addValue) {
    return __atomic_fetch_add(value, addValue, __ATOMIC_SEQ_CST);
}
inline int64 atomic_and64(vint64* value, int64 andValue) {
    return __atomic_fetch_and(value, andValue, __ATOMIC_SEQ_CST);
}
inline int64 atomic_or64(vint64* value, int64 orValue) {
    return __atomic_fetch_or(value, orValue, __ATOMIC_SEQ_CST);
}
inline int64 atomic_get64(vint64* value) {
    return __atomic_load_n(value, __ATOMIC_SEQ_CST);
}
