#pragma once

#include "host/api/predicate.h"
#include "host/sqlite/attribute_value.h"
#include "host/sqlite/wildcard.h"
#include <optional>
#include <string>
#include <string_view>

namespace host {

/// One comparison of a predicate, prepared for being asked often. Immutable; any thread.
///
/// A text in the predicate meets a number on the file by its number, where all of it reads as one; a number
/// meets a text by its decimal digits. `contains`, `begins_with`, `ends_with` and `matches` hold for text
/// only.
class Comparison {
  public:
    explicit Comparison(const Predicate& predicate);

    const std::string& attribute() const { return attribute_; }
    Predicate::Operator op() const { return op_; }
    Predicate::Case letter_case() const { return letter_case_; }
    /// The predicate's text, lowered where case does not count. Never holds a zero byte.
    const std::string& text() const { return text_; }

    bool holds(const AttributeValue& value) const;
    bool holds_for_text(std::string_view text) const;

  private:
    bool holds_for_folded_text(std::string_view text) const;
    bool ordered(int order) const;

    std::string attribute_;
    Predicate::Operator op_ = Predicate::Operator::equal;
    Predicate::Case letter_case_ = Predicate::Case::sensitive;
    std::string text_;
    AttributeValue number_;
    std::optional<Wildcard> wildcard_;
};

} // namespace host
