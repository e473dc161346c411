#include "HttpServer.h"

#include <arpa/inet.h>
#include <microhttpd.h>
#include <netdb.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <cerrno>
#include <condition_variable>
#include <cstring>
#include <exception>
#include <list>
#include <mutex>
#include <stdexcept>
#include <thread>

namespace cimom {

namespace {

using Clock = std::chrono::steady_clock;

/// Small answers go out with their length; of larger ones so much is held at a time.
constexpr std::size_t kHeld = std::size_t{64} << 10;
constexpr unsigned kUnauthorized = MHD_HTTP_UNAUTHORIZED;
constexpr std::chrono::milliseconds kBreath{100};

class Socket {
public:
    explicit Socket(int descriptor = -1) : m_descriptor(descriptor) {}
    ~Socket() {
        if (m_descriptor >= 0) {
            close(m_descriptor);
        }
    }
    Socket(Socket&& other) noexcept : m_descriptor(other.release()) {}
    Socket& operator=(Socket&&) = delete;
    int get() const { return m_descriptor; }
    int release() { return std::exchange(m_descriptor, -1); }

private:
    int m_descriptor;
};

/// A connection, as the watch sees it.
struct Connection {
    int socket = -1;
    Clock::time_point since = Clock::now();
    enum class State { Receiving, Working, Answering } state = State::Receiving;
    std::atomic<std::uint64_t> sent{0};
    // Of the last client that was believed, so that its password is not judged each time anew.
    std::string believed;
};

/// One request and its answer.
struct Exchange {
    HttpServer::Impl& server;
    MHD_Connection* handle;
    Connection& connection;
    Clock::time_point since = Clock::now();
    HttpRequest request;
    unsigned refused = 0;  // the status; what the client still sends is thrown away
    HttpAnswer answer;
    HttpRecord record;
    std::string pending;
    std::size_t taken = 0;
    bool answered = false;

    Exchange(HttpServer::Impl& s, MHD_Connection* h, Connection& c)
        : server(s), handle(h), connection(c) {}
};

std::string addressOf(MHD_Connection* connection) {
    const MHD_ConnectionInfo* info =
        MHD_get_connection_info(connection, MHD_CONNECTION_INFO_CLIENT_ADDRESS);
    char text[NI_MAXHOST] = "?";
    if (info && info->client_addr) {
        const socklen_t size =
            info->client_addr->sa_family == AF_INET6 ? sizeof(sockaddr_in6) : sizeof(sockaddr_in);
        getnameinfo(info->client_addr, size, text, sizeof text, nullptr, 0, NI_NUMERICHOST);
    }
    return text;
}

struct FreeAddress {
    void operator()(addrinfo* info) const { freeaddrinfo(info); }
};
using Address = std::unique_ptr<addrinfo, FreeAddress>;

Address resolve(const std::string& address, std::uint16_t port) {
    addrinfo hints = {};
    hints.ai_flags = AI_NUMERICHOST | AI_NUMERICSERV | AI_PASSIVE;
    hints.ai_socktype = SOCK_STREAM;
    addrinfo* found = nullptr;
    if (getaddrinfo(address.c_str(), std::to_string(port).c_str(), &hints, &found) != 0) {
        throw std::runtime_error("'" + address + "' is no address of a network interface");
    }
    return Address(found);
}

struct DropResponse {
    void operator()(MHD_Response* response) const { MHD_destroy_response(response); }
};
using Response = std::unique_ptr<MHD_Response, DropResponse>;

struct StopDaemon {
    void operator()(MHD_Daemon* daemon) const { MHD_stop_daemon(daemon); }
};

/// A thread of the library that talks to one client after another. It stays, because what GnuTLS
/// notes of a thread that has shaken hands is kept until the process ends.
struct Talker {
    HttpServer::Impl& server;
    std::unique_ptr<Connection> connection;
    bool taken = false;
    std::unique_ptr<MHD_Daemon, StopDaemon> daemon;

