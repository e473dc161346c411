#include "RecordParser.h"

#include <algorithm>
#include <memory>
#include <string>
#include <vector>

namespace {

/// Walks over the fields of one record.
class FieldReader {
public:
    /// @param record  bytes of the record, without its newline
    /// @param pieces  takes the fields with quotes; keeps its buffer from record to record
    FieldReader(std::string_view record, std::string& pieces)
        : m_next(record.data()), m_end(record.data() + record.size()), m_pieces(pieces) {
        m_pieces.clear();
        m_pieces.reserve(record.size());  // so that it stays where fields lie in it
    }

    /// Reads the next field, empty when the record has no more. It lies in the record, or in the
    /// pieces until those are another record's.
    /// @return false when the record ends inside a quoted run
    // Inline by force, for there is one call for each field of a result.
    __attribute__((always_inline)) bool next(std::string_view& field) {
        const char* const begin = m_next;
        const char* const special =
            std::find_if(begin, m_end, [](char c) { return c == ',' || c == '"' || c == '\0'; });
        const auto plain = static_cast<size_t>(special - begin);
        field = {begin, plain};
        m_next = special;
        bool quoted = false;
        if (special != m_end && *special == '"') {
            const size_t start = m_pieces.size();
            m_pieces.append(begin, plain);
            quoted = readQuoted();
            field = std::string_view(m_pieces).substr(start);
        }
        m_hasMore = m_next != m_end;
        m_next += m_hasMore ? 1 : 0;
        return !quoted;
    }

    /// Whether the last field ended before the end of the record, so that one follows it.
    bool hasMore() const { return m_hasMore; }

private:
    /// Reads on up to the end of the field, from its first quote.
    /// @return whether the record ends inside a quoted run
    bool readQuoted() {
        bool quoted = false;
        for (; m_next != m_end; ++m_next) {
            if (*m_next == '"') {
                if (!quoted || m_next + 1 == m_end || m_next[1] != '"') {
                    quoted = !quoted;
                    continue;
                }
                ++m_next;
            } else if (*m_next == '\0' || (*m_next == ',' && !quoted)) {
                break;
            }
            m_pieces += *m_next;
        }
        return quoted;
    }

    const char* m_next;
    const char* m_end;
    bool m_hasMore = true;
    std::string& m_pieces;
};

zemString valueOf(std::string_view field) {
    return zemString(field.data(), static_cast<unsigned>(field.size()));
}

/// What the records of one query have in common.
class RecordMaker {
public:
    RecordMaker(const int* keys, unsigned count) : m_fields(count), m_used(count) {
        auto all = std::make_shared<std::vector<int>>(count);
        for (unsigned i = 0; i < count; ++i) {
            (*all)[i] = keys != nullptr ? keys[i] : static_cast<int>(i);
            // Of a field that is asked for twice, the first value stands.
            m_used[i] = std::find(all->begin(), all->begin() + i, (*all)[i]) == all->begin() + i;
        }
        m_keys = std::move(all);
    }

    /// The record of @p line; null when that ends inside a quoted run. Only fields with a text take
    /// room: tools print lines of many fields of which few have one.
    std::unique_ptr<zemRecordType> make(std::string_view line) {
        FieldReader reader(line, m_pieces);
        unsigned texts = 0;
        for (std::string_view& field : m_fields) {
            if (!reader.next(field)) {
                return nullptr;
            }
            texts += field.empty() ? 0 : 1;
        }
        auto record = std::make_unique<zemRecordType>(texts);
        for (size_t i = 0; i < m_fields.size(); ++i) {
            if (!m_fields[i].empty() && m_used[i]) {
                record->insert((*m_keys)[i], valueOf(m_fields[i]));
            }
        }
        record->insertBlanks(m_keys);
        return record;
    }

private:
    std::shared_ptr<const std::vector<int>> m_keys;
    std::vector<std::string_view> m_fields;
    std::vector<bool> m_used;
    std::string m_pieces;
};

}  // namespace

bool zemParseRecords(std::string_view output, const int* keys, unsigned count,
                     zemRecordSetsType& results) {
    RecordMaker maker(keys, count);
    for (size_t begin = 0; begin < output.size();) {
        const size_t end = std::min(output.find('\n', begin), output.size());
        auto record = maker.make(output.substr(begin, end - begin));
        if (record == nullptr) {
            return false;
        }
        results.addElement(std::move(record));
        begin = end + 1;
    }
    return true;
}

bool zemParseFields(std::string_view record, zemDynamicArray<zemString>& fields) {
    std::string pieces;
    FieldReader reader(record, pieces);
    while (reader.hasMore()) {
        std::string_view field;
        if (!reader.next(field)) {
            return false;
        }
        fields.addElement(std::make_unique<zemString>(valueOf(field)));
    }
    return true;
}
