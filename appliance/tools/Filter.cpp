#include "Filter.h"

#include <algorithm>
#include <unordered_set>

#include "Failure.h"
#include "Text.h"

namespace appliance {

namespace {

using Words = std::unordered_set<std::string>;

/// One value as it was written: a quoted one is never joined with its neighbours.
struct Value {
    std::string text;
    bool quoted;
};

struct Item {
    std::string name;
    std::vector<Value> values;
};

/// What a filter compares. Of a filter that names partitions, a value that names none is a
/// failure: callers must learn that a partition is gone, while an empty answer says that it has
/// nothing of the kind.
struct Rule {
    const char* name;
    const char* attribute;
    bool ofLpars = false;
    Fault unknown = Fault::BadFilter;
};

constexpr Rule kRules[] = {
    {"lpar_ids", "lpar_id", true, Fault::LparIdNotFound},
    {"lpar_names", "lpar_name", true, Fault::LparNameNotFound},
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

class Parser {
public:
    explicit Parser(const std::string& text) : m_text(text) {}

    std::vector<Item> parse() {
        readFields(m_text, true);
        return std::move(m_items);
    }

private:
    /// @param outermost  whether a quoted field can be an item of its own
    void readFields(const std::string& text, bool outermost) {
        bool fresh = true;  // the first field must name its filter
        for (std::size_t begin = 0; begin < text.size(); ++begin, fresh = false) {
            std::size_t end = 0;
            if (quotedFieldAt(text, begin, &end)) {
                const std::string content = unquoted(text.substr(begin, end - begin));
                if (outermost && headLength(content) != 0) {
                    readFields(content, false);
                } else {
                    add(content, true);
                }
                begin = end;
                continue;
            }
            const std::size_t head =
                fresh || outermost ? headLength(text.substr(begin, text.find(',', begin) - begin))
                                   : 0;
            if (head != 0) {
                m_items.push_back({text.substr(begin, head - 1), {}});
                begin += head;
            }
            begin = readValue(text, begin);
        }
    }

    /// @return the position of the comma behind the value, or the end of the text
    std::size_t readValue(const std::string& text, std::size_t begin) {
        std::size_t end = 0;
        if (quotedFieldAt(text, begin, &end)) {
            add(unquoted(text.substr(begin, end - begin)), true);
            return end;
        }
        end = std::min(text.find(',', begin), text.size());
        add(text.substr(begin, end - begin), false);
        return end;
    }

    void add(std::string value, bool quoted) {
        if (m_items.empty()) throw Failure(Fault::BadFilter, {m_text});
        m_items.back().values.push_back({std::move(value), quoted});
    }

    const std::string& m_text;
    std::vector<Item> m_items;
};

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
            if (n == longest || i + n == item.values.size()) break;
            if (item.values[i + n - 1].quoted || item.values[i + n].quoted) break;
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
const Rule& ruleFor(const Item& item, const std::vector<std::string>& names) {
    if (std::find(names.begin(), names.end(), item.name) != names.end()) {
        for (const Rule& rule : kRules) {
            if (item.name == rule.name) return rule;
        }
    }
    throw Failure(Fault::UnknownFilter, {item.name});
}

/// Every value that the filter's attribute has.
Words valuesOf(const Rule& rule, const Hosts& hosts, const std::vector<Row>& rows) {
    Words words;
    if (!rule.ofLpars) {
        for (const Row& row : rows) words.insert(valueOf(row, rule.attribute));
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
    const std::vector<std::string> known = split(names);
    for (const Item& item : Parser(text).parse()) {
        const Rule& rule = ruleFor(item, known);
        std::vector<std::string> strangers;
        const Words chosen = resolve(item, valuesOf(rule, hosts, rows), strangers);
        if (rule.ofLpars && !strangers.empty()) throw Failure(rule.unknown, {strangers.front()});
        const auto isOther = [&](const Row& row) {
            return chosen.count(valueOf(row, rule.attribute)) == 0;
        };
        rows.erase(std::remove_if(rows.begin(), rows.end(), isOther), rows.end());
    }
}

}  // namespace appliance
