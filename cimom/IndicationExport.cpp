#include "IndicationExport.h"

#include <curl/curl.h>
#include <pthread.h>
#include <sys/socket.h>

#include <algorithm>
#include <csignal>
#include <cstdint>
#include <deque>
#include <map>
#include <mutex>
#include <optional>
#include <set>
#include <stdexcept>
#include <thread>

#include "CimXmlTree.h"
#include "CimXmlWriter.h"
#include "Failure.h"

namespace cimom {

namespace {

using Clock = std::chrono::steady_clock;

constexpr std::size_t kLongestUrl = 2000;
constexpr std::size_t kLongestAnswer = 65536;
constexpr long kTaken = 2;  // hundreds
constexpr std::chrono::hours kIdle{1};

template <auto Free>
struct Freeing {
    template <class T>
    void operator()(T* handle) const {
        Free(handle);
    }
};
using EasyHandle = std::unique_ptr<CURL, Freeing<curl_easy_cleanup>>;
using MultiHandle = std::unique_ptr<CURLM, Freeing<curl_multi_cleanup>>;
using HeaderList = std::unique_ptr<curl_slist, Freeing<curl_slist_free_all>>;
using UrlHandle = std::unique_ptr<CURLU, Freeing<curl_url_cleanup>>;

struct Message {
    std::uint64_t number;
    Clock::time_point since;
    std::string subscription;
    std::string xml;  ///< INSTANCE
};

/// Where indications go, and what waits to go there. What only the sending thread touches, it may
/// touch without the lock.
struct Destination {
    std::string url;
    std::deque<Message> waiting;
    std::size_t bytes = 0;  ///< of what waits
    std::chrono::milliseconds pause{0};
    Clock::time_point nextAttempt{};
    std::string trouble;  ///< why the last attempt failed; empty when it did not
    std::size_t lost = 0;
    std::string lostBy;
    Clock::time_point nextLine{};
    std::optional<Message> sending;  ///< what is on its way
    bool removed = false;

    // The sending thread's.
    EasyHandle transfer;
    std::string body;
    std::string answer;
};

void put(Destination& to, Message message, bool inFront) {
    to.bytes += message.xml.size();
    inFront ? to.waiting.push_front(std::move(message)) : to.waiting.push_back(std::move(message));
}
Message takeFirst(Destination& from) {
    Message message = std::move(from.waiting.front());
    from.waiting.pop_front();
    from.bytes -= message.xml.size();
    return message;
}

std::string exportRequest(const Message& message) {
    std::string xml = "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n";
    const std::string number = std::to_string(message.number);
    writeElement(xml, "CIM", {{"CIMVERSION", "2.0"}, {"DTDVERSION", "2.0"}}, [&] {
        writeElement(xml, "MESSAGE", {{"ID", number}, {"PROTOCOLVERSION", "1.0"}}, [&] {
            openElement(xml, "SIMPLEEXPREQ");
            openElement(xml, "EXPMETHODCALL", {{"NAME", "ExportIndication"}});
            openElement(xml, "EXPPARAMVALUE", {{"NAME", "NewIndication"}});
            xml += message.xml;
            for (const char* name : {"EXPPARAMVALUE", "EXPMETHODCALL", "SIMPLEEXPREQ"}) {
                closeElement(xml, name);
            }
        });
    });
    return xml + "\n";
}

/// Why a listener did not take what was sent; empty when it did. Whoever answers with success and
/// something that is no CIM-XML has it, and would have it twice.
std::string refusalIn(const std::string& answer) {
    try {
        const XmlElement root = parseXml(answer);
        const XmlElement* at = &root;
        for (const char* name : {"MESSAGE", "SIMPLEEXPRSP", "EXPMETHODRESPONSE", "ERROR"}) {
            at = at->child(name);
            if (!at) {
                return {};
            }
        }
        const std::string* code = at->attribute("CODE");
        const std::string* text = at->attribute("DESCRIPTION");
        return "CIM error " + (code ? *code : "") + (text ? ": " + *text : "");
    } catch (const XmlError&) {
        return {};
    }
}

std::size_t takeAnswer(const char* data, std::size_t, std::size_t size, void* to) {
    auto& answer = *static_cast<std::string*>(to);
    if (answer.size() + size > kLongestAnswer) {
        return 0;
    }
    answer.append(data, size);
    return size;
}

/// As curl does it, but so that tools which providers start do not get the connection.
curl_socket_t openSocket(void*, curlsocktype, curl_sockaddr* to) {
    return socket(to->family, to->socktype | SOCK_CLOEXEC, to->protocol);
}

[[noreturn]] void refuseUrl(const std::string& url, const std::string& why) {
    throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "destination '" + url + "': " + why);
}

std::string partOf(CURLU* url, CURLUPart part) {
    char* text = nullptr;
    if (curl_url_get(url, part, &text, 0) != CURLUE_OK) {
        return {};
    }
    const std::unique_ptr<char, Freeing<curl_free>> owned(text);
    return text;
}

}  // namespace

