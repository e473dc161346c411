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
#include <fstream>
#include <sstream>
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

enum class Missing { Ignore, Create };

/// The locked file. One line for each plan; its fields have tabs between them.
class PlanFile {
public:
    /// @throws Failure NoHome, StateUnusable when it cannot be created
    explicit PlanFile(Missing missing) : m_path(faultsFile()) {
        const bool creates = missing == Missing::Create;
        if (creates && m_path.empty()) throw Failure(Fault::NoHome);
        m_file = open(m_path.c_str(), O_RDWR | O_CLOEXEC | (creates ? O_CREAT : 0), 0666);
        if (m_file < 0) {
            if (creates) throw Failure(Fault::StateUnusable, {m_path, std::strerror(errno)});
            return;
        }
        // Tools run as other users too, and count what they take.
        if (creates) fchmod(m_file, 0666);
        while (flock(m_file, LOCK_EX) != 0 && errno == EINTR) {
        }
    }
    ~PlanFile() {
        if (m_file >= 0) close(m_file);
    }
    PlanFile(const PlanFile&) = delete;
    PlanFile& operator=(const PlanFile&) = delete;

    bool isOpen() const { return m_file >= 0; }

    Plans read() const;
    bool write(const Plans& plans) const;

private:
    std::string m_path;
    int m_file = -1;
};

Plans PlanFile::read() const {
    Plans plans;
    std::ifstream lines(m_path);
    for (std::string line; std::getline(lines, line) && !lines.eof();) {
        std::istringstream in(line);
        std::string fields[6];
        for (std::string& field : fields) std::getline(in, field, '\t');
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
    std::ostringstream lines;
    for (const PlannedFault& fault : plans) {
        const std::string code = fault.code ? std::to_string(*fault.code) : "";
        lines << fault.name << '\t' << fault.calls << '\t' << fault.delay << '\t'
              << (fault.isNull ? "null" : code) << '\t' << fault.signal << '\t' << fault.text
              << '\n';
    }
    const std::string text = lines.str();
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
    const PlanFile file(Missing::Create);
    Plans plans = file.read();
    const auto planned = find(plans, fault.name);
    *(planned == plans.end() ? plans.emplace(planned) : planned) = fault;
    change(file, plans);
}

std::vector<PlannedFault> plannedFaults() { return PlanFile(Missing::Create).read(); }

void clearFaults() { change(PlanFile(Missing::Create), {}); }

std::optional<PlannedFault> takeFault(const std::string& name) {
    const PlanFile file(Missing::Ignore);
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
