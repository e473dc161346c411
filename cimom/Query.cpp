#include "Query.h"

#include <strings.h>

#include <algorithm>
#include <cctype>

#include "Failure.h"
#include "PathText.h"

namespace cimom {

// A leaf compares; an inner node joins its operands. NOT is gone after parsing: it turns the
// operators of the leaves around and swaps AND and OR.
struct Query::Expression {
    Predicate predicate;  // of a leaf
    bool all = true;      // inner: AND, otherwise OR
    std::vector<std::shared_ptr<const Expression>> operands;

    bool isLeaf() const { return operands.empty(); }
};

namespace {

using ExpressionPtr = std::shared_ptr<const Query::Expression>;

constexpr std::size_t kMostParts = 1000;
constexpr int kDeepestNesting = 100;

// How the value of a property may stand to a literal, as bits.
enum Order : unsigned { kBelow = 1, kEqual = 2, kAbove = 4 };

struct Operator {
    const char* text;
    CMPIPredOp op;
    CMPIPredOp negated;
    CMPIPredOp mirrored;  // with its sides exchanged
    unsigned orders;      // for which it holds
};
constexpr Operator kOperators[] = {
    {"=", CMPI_PredOp_Equals, CMPI_PredOp_NotEquals, CMPI_PredOp_Equals, kEqual},
    {"<>", CMPI_PredOp_NotEquals, CMPI_PredOp_Equals, CMPI_PredOp_NotEquals, kBelow | kAbove},
    {"!=", CMPI_PredOp_NotEquals, CMPI_PredOp_Equals, CMPI_PredOp_NotEquals, kBelow | kAbove},
    {"<", CMPI_PredOp_LessThan, CMPI_PredOp_GreaterThanOrEquals, CMPI_PredOp_GreaterThan, kBelow},
    {">", CMPI_PredOp_GreaterThan, CMPI_PredOp_LessThanOrEquals, CMPI_PredOp_LessThan, kAbove},
    {"<=", CMPI_PredOp_LessThanOrEquals, CMPI_PredOp_GreaterThan, CMPI_PredOp_GreaterThanOrEquals,
     kBelow | kEqual},
    {">=", CMPI_PredOp_GreaterThanOrEquals, CMPI_PredOp_LessThan, CMPI_PredOp_LessThanOrEquals,
     kEqual | kAbove},
    {"ISA", CMPI_PredOp_Isa, CMPI_PredOp_NotIsa, CMPI_PredOp_Isa, 0},
    {"", CMPI_PredOp_NotIsa, CMPI_PredOp_Isa, CMPI_PredOp_NotIsa, 0},
    {"LIKE", CMPI_PredOp_Like, CMPI_PredOp_NotLike, CMPI_PredOp_Like, 0},
    {"", CMPI_PredOp_NotLike, CMPI_PredOp_Like, CMPI_PredOp_NotLike, 0},
    {"", CMPI_PredOp_Null, CMPI_PredOp_Not_Null, CMPI_PredOp_Null, 0},
    {"", CMPI_PredOp_Not_Null, CMPI_PredOp_Null, CMPI_PredOp_Not_Null, 0},
};

const Operator& rowOf(CMPIPredOp op) {
    return *std::find_if(std::begin(kOperators), std::end(kOperators),
                         [op](const Operator& row) { return row.op == op; });
}

ExpressionPtr leaf(Predicate predicate) {
    return std::make_shared<Query::Expression>(Query::Expression{std::move(predicate), true, {}});
}

ExpressionPtr join(bool all, std::vector<ExpressionPtr> operands) {
    if (operands.size() == 1) {
        return operands.front();
    }
    return std::make_shared<Query::Expression>(Query::Expression{{}, all, std::move(operands)});
}

ExpressionPtr negated(const ExpressionPtr& expression) {
    if (expression->isLeaf()) {
        Predicate predicate = expression->predicate;
        predicate.op = rowOf(predicate.op).negated;
        return leaf(std::move(predicate));
    }
    std::vector<ExpressionPtr> operands;
    for (const ExpressionPtr& operand : expression->operands) {
        operands.push_back(negated(operand));
    }
    return join(!expression->all, std::move(operands));
}

}  // namespace

class QueryParser {
public:
    explicit QueryParser(const std::string& text) : m_text(text) { advance(); }

    void parseInto(Query& query) {
        expect("SELECT");
        if (!accept("*")) {
            do {
                query.m_projection.push_back(name());
            } while (accept(","));
        }
        expect("FROM");
        query.m_className = name();
        if (accept("WHERE")) {
            query.m_where = disjunction(0);
        }
        if (!m_token.empty()) {
            fail("unexpected '" + m_token + "'");
        }
        query.m_text = m_text;
    }

private:
    [[noreturn]] void fail(const std::string& why) const {
        throw Failure(CMPI_RC_ERR_INVALID_QUERY, why + " in query '" + m_text + "'");
    }

    static bool isWord(char c) {
        return std::isalnum(static_cast<unsigned char>(c)) ||
               std::string("_.:#+-").find(c) != std::string::npos;
    }

