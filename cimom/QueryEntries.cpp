// Entries of select expressions and of their normal forms.

#include "NamedEntries.h"
#include "PathText.h"
#include "Query.h"

namespace cimom {

namespace {

using QueryPtr = std::shared_ptr<const Query>;
using ConditionPtr = std::shared_ptr<const Condition>;
using SubConditionPtr = std::shared_ptr<const SubCondition>;
using PredicatePtr = std::shared_ptr<const Predicate>;

Query::IsA isAIn(Broker& broker) {
    return [&broker](const std::string& className, const std::string& ancestor) {
        return sameName(className, ancestor) ||
               (broker.classes() && broker.classes()->isA(className, ancestor));
    };
}

Query::Accessor through(CMPIAccessor* accessor, void* parm) {
    if (!accessor) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "no accessor");
    }
    return [accessor, parm](const std::string& name) {
        return readData(accessor(name.c_str(), parm));
    };
}

CMPIBoolean evaluate(QueryPtr& query, Broker& broker, const CMPIInstance* instance) {
    return instanceMatches(broker, *query, bodyOf(instance).value);
}
CMPIBoolean evaluateThrough(QueryPtr& query, Broker& broker, CMPIAccessor* accessor, void* parm) {
    return query->matches(through(accessor, parm), isAIn(broker));
}
CMPIString* queryText(QueryPtr& query, Broker& broker) { return makeString(broker, query->text()); }
template <CMPISelectCondType Type>
CMPISelectCond* normalForm(QueryPtr& query, Broker& broker) {
    return make<CMPISelectCond>(broker, std::make_shared<const Condition>(query->normalForm(Type)));
}

CMPICount conditionCount(ConditionPtr& body, Broker&, int* type) {
    if (type) {
        *type = body->type;
    }
    return static_cast<CMPICount>(body->parts.size());
}
CMPISubCond* subConditionAt(ConditionPtr& body, Broker& broker, CMPICount index) {
    return make<CMPISubCond>(broker, SubConditionPtr(body, &elementAt(body->parts, index)));
}
CMPICount predicateCount(SubConditionPtr& body, Broker&) {
    return static_cast<CMPICount>(body->predicates.size());
}
CMPIPredicate* predicateAt(SubConditionPtr& body, Broker& broker, CMPICount index) {
    return make<CMPIPredicate>(broker, PredicatePtr(body, &elementAt(body->predicates, index)));
}
CMPIPredicate* predicateOf(SubConditionPtr& body, Broker& broker, const char* name) {
    for (const Predicate& predicate : body->predicates) {
        if (sameName(predicate.name, textOf(name))) {
            return make<CMPIPredicate>(broker, PredicatePtr(body, &predicate));
        }
    }
    throw Failure(CMPI_RC_ERR_NO_SUCH_PROPERTY, textOf(name));
}

// The kind of literal, which the property is compared with.
CMPIType literalType(const Predicate& predicate) {
    constexpr std::pair<CMPIType, CMPIType> kKinds[] = {{CMPI_string, CMPI_charString},
                                                        {CMPI_sint64, CMPI_integerString},
                                                        {CMPI_real64, CMPI_realString},
                                                        {CMPI_boolean, CMPI_booleanString}};
    for (const auto& [type, kind] : kKinds) {
        if (type == predicate.literal.type()) {
            return kind;
        }
    }
    return CMPI_null;
}
void predicateData(PredicatePtr& body, Broker& broker, CMPIType* type, CMPIPredOp* op,
                   CMPIString** left, CMPIString** right) {
    const Value& literal = body->literal;
    if (type) {
        *type = literalType(*body);
    }
    if (op) {
        *op = body->op;
    }
    if (left) {
        *left = makeString(broker, body->name);
    }
    if (right) {
        *right = literal.isNull() ? nullptr : makeString(broker, plainText(literal));
    }
}
CMPIBoolean predicateHolds(PredicatePtr& body, Broker& broker, CMPIAccessor* accessor, void* parm) {
    return holds(*body, through(accessor, parm)(body->name), isAIn(broker));
}

// The value of a name such as SourceInstance.Name; the class of the query may stand before it.
Value valueAt(const Instance& instance, const std::string& className, const std::string& name) {
    // The class itself, as the left side of ISA, goes by the name SELF or OBJECTCLASS.
    if (sameName(name, "SELF") || sameName(name, "OBJECTCLASS")) {
        return Value(instance.path.className);
    }
    const std::size_t dot = name.find('.');
    const std::string first = name.substr(0, dot);
    const Value* value = instance.properties.find(first);
    if (dot == std::string::npos) {
        return value ? *value : Value();
    }
    const std::string rest = name.substr(dot + 1);
    if (sameName(first, className)) {
        return valueAt(instance, {}, rest);
    }
    const bool deeper = value && !value->isNull() && value->type() == CMPI_instance;
    return deeper ? valueAt(value->instance(), {}, rest) : Value();
}

}  // namespace

bool instanceMatches(Broker& broker, const Query& query, const Instance& instance) {
    const Query::IsA isA = isAIn(broker);
    const auto property = [&](const std::string& name) {
        return valueAt(instance, query.className(), name);
    };
    return isA(instance.path.className, query.className()) && query.matches(property, isA);
}

void fillQueryTables(ObjectTables& tables) {
    std::get<CMPISelectExpFT>(tables) = tableOf<CMPISelectExp>(
        entryOf<evaluate>, entryOf<queryText>, entryOf<normalForm<CMPI_COND_DOC>>,
        entryOf<normalForm<CMPI_COND_COD>>, entryOf<evaluateThrough>);
    std::get<CMPISelectCondFT>(tables) =
        tableOf<CMPISelectCond>(entryOf<conditionCount>, entryOf<subConditionAt>);
    std::get<CMPISubCondFT>(tables) =
        tableOf<CMPISubCond>(entryOf<predicateCount>, entryOf<predicateAt>, entryOf<predicateOf>);
    std::get<CMPIPredicateFT>(tables) =
        tableOf<CMPIPredicate>(entryOf<predicateData>, entryOf<predicateHolds>);
}

}  // namespace cimom
