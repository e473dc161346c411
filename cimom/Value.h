/// The values of CIM: scalars, date-times, object paths, instances and arrays of these.
///
/// One model for the whole object manager. The C objects that a provider sees (CMPIInstance,
/// CMPIObjectPath, ...) are handles on these; what a Server answers is made of these.
/// All types are plain values: a change to one is seen in no copy of it.
/// Thread-safety: that of standard containers.
#ifndef CIMOM_VALUE_H
#define CIMOM_VALUE_H

#include <atomic>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <tuple>
#include <type_traits>
#include <unordered_map>
#include <unordered_set>
#include <utility>
#include <variant>
#include <vector>

#include "cmpidt.h"

namespace cimom {

struct ObjectPath;
struct Instance;

/// True when both are equal but for the case of ASCII letters, as names are in CIM.
bool sameName(std::string_view a, std::string_view b);
bool containsName(const std::vector<std::string>& names, const std::string& name);

/// For containers by name.
struct NameEqual {
    bool operator()(std::string_view a, std::string_view b) const { return sameName(a, b); }
};
struct NameHash {
    std::size_t operator()(std::string_view name) const;
};
using NameSet = std::unordered_set<std::string, NameHash, NameEqual>;

/// The text, which lasts as long as the process. For names of which there are few, as the
/// properties of the classes that have been loaded.
const std::string& lastingName(std::string_view name);

bool isInteger(CMPIType type);
bool isReal(CMPIType type);

/// A point in time or an interval, held in the 25-character text form of CIM:
/// "yyyymmddhhmmss.mmmmmmsutc" or "ddddddddhhmmss.mmmmmm:000".
class DateTime {
public:
    /// The interval of length zero.
    DateTime();
    /// @param microseconds  since 1970-01-01 UTC, or the length of the interval
    static DateTime fromBinary(std::uint64_t microseconds, bool interval);
    static DateTime now();
    /// @return false, leaving @p result, unless @p text has one of the two forms; digits may be
    ///         replaced by asterisks from the right, field by field
    static bool parse(const std::string& text, DateTime& result);

    const std::string& text() const { return m_text; }
    bool isInterval() const;
    /// Microseconds as in fromBinary; fields of asterisks count as their lowest value.
    std::uint64_t binary() const;
    bool operator==(const DateTime& other) const { return m_text == other.m_text; }

private:
    std::string m_text;
};

/// One CIM value with its CMPI type; null values have a type too.
///
/// Strings are always of type CMPI_string, whichever way they came. An array has the type of its
/// elements with CMPI_ARRAY; each element is a Value of the element type and may be null.
class Value {
public:
    using Array = std::vector<Value>;

    /// A null without a type (CMPI_null).
    Value() = default;
    static Value null(CMPIType type);
    static Value char16(std::uint16_t unit);
    /// A number as it stands, even one that a CMPI_real32 has to round.
    static Value real(CMPIType type, double number);
    /// A raw memory area, as context entries may hold; the memory is not owned.
    static Value pointer(CMPIValuePtr area);
    /// @param elementType  without CMPI_ARRAY
    static Value array(CMPIType elementType, Array elements);

    /// From the C++ types that CIM has: bool, integers by width and sign, float, double.
    template <class T, class = std::enable_if_t<std::is_arithmetic_v<T>>>
    Value(T v) : m_type(typeOf<T>()) {  // NOLINT: a value reads as one
        if constexpr (std::is_same_v<T, bool>) {
            m_data = v;
        } else if constexpr (std::is_floating_point_v<T>) {
            m_data = static_cast<double>(v);
        } else if constexpr (std::is_signed_v<T>) {
            m_data = static_cast<std::int64_t>(v);
        } else {
            m_data = static_cast<std::uint64_t>(v);
        }
    }
    Value(const char* text);  // NOLINT
    Value(std::string text);  // NOLINT
    Value(DateTime when);     // NOLINT
    /// @throws Failure CMPI_RC_ERR_INVALID_PARAMETER when it holds others more than kMostNested
    ///         deep: whatever walks through values calls itself once a level
    Value(const ObjectPath& path);    // NOLINT
    Value(const Instance& embedded);  // NOLINT
    static constexpr unsigned kMostNested = 50;

