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
    if (!accessor) throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "no accessor");
    return [accessor, parm](const std::string& name) {
        return readData(accessor(name.c_str(), parm));
    };
}

CMPIBoolean evaluate(const CMPISelectExp* expression, const CMPIInstance* instance,
                     CMPIStatus* rc) {
    return objectEntry(expression, rc, [=](QueryPtr& query, Broker& broker) -> CMPIBoolean {
        return instanceMatches(broker, *query, bodyOf(instance).value) ? 1 : 0;
    });
}
CMPIBoolean evaluateThrough(const CMPISelectExp* expression, CMPIAccessor* accessor, void* parm,
                            CMPIStatus* rc) {
    return objectEntry(expression, rc, [=](QueryPtr& query, Broker& broker) -> CMPIBoolean {
        return query->matches(through(accessor, parm), isAIn(broker)) ? 1 : 0;
    });
}
CMPIString* queryText(const CMPISelectExp* expression, CMPIStatus* rc) {
    return objectEntry(expression, rc, [](QueryPtr& query, Broker& broker) {
        return makeString(broker, query->text());
    });
}
template <CMPISelectCondType Type>
CMPISelectCond* normalForm(const CMPISelectExp* expression, CMPIStatus* rc) {
    return objectEntry(expression, rc, [](QueryPtr& query, Broker& broker) {
        return make<CMPISelectCond>(broker,
                                    std::make_shared<const Condition>(query->normalForm(Type)));
    });
}

CMPICount conditionCount(const CMPISelectCond* condition, int* type, CMPIStatus* rc) {
    return objectEntry(condition, rc, [type](ConditionPtr& body, Broker&) {
        if (type) *type = body->type;
        return static_cast<CMPICount>(body->parts.size());
    });
}

[[noreturn]] void outOfRange(CMPICount index) {
    throw Failure(CMPI_RC_ERR_NO_SUCH_PROPERTY, "index " + std::to_string(index));
}
CMPISubCond* subConditionAt(const CMPISelectCond* condition, CMPICount index, CMPIStatus* rc) {
    return objectEntry(condition, rc, [index](ConditionPtr& body, Broker& broker) {
        if (index >= body->parts.size()) outOfRange(index);
        return make<CMPISubCond>(broker, SubConditionPtr(body, &body->parts[index]));
    });
}
CMPICount predicateCount(const CMPISubCond* condition, CMPIStatus* rc) {
    return objectEntry(condition, rc, [](SubConditionPtr& body, Broker&) {
        return static_cast<CMPICount>(body->predicates.size());
    });
}
CMPIPredicate* predicateAt(const CMPISubCond* condition, CMPICount index, CMPIStatus* rc) {
    return objectEntry(condition, rc, [index](SubConditionPtr& body, Broker& broker) {
        if (index >= body->predicates.size()) outOfRange(index);
        return make<CMPIPredicate>(broker, PredicatePtr(body, &body->predicates[index]));
    });
}
CMPIPredicate* predicateOf(const CMPISubCond* condition, const char* name, CMPIStatus* rc) {
    return objectEntry(condition, rc, [name](SubConditionPtr& body, Broker& broker) {
        for (const Predicate& predicate : body->predicates)
            if (sameName(predicate.name, textOf(name)))
                return make<CMPIPredicate>(broker, PredicatePtr(body, &predicate));
        throw Failure(CMPI_RC_ERR_NO_SUCH_PROPERTY, textOf(name));
    });
}

// The kind of literal, which the property is compared with.
CMPIType literalType(const Predicate& predicate) {
    switch (predicate.literal.type()) {
        case CMPI_string:
            return CMPI_charString;
        case CMPI_sint64:
            return CMPI_integerString;
        case CMPI_real64:
            return CMPI_realString;
        case CMPI_boolean:
            return CMPI_booleanString;
        default:
            return CMPI_null;
    }
}
CMPIStatus predicateData(const CMPIPredicate* predicate, CMPIType* type, CMPIPredOp* op,
                         CMPIString** left, CMPIString** right) {
    return objectStatus(predicate, [=](PredicatePtr& body, Broker& broker) {
        if (type) *type = literalType(*body);
        if (op) *op = body->op;
        if (left) *left = makeString(broker, body->name);
        if (right)
            *right =
                body->literal.isNull() ? nullptr : makeString(broker, plainText(body->literal));
    });
}
CMPIBoolean predicateHolds(const CMPIPredicate* predicate, CMPIAccessor* accessor, void* parm,
                           CMPIStatus* rc) {
    return objectEntry(predicate, rc, [=](PredicatePtr& body, Broker& broker) -> CMPIBoolean {
        return holds(*body, through(accessor, parm)(body->name), isAIn(broker)) ? 1 : 0;
    });
}

// The value of a name such as SourceInstance.Name; the class of the query may stand before it.
Value valueAt(const Instance& instance, const std::string& className, const std::string& name) {
    // The class itself, as the left side of ISA, goes by the name SELF or OBJECTCLASS.
    if (sameName(name, "SELF") || sameName(name, "OBJECTCLASS"))
        return Value(instance.path.className);
    const std::size_t dot = name.find('.');
    const std::string first = name.substr(0, dot);
    const Value* value = instance.properties.find(first);
    if (dot == std::string::npos) return value ? *value : Value();
    const std::string rest = name.substr(dot + 1);
    if (sameName(first, className)) return valueAt(instance, {}, rest);
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
    std::get<CMPISelectExpFT>(tables) = {
        0,         releaseObject<CMPISelectExp>, cloneObject<CMPISelectExp>, evaluate,
        queryText, normalForm<CMPI_COND_DOC>,    normalForm<CMPI_COND_COD>,  evaluateThrough};
    std::get<CMPISelectCondFT>(tables) = {0, releaseObject<CMPISelectCond>,
                                          cloneObject<CMPISelectCond>, conditionCount,
                                          subConditionAt};
    std::get<CMPISubCondFT>(tables) = {0,
                                       releaseObject<CMPISubCond>,
                                       cloneObject<CMPISubCond>,
                                       predicateCount,
                                       predicateAt,
                                       predicateOf};
    std::get<CMPIPredicateFT>(tables) = {0, releaseObject<CMPIPredicate>,
                                         cloneObject<CMPIPredicate>, predicateData, predicateHolds};
}

}  // namespace cimom
