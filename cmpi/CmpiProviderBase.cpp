#include "CmpiProviderBase.h"

#include <algorithm>
#include <mutex>
#include <vector>

namespace {

// One entry for each living provider object, oldest first. Kept by address: a broker may know
// itself by it, and a copy would read fields that a broker of an older level doesn't have. The
// youngest is read without the lock, for every string that is made.
struct Brokers {
    std::mutex lock;
    std::vector<const CMPIBroker*> all;
    std::atomic<const CMPIBroker*> youngest{nullptr};
};

Brokers& brokers() {
    // Never destroyed: provider objects with static storage may outlive this library's statics.
    static Brokers& instance = *new Brokers;
    return instance;
}

}  // namespace

CmpiProviderBase::CmpiProviderBase() : baseMI(nullptr), useCount(0) {}

CmpiProviderBase::~CmpiProviderBase() {}

CmpiBaseMI* CmpiProviderBase::getBaseMI() { return baseMI; }

void CmpiProviderBase::setBaseMI(CmpiBaseMI* aBaseMI) { baseMI = aBaseMI; }

void CmpiProviderBase::incUseCount() { ++useCount; }

int CmpiProviderBase::decUseCount() { return --useCount; }

CMPIBroker* CmpiProviderBase::getBroker() {
    return const_cast<CMPIBroker*>(brokers().youngest.load());
}

void CmpiProviderBase::setBroker(const CMPIBroker* mb) {
    if (!mb) {
        return;
    }
    Brokers& b = brokers();
    const std::lock_guard<std::mutex> guard(b.lock);
    b.all.push_back(mb);
    b.youngest = mb;
}

void CmpiProviderBase::dropBroker(const CMPIBroker* mb) {
    Brokers& b = brokers();
    const std::lock_guard<std::mutex> guard(b.lock);
    const auto last = std::find(b.all.rbegin(), b.all.rend(), mb);
    if (last == b.all.rend()) {
        return;
    }
    b.all.erase(std::next(last).base());
    b.youngest = b.all.empty() ? nullptr : b.all.back();
}
