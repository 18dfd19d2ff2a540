// Writes a query's condition as a text (docs/queries.md). Internal to the storage kit.
#pragma once

#include <PredicatePattern.h>

// A text that ParsePredicate() turns into the canonical form of the same predicate. Numbers are finite, texts
// and attribute names hold no zero bytes, the tree is no deeper than kMaxPredicateDepth.
[[nodiscard]] std::string PrintPredicate(const host::Predicate& predicate);
