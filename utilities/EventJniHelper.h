/// Base of what reaches the appliance's Java side through the VM of the process (zemJvm).
#ifndef EVENT_JNI_HELPER_H
#define EVENT_JNI_HELPER_H

#include "Jvm.h"
#include "ZemExport.h"

class ZEM_EXPORT zemEventJniHelper {
public:
    zemEventJniHelper() : m_jvm(zemJvm::getJvm()) {}
    virtual ~zemEventJniHelper();
    zemEventJniHelper(const zemEventJniHelper&) = delete;
    zemEventJniHelper& operator=(const zemEventJniHelper&) = delete;

protected:
    zemJvm& m_jvm;
};

#endif
