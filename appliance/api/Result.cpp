#include "Result.h"

#include <sys/mman.h>
#include <unistd.h>

#include <cstring>
#include <new>
#include <stdexcept>
#include <utility>

namespace appliance {

namespace {

/// In front of the header lies one page that holds the length of the mapping: the caller may write
/// to the records, and gives nothing but the header back.
std::size_t prefixSize() {
    static const auto size = static_cast<std::size_t>(sysconf(_SC_PAGESIZE));
    return size;
}

/// The bytes of entry @p index of the table that begins at @p table bytes of the record.
char* entry(apiProp* record, std::size_t table, std::size_t index) {
    return reinterpret_cast<char*>(record) + table + index * API_TEXT_SIZE;
}

}  // namespace

Result::Result(std::size_t most) {
    // Pages come into being, zeroed, when they are first written to. Large ones would bring the
    // empty parts of the tables with them.
    const std::size_t size = prefixSize() + (most + 1) * sizeof(apiProp);
    void* mapping = mmap(nullptr, size, PROT_READ | PROT_WRITE,
                         MAP_PRIVATE | MAP_ANONYMOUS | MAP_NORESERVE, -1, 0);
    if (mapping == MAP_FAILED) {
        throw std::bad_alloc();
    }
    madvise(mapping, size, MADV_NOHUGEPAGE);
    std::memcpy(mapping, &size, sizeof size);
    m_header = reinterpret_cast<apiProp*>(static_cast<char*>(mapping) + prefixSize());
    m_header->objCount = 1;
}

Result::~Result() { free(m_header); }

void Result::addObject(int classType) { m_header[m_header->objCount++].classType = classType; }

void Result::put(const std::string& key, const std::string& value) {
    apiProp* record = &m_header[m_header->objCount - 1];
    const auto index = static_cast<std::size_t>(record->propertyCount);
    const std::size_t entries = value.size() / API_TEXT_SIZE + 1;
    if (index + entries > API_MAX_PROPERTIES || key.size() >= API_TEXT_SIZE) {
        throw std::length_error(key);
    }
    std::memcpy(entry(record, offsetof(apiProp, name), index), key.data(), key.size());
    std::memcpy(entry(record, offsetof(apiProp, value), index), value.data(), value.size());
    record->propertyCount += static_cast<int>(entries);
}

apiProp* Result::release(int rc) {
    m_header->rc = rc;
    return std::exchange(m_header, nullptr);
}

void Result::free(apiProp* header) {
    if (header == nullptr) {
        return;
    }
    char* mapping = reinterpret_cast<char*>(header) - prefixSize();
    std::size_t size = 0;
    std::memcpy(&size, mapping, sizeof size);
    munmap(mapping, size);
}

}  // namespace appliance