std::string IndicationExport::listenerUrl(const std::string& text) {
    const std::string whole = text.find("://") == std::string::npos ? "http://" + text : text;
    const UrlHandle url(curl_url());
    if (text.empty() || whole.size() > kLongestUrl) {
        refuseUrl(text.substr(0, kLongestUrl), "not a URL");
    }
    const CURLUcode code = curl_url_set(url.get(), CURLUPART_URL, whole.c_str(), 0);
    const std::string scheme = partOf(url.get(), CURLUPART_SCHEME);
    if (code == CURLUE_UNSUPPORTED_SCHEME ||
        (code == CURLUE_OK && scheme != "http" && scheme != "https")) {
        refuseUrl(text, "neither http nor https");
    }
    if (code != CURLUE_OK) {
        refuseUrl(text, curl_url_strerror(code));
    }
    if (!partOf(url.get(), CURLUPART_USER).empty() ||
        !partOf(url.get(), CURLUPART_PASSWORD).empty()) {
        refuseUrl(text, "names and passwords are not kept");
    }
    return partOf(url.get(), CURLUPART_URL);
}

class IndicationExport::Impl {
public:
    explicit Impl(const ExportOptions& options) : m_options(options) {
        // NOLINTNEXTLINE(concurrency-mt-unsafe): the language sees to it that it is done once
        static const CURLcode ready = curl_global_init(CURL_GLOBAL_DEFAULT);
        m_multi.reset(ready == CURLE_OK ? curl_multi_init() : nullptr);
        if (!m_multi) {
            throw std::runtime_error("no HTTP client: libcurl cannot be initialized");
        }
        for (const char* header :
             {"Content-Type: application/xml; charset=\"utf-8\"", "CIMExport: MethodRequest",
              "CIMExportMethod: ExportIndication", "Expect:"}) {
            curl_slist* const longer = curl_slist_append(m_headers.get(), header);
            static_cast<void>(m_headers.release());
            m_headers.reset(longer);
        }
        m_thread = std::thread([this] { run(); });
    }
    ~Impl() { stop(std::chrono::milliseconds(0)); }
    Impl(const Impl&) = delete;
    Impl& operator=(const Impl&) = delete;

    void setDestination(const std::string& id, const std::string& url) {
        std::string whole = listenerUrl(url);
        const std::lock_guard<std::mutex> lock(m_mutex);
        std::unique_ptr<Destination>& destination = m_destinations[id];
        if (!destination) {
            destination = std::make_unique<Destination>();
        }
        destination->url = std::move(whole);
        destination->nextAttempt = {};
        curl_multi_wakeup(m_multi.get());
    }