    CMPIType type() const { return m_type; }
    bool isNull() const { return m_data.index() == 0; }
    bool isArray() const { return (m_type & CMPI_ARRAY) != 0; }
    /// Whether it is an integer with a sign.
    bool isSigned() const { return (m_type & CMPI_SINT) == CMPI_SINT; }
    /// How deep paths and instances lie in one another here; 0 for a value without one.
    unsigned nesting() const;
    /// Gives a null its type; a value keeps its own.
    void retypeNull(CMPIType type);

    /// The getters require the matching type and a value: std::bad_variant_access otherwise.
    bool boolean() const { return std::get<bool>(m_data); }
    std::uint64_t uint() const { return std::get<std::uint64_t>(m_data); }
    std::int64_t sint() const { return std::get<std::int64_t>(m_data); }
    double real() const { return std::get<double>(m_data); }
    const std::string& text() const { return std::get<std::string>(m_data); }
    const DateTime& dateTime() const { return std::get<DateTime>(m_data); }
    const ObjectPath& reference() const { return *std::get<PathPtr>(m_data); }
    const Instance& instance() const { return *std::get<InstancePtr>(m_data); }
    const CMPIValuePtr& pointer() const { return std::get<CMPIValuePtr>(m_data); }
    const Array& elements() const { return std::get<Array>(m_data); }

    /// This value as a value of another type, where nothing is lost: integers that fit, a
    /// text that is a date-time, and the like.
    /// @return false, leaving @p result, when there is no such value
    bool convertTo(CMPIType type, Value& result) const;

    /// Equal in type and content; paths and instances are compared member by member.
    bool operator==(const Value& other) const;
    bool operator!=(const Value& other) const { return !(*this == other); }

private:
    using PathPtr = std::shared_ptr<const ObjectPath>;
    using InstancePtr = std::shared_ptr<const Instance>;

    template <class T>
    static constexpr CMPIType typeOf() {
        if (std::is_same_v<T, bool>) {
            return CMPI_boolean;
        }
        if (std::is_floating_point_v<T>) {
            return sizeof(T) == 4 ? CMPI_real32 : CMPI_real64;
        }
        constexpr CMPIType bySize[] = {CMPI_uint8, CMPI_uint16, CMPI_uint32, CMPI_uint64,
                                       CMPI_sint8, CMPI_sint16, CMPI_sint32, CMPI_sint64};
        const int width = sizeof(T) == 1 ? 0 : sizeof(T) == 2 ? 1 : sizeof(T) == 4 ? 2 : 3;
        return bySize[width + (std::is_signed_v<T> ? 4 : 0)];
    }

    // The type finds room in what the variant leaves free at its end.
    [[no_unique_address]] std::variant<std::monostate, bool, std::uint64_t, std::int64_t, double,
                                       std::string, DateTime, PathPtr, InstancePtr, CMPIValuePtr,
                                       Array>
        m_data;
    CMPIType m_type = CMPI_null;
};

/// Values by name, in the order in which they came; names that were set differ by more than case.
/// The keys of a path, the properties of an instance, the arguments of a method, the entries
/// of a context.
class NamedValues {
public:
    /// A name and its value, which can be bound as such: const auto& [name, value]. The properties
    /// of thousands of instances have the same names: they refer to one that lasts.
    class Entry {
    public:
        Entry(std::string_view text, Value&& v)
            : name(*new std::string(text)), value(std::move(v)), m_ownsName(true) {}
        Entry(std::string_view text, const Value& v) : Entry(text, Value(v)) {}
        struct Lasting {};
        Entry(Lasting, const std::string& lasting, Value&& v)
            : name(lasting), value(std::move(v)), m_ownsName(false) {}
        Entry(const Entry& other) : Entry(other, Value(other.value)) {}
        Entry(Entry&& other) noexcept
            : name(other.name),
              value(std::move(other.value)),
              m_ownsName(std::exchange(other.m_ownsName, false)) {}
        Entry& operator=(const Entry&) = delete;
        ~Entry() {
            if (m_ownsName) {
                delete &name;
            }
        }

