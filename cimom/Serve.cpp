#include "Serve.h"

#include <arpa/inet.h>
#include <malloc.h>

#include <fstream>
#include <mutex>
#include <sstream>

#include "CimXmlService.h"
#include "EndSignals.h"
#include "Failure.h"
#include "HttpServer.h"
#include "Interop.h"
#include "Passwords.h"

namespace cimom {

namespace {

constexpr std::uint16_t kPort = 5988;
constexpr std::uint16_t kTlsPort = 5989;
constexpr int kArenas = 2;
constexpr std::chrono::seconds kGrace{60};
constexpr std::chrono::seconds kExportGrace{5};

bool isLoopback(const std::string& address) {
    in_addr four = {};
    in6_addr six = {};
    if (inet_pton(AF_INET, address.c_str(), &four) == 1) {
        return ntohl(four.s_addr) >> 24 == 127;
    }
    return inet_pton(AF_INET6, address.c_str(), &six) == 1 && IN6_IS_ADDR_LOOPBACK(&six);
}

std::string contentOf(const std::string& file) {
    std::ostringstream text;
    std::ifstream in(file);
    if (!(text << in.rdbuf())) {
        throw std::runtime_error(file + ": cannot be read");
    }
    return text.str();
}

[[noreturn]] void refuse(const std::string& why) {
    throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, why);
}

void checkOptions(const Arguments& arguments) {
    if (arguments.certificate.empty() != arguments.key.empty()) {
        refuse("--certificate and --key go together");
    }
    const bool safe = !arguments.certificate.empty() && !arguments.passwords.empty();
    if (!safe && !isLoopback(arguments.address)) {
        refuse(
            "only addresses of the loopback interface are served without --certificate, --key "
            "and --passwords");
    }
}

/// What a client sent, as it can stand in a line.
std::string printable(const std::string& text) {
    constexpr std::size_t kLongest = 200;
    std::string out = text.substr(0, kLongest);
    for (char& c : out) {
        if (static_cast<unsigned char>(c) < 0x20 || c == 0x7F) {
            c = '?';
        }
    }
    return out;
}

std::string lineOf(const HttpRecord& record) {
    const auto time = std::chrono::duration_cast<std::chrono::microseconds>(record.time);
    char milliseconds[32];
    std::snprintf(milliseconds, sizeof milliseconds, "%.1f",
                  static_cast<double>(time.count()) / 1000);
    return record.client + " " + printable(record.user.value_or("-")) + " " +
           printable(record.method) + " " + std::to_string(record.status) + " " +
           std::to_string(record.bytes) + " B " + milliseconds + " ms " +
           (record.whole ? "" : "broken off ") + printable(record.note) + "\n";
}

/// For what nobody asked about: a line on standard error.
void report(const std::string& line) {
    std::fprintf(stderr, "cimom: %s\n", printable(line).c_str());
}

std::shared_ptr<IndicationExport> makeExport(const Arguments& arguments) {
    ExportOptions options;
    options.trusted = arguments.trusted;
    options.log = report;
    if (!options.trusted.empty()) {
        contentOf(options.trusted);  // to say now what else each listener would be refused for
    }
    return std::make_shared<IndicationExport>(options);
}

}  // namespace

Reply serve(Session& session, const Arguments& arguments) {
    checkOptions(arguments);
    // Each arena keeps room for the largest request that it ever had; eight for a core are many.
    mallopt(M_ARENA_MAX, kArenas);
    EndSignals signals;
    const auto exports = makeExport(arguments);
    const auto subscriptions = std::make_shared<Subscriptions>(
        session.server, session.classes, hostName(), arguments.state, exports, report);
    serveInterop(session.server, CIMOM_VERSION, subscriptions);
    subscriptions->start();
    CimXmlService service(session.server, session.classes, session.unfit, session.request.user);
    HttpOptions options;
    const bool tls = !arguments.certificate.empty();
    options.address = arguments.address;
    options.port = arguments.port.value_or(tls ? kTlsPort : kPort);
    if (tls) {
        options.certificate = contentOf(arguments.certificate);
        options.key = contentOf(arguments.key);
    }
    if (!arguments.passwords.empty()) {
        options.knows = [passwords = std::make_shared<Passwords>(arguments.passwords)](
                            const std::string& name, const std::string& password) {
            return passwords->match(name, password);
        };
    }
    std::mutex mutex;
    if (arguments.log) {
        options.log = [&](const HttpRecord& record) {
            const std::lock_guard<std::mutex> lock(mutex);
            session.out.write(lineOf(record));
        };
    }
    HttpServer http(options, [&](const HttpRequest& request) { return service.answer(request); });
    const bool six = arguments.address.find(':') != std::string::npos;
    {
        const std::lock_guard<std::mutex> lock(mutex);
        session.out.write(std::string("serving ") + (tls ? "https" : "http") + "://" +
                          (six ? "[" : "") + arguments.address + (six ? "]:" : ":") +
                          std::to_string(http.port()) + "\n");
    }
    while (!signals.wait(std::chrono::seconds(1))) {
        http.watch();
        service.expire();
        subscriptions->watch();
    }
    http.stop(kGrace);
    subscriptions->stop();
    exports->stop(kExportGrace);
    return {};
}

}  // namespace cimom
