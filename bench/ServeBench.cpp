// What does a client of CIM-XML pay beside one who calls the broker in its own process, how many
// requests are answered in a second, and does what is sent need memory?
//
// A provider in C (PartProvider.c) makes instances of six properties. "Direct" asks the broker,
// "Served" asks over HTTP and reads the answer to its end: an enumeration of so many instances, or
// one instance for so many clients at a time, a hundred times each, over connections that stay
// ("get") or over one for each request ("connect"). "median_us" is what a client waits for an
// answer, connecting included.
// "grown_KB" is what memory grew by from the first byte of an answer of 100,000 instances to its
// last.
//
//     ServeBench NAME=PORT...
//
// asks other servers of this machine the same, which have the provider and its classes (parts.mof)
// in root/cimv2; their rows begin with the name.

#include <arpa/inet.h>
#include <benchmark/benchmark.h>
#include <netinet/tcp.h>
#include <strings.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <iostream>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>
#include <thread>
#include <utility>
#include <vector>

#include "CimXmlService.h"

namespace {

constexpr int kMostClients = 8;
constexpr int kEach = 100;  ///< requests of a client between two looks at the clock

std::string className(long instances) { return "Bench_Part" + std::to_string(instances); }

// -- the server in this process -------------------------------------------------------------------

struct Own {
    Own() : server(options), service(server, options.classes.get(), cimom::Unfit::Refused) {
        std::signal(SIGPIPE, [](int) {});
        server.loadRegistration(ZEM_PARTS "/parts.json");
    }
    const cimom::Options options = [] {
        cimom::Options withClasses;
        withClasses.classes = cimom::ClassRepository::load(ZEM_PARTS "/parts.mof");
        return withClasses;
    }();
    cimom::Server server;
    cimom::CimXmlService service;
    cimom::HttpServer http{{}, [this](const cimom::HttpRequest& r) { return service.answer(r); }};
};

Own& own() {
    static Own all;
    return all;
}

long residentKilobytes() {
    std::ifstream status("/proc/self/statm");
    long pages = 0;
    status >> pages >> pages;
    return pages * (sysconf(_SC_PAGESIZE) / 1024);
}

// -- a client -------------------------------------------------------------------------------------

/// An operation on a class, as it goes over the wire.
std::string request(const char* operation, const std::string& argument) {
    const std::string body =
        R"(<?xml version="1.0" encoding="utf-8"?><CIM CIMVERSION="2.0" DTDVERSION="2.0">)"
        R"(<MESSAGE ID="1" PROTOCOLVERSION="1.0"><SIMPLEREQ><IMETHODCALL NAME=")" +
        std::string(operation) +
        R"("><LOCALNAMESPACEPATH><NAMESPACE NAME="root"/><NAMESPACE NAME="cimv2"/>)"
        R"(</LOCALNAMESPACEPATH>)" +
        argument + R"(</IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>)";
    return "POST /cimom HTTP/1.1\r\nHost: localhost\r\nContent-Type: application/xml\r\n"
           "CIMOperation: MethodCall\r\nCIMMethod: " +
           std::string(operation) +
           "\r\nCIMObject: root/cimv2\r\nContent-Length: " + std::to_string(body.size()) +
           "\r\n\r\n" + body;
}

/// Finds the end of an HTTP answer.
class Answer {
public:
    /// @return whether that was the last piece
    bool take(std::string_view piece) {
        if (!m_hasHead) {
            m_line.append(piece);
            const std::size_t end = m_line.find("\r\n\r\n");
            if (end == std::string::npos) {
                return false;
            }
            const std::string head = std::exchange(m_line, {});
            readHead(head.substr(0, end + 2));
            piece.remove_prefix(piece.size() - (head.size() - end - 4));
        }
        m_isFailure = m_isFailure || piece.substr(0, 500).find("<ERROR") != piece.npos;
        bool isLast = !m_isChunked && m_left == piece.size();
        while (!piece.empty()) {
            const std::size_t count = std::min(m_left, piece.size());
            piece.remove_prefix(count);
            m_left -= count;
            isLast = isLast || (m_isChunked && m_left == 0 && takeLine(piece));
        }
        return isLast;
    }
    bool isGood() const { return m_isGood && !m_isFailure; }
    bool isConnectionClosed() const { return m_closes; }

private:
    void readHead(const std::string& head) {
        m_hasHead = true;
        m_isGood = head.rfind("HTTP/1.1 200", 0) == 0;
        const auto value = [&](const char* name) {
            const char* found = strcasestr(head.c_str(), name);
            return found ? std::string(found + std::strlen(name)) : std::string();
        };
        m_left = std::strtoul(value("\r\nContent-Length:").c_str(), nullptr, 10);
        m_isChunked = !value("\r\nTransfer-Encoding: chunked").empty();
        m_closes = !value("\r\nConnection: close").empty();
    }
    /// Between chunks. @return whether the last is over
    bool takeLine(std::string_view& piece) {
        const std::size_t end = std::min(piece.find('\n'), piece.size());
        m_line.append(piece.substr(0, end));
        if (end == piece.size()) {
            piece = {};
            return false;
        }
        piece.remove_prefix(end + 1);
        const std::string line = std::exchange(m_line, {});
        if (m_isTrailer) {
            return line == "\r";
        }
        const std::size_t size = std::strtoul(line.c_str(), nullptr, 16);
        m_isTrailer = size == 0;
        m_left = m_isTrailer ? 0 : size + 2;
        return false;
    }