    explicit Talker(HttpServer::Impl& s) : server(s) {}
};

bool isFree(const Talker& talker) { return !talker.taken; }

Socket listenAt(const std::string& address, std::uint16_t port) {
    const Address found = resolve(address, port);
    const int on = 1;
    Socket listening(
        socket(found->ai_family, found->ai_socktype | SOCK_CLOEXEC, found->ai_protocol));
    setsockopt(listening.get(), SOL_SOCKET, SO_REUSEADDR, &on, sizeof on);
    if (found->ai_family == AF_INET6) {
        setsockopt(listening.get(), IPPROTO_IPV6, IPV6_V6ONLY, &on, sizeof on);
    }
    if (bind(listening.get(), found->ai_addr, found->ai_addrlen) != 0 ||
        listen(listening.get(), SOMAXCONN) != 0) {
        throw std::runtime_error(address + " port " + std::to_string(port) +
                                 ": cannot be served: " + std::strerror(errno));
    }
    return listening;
}

}  // namespace

class HttpServer::Impl {
public:
    Impl(const HttpOptions& options, Service service)
        : m_options(options),
          m_service(std::move(service)),
          m_listening(listenAt(m_options.address, m_options.port)) {
        start();
    }
    ~Impl() { endAccepting(); }
    Impl(const Impl&) = delete;
    Impl& operator=(const Impl&) = delete;

    std::uint16_t port() const;
    void watch();
    void stop(std::chrono::milliseconds grace);

private:
    void start();
    void startTalking(Talker& talker);
    void acceptAll();
    bool waitUntilOneIsFree();
    void endAccepting();
    void giveToTalker(Socket client, const sockaddr_storage& from, socklen_t size);
    Exchange* begin(MHD_Connection* handle, const char* target, const char* method);
    unsigned refusal(Exchange& exchange);
    bool believes(Exchange& exchange);
    MHD_Result proceed(Exchange& exchange, const char* data, size_t* size);
    MHD_Result finish(Exchange& exchange);
    void serve(Exchange& exchange);
    MHD_Result send(Exchange& exchange);
    void ended(Exchange* exchange, bool whole);
    void enter(Connection& connection, Connection::State state);

    // What the library calls; nothing is thrown through it.
    static MHD_Result onRequest(void* self, MHD_Connection* handle, const char* target,
                                const char* method, const char*, const char* data, size_t* size,
                                void** exchange);
    static void onEnd(void* self, MHD_Connection*, void** exchange, MHD_RequestTerminationCode why);
    static void onConnection(void* self, MHD_Connection* handle, void** context,
                             MHD_ConnectionNotificationCode what);
    static ssize_t onRoom(void* exchange, uint64_t, char* room, size_t size);

