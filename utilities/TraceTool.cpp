#include "TraceTool.h"

#include <fcntl.h>
#include <sched.h>
#include <sys/time.h>
#include <sys/uio.h>
#include <unistd.h>

#include <cstdlib>
#include <cstring>
#include <memory>
#include <string>

#include "LetUnwind.h"
#include "Log.h"
#include "SigpipeHeld.h"

namespace {

constexpr char kSwitchVariable[] = "VM_CIMPROVIDER_TRACE";
constexpr char kPathVariable[] = "VM_CIMPROVIDER_TRACE_PATH";
constexpr char kDefaultPath[] = "/tmp/CIMTestPerfData.txt";

constexpr int kQueueStep = 25;
constexpr int kFullQueue = 50;
constexpr int kOldQueueMilliseconds = 60000;
constexpr int kPollMilliseconds = 500;

const char* variable(const char* name) {
    const char* const value = std::getenv(name);
    if (value == nullptr) {
        zemLog::LogPlain((std::string("env not set for ") + name).c_str());
    }
    return value;
}

zemString fileOfThread() {
    zemString path;
    path.format("/tmp/CIMTest-%d", zemThread::getCurrentThreadId());
    return path;
}

}  // namespace

CTimer::CTimer() : _beginTick(0), _currentTick(0), _previousTick(0) { timer(1); }

std::uint64_t CTimer::timer(int setBegin) {
    timeval now{};
    gettimeofday(&now, nullptr);
    const std::uint64_t tick =
        static_cast<std::uint64_t>(now.tv_sec) * 1000000U + static_cast<std::uint64_t>(now.tv_usec);
    _previousTick = _currentTick.exchange(tick);
    if (setBegin != 0) {
        _beginTick = tick;
    }
    return tick;
}

int CTimer::getElapsedTime(tagTimeIntervalType interval, tagTimerPrecisionType precision) const {
    if (interval != fromprevious && interval != frombegin) {
        return 0;
    }
    const std::uint64_t from = interval == fromprevious ? _previousTick : _beginTick;
    // Signed: the clock may have been set back in between.
    const auto elapsed = static_cast<std::int64_t>(_currentTick - from);
    return static_cast<int>(precision == micro ? elapsed : elapsed / 1000);
}

CTimeLoger::CTimeLoger(const zemString& id) : CTimeLoger(id, false) {}

CTimeLoger::CTimeLoger(const zemString& id, bool isSwitched) : _id(id), _isSwitched(isSwitched) {}

CTimeLoger::~CTimeLoger() = default;

bool CTimeLoger::isDropped() const {
    return _isSwitched && !CTimeLogerManager::getInstance()->isEnabled();
}

// A line that cannot be built or written is lost: marks are set in destructors, too.
void CTimeLoger::mark(int setBegin, const char* word, const char* text) {
    if (isDropped()) {
        return;
    }
    const unsigned long long tick = _timer.timer(setBegin);
    const char* const id = _id;
    zemQuietly([&] {
        zemString line;
        line.format("+++%s:%d %s-%s %s at %llu.", id, zemThread::getCurrentThreadId(), id, text,
                    word, tick);
        log(line);
    });
}

void CTimeLoger::begin(const char* text) { mark(1, "begin", text); }

void CTimeLoger::end(const char* text) { mark(0, "end", text); }

void CTimeLoger::log(const char* a, const char* b, const char* c) {
    if (isDropped()) {
        return;
    }
    const unsigned long long tick = _timer.timer(0);
    const char* const id = _id;
    zemQuietly([&] {
        zemString line;
        line.format("+++%s:%d,%llu, %s,%s-%s,%s", id, zemThread::getCurrentThreadId(), tick, id, a,
                    b, c);
        log(line);
    });
}

CTimeThreadLoger::CTimeThreadLoger(const zemString& id) : CTimeLoger(id, true) {}

void CTimeThreadLoger::log(const char* text) { CTimeLogerManager::getInstance()->log(text); }

CTimeFileLoger::CTimeFileLoger(const zemString& id) : CTimeLoger(id), m_logger(fileOfThread()) {}

void CTimeFileLoger::log(const char* text) {
    zemString line;
    line.format("++%s: %s", static_cast<const char*>(getId()), text);
    m_logger.log(line);
}

// The name may lie where anyone can put something else in its place.
CFileLoger::CFileLoger(const zemString& path)
    : m_filepath(path),
      m_logger(open(m_filepath, O_WRONLY | O_APPEND | O_CREAT | O_NOFOLLOW | O_CLOEXEC | O_NONBLOCK,
                    S_IRUSR | S_IWUSR)) {}

