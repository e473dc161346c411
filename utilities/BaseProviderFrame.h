/// The steps around every operation of zemBaseProvider; private to its sources.
///
/// What differs between the operations stands in one table at the top of BaseProviderFrame.cpp, one
/// row each; what they do stands in the callable that a wrapper hands to run(). A frame lives on
/// the stack of one operation.
#ifndef ZEM_BASE_PROVIDER_FRAME_H
#define ZEM_BASE_PROVIDER_FRAME_H

#include <functional>
#include <optional>
#include <string>

#include "BaseProvider.h"

class CTimeLoger;
struct zemOperationRow;

/// In the order of the table's rows.
enum class zemOperation {
    GetInstance,
    InnerGetInstance,
    EnumInstances,
    EnumInstanceNames,
    SetInstance,
    CreateInstance,
    DeleteInstance,
    Associators,
    AssociatorNames,
    References,
    ReferenceNames,
    InvokeMethod,
    GetProperty,
    SetProperty,
    MustPoll,
    ActivateFilter,
    AuthorizeFilter,
    DeActivateFilter,
    EnableIndications,
    DisableIndications,
};

class zemOperationFrame {
public:
    /// @param path, result  null for operations that have none
    zemOperationFrame(zemBaseProvider& provider, zemOperation operation, const CmpiContext& ctx,
                      const CmpiObjectPath* path = nullptr, CmpiResult* result = nullptr);

    /// The class filter of an association operation, tested in place of the path's class.
    void setFilterClass(const char* className);
    /// The event type that a refused filter operation names in place of the class.
    void setEventType(const char* eventType);
    /// Opens the lines on standard output that tell of a filter; without it there are none.
    void setFilterLabel(const char* label) { m_filterLabel = label; }
    /// The instance whose properties count as keys.
    void setInstance(const CmpiInstance& instance) { m_instance = &instance; }
    void setMethod(const char* method) { m_method = method != nullptr ? method : ""; }

    /// Runs the whole operation: entry, tests, @p work, end of the result, exit. What a test or
    /// the work throws becomes the status; exceptions of other types pass through.
    CmpiStatus run(const std::function<void()>& work);

    /// The same in pieces, for the operation that answers no status. admit() is false when the
    /// provider is disabled and the operation is to answer nothing.
    void enter();
    bool admit();
    void leave();

    /// From inside the work: answers this status as it stands, and skips the rest of the frame.
    void answer(const CmpiStatus& status) { m_answer = status; }

    void traceExit() const;
    void traceStatus(const CmpiStatus& status) const;
    void traceDetail(const char* text) const;

    /// Class of the path.
    const char* className() const { return m_className; }

private:
    std::string timingKey() const;
    void endTiming(const std::string& key) const;
    [[noreturn]] void refuseKeys() const;
    void traceBanner(zemString path) const;
    void logFilter() const;
    void testClass();
    void testKeys();
    bool hasKey(const char* key) const;
    CmpiStatus answerFailure(const CmpiStatus& status) const;
    CmpiStatus answerFailure(const zemException& failure) const;
    CmpiStatus logAndAnswerOK(const CmpiStatus& status) const;

    zemBaseProvider& m_provider;
    const zemOperationRow& m_row;
    const CmpiContext& m_ctx;
    const CmpiObjectPath* m_path;
    CmpiResult* m_result;
    const CmpiInstance* m_instance = nullptr;
    const char* m_method = nullptr;
    const char* m_filterLabel = nullptr;
    zemString m_className;
    zemString m_testedClass;
    zemString m_namedClass;
    CTimeLoger* m_timing = nullptr;
    std::string m_timingKey;
    std::optional<CmpiStatus> m_answer;
};

#endif