    void removeDestination(const std::string& id) {
        const std::lock_guard<std::mutex> lock(m_mutex);
        const auto at = m_destinations.find(id);
        if (at != m_destinations.end()) {
            at->second->removed = true;
            m_removed.push_back(std::move(at->second));
            m_destinations.erase(at);
            curl_multi_wakeup(m_multi.get());
        }
    }

    void send(const std::string& id, const std::string& subscription, std::string xml) {
        const std::lock_guard<std::mutex> lock(m_mutex);
        const auto at = m_destinations.find(id);
        if (at == m_destinations.end() || m_end) {
            return;
        }
        Destination& to = *at->second;
        Message message{m_nextNumber++, Clock::now(), subscription, std::move(xml)};
        const bool full = to.waiting.size() >= m_options.mostWaiting ||
                          to.bytes + message.xml.size() > m_options.mostBytes;
        full ? giveUp(to, message, "too many wait") : put(to, std::move(message), false);
        curl_multi_wakeup(m_multi.get());
    }

    void forget(const std::string& id, const std::string& subscription) {
        const std::lock_guard<std::mutex> lock(m_mutex);
        m_failed.erase(subscription);
        const auto at = m_destinations.find(id);
        if (at == m_destinations.end()) {
            return;
        }
        Destination& of = *at->second;
        std::deque<Message> kept;
        for (Message& each : of.waiting) {
            if (each.subscription != subscription) {
                kept.push_back(std::move(each));
            } else {
                of.bytes -= each.xml.size();
            }
        }
        of.waiting = std::move(kept);
        if (of.sending && of.sending->subscription == subscription) {
            of.sending.reset();  // it goes on, and nobody comes back to it
        }
    }

    std::vector<std::string> takeFailed() {
        const std::lock_guard<std::mutex> lock(m_mutex);
        std::vector<std::string> failed(m_failed.begin(), m_failed.end());
        m_failed.clear();
        return failed;
    }

    void stop(std::chrono::milliseconds grace) {
        {
            const std::lock_guard<std::mutex> lock(m_mutex);
            m_end = Clock::now() + grace;
            curl_multi_wakeup(m_multi.get());
        }
        if (m_thread.joinable()) {
            m_thread.join();
        }
    }

private:
    // -- the sending thread -----------------------------------------------------------------------

    void run() {
        sigset_t all;
        sigfillset(&all);
        pthread_sigmask(SIG_SETMASK, &all, nullptr);  // they are for others
        while (const std::optional<Clock::time_point> wake = beginWhatIsDue()) {
            tellLog();
            int running = 0;
            curl_multi_perform(m_multi.get(), &running);
            if (!endWhatIsDone()) {
                const auto left =
                    std::chrono::ceil<std::chrono::milliseconds>(*wake - Clock::now()).count();
                curl_multi_poll(m_multi.get(), nullptr, 0,
                                static_cast<int>(std::max<std::int64_t>(left, 0)), nullptr);
            }
        }
        giveUpTheRest();
        tellLog();
    }

    /// @return when to look again, or nothing when it is time to end
    std::optional<Clock::time_point> beginWhatIsDue() {
        const std::lock_guard<std::mutex> lock(m_mutex);
        const auto now = Clock::now();
        for (const auto& destination : m_removed) {
            endTransfer(*destination);
        }
        m_removed.clear();
        Clock::time_point wake = m_end.value_or(now + kIdle);
        bool busy = false;
        for (const auto& [id, destination] : m_destinations) {
            const Clock::time_point own = tend(*destination, now);
            wake = std::min(wake, own);
            busy = busy || destination->body.size() > 0 ||
                   (!destination->waiting.empty() && m_end && own < *m_end);
        }
        return m_end && (!busy || now >= *m_end) ? std::nullopt : std::optional(wake);
    }

