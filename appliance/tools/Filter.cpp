#include "Filter.h"

#include <algorithm>
#include <optional>
#include <unordered_set>

#include "Failure.h"
#include "Rows.h"
#include "Text.h"

namespace appliance {

namespace {

using Words = std::unordered_set<std::string>;

/// One value as it was written: a quoted one is never joined with its neighbours.
struct WrittenValue {
    std::string text;
    bool quoted;
};

struct Item {
    std::string name;
    std::vector<WrittenValue> values;
};

/// What a filter compares. Of a filter that names partitions, a value that names none is a
/// failure: callers must learn that a partition is gone, while an empty answer says that it has
/// nothing of the kind.
struct FilterRule {
    const char* name;
    const char* attribute;
    std::optional<Fault> unknown = {};  ///< of filters that name partitions
};

constexpr FilterRule kRules[] = {
    {"lpar_ids", "lpar_id", Fault::LparIdNotFound},
    {"lpar_names", "lpar_name", Fault::LparNameNotFound},
    {"profile_names", "name"},
    {"sys_names", "sys_name"},
    {"lpar_envs", "lpar_env"},
    {"work_groups", "work_group_id"},
    {"slots", "slot_num"},
    {"pool_ids", "shared_proc_pool_id"},
    {"units", "unit_phys_loc"},
    {"buses", "bus_id"},
    {"drc_indexes", "drc_index"},
    {"io_pools", "slot_io_pool_id"},
    {"event_types", "event_type"},
};

/// The length of "name=" at the start of @p field, 0 when it does not start so.
std::size_t headLength(const std::string& field) {
    const std::size_t end = field.find_first_not_of("abcdefghijklmnopqrstuvwxyz_");
    return end != 0 && end != std::string::npos && field[end] == '=' ? end + 1 : 0;
}

/// Adds what @p text has to @p items.
/// @param outermost  whether a quoted field can hold items of its own
/// @throws Failure BadFilter the first value stands behind no name
void parse(const std::string& text, bool outermost, std::vector<Item>& items) {
    for (std::size_t begin = 0, end = 0; begin < text.size(); begin = end + 1) {
        std::size_t head = 0;
        bool quoted = quotedFieldAt(text, begin, &end);
        // Inside a quoted field, only its beginning names a filter.
        if (!quoted && (begin == 0 || outermost)) {
            head = headLength(text.substr(begin, text.find(',', begin) - begin));
            if (head != 0) {
                items.push_back({text.substr(begin, head - 1), {}});
            }
            begin += head;
            quoted = quotedFieldAt(text, begin, &end);
        }
        if (!quoted) {
            end = std::min(text.find(',', begin), text.size());
        }
        std::string value = text.substr(begin, end - begin);
        if (quoted) {
            value = unquoted(value);
        }
        if (quoted && outermost && head == 0 && headLength(value) != 0) {
            parse(value, false, items);
            continue;
        }
        refuseIf(items.empty(), Fault::BadFilter, {text});
        items.back().values.push_back({std::move(value), quoted});
    }
}

/// The values of @p item, with those runs joined that are one of @p known; values that are not
/// known go to @p strangers.
Words resolve(const Item& item, const Words& known, std::vector<std::string>& strangers) {
    std::size_t longest = 1;
    for (const std::string& word : known) {
        const auto commas = std::count(word.begin(), word.end(), ',');
        longest = std::max(longest, static_cast<std::size_t>(commas) + 1);
    }
    Words chosen;
    for (std::size_t i = 0; i < item.values.size();) {
        std::string run = item.values[i].text;
        std::string best;
        std::size_t taken = 0;
        for (std::size_t n = 1;; ++n) {
            if (known.count(run) != 0) {
                taken = n;
                best = run;
            }
            if (n == longest || i + n == item.values.size()) {
                break;
            }
            if (item.values[i + n - 1].quoted || item.values[i + n].quoted) {
                break;
            }
            run += ',' + item.values[i + n].text;
        }
        if (taken != 0) {
            chosen.insert(std::move(best));
        } else {
            strangers.push_back(item.values[i].text);
        }
        i += std::max<std::size_t>(taken, 1);
    }
    return chosen;
}

/// @param names  of the filters that the resource has
/// @throws Failure UnknownFilter
const FilterRule& ruleFor(const Item& item, const char* names) {
    for (const FilterRule& rule : kRules) {
        if (item.name == rule.name && isListed(names, item.name)) {
            return rule;
        }
    }
    throw Failure(Fault::UnknownFilter, {item.name});
}

/// Every value that the filter's attribute has.
Words valuesOf(const FilterRule& rule, const Hosts& hosts, const std::vector<Row>& rows) {
    Words words;
    if (!rule.unknown) {
        for (const Row& row : rows) {
            words.insert(valueOf(row, rule.attribute));
        }
        return words;
    }
    for (const auto& host : hosts) {
        for (const Object& lpar : host->all(Kind::Lpar)) {
            words.insert(valueOf(rowOf(*host, lpar), rule.attribute));
        }
    }
    return words;
}

}  // namespace

void applyFilter(const std::string& text, const char* names, const Hosts& hosts,
                 std::vector<Row>& rows) {
    std::vector<Item> items;
    parse(text, true, items);
    for (const Item& item : items) {
        const FilterRule& rule = ruleFor(item, names);
        std::vector<std::string> strangers;
        const Words chosen = resolve(item, valuesOf(rule, hosts, rows), strangers);
        if (rule.unknown && !strangers.empty()) {
            throw Failure(*rule.unknown, {strangers.front()});
        }
        keep(rows, [&](const Row& row) { return chosen.count(valueOf(row, rule.attribute)) != 0; });
    }
}

}  // namespace appliance
