/// When the runner of a tool looks at its child again, and when it gives up.
///
/// The plan only counts; its user sleeps and looks. One object belongs to one run.
#ifndef POLL_PLAN_H
#define POLL_PLAN_H

#include <chrono>
#include <cstdint>

/// The passes of one run: each begins with expired() and, while the child runs, ends with pause().
///
/// Without a limit a run is looked at every 2 milliseconds for about twenty minutes, then after
/// 1, 2, 4 ... 32768 milliseconds, then once a minute for ever. With a limit the passes lie a tenth
/// of a second apart.
///
/// The long waits are for a system that cannot wake the runner at its child's end. Where it can, by
/// a descriptor of the child (Linux from 5.3 on), a run without a limit never asks for a pause.
class zemPollPlan {
public:
    /// @param waitTime  limit in microseconds; zero or less means none. Only whole tenths of a
    ///        second count, so that a limit below one is reached at once. Callers have scaled their
    ///        values to this grain; it is not to be mended.
    explicit zemPollPlan(int waitTime) : m_limited(waitTime > 0) {
        if (!m_limited) {
            return;
        }
        // The product is taken in 32 bits, where it wraps above two seconds. A negative unit makes
        // the count zero, reached at once, or negative, which only counts further down.
        const auto product = static_cast<int32_t>(static_cast<uint32_t>(waitTime) * 1000U);
        m_unit = product < kLongestUnit ? product : kLongestUnit;
        m_passesLeft = m_unit != 0 ? waitTime / m_unit : -1;
    }

    /// Whether there is a limit, so that the number of passes counts.
    bool limited() const { return m_limited; }

    /// Begins a pass: true when the limit is used up.
    bool expired() {
        if (m_limited && m_passesLeft == 0) {
            return true;
        }
        --m_passesLeft;
        return false;
    }

    /// How long to sleep before the next pass.
    std::chrono::microseconds pause() {
        if (m_limited && m_passesLeft > 0) {
            return std::chrono::microseconds(m_unit);
        }
        if (!m_longRegime) {
            if (m_count > kShortPasses) {
                m_longRegime = true;
                m_count = 1;
                return std::chrono::microseconds(0);
            }
            ++m_count;
            return std::chrono::milliseconds(2);
        }
        if (m_count > kLongestWait) {
            return std::chrono::minutes(1);
        }
        const std::chrono::milliseconds wait(m_count);
        m_count *= 2;
        return wait;
    }

private:
    static constexpr int32_t kLongestUnit = 100000;  // microseconds
    static constexpr int kShortPasses = 600000;
    static constexpr int kLongestWait = 60000;  // milliseconds

    bool m_limited;
    int32_t m_unit = 0;
    int64_t m_passesLeft = 0;
    bool m_longRegime = false;
    int m_count = 0;
};

#endif
