#include "TraceTool.h"

#include <sched.h>
#include <sys/time.h>

#include <cstdlib>
#include <iostream>
#include <memory>
#include <typeinfo>

namespace {

constexpr char switchVariable[] = "VM_CIMPROVIDER_TRACE";
constexpr char pathVariable[] = "VM_CIMPROVIDER_TRACE_PATH";
constexpr char defaultPath[] = "/tmp/CIMTestPerfData.txt";

constexpr int queueStep = 25;
constexpr int fullQueue = 50;
constexpr int oldQueueMilliseconds = 60000;
constexpr int pollMilliseconds = 500;

const char* variable(const char* name) {
    const char* const value = std::getenv(name);
    if (value == nullptr) {
        std::cout << "env not set for " << name << std::endl;
    }
    return value;
}

}  // namespace

CTimer::CTimer() : _beginTick(0), _currentTick(0), _previousTick(0) { timer(1); }

// Loggers are shared by all threads, so the ticks are read and written atomically.
std::uint64_t CTimer::timer(int setBegin) {
    timeval now{};
    gettimeofday(&now, nullptr);
    const std::uint64_t tick =
        static_cast<std::uint64_t>(now.tv_sec) * 1000000U + static_cast<std::uint64_t>(now.tv_usec);
    const std::uint64_t previous = __atomic_exchange_n(&_currentTick, tick, __ATOMIC_RELAXED);
    __atomic_store_n(&_previousTick, previous, __ATOMIC_RELAXED);
    if (setBegin != 0) {
        __atomic_store_n(&_beginTick, tick, __ATOMIC_RELAXED);
    }
    return tick;
}

int CTimer::getElapsedTime(tagTimeIntervalType interval, tagTimerPrecisionType precision) const {
    if (interval != fromprevious && interval != frombegin) {
        return 0;
    }
    const std::uint64_t* const from = interval == fromprevious ? &_previousTick : &_beginTick;
    // Signed: the clock may have been set back in between.
    const auto elapsed = static_cast<std::int64_t>(
        __atomic_load_n(&_currentTick, __ATOMIC_RELAXED) - __atomic_load_n(from, __ATOMIC_RELAXED));
    return static_cast<int>(precision == micro ? elapsed : elapsed / 1000);
}

CTimeLoger::CTimeLoger(const zemString& id) : _id(id) {}

CTimeLoger::~CTimeLoger() = default;

// With tracing off the lines of a thread logger would be thrown away, so they are not even built.
bool CTimeLoger::isDropped() const {
    return typeid(*this) == typeid(CTimeThreadLoger) &&
           !CTimeLogerManager::getInstance()->isEnabled();
}

void CTimeLoger::mark(int setBegin, const char* word, const char* text) {
    if (isDropped()) {
        return;
    }
    const unsigned long long tick = _timer.timer(setBegin);
    const char* const id = _id;
    zemString line;
    line.format("+++%s:%d %s-%s %s at %llu.", id, zemThread::getCurrentThreadId(), id, text, word,
                tick);
    log(line);
}

void CTimeLoger::begin(const char* text) { mark(1, "begin", text); }

void CTimeLoger::end(const char* text) { mark(0, "end", text); }

void CTimeLoger::log(const char* a, const char* b, const char* c) {
    if (isDropped()) {
        return;
    }
    const unsigned long long tick = _timer.timer(0);
    const char* const id = _id;
    zemString line;
    line.format("+++%s:%d,%llu, %s,%s-%s,%s", id, zemThread::getCurrentThreadId(), tick, id, a, b,
                c);
    log(line);
}

CTimeThreadLoger::CTimeThreadLoger(const zemString& id) : CTimeLoger(id) {}

void CTimeThreadLoger::log(const char* text) { CTimeLogerManager::getInstance()->log(text); }

CTimeFileLoger::CTimeFileLoger(const zemString& id) : CTimeLoger(id) {
    m_filepath.format("/tmp/CIMTest-%d", zemThread::getCurrentThreadId());
    m_logger.open(m_filepath, std::ios::app);
}

void CTimeFileLoger::log(const char* text) {
    zemSynchronizer hold(_context);
    m_logger << "++" << getId() << ": " << text << std::endl;
}

CFileLoger::CFileLoger(const zemString& path)
    : m_filepath(path), m_logger(m_filepath, std::ios::app) {}

void CFileLoger::log(const char* text) { m_logger << text << std::endl; }

CTimeLogerManager* CTimeLogerManager::getInstance() {
    static CTimeLogerManager manager;
    return &manager;
}

CTimeLogerManager::CTimeLogerManager()
    : _logger(nullptr), m_stopThread(false), _messageQueue(nullptr), _enableLogger(false) {
    if (variable(switchVariable) == nullptr) {
        return;
    }
    _messageQueue = new LogListData(queueStep);
    const char* const named = variable(pathVariable);
    const zemString path(named == nullptr ? defaultPath : named);
    std::cout << "path:" << path << std::endl;
    _logger = new CFileLoger(path);
    _timer.timer(1);
    // Without a drain the queue would grow without bound.
    _enableLogger = m_monitorThread.start(monitorThread, this) == 0;
}

CTimeLogerManager::~CTimeLogerManager() {
    if (_enableLogger) {
        __atomic_store_n(&m_stopThread, true, __ATOMIC_RELEASE);
        // A signal between the thread's look at the flag and its wait is lost: give it again.
        do {
            m_threadCond.signal();
            sched_yield();
        } while (m_monitorThread.isStarted());
        m_monitorThread.waitThreadExit();
    }
    delete _logger;
    delete _messageQueue;
}

bool CTimeLogerManager::isStopped() const {
    return __atomic_load_n(&m_stopThread, __ATOMIC_ACQUIRE);
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
    if (!_enableLogger) {
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
    if (_messageQueue->size() < fullQueue &&
        _timer.getElapsedTime(CTimer::frombegin, CTimer::milli) < oldQueueMilliseconds) {
        return nullptr;
    }
    LogListData* const full = _messageQueue;
    _messageQueue = new LogListData(queueStep);
    _timer.timer(1);
    return full;
}

void CTimeLogerManager::monitorThread(void* manager) {
    auto* const self = static_cast<CTimeLogerManager*>(manager);
    while (!self->isStopped()) {
        self->drain();
        if (!self->isStopped()) {
            self->m_threadCond.timedWait(pollMilliseconds);
        }
    }
}

void CTimeLogerManager::drain() {
    const std::unique_ptr<LogListData> queue(getLogQueue());
    for (int i = 0; queue != nullptr && i < queue->size(); ++i) {
        _logger->log(*queue->getElementAt(i));
    }
}
