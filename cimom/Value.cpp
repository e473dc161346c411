#include "Value.h"

#include <sys/time.h>

#include <algorithm>
#include <cctype>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <limits>
#include <mutex>
#include <new>

#include "Failure.h"

namespace cimom {

namespace {

constexpr std::size_t kDateTimeLength = 25;
constexpr std::size_t kPointAt = 14;
constexpr std::size_t kSignAt = 21;
constexpr std::size_t kLookedThrough = 64;  // entries
constexpr std::uint64_t kMicrosPerSecond = 1000000;
constexpr std::uint64_t kSecondsPerDay = 86400;

// Start and length of each field, most significant first; bounds hold for written digits.
struct Field {
    std::size_t at;
    std::size_t length;
    unsigned low;
    unsigned high;
};
constexpr Field kTimestampFields[] = {{0, 4, 0, 9999},   {4, 2, 1, 12},  {6, 2, 1, 31},
                                      {8, 2, 0, 23},     {10, 2, 0, 59}, {12, 2, 0, 60},
                                      {15, 6, 0, 999999}};
constexpr Field kIntervalFields[] = {
    {0, 8, 0, 99999999}, {8, 2, 0, 23}, {10, 2, 0, 59}, {12, 2, 0, 59}, {15, 6, 0, 999999}};

bool isDigit(char c) { return c >= '0' && c <= '9'; }

// Value of a field; asterisks give its lowest value.
unsigned fieldValue(const std::string& text, const Field& field) {
    const std::string digits = text.substr(field.at, field.length);
    if (digits.front() == '*') {
        return field.low;
    }
    unsigned value = 0;
    for (char c : digits) {
        value = value * 10 + (c == '*' ? 0U : static_cast<unsigned>(c - '0'));
    }
    return value;
}

template <std::size_t N>
bool validFields(const std::string& text, const Field (&fields)[N]) {
    bool wild = false;  // asterisks go on to the last field once they begin
    for (const Field& field : fields) {
        const std::string part = text.substr(field.at, field.length);
        const std::size_t digits =
            part.find('*') == std::string::npos ? part.size() : part.find('*');
        if (!std::all_of(part.begin(), part.begin() + static_cast<std::ptrdiff_t>(digits),
                         isDigit)) {
            return false;
        }
        if (part.find_first_not_of('*', digits) != std::string::npos) {
            return false;
        }
        // Only microseconds may be cut within the field.
        if (digits != 0 && digits != part.size() && field.length != 6) {
            return false;
        }
        if (wild && digits != 0) {
            return false;
        }
        wild = digits != part.size();
        const unsigned value = fieldValue(text, field);
        if (value < field.low || value > field.high) {
            return false;
        }
    }
    return true;
}

template <class T>
std::shared_ptr<const T> nested(const T& object, unsigned nesting) {
    if (nesting >= Value::kMostNested) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER,
                      "paths and instances lie in one another more than " +
                          std::to_string(Value::kMostNested) + " deep");
    }
    return std::make_shared<const T>(object);
}

// Range check and conversion between the integer representations.
bool integerFits(CMPIType type, bool negative, std::uint64_t magnitude) {
    const unsigned bits = 8U << (type >> 4 & 3);
    if ((type & CMPI_SINT) != CMPI_SINT) {
        return !negative && (bits == 64 || magnitude >> bits == 0);
    }
    const std::uint64_t limit = std::uint64_t{1} << (bits - 1);
    return negative ? magnitude <= limit : magnitude < limit;
}

// Whatever the locale says.
char lower(char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c; }

}  // namespace

bool isInteger(CMPIType type) { return (type & CMPI_UINT) != 0 && (type & ~0x00F0) == 0; }
bool isReal(CMPIType type) { return type == CMPI_real32 || type == CMPI_real64; }

// -- names ----------------------------------------------------------------------------------

bool sameName(std::string_view a, std::string_view b) {
    return a == b || std::equal(a.begin(), a.end(), b.begin(), b.end(),
                                [](char x, char y) { return x == y || lower(x) == lower(y); });
}

std::size_t NameHash::operator()(std::string_view name) const {
    // Eight letters at a time, without the bit in which the two cases differ: every property that a
    // provider sets is looked up in its class.
    constexpr std::uint64_t kCases = 0x2020202020202020, kSpread = 0x9E3779B97F4A7C15;
    std::uint64_t hash = name.size();
    while (!name.empty()) {
        std::uint64_t letters = 0;
        const std::size_t count = std::min(name.size(), sizeof letters);
        std::memcpy(&letters, name.data(), count);
        hash = (hash ^ (letters | kCases)) * kSpread;
        hash ^= hash >> 32;
        name.remove_prefix(count);
    }
    return static_cast<std::size_t>(hash);
}

