#include "Rows.h"

#include "Failure.h"
#include "Text.h"

namespace appliance {

namespace {

constexpr std::time_t kHour = 3'600;
constexpr std::time_t kKept = 168 * kHour;  ///< samples are kept for a week

/// The moment that --<edge>year and its like name, or @p absent without a year.
std::time_t moment(const Request& request, const std::string& edge, std::time_t absent) {
    const auto part = [&](const char* unit, std::int64_t least, std::int64_t most) {
        const std::string option = "--" + edge + unit;
        return static_cast<int>(request.number(option.c_str(), least, most, least));
    };
    std::tm parts{};
    parts.tm_mon = part("month", 1, 12) - 1;
    parts.tm_mday = part("day", 1, 31);
    parts.tm_hour = part("hour", 0, 23);
    parts.tm_year = part("year", 1970, 9999) - 1900;
    return request.has(("--" + edge + "year").c_str()) ? timegm(&parts) : absent;
}

/// The moments at which a host with this rate of seconds has samples, newest first.
std::vector<std::time_t> sampleTimes(const Request& request, std::time_t rate) {
    const std::time_t now = std::time(nullptr);
    const std::time_t end = std::min(moment(request, "end", now), now);
    const std::time_t start = std::max(moment(request, "start", end - kHour), now - kKept);
    const auto most = static_cast<std::size_t>(request.number("-n", 1, 1'000'000, 1'000'000));
    std::vector<std::time_t> times;
    if (rate <= 0) {
        return times;
    }
    for (std::time_t time = end - end % rate; time >= start && times.size() < most; time -= rate) {
        times.push_back(time);
    }
    return times;
}

std::vector<Row> samples(const std::vector<Row>& objects, const Request& request) {
    std::vector<Row> rows;
    for (auto first = objects.begin(); first != objects.end();) {
        const HostView* host = first->view;
        const auto last =
            std::find_if(first, objects.end(), [&](const Row& row) { return row.view != host; });
        for (std::time_t time : sampleTimes(request, number(host->host().get("sample_rate")))) {
            for (auto object = first; object != last; ++object) {
                rows.push_back(*object);
                rows.back().time = time;
            }
        }
        first = last;
    }
    return rows;
}

}  // namespace

std::vector<Row> eachHost(const Hosts& hosts, const Request&) {
    std::vector<Row> rows;
    for (const auto& view : hosts) {
        rows.push_back({view.get(), &view->host()});
    }
    return rows;
}

std::vector<Row> hostCapacity(const Hosts& hosts, const Request& request) {
    constexpr std::int64_t kMost = 1LL << 40;
    request.number("--procunits", 1, kMost, 0);
    std::vector<Row> rows = eachHost(hosts, request);
    for (Row& row : rows) {
        row.maxMem = request.number("--maxmem", 1, kMost, 0);
    }
    return rows;
}

std::vector<Row> taggedLpars(const Hosts& hosts, const Request& request) {
    std::vector<Row> rows = each<Kind::Lpar>(hosts, request);
    keep(rows, [](const Row& row) { return row.lpar->get("lpar_env") == "osq00"; });
    return rows;
}

std::vector<Row> hostSamples(const Hosts& hosts, const Request& request) {
    return samples(eachHost(hosts, request), request);
}

std::vector<Row> lparSamples(const Hosts& hosts, const Request& request) {
    return samples(each<Kind::Lpar>(hosts, request), request);
}

std::vector<Row> theAppliance(const Hosts& hosts, const Request& request) {
    std::vector<Row> rows = eachHost(hosts, request);
    if (rows.size() > 1) {
        rows.resize(1);
    }
    return rows;
}

std::vector<Row> singleHostManager(const Hosts& hosts, const Request& request) {
    if (hosts.size() == 1) {
        for (const Row& row : each<Kind::Lpar>(hosts, request)) {
            if (row.lpar->get("lpar_env") == "xbrgserver") {
                return {row};
            }
        }
    }
    throw Failure(Fault::NoSingleHostManager);
}

std::vector<Row> dynamicLpars(const Hosts& hosts, const Request& request) {
    refuseIf(!request.has("-dlpar"), Fault::MissingOption, {"-dlpar"});
    return each<Kind::Lpar>(hosts, request);
}

std::vector<Row> ioServer(const Hosts& hosts, const Request& request) {
    for (const char* option : {"-m", "--id"}) {
        refuseIf(request.value(option).empty(), Fault::MissingOption, {option});
    }
    const std::string id = request.value("--id");
    const HostView& host = *hosts.front();
    const Object* lpar = host.lpar(request.number("--id", 1, 65'535, 0));
    refuseIf(lpar == nullptr, Fault::LparIdNotFound, {id});
    refuseIf(lpar->get("lpar_env") != "xbrgserver", Fault::NotIoServer, {id});
    refuseIf(lpar->get("state") != "Running", Fault::LparNotRunning, {id});
    return {rowOf(host, *lpar)};
}

std::vector<Row> ioServerMappings(const Hosts& hosts, const Request& request) {
    const Object* server = ioServer(hosts, request).front().lpar;
    std::vector<Row> rows = each<Kind::VirtualScsi>(hosts, request);
    keep(rows, [&](const Row& row) {
        return row.lpar == server && row.self->get("adapter_type") == "server";
    });
    return rows;
}

}  // namespace appliance
