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
#include <limits>
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

/// Behind its bound, what others may have written there is not read.
constexpr off_t kMostBytes = 16 << 20;
constexpr std::int64_t kMostDelay = std::numeric_limits<std::int32_t>::max();

/// The locked file. One line for each plan; its fields have tabs between them.
class PlanFile {
public:
    /// @throws Failure NoHome; StateUnusable when it cannot be created, StateBusy when it cannot be
    ///         locked
    explicit PlanFile(Missing missing) : PlanFile(faultsFile(), missing) {
        const bool creates = missing == Missing::Create;
        if (creates && m_path.empty()) {
            throw Failure(Fault::NoHome);
        }
        const char* damage = m_file < 0 ? std::strerror(errno) : "it is no regular file";
        struct stat status {};
        const bool isFile = fstat(m_file, &status) == 0 && S_ISREG(status.st_mode);
        if (creates && !isFile) {
            throw Failure(Fault::StateUnusable, {m_path, damage});
        }
        // Tools of other users count what they take, where the maker's umask lets them write. Who
        // could only read could do nothing but hold the lock.
        if (creates) {
            fchmod(m_file, 0600 | (status.st_mode & 0022) * 3);
        }
        m_isLocked = isFile && lock();
        if (creates && !m_isLocked) {
            throw Failure(Fault::StateBusy, {m_path});
        }
    }
    ~PlanFile() {
        if (m_file >= 0) {
            close(m_file);
        }
    }
    PlanFile(const PlanFile&) = delete;
    PlanFile& operator=(const PlanFile&) = delete;

    bool isLocked() const { return m_isLocked; }

    Plans read() const;
    bool write(const Plans& plans) const;

private:
    PlanFile(std::string path, Missing missing)
        : m_path(std::move(path)),
          m_file(open(m_path.c_str(),
                      O_RDWR | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK |
                          (missing == Missing::Create ? O_CREAT : 0),
                      0666)) {}

    /// Waits, but not for ever: whoever may write may also be stopped while holding the lock.
    bool lock() const {
        constexpr int kTries = 200;
        for (int i = 0; i < kTries; ++i) {
            if (flock(m_file, LOCK_EX | LOCK_NB) == 0) {
                return true;
            }
            std::this_thread::sleep_for(std::chrono::milliseconds(10));
        }
        return false;
    }

    std::string m_path;
    int m_file;
    bool m_isLocked = false;
};

Plans PlanFile::read() const {
    std::string text;
    char part[4096];
    for (ssize_t size = 0; static_cast<off_t>(text.size()) < kMostBytes;
         text.append(part, static_cast<std::size_t>(size))) {
        size = pread(m_file, part, sizeof part, static_cast<off_t>(text.size()));
        if (size <= 0) {
            break;
        }
    }
    Plans plans;
    std::istringstream lines(text);
    for (std::string line; std::getline(lines, line) && !lines.eof();) {
        std::istringstream in(line);
        std::string fields[6];
        for (std::string& field : fields) {
            std::getline(in, field, '\t');
        }
        PlannedFault fault;
        fault.name = fields[0];
        fault.calls = number(fields[1]);
        fault.delay = std::clamp<std::int64_t>(number(fields[2]), 0, kMostDelay);
        fault.isNull = fields[3] == "null";
        if (!fault.isNull && !fields[3].empty()) {
            fault.code = static_cast<int>(number(fields[3]));
        }
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
    const auto size = static_cast<ssize_t>(text.size());
    return pwrite(m_file, text.data(), text.size(), 0) == size && ftruncate(m_file, size) == 0;
}

Plans::iterator find(Plans& plans, const std::string& name) {
    return std::find_if(plans.begin(), plans.end(),
                        [&](const PlannedFault& fault) { return fault.name == name; });
}

void change(const PlanFile& file, const Plans& plans) {
    if (!file.write(plans)) {
        throw Failure(Fault::StateUnusable, {"faults", std::strerror(errno)});
    }
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
    if (!file.isLocked()) {
        return {};
    }
    Plans plans = file.read();
    const auto planned = find(plans, name);
    if (planned == plans.end()) {
        return {};
    }
    PlannedFault fault = *planned;
    if (--planned->calls <= 0) {
        plans.erase(planned);
    }
    // A plan that cannot be counted down would hold for ever.
    if (!file.write(plans)) {
        return {};
    }
    return fault;
}

void pause(const PlannedFault& fault) {
    std::this_thread::sleep_for(std::chrono::milliseconds(fault.delay));
}

}  // namespace appliance
