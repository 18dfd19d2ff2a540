#include <PredicateBuilder.h>

#include <PredicateParser.h>

#include <algorithm>
#include <optional>

using host::Predicate;

namespace {

std::optional<Predicate::Operator> ComparisonOf(query_op op) {
    switch (op) {
    case B_EQ:
        return Predicate::Operator::equal;
    case B_NE:
        return Predicate::Operator::not_equal;
    case B_LT:
        return Predicate::Operator::less;
    case B_LE:
        return Predicate::Operator::less_or_equal;
    case B_GT:
        return Predicate::Operator::greater;
    case B_GE:
        return Predicate::Operator::greater_or_equal;
    case B_CONTAINS:
        return Predicate::Operator::contains;
    case B_BEGINS_WITH:
        return Predicate::Operator::begins_with;
    case B_ENDS_WITH:
        return Predicate::Operator::ends_with;
    default:
        return std::nullopt;
    }
}

bool NeedsText(query_op op) {
    return op == B_CONTAINS || op == B_BEGINS_WITH || op == B_ENDS_WITH;
}

} // namespace

void PredicateBuilder::PushAttribute(std::string name) {
    mParts.emplace_back(Attribute{std::move(name)});
}

void PredicateBuilder::PushValue(Predicate::Value value, Predicate::Case letterCase) {
    mParts.emplace_back(Literal{std::move(value), letterCase});
}

status_t PredicateBuilder::PushOperator(query_op op) {
    if (!ComparisonOf(op) && op != B_AND && op != B_OR && op != B_NOT)
        return B_BAD_VALUE;
    mParts.emplace_back(op);
    return B_OK;
}

status_t PredicateBuilder::Build(PredicateRef& predicate) const {
    if (mParts.empty())
        return B_NO_INIT;
    std::vector<Operand> operands;
    for (const Part& part : mParts) {
        if (const auto* attribute = std::get_if<Attribute>(&part)) {
            operands.emplace_back(*attribute);
        } else if (const auto* literal = std::get_if<Literal>(&part)) {
            operands.emplace_back(*literal);
        } else {
            query_op op = std::get<query_op>(part);
            status_t status = ComparisonOf(op) ? Compare(op, operands) : Combine(op, operands);
            if (status != B_OK)
                return status;
        }
    }
    if (operands.size() != 1 || !std::holds_alternative<Tree>(operands[0]))
        return B_BAD_VALUE;
    predicate = CanonicalPredicate(std::get<Tree>(operands[0]).predicate);
    return B_OK;
}

status_t PredicateBuilder::Compare(query_op op, std::vector<Operand>& operands) {
    if (operands.size() < 2)
        return B_BAD_VALUE;
    auto* attribute = std::get_if<Attribute>(&operands[operands.size() - 2]);
    auto* literal = std::get_if<Literal>(&operands.back());
    if (attribute == nullptr || literal == nullptr)
        return B_BAD_VALUE;
    if (NeedsText(op) && !std::holds_alternative<std::string>(literal->value))
        return B_BAD_VALUE;
    auto comparison = std::make_shared<Predicate>();
    comparison->op = *ComparisonOf(op);
    comparison->attribute = std::move(attribute->name);
    comparison->value = std::move(literal->value);
    comparison->letter_case = literal->letterCase;
    operands.resize(operands.size() - 2);
    operands.emplace_back(Tree{std::move(comparison), 0});
    return B_OK;
}

status_t PredicateBuilder::Combine(query_op op, std::vector<Operand>& operands) {
    size_t count = op == B_NOT ? 1 : 2;
    if (operands.size() < count)
        return B_BAD_VALUE;
    auto combined = std::make_shared<Predicate>();
    combined->op = op == B_NOT   ? Predicate::Operator::negate
                   : op == B_AND ? Predicate::Operator::both
                                 : Predicate::Operator::either;
    int depth = 0;
    for (size_t i = operands.size() - count; i < operands.size(); i++) {
        auto* tree = std::get_if<Tree>(&operands[i]);
        if (tree == nullptr)
            return B_BAD_VALUE;
        depth = std::max(depth, tree->depth + 1);
        combined->operands.push_back(std::move(tree->predicate));
    }
    if (depth > kMaxPredicateDepth)
        return B_BAD_VALUE;
    operands.resize(operands.size() - count);
    operands.emplace_back(Tree{std::move(combined), depth});
    return B_OK;
}
