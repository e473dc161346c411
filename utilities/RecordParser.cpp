#include "RecordParser.h"

#include <algorithm>
#include <memory>
#include <string>

namespace {

/// Walks over the fields of one record.
class FieldReader {
public:
    /// @param record  bytes of the record, without its newline
    /// @param field  receives each field's value, terminated; has room for the whole record
    FieldReader(std::string_view record, char* field)
        : m_next(record.data()), m_end(record.data() + record.size()), m_field(field) {}

    /// Reads the next field, empty when the record has no more.
    /// @return false when the record ends inside a quoted run
    bool next() {
        const char* from = m_next;
        char* to = m_field;
        bool quoted = false;
        for (; from != m_end; ++from) {
            if (*from == '"') {
                if (!quoted || from + 1 == m_end || from[1] != '"') {
                    quoted = !quoted;
                    continue;
                }
                ++from;
            } else if (*from == '\0' || (*from == ',' && !quoted)) {
                break;
            }
            *to++ = *from;
        }
        *to = '\0';
        m_next = from != m_end ? from + 1 : m_end;
        return !quoted;
    }

private:
    const char* m_next;
    const char* m_end;
    char* m_field;
};

}  // namespace

bool zemParseRecords(std::string_view output, const int* keys, unsigned count,
                     zemRecordSetsType& results) {
    std::string field;
    zemString value;  // keeps its buffer from field to field
    for (size_t begin = 0; begin < output.size();) {
        const size_t end = std::min(output.find('\n', begin), output.size());
        field.resize(std::max(field.size(), end - begin + 1));
        FieldReader fields(output.substr(begin, end - begin), field.data());
        auto record = std::make_unique<zemRecordType>(count);
        for (unsigned i = 0; i < count; ++i) {
            if (!fields.next()) {
                return false;
            }
            value = field.c_str();
            record->insert(keys != nullptr ? keys[i] : static_cast<int>(i), value);
        }
        results.addElement(record.get());
        static_cast<void>(record.release());
        begin = end + 1;
    }
    return true;
}
