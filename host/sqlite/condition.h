#pragma once

#include "host/api/predicate.h"
#include "host/sqlite/comparison.h"
#include <cstdint>
#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <vector>

namespace host {

/// What a condition is asked of: one entry of the file system. Views stay valid until the next call.
class Subject {
  public:
    virtual ~Subject() = default;
    virtual std::string_view name() = 0;
    /// Kind none where the file has gone.
    virtual AttributeValue size() = 0;
    virtual AttributeValue last_modified() = 0;
    /// Kind none where the file has no such attribute, or none that can be compared.
    virtual AttributeValue attribute(const std::string& name) = 0;
};

/// A predicate prepared for evaluation: comparisons compiled, negations moved down to them. Immutable; any
/// thread.
class Condition {
  public:
    enum class Kind { comparison, both, either };

    /// Null for a malformed tree (wrong number of operands).
    static std::shared_ptr<const Condition> compile(const Predicate& predicate);

    Kind kind() const { return kind_; }
    bool negated() const { return negated_; }
    const Comparison& comparison() const { return *comparison_; }
    const Condition& left() const { return *left_; }
    const Condition& right() const { return *right_; }

    bool holds(Subject& subject) const;

    /// Every file that satisfies it has one of the attributes that it names, so an index can answer.
    bool bound() const;
    /// A comparison on "name", "size" or "last_modified", which every file has.
    bool is_intrinsic() const;
    /// Names of the attributes that are compared, the intrinsic ones left out.
    void collect_attributes(std::set<std::string>& names) const;

  private:
    static std::shared_ptr<const Condition> compile(const Predicate& predicate, bool negated, int depth);

    Kind kind_ = Kind::comparison;
    bool negated_ = false;
    std::unique_ptr<const Comparison> comparison_;
    std::shared_ptr<const Condition> left_;
    std::shared_ptr<const Condition> right_;
};

} // namespace host
