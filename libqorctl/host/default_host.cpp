// The built-in default host: the same names and values on every machine, so
// scripts, examples and tests can rely on them.
#include "model.h"

namespace QorCtl {
namespace Model {

namespace {
char const kIdChars[] = "abcdefghijklmnopqrstuvwxyz0123456789-_";
char const kTextChars[] =
    "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789 .,:;-_()/@+#\"'";
char const kPathChars[] = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789/._-+";
char const kPatternChars[] =
    "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789.:-_,*";
char const kLocaleChars[] = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789._-@";
char const kMailChars[] = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789@._-+";
constexpr uint32 kU32Max = 4294967295u;

constexpr DefaultEntry I(char const *path, uint32 def, uint32 min, uint32 max, char const *desc,
                         bool hidden = false) {
    return DefaultEntry{'i', path, def, min, max, "", "", hidden, desc};
}
constexpr DefaultEntry S(char const *path, char const *def, char const *valid, char const *desc,
                         bool hidden = false) {
    return DefaultEntry{'s', path, 0, 0, 0, def, valid, hidden, desc};
}
constexpr DefaultEntry B(char const *path) {
    return DefaultEntry{'b', path, 0, 0, 0, "", "", false, ""};
}
}  // namespace

char const *const kDefaultHostName = "simhost";

// Branches appear in the order of their first mention.
DefaultEntry const kDefaultHost[] = {
    I("/Net/TcpipHeapSize", 32, 0, 1024, "Initial size of the TCP/IP stack heap in MiB."),
    I("/Net/TcpipHeapMax", 512, 32, 1536, "Largest size of the TCP/IP stack heap in MiB."),
    I("/Net/MaxTxQueueLen", 2000, 1, 10000, "Packets queued for transmission per interface."),
    I("/Net/MaxRxQueueLen", 2000, 1, 10000, "Packets queued for reception per interface."),
    I("/Net/RxBurstSize", 64, 1, 512, "Packets taken from a receive ring in one pass."),
    I("/Net/UseHwChecksum", 1, 0, 1, "Let NICs compute checksums (1) or not (0)."),
    I("/Net/UseHwTso", 1, 0, 1, "Let NICs segment large TCP sends (1) or not (0)."),
    I("/Net/ArpCacheTimeout", 1200, 60, 86400, "Seconds an ARP cache entry stays valid."),
    I("/Net/PacketTraceLevel", 0, 0, 5, "Detail of the packet trace (0: off).", true),
    S("/Net/DefaultTeamPolicy", "loadbalance_srcid", kIdChars,
      "Teaming policy of new port groups."),
    I("/Net/Tcpip/DelayedAck", 1, 0, 1, "Delay TCP acknowledgements (1) or not (0)."),
    I("/Net/Tcpip/KeepAliveSeconds", 7200, 10, 86400, "Idle seconds before TCP keep-alives."),
    I("/Net/Tcpip/RetransmitLimit", 15, 3, 50, "Retransmissions before a TCP connection fails."),
    I("/Net/Tcpip/InitialWindowKiB", 64, 4, 4096, "Initial TCP receive window in KiB."),
    S("/Net/Tcpip/CongestionControl", "newreno", kIdChars, "TCP congestion control algorithm."),
    B("/Net/Experimental"),

    I("/Disk/MaxLun", 1024, 1, 16384, "Highest logical unit number scanned."),
    I("/Disk/QueueDepth", 64, 1, 256, "Outstanding commands per logical unit."),
    I("/Disk/MaxIoSizeKiB", 32767, 32, 32767, "Largest I/O passed to a device unsplit, in KiB."),
    I("/Disk/PathEvalSeconds", 300, 30, 1500, "Seconds between evaluations of path states."),
    I("/Disk/RetryCount", 5, 0, 30, "Retries of a failed command before it is reported."),
    I("/Disk/UseReportLuns", 1, 0, 1, "Discover logical units with REPORT LUNS (1) or not (0)."),
    I("/Disk/IoDelayMs", 0, 0, 10000, "Delay added to every I/O, for testing only.", true),
    S("/Disk/DeviceFilter", "", kPatternChars,
      "Comma-separated device name patterns that discovery skips."),
    I("/Disk/Scsi/TimeoutSeconds", 30, 1, 600, "Seconds before a SCSI command times out."),
    I("/Disk/Scsi/ResetOnTimeout", 1, 0, 1, "Reset the target after a timeout (1) or not (0)."),
    I("/Disk/Scsi/MaxSenseBytes", 96, 18, 252, "Sense data bytes kept per failed command."),
    I("/Disk/Multipath/FailoverDelayMs", 1000, 0, 60000, "Milliseconds before a path failover."),
    I("/Disk/Multipath/PathProbeSeconds", 20, 1, 3600, "Seconds between probes of dead paths."),
    S("/Disk/Multipath/DefaultPolicy", "fixed", kIdChars, "Path selection policy of new devices."),

    I("/Mem/MinFreePct", 6, 0, 50, "Memory kept free, in percent of the host's memory."),
    I("/Mem/ShareScanRate", 100, 0, 1000, "Pages scanned for sharing per second and VM."),
    I("/Mem/BalancePeriodSec", 15, 0, 120, "Seconds between memory rebalancing passes."),
    I("/Mem/SampleSize", 100, 1, 1000, "Pages sampled to estimate a VM's active memory."),
    I("/Mem/IdleTaxPct", 75, 0, 99, "Share of idle memory reclaimable from a VM, in percent."),
    I("/Mem/CompressionEnabled", 1, 0, 1, "Compress memory before swapping (1) or not (0)."),
    I("/Mem/LargePageEnabled", 1, 0, 1, "Back guest memory with large pages (1) or not (0)."),
    I("/Mem/ScrubPattern", 0xA5A5A5A5u, 0, kU32Max, "Pattern written into freed pages.", true),
    I("/Mem/Numa/RebalanceEnabled", 1, 0, 1, "Move VMs between NUMA nodes (1) or not (0)."),
    I("/Mem/Numa/RebalancePeriodMs", 2000, 100, 60000, "Milliseconds between NUMA rebalances."),
    I("/Mem/Numa/MigrationThreshold", 10, 0, 100, "Imbalance in percent that moves a VM."),

    I("/Misc/LogLevel", 3, 0, 6, "Detail of the host log (0: errors only, 6: everything)."),
    I("/Misc/HeartbeatIntervalMs", 1000, 100, 10000, "Milliseconds between heartbeats."),
    I("/Misc/HeartbeatTimeoutSec", 30, 5, 600, "Seconds without a heartbeat before alarm."),
    I("/Misc/WatchdogEnabled", 1, 0, 1, "Run the system watchdog (1) or not (0)."),
    I("/Misc/PanicRebootDelaySec", 10, 0, 3600, "Seconds before rebooting after a panic."),
    I("/Misc/SerialBaudRate", 115200, 9600, 921600, "Baud rate of the serial console."),
    S("/Misc/HostDescription", "Simulated qorctl host", kTextChars,
      "Free text describing the host."),
    S("/Misc/LogFacility", "daemon", kIdChars, "Syslog facility of the host log."),
    I("/Misc/Debug/TraceMask", 0, 0, kU32Max, "Bit mask of traced kernel components.", true),
    I("/Misc/Debug/ForceCrashOnPanic", 0, 0, 1, "Crash instead of halting on panic.", true),
    S("/Misc/Debug/CoreDumpDir", "/var/core", kPathChars, "Directory of kernel core dumps.",
      true),

    I("/UserVars/ShellTimeoutSec", 900, 0, 86400, "Seconds before an idle shell is closed."),
    I("/UserVars/SessionIdleTimeoutSec", 0, 0, 604800,
      "Seconds before an idle management session ends (0: never)."),
    S("/UserVars/ActivationScript", "", kPathChars, "Script run once after the first boot."),
    S("/UserVars/Locale", "en_US.UTF-8", kLocaleChars, "Locale of messages and formats."),
    S("/UserVars/ContactEmail", "", kMailChars, "Whom to tell about this host."),
    B("/UserVars/Site"),
};

unsigned const kDefaultHostSize = sizeof kDefaultHost / sizeof kDefaultHost[0];

}  // namespace Model
}  // namespace QorCtl