    bool m_hasHead = false, m_isGood = false, m_isFailure = false, m_closes = false;
    bool m_isChunked = false, m_isTrailer = false;
    std::size_t m_left = 0;
    std::string m_line;
};

class Client {
public:
    explicit Client(std::uint16_t port) : m_port(port), m_room(1 << 18) {}
    ~Client() { hangUp(); }
    Client(const Client&) = delete;
    Client& operator=(const Client&) = delete;

    void hangUp() {
        if (m_socket >= 0) {
            close(std::exchange(m_socket, -1));
        }
    }
    /// @return bytes of the answer; @p each is called for each piece of it
    /// @throws std::runtime_error for an answer that is none
    template <class F>
    std::size_t ask(const std::string& message, F each) {
        if (m_socket < 0) {
            dial();
        }
        send(m_socket, message.data(), message.size(), MSG_NOSIGNAL);
        Answer answer;
        std::size_t bytes = 0;
        for (bool isWhole = false; !isWhole;) {
            const ssize_t count = recv(m_socket, m_room.data(), m_room.size(), 0);
            if (count <= 0) {
                throw std::runtime_error("the server has hung up");
            }
            isWhole = answer.take({m_room.data(), static_cast<std::size_t>(count)});
            bytes += static_cast<std::size_t>(count);
            each();
        }
        if (!answer.isGood()) {
            throw std::runtime_error("the server does not know the classes");
        }
        if (answer.isConnectionClosed()) {
            hangUp();
        }
        return bytes;
    }

private:
    void dial() {
        sockaddr_in address = {};
        address.sin_family = AF_INET;
        address.sin_port = htons(m_port);
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        m_socket = socket(AF_INET, SOCK_STREAM, 0);
        const int one = 1;
        setsockopt(m_socket, IPPROTO_TCP, TCP_NODELAY, &one, sizeof one);
        if (connect(m_socket, reinterpret_cast<sockaddr*>(&address), sizeof address) != 0) {
            throw std::runtime_error("nobody serves at port " + std::to_string(m_port));
        }
    }

    const std::uint16_t m_port;
    int m_socket = -1;
    std::vector<char> m_room;
};

// -- the questions --------------------------------------------------------------------------------

void enumerateDirectly(benchmark::State& state, long instances) {
    for (auto _ : state) {
        benchmark::DoNotOptimize(
            own().server.enumInstances({}, {"root/cimv2", className(instances), {}}));
    }
}

void enumerateServed(benchmark::State& state, std::uint16_t port, long instances) {
    Client client(port);
    const std::string message =
        request("EnumerateInstances", R"(<IPARAMVALUE NAME="ClassName"><CLASSNAME NAME=")" +
                                          className(instances) + R"("/></IPARAMVALUE>)");
    for (auto _ : state) {
        long before = 0, most = 0;
        const std::size_t bytes = client.ask(message, [&] {
            if (instances == 100'000) {
                most = std::max(most, residentKilobytes());
                before = before == 0 ? most : before;
            }
        });
        state.counters["bytes"] = static_cast<double>(bytes);
        state.counters["grown_KB"] = static_cast<double>(most - before);
    }
}

