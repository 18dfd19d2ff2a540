// Texts with wildcards, as they stand in a query's predicate, and the comparisons that they amount to.
// Internal to the storage kit.
#pragma once

#include "host/api/predicate.h"

#include <memory>
#include <string>
#include <string_view>

using PredicateRef = std::shared_ptr<const host::Predicate>;

// A backslash before every byte that would be a wildcard, and before backslashes.
[[nodiscard]] std::string EscapeWildcards(std::string_view literal);

// Takes the backslashes away: what a text means where wildcards have no meaning.
[[nodiscard]] std::string Unescape(std::string_view text);

// False when a bracket is not closed or holds nothing, or when the text ends with a lone backslash.
[[nodiscard]] bool IsWellFormedPattern(std::string_view pattern);

// "attribute equals pattern" in its simplest form: `equal`, `contains`, `begins_with` or `ends_with` with a
// literal text where the pattern is no more than that, else `matches` with the pattern written in one way
// only (no needless backslashes, no doubled asterisks). The pattern is well formed.
[[nodiscard]] host::Predicate ComparisonFromPattern(std::string attribute, std::string_view pattern,
                                                    host::Predicate::Case letterCase);

// The way back: the pattern that gives this comparison (equal, contains, begins_with, ends_with, matches).
[[nodiscard]] std::string PatternFromComparison(const host::Predicate& comparison);

// The predicate with every comparison in its simplest form. Two predicates that print alike have one such
// form.
[[nodiscard]] PredicateRef CanonicalPredicate(const PredicateRef& predicate);

// The same tree with the same values.
[[nodiscard]] bool PredicatesAreEqual(const host::Predicate& first, const host::Predicate& second);
