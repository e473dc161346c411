/// Methods that answer before their work is done, and name the job that does it.
#ifndef CIMOM_JOB_PROGRESS_H
#define CIMOM_JOB_PROGRESS_H

#include "Commands.h"

namespace cimom {

/// Whether a method has answered that a job does its work.
/// @param job  receives the job's path
bool hasStartedJob(const Reply& method, ObjectPath& job);

/// Follows a job until it has ended, as the job lives where the providers do: in this process.
/// Tells on standard error how far it is if that is a terminal. SIGINT and SIGTERM ask the job to
/// terminate, and from the second on to be killed; its end is waited for all the same.
/// @return a failure with the job's own words unless the job has done its work
Reply awaitJob(Session& session, const ObjectPath& job);

}  // namespace cimom

#endif
