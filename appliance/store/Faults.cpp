#include "Faults.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <cstdlib>
#include <cstring>
#include <thread>

#include "Failure.h"
#include "Text.h"

namespace appliance {

namespace {

using Plans = std::vector<PlannedFault>;

std::string faultsFile() {
    const char* folder = std::getenv("APPLIANCE_HOME");
    return folder == nullptr || *folder == '\0' ? std::string() : std::string(folder) + "/faults";
}

/// The locked file. One line for each plan; its fields have tabs between them.
class PlanFile {
public:
    /// @param flags  O_CREAT or 0
    explicit PlanFile(int flags) : m_path(faultsFile()) {
        if (m_path.empty()) return;
        m_file = open(m_path.c_str(), O_RDWR | O_CLOEXEC | flags, 0666);
        if (m_file < 0) return;
        // Tools run as other users too, and count what they take.
        if ((flags & O_CREAT) != 0) fchmod(m_file, 0666);
        while (flock(m_file, LOCK_EX) != 0 && errno == EINTR) {
        }
    }
    ~PlanFile() {
        if (m_file >= 0) close(m_file);
    }
    PlanFile(const PlanFile&) = delete;
    PlanFile& operator=(const PlanFile&) = delete;

    bool isOpen() const { return m_file >= 0; }

    void insist() const {
        if (m_path.empty()) throw Failure(Fault::NoHome);
        if (!isOpen()) throw Failure(Fault::StateUnusable, {m_path, std::strerror(errno)});
    }

    Plans read() const;
    bool write(const Plans& plans) const;

private:
    std::string m_path;
    int m_file = -1;
};

Plans PlanFile::read() const {
    std::string text;
    char buffer[4096];
    for (ssize_t n = 0;
         (n = pread(m_file, buffer, sizeof buffer, static_cast<off_t>(text.size()))) > 0;) {
        text.append(buffer, static_cast<std::size_t>(n));
    }
    Plans plans;
    for (std::size_t begin = 0, end = 0; (end = text.find('\n', begin)) != std::string::npos;
         begin = end + 1) {
        std::vector<std::string> fields(1);
        for (char c : text.substr(begin, end - begin)) {
            if (c == '\t') {
                fields.emplace_back();
            } else {
                fields.back() += c;
            }
        }
        fields.resize(6);
        PlannedFault fault;
        fault.name = fields[0];
        fault.calls = number(fields[1]);
        fault.delay = number(fields[2]);
        fault.isNull = fields[3] == "null";
        if (!fault.isNull && !fields[3].empty()) fault.code = static_cast<int>(number(fields[3]));
        fault.signal = static_cast<int>(number(fields[4]));
        fault.text = fields[5];
        plans.push_back(fault);
    }
    return plans;
}

bool PlanFile::write(const Plans& plans) const {
    std::string text;
    for (const PlannedFault& fault : plans) {
        const std::string code = fault.isNull ? "null"
                                 : fault.code ? std::to_string(*fault.code)
                                              : std::string();
        text += fault.name + '\t' + std::to_string(fault.calls) + '\t' +
                std::to_string(fault.delay) + '\t' + code + '\t' + std::to_string(fault.signal) +
                '\t' + fault.text + '\n';
    }
    return pwrite(m_file, text.data(), text.size(), 0) == static_cast<ssize_t>(text.size()) &&
           ftruncate(m_file, static_cast<off_t>(text.size())) == 0;
}

Plans::iterator find(Plans& plans, const std::string& name) {
    return std::find_if(plans.begin(), plans.end(),
                        [&](const PlannedFault& fault) { return fault.name == name; });
}

void change(const PlanFile& file, const Plans& plans) {
    if (!file.write(plans)) throw Failure(Fault::StateUnusable, {"faults", std::strerror(errno)});
}

}  // namespace

void planFault(const PlannedFault& fault) {
    for (const std::string* value : {&fault.name, &fault.text}) {
        if (value->find_first_of("\t\n\r") != std::string::npos) {
            throw Failure(Fault::BadValue, {"fault", *value});
        }
    }
    const PlanFile file(O_CREAT);
    file.insist();
    Plans plans = file.read();
    const auto planned = find(plans, fault.name);
    if (planned == plans.end()) {
        plans.push_back(fault);
    } else {
        *planned = fault;
    }
    change(file, plans);
}

std::vector<PlannedFault> plannedFaults() {
    const PlanFile file(O_CREAT);
    file.insist();
    return file.read();
}

void clearFaults() {
    const PlanFile file(O_CREAT);
    file.insist();
    change(file, {});
}

std::optional<PlannedFault> takeFault(const std::string& name) {
    const PlanFile file(0);
    if (!file.isOpen()) return {};
    Plans plans = file.read();
    const auto planned = find(plans, name);
    if (planned == plans.end()) return {};
    PlannedFault fault = *planned;
    if (--planned->calls <= 0) plans.erase(planned);
    // A plan that cannot be counted down would hold for ever.
    if (!file.write(plans)) return {};
    return fault;
}

void pause(const PlannedFault& fault) {
    std::this_thread::sleep_for(std::chrono::milliseconds(fault.delay));
}

}  // namespace appliance
