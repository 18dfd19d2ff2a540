// Assertions for the kits and applications.
#pragma once

#include <SupportDefs.h>

// Prints "file:line: assertion failed: expression" on standard error and ends the process there, in the
// debugger when one is attached.
[[noreturn]] void assertion_failed(const char* expression, const char* file, int line);

#ifndef NDEBUG
#define ASSERT(expression) ((expression) ? (void)0 : assertion_failed(#expression, __FILE__, __LINE__))
#else
#define ASSERT(expression) ((void)0)
#endif
#define TRESPASS() assertion_failed("should not be here", __FILE__, __LINE__)
