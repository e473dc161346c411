/// What Java tells of an event, and of an object in it.
///
/// Thread-safety: an event belongs to the thread that Java delivers it on, until its callback
/// returns, and so do the objects that it gives.
#ifndef WRT_EVENT_HELPER_EVENT_H
#define WRT_EVENT_HELPER_EVENT_H

#include "JniTypes.h"
#include "JvmHelper.h"
#include "StringUtils.h"
#include "ZemExport.h"

/// The view of one Java event. The getters throw what a Java exception in them raises
/// (zemJvmServices::checkException()); objects that they return are local references, null for what
/// is not there or of another class.
class ZEM_EXPORT zemWRTEvent {
public:
    /// @param helper  made with the environment of this thread; outlives the event
    /// @param event   not null; outlives the event
    zemWRTEvent(zemJvmHelper* helper, jobject& event);
    ~zemWRTEvent();
    zemWRTEvent(const zemWRTEvent&) = delete;
    zemWRTEvent& operator=(const zemWRTEvent&) = delete;

    /// One of zemEventSubscription.
    int getEventType() const;
    /// A class of zemWrtConstants, such as getLPAR_CIM_CLASS(); empty for events of no object.
    zemString getObjectType() const;

    /// The object of the event before and after; null where there was or is none.
    jobject getOldObject() const;
    jobject getNewObject() const;

    /// What the event's getter @p name ("getNewObject") returns, when that is a
    /// java.util.Hashtable; read it with zemJvmServices::getValueOfHashtable().
    jobject getHashObject(const char* name) const;

    /// The same for a com.orx.wrt.rep.client.RClientObject, a set of properties.
    jobject getRClientObject(const char* name) const;
    jobject getOldRClientObject() const { return getRClientObject("getOldObject"); }
    jobject getNewRClientObject() const { return getRClientObject("getNewObject"); }

    /// The text of a property such as zemWrtConstants::getNAME(); empty for a null @p object and
    /// for what it does not have.
    zemString getRClientObjectProperty(jobject object, const char* name) const;

    zemJvmHelper* getJvmHelper() const { return m_jvm; }

private:
    JNIEnv* env() const { return m_jvm->getEnv(); }
    jobject object(const char* getter) const;
    jobject object(const char* getter, const char* signature) const;
    jobject objectOf(const char* getter, const char* className) const;

    zemJvmHelper* m_jvm;
    jobject m_WRTEventObject;
    jclass m_WRTEventClass;
};

/// What else the console's Java side is asked for. Any thread may call.
class ZEM_EXPORT zemDnxPegasusApi {
public:
    /// @param helper  of a zemJvmHelperRef, which is held meanwhile
    explicit zemDnxPegasusApi(zemJvmHelper* helper) : m_jvm(helper) {}

    /// The last reference code of a partition, through com.orx.wrt.api.DnxPegasusApi.
    /// @param mtms,lparId  the host's key and the partition's number
    /// @throws zemOperationFailedException no VM; whatever Java refuses
    zemString getLparRefCode(const char* mtms, const char* lparId) const;

private:
    zemJvmHelper* m_jvm;
};

#endif