const std::string& lastingName(std::string_view name) {
    static std::mutex mutex;
    // never destroyed: values may outlive what is static
    static auto& names = *new std::unordered_set<std::string>;
    const std::lock_guard<std::mutex> lock(mutex);
    return *names.emplace(name).first;
}

bool containsName(const std::vector<std::string>& names, const std::string& name) {
    return std::any_of(names.begin(), names.end(),
                       [&](const std::string& each) { return sameName(each, name); });
}

// -- DateTime -------------------------------------------------------------------------------

DateTime::DateTime() : m_text("00000000000000.000000:000") {}

DateTime DateTime::fromBinary(std::uint64_t microseconds, bool interval) {
    const auto micros = static_cast<unsigned>(microseconds % kMicrosPerSecond);
    const std::uint64_t seconds = microseconds / kMicrosPerSecond;
    char text[64];
    if (interval) {
        const std::uint64_t days = std::min<std::uint64_t>(seconds / kSecondsPerDay, 99999999);
        const auto rest = static_cast<unsigned>(seconds % kSecondsPerDay);
        std::snprintf(text, sizeof text, "%08u%02u%02u%02u.%06u:000", static_cast<unsigned>(days),
                      rest / 3600, rest / 60 % 60, rest % 60, micros);
    } else {
        constexpr std::uint64_t kEndOf9999 = 253402300799;
        const auto when = static_cast<time_t>(std::min(seconds, kEndOf9999));
        std::tm utc{};
        gmtime_r(&when, &utc);
        std::snprintf(text, sizeof text, "%04d%02d%02d%02d%02d%02d.%06u+000", utc.tm_year + 1900,
                      utc.tm_mon + 1, utc.tm_mday, utc.tm_hour, utc.tm_min, utc.tm_sec, micros);
    }
    DateTime result;
    result.m_text = text;
    return result;
}

DateTime DateTime::now() {
    timeval tv{};
    gettimeofday(&tv, nullptr);
    return fromBinary(static_cast<std::uint64_t>(tv.tv_sec) * kMicrosPerSecond +
                          static_cast<std::uint64_t>(tv.tv_usec),
                      false);
}

bool DateTime::parse(const std::string& text, DateTime& result) {
    if (text.size() != kDateTimeLength || text[kPointAt] != '.') {
        return false;
    }
    const char sign = text[kSignAt];
    if (!std::all_of(text.begin() + kSignAt + 1, text.end(), isDigit)) {
        return false;
    }
    if (sign == ':') {
        if (text.compare(kSignAt, 4, ":000") != 0 || !validFields(text, kIntervalFields)) {
            return false;
        }
    } else if ((sign != '+' && sign != '-') || !validFields(text, kTimestampFields)) {
        return false;
    }
    result.m_text = text;
    return true;
}

bool DateTime::isInterval() const { return m_text[kSignAt] == ':'; }

std::uint64_t DateTime::binary() const {
    if (isInterval()) {
        constexpr std::uint64_t kOfTheOneBefore[] = {1, 24, 60, 60, kMicrosPerSecond};
        std::uint64_t value = 0;
        for (std::size_t i = 0; i < std::size(kIntervalFields); ++i) {
            value = value * kOfTheOneBefore[i] + fieldValue(m_text, kIntervalFields[i]);
        }
        return value;
    }
    const auto field = [this](std::size_t i) {
        return static_cast<int>(fieldValue(m_text, kTimestampFields[i]));
    };
    std::tm utc{};
    utc.tm_year = field(0) - 1900;
    utc.tm_mon = field(1) - 1;
    utc.tm_mday = field(2);
    utc.tm_hour = field(3);
    utc.tm_min = field(4);
    utc.tm_sec = field(5);
    const long offset = std::strtol(m_text.c_str() + kSignAt, nullptr, 10);
    const std::int64_t seconds = timegm(&utc) - offset * 60;
    if (seconds < 0) {
        return 0;
    }
    return static_cast<std::uint64_t>(seconds) * kMicrosPerSecond +
           static_cast<std::uint64_t>(field(6));
}

