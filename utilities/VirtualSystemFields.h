/// How the classes of the model declare their fields: one line a field, which gives the member, its
/// getter and its setter, and behind which stand the field's meaning, source and unit.
///
///     class zemExample {
///         ZEM_TEXT_FIELD(m_LparName, LparName);  ///< user's name; "UserDefinedName"
///         ZEM_TRANSLATED_FIELD(m_CurrProcMode, CurrProcMode);  ///< "ded" or "shared"
///         ZEM_READ_FIELD(m_CurrSharingMode, CurrSharingMode);  ///< the class says how it is set
///         ZEM_FIELD(int, m_slots, Slots);  ///< no text
///
///     public:
///         void setCurrSharingMode(const zemString& procMode, const zemString& sharingMode);
///     };
///
///     ZEM_TRANSLATED_SETTER(zemExample, CurrProcMode, zemProcModeText(value))  // in the source
///
/// Each line may stand anywhere in a class body and leaves its access at private. Members lie in
/// the order of the lines. Texts start empty, flags false and numbers at -1, which says "not
/// known".
#ifndef VIRTUAL_SYSTEM_FIELDS_H
#define VIRTUAL_SYSTEM_FIELDS_H

#include <type_traits>
#include <utility>

#include "StringUtils.h"

/// What a field holds that nobody has set.
template <class Value>
Value zemUnsetField() {
    if constexpr (std::is_arithmetic_v<Value> && !std::is_same_v<Value, bool>) {
        return Value(-1);
    } else {
        return Value();
    }
}

/// The type by which a field's value goes out: a number as itself, all else by reference.
template <class Value>
using zemFieldResult =
    std::conditional_t<std::is_arithmetic_v<Value> || std::is_enum_v<Value>, Value, const Value&>;

/// The member and its getter.
#define ZEM_READ_FIELD_OF(TYPE, MEMBER, NAME)                 \
public:                                                       \
    zemFieldResult<TYPE> get##NAME() const { return MEMBER; } \
                                                              \
private:                                                      \
    TYPE MEMBER = zemUnsetField<TYPE>()

/// A field of any type: member, getter, and a setter that stores what it gets. It takes the value
/// itself: what readers hand over is fresh, and there are thirty fields to a record.
#define ZEM_FIELD(TYPE, MEMBER, NAME)                               \
public:                                                             \
    void set##NAME(TYPE value) { this->MEMBER = std::move(value); } \
    ZEM_READ_FIELD_OF(TYPE, MEMBER, NAME)

/// A text kept as it comes.
#define ZEM_TEXT_FIELD(MEMBER, NAME) ZEM_FIELD(zemString, MEMBER, NAME)

/// A text that can be read; its setter is declared and defined by the class.
#define ZEM_READ_FIELD(MEMBER, NAME) ZEM_READ_FIELD_OF(zemString, MEMBER, NAME)

/// A text made from what the management library tells; ZEM_TRANSLATED_SETTER says how.
#define ZEM_TRANSLATED_FIELD(MEMBER, NAME)  \
public:                                     \
    void set##NAME(const zemString& value); \
    ZEM_READ_FIELD(MEMBER, NAME)

/// The setter of a translated field, in the source: TEXT is what is stored for "value".
#define ZEM_TRANSLATED_SETTER(CLASS, NAME, TEXT) \
    void CLASS::set##NAME(const zemString& value) { m_##NAME = TEXT; }

#endif