void getDirectly(benchmark::State& state) {
    cimom::ObjectPath path{"root/cimv2", className(1), {}};
    path.keys.set("Name", "0");
    for (auto _ : state) {
        benchmark::DoNotOptimize(own().server.getInstance({}, path));
    }
}

/// Asks so often; what each request took, in microseconds.
std::vector<double> ask(Client& client, const std::string& message, bool keeps) {
    using Clock = std::chrono::steady_clock;
    std::vector<double> times;
    for (int i = 0; i < kEach; ++i) {
        const Clock::time_point begin = Clock::now();
        client.ask(message, [] {});
        if (!keeps) {
            client.hangUp();
        }
        times.push_back(std::chrono::duration<double, std::micro>(Clock::now() - begin).count());
    }
    return times;
}

void getServed(benchmark::State& state, std::uint16_t port, int clients, bool keeps) {
    const std::string message =
        request("GetInstance",
                R"(<IPARAMVALUE NAME="InstanceName"><INSTANCENAME CLASSNAME=")" + className(1) +
                    R"("><KEYBINDING NAME="Name"><KEYVALUE VALUETYPE="string">0</KEYVALUE>)"
                    R"(</KEYBINDING></INSTANCENAME></IPARAMVALUE>)");
    std::vector<std::unique_ptr<Client>> all;
    for (int i = 0; i < clients; ++i) {
        all.push_back(std::make_unique<Client>(port));
        all.back()->ask(message, [] {});  // the server knows them all before the clock starts
    }
    std::vector<double> times;
    for (auto _ : state) {
        std::vector<std::vector<double>> theirs(all.size());
        std::vector<std::thread> threads;
        std::atomic<bool> isBroken{false};
        const auto begin = std::chrono::steady_clock::now();
        for (std::size_t i = 0; i < all.size(); ++i) {
            threads.emplace_back([&, i] {
                try {
                    theirs[i] = ask(*all[i], message, keeps);
                } catch (const std::exception&) {
                    isBroken = true;
                }
            });
        }
        for (std::thread& each : threads) {
            each.join();
        }
        const std::chrono::duration<double> took = std::chrono::steady_clock::now() - begin;
        state.SetIterationTime(took.count());
        for (const std::vector<double>& some : theirs) {
            times.insert(times.end(), some.begin(), some.end());
        }
        if (isBroken) {
            state.SkipWithError("a request failed");
            return;
        }
    }
    state.SetItemsProcessed(static_cast<long>(times.size()));
    const auto middle = times.begin() + static_cast<long>(times.size() / 2);
    std::nth_element(times.begin(), middle, times.end());
    state.counters["median_us"] = *middle;
}

// -- all of them ----------------------------------------------------------------------------------

void addServer(const std::string& name, std::uint16_t port, long most) {
    for (long instances = 1; instances <= most; instances *= instances == 1 ? 100 : 10) {
        benchmark::RegisterBenchmark((name + "/enumerate/" + std::to_string(instances)).c_str(),
                                     enumerateServed, port, instances)
            ->UseRealTime();
    }
    for (const int clients : {1, kMostClients}) {
        for (const bool keeps : {true, false}) {
            benchmark::RegisterBenchmark(
                (name + (keeps ? "/get/" : "/connect/") + std::to_string(clients)).c_str(),
                getServed, port, clients, keeps)
                ->UseManualTime();
        }
    }
}

}  // namespace

int main(int argc, char** argv) {
    benchmark::Initialize(&argc, argv);
    for (const long instances : {1L, 100L, 1000L, 10'000L}) {
        benchmark::RegisterBenchmark(("Direct/enumerate/" + std::to_string(instances)).c_str(),
                                     enumerateDirectly, instances)
            ->UseRealTime();
    }
    benchmark::RegisterBenchmark("Direct/get", getDirectly)->UseRealTime();
    try {
        addServer("Served", own().http.port(), 100'000);
        for (int i = 1; i < argc; ++i) {
            const std::string argument = argv[i];
            const std::size_t equals = std::min(argument.find('='), argument.size());
            const int port = std::atoi(argument.c_str() + std::min(equals + 1, argument.size()));
            addServer(argument.substr(0, equals), static_cast<std::uint16_t>(port), 10'000);
        }
        benchmark::RunSpecifiedBenchmarks();
    } catch (const std::exception& error) {
        std::cerr << argv[0] << ": " << error.what() << '\n';
        return EXIT_FAILURE;
    }
    return EXIT_SUCCESS;
}
