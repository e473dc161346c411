#include "RecordParser.h"

#include <algorithm>
#include <memory>
#include <string>

namespace {

/// Walks over the fields of one record.
class FieldReader {
public:
    /// @param record  bytes of the record, without its newline
    /// @param pieces  room for fields with quotes; keeps its buffer from record to record
    FieldReader(std::string_view record, std::string& pieces)
        : m_next(record.data()), m_end(record.data() + record.size()), m_pieces(pieces) {}

    /// Reads the next field, empty when the record has no more.
    /// @return false when the record ends inside a quoted run
    bool next(std::string_view& field) {
        const char* const begin = m_next;
        const char* const special =
            std::find_if(begin, m_end, [](char c) { return c == ',' || c == '"' || c == '\0'; });
        const auto plain = static_cast<size_t>(special - begin);
        field = {begin, plain};
        m_next = special;
        bool quoted = false;
        if (special != m_end && *special == '"') {
            m_pieces.assign(begin, plain);
            quoted = readQuoted();
            field = m_pieces;
        }
        m_next = m_next != m_end ? m_next + 1 : m_end;
        return !quoted;
    }

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
    std::string& m_pieces;
};

}  // namespace

bool zemParseRecords(std::string_view output, const int* keys, unsigned count,
                     zemRecordSetsType& results) {
    std::string pieces;
    for (size_t begin = 0; begin < output.size();) {
        const size_t end = std::min(output.find('\n', begin), output.size());
        FieldReader fields(output.substr(begin, end - begin), pieces);
        auto record = std::make_unique<zemRecordType>(count);
        for (unsigned i = 0; i < count; ++i) {
            std::string_view field;
            if (!fields.next(field)) {
                return false;
            }
            const auto size = static_cast<unsigned>(field.size());
            record->insert(keys != nullptr ? keys[i] : static_cast<int>(i),
                           size != 0 ? zemString(field.data(), size) : zemString());
        }
        results.addElement(record.get());
        static_cast<void>(record.release());
        begin = end + 1;
    }
    return true;
}
