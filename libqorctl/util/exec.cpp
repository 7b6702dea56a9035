// Running commands through /bin/sh (see util/exec.h for the flags).
#include "util/exec.h"

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <fcntl.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <time.h>
#include <unistd.h>

#include "lib/exception.h"

namespace QorCtl {
namespace Util {

using HostCtl::Lib::HostCtlException;
using HostCtl::Lib::VobMessage;

namespace {

size_t const kKeptOutput = 2048;  // bytes of captured output quoted on failure
int const kStartWindowSteps = 25;  // 25 x 10 ms watched by verifyStart

// What a child tells its parent through the report pipe.
struct Report {
    char tag;  // 'e' exec failed (errno), 'p' daemon pid, 's' ended early (status)
    int value;
};

std::string Shown(std::string const &command) {
    return "'" + (command.size() > 200 ? command.substr(0, 197) + "..." : command) + "'";
}

[[noreturn]] void Fail(std::string const &command, std::string const &why) {
    throw HostCtlException("Command " + Shown(command) + " " + why,
                           VobMessage("exec.failed", {command, why}));
}

void CheckCommand(std::string const &command) {
    if (command.find_first_not_of(" \t\n") == std::string::npos)
        Fail(command, "cannot be run: it is empty");
    if (command.find('\0') != std::string::npos)
        Fail(command, "cannot be run: it contains a NUL character");
}

// The shell's convention: the exit code, or 128 + the signal's number.
int ExitCode(int status) {
    if (WIFEXITED(status))
        return WEXITSTATUS(status);
    if (WIFSIGNALED(status))
        return 128 + WTERMSIG(status);
    return -1;
}

std::string Describe(int status) {
    if (WIFSIGNALED(status))
        return "was ended by signal " + std::to_string(WTERMSIG(status));
    return "exited with status " + std::to_string(ExitCode(status));
}

int WaitFor(std::string const &command, pid_t pid) {
    int status = 0;
    while (::waitpid(pid, &status, 0) < 0) {
        if (errno != EINTR)
            Fail(command, std::string("ran, but its exit status is lost: waitpid: ") +
                              std::strerror(errno));
    }
    return status;
}

ssize_t ReadSome(int fd, void *buf, size_t size) {
    ssize_t n;
    do
        n = ::read(fd, buf, size);
    while (n < 0 && errno == EINTR);
    return n;
}

void CloseIf(int fd) {
    if (fd >= 0)
        ::close(fd);
}

// In a child after fork: only async-signal-safe calls from here on.
[[noreturn]] void ChildFail(int reportFd) {
    Report r = {'e', errno};
    if (::write(reportFd, &r, sizeof r) < 0) {
    }
    ::_exit(127);
}

void Sleep10ms() {
    struct timespec ts = {0, 10 * 1000 * 1000};
    ::nanosleep(&ts, nullptr);
}

}  // namespace

int QorCtl_Exec(std::string command, bool wait, bool quiet, bool check) {
    CheckCommand(command);
    int report[2], out[2] = {-1, -1};
    if (::pipe2(report, O_CLOEXEC) != 0)
        Fail(command, std::string("cannot be started: pipe: ") + std::strerror(errno));
    if (quiet && wait && ::pipe2(out, O_CLOEXEC) != 0) {
        int e = errno;
        ::close(report[0]);
        ::close(report[1]);
        Fail(command, std::string("cannot be started: pipe: ") + std::strerror(e));
    }
    int devnull = quiet && !wait ? ::open("/dev/null", O_RDWR | O_CLOEXEC) : -1;
    char const *argv[] = {"sh", "-c", command.c_str(), nullptr};
    std::fflush(nullptr);
    pid_t pid = ::fork();
    if (pid == 0) {
        int sink = out[1] >= 0 ? out[1] : devnull;
        if (sink >= 0 && (::dup2(sink, 1) < 0 || ::dup2(sink, 2) < 0))
            ChildFail(report[1]);
        ::execv("/bin/sh", const_cast<char *const *>(argv));
        ChildFail(report[1]);
    }
    int forkErrno = errno;
    ::close(report[1]);
    CloseIf(out[1]);
    CloseIf(devnull);
    if (pid < 0) {
        ::close(report[0]);
        CloseIf(out[0]);
        Fail(command, std::string("cannot be started: fork: ") + std::strerror(forkErrno));
    }
    std::string captured;
    if (out[0] >= 0) {
        char buf[4096];
        ssize_t n;
        while ((n = ReadSome(out[0], buf, sizeof buf)) > 0) {
            captured.append(buf, size_t(n));
            if (captured.size() > 4 * kKeptOutput)
                captured.erase(0, captured.size() - kKeptOutput);
        }
        ::close(out[0]);
    }
    Report r;
    ssize_t got = ReadSome(report[0], &r, sizeof r);
    ::close(report[0]);
    if (got == ssize_t(sizeof r) && r.tag == 'e') {
        WaitFor(command, pid);
        Fail(command, std::string("cannot be started: /bin/sh: ") + std::strerror(r.value));
    }
    if (!wait)
        return pid;
    int status = WaitFor(command, pid);
    int code = ExitCode(status);
    if (check && code != 0) {
        std::string why = Describe(status);
        if (captured.size() > kKeptOutput)
            captured = "..." + captured.substr(captured.size() - kKeptOutput);
        while (!captured.empty() && captured.back() == '\n')
            captured.pop_back();
        if (!captured.empty())
            why += "; its output ends with:\n" + captured;
        Fail(command, why);
    }
    return code;
}

int QorCtl_Daemon(std::string command, bool verifyStart, bool detach, bool quiet,
                  bool lowPriority) {
    CheckCommand(command);
    int report[2];
    if (::pipe2(report, O_CLOEXEC) != 0)
        Fail(command, std::string("cannot be started: pipe: ") + std::strerror(errno));
    int devnull = ::open("/dev/null", O_RDWR | O_CLOEXEC);
    errno = 0;
    int niceness = ::getpriority(PRIO_PROCESS, 0);
    if (errno != 0)
        niceness = 0;
    niceness = niceness + 10 > 19 ? 19 : niceness + 10;
    char const *argv[] = {"sh", "-c", command.c_str(), nullptr};
    std::fflush(nullptr);
    pid_t pid = ::fork();
    if (pid == 0) {
        if (detach) {
            ::setsid();
            pid_t daemonPid = ::fork();
            if (daemonPid < 0)
                ChildFail(report[1]);
            if (daemonPid > 0) {
                Report r = {'p', int(daemonPid)};
                bool ok = ::write(report[1], &r, sizeof r) == ssize_t(sizeof r);
                for (int i = 0; ok && verifyStart && i < kStartWindowSteps; ++i) {
                    Sleep10ms();
                    int status;
                    if (::waitpid(daemonPid, &status, WNOHANG) == daemonPid) {
                        Report s = {'s', status};
                        ok = ::write(report[1], &s, sizeof s) == ssize_t(sizeof s);
                        break;
                    }
                }
                ::_exit(ok ? 0 : 1);
            }
        }
        if (lowPriority)
            ::setpriority(PRIO_PROCESS, 0, niceness);
        if (detach && devnull >= 0 && ::dup2(devnull, 0) < 0)
            ChildFail(report[1]);
        if (quiet && devnull >= 0 && (::dup2(devnull, 1) < 0 || ::dup2(devnull, 2) < 0))
            ChildFail(report[1]);
        ::execv("/bin/sh", const_cast<char *const *>(argv));
        ChildFail(report[1]);
    }
    int forkErrno = errno;
    ::close(report[1]);
    CloseIf(devnull);
    if (pid < 0) {
        ::close(report[0]);
        Fail(command, std::string("cannot be started: fork: ") + std::strerror(forkErrno));
    }
    // Reports until every writer is gone: the daemon has exec'd (or failed)
    // and, when detached, the intermediate process has left.
    pid_t daemonPid = detach ? -1 : pid;
    int execErrno = 0, earlyStatus = 0;
    bool endedEarly = false;
    Report r;
    while (ReadSome(report[0], &r, sizeof r) == ssize_t(sizeof r)) {
        if (r.tag == 'p')
            daemonPid = r.value;
        else if (r.tag == 'e')
            execErrno = r.value;
        else if (r.tag == 's')
            endedEarly = true, earlyStatus = r.value;
    }
    ::close(report[0]);
    if (detach)
        WaitFor(command, pid);  // the intermediate process
    if (execErrno != 0) {
        if (!detach)
            WaitFor(command, pid);
        Fail(command, std::string("cannot be started: ") + std::strerror(execErrno));
    }
    if (daemonPid <= 0)
        Fail(command, "cannot be started: the daemon's process id was not reported");
    for (int i = 0; !detach && verifyStart && i < kStartWindowSteps; ++i) {
        Sleep10ms();
        int status;
        if (::waitpid(pid, &status, WNOHANG) == pid) {
            endedEarly = true, earlyStatus = status;
            break;
        }
    }
    if (endedEarly && ExitCode(earlyStatus) != 0)
        Fail(command, "ended while starting: it " + Describe(earlyStatus));
    return daemonPid;
}

}  // namespace Util
}  // namespace QorCtl