    /// @return when there is something to do for it again
    Clock::time_point tend(Destination& to, Clock::time_point now) {
        while (!to.waiting.empty() && to.waiting.front().since + m_options.patience <= now) {
            giveUp(to, takeFirst(to), to.trouble.empty() ? "the listener is too slow" : to.trouble);
        }
        Clock::time_point wake = now + kIdle;
        if (to.lost != 0) {
            wake = to.nextLine;
            if (to.nextLine <= now) {
                tellLost(to);
                to.nextLine = now + m_options.logPause;
                wake = now + kIdle;
            }
        }
        if (to.waiting.empty() || !to.body.empty()) {
            return wake;
        }
        if (to.nextAttempt <= now) {
            beginTransfer(to);
            return wake;
        }
        return std::min({wake, to.nextAttempt, to.waiting.front().since + m_options.patience});
    }

    void beginTransfer(Destination& to) {
        if (!to.transfer) {
            to.transfer = newTransfer(to);
        }
        CURL* const transfer = to.transfer.get();
        to.sending = takeFirst(to);
        to.body = exportRequest(*to.sending);
        to.answer.clear();
        curl_easy_setopt(transfer, CURLOPT_URL, to.url.c_str());
        curl_easy_setopt(transfer, CURLOPT_POSTFIELDS, to.body.c_str());
        curl_easy_setopt(transfer, CURLOPT_POSTFIELDSIZE_LARGE,
                         static_cast<curl_off_t>(to.body.size()));
        curl_multi_add_handle(m_multi.get(), transfer);
    }

    EasyHandle newTransfer(Destination& to) const {
        EasyHandle made(curl_easy_init());
        CURL* const transfer = made.get();
        if (!transfer) {
            throw std::bad_alloc();
        }
        curl_easy_setopt(transfer, CURLOPT_POST, 1L);
        curl_easy_setopt(transfer, CURLOPT_HTTPHEADER, m_headers.get());
        curl_easy_setopt(transfer, CURLOPT_PROTOCOLS_STR, "http,https");
        curl_easy_setopt(transfer, CURLOPT_HTTP_VERSION, long{CURL_HTTP_VERSION_1_1});
        curl_easy_setopt(transfer, CURLOPT_PROXY, "");
        curl_easy_setopt(transfer, CURLOPT_NOSIGNAL, 1L);
        curl_easy_setopt(transfer, CURLOPT_QUICK_EXIT, 1L);  // waits for no look-up of a name
        const auto limit = static_cast<long>(m_options.timeout.count());
        curl_easy_setopt(transfer, CURLOPT_CONNECTTIMEOUT_MS, limit);
        curl_easy_setopt(transfer, CURLOPT_TIMEOUT_MS, limit);
        curl_easy_setopt(transfer, CURLOPT_OPENSOCKETFUNCTION, openSocket);
        curl_easy_setopt(transfer, CURLOPT_WRITEFUNCTION, takeAnswer);
        curl_easy_setopt(transfer, CURLOPT_WRITEDATA, &to.answer);
        curl_easy_setopt(transfer, CURLOPT_PRIVATE, &to);
        if (!m_options.trusted.empty()) {
            curl_easy_setopt(transfer, CURLOPT_CAINFO, m_options.trusted.c_str());
            curl_easy_setopt(transfer, CURLOPT_CAPATH, nullptr);
        }
        return made;
    }

    void endTransfer(Destination& of) {
        if (!of.body.empty()) {
            curl_multi_remove_handle(m_multi.get(), of.transfer.get());
            of.body.clear();
        }
    }

    /// @return whether there was any
    bool endWhatIsDone() {
        const std::lock_guard<std::mutex> lock(m_mutex);
        bool any = false;
        int left = 0;
        while (const CURLMsg* done = curl_multi_info_read(m_multi.get(), &left)) {
            if (done->msg != CURLMSG_DONE) {
                continue;
            }
            any = true;
            Destination* of = nullptr;
            curl_easy_getinfo(done->easy_handle, CURLINFO_PRIVATE, &of);
            const std::string trouble = troubleWith(*of, done->data.result);
            endTransfer(*of);
            trouble.empty() ? succeeded(*of) : failed(*of, trouble);
        }
        return any;
    }