// -- Value ----------------------------------------------------------------------------------

Value Value::null(CMPIType type) {
    Value value;
    value.m_type = type;
    return value;
}

Value Value::char16(std::uint16_t unit) {
    Value value(unit);
    value.m_type = CMPI_char16;
    return value;
}

Value Value::real(CMPIType type, double number) {
    Value value(number);
    value.m_type = type;
    return value;
}

Value Value::pointer(CMPIValuePtr area) {
    Value value;
    value.m_type = CMPI_ptr;
    value.m_data = area;
    return value;
}

Value Value::array(CMPIType elementType, Array elements) {
    Value value;
    value.m_type = static_cast<CMPIType>(elementType | CMPI_ARRAY);
    for (Value& element : elements) {
        element.retypeNull(elementType);
    }
    value.m_data = std::move(elements);
    return value;
}

Value::Value(const char* text) : m_type(CMPI_string) {
    if (text) {
        m_data.emplace<std::string>(text);
    }
}
Value::Value(std::string text) : m_data(std::move(text)), m_type(CMPI_string) {}
Value::Value(DateTime when) : m_data(std::move(when)), m_type(CMPI_dateTime) {}
Value::Value(const ObjectPath& path)
    : m_data(nested(path, path.keys.nesting())), m_type(CMPI_ref) {}
Value::Value(const Instance& embedded)
    : m_data(
          nested(embedded, std::max(embedded.path.keys.nesting(), embedded.properties.nesting()))),
      m_type(CMPI_instance) {}

unsigned Value::nesting() const {
    if (isNull()) {
        return 0;
    }
    if (m_type == CMPI_ref) {
        return 1 + reference().keys.nesting();
    }
    if (m_type == CMPI_instance) {
        return 1 + std::max(instance().path.keys.nesting(), instance().properties.nesting());
    }
    unsigned most = 0;
    if (m_type == CMPI_refA || m_type == CMPI_instanceA) {
        for (const Value& element : elements()) {
            most = std::max(most, element.nesting());
        }
    }
    return most;
}

void Value::retypeNull(CMPIType type) {
    if (isNull()) {
        m_type = type;
    }
}

bool Value::convertTo(CMPIType type, Value& result) const {
    if (isNull() || type == m_type) {
        result = *this;
        result.retypeNull(type);
        return true;
    }
    if (isArray() != ((type & CMPI_ARRAY) != 0)) {
        return false;
    }
    if (isArray()) {
        const auto elementType = static_cast<CMPIType>(type & ~CMPI_ARRAY);
        Array converted(elements().size());
        for (std::size_t i = 0; i < converted.size(); ++i) {
            if (!elements()[i].convertTo(elementType, converted[i])) {
                return false;
            }
        }
        result = array(elementType, std::move(converted));
        return true;
    }
    if (isInteger(m_type) || m_type == CMPI_char16) {
        const bool negative = isSigned() && sint() < 0;
        const std::uint64_t raw = isSigned() ? static_cast<std::uint64_t>(sint()) : uint();
        if (isReal(type)) {
            result.m_data = negative ? static_cast<double>(sint()) : static_cast<double>(raw);
        } else if (isInteger(type) && integerFits(type, negative, negative ? ~raw + 1 : raw)) {
            if ((type & CMPI_SINT) == CMPI_SINT) {
                result.m_data = static_cast<std::int64_t>(raw);
            } else {
                result.m_data = raw;
            }
        } else {
            return false;
        }
    } else if (isReal(m_type) && isReal(type)) {
        const double value = real();
        result.m_data =
            type == CMPI_real32 ? static_cast<double>(static_cast<float>(value)) : value;
    } else if (m_type == CMPI_string && type == CMPI_dateTime) {
        DateTime when;
        if (!DateTime::parse(text(), when)) {
            return false;
        }
        result.m_data = when;
    } else {
        return false;
    }
    result.m_type = type;
    return true;
}

bool Value::operator==(const Value& other) const {
    if (m_type != other.m_type || m_data.index() != other.m_data.index()) {
        return false;
    }
    return std::visit(
        [&other](const auto& mine) {
            using T = std::decay_t<decltype(mine)>;
            const T& theirs = std::get<T>(other.m_data);
            if constexpr (std::is_same_v<T, PathPtr> || std::is_same_v<T, InstancePtr>) {
                return *mine == *theirs;
            } else if constexpr (std::is_same_v<T, CMPIValuePtr>) {
                return mine.ptr == theirs.ptr && mine.length == theirs.length;
            } else {
                return mine == theirs;
            }
        },
        m_data);
}

