/// Sends indications to listeners: CIM-XML exports over HTTP or HTTPS, each again until it is
/// taken.
///
/// A destination has a queue of its own, of which one indication is on its way at a time: they
/// arrive in the order in which they were sent, and who is slow, or away, holds up nobody else.
/// After a failure the pause before the next attempt doubles up to a limit. An indication that has
/// waited for too long, or finds its queue full, is given up, and the log told so.
///
///     IndicationExport exports(options);
///     exports.setDestination("one", "http://listener.example:5990");
///     exports.send("one", "the subscription", xml);  // does not wait
///     exports.stop(std::chrono::seconds(5));
///
/// One thread sends for all destinations. It follows no redirection, asks no proxy, and has no
/// credentials; HTTPS listeners have to prove who they are.
/// Thread-safety: all of it may be used from any thread; the log is called on the sending one.
#ifndef CIMOM_INDICATION_EXPORT_H
#define CIMOM_INDICATION_EXPORT_H

#include <chrono>
#include <cstddef>
#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace cimom {

struct ExportOptions {
    std::string
        trusted;  ///< file in PEM with whose word is taken for listeners; empty: the system's
    std::function<void(const std::string& line)> log;  ///< may be null

    std::chrono::milliseconds timeout{30000};    ///< of an attempt
    std::chrono::milliseconds firstPause{1000};  ///< after a failure
    std::chrono::milliseconds longestPause{60000};
    std::chrono::milliseconds patience{600000};  ///< how long an indication waits to be taken
    std::chrono::milliseconds logPause{10000};   ///< between two lines on what one destination lost
    // What waits for one destination.
    std::size_t mostWaiting = 10000;
    std::size_t mostBytes = std::size_t{16} << 20;
};

class IndicationExport {
public:
    /// @throws std::runtime_error when there is no HTTP client to be had
    explicit IndicationExport(const ExportOptions& options = {});
    /// Ends without waiting for anybody.
    ~IndicationExport();
    IndicationExport(const IndicationExport&) = delete;
    IndicationExport& operator=(const IndicationExport&) = delete;

    /// The URL as it is used; one without a scheme is of HTTP.
    /// @throws Failure CMPI_RC_ERR_INVALID_PARAMETER for one of another scheme, without a host, or
    ///         with a name or password in it
    static std::string listenerUrl(const std::string& text);

    /// Adds a destination, or changes where it is; what waits for it goes there then.
    /// @throws Failure as listenerUrl
    void setDestination(const std::string& id, const std::string& url);
    /// Removes it with all that waits for it.
    void removeDestination(const std::string& id);

    /// Sends an indication, an INSTANCE element, on behalf of a subscription. Nothing happens when
    /// there is no such destination.
    void send(const std::string& id, const std::string& subscription, std::string xml);
    /// Forgets what waits on behalf of a subscription; what is on its way may still arrive.
    void forget(const std::string& id, const std::string& subscription);
    /// The subscriptions of which something was given up since the last call.
    std::vector<std::string> takeFailed();

    /// Sends what waits where that goes within @p grace, gives up the rest, and ends.
    void stop(std::chrono::milliseconds grace);

private:
    class Impl;
    const std::unique_ptr<Impl> m_impl;
};

}  // namespace cimom

#endif
