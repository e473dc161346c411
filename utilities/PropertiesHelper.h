/// Runs the appliance's tools, and answers small questions about this host, names and time stamps.
///
/// This is the one place where a program is started. A command line is one flat text that the
/// library splits itself (see CommandLine.h); no shell is involved and PATH is searched.
///
///     zemString out, err;
///     int exitCode = -1;
///     zemPropertiesHelper::executeCommand("qyplat -r sys -F name", out, err, &exitCode, "", 0, "",
///                                         true);
///
/// A tool inherits the environment, the standard input, the folder and the supplementary groups of
/// this process. Everything else of a server is kept from it: its other descriptors, what it does
/// with signals and, from a tool that runs as another user, its capabilities.
///
/// All operations are static and may be called by any number of threads at a time. Every failure of
/// the two runners is an exception with throwing class "zemPropertiesHelper" and throwing method
/// "executeCommand"; an exit status other than 0 is none: it is the caller's to judge.
#ifndef PROPERTIES_HELPER_H
#define PROPERTIES_HELPER_H

#include <sys/types.h>

#include <cstdio>

#include "StringUtils.h"
#include "ZemExport.h"

class ZEM_EXPORT zemPropertiesHelper {
public:
    zemPropertiesHelper() = delete;

    /// Runs @p command to its end and collects what it writes.
    /// @param strStdout,strStderr  output up to the end of the run, also when the run fails; text
    ///        behind a zero byte is lost up to the next piece of output
    /// @param exitCode  exit status 0 to 255; -1 while there is none. May be null.
    /// @param requestUserContext  user to run as; null or empty: the process's own
    /// @param waitTime  limit in microseconds, counted in tenths of a second; 0 or less: none. It
    ///        is meant for up to two seconds (see PollPlan.h). At the limit the child is left
    ///        running and is not waited for.
    /// @param locale  value of LC_ALL for the tool; null or empty leaves it alone
    /// @param forceTimeOut  has no effect
    ///
    /// A thread that is cancelled leaves while it waits for the child, which it leaves running; a
    /// later run of any tool reaps it when it has ended. Output that finds no memory is dropped and
    /// its pipe closed; std::bad_alloc is thrown when the child has ended.
    /// @return 0
    /// @throws zemAccessDeniedException id "13": the program may not be run
    /// @throws zemOperationFailedException id the error number of what failed, "-1" for a command
    ///         line with a quote or backslash left open, "0" for an unknown user, "CLI_TIME_OUT" at
    ///         the limit, none when a signal ended or stopped the tool
    static int executeCommand(const char* command, zemString& strStdout, zemString& strStderr,
                              int* exitCode, const char* requestUserContext, int waitTime,
                              const char* locale, bool forceTimeOut);

    /// Starts @p command and returns at once.
    /// @param pid  receives the child, which the caller reaps
    /// @param fpOutput  receives a non-blocking stream of output and errors together, which the
    ///        caller closes. What keeps the child from reaching the program is written there too,
    ///        and its number is the exit status.
    ///
    /// A thread that is cancelled meanwhile goes on up to the return.
    /// @return 0
    /// @throws zemOperationFailedException when no pipe, stream or process can be made
    static int asynExecuteCommand(const char* command, pid_t* pid, FILE** fpOutput,
                                  const char* requestUserContext, const char* locale);

    /// Gives the process the group and user of @p userName; supplementary groups stay.
    /// A name longer than any that the system allows is not looked up.
    /// @return 0 (also when it is that user already), an error number, or -1 for no such user
    static int changeProcessUserContext(const char* userName);

    /// Short name of this host, kept from the first success on; empty while there is none.
    static zemString& getHostName();

    /// Canonical name of this host, kept from the first success on; empty while there is none.
    static zemString& getFullHostName();

    /// First IPv4 address of @p name in host order, or 0xFFFFFFFF.
    static unsigned int getHostIPAddress(const char* name);

    /// First IPv4 address of @p name as dotted text, empty when there is none.
    static zemString getHostIP(const char* name);

    /// Whether @p host is this machine: a loopback name, or one with this host's first address.
    static bool isSameHost(const char* host);

    /// 1 for four numbers up to 255 with dots between them, else 0. A coarse test: runs of dots and
    /// negative numbers pass.
    static int isValidIPAddress(const zemString& text);

    /// 1 when @p name is a letter followed by letters, digits and characters of @p extra, else 0.
    /// An empty @p extra stands for "$#@", and these may then begin the name as well.
    static int isValidName(const zemString& name, const zemString& extra);

    /// Seconds since the epoch.
    static long getLocalDateTime();

    /// Seconds since the epoch, by way of the local calendar.
    static long getCurrentTimeBaseSec();

    /// Seconds of 13 characters CYYMMDDHHMMSS in local time, where C counts centuries from 1900.
    /// @return 0 when all are blank
    static long getTimeFromTimeStamp13(char* stamp);

    /// Seconds of 8 characters YYYYMMDD and 6 characters HHMMSS in local time.
    /// @return 0 when either begins with a blank
    static long getTimeFromDateTimeStamps(char* date, char* time);
};

#endif
