#include "CimXmlPulls.h"

#include <sys/random.h>

#include <algorithm>
#include <cstdio>
#include <iterator>
#include <utility>

#include "Failure.h"

namespace cimom {

namespace {

std::string unguessableName() {
    unsigned char bytes[16];
    if (getrandom(bytes, sizeof bytes, 0) != sizeof bytes) {
        throw Failure(CMPI_RC_ERROR_SYSTEM, "no random numbers");
    }
    std::string name;
    for (unsigned char byte : bytes) {
        char digits[3];
        std::snprintf(digits, sizeof digits, "%02x", byte);
        name += digits;
    }
    return name;
}

template <class List>
List takeFirst(List& from, std::size_t most) {
    if (most >= from.size()) {
        return std::exchange(from, {});
    }
    const auto end = from.begin() + static_cast<std::ptrdiff_t>(most);
    List first(std::make_move_iterator(from.begin()), std::make_move_iterator(end));
    from.erase(from.begin(), end);
    return first;
}

}  // namespace

PulledPiece CimXmlPulls::take(Enumeration& from, std::size_t most) {
    PulledPiece piece;
    most = std::min(most, kMostAtOnce);
    piece.instances = takeFirst(from.instances, most);  // there are these or the others
    piece.paths = takeFirst(from.paths, most);
    return piece;
}

PulledPiece CimXmlPulls::open(Reply reply, PullKind kind, const std::optional<std::string>& owner,
                              std::optional<std::uint32_t> seconds, std::size_t most) {
    const std::chrono::seconds wait(seconds.value_or(kDefaultWait.count()));
    if (wait > kLongestWait || wait.count() == 0) {
        throw Failure(kInvalidOperationTimeout, "an enumeration stays open for 1 to " +
                                                    std::to_string(kLongestWait.count()) +
                                                    " seconds");
    }
    Enumeration enumeration{
        kind, owner, wait, Clock::now() + wait, std::move(reply.instances), std::move(reply.paths)};
    PulledPiece piece = take(enumeration, most);
    if (enumeration.instances.empty() && enumeration.paths.empty()) {
        return piece;
    }
    expire();
    const std::lock_guard<std::mutex> lock(m_mutex);
    if (m_open.size() >= kMostOpen) {
        throw Failure(kServerLimitsExceeded, std::to_string(kMostOpen) + " enumerations are open");
    }
    piece.context = unguessableName();
    m_open.emplace(piece.context, std::move(enumeration));
    return piece;
}

CimXmlPulls::Open::iterator CimXmlPulls::find(const std::string& context,
                                              const std::optional<std::string>& owner) {
    const auto found = m_open.find(context);
    if (found == m_open.end() || found->second.owner != owner ||
        found->second.until < Clock::now()) {
        throw Failure(kInvalidEnumerationContext, "no such enumeration is open");
    }
    return found;
}

PulledPiece CimXmlPulls::pull(const std::string& context, PullKind kind,
                              const std::optional<std::string>& owner, std::size_t most) {
    const std::lock_guard<std::mutex> lock(m_mutex);
    const auto found = find(context, owner);
    Enumeration& enumeration = found->second;
    if (enumeration.kind != kind) {
        throw Failure(kInvalidEnumerationContext, "the enumeration is of something else");
    }
    PulledPiece piece = take(enumeration, most);
    if (enumeration.instances.empty() && enumeration.paths.empty()) {
        m_open.erase(found);
    } else {
        piece.context = context;
        enumeration.until = Clock::now() + enumeration.wait;
    }
    return piece;
}

void CimXmlPulls::close(const std::string& context, const std::optional<std::string>& owner) {
    const std::lock_guard<std::mutex> lock(m_mutex);
    m_open.erase(find(context, owner));
}

void CimXmlPulls::expire() {
    const std::lock_guard<std::mutex> lock(m_mutex);
    for (auto each = m_open.begin(); each != m_open.end();) {
        each = each->second.until < Clock::now() ? m_open.erase(each) : std::next(each);
    }
}

std::size_t CimXmlPulls::size() const {
    const std::lock_guard<std::mutex> lock(m_mutex);
    return m_open.size();
}

}  // namespace cimom