    void advance() {
        while (m_at < m_text.size() && std::isspace(static_cast<unsigned char>(m_text[m_at]))) {
            ++m_at;
        }
        const std::size_t from = m_at;
        m_quoted = false;
        if (m_at == m_text.size()) {
            m_token.clear();
        } else if (m_text[m_at] == '"' || m_text[m_at] == '\'') {
            quotedToken();
        } else if (isWord(m_text[m_at])) {
            while (m_at < m_text.size() && isWord(m_text[m_at])) {
                ++m_at;
            }
            m_token = m_text.substr(from, m_at - from);
        } else {
            const std::string two = m_text.substr(m_at, 2);
            const bool wide = two == "<>" || two == "<=" || two == ">=" || two == "!=";
            m_token = m_text.substr(m_at, wide ? 2 : 1);
            m_at += m_token.size();
        }
    }

    void quotedToken() {
        const char quote = m_text[m_at++];
        m_token.clear();
        m_quoted = true;
        for (; m_at < m_text.size() && m_text[m_at] != quote; ++m_at) {
            if (m_text[m_at] == '\\' && m_at + 1 < m_text.size()) {
                ++m_at;
            }
            m_token += m_text[m_at];
        }
        if (m_at == m_text.size()) {
            fail("a quote is not closed");
        }
        ++m_at;
    }

    bool accept(const char* word) {
        if (m_quoted || strcasecmp(m_token.c_str(), word) != 0) {
            return false;
        }
        advance();
        return true;
    }
    void expect(const char* word) {
        if (!accept(word)) {
            fail(std::string(word) + " is missing");
        }
    }
    std::string name() {
        if (m_quoted || m_token.empty() || !isWord(m_token[0])) {
            fail("a name is missing");
        }
        std::string word = m_token;
        advance();
        return word;
    }

    ExpressionPtr disjunction(int depth) {
        std::vector<ExpressionPtr> operands{conjunction(depth)};
        while (accept("OR")) {
            operands.push_back(conjunction(depth));
        }
        return join(false, std::move(operands));
    }
    ExpressionPtr conjunction(int depth) {
        std::vector<ExpressionPtr> operands{factor(depth)};
        while (accept("AND")) {
            operands.push_back(factor(depth));
        }
        return join(true, std::move(operands));
    }
    ExpressionPtr factor(int depth) {
        if (depth > kDeepestNesting) {
            fail("too deep a nesting");
        }
        if (accept("NOT")) {
            return negated(factor(depth + 1));
        }
        if (!accept("(")) {
            return comparison();
        }
        ExpressionPtr inner = disjunction(depth + 1);
        expect(")");
        return inner;
    }

    ExpressionPtr comparison() {
        Predicate predicate;
        const bool literalFirst = isLiteral();
        if (literalFirst) {
            predicate.literal = literal();
        } else {
            predicate.name = name();
        }
        if (!literalFirst && accept("IS")) {
            predicate.op = accept("NOT") ? CMPI_PredOp_Not_Null : CMPI_PredOp_Null;
            expect("NULL");
            return leaf(std::move(predicate));
        }
        const auto row = std::find_if(
            std::begin(kOperators), std::end(kOperators),
            [this](const Operator& each) { return *each.text != '\0' && accept(each.text); });
        if (row == std::end(kOperators)) {
            fail("an operator is missing");
        }
        predicate.op = literalFirst ? row->mirrored : row->op;
        if (literalFirst) {
            predicate.name = name();
        } else if (predicate.op == CMPI_PredOp_Isa && !m_quoted) {
            predicate.literal = Value(name());
        } else {
            predicate.literal = literal();
        }
        return leaf(std::move(predicate));
    }

    bool isLiteral() const {
        return m_quoted ||
               (!m_token.empty() && (std::isdigit(static_cast<unsigned char>(m_token[0])) ||
                                     m_token[0] == '-' || m_token[0] == '+'));
    }
    Value literal() {
        if (accept("true")) {
            return true;
        }
        if (accept("false")) {
            return false;
        }
        if (!isLiteral()) {
            fail("a literal is missing");
        }
        Value value(m_token);
        const bool real = m_token.find_first_of(".eE") != std::string::npos;
        if (!m_quoted && !parseNumber(m_token, real ? CMPI_real64 : CMPI_sint64, value)) {
            fail("'" + m_token + "' is no number");
        }
        advance();
        return value;
    }

