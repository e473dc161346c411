// The HTTP server and who may use it, with clients that behave badly.
#include <arpa/inet.h>
#include <gtest/gtest.h>
#include <poll.h>
#include <sys/socket.h>
#include <sys/stat.h>

#include <atomic>
#include <csignal>
#include <mutex>
#include <set>
#include <thread>

#include "../utilities/OnThreads.h"
#include "Folder.h"
#include "HttpServer.h"
#include "Passwords.h"

namespace {

using namespace std::chrono_literals;

/// A client that sends and takes just what it is told to.
class Client {
public:
    explicit Client(std::uint16_t port) : m_socket(socket(AF_INET, SOCK_STREAM, 0)) {
        sockaddr_in address = {};
        address.sin_family = AF_INET;
        address.sin_port = htons(port);
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        connected = connect(m_socket, reinterpret_cast<sockaddr*>(&address), sizeof address) == 0;
    }
    ~Client() { close(m_socket); }
    Client(const Client&) = delete;
    Client& operator=(const Client&) = delete;

    bool send(const std::string& text) const {
        return ::send(m_socket, text.data(), text.size(), MSG_NOSIGNAL) ==
               static_cast<ssize_t>(text.size());
    }
    /// What comes until so much is there, the other side closes, or nothing comes for long.
    std::string take(std::size_t most = SIZE_MAX) const {
        std::string all;
        char room[65536];
        pollfd waited = {m_socket, POLLIN, 0};
        while (all.size() < most && poll(&waited, 1, 10000) > 0) {
            const ssize_t count = recv(m_socket, room, std::min(sizeof room, most - all.size()), 0);
            if (count <= 0) {
                break;
            }
            all.append(room, static_cast<std::size_t>(count));
        }
        return all;
    }

