/// zemGuid: a 128-bit identifier, unique within a host, with the usual text form.
///
/// Made from clock, thread and a random number; it follows none of the RFC 4122 versions.
///
/// Thread-safety: a value belongs to one thread at a time; getNewGuid() may be called by many.
#ifndef GUID_H
#define GUID_H

#include <cstdint>

#include "StringUtils.h"
#include "ZemExport.h"

class ZEM_EXPORT zemGuid {
public:
    /// The zero identifier.
    zemGuid();

    /// Reads hexadecimal digits in groups of 8-4-4-4-12, any case. A text of another length, or
    /// with its dashes elsewhere, and null give zero; of a text with other bytes than hexadecimal
    /// digits the groups before the first such byte count.
    zemGuid(const char* text);

    virtual ~zemGuid();

    /// The text form, in upper case.
    zemString toString() const;

    bool operator==(const zemGuid& other) const;

    /// A fresh identifier: differs between threads, and by random number within one second.
    static zemGuid getNewGuid();

private:
    std::uint64_t m_u64High;
    std::uint64_t m_u64Low;
};

#endif
