/// Select expressions: the filters of indications and the queries of execQuery.
///
/// The language is the common core of "WQL", "CIM:CQL" and "DMTF:CQL":
///
///     SELECT <* or names> FROM <class> [WHERE <condition>]
///
/// where a condition joins comparisons by AND, OR, NOT and parentheses, and a comparison is
/// `name op literal` (=, <>, !=, <, <=, >, >=, LIKE with % and _), `name ISA class`,
/// `literal op name`, or `name IS [NOT] NULL`. A comparison with a null does not hold.
#ifndef CIMOM_QUERY_H
#define CIMOM_QUERY_H

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "Value.h"

namespace cimom {

struct Predicate {
    std::string name;
    CMPIPredOp op = CMPI_PredOp_Equals;
    Value literal;  ///< what the property is compared with; the class of ISA as a text
};
/// Predicates of which all must hold (or any, in a conjunction of disjunctions).
struct SubCondition {
    std::vector<Predicate> predicates;
};
/// The normal form of a where clause. No sub-condition at all stands for "always".
struct Condition {
    CMPISelectCondType type = CMPI_COND_DOC;
    std::vector<SubCondition> parts;
};

/// Immutable.
class Query {
public:
    /// @throws Failure CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED, CMPI_RC_ERR_INVALID_QUERY
    static std::shared_ptr<const Query> parse(const std::string& text, const std::string& language);

    const std::string& text() const { return m_text; }
    const std::string& className() const { return m_className; }
    /// Names selected; empty for all.
    const std::vector<std::string>& projection() const { return m_projection; }

    /// The value of a property, null for what is not there.
    using Accessor = std::function<Value(const std::string& name)>;
    /// Whether a class is another or one below it.
    using IsA = std::function<bool(const std::string& className, const std::string& ancestor)>;
    bool matches(const Accessor& property, const IsA& isA) const;

    /// The where clause as a disjunction of conjunctions, or a conjunction of disjunctions.
    /// @throws Failure CMPI_RC_ERR_FAILED when that has more than a thousand parts
    Condition normalForm(CMPISelectCondType type) const;

    struct Expression;

private:
    friend class QueryParser;
    std::string m_text;
    std::string m_className;
    std::vector<std::string> m_projection;
    std::shared_ptr<const Expression> m_where;  // null: always
};

/// Whether one comparison holds for the value of its property.
bool holds(const Predicate& predicate, const Value& value, const Query::IsA& isA);

}  // namespace cimom

#endif