CFileLoger::~CFileLoger() {
    const zemUncancelled uncancelled;
    if (m_logger >= 0) {
        close(m_logger);
    }
}

void CFileLoger::log(const char* text) {
    const zemSigpipeHeld held;
    char newline = '\n';
    const iovec line[] = {{const_cast<char*>(text), std::strlen(text)}, {&newline, 1}};
    if (writev(m_logger, line, 2) < 0) {
        return;  // a trace that is lost is no failure
    }
}

// Never destroyed: other threads may still be timing while the process ends. Only its own thread
// must have ended before what it stands on goes.
CTimeLogerManager* CTimeLogerManager::getInstance() {
    static CTimeLogerManager* const manager = new CTimeLogerManager;
    static const struct End {
        ~End() { manager->shutDown(); }
    } end;
    return manager;
}

CTimeLogerManager::CTimeLogerManager()
    : m_stopThread(false), _messageQueue(nullptr), _enableLogger(false), m_process(getpid()) {
    if (variable(kSwitchVariable) == nullptr) {
        return;
    }
    _messageQueue = std::make_unique<LogListData>(kQueueStep);
    const char* const named = variable(kPathVariable);
    const zemString path(named == nullptr ? kDefaultPath : named);
    zemLog::LogPlain("path:" + path);
    _logger = std::make_unique<CFileLoger>(path);
    _timer.timer(1);
    // Without a drain the queue would grow without bound.
    _enableLogger = m_monitorThread.start(monitorThread, this) == 0;
}

// In a child of a fork there is no such thread to wait for.
void CTimeLogerManager::shutDown() {
    if (!_enableLogger || m_process != getpid()) {
        return;
    }
    m_stopThread = true;
    m_threadCond.signal();
    sched_yield();
    // A signal between the thread's look at the flag and its wait is lost: it is given again, for
    // as long as that wait can last.
    for (int i = 0; i < kPollMilliseconds && m_monitorThread.isStarted(); ++i) {
        m_threadCond.signal();
        usleep(1000);
    }
    m_monitorThread.waitThreadExit();
    _logger.reset();
}

CTimeLoger* CTimeLogerManager::getLogger(const zemString& name) {
    if (!_enableLogger) {
        static CTimeLoger* const dummy = findOrAdd("dummy");
        return dummy;
    }
    return findOrAdd(name);
}

CTimeLoger* CTimeLogerManager::findOrAdd(const zemString& name) {
    zemSynchronizer hold(_loggercontext);
    for (int i = 0; i < _loggers.size(); ++i) {
        CTimeLoger* const logger = _loggers.getElementAt(i);
        if (logger->getId() == name) {
            return logger;
        }
    }
    auto logger = std::make_unique<CTimeThreadLoger>(name);
    _loggers.addElement(logger.get());
    return logger.release();
}

void CTimeLogerManager::log(const char* text) {
    if (!_enableLogger || m_stopThread) {
        return;
    }
    auto line = std::make_unique<zemString>(text);
    zemSynchronizer hold(_queuecontext);
    _messageQueue->addElement(line.get());
    static_cast<void>(line.release());
}

CTimeLogerManager::LogListData* CTimeLogerManager::getLogQueue() {
    zemSynchronizer hold(_queuecontext);
    _timer.timer(0);
    if (_messageQueue == nullptr || _messageQueue->size() == 0) {
        return nullptr;
    }
    if (_messageQueue->size() < kFullQueue &&
        _timer.getElapsedTime(CTimer::frombegin, CTimer::milli) < kOldQueueMilliseconds) {
        return nullptr;
    }
    auto next = std::make_unique<LogListData>(kQueueStep);
    _messageQueue.swap(next);
    _timer.timer(1);
    return next.release();
}

void CTimeLogerManager::monitorThread(void* manager) {
    auto* const self = static_cast<CTimeLogerManager*>(manager);
    while (!self->m_stopThread) {
        self->drain();
        if (!self->m_stopThread) {
            self->m_threadCond.timedWait(kPollMilliseconds);
        }
    }
}

void CTimeLogerManager::drain() {
    const std::unique_ptr<LogListData> queue(getLogQueue());
    for (int i = 0; queue != nullptr && i < queue->size(); ++i) {
        _logger->log(*queue->getElementAt(i));
    }
}
