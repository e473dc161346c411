/// The child that becomes a tool: what it needs, and all that runs in it up to its program. Private
/// to the runner in PropertiesHelperRun.cpp.
///
/// The rule of everything behind start(): no lock, no memory, no cancellation point. The child
/// borrows the memory of the server, and the stack and the locks of the thread that starts it,
/// which stands still until the program begins. To copy the process instead would take a large
/// server longer than many a tool runs. So whatever the child needs is made by the constructor,
/// while threads, locks and memory are still in order; the child only reads it, and leaves nothing
/// but bytes in a pipe and an exit status.
///
/// Thread-safety: one object belongs to one run; any number may be made and started at a time.
#ifndef PROPERTIES_HELPER_CHILD_H
#define PROPERTIES_HELPER_CHILD_H

#include <sys/types.h>

#include <string>
#include <vector>

#include "CommandLine.h"

/// A user to become.
struct zemUserSwitch {
    static constexpr int kNoSuchUser = -1;

    int failure = 0;      ///< of the look-up: an error number or kNoSuchUser
    bool needed = false;  ///< not with a failure, nor for the user that the process is already
    uid_t uid = 0;
    gid_t gid = 0;
};

/// Looks up @p userName. Takes locks, and may ask a server.
zemUserSwitch zemFindUser(const char* userName);

/// Gives the whole process the group, then the user: it may have lost the right to the group by
/// then.
/// @return 0, an error number or kNoSuchUser
int zemBecomeUser(const zemUserSwitch& user);

/// Where a child writes. All are descriptors above the standard ones that close at exec.
struct zemChildWiring {
    int out;  ///< becomes descriptor 1
    int err;  ///< becomes descriptor 2

    /// Receives "<number>:<text>" of what kept the child from its program. 0: the text alone goes
    /// to descriptor 1, with all complaints, and its number is the exit status.
    int channel;

    /// Reading end of a pipe that is closed in the child, which could not see else that nobody
    /// reads what it has to say; 0 for none.
    int readingEnd;
};

class zemChildProcess {
public:
    /// Exit status of a child that did not reach its program and tells why on its channel.
    static constexpr int kEarlyEnd = 255;

    /// @param userName,locale  null or empty: the process's own
    zemChildProcess(const char* command, const char* userName, const char* locale);
    zemChildProcess(const zemChildProcess&) = delete;
    zemChildProcess& operator=(const zemChildProcess&) = delete;

    /// The first word of the command line.
    const std::string& program() const { return m_line.program; }

    /// "<number>:<text>" of what was wrong before the start, empty if nothing was: an unknown user,
    /// else a command line that ends too early. It stands behind what the channel holds.
    const std::string& complaint() const { return m_complaint; }

    /// Starts the child. It has descriptors 0 (this process's own), 1 and 2 and no others, the
    /// default disposition of every signal, an empty mask and, as another user, no capabilities.
    /// @return its id, or -1 with errno set
    pid_t start(const zemChildWiring& wiring) const;

private:
    void setLocale(const char* locale);
    bool fitsPipe() const;

    [[noreturn]] void run(const zemChildWiring& wiring) const;
    [[noreturn]] void endEarly(const zemChildWiring& wiring, int error, const char* separator = "",
                               const char* subject = "") const;
    void exec() const;

    const std::vector<std::string>& m_texts;  // "<number>:<text>" of every error number
    zemCommandLine m_line;
    std::vector<char*> m_argv;
    zemUserSwitch m_user;
    std::string m_complaint;
    const char* m_streamed = "";  // the complaint as a child without a channel words it
    std::string m_localeEntry;
    std::vector<char*> m_environment;  // empty: the process's own
};

#endif
