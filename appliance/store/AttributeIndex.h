/// Finds the row of a table that is about an attribute of a kind of object.
///
///     struct Row { Kinds kinds; const char* names; const char* value; };
///     constexpr Row kRows[] = {{{Kind::Lpar, Kind::Profile}, "mem_mode,sharing_mode", "cap"}};
///     static const AttributeIndex<Row> index(kRows);
///     index.find(Kind::Lpar, "mem_mode")->value;
#ifndef APPLIANCE_ATTRIBUTEINDEX_H
#define APPLIANCE_ATTRIBUTEINDEX_H

#include <array>
#include <string_view>
#include <unordered_map>

#include "Object.h"
#include "Text.h"

namespace appliance {

/// A set of kinds, for a row of a table.
struct Kinds {
    template <typename... Others>
    constexpr Kinds(Kind kind, Others... others)
        : bits(((1U << static_cast<unsigned>(kind)) | ... |
                (1U << static_cast<unsigned>(others)))) {}
    static constexpr Kinds all() {
        Kinds kinds(Kind::Host);
        kinds.bits = ~0U;
        return kinds;
    }
    constexpr bool has(std::size_t kind) const { return (bits >> kind & 1U) != 0; }

    unsigned bits;
};

template <typename Row>
class AttributeIndex {
public:
    /// @param rows  with the set "kinds" and the list "names"; later ones take precedence. Must
    ///              live as long as the index
    template <std::size_t N>
    explicit AttributeIndex(const Row (&rows)[N]) {
        for (const Row& row : rows) {
            for (std::size_t kind = 0; kind < kKinds; ++kind) {
                if (!row.kinds.has(kind)) {
                    continue;
                }
                for (std::string_view name : namesIn(row.names)) {
                    m_rows[kind][name] = &row;
                }
            }
        }
    }

    /// Null when no row is about this attribute.
    const Row* find(Kind kind, std::string_view name) const {
        const auto& rows = m_rows[static_cast<std::size_t>(kind)];
        const auto found = rows.find(name);
        return found == rows.end() ? nullptr : found->second;
    }

private:
    std::array<std::unordered_map<std::string_view, const Row*>, kKinds> m_rows;
};

}  // namespace appliance

#endif
