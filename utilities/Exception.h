/// zemException and its eight subclasses: every failure that crosses a function boundary.
///
/// Thrown by value, caught by value or reference. The kind, not the class, decides which CMPI
/// status a client sees, and the texts decide its words; a subclass only fixes the kind, so that
/// a handler of the base loses nothing. Objects own copies of their texts; null texts read as "".
///
/// Thread-safety: plain values.
#ifndef EXCEPTION_H
#define EXCEPTION_H

#include "StringUtils.h"
#include "ZemExport.h"

class ZEM_EXPORT zemException {
public:
    /// @param type    the kind, one of the subclasses' `kind`
    /// @param cls     class that throws
    /// @param method  method that throws
    /// @param access  access method on whose behalf the work ran
    /// @param id      identifier of the failure: free text or a message key
    /// @param text    the words for a human
    zemException(int type, const char* text);
    zemException(int type, const char* cls, const char* method, const char* text);
    zemException(int type, const char* cls, const char* method, const char* id, const char* text);
    zemException(int type, const char* cls, const char* method, const char* access, const char* id,
                 const char* text);

    /// The texts are never null and belong to the object.
    int getExceptionType() const { return m_exceptionType; }
    const char* getAccessMethod() const { return m_accessMethod; }
    const char* getExceptionId() const { return m_exceptionId; }
    const char* getExceptionString() const { return m_exceptionString; }
    const char* getThrowingClass() const { return m_throwingClass; }
    const char* getThrowingMethod() const { return m_throwingMethod; }

    /// A changed type changes the status that the object maps to, whatever its class.
    void setExceptionType(int type) { m_exceptionType = type; }
    void setAccessMethod(const char* text) { m_accessMethod = text; }
    void setExceptionId(const char* text) { m_exceptionId = text; }
    void setExceptionString(const char* text) { m_exceptionString = text; }
    void setThrowingClass(const char* text) { m_throwingClass = text; }
    void setThrowingMethod(const char* text) { m_throwingMethod = text; }

    /// All texts for a log: the non-empty fields with their labels, then the exception string.
    zemString toString() const;

protected:
    explicit zemException(int type);

private:
    zemException();

    int m_exceptionType;
    zemString m_accessMethod;
    zemString m_exceptionId;
    zemString m_exceptionString;
    zemString m_throwingClass;
    zemString m_throwingMethod;
};

// One subclass: its kind, and the base's constructors with that kind put in.
#define ZEM_EXCEPTION_CLASS(NAME, KIND)                                               \
    class ZEM_EXPORT NAME : public zemException {                                     \
    public:                                                                           \
        static constexpr int kind = KIND;                                             \
        explicit NAME(const char* text) : zemException(kind, text) {}                 \
        NAME(const char* cls, const char* method, const char* text)                   \
            : zemException(kind, cls, method, text) {}                                \
        NAME(const char* cls, const char* method, const char* id, const char* text)   \
            : zemException(kind, cls, method, id, text) {}                            \
        NAME(const char* cls, const char* method, const char* access, const char* id, \
             const char* text)                                                        \
            : zemException(kind, cls, method, access, id, text) {}                    \
                                                                                      \
    private:                                                                          \
        NAME() : zemException(0) {}                                                   \
    }

ZEM_EXCEPTION_CLASS(zemAccessDeniedException, 1);
ZEM_EXCEPTION_CLASS(zemObjectAlreadyExistsException, 2);
ZEM_EXCEPTION_CLASS(zemInvalidParameterException, 3);
ZEM_EXCEPTION_CLASS(zemNotSupportedException, 4);
ZEM_EXCEPTION_CLASS(zemObjectNotFoundException, 5);
ZEM_EXCEPTION_CLASS(zemOperationFailedException, 6);
ZEM_EXCEPTION_CLASS(zemPropertyNotFoundException, 7);
ZEM_EXCEPTION_CLASS(zemMethodNotFoundException, 8);

#undef ZEM_EXCEPTION_CLASS

#endif
