// Reads a query's condition from its text (docs/queries.md). Internal to the storage kit.
#pragma once

#include <PredicatePattern.h>

#include <time.h>

// Levels of a tree; a chain of n terms joined by && counts n - 1. Beyond it a text is refused, so that
// whoever walks the tree may do so recursively.
inline constexpr int kMaxPredicateDepth = 500;
inline constexpr size_t kMaxPredicateLength = 1024 * 1024;

struct ParsedPredicate {
    PredicateRef predicate; // in canonical form; null when the text is malformed
    std::string error;      // what is wrong, for a person
    size_t position = 0;    // the byte where it was noticed
};

// `now` is what times in words refer to. Takes any bytes.
[[nodiscard]] ParsedPredicate ParsePredicate(std::string_view text, time_t now);
