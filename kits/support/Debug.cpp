#include <Debug.h>

#include <cstdio>
#include <cstdlib>

void assertion_failed(const char* expression, const char* file, int line) {
    std::fprintf(stderr, "%s:%d: assertion failed: %s\n", file, line, expression);
    std::abort();
}