    static std::string troubleWith(const Destination& of, CURLcode result) {
        long status = 0;
        curl_easy_getinfo(of.transfer.get(), CURLINFO_RESPONSE_CODE, &status);
        if (result != CURLE_OK) {
            return curl_easy_strerror(result);
        }
        return status / 100 == kTaken ? refusalIn(of.answer)
                                      : "HTTP status " + std::to_string(status);
    }

    void succeeded(Destination& of) {
        if (!of.trouble.empty()) {
            m_lines.push_back("listener " + of.url + " takes indications again");
        }
        of.trouble.clear();
        of.pause = std::chrono::milliseconds(0);
        of.nextAttempt = {};
        of.sending.reset();
    }

    void failed(Destination& of, const std::string& trouble) {
        if (of.trouble.empty()) {
            m_lines.push_back("listener " + of.url + ": " + trouble + "; it is tried again");
        }
        of.trouble = trouble;
        of.pause = std::min(std::max(of.pause * 2, m_options.firstPause), m_options.longestPause);
        of.nextAttempt = Clock::now() + of.pause;
        if (of.sending) {
            put(of, std::move(*of.sending), true);
            of.sending.reset();
        }
    }

    void giveUp(Destination& of, const Message& message, const std::string& why) {
        ++of.lost;
        of.lostBy = why;
        m_failed.insert(message.subscription);
    }
    void tellLost(Destination& of) {
        m_lines.push_back("listener " + of.url + ": " + std::to_string(of.lost) +
                          (of.lost == 1 ? " indication was" : " indications were") +
                          " given up: " + of.lostBy);
        of.lost = 0;
    }

    void giveUpTheRest() {
        const std::lock_guard<std::mutex> lock(m_mutex);
        for (const auto& [id, destination] : m_destinations) {
            endTransfer(*destination);
            if (destination->sending) {
                put(*destination, std::move(*destination->sending), true);
                destination->sending.reset();
            }
            while (!destination->waiting.empty()) {
                giveUp(*destination, takeFirst(*destination), "the end has come");
            }
            if (destination->lost != 0) {
                tellLost(*destination);
            }
        }
        m_removed.clear();
    }

    void tellLog() {
        std::vector<std::string> lines;
        {
            const std::lock_guard<std::mutex> lock(m_mutex);
            lines.swap(m_lines);
        }
        for (const std::string& line : lines) {
            if (m_options.log) {
                m_options.log(line);
            }
        }
    }

    const ExportOptions m_options;
    MultiHandle m_multi;
    HeaderList m_headers;

    std::mutex m_mutex;
    std::map<std::string, std::unique_ptr<Destination>> m_destinations;
    std::vector<std::unique_ptr<Destination>> m_removed;  // until the sending thread lets go
    std::set<std::string> m_failed;
    std::vector<std::string> m_lines;  // for the log, which is not called under the lock
    std::uint64_t m_nextNumber = 1;
    std::optional<Clock::time_point> m_end;
    std::thread m_thread;
};

IndicationExport::IndicationExport(const ExportOptions& options)
    : m_impl(std::make_unique<Impl>(options)) {}
IndicationExport::~IndicationExport() = default;
void IndicationExport::setDestination(const std::string& id, const std::string& url) {
    m_impl->setDestination(id, url);
}
void IndicationExport::removeDestination(const std::string& id) { m_impl->removeDestination(id); }
void IndicationExport::send(const std::string& id, const std::string& subscription,
                            std::string xml) {
    m_impl->send(id, subscription, std::move(xml));
}
void IndicationExport::forget(const std::string& id, const std::string& subscription) {
    m_impl->forget(id, subscription);
}
std::vector<std::string> IndicationExport::takeFailed() { return m_impl->takeFailed(); }
void IndicationExport::stop(std::chrono::milliseconds grace) { m_impl->stop(grace); }

}  // namespace cimom