    const std::string& m_text;
    std::size_t m_at = 0;
    std::string m_token;  // empty and not quoted: the end
    bool m_quoted = false;
};

std::shared_ptr<const Query> Query::parse(const std::string& text, const std::string& language) {
    if (!containsName({"WQL", "CQL", "CIM:CQL", "DMTF:CQL"}, language)) {
        throw Failure(CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED, "query language " + language);
    }
    auto query = std::make_shared<Query>();
    QueryParser(text).parseInto(*query);
    return query;
}

namespace {

// % for any text, _ for any character.
bool like(const char* text, const char* pattern) {
    const char* retryText = nullptr;
    const char* retryPattern = nullptr;
    while (*text) {
        if (*pattern == '%') {
            retryPattern = ++pattern;
            retryText = text;
        } else if (*pattern == '_' || *pattern == *text) {
            ++pattern;
            ++text;
        } else if (retryPattern) {
            pattern = retryPattern;
            text = ++retryText;
        } else {
            return false;
        }
    }
    while (*pattern == '%') {
        ++pattern;
    }
    return *pattern == '\0';
}

// How a value stands to a literal; 0 when the two cannot be compared.
unsigned compare(const Value& value, const Value& literal) {
    const auto order = [](const auto& a, const auto& b) -> unsigned {
        return a < b ? kBelow : b < a ? kAbove : kEqual;
    };
    if (value.type() == CMPI_string && literal.type() == CMPI_string) {
        return order(strcasecmp(value.text().c_str(), literal.text().c_str()), 0);
    }
    Value mine, other;
    if (value.type() == CMPI_dateTime && literal.convertTo(CMPI_dateTime, other)) {
        return order(value.dateTime().binary(), other.dateTime().binary());
    }
    if (value.type() == CMPI_boolean && literal.type() == CMPI_boolean) {
        return order(value.boolean(), literal.boolean());
    }
    if (value.convertTo(CMPI_sint64, mine) && literal.convertTo(CMPI_sint64, other)) {
        return order(mine.sint(), other.sint());
    }
    if (value.convertTo(CMPI_real64, mine) && literal.convertTo(CMPI_real64, other)) {
        return order(mine.real(), other.real());
    }
    return 0;
}

bool evaluate(const Query::Expression& expression, const Query::Accessor& property,
              const Query::IsA& isA) {
    if (expression.isLeaf()) {
        return holds(expression.predicate, property(expression.predicate.name), isA);
    }
    const auto test = [&](const ExpressionPtr& operand) {
        return evaluate(*operand, property, isA);
    };
    const auto& operands = expression.operands;
    return expression.all ? std::all_of(operands.begin(), operands.end(), test)
                          : std::any_of(operands.begin(), operands.end(), test);
}

// Parts of the normal form; @p outer tells which joint is the outer one.
std::vector<SubCondition> normalize(const Query::Expression& expression, bool outerIsAnd) {
    if (expression.isLeaf()) {
        return {SubCondition{{expression.predicate}}};
    }
    std::vector<SubCondition> parts;
    if (expression.all != outerIsAnd) {
        parts.emplace_back();
    }
    for (const ExpressionPtr& operand : expression.operands) {
        std::vector<SubCondition> more = normalize(*operand, outerIsAnd);
        if (expression.all == outerIsAnd) {
            std::move(more.begin(), more.end(), std::back_inserter(parts));
        } else {
            std::vector<SubCondition> product;
            for (const SubCondition& a : parts) {
                for (const SubCondition& b : more) {
                    product.push_back(a);
                    product.back().predicates.insert(product.back().predicates.end(),
                                                     b.predicates.begin(), b.predicates.end());
                    if (product.size() > kMostParts) {
                        break;
                    }
                }
            }
            parts = std::move(product);
        }
        if (parts.size() > kMostParts) {
            throw Failure(CMPI_RC_ERR_FAILED, "the normal form of the query is too large");
        }
    }
    return parts;
}

}  // namespace

bool holds(const Predicate& predicate, const Value& value, const Query::IsA& isA) {
    if (predicate.op == CMPI_PredOp_Null) {
        return value.isNull();
    }
    if (predicate.op == CMPI_PredOp_Not_Null) {
        return !value.isNull();
    }
    if (value.isNull() || value.isArray()) {
        return false;
    }
    const bool isaOp = predicate.op == CMPI_PredOp_Isa || predicate.op == CMPI_PredOp_NotIsa;
    const bool likeOp = predicate.op == CMPI_PredOp_Like || predicate.op == CMPI_PredOp_NotLike;
    if (isaOp || likeOp) {
        if (predicate.literal.type() != CMPI_string) {
            return false;
        }
        const std::string& right = predicate.literal.text();
        const std::string left = value.type() == CMPI_instance ? value.instance().path.className
                                 : value.type() == CMPI_ref    ? value.reference().className
                                                               : plainText(value);
        const bool yes = isaOp ? isA(left, right) : like(left.c_str(), right.c_str());
        return yes == (predicate.op == CMPI_PredOp_Isa || predicate.op == CMPI_PredOp_Like);
    }
    return (compare(value, predicate.literal) & rowOf(predicate.op).orders) != 0;
}

bool Query::matches(const Accessor& property, const IsA& isA) const {
    return !m_where || evaluate(*m_where, property, isA);
}

Condition Query::normalForm(CMPISelectCondType type) const {
    Condition condition;
    condition.type = type;
    if (m_where) {
        condition.parts = normalize(*m_where, type == CMPI_COND_COD);
    }
    return condition;
}

}  // namespace cimom