    bool connected = false;

private:
    int m_socket;
};

std::string post(const std::string& body, const std::string& headers = "Connection: close\r\n") {
    return "POST /cimom HTTP/1.1\r\nHost: x\r\n" + headers +
           "Content-Length: " + std::to_string(body.size()) + "\r\n\r\n" + body;
}

/// An answer whose end never comes, and how many bytes of it have been made.
using Made = std::shared_ptr<std::atomic<std::size_t>>;
cimom::HttpAnswer endless(const Made& made) {
    cimom::HttpAnswer answer;
    answer.next = [made](std::string& out) {
        out.append(10000, 'x');
        *made += 10000;
        return true;
    };
    return answer;
}
cimom::HttpAnswer saying(const std::string& text) {
    cimom::HttpAnswer answer;
    answer.next = [left = text](std::string& out) mutable {
        out += left;
        return !std::exchange(left, "").empty();
    };
    return answer;
}

class Http : public testing::Test {
protected:
    Http() {
        std::signal(SIGPIPE, [](int) {});
    }
    std::unique_ptr<cimom::HttpServer> serve(cimom::HttpServer::Service service) {
        return std::make_unique<cimom::HttpServer>(m_options, std::move(service));
    }
    cimom::HttpOptions m_options;
};

TEST_F(Http, RequestsAreBoundedAndTheirClientsKnown) {
    m_options.largestRequest = 100;
    m_options.knows = [](const std::string& name, const std::string& password) {
        return name == "ann" && password == "se:cret";
    };
    const auto server = serve([](const cimom::HttpRequest& request) {
        return saying("'" + request.body + "' of " + *request.user);
    });
    const std::string known = "Authorization: Basic YW5uOnNlOmNyZXQ=\r\n";
    const std::string wrong = "Authorization: Basic YW5uOnNlOmNyZXg=\r\n";
    const std::string chunked = "POST / HTTP/1.1\r\nHost: x\r\n" + known +
                                "Connection: close\r\nTransfer-Encoding: chunked\r\n\r\n";
    const std::string chunk = "40\r\n" + std::string(64, 'x') + "\r\n";
    const struct {
        std::string request, status, end;
    } rows[] = {
        {post("hello", known + "Connection: close\r\n"), "200", "'hello' of ann"},
        {chunked + "2\r\nhi\r\n0\r\n\r\n", "200", "'hi' of ann"},
        {chunked + chunk + chunk + "0\r\n\r\n", "413", ""},
        {post(std::string(101, 'x'), known), "413", ""},
        {post("x"), "401", ""},
        {post("x", wrong), "401", ""},
        {post("x", "Authorization: Basic !!!!\r\n"), "401", ""},
        {post("x", "Authorization: Digest YW5uOnNlOmNyZXQ=\r\n"), "401", ""},
        {post(std::string(101, 'x'), wrong), "401", ""},
        // Nobody is believed for what another proved on the same connection.
        {post("one", known) + post("two", wrong), "200", "Content-Length: 0\r\n\r\n"},
        {post("x", "X: " + std::string(100000, 'x') + "\r\n"), "4", ""},
    };
    for (const auto& row : rows) {
        const Client client(server->port());
        client.send(row.request);
        const std::string answer = client.take();
        EXPECT_EQ(answer.substr(0, 9 + row.status.size()), "HTTP/1.1 " + row.status);
        EXPECT_EQ(answer.substr(answer.size() - std::min(answer.size(), row.end.size())), row.end);
    }
}

TEST_F(Http, SlowClientsLoseTheirConnection) {
    m_options.idle = 1s;
    m_options.sending = 1s;
    m_options.leastBytesPerSecond = std::uint64_t{1} << 30;
    const Made made = std::make_shared<std::atomic<std::size_t>>(0);
    const auto server = serve([&](const cimom::HttpRequest& request) {
        if (request.body == "work") {  // which is no fault of the client
            std::this_thread::sleep_for(2500ms);
            return saying("done");
        }
        return endless(made);
    });
    std::atomic<bool> ended{false};
    std::thread watching([&] {
        while (!ended) {
            server->watch();
            std::this_thread::sleep_for(50ms);
        }
    });
    const Client working(server->port()), trickling(server->port()), silent(server->port()),
        sipping(server->port()), deaf(server->port());
    working.send(post("work"));
    sipping.send(post("x"));
    deaf.send(post("x"));
    std::thread sips([&] {
        while (!ended && !sipping.take(1).empty()) {
            std::this_thread::sleep_for(5ms);
        }
    });
    const std::string request = post(std::string(1000, 'x'));
    EXPECT_TRUE(within(5s, [&, at = std::size_t{0}]() mutable {
        return !trickling.send(request.substr(at++, 1));
    }));
    EXPECT_EQ(silent.take(), "");
    const std::string answer = working.take();
    EXPECT_EQ(answer.substr(answer.size() - std::min(answer.size(), std::size_t{4})), "done");
    EXPECT_TRUE(within(5s, [&] { return made.use_count() == 1; }));
    ended = true;
    watching.join();
    sips.join();
}

TEST_F(Http, LongAnswersAreMadeAsTheyAreTaken) {
    constexpr std::size_t kTaken = std::size_t{20} << 20;
    const Made made = std::make_shared<std::atomic<std::size_t>>(0);
    std::mutex mutex;
    std::vector<cimom::HttpRecord> records;
    m_options.log = [&](const cimom::HttpRecord& record) {
        const std::lock_guard<std::mutex> lock(mutex);
        records.push_back(record);
    };
    const auto server = serve([&](const cimom::HttpRequest&) { return endless(made); });
    {
        const Client client(server->port());
        client.send(post("x"));
        ASSERT_EQ(client.take(kTaken).size(), kTaken);
        EXPECT_LT(*made, kTaken * 2);  // for sockets hold some
    }                                  // and away it goes, in the middle
    EXPECT_TRUE(within(5s, [&] { return made.use_count() == 1; }));
    server->stop(1s);
    ASSERT_EQ(records.size(), 1U);
    EXPECT_FALSE(records[0].whole);
    EXPECT_EQ(records[0].client, "127.0.0.1");
    EXPECT_GE(records[0].bytes, kTaken);
}

TEST_F(Http, ManyClientsAreServedAtOnceAndTheLastRequestsFinished) {
    constexpr int kClients = 64;
    std::atomic<int> running{0}, right{0};
    const auto server = serve([&](const cimom::HttpRequest& request) {
        ++running;
        EXPECT_TRUE(within(20s, [&] { return running == kClients; }));
        std::this_thread::sleep_for(300ms);
        return saying(request.body);
    });
    std::vector<std::thread> clients;
    for (int i = 0; i < kClients; ++i) {
        clients.emplace_back([&] {
            const Client client(server->port());
            client.send(post("wait", ""));
            right += client.take().find("\r\n\r\nwait") != std::string::npos ? 1 : 0;
        });
    }
    ASSERT_TRUE(within(20s, [&] { return running == kClients; }));
    m_options.port = server->port();
    EXPECT_THROW(serve({}), std::runtime_error);  // clients would get either
    server->stop(10s);
    for (std::thread& each : clients) {
        each.join();
    }
    EXPECT_EQ(right, kClients);
    EXPECT_FALSE(Client(server->port()).connected);
}

TEST_F(Http, ThreadsStayForLaterClientsWhichWaitForThem) {
    m_options.mostConnections = 2;
    std::mutex mutex;
    std::set<std::thread::id> threads;
    const auto server = serve([&](const cimom::HttpRequest& request) {
        const std::lock_guard<std::mutex> lock(mutex);
        threads.insert(std::this_thread::get_id());
        return saying(request.body);
    });
    for (int round = 0; round < 10; ++round) {
        const Client clients[] = {Client(server->port()), Client(server->port()),
                                  Client(server->port())};
        for (const Client& client : clients) {
            client.send(post("hear"));
            EXPECT_NE(client.take().find("\r\n\r\nhear"), std::string::npos);
        }
    }
    EXPECT_LE(threads.size(), 2U);
}

TEST(Passwords, OfAFileThatIsNobodyElses) {
    const std::string content =
        "#\n\nann:$6$4xJMKTMl0JqcVNFe$VBZ8tVnHYeyazs3qxJRdoNXAAutRY8dxiNLNCwJ6WQAzZogM6gom2J"
        "nNEntgQYmlG.U9E0aK/h3bGteEHpcWY1\n"
        "bob:$y$j9T$aqAJQ8aZUtfKNIJpsJ7xi.$Dw9bQYhisH1okLElyby7mxjUAC.eZM4RBAh4uN0ZdJ2\n";
    const fixture::Folder folder;
    const std::string file = folder.write("passwords", content);
    chmod(file.c_str(), 0600);
    const cimom::Passwords passwords(file);
    const struct {
        const char *name, *password;
        bool matches;
    } rows[] = {{"ann", "secret", true},  {"ann", "Secret", false}, {"ann", "", false},
                {"eve", "secret", false}, {"", "secret", false},    {"#", "", false}};
    for (const auto& row : rows) {
        EXPECT_EQ(passwords.match(row.name, row.password), row.matches) << row.name;
    }
    folder.write("passwords", "eve:$6$x$y\n");  // which no password has
    EXPECT_FALSE(passwords.match("ann", "secret"));
    chmod(file.c_str(), 0644);
    EXPECT_FALSE(passwords.match("ann", "secret"));
    EXPECT_THROW(cimom::Passwords{file}, std::runtime_error);
    for (const char* wrong : {"ann", "ann:secret", ":$6$x$y", "ann:", "ann:$nix$x"}) {
        const std::string other = folder.write("other", wrong);
        chmod(other.c_str(), 0600);
        EXPECT_THROW(cimom::Passwords{other}, std::runtime_error) << wrong;
    }
    EXPECT_THROW(cimom::Passwords{folder / "none"}, std::runtime_error);
    EXPECT_THROW(cimom::Passwords{folder / ""}, std::runtime_error);
}

}  // namespace