        const std::string& name;
        [[no_unique_address]] Value value;

    private:
        Entry(const Entry& other, Value&& copy)
            : name(other.m_ownsName ? *new std::string(other.name) : other.name),
              value(std::move(copy)),
              m_ownsName(other.m_ownsName) {}

        bool m_ownsName;  // finds room in what the value leaves free at its end
    };

    NamedValues() = default;
    NamedValues(std::initializer_list<Entry> entries);
    NamedValues(const NamedValues& other);
    NamedValues(NamedValues&& other) noexcept : m_block(std::exchange(other.m_block, nullptr)) {}
    NamedValues& operator=(NamedValues other) noexcept {
        std::swap(m_block, other.m_block);
        return *this;
    }
    ~NamedValues();

    /// Makes room for so many values in all.
    void reserve(std::size_t count);
    /// Replaces the value of that name, or appends.
    void set(std::string_view name, Value&& value);
    void set(std::string_view name, const Value& value) { set(name, Value(value)); }
    /// Appends, even to a value of that name: what a client sends may be wrong, and small servers
    /// leave it to the provider to say so. find() and set() know the first.
    void add(std::string_view name, Value&& value);
    void add(std::string_view name, const Value& value) { add(name, Value(value)); }
    /// The same with a name that lasts.
    void addLasting(const std::string& name, Value&& value);
    /// @return null when there is none; valid until the next change
    const Value* find(std::string_view name) const;

    std::size_t size() const { return m_block ? m_block->size : 0; }
    /// The most that a value here has, or had before it was replaced.
    unsigned nesting() const { return m_block ? m_block->nesting : 0; }
    bool empty() const { return size() == 0; }
    const Entry* begin() const { return m_block ? m_block->entries() : nullptr; }
    const Entry* end() const { return begin() + size(); }

    /// Same names and values, in any order.
    bool operator==(const NamedValues& other) const;

private:
    // Copies share a block until one of them changes, for what a provider made and what the
    // client is answered are mostly the same. The entries lie behind the head of the block. Few
    // are looked through; many have an index, of the first of each name.
    using Index = std::unordered_map<std::string_view, std::size_t, NameHash, NameEqual>;
    struct alignas(Entry) Block {
        Entry* entries() { return reinterpret_cast<Entry*>(this + 1); }

        std::atomic<std::uint32_t> users{1};
        std::uint32_t size = 0;
        std::uint32_t room = 0;
        std::uint32_t nesting = 0;
        std::unique_ptr<Index> index;
    };
    bool owns(std::size_t room) const;
    void makeOwn(std::size_t room);
    template <class... Name>
    void append(Value&& value, const Name&... name);
    std::size_t indexOf(std::string_view name) const;

    Block* m_block = nullptr;
};

/// The name of a class or, with keys, of an instance.
struct ObjectPath {
    std::string host;
    std::string nameSpace;
    std::string className;
    NamedValues keys;

    ObjectPath() = default;
    ObjectPath(std::string ns, std::string cls, NamedValues bindings = {})
        : nameSpace(std::move(ns)), className(std::move(cls)), keys(std::move(bindings)) {}

    /// Names compare without case; the host counts.
    bool operator==(const ObjectPath& other) const;
};

struct Instance {
    ObjectPath path;
    NamedValues properties;

    Instance() = default;
    explicit Instance(ObjectPath p, NamedValues values = {})
        : path(std::move(p)), properties(std::move(values)) {}

    bool operator==(const Instance& other) const;
};

template <std::size_t I>
const auto& get(const NamedValues::Entry& entry) {
    if constexpr (I == 0) {
        return entry.name;
    } else {
        return entry.value;
    }
}

}  // namespace cimom

template <>
struct std::tuple_size<cimom::NamedValues::Entry> : std::integral_constant<std::size_t, 2> {};
template <>
struct std::tuple_element<0, cimom::NamedValues::Entry> {
    using type = const std::string;
};
template <>
struct std::tuple_element<1, cimom::NamedValues::Entry> {
    using type = const cimom::Value;
};

#endif
