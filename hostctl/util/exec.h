// Running commands on the host, and back traces.
//
// Commands run as /bin/sh -c <command>. Exit statuses follow the shell's
// convention: the command's exit code, or 128 + n when signal n ended it.
// A command that cannot be started (empty, containing a NUL character, fork
// or exec failing) is refused with HostCtl::Lib::HostCtlException.
#ifndef HOSTCTL_UTIL_EXEC_H
#define HOSTCTL_UTIL_EXEC_H

#include <iosfwd>
#include <string>

#include "annotate.h"
#include "types.h"

namespace QorCtl {
namespace Util {

// Runs a command.
//   wait   true: wait for the command and return its exit status.
//          false: return its process id at once; the caller reaps it
//          (waitpid).
//   quiet  capture the command's standard output and error instead of
//          passing them through (without wait they go to /dev/null); the
//          end of the captured text is quoted in the exception when check
//          is set and the command fails. The call returns once the
//          command has ended and its output is closed, so background
//          processes it starts should send their output elsewhere.
//   check  throw HostCtlException when the waited-for command exits with a
//          status other than 0; otherwise the status is returned as it is.
HC_THROWS int QorCtl_Exec(std::string command, bool wait = true, bool quiet = false,
                          bool check = false);

// Starts a long-running command and returns its process id.
//   verifyStart  watch the command for 250 ms and throw HostCtlException if
//                it ends with a status other than 0 in that time.
//   detach       start it in its own session with standard input from
//                /dev/null, no longer a child of this process (nothing to
//                reap). Otherwise it stays a child, which the caller reaps.
//   quiet        send its standard output and error to /dev/null.
//   lowPriority  run it 10 nice levels below this process (at most 19).
HC_THROWS int QorCtl_Daemon(std::string command, bool verifyStart = false, bool detach = true,
                            bool quiet = false, bool lowPriority = false);

// Writes the calling thread's stack, innermost frame first, one
// "#n function+offset (object)" line per frame.
void QorCtl_PrintBackTrace(std::ostream &out);

}  // namespace Util
}  // namespace QorCtl

#endif
