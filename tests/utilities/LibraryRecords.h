/// Answers of the management library, made by hand.
#pragma once

#include <memory>
#include <sstream>
#include <string>
#include <vector>

#include "LibrarySpy.h"

/// Fills a record from "name=value" with ";" between them.
inline void fillRecord(apiProp& record, const std::string& properties) {
    std::istringstream all(properties);
    for (std::string one; std::getline(all, one, ';');) {
        const size_t equals = one.find('=');
        one.copy(record.name[record.propertyCount], equals);
        one.copy(record.value[record.propertyCount++], one.size(), equals + 1);
    }
}

/// A record of its own.
inline std::unique_ptr<apiProp> object(const std::string& properties) {
    auto record = std::make_unique<apiProp>();
    fillRecord(*record, properties);
    return record;
}

/// Lets all calls answer with these objects until the end of the scope.
class LibraryAnswer {
public:
    explicit LibraryAnswer(const std::vector<std::string>& objects)
        : m_records(new apiProp[objects.size() + 1]()) {
        m_records[0].objCount = static_cast<int>(objects.size()) + 1;
        for (size_t i = 0; i < objects.size(); ++i) {
            fillRecord(m_records[i + 1], objects[i]);
        }
        librarySpy.answer = m_records.get();
    }
    ~LibraryAnswer() { librarySpy.answer = nullptr; }
    LibraryAnswer(const LibraryAnswer&) = delete;
    LibraryAnswer& operator=(const LibraryAnswer&) = delete;

private:
    std::unique_ptr<apiProp[]> m_records;
};
