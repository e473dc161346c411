#include "Show.h"

#include <algorithm>

#include "Text.h"
#include "View.h"

namespace appliance {

namespace {

using Line = std::vector<std::string>;

constexpr const char* kColumns[] = {"name",           "lpar_env", "state",
                                    "run_proc_units", "run_mem",  "curr_profile"};

std::string table(const std::vector<Line>& lines) {
    std::vector<std::size_t> widths(lines.front().size(), 0);
    for (const Line& line : lines) {
        for (std::size_t i = 0; i < line.size(); ++i) {
            widths[i] = std::max(widths[i], characters(line[i]));
        }
    }
    std::string text;
    for (const Line& line : lines) {
        text += "   ";
        for (std::size_t i = 0; i < line.size(); ++i) {
            text += ' ' + line[i];
            if (i + 1 < line.size()) {
                text.append(widths[i] - characters(line[i]) + 1, ' ');
            }
        }
        text += '\n';
    }
    return text;
}

std::string overview(const HostView& view) {
    const Row row{&view, &view.host()};
    const auto& lpars = view.all(Kind::Lpar);
    std::string text = view.host().get("name") + " (" + view.mtms() + ")  " +
                       view.host().get("state") + "\n    " + std::to_string(lpars.size()) +
                       " partitions, free: " + valueOf(row, "pend_avail_sys_proc_units") + " of " +
                       valueOf(row, "configurable_sys_proc_units") + " processing units, " +
                       valueOf(row, "pend_avail_sys_mem") + " of " +
                       valueOf(row, "configurable_sys_mem") + " MB\n";
    if (lpars.empty()) {
        return text;
    }
    std::vector<Line> lines = {
        {"id", "name", "environment", "state", "processors", "memory", "profile"}};
    for (const Object& lpar : lpars) {
        lines.push_back({lpar.get("lpar_id")});
        for (const char* column : kColumns) {
            lines.back().push_back(lpar.get(column));
        }
    }
    return text + table(lines);
}

}  // namespace

std::string showText(Store& store) {
    std::string text;
    for (const auto& view : allHosts(store)) {
        text += overview(*view);
    }
    return text;
}

}  // namespace appliance
