"""A tour of the qorctl module on the default host.

Shows the host, walks the advanced-option tree, changes one option, shows
what the host refuses, saves the configuration and reads the change back in
a fresh process with the qorctl command-line tool.

Run with PYTHONPATH set to the build's python directory (make demo does).
Everything it writes stays in the build tree: the configuration file is
<build>/demo-host.conf, removed at the start so every run begins from the
built-in defaults.
"""
import os
import subprocess
import sys

import qorctl

BUILD = os.path.dirname(os.path.dirname(os.path.abspath(qorctl.__file__)))
SOURCE = os.path.dirname(os.path.dirname(os.path.abspath(__file__)))
CONFIG = os.path.join(BUILD, "demo-host.conf")
OPTION = "/Net/TcpipHeapSize"


def heading(text):
    print
    print "== %s" % text


def describe(option):
    """One line for an option: its typed view decides what there is to say."""
    if option.GetType() == qorctl.AdvancedOption_ADV_OPTION_INT_TYPE:
        opt = qorctl.CastAdvInt(option)
        detail = "int     %-24s [%d..%d]" % (opt.GetValue(), opt.GetMinimum(), opt.GetMaximum())
    else:
        opt = qorctl.CastAdvString(option)
        detail = "string  %-24s (%d valid characters)" % (
            '"%s"' % opt.GetValue(), len(opt.GetValidCharacters()))
    return "%-22s %s" % (opt.GetOptionName(), detail)


def walk(branch, depth=0):
    pad = "  " * depth
    print "%s%s" % (pad, branch.GetName())
    for option in branch.GetOptions():
        print "%s  %s" % (pad, describe(option))
    for sub in branch.GetBranches():
        walk(sub, depth + 1)


def main():
    if os.path.exists(CONFIG):
        os.remove(CONFIG)
    # The configuration file is chosen for the whole host before the library
    # loads it; any implementation object can set it.
    qorctl.HostImpl().SetConfigFile(CONFIG)
    qorctl.QorCtlObject.Init()

    host = qorctl.HostFactory.GetHost()
    heading("The host")
    print "name:  %s" % host.GetName()
    print "areas: %s" % ", ".join(
        "advanced options" if a.GetName() == "/" else a.GetName() for a in host.GetChildren())

    heading("The advanced-option tree (hidden options left out)")
    root = host.GetAdvancedOptions()
    walk(root)

    heading("Changing %s" % OPTION)
    parts = OPTION.strip("/").split("/")
    branch = root
    for name in parts[:-1]:
        branch = branch.GetBranchByName(name)
    heap = qorctl.CastAdvInt(branch.GetOptionByName(parts[-1]))
    print "description: %s" % heap.GetDescription()
    before = heap.GetValue()
    heap.SetValue(before * 2)
    print "value: %d -> %d (default %d)" % (before, heap.GetValue(), heap.GetDefaultValue())

    heading("What the host refuses")
    try:
        heap.SetValue(heap.GetMaximum() + 1)
    except qorctl.HostCtlException as e:
        print "refused: %s" % e
    congestion = qorctl.CastAdvString(qorctl.AdvancedOptionImpl.FindOption(
        "/Net/Tcpip/CongestionControl"))
    try:
        congestion.SetValue("Cubic!")
    except qorctl.HostCtlException as e:
        print "refused: %s" % e
    print "%s is still %d" % (OPTION, heap.GetValue())

    heading("Saving to %s and reading it back in a new process" % CONFIG)
    host.SaveConfig()
    launcher = os.path.join(BUILD, "bin", "qorctl")
    if os.path.exists(launcher):
        command = [launcher]
    else:
        command = [sys.executable, os.path.join(SOURCE, "python", "qorctl_cli.py")]
    sys.stdout.flush()
    for args in (["options", "get", OPTION], ["show"]):
        print "$ qorctl --config %s %s" % (CONFIG, " ".join(args))
        sys.stdout.flush()
        status = subprocess.call(command + ["--config", CONFIG] + args)
        if status != 0:
            print >> sys.stderr, "demo: qorctl failed with status %d" % status
            return 1
    return 0


if __name__ == "__main__":
    sys.exit(main())
