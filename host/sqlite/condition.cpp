#include "host/sqlite/condition.h"

namespace host {
namespace {

// Deeper trees than any predicate text can hold are refused rather than recursed into.
constexpr int kDeepest = 2000;

} // namespace

std::shared_ptr<const Condition> Condition::compile(const Predicate& predicate) {
    return compile(predicate, false, 0);
}

std::shared_ptr<const Condition> Condition::compile(const Predicate& predicate, bool negated, int depth) {
    if (depth > kDeepest)
        return nullptr;
    if (predicate.op == Predicate::Operator::negate) {
        if (predicate.operands.size() != 1 || !predicate.operands[0])
            return nullptr;
        return compile(*predicate.operands[0], !negated, depth + 1);
    }
    auto condition = std::make_shared<Condition>();
    if (predicate.is_comparison()) {
        condition->negated_ = negated;
        condition->comparison_ = std::make_unique<Comparison>(predicate);
        return condition;
    }
    if (predicate.operands.size() != 2 || !predicate.operands[0] || !predicate.operands[1])
        return nullptr;
    const bool both = (predicate.op == Predicate::Operator::both) != negated;
    condition->kind_ = both ? Kind::both : Kind::either;
    condition->left_ = compile(*predicate.operands[0], negated, depth + 1);
    condition->right_ = compile(*predicate.operands[1], negated, depth + 1);
    if (!condition->left_ || !condition->right_)
        return nullptr;
    return condition;
}

bool Condition::holds(Subject& subject) const {
    if (kind_ == Kind::both)
        return left_->holds(subject) && right_->holds(subject);
    if (kind_ == Kind::either)
        return left_->holds(subject) || right_->holds(subject);
    const std::string& attribute = comparison_->attribute();
    AttributeValue value;
    if (attribute == "name")
        value = AttributeValue::of_text(subject.name());
    else if (attribute == "size")
        value = subject.size();
    else if (attribute == "last_modified")
        value = subject.last_modified();
    else
        value = subject.attribute(attribute);
    return comparison_->holds(value) != negated_;
}

bool Condition::is_intrinsic() const {
    if (kind_ != Kind::comparison)
        return false;
    const std::string& attribute = comparison_->attribute();
    return attribute == "name" || attribute == "size" || attribute == "last_modified";
}

bool Condition::bound() const {
    switch (kind_) {
    case Kind::both:
        return left_->bound() || right_->bound();
    case Kind::either:
        return left_->bound() && right_->bound();
    case Kind::comparison:
        break;
    }
    return !negated_ && !is_intrinsic();
}

void Condition::collect_attributes(std::set<std::string>& names) const {
    if (kind_ != Kind::comparison) {
        left_->collect_attributes(names);
        right_->collect_attributes(names);
    } else if (!is_intrinsic()) {
        names.insert(comparison_->attribute());
    }
}

} // namespace host
