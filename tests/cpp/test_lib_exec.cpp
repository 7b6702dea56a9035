// Commands, daemons, back traces, sizes and record printing.
#include <algorithm>
#include <cerrno>
#include <csignal>
#include <fcntl.h>
#include <fstream>
#include <sstream>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include "network/print.h"
#include "resource/print.h"
#include "test_lib_support.h"
#include "util/exec.h"
#include "util/object_printer.h"

using namespace libtest;
using QorCtl::Util::QorCtl_Daemon;
using QorCtl::Util::QorCtl_Exec;

namespace {

// Runs f with this process's standard output sent to a file and returns
// what was written there.
template <class F>
std::string CaptureStdout(F f) {
    char name[] = "/tmp/qorctl-stdout-XXXXXX";
    int fd = mkstemp(name);
    fflush(stdout);
    int saved = dup(1);
    dup2(fd, 1);
    f();
    fflush(stdout);
    dup2(saved, 1);
    close(saved);
    close(fd);
    std::ifstream in(name);
    std::stringstream s;
    s << in.rdbuf();
    unlink(name);
    return s.str();
}

// The state letter of a process in /proc (0 if it is gone).
char ProcessState(int pid) {
    std::ifstream in("/proc/" + std::to_string(pid) + "/stat");
    std::string all((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
    size_t close = all.rfind(')');
    return close == std::string::npos || close + 2 >= all.size() ? 0 : all[close + 2];
}

bool WaitForFile(std::string const &path) {
    for (int i = 0; i < 300; ++i) {
        if (access(path.c_str(), F_OK) == 0)
            return true;
        usleep(10000);
    }
    return false;
}

std::string Slurp(std::string const &path) {
    std::ifstream in(path);
    std::stringstream s;
    s << in.rdbuf();
    return s.str();
}

}  // namespace

using LibExec = LibFixture;

TEST_F(LibExec, ExecReturnsTheExitStatus) {
    EXPECT_EQ(QorCtl_Exec("/bin/true"), 0);
    EXPECT_EQ(QorCtl_Exec("/bin/false"), 1);
    EXPECT_EQ(QorCtl_Exec("exit 7"), 7);
    EXPECT_EQ(QorCtl_Exec("kill -9 $$"), 128 + 9);
    EXPECT_EQ(QorCtl_Exec("/no/such/program 2>/dev/null"), 127);
}

TEST_F(LibExec, ExecFlagsWaitQuietCheck) {
    // Output passes through unless quiet.
    EXPECT_EQ(CaptureStdout([] { QorCtl_Exec("echo hello"); }), "hello\n");
    EXPECT_EQ(CaptureStdout([] { QorCtl_Exec("echo hello; echo err >&2", true, true); }), "");

    // check turns a failure into an exception that quotes the output's end.
    EXPECT_EQ(QorCtl_Exec("/bin/false", true, false, false), 1);
    EXPECT_EQ(ErrorOf([] { QorCtl_Exec("/bin/false", true, false, true); }),
              "Command '/bin/false' exited with status 1");
    EXPECT_EQ(ErrorOf([] { QorCtl_Exec("echo one; echo boom >&2; exit 3", true, true, true); }),
              "Command 'echo one; echo boom >&2; exit 3' exited with status 3; its output ends "
              "with:\none\nboom");
    EXPECT_EQ(ErrorOf([] { QorCtl_Exec("kill -TERM $$", true, false, true); }),
              "Command 'kill -TERM $$' was ended by signal 15");
    EXPECT_EQ(QorCtl_Exec("/bin/true", true, true, true), 0);
    // Only the end of a long output is kept.
    std::string error = ErrorOf([] { QorCtl_Exec("seq 1 100000; exit 1", true, true, true); });
    EXPECT_NE(error.find("\n100000"), std::string::npos);
    EXPECT_LT(error.size(), 2200u);

    // Without wait the caller gets the process and reaps it.
    int pid = QorCtl_Exec("exit 5", false);
    ASSERT_GT(pid, 0);
    int status = 0;
    ASSERT_EQ(waitpid(pid, &status, 0), pid);
    EXPECT_TRUE(WIFEXITED(status));
    EXPECT_EQ(WEXITSTATUS(status), 5);
    EXPECT_EQ(CaptureStdout([] {
                  int p = QorCtl_Exec("echo hidden", false, true);
                  waitpid(p, nullptr, 0);
              }),
              "");
}

TEST_F(LibExec, CommandsThatCannotRunAreRefused) {
    EXPECT_EQ(ErrorOf([] { QorCtl_Exec(""); }), "Command '' cannot be run: it is empty");
    EXPECT_NE(ErrorOf([] { QorCtl_Exec("  \t"); }).find("it is empty"), std::string::npos);
    EXPECT_NE(ErrorOf([] { QorCtl_Exec(std::string("true\0rm -rf /tmp/x", 17)); })
                  .find("contains a NUL character"),
              std::string::npos);
    EXPECT_NE(ErrorOf([] { QorCtl_Daemon(""); }).find("it is empty"), std::string::npos);
}

TEST_F(LibExec, DaemonDetachesByDefault) {
    int pid = QorCtl_Daemon("exec sleep 30");
    ASSERT_GT(pid, 0);
    EXPECT_NE(ProcessState(pid), 0);
    EXPECT_NE(getsid(pid), getsid(0));               // its own session
    EXPECT_EQ(waitpid(pid, nullptr, WNOHANG), -1);  // not our child
    EXPECT_EQ(errno, ECHILD);
    kill(pid, SIGKILL);
}

TEST_F(LibExec, DaemonAttachedStaysOurChild) {
    int pid = QorCtl_Daemon("exec sleep 30", false, false);
    ASSERT_GT(pid, 0);
    EXPECT_EQ(getsid(pid), getsid(0));
    EXPECT_EQ(waitpid(pid, nullptr, WNOHANG), 0);  // running child
    kill(pid, SIGKILL);
    int status = 0;
    EXPECT_EQ(waitpid(pid, &status, 0), pid);
}

TEST_F(LibExec, DaemonVerifyStartReportsEarlyFailure) {
    EXPECT_EQ(ErrorOf([] { QorCtl_Daemon("exit 3", true); }),
              "Command 'exit 3' ended while starting: it exited with status 3");
    EXPECT_EQ(ErrorOf([] { QorCtl_Daemon("exit 4", true, false); }),
              "Command 'exit 4' ended while starting: it exited with status 4");
    // Without verification the same command "starts".
    EXPECT_GT(QorCtl_Daemon("exit 3"), 0);
    // A daemon that keeps running passes the check.
    int pid = QorCtl_Daemon("exec sleep 30", true);
    EXPECT_NE(ProcessState(pid), 0);
    kill(pid, SIGKILL);
}

TEST_F(LibExec, DaemonQuietAndLowPriority) {
    std::string mark = dir_ + "/mark";
    std::string out = CaptureStdout([&] {
        QorCtl_Daemon("echo loud; touch " + mark, false, true, false);
        EXPECT_TRUE(WaitForFile(mark));
    });
    EXPECT_EQ(out, "loud\n");
    unlink(mark.c_str());
    out = CaptureStdout([&] {
        QorCtl_Daemon("echo loud; touch " + mark, false, true, true);
        EXPECT_TRUE(WaitForFile(mark));
    });
    EXPECT_EQ(out, "");

    std::string nice = dir_ + "/nice";
    QorCtl_Daemon("nice > " + nice + ".tmp && mv " + nice + ".tmp " + nice, false, true, false, true);
    ASSERT_TRUE(WaitForFile(nice));
    int expected = std::min(getpriority(PRIO_PROCESS, 0) + 10, 19);
    EXPECT_EQ(std::stoi(Slurp(nice)), expected);
}

TEST_F(LibExec, BackTraceNamesTheCallers) {
    std::ostringstream out;
    QorCtl::Util::QorCtl_PrintBackTrace(out);
    std::string text = out.str();
    EXPECT_EQ(text.rfind("#0 ", 0), 0u) << text;
    EXPECT_NE(text.find("#1 "), std::string::npos);
    EXPECT_NE(text.find("testing::"), std::string::npos) << text;  // demangled gtest frames
}

TEST(LibSizeString, BinaryUnitsWithTwoDecimals) {
    using QorCtl::Resource::Resgrp_SizeString;
    EXPECT_EQ(Resgrp_SizeString(0), "0 B");
    EXPECT_EQ(Resgrp_SizeString(1), "1 B");
    EXPECT_EQ(Resgrp_SizeString(1023), "1023 B");
    EXPECT_EQ(Resgrp_SizeString(1024), "1.00 KiB");
    EXPECT_EQ(Resgrp_SizeString(1536), "1.50 KiB");
    EXPECT_EQ(Resgrp_SizeString(1048575), "1.00 MiB");  // not "1024.00 KiB"
    EXPECT_EQ(Resgrp_SizeString(1048576 * 5 / 2), "2.50 MiB");
    EXPECT_EQ(Resgrp_SizeString(1073741824), "1.00 GiB");
    EXPECT_EQ(Resgrp_SizeString(1099511627776ull * 3), "3.00 TiB");
    EXPECT_EQ(Resgrp_SizeString(1ull << 50), "1.00 PiB");
    EXPECT_EQ(Resgrp_SizeString(18446744073709551615ull), "16.00 EiB");
}

TEST(LibNetworkPrint, PoliciesPrintSetAndUnsetAttributes) {
    std::ostringstream out;
    QorCtl::Util::ObjectPrinter printer(out);
    HostCtl::Network::ShapingPolicy shaping;
    shaping.SetEnabled(true);
    shaping.SetBurstSize(1536);
    QorCtl::Network::Network_Print(&printer, "Shaping", shaping);
    EXPECT_EQ(out.str(),
              "Shaping:\n"
              "   Enabled: yes\n"
              "   Average rate: not set\n"
              "   Peak rate: not set\n"
              "   Burst size: 1.50 KiB\n");
    out.str("");
    QorCtl::Network::Network_Print(&printer, "Teaming",
                                   HostCtl::Network::NicTeamingPolicy::GetDefaultPolicy());
    EXPECT_NE(out.str().find("   Teaming policy: load balance by source port\n"), std::string::npos)
        << out.str();
    EXPECT_NE(out.str().find("   Failure detection:\n      Exact speed: 0 Mbit/s (ignored)\n"),
              std::string::npos)
        << out.str();
    EXPECT_EQ(printer.GetDepth(), 0u);
}
