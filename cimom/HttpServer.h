/// HTTP for a service that answers requests, each as a whole, with answers of any length.
///
/// The only place of the HTTP library. Each connection has a thread to itself, on which the
/// service is called, and which stays for others. Who has no right is turned away before the
/// service hears of it. Limits hold on connections, on the size of a request, and on the time that
/// a client takes to send it and to take the answer: a slow one loses its connection.
///
///     HttpServer http(options, [](const HttpRequest& request) { return answerTo(request); });
///     while (!ending) wait();
///     http.stop(std::chrono::seconds(30));
///
/// Thread-safety: the service and the hooks are called on any number of threads at once. A process
/// with one of these must have a handler for SIGPIPE, or ignore it.
#ifndef CIMOM_HTTP_SERVER_H
#define CIMOM_HTTP_SERVER_H

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace cimom {

struct HttpRequest {
    std::string method;
    std::string target;
    std::string body;
    std::optional<std::string> user;  ///< who has proved to be that
    /// Value of a header, of whatever case its name is; null when there is none.
    std::function<const char*(const char* name)> header;
};

struct HttpAnswer {
    unsigned status = 200;
    std::vector<std::pair<std::string, std::string>> headers;
    /// Appends the next part of the body; false, and nothing is appended, behind the last. Null
    /// for no body. Called as the client takes what there is.
    std::function<bool(std::string&)> next;
    std::string note;  ///< for the log
};

/// One request, for the log; text of clients in it is as they sent it.
struct HttpRecord {
    std::string client;
    std::optional<std::string> user;
    std::string method;
    unsigned status = 0;
    std::uint64_t bytes = 0;  ///< of the answer's body
    std::chrono::steady_clock::duration time{};
    bool whole = false;  ///< whether the client took all of it
    std::string note;
};

struct HttpOptions {
    std::string address = "127.0.0.1";
    std::uint16_t port = 0;   ///< 0 for any
    std::string certificate;  ///< in PEM; empty for no TLS
    std::string key;          ///< in PEM
    /// Whether a client is who it says; null when nobody is asked.
    std::function<bool(const std::string& name, const std::string& password)> knows;
    std::function<void(const HttpRecord&)> log;  ///< may be null

    unsigned mostConnections = 256;
    std::size_t largestRequest = std::size_t{4} << 20;
    std::chrono::seconds idle{30};     ///< without a byte in either direction
    std::chrono::seconds sending{60};  ///< from one request's end to the next one's
    /// A client that takes an answer more slowly, after as long as it may send, loses it.
    std::uint64_t leastBytesPerSecond = 1024;
};

class HttpServer {
public:
    using Service = std::function<HttpAnswer(const HttpRequest&)>;

    /// Begins to serve.
    /// @throws std::runtime_error when the address or the certificate cannot be used
    HttpServer(const HttpOptions& options, Service service);
    ~HttpServer();
    HttpServer(const HttpServer&) = delete;
    HttpServer& operator=(const HttpServer&) = delete;

    std::uint16_t port() const;
    /// Cuts off clients that are too slow; to be called about once a second.
    void watch();
    /// Takes no further requests, waits until those that run are answered, but no longer than
    /// @p grace, and closes all connections.
    void stop(std::chrono::milliseconds grace);

    class Impl;

private:
    std::unique_ptr<Impl> m_impl;
};

}  // namespace cimom

#endif
