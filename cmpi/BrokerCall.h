// Calls into a server's function tables, used by every handle class of the binding.
//
// Servers leave entries null, end tables early and return no object without saying why. Here each
// of these becomes a CmpiStatus, in one place. No call looks at a table's version, which servers
// don't keep: an entry that is there is called.
#ifndef _BrokerCall_h_
#define _BrokerCall_h_

#include "CmpiStatus.h"
#include "cmpift.h"

namespace brokercall {

void check(const CMPIStatus& rc);
[[noreturn]] void refuse(CMPIrc rc, const char* text);

/// An object that is passed on to the server.
template <class Object>
Object* given(Object* object) {
    if (!object) {
        refuse(CMPI_RC_ERR_INVALID_HANDLE, "A null object was passed.");
    }
    return object;
}

/// A name that is passed on to the server.
inline const char* named(const char* name) {
    if (!name) {
        refuse(CMPI_RC_ERR_INVALID_PARAMETER, "No name was passed.");
    }
    return name;
}

/// A text that is passed on to the server, which may not be ready for null.
inline const char* orEmpty(const char* text) { return text ? text : ""; }

/// An object that the server has to return.
template <class Object>
Object* need(Object* object) {
    if (!object) {
        refuse(CMPI_RC_ERR_FAILED, "The CIM server returned no object.");
    }
    return object;
}

inline const CMPIBroker* theBroker(const CMPIBroker* broker) {
    if (!broker) {
        refuse(CMPI_RC_ERR_FAILED, "There is no broker.");
    }
    return broker;
}
inline const CMPIBrokerFT* tableOf(const CMPIBroker* broker, const CMPIBrokerFT*) {
    return theBroker(broker)->bft;
}
inline const CMPIBrokerEncFT* tableOf(const CMPIBroker* broker, const CMPIBrokerEncFT*) {
    return theBroker(broker)->eft;
}
template <class Object, class Table>
const Table* tableOf(const Object* object, const Table*) {
    return given(object)->ft;
}

template <class Object, class Table, class Entry>
Entry entryOf(const Object* object, Entry Table::*entry) {
    const Table* table = tableOf(object, static_cast<const Table*>(nullptr));
    if (!table || !(table->*entry)) {
        refuse(CMPI_RC_ERR_NOT_SUPPORTED, "The CIM server does not offer this operation.");
    }
    return table->*entry;
}

/// Calls an entry that reports through a status pointer, its last argument.
template <class Object, class Entry, class... Args>
auto ask(Object* object, Entry entry, Args... args) {
    CMPIStatus rc = {CMPI_RC_OK, nullptr};
    auto answer = entryOf(object, entry)(object, args..., &rc);
    check(rc);
    return answer;
}

/// Calls an entry that returns a status.
template <class Object, class Entry, class... Args>
void tell(Object* object, Entry entry, Args... args) {
    check(entryOf(object, entry)(object, args...));
}

/// The value that stands for one that is not there.
CMPIData missing();

/// Turns the outcome of a search into a value: missing() when there is none under @p name, which
/// may be null for a search by position.
CMPIData found(const CMPIData& data, const CMPIStatus& rc, const char* name);

/// Calls an entry that searches by name.
template <class Object, class Entry>
CMPIData find(Object* object, Entry entry, const char* name) {
    CMPIStatus rc = {CMPI_RC_OK, nullptr};
    const CMPIData data = entryOf(object, entry)(object, named(name), &rc);
    return found(data, rc, name);
}

/// Calls an entry that searches by position and tells the name.
template <class Object, class Entry>
CMPIData findAt(Object* object, Entry entry, int position, CMPIString** name) {
    if (position < 0) {
        return missing();
    }
    CMPIStatus rc = {CMPI_RC_OK, nullptr};
    const CMPIData data =
        entryOf(object, entry)(object, static_cast<CMPICount>(position), name, &rc);
    return found(data, rc, nullptr);
}

/// What a table takes for the value: the text itself for CMPI_chars, null for a null value, else
/// the address of the union, so that @p data must outlive the call.
/// @throws CmpiStatus CMPI_RC_ERR_INVALID_DATA_TYPE for a type that is none of CMPI's: servers that
///         store such a value crash when it is read back
const CMPIValue* valueOf(const CMPIData& data);

}  // namespace brokercall

#endif
