// Grammar of MOF: what may stand where, and the declarations that come of it.
//
// All lists recurse on the left, and nothing nests, so the parser's stack stays small whatever
// the input. Words that are keywords only in their place (AS, OF, ...) are names elsewhere.

%require "3.8"
%language "c++"
%define api.namespace {cimom}
%define api.parser.class {MofGrammar}
%define api.value.type variant
%define api.value.automove
%define api.token.constructor
%define api.location.type {MofPlace}
%define parse.error custom
%define parse.lac full
%locations
%parse-param {MofInput& input} {void* scanner}
%lex-param {void* scanner}

%code requires {
#include "MofInput.h"
}

%code {
#include <set>

// Something stands where its first token stands.
#define YYLLOC_DEFAULT(Current, Rhs, N) (Current) = YYRHSLOC(Rhs, (N) ? 1 : 0)

cimom::MofGrammar::symbol_type mofNextToken(void* scanner);
static cimom::MofGrammar::symbol_type yylex(void* scanner) { return mofNextToken(scanner); }

static void setBrackets(cimom::CimType& type, const cimom::CimType& brackets) {
    type.isArray = brackets.isArray;
    type.arraySize = brackets.arraySize;
}
}

%token END 0 "the end of the file"
%token PRAGMA "'#pragma'" CLASS "'class'" REF "'ref'"
%token <std::string> AS "'as'" FLAVOR "'flavor'" INSTANCE "'instance'" OF "'of'"
%token <std::string> QUALIFIER "'qualifier'" SCOPE "'scope'"
%token <std::string> IDENTIFIER "a name" ALIAS "an alias" STRING "a string"
%token <CMPIType> DATATYPE "a type"
%token <MofInteger> INTEGER "an integer"
%token <Value> LITERAL "a literal"
%token BRACKET_OPEN "'['" BRACKET_CLOSE "']'" PAREN_OPEN "'('" PAREN_CLOSE "')'"
%token BRACE_OPEN "'{'" BRACE_CLOSE "'}'" COLON "':'" SEMICOLON "';'" COMMA "','" EQUALS "'='"

%type <std::string> name string
%type <MofClass> superclass
%type <std::vector<MofQualifier>> qualifiers qualifierList
%type <MofQualifier> qualifier flavors flavorList defaultFlavors commaFlavors
%type <std::optional<MofInitializer>> qualifierValue default
%type <MofInitializer> initializer array
%type <std::vector<MofLiteral>> literals literalList
%type <MofLiteral> literal
%type <std::vector<MofFeature>> features
%type <MofFeature> feature
%type <MofParameter> element parameter
%type <std::vector<MofParameter>> parameters parameterList
%type <CimType> type brackets
%type <unsigned> scopes scopeName

%%

mof: %empty | mof production;

production:
    PRAGMA name "'('" literals "')'" { input.pragma(@2, $2, $4); }
  | qualifiers CLASS name alias superclass "'{'" features "'}'" "';'" {
        MofClass declared = $5;
        declared.place = @3;
        declared.name = $3;
        declared.qualifiers = $1;
        declared.features = $7;
        input.declarations().classes.push_back(std::move(declared));
    }
  | qualifiers INSTANCE OF name alias "'{'" members "'}'" "';'"
  | QUALIFIER name "':'" DATATYPE brackets default
        "','" SCOPE "'('" scopes "')'" defaultFlavors "';'" {
        MofQualifierType declared{{$2, $5, $10, $12.flavorsOn}, @2, $6};
        declared.type.type = $4;
        input.declarations().qualifierTypes.push_back(std::move(declared));
    }
;

name: IDENTIFIER | AS | FLAVOR | INSTANCE | OF | QUALIFIER | SCOPE;

alias: %empty | AS ALIAS;

superclass:
    %empty {}
  | "':'" name {
        $$.superclassPlace = @2;
        $$.superclass = $2;
    }
;

// ---- qualifiers

qualifiers:
    %empty {}
  | "'['" qualifierList "']'" { $$ = $2; }
;

qualifierList:
    qualifier { $$.push_back($1); }
  | qualifierList "','" qualifier { $$ = $1; $$.push_back($3); }
;

qualifier: name qualifierValue flavors {
        $$ = $3;
        $$.place = @1;
        $$.name = $1;
        $$.value = $2;
    }
;

qualifierValue:
    %empty {}
  | "'('" literal "')'" { $$ = MofInitializer{@2, false, {$2}}; }
  | array { $$ = $1; }
;

flavors: %empty {} | "':'" flavorList { $$ = $2; };

flavorList:
    name { input.addFlavor(@1, $1, $$); }
  | flavorList name { $$ = $1; input.addFlavor(@2, $2, $$); }
;

defaultFlavors: %empty {} | "','" FLAVOR "'('" commaFlavors "')'" { $$ = $4; };