// -- NamedValues, ObjectPath, Instance ------------------------------------------------------

NamedValues::NamedValues(std::initializer_list<Entry> entries) : NamedValues() {
    for (const Entry& entry : entries) {
        set(entry.name, entry.value);
    }
}

NamedValues::NamedValues(const NamedValues& other) : m_block(other.m_block) {
    if (m_block) {
        m_block->users.fetch_add(1, std::memory_order_relaxed);
    }
}

NamedValues::~NamedValues() {
    if (!m_block || m_block->users.fetch_sub(1, std::memory_order_acq_rel) != 1) {
        return;
    }
    std::destroy_n(m_block->entries(), m_block->size);
    m_block->~Block();
    ::operator delete(m_block);
}

// Whether nobody else has the block and so many entries fit.
bool NamedValues::owns(std::size_t room) const {
    return m_block && m_block->users.load(std::memory_order_acquire) == 1 && room <= m_block->room;
}

// Makes a block with room for so many, not less than there are.
void NamedValues::makeOwn(std::size_t room) {
    const bool own = owns(0);
    NamedValues other;
    other.m_block = new (::operator new(sizeof(Block) + room * sizeof(Entry))) Block;
    other.m_block->room = static_cast<std::uint32_t>(room);
    Entry* const entries = other.m_block->entries();
    if (own) {
        std::uninitialized_move_n(m_block->entries(), size(), entries);
    } else {
        std::uninitialized_copy_n(begin(), size(), entries);
    }
    other.m_block->size = static_cast<std::uint32_t>(size());
    other.m_block->nesting = nesting();
    if (room > kLookedThrough) {
        other.m_block->index = std::make_unique<Index>(room);
        for (std::size_t i = 0; i < size(); ++i) {
            other.m_block->index->emplace(entries[i].name, i);
        }
    }
    std::swap(m_block, other.m_block);
}

void NamedValues::reserve(std::size_t count) {
    if (count > size() && !owns(count)) {
        makeOwn(count);
    }
}

void NamedValues::set(std::string_view name, Value&& value) {
    const std::size_t at = indexOf(name);
    if (at == size()) {
        return append(std::move(value), name);
    }
    if (!owns(size())) {
        makeOwn(size());
    }
    m_block->nesting = std::max(m_block->nesting, value.nesting());
    m_block->entries()[at].value = std::move(value);
}

void NamedValues::add(std::string_view name, Value&& value) { append(std::move(value), name); }

void NamedValues::addLasting(const std::string& name, Value&& value) {
    append(std::move(value), Entry::Lasting(), name);
}

/// @param name  the arguments of the constructor in front of the value
template <class... Name>
void NamedValues::append(Value&& value, const Name&... name) {
    if (!owns(size() + 1)) {
        makeOwn(2 * (size() + 1));
    }
    const unsigned nesting = value.nesting();
    Entry* const entry = new (m_block->entries() + m_block->size) Entry(name..., std::move(value));
    ++m_block->size;
    m_block->nesting = std::max(m_block->nesting, nesting);
    if (m_block->index) {
        m_block->index->emplace(entry->name, m_block->size - 1);
    }
}

const Value* NamedValues::find(std::string_view name) const {
    const std::size_t at = indexOf(name);
    return at == size() ? nullptr : &begin()[at].value;
}

// The number of entries when there is none of that name.
std::size_t NamedValues::indexOf(std::string_view name) const {
    if (m_block && m_block->index) {
        const auto found = m_block->index->find(name);
        return found == m_block->index->end() ? size() : found->second;
    }
    return static_cast<std::size_t>(
        std::find_if(begin(), end(),
                     [&](const Entry& entry) { return sameName(entry.name, name); }) -
        begin());
}

bool NamedValues::operator==(const NamedValues& other) const {
    return size() == other.size() && std::all_of(begin(), end(), [&other](const Entry& entry) {
               const Value* twin = other.find(entry.name);
               return twin && *twin == entry.value;
           });
}

bool ObjectPath::operator==(const ObjectPath& other) const {
    return sameName(host, other.host) && sameName(nameSpace, other.nameSpace) &&
           sameName(className, other.className) && keys == other.keys;
}

bool Instance::operator==(const Instance& other) const {
    return path == other.path && properties == other.properties;
}

}  // namespace cimom