    const HttpOptions m_options;
    const Service m_service;
    std::mutex m_mutex;
    std::condition_variable m_changed;
    unsigned m_running = 0;  // requests that are worked on or answered
    bool m_stopping = false;
    const Socket m_listening;
    std::thread m_accepting;
    std::list<Talker> m_talkers;  // last: their threads use all of the above
};

// -- beginning and end ----------------------------------------------------------------------------

void HttpServer::Impl::start() {
    m_talkers.emplace_back(*this);
    startTalking(m_talkers.front());
    m_accepting = std::thread([this] { acceptAll(); });
}

void HttpServer::Impl::startTalking(Talker& talker) {
    unsigned flags =
        MHD_USE_NO_LISTEN_SOCKET | MHD_USE_INTERNAL_POLLING_THREAD | MHD_USE_POLL | MHD_USE_ITC;
    std::vector<MHD_OptionItem> items;
    if (!m_options.certificate.empty()) {
        flags |= MHD_USE_TLS;
        const auto text = [](const std::string& pem) { return const_cast<char*>(pem.c_str()); };
        items.push_back({MHD_OPTION_HTTPS_MEM_CERT, 0, text(m_options.certificate)});
        items.push_back({MHD_OPTION_HTTPS_MEM_KEY, 0, text(m_options.key)});
        items.push_back({MHD_OPTION_HTTPS_PRIORITIES, 0,
                         const_cast<char*>("NORMAL:-VERS-ALL:+VERS-TLS1.3:+VERS-TLS1.2")});
    }
    items.push_back({MHD_OPTION_END, 0, nullptr});
    talker.daemon.reset(MHD_start_daemon(
        flags, 0, nullptr, nullptr, &Impl::onRequest, this,
        // One, and one that comes while the library still clears away the last.
        MHD_OPTION_CONNECTION_LIMIT, 2U, MHD_OPTION_CONNECTION_TIMEOUT,
        static_cast<unsigned>(m_options.idle.count()), MHD_OPTION_NOTIFY_COMPLETED, &Impl::onEnd,
        this, MHD_OPTION_NOTIFY_CONNECTION, &Impl::onConnection, &talker,
        // Blocked signals would be inherited by the tools that providers start.
        MHD_OPTION_SIGPIPE_HANDLED_BY_APP, 1, MHD_OPTION_ARRAY, items.data(), MHD_OPTION_END));
    if (!talker.daemon) {
        throw std::runtime_error(
            m_options.certificate.empty()
                ? std::string("no thread for a client: ") + std::strerror(errno)
                : "TLS cannot be served: the certificate and its key are no pair in PEM");
    }
}

std::uint16_t HttpServer::Impl::port() const {
    sockaddr_storage address = {};
    socklen_t size = sizeof address;
    getsockname(m_listening.get(), reinterpret_cast<sockaddr*>(&address), &size);
    return ntohs(address.ss_family == AF_INET6
                     ? reinterpret_cast<const sockaddr_in6&>(address).sin6_port
                     : reinterpret_cast<const sockaddr_in&>(address).sin_port);
}

void HttpServer::Impl::acceptAll() {
    while (waitUntilOneIsFree()) {
        sockaddr_storage from = {};
        socklen_t size = sizeof from;
        Socket client(accept4(m_listening.get(), reinterpret_cast<sockaddr*>(&from), &size,
                              SOCK_CLOEXEC | SOCK_NONBLOCK));
        if (client.get() < 0) {
            // No descriptor or memory: others may give back theirs. Or the end: known at once.
            std::unique_lock<std::mutex> lock(m_mutex);
            m_changed.wait_for(lock, kBreath, [this] { return m_stopping; });
            continue;
        }
        try {
            giveToTalker(std::move(client), from, size);
        } catch (const std::exception&) {
            // the connection is closed
        }
    }
}

/// False when none will be.
bool HttpServer::Impl::waitUntilOneIsFree() {
    std::unique_lock<std::mutex> lock(m_mutex);
    m_changed.wait(lock, [this] {
        return m_stopping || m_talkers.size() < m_options.mostConnections ||
               std::any_of(m_talkers.begin(), m_talkers.end(), isFree);
    });
    return !m_stopping;
}

void HttpServer::Impl::giveToTalker(Socket client, const sockaddr_storage& from, socklen_t size) {
    std::unique_lock<std::mutex> lock(m_mutex);
    auto talker = std::find_if(m_talkers.begin(), m_talkers.end(), isFree);
    if (talker == m_talkers.end()) {
        lock.unlock();
        std::list<Talker> one;
        one.emplace_back(*this);
        startTalking(one.front());
        lock.lock();
        m_talkers.splice(m_talkers.begin(), one);
        talker = m_talkers.begin();
    }
    talker->taken = true;
    lock.unlock();
    const auto* address = reinterpret_cast<const sockaddr*>(&from);
    if (MHD_add_connection(talker->daemon.get(), client.release(), address, size) != MHD_YES) {
        lock.lock();
        talker->taken = false;
    }
}

void HttpServer::Impl::endAccepting() {
    {
        const std::lock_guard<std::mutex> lock(m_mutex);
        m_stopping = true;
    }
    m_changed.notify_all();
    shutdown(m_listening.get(), SHUT_RDWR);
    if (m_accepting.joinable()) {
        m_accepting.join();
    }
}

void HttpServer::Impl::stop(std::chrono::milliseconds grace) {
    endAccepting();
    std::unique_lock<std::mutex> lock(m_mutex);
    m_changed.wait_for(lock, grace, [this] { return m_running == 0; });
    lock.unlock();
    for (Talker& talker : m_talkers) {
        talker.daemon.reset();
    }
}

void HttpServer::Impl::watch() {
    const Clock::time_point now = Clock::now();
    const std::lock_guard<std::mutex> lock(m_mutex);
    for (const Talker& talker : m_talkers) {
        if (!talker.connection) {
            continue;
        }
        const Connection& connection = *talker.connection;
        Clock::duration allowed = m_options.sending;
        if (connection.state == Connection::State::Answering) {
            allowed += std::chrono::seconds(connection.sent / m_options.leastBytesPerSecond);
        }
        if (connection.state != Connection::State::Working && now - connection.since > allowed) {
            shutdown(connection.socket, SHUT_RDWR);
        }
    }
}

void HttpServer::Impl::enter(Connection& connection, Connection::State state) {
    const std::lock_guard<std::mutex> lock(m_mutex);
    connection.state = state;
    connection.since = Clock::now();
    connection.sent = 0;
}

void HttpServer::Impl::onConnection(void* self, MHD_Connection* handle, void** context,
                                    MHD_ConnectionNotificationCode what) {
    Talker& talker = *static_cast<Talker*>(self);
    Impl& impl = talker.server;
    try {
        if (what == MHD_CONNECTION_NOTIFY_STARTED) {
            auto connection = std::make_unique<Connection>();
            connection->socket =
                MHD_get_connection_info(handle, MHD_CONNECTION_INFO_CONNECTION_FD)->connect_fd;
            const std::lock_guard<std::mutex> lock(impl.m_mutex);
            *context = connection.get();
            talker.connection = std::move(connection);
        } else {
            const std::lock_guard<std::mutex> lock(impl.m_mutex);
            talker.connection = nullptr;
            talker.taken = false;
            impl.m_changed.notify_all();
        }
    } catch (const std::exception&) {
        *context = nullptr;  // whose requests are refused
    }
}

// -- a request ------------------------------------------------------------------------------------

MHD_Result HttpServer::Impl::onRequest(void* self, MHD_Connection* handle, const char* target,
                                       const char* method, const char*, const char* data,
                                       size_t* size, void** exchange) {
    Impl& impl = *static_cast<Impl*>(self);
    try {
        if (!*exchange) {
            *exchange = impl.begin(handle, target, method);
            return *exchange ? MHD_YES : MHD_NO;
        }
        return impl.proceed(*static_cast<Exchange*>(*exchange), data, size);
    } catch (const std::exception&) {
        return MHD_NO;  // the connection is closed
    }
}

Exchange* HttpServer::Impl::begin(MHD_Connection* handle, const char* target, const char* method) {
    auto* const connection = static_cast<Connection*>(
        MHD_get_connection_info(handle, MHD_CONNECTION_INFO_SOCKET_CONTEXT)->socket_context);
    if (!connection) {
        return nullptr;
    }
    auto exchange = std::make_unique<Exchange>(*this, handle, *connection);
    exchange->request.method = method;
    exchange->request.target = target;
    exchange->request.header = [handle](const char* name) {
        return MHD_lookup_connection_value(handle, MHD_HEADER_KIND, name);
    };
    exchange->record.client = addressOf(handle);
    exchange->record.method = method;
    exchange->refused = refusal(*exchange);
    exchange->record.user = exchange->request.user;
    return exchange.release();
}

/// What is wrong with a request by its head alone; 0 for nothing.
unsigned HttpServer::Impl::refusal(Exchange& exchange) {
    {
        const std::lock_guard<std::mutex> lock(m_mutex);
        if (m_stopping) {
            return MHD_HTTP_SERVICE_UNAVAILABLE;
        }
    }
    if (m_options.knows && !believes(exchange)) {
        return kUnauthorized;
    }
    const char* length = exchange.request.header(MHD_HTTP_HEADER_CONTENT_LENGTH);
    if (length && std::strtoull(length, nullptr, 10) > m_options.largestRequest) {
        return MHD_HTTP_CONTENT_TOO_LARGE;
    }
    return 0;
}

bool HttpServer::Impl::believes(Exchange& exchange) {
    struct FreeText {
        void operator()(char* text) const { MHD_free(text); }
    };
    char* passwordText = nullptr;
    const std::unique_ptr<char, FreeText> name(
        MHD_basic_auth_get_username_password(exchange.handle, &passwordText));
    const std::unique_ptr<char, FreeText> password(passwordText);
    if (!name || !password) {
        return false;
    }
    const std::string said = exchange.request.header(MHD_HTTP_HEADER_AUTHORIZATION);
    std::string& believed = exchange.connection.believed;
    if (said != believed) {
        believed.clear();
        if (!m_options.knows(name.get(), password.get())) {
            return false;
        }
        believed = said;
    }
    exchange.request.user = name.get();
    return true;
}

MHD_Result HttpServer::Impl::proceed(Exchange& exchange, const char* data, size_t* size) {
    if (*size == 0) {
        return exchange.answered ? MHD_YES : finish(exchange);
    }
    if (exchange.refused == 0 && exchange.request.body.size() + *size > m_options.largestRequest) {
        exchange.refused = MHD_HTTP_CONTENT_TOO_LARGE;
        exchange.request.body = {};
    }
    if (exchange.refused == 0) {
        exchange.request.body.append(data, *size);
    }
    *size = 0;
    return MHD_YES;
}

MHD_Result HttpServer::Impl::finish(Exchange& exchange) {
    exchange.answered = true;
    {
        const std::lock_guard<std::mutex> lock(m_mutex);
        ++m_running;
    }
    // However long the service takes, the client is not to blame.
    MHD_set_connection_option(exchange.handle, MHD_CONNECTION_OPTION_TIMEOUT, 0U);
    enter(exchange.connection, Connection::State::Working);
    if (exchange.refused != 0) {
        exchange.answer.status = exchange.refused;
    } else {
        serve(exchange);
    }
    exchange.request.body = {};
    enter(exchange.connection, Connection::State::Answering);
    MHD_set_connection_option(exchange.handle, MHD_CONNECTION_OPTION_TIMEOUT,
                              static_cast<unsigned>(m_options.idle.count()));
    return send(exchange);
}

void HttpServer::Impl::serve(Exchange& exchange) {
    try {
        exchange.answer = m_service(exchange.request);
    } catch (const std::exception& error) {
        exchange.answer = {};
        exchange.answer.status = MHD_HTTP_INTERNAL_SERVER_ERROR;
        exchange.answer.note = error.what();
    }
}

MHD_Result HttpServer::Impl::send(Exchange& exchange) {
    HttpAnswer& answer = exchange.answer;
    bool more = answer.next != nullptr;
    while (more && exchange.pending.size() < kHeld) {
        more = answer.next(exchange.pending);
    }
    const Response response(more ? MHD_create_response_from_callback(
                                       MHD_SIZE_UNKNOWN, kHeld, &Impl::onRoom, &exchange, nullptr)
                                 : MHD_create_response_from_buffer(exchange.pending.size(),
                                                                   exchange.pending.data(),
                                                                   MHD_RESPMEM_MUST_COPY));
    if (!response) {
        return MHD_NO;
    }
    if (!more) {
        exchange.record.bytes = exchange.pending.size();
    }
    for (const auto& [name, value] : answer.headers) {
        MHD_add_response_header(response.get(), name.c_str(), value.c_str());
    }
    if (answer.status == kUnauthorized) {
        MHD_add_response_header(response.get(), MHD_HTTP_HEADER_WWW_AUTHENTICATE,
                                "Basic realm=\"cimom\"");
    }
    bool stopping = false;
    {
        const std::lock_guard<std::mutex> lock(m_mutex);
        stopping = m_stopping;
    }
    if (stopping || exchange.refused != 0) {
        MHD_add_response_header(response.get(), MHD_HTTP_HEADER_CONNECTION, "close");
    }
    return MHD_queue_response(exchange.handle, answer.status, response.get());
}

ssize_t HttpServer::Impl::onRoom(void* context, uint64_t, char* room, size_t size) {
    Exchange& exchange = *static_cast<Exchange*>(context);
    try {
        std::string& pending = exchange.pending;
        if (exchange.taken == pending.size()) {
            pending.clear();
            exchange.taken = 0;
            while (pending.size() < size && exchange.answer.next(pending)) {
                continue;
            }
        }
        const std::size_t count = std::min(size, pending.size() - exchange.taken);
        if (count == 0) {
            return MHD_CONTENT_READER_END_OF_STREAM;
        }
        pending.copy(room, count, exchange.taken);
        exchange.taken += count;
        exchange.record.bytes += count;
        exchange.connection.sent = exchange.record.bytes;
        return static_cast<ssize_t>(count);
    } catch (const std::exception&) {
        return MHD_CONTENT_READER_END_WITH_ERROR;
    }
}

void HttpServer::Impl::onEnd(void* self, MHD_Connection*, void** exchange,
                             MHD_RequestTerminationCode why) {
    if (*exchange) {
        static_cast<Impl*>(self)->ended(static_cast<Exchange*>(std::exchange(*exchange, nullptr)),
                                        why == MHD_REQUEST_TERMINATED_COMPLETED_OK);
    }
}

void HttpServer::Impl::ended(Exchange* exchange, bool whole) {
    const std::unique_ptr<Exchange> owned(exchange);
    enter(owned->connection, Connection::State::Receiving);
    try {
        if (m_options.log) {
            HttpRecord& record = owned->record;
            record.status = owned->answered ? owned->answer.status : 0;
            record.time = Clock::now() - owned->since;
            record.whole = whole;
            record.note = owned->answer.note;
            m_options.log(record);
        }
    } catch (const std::exception&) {
        // a line of the log is lost, and nothing else
    }
    if (owned->answered) {
        const std::lock_guard<std::mutex> lock(m_mutex);
        --m_running;
        m_changed.notify_all();
    }
}

HttpServer::HttpServer(const HttpOptions& options, Service service)
    : m_impl(std::make_unique<Impl>(options, std::move(service))) {}
HttpServer::~HttpServer() = default;
std::uint16_t HttpServer::port() const { return m_impl->port(); }
void HttpServer::watch() { m_impl->watch(); }
void HttpServer::stop(std::chrono::milliseconds grace) { m_impl->stop(grace); }

}  // namespace cimom
