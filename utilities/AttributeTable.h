/// The field names of a tool, and the numbers by which code names the fields.
///
/// A list names each field once, with its enumerator, and makes both the enumeration and the table
/// of names, in which the enumerator is the position. A query's list of wanted fields ends in
/// ATTR_END, and records are keyed by the enumerators.
///
///     #define MY_FIELDS(X) X(LPAR_ID, "lpar_id") X(STATE, "state")
///     ZEM_ATTRIBUTE_TABLE(PartitionAttribute, MY_FIELDS);
///     #undef MY_FIELDS
///
///     PartitionAttribute::m_attributeName[PartitionAttribute::ATTR_STATE]  // "state"
///
/// Constants only; any thread may read them.
#ifndef ATTRIBUTE_TABLE_H
#define ATTRIBUTE_TABLE_H

/// What follows the prefix of an enumerator, and the field's name as the tool has it.
#define ZEM_ATTRIBUTE_ENUMERATOR(ENUMERATOR, NAME) ATTR_##ENUMERATOR,
#define ZEM_ATTRIBUTE_NAME(ENUMERATOR, NAME) NAME,

/// Defines the struct STRUCT with the enumeration Attribute and the names m_attributeName.
#define ZEM_ATTRIBUTE_TABLE(STRUCT, LIST)                                                  \
    struct STRUCT {                                                                        \
        enum Attribute { ATTR_END = -1, LIST(ZEM_ATTRIBUTE_ENUMERATOR) };                  \
        static constexpr const char* const m_attributeName[] = {LIST(ZEM_ATTRIBUTE_NAME)}; \
    }

/// A table of names as an argument. The default is the empty table, of resources without fields.
struct zemAttributeNames {
    const char* const* names = nullptr;
    unsigned count = 0;

    constexpr zemAttributeNames() = default;
    constexpr zemAttributeNames(const char* const* table, unsigned n) : names(table), count(n) {}
    template <unsigned N>
    constexpr zemAttributeNames(const char* const (&table)[N]) : names(table), count(N) {}

    /// The first @p n rows alone.
    constexpr zemAttributeNames first(unsigned n) const { return {names, n}; }
};

#endif
