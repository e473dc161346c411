/// Enumerations that clients have opened and pull piece by piece.
///
/// What was found when one was opened is kept until it has been pulled, or closed, or nobody has
/// asked for it for as long as its client said. Only the user who opened one reaches it, and its
/// name cannot be guessed.
/// Thread-safety: any number of threads at once.
#ifndef CIMOM_CIM_XML_PULLS_H
#define CIMOM_CIM_XML_PULLS_H

#include <chrono>
#include <cstddef>
#include <map>
#include <mutex>
#include <optional>
#include <string>

#include "Server.h"

namespace cimom {

/// Statuses of CIM-XML that CMPI does not name.
constexpr auto kInvalidEnumerationContext = static_cast<CMPIrc>(21);
constexpr auto kInvalidOperationTimeout = static_cast<CMPIrc>(22);
constexpr auto kFilteredEnumerationNotSupported = static_cast<CMPIrc>(25);
constexpr auto kContinuationOnErrorNotSupported = static_cast<CMPIrc>(26);
constexpr auto kServerLimitsExceeded = static_cast<CMPIrc>(27);

/// What an enumeration is of; the operation that pulls has to agree.
enum class PullKind { InstancesWithPath, InstancePaths, Instances };

/// The part of an enumeration that goes out at once.
struct PulledPiece {
    std::deque<Instance> instances;
    std::deque<ObjectPath> paths;
    std::string context;  ///< under which to ask for more; empty when that is all
};

class CimXmlPulls {
public:
    static constexpr std::size_t kMostOpen = 64;
    static constexpr std::size_t kMostAtOnce = 10000;
    static constexpr std::chrono::seconds kDefaultWait{60};
    static constexpr std::chrono::seconds kLongestWait{600};

    /// Begins to hand out @p reply, with its first @p most objects; all that is left is kept.
    /// @param seconds  for how long without a request; none for the default
    /// @throws Failure for a time that is too long, or when too many are open
    PulledPiece open(Reply reply, PullKind kind, const std::optional<std::string>& owner,
                     std::optional<std::uint32_t> seconds, std::size_t most);
    /// @throws Failure for an enumeration that is not open, not of that kind, or not the owner's
    PulledPiece pull(const std::string& context, PullKind kind,
                     const std::optional<std::string>& owner, std::size_t most);
    void close(const std::string& context, const std::optional<std::string>& owner);
    /// Frees what nobody asks for any more.
    void expire();
    std::size_t size() const;

private:
    using Clock = std::chrono::steady_clock;
    struct Enumeration {
        PullKind kind;
        std::optional<std::string> owner;
        Clock::duration wait;
        Clock::time_point until;
        std::deque<Instance> instances;
        std::deque<ObjectPath> paths;
    };
    using Open = std::map<std::string, Enumeration>;
    Open::iterator find(const std::string& context, const std::optional<std::string>& owner);
    static PulledPiece take(Enumeration& from, std::size_t most);

    mutable std::mutex m_mutex;
    Open m_open;
};

}  // namespace cimom

#endif
