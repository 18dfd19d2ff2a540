// Puts a query's pushed parts together. Internal to the storage kit.
#pragma once

#include <PredicatePattern.h>
#include <Query.h>

#include <variant>
#include <vector>

// Takes attributes, values and operators in reverse Polish order. One thread at a time.
class PredicateBuilder {
  public:
    void PushAttribute(std::string name);
    void PushValue(host::Predicate::Value value, host::Predicate::Case letterCase);
    // B_BAD_VALUE for a number that is no operator.
    status_t PushOperator(query_op op);

    bool IsEmpty() const { return mParts.empty(); }
    void MakeEmpty() { mParts.clear(); }

    // The whole condition, in canonical form. B_NO_INIT when nothing was pushed; B_BAD_VALUE when an operator
    // lacks its operands or gets the wrong ones (a comparison takes an attribute and then a value, B_CONTAINS
    // and its kin a text), when parts are left over, or the tree is deeper than kMaxPredicateDepth.
    status_t Build(PredicateRef& predicate) const;

  private:
    struct Attribute {
        std::string name;
    };
    struct Literal {
        host::Predicate::Value value;
        host::Predicate::Case letterCase;
    };
    struct Tree {
        PredicateRef predicate;
        int depth;
    };
    using Part = std::variant<Attribute, Literal, query_op>;
    using Operand = std::variant<Attribute, Literal, Tree>;

    static status_t Compare(query_op op, std::vector<Operand>& operands);
    static status_t Combine(query_op op, std::vector<Operand>& operands);

    std::vector<Part> mParts;
};
