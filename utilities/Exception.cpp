#include "Exception.h"

zemException::zemException() : zemException(0) {}

zemException::zemException(int type) : m_exceptionType(type) {}

zemException::zemException(int type, const char* text)
    : zemException(type, nullptr, nullptr, text) {}

zemException::zemException(int type, const char* cls, const char* method, const char* text)
    : zemException(type, cls, method, nullptr, text) {}

zemException::zemException(int type, const char* cls, const char* method, const char* id,
                           const char* text)
    : zemException(type, cls, method, nullptr, id, text) {}

zemException::zemException(int type, const char* cls, const char* method, const char* access,
                           const char* id, const char* text)
    : m_exceptionType(type),
      m_accessMethod(access),
      m_exceptionId(id),
      m_exceptionString(text),
      m_throwingClass(cls),
      m_throwingMethod(method) {}

zemString zemException::toString() const {
    const struct {
        const char* label;
        const zemString& value;
    } fields[] = {
        {"ThrowingClass: ", m_throwingClass},
        {"ThrowingMethod: ", m_throwingMethod},
        {"AccessMethod: ", m_accessMethod},
        {"ExceptionId: ", m_exceptionId},
    };
    zemString text("\n\t");
    for (const auto& field : fields) {
        if (!field.value.isEmpty()) {
            text += field.label;
            text += field.value;
            text += ' ';
        }
    }
    text += "\n\tExceptionString: ";
    text += m_exceptionString;
    return text;
}
