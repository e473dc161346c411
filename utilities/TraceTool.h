/// The timing trace: "begin" and "end" lines with a microsecond clock around provider operations.
///
/// Off unless the environment variable VM_CIMPROVIDER_TRACE is set when the manager first comes
/// into being; VM_CIMPROVIDER_TRACE_PATH may name the file, /tmp/CIMTestPerfData.txt otherwise.
/// Lines gather in a queue in memory, and one background thread writes them out, so that the
/// threads of operations never touch the file. When off, begin(), end() and log() of the
/// manager's loggers cost next to nothing.
///
/// Thread-safety: loggers and the manager are shared by all threads. Lines of one thread stand in
/// the file in the order in which it wrote them.
///
///     CTimeLoger* timing = CTimeLogerManager::getInstance()->getLogger("enumInstances");
///     timing->begin(key);
///     ...
///     timing->end(key);
#ifndef TRACE_TOOL_H
#define TRACE_TOOL_H

#include <sys/types.h>

#include <atomic>
#include <cstdint>
#include <memory>

#include "DynamicArray.h"
#include "StringUtils.h"
#include "Synchronizer.h"
#include "Thread.h"
#include "ZemExport.h"

/// A clock of microseconds since the epoch that keeps three ticks: the begin mark, the current
/// reading and the one before it. May be read by many threads; their readings then mix.
class ZEM_EXPORT CTimer {
public:
    enum tagTimeIntervalType { fromprevious = 0, frombegin = 1 };
    enum tagTimerPrecisionType { milli = 0, micro = 1 };

    /// Takes the first reading as the begin mark.
    CTimer();

    /// Takes a reading and returns it; a non-zero @p setBegin makes it the begin mark as well.
    std::uint64_t timer(int setBegin);

    /// From the previous reading or the begin mark to the current reading, in milliseconds or
    /// microseconds, negative after the clock was set back; 0 for other intervals.
    int getElapsedTime(tagTimeIntervalType interval, tagTimerPrecisionType precision) const;

private:
    // Timers are shared by all threads.
    std::atomic<std::uint64_t> _beginTick;
    std::atomic<std::uint64_t> _currentTick;
    std::atomic<std::uint64_t> _previousTick;
};

/// Builds the lines of one named logger and leaves to its subclasses where they go. What fails on
/// the way loses the line, and nothing else.
class ZEM_EXPORT CTimeLoger {
public:
    explicit CTimeLoger(const zemString& id);
    virtual ~CTimeLoger();

    /// Bracket a piece of work; @p text tells one from another.
    void begin(const char* text);
    void end(const char* text);

    /// A line of three texts at the current tick.
    void log(const char* a, const char* b, const char* c);

    const zemString& getId() const { return _id; }

protected:
    /// @param isSwitched  lines go to the manager's queue, and are not even built while tracing is
    ///                    off
    CTimeLoger(const zemString& id, bool isSwitched);

    /// Takes one line, without its newline.
    virtual void log(const char* text) = 0;

private:
    bool isDropped() const;
    void mark(int setBegin, const char* word, const char* text);

    zemString _id;
    CTimer _timer;
    bool _isSwitched;
};

/// Sends its lines to the manager's queue; the manager makes them.
class ZEM_EXPORT CTimeThreadLoger : public CTimeLoger {
public:
    explicit CTimeThreadLoger(const zemString& id);

protected:
    void log(const char* text) override;
};

/// A file that is opened for append and closed with the object. It belongs to its user alone, no
/// child keeps it, no link is followed, and nothing waits for the reader of a FIFO. Lines that the
/// file does not take are lost. Any thread may call.
class ZEM_EXPORT CFileLoger {
public:
    explicit CFileLoger(const zemString& path);
    ~CFileLoger();
    CFileLoger(const CFileLoger&) = delete;
    CFileLoger& operator=(const CFileLoger&) = delete;

    /// Writes the line and a newline, at once.
    void log(const char* text);

private:
    zemString m_filepath;
    int m_logger;  ///< a descriptor, as no stream refuses links and FIFOs
};

/// Writes its lines to a file of its own, "/tmp/CIMTest-" and the id of the thread that makes it.
class ZEM_EXPORT CTimeFileLoger : public CTimeLoger {
public:
    explicit CTimeFileLoger(const zemString& id);

protected:
    void log(const char* text) override;

private:
    CFileLoger m_logger;
};

/// The one owner of the loggers, the queue, the file and the thread that drains one into the
/// other.
class ZEM_EXPORT CTimeLogerManager {
public:
    using LogListData = zemDynamicArray<zemString>;

    /// The only manager; the first call reads the environment, starts the trace if that asks for
    /// it, and says on standard output what it found. It outlives the exit of the process: the
    /// lines of threads that still run then are dropped.
    static CTimeLogerManager* getInstance();

    /// The logger of that name, made at the first call, owned by the manager. When tracing is off
    /// all names share one.
    CTimeLoger* getLogger(const zemString& name);

    /// Appends a line to the queue; nothing when tracing is off.
    void log(const char* text);

    /// Hands the queue over to the caller, who deletes it, once it has 50 lines or is a minute
    /// old; else null.
    LogListData* getLogQueue();

    bool isEnabled() const { return _enableLogger; }

private:
    CTimeLogerManager();
    ~CTimeLogerManager() = delete;
    CTimeLogerManager(const CTimeLogerManager&) = delete;
    CTimeLogerManager& operator=(const CTimeLogerManager&) = delete;

    static void monitorThread(void* manager);
    void drain();
    void shutDown();
    CTimeLoger* findOrAdd(const zemString& name);

    std::unique_ptr<CFileLoger> _logger;
    zemThread m_monitorThread;
    std::atomic<bool> m_stopThread;
    CTimer _timer;
    zemCondition m_threadCond;
    std::unique_ptr<LogListData> _messageQueue;
    zemSynchronizerContext _queuecontext;
    zemSynchronizerContext _loggercontext;
    zemDynamicArray<CTimeLoger> _loggers;
    bool _enableLogger;
    pid_t m_process;
};

#endif
