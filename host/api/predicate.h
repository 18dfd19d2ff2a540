#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <variant>
#include <vector>

namespace host {

/// A query's condition as a tree. Immutable once built; shared freely between threads.
///
/// A comparison holds for a file that has the attribute and whose value compares so; a file without the
/// attribute satisfies no comparison, `not_equal` included. The attributes "name" (text), "size" (integer,
/// bytes) and "last_modified" (integer, whole seconds since 1970) are there for every file.
struct Predicate {
    enum class Operator {
        equal,
        not_equal,
        less,
        less_or_equal,
        greater,
        greater_or_equal,
        contains,
        begins_with,
        ends_with,
        /// The value holds wildcards as the predicate text has them: `*`, `?`, `[...]`, `\` before a literal
        /// one.
        matches,
        both,   ///< logical and
        either, ///< logical or
        negate, ///< one operand only
    };
    enum class Case { sensitive, insensitive };

    /// Text is bytes, compared as bytes (case-insensitive: after lowering each UTF-8 character); taken
    /// literally except by `matches`.
    using Value = std::variant<std::string, std::int64_t, std::uint64_t, double>;

    Operator op = Operator::equal;
    std::string attribute; ///< comparisons only
    Value value;           ///< comparisons only
    Case letter_case = Case::sensitive;
    std::vector<std::shared_ptr<const Predicate>> operands; ///< two for both/either, one for negate

    bool is_comparison() const { return op < Operator::both; }
};

} // namespace host
