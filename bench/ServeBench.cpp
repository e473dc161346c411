// What does a client of CIM-XML pay for an enumeration, beside one who calls the broker in its own
// process, and does what is sent need memory?
//
// A provider in C makes instances of six properties. "Served" asks for them over a connection that
// stays, and reads the answer to its end; "Direct" asks the broker. "grown_KB" is what memory grew
// by from the first byte of an answer of 100,000 instances to its last.

#include <arpa/inet.h>
#include <benchmark/benchmark.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <csignal>
#include <cstdlib>
#include <fstream>
#include <string>

#include "CimXmlService.h"

namespace {

constexpr const char* kClass = "Bench_Part";
const CMPIBroker* broker;
long instancesServed = 1;

CMPIStatus enumerate(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                     const CMPIObjectPath* reference, const char**) {
    for (long i = 0; i < instancesServed; ++i) {
        const std::string name = std::to_string(i);
        const auto* text = reinterpret_cast<const CMPIValue*>(name.c_str());
        const char* nameSpace =
            reinterpret_cast<const char*>(reference->ft->getNameSpace(reference, nullptr)->hdl);
        CMPIObjectPath* path = broker->eft->newObjectPath(broker, nameSpace, kClass, nullptr);
        path->ft->addKey(path, "Name", text, CMPI_chars);
        CMPIInstance* instance = broker->eft->newInstance(broker, path, nullptr);
        instance->ft->setProperty(instance, "Name", text, CMPI_chars);
        for (const char* property : {"A", "B", "C", "D"}) {
            instance->ft->setProperty(instance, property,
                                      reinterpret_cast<const CMPIValue*>("some text"), CMPI_chars);
        }
        CMPIValue state;
        state.uint16 = 2;
        instance->ft->setProperty(instance, "State", &state, CMPI_uint16);
        result->ft->returnInstance(result, instance);
    }
    result->ft->returnDone(result);
    return {CMPI_RC_OK, nullptr};
}

CMPIInstanceMI* makeProvider(const CMPIBroker* mb, const CMPIContext*, CMPIStatus*) {
    static CMPIInstanceMIFT table = {};
    table.ftVersion = 100;
    table.miName = "Part";
    table.enumerateInstances = enumerate;
    table.cleanup = [](CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
        return CMPIStatus{CMPI_RC_OK, nullptr};
    };
    static CMPIInstanceMI mi = {nullptr, &table};
    broker = mb;
    return &mi;
}

struct Parts {
    Parts() {
        std::signal(SIGPIPE, [](int) {});
        cimom::Factories factories;
        factories.instance = makeProvider;
        server.registerProvider("Part", {kClass}, factories);
    }
    cimom::Server server;
};

/// A client whose connection stays.
class Client {
public:
    explicit Client(std::uint16_t port) {
        sockaddr_in address = {};
        address.sin_family = AF_INET;
        address.sin_port = htons(port);
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        if (connect(m_socket, reinterpret_cast<sockaddr*>(&address), sizeof address) != 0) {
            std::abort();
        }
    }
    ~Client() { close(m_socket); }
    Client(const Client&) = delete;
    Client& operator=(const Client&) = delete;

    /// @return bytes of the answer; @p each is called for each piece of it
    template <class F>
    std::size_t ask(F each) const {
        static const std::string body =
            "<?xml version=\"1.0\" encoding=\"utf-8\"?><CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\">"
            "<MESSAGE ID=\"1\" PROTOCOLVERSION=\"1.0\"><SIMPLEREQ><IMETHODCALL "
            "NAME=\"EnumerateInstances\"><LOCALNAMESPACEPATH><NAMESPACE NAME=\"root\"/><NAMESPACE "
            "NAME=\"cimv2\"/></LOCALNAMESPACEPATH><IPARAMVALUE NAME=\"ClassName\"><CLASSNAME "
            "NAME=\"Bench_Part\"/></IPARAMVALUE></IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>";
        static const std::string request =
            "POST /cimom HTTP/1.1\r\nHost: x\r\nContent-Type: application/xml\r\nCIMOperation: "
            "MethodCall\r\nCIMMethod: EnumerateInstances\r\nCIMObject: root/cimv2\r\n"
            "Content-Length: " +
            std::to_string(body.size()) + "\r\n\r\n" + body;
        send(m_socket, request.data(), request.size(), MSG_NOSIGNAL);
        std::size_t all = 0;
        std::string tail;
        static char room[1 << 18];
        // An answer in chunks ends with an empty one, any other with its document.
        for (std::string end; end.empty() || !endsWith(tail, end);) {
            const ssize_t count = recv(m_socket, room, sizeof room, 0);
            if (count <= 0) {
                return 0;
            }
            const std::string_view got(room, static_cast<std::size_t>(count));
            if (end.empty()) {
                end = got.find("chunked") < got.find("<?xml") ? "\r\n0\r\n\r\n" : "</CIM>\n";
            }
            all += got.size();
            tail.append(got.substr(got.size() - std::min(got.size(), kTail)));
            tail.erase(0, tail.size() - std::min(tail.size(), kTail));
            each();
        }
        return all;
    }

private:
    static constexpr std::size_t kTail = 32;
    static bool endsWith(const std::string& text, const std::string& end) {
        return text.size() >= end.size() &&
               text.compare(text.size() - end.size(), end.size(), end) == 0;
    }

    int m_socket = socket(AF_INET, SOCK_STREAM, 0);
};

long residentKilobytes() {
    std::ifstream status("/proc/self/statm");
    long pages = 0;
    status >> pages >> pages;
    return pages * (sysconf(_SC_PAGESIZE) / 1024);
}

void Direct(benchmark::State& state) {
    Parts parts;
    instancesServed = state.range(0);
    for (auto _ : state) {
        benchmark::DoNotOptimize(parts.server.enumInstances({}, {"root/cimv2", kClass}));
    }
}
void Served(benchmark::State& state) {
    Parts parts;
    instancesServed = state.range(0);
    cimom::CimXmlService service(parts.server, nullptr, cimom::Unfit::Refused);
    cimom::HttpServer http({}, [&](const cimom::HttpRequest& r) { return service.answer(r); });
    const Client client(http.port());
    for (auto _ : state) {
        long before = 0, most = 0;
        const std::size_t bytes = client.ask([&] {
            if (instancesServed == 100000) {
                most = std::max(most, residentKilobytes());
                before = before == 0 ? most : before;
            }
        });
        if (bytes == 0) {
            state.SkipWithError("no answer");
        }
        state.counters["bytes"] = static_cast<double>(bytes);
        state.counters["grown_KB"] = static_cast<double>(most - before);
    }
}
BENCHMARK(Direct)->Arg(1)->Arg(100)->Arg(1000)->Arg(10000)->UseRealTime();
BENCHMARK(Served)->Arg(1)->Arg(100)->Arg(1000)->Arg(10000)->Arg(100000)->UseRealTime();

}  // namespace