commaFlavors:
    name { input.addFlavor(@1, $1, $$); }
  | commaFlavors "','" name { $$ = $1; input.addFlavor(@3, $3, $$); }
;

scopes:
    scopeName
  | scopes "','" scopeName { $$ = $1 | $3; }
;

scopeName:
    name { $$ = input.scope(@1, $1); }
  | CLASS { $$ = ScopeClass; }
;

// ---- features

features: %empty {} | features feature { $$ = $1; $$.push_back($2); };

feature:
    element brackets default "';'" {
        static_cast<MofParameter&>($$) = $1;
        setBrackets($$.type, $2);
        if ($$.type.type == CMPI_ref && $$.type.isArray)
            MofInput::fail(@2, "a reference property cannot be an array");
        $$.defaultValue = $3;
    }
  | element "'('" parameters "')'" "';'" {
        static_cast<MofParameter&>($$) = $1;
        if ($$.type.type == CMPI_ref)
            MofInput::fail($$.place, "a method cannot return a reference");
        $$.isMethod = true;
        $$.parameters = $3;
    }
;

element: qualifiers type name {
        $$.place = @3;
        $$.name = $3;
        $$.type = $2;
        $$.qualifiers = $1;
    }
;

type:
    DATATYPE { $$.type = $1; }
  | name REF {
        $$.type = CMPI_ref;
        $$.referenceClass = $1;
    }
;

brackets:
    %empty {}
  | "'['" "']'" { $$.isArray = true; }
  | "'['" INTEGER "']'" {
        $$.isArray = true;
        $$.arraySize = input.arraySize(@2, $2);
    }
;

parameters: %empty {} | parameterList;

parameterList:
    parameter { $$.push_back($1); }
  | parameterList "','" parameter { $$ = $1; $$.push_back($3); }
;

parameter: element brackets {
        $$ = $1;
        setBrackets($$.type, $2);
    }
;

// ---- values

default: %empty {} | "'='" initializer { $$ = $2; };

initializer:
    literal { $$ = MofInitializer{@1, false, {$1}}; }
  | array
;

array: "'{'" literals "'}'" { $$ = MofInitializer{@1, true, $2}; };

literals: %empty {} | literalList;

literalList:
    literal { $$.push_back($1); }
  | literalList "','" literal { $$ = $1; $$.push_back($3); }
;

literal:
    LITERAL { $$ = MofLiteral{@1, $1}; }
  | INTEGER { $$ = MofLiteral{@1, $1}; }
  | string { $$ = MofLiteral{@1, Value($1)}; }
;

string: STRING | string STRING { $$ = $1; $$ += $2; };

// ---- instances, whose values go nowhere

members: %empty | members member;

member: qualifiers name "'='" memberValue "';'";

memberValue: initializer | ALIAS;

%%

namespace cimom {

namespace {

using Kind = MofGrammar::symbol_kind;

// A whole group of expected tokens reads as one word.
struct Group {
    const char* word;
    std::vector<Kind::symbol_kind_type> kinds;
};

const Group kGroups[] = {
    {"a name",
     {Kind::S_IDENTIFIER, Kind::S_AS, Kind::S_FLAVOR, Kind::S_INSTANCE, Kind::S_OF,
      Kind::S_QUALIFIER, Kind::S_SCOPE}},
    {"a value", {Kind::S_STRING, Kind::S_INTEGER, Kind::S_LITERAL}},
};

}  // namespace

void MofGrammar::report_syntax_error(const context& where) const {
    std::vector<symbol_kind_type> kinds(YYNTOKENS);
    const int count = where.expected_tokens(kinds.data(), YYNTOKENS);
    std::set<symbol_kind_type> expected(kinds.begin(), kinds.begin() + count);

    std::vector<std::string> words;
    for (const Group& group : kGroups) {
        if (!std::all_of(group.kinds.begin(), group.kinds.end(),
                         [&](symbol_kind_type kind) { return expected.count(kind) != 0; }))
            continue;
        for (symbol_kind_type kind : group.kinds) expected.erase(kind);
        words.push_back(group.word);
    }
    for (symbol_kind_type kind : expected) words.push_back(symbol_name(kind));

    std::string text = "expected ";
    for (std::size_t i = 0; i < words.size(); ++i) {
        if (i > 0) text += i + 1 < words.size() ? ", " : " or ";
        text += words[i];
    }
    bool atEnd = where.token() == symbol_kind::S_YYEOF;
    text += atEnd ? ", found the end of the file" : ", found '" + input.shownLexeme() + "'";
    MofInput::fail(where.location(), text);
}

void MofGrammar::error(const MofPlace& place, const std::string& text) {
    MofInput::fail(place, text);
}

}  // namespace cimom
