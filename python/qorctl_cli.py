#!/usr/bin/python2.7
"""qorctl: look at the host and read or change its advanced options.

The tool works through the qorctl module. Every command first initialises
the library, which loads the saved host configuration when the file exists;
commands that change an option write the configuration back afterwards, so
a change lasts across invocations.
"""
import argparse
import errno
import json
import os
import re
import sys

PROG = "qorctl"

# Exit statuses, also listed in --help.
EXIT_OK = 0
EXIT_FAILURE = 1     # any other library failure
EXIT_USAGE = 2       # bad command line, bad number text
EXIT_NOT_FOUND = 3   # no such option or branch
EXIT_REFUSED = 4     # the library refused the value
EXIT_CONFIG = 5      # the configuration file could not be read or written

DEFAULT_CONFIG = "/var/lib/qorctl/host.conf"
UINT32_MAX = 4294967295

EPILOG = """\
paths:
  Options and branches are named by their path from the root branch, for
  example /Net/TcpipHeapSize or /Net/Tcpip; the leading '/' may be left out.

configuration file:
  --config FILE, else the environment variable QORCTL_CONFIG, else
  %s. It is loaded (when it exists) before every command
  and written after every change.

exit status:
  0 success, 1 other library failure, 2 usage error or bad number,
  3 no such option or branch, 4 value refused by the host,
  5 configuration file unreadable, damaged or not writable.
""" % DEFAULT_CONFIG


class CliError(Exception):
    """An expected failure: reported as one line on stderr, no traceback."""

    def __init__(self, message, status=EXIT_FAILURE):
        Exception.__init__(self, message)
        self.status = status


def one_line(text):
    return " ".join(part.strip() for part in str(text).splitlines() if part.strip())


def quote(text):
    """A string value as the library shows it: double quotes, escapes."""
    out = ['"']
    for ch in text:
        if ch in '"\\':
            out.append("\\" + ch)
        elif ord(ch) < 0x20 or ord(ch) >= 0x7f:
            out.append("\\x%02x" % ord(ch))
        else:
            out.append(ch)
    out.append('"')
    return "".join(out)


def char_ranges(chars):
    """Shortens runs of consecutive letters or digits: 'abc...z' -> 'a-z'."""
    out = []
    i = 0
    while i < len(chars):
        j = i
        while (j + 1 < len(chars) and chars[j].isalnum() and chars[j + 1].isalnum()
               and ord(chars[j + 1]) == ord(chars[j]) + 1):
            j += 1
        if j - i >= 2:
            out.append("%s-%s" % (chars[i], chars[j]))
        else:
            out.append(chars[i:j + 1])
        i = j + 1
    return "".join(out)


def parse_uint32(text, path):
    t = text.strip()
    if re.match(r"^0[xX][0-9a-fA-F]+$", t):
        value = int(t, 16)
    elif re.match(r"^[0-9]+$", t):
        value = int(t, 10)
    else:
        raise CliError("%s is an integer option; %s is not an unsigned integer"
                       % (path, quote(text)), EXIT_USAGE)
    if value > UINT32_MAX:
        raise CliError("%s is an integer option; %s is larger than %d"
                       % (path, t, UINT32_MAX), EXIT_USAGE)
    return value


def split_path(path):
    """'/Net//Tcpip/' -> ['Net', 'Tcpip']."""
    return [part for part in path.split("/") if part]


def join_path(parts):
    return "/" + "/".join(parts)


class HostSession(object):
    """The library, initialised with the chosen configuration file."""

    def __init__(self, config):
        try:
            import qorctl
        except ImportError as e:
            raise CliError("cannot load the qorctl module (%s); is PYTHONPATH set to the "
                           "build's python directory?" % e)
        self.q = qorctl
        if config is not None:
            if not config:
                raise CliError("--config needs a file name", EXIT_USAGE)
            config = os.path.abspath(config)
            # SetConfigFile is host-wide; any implementation object will do.
            qorctl.HostImpl().SetConfigFile(config)
            self.config_path = config
        else:
            self.config_path = os.environ.get("QORCTL_CONFIG") or DEFAULT_CONFIG
        self.config_existed = os.path.exists(self.config_path)
        try:
            qorctl.QorCtlObject.Init()
        except qorctl.HostCtlException as e:
            raise CliError(one_line(e), EXIT_CONFIG)
        self.host = qorctl.HostFactory.GetHost()
        self.root = self.host.GetAdvancedOptions()

    # ---- finding things ----

    def resolve(self, path):
        """('branch', branch, path) or ('option', option, path)."""
        parts = split_path(path)
        branch = self.root
        for i, name in enumerate(parts):
            last = i == len(parts) - 1
            sub = self._branch_named(branch, name)
            if sub is not None:
                branch = sub
                continue
            if last:
                option = self._option_named(branch, name)
                if option is not None:
                    return "option", option, join_path(parts)
            raise CliError("no option or branch %s on this host" % join_path(parts[:i + 1]),
                           EXIT_NOT_FOUND)
        return "branch", branch, join_path(parts)

    def _branch_named(self, branch, name):
        try:
            return branch.GetBranchByName(name)
        except self.q.HostCtlException:
            return None

    def _option_named(self, branch, name):
        try:
            return branch.GetOptionByName(name)
        except self.q.HostCtlException:
            return None

    def option(self, path):
        kind, obj, full = self.resolve(path)
        if kind != "option":
            raise CliError("%s is a branch, not an option (see '%s options list %s')"
                           % (full, PROG, full), EXIT_NOT_FOUND)
        return self.typed(obj)

    def typed(self, option):
        """The integer or string view of an option."""
        if option.GetType() == self.q.AdvancedOption_ADV_OPTION_INT_TYPE:
            return self.q.CastAdvInt(option)
        return self.q.CastAdvString(option)

    def is_int(self, typed):
        return isinstance(typed, self.q.AdvancedIntegerOptionImpl)

    def branch_options(self, branch, include_hidden):
        """The branch's options; hidden ones only when asked for."""
        if not include_hidden:
            return branch.GetOptions()
        # Only the implementation lists hidden options; make a handle on
        # the same branch.
        parts = split_path(branch.GetName())
        if parts:
            impl = self.q.AdvancedOptionBranchImpl(parts[:-1], parts[-1])
        else:
            impl = self.q.AdvancedOptionBranchImpl()
        return impl.GetOptions(True)

    def walk(self, branch, include_hidden):
        """Yields (branch path, [typed options], number of sub-branches) for
        branch and every branch below it, depth first."""
        options = [self.typed(o) for o in self.branch_options(branch, include_hidden)]
        subs = branch.GetBranches()
        yield branch.GetName(), options, len(subs)
        for sub in subs:
            for item in self.walk(sub, include_hidden):
                yield item

    # ---- describing ----

    def describe(self, opt):
        if self.is_int(opt):
            d = {"type": "integer", "value": opt.GetValue(), "default": opt.GetDefaultValue(),
                 "minimum": opt.GetMinimum(), "maximum": opt.GetMaximum()}
        else:
            d = {"type": "string", "value": opt.GetValue(), "default": opt.GetDefaultValue(),
                 "valid_characters": opt.GetValidCharacters()}
        d.update(path=opt.GetOptionPath(), name=opt.GetOptionName(), hidden=opt.IsHidden(),
                 description=opt.GetDescription())
        d["changed"] = d["value"] != d["default"]
        return d

    def save(self):
        try:
            self.host.SaveConfig()
        except self.q.HostCtlException as e:
            raise CliError(one_line(e), EXIT_CONFIG)


def shown_value(d, key="value"):
    return str(d[key]) if d["type"] == "integer" else quote(d[key])


def limits(d):
    if d["type"] == "integer":
        return "range %d..%d" % (d["minimum"], d["maximum"])
    return "chars %s" % char_ranges(d["valid_characters"])


# ---- commands ----

def cmd_show(session, args, out):
    host = session.host
    areas = []
    for child in host.GetChildren():
        name = child.GetName()
        areas.append("advanced options" if name == "/" else name)
    branches = []
    total = hidden = changed = 0
    for top in session.root.GetBranches():
        n = h = c = 0
        for _, options, _ in session.walk(top, True):
            for opt in options:
                n += 1
                h += opt.IsHidden()
                c += session.describe(opt)["changed"]
        branches.append({"path": top.GetName(), "options": n, "hidden": h, "changed": c})
        total += n
        hidden += h
        changed += c
    result = {
        "host": host.GetName(),
        "config_file": session.config_path,
        "config_loaded": session.config_existed,
        "areas": areas,
        "options": {"total": total, "hidden": hidden, "changed": changed},
        "branches": branches,
    }
    if args.json:
        return result
    out.append("Host %s" % result["host"])
    out.append("  Configuration file: %s (%s)" % (
        session.config_path, "loaded" if session.config_existed else "not present; defaults"))
    out.append("  Areas:              %s" % ", ".join(areas))
    out.append("  Advanced options:   %d (%d hidden, %d changed from default)"
               % (total, hidden, changed))
    width = max([len(b["path"]) for b in branches] + [4])
    for b in branches:
        out.append("    %-*s  %3d options, %d hidden, %d changed"
                   % (width, b["path"], b["options"], b["hidden"], b["changed"]))
    return None


def cmd_list(session, args, out):
    kind, obj, full = session.resolve(args.path or "/")
    if kind == "option":
        sections = [(full.rsplit("/", 1)[0] or "/", [session.typed(obj)], 0)]
    else:
        sections = list(session.walk(obj, args.all))
    described = [(path, [session.describe(o) for o in options], subs)
                 for path, options, subs in sections]
    if args.json:
        return {
            "path": full,
            "branches": [path for path, _, _ in described] if kind == "branch" else [],
            "options": [d for _, ds, _ in described for d in ds],
        }
    everything = [d for _, ds, _ in described for d in ds]
    nw = max([len(d["name"]) for d in everything] + [1])
    vw = max([len(shown_value(d)) for d in everything] + [1])
    any_changed = False
    for path, ds, subs in described:
        if not ds and subs:
            continue  # only a parent of the branches that follow
        out.append(path)
        if not ds:
            out.append("  (no options)")
            continue
        for d in ds:
            any_changed = any_changed or d["changed"]
            out.append("  %s %-*s  %-7s  %-*s  default %s, %s%s" % (
                "*" if d["changed"] else " ", nw, d["name"],
                "int" if d["type"] == "integer" else "string", vw, shown_value(d),
                shown_value(d, "default"), limits(d), "  [hidden]" if d["hidden"] else ""))
    if any_changed:
        out.append("(* changed from the default)")
    return None


def cmd_get(session, args, out):
    d = session.describe(session.option(args.path))
    if args.json:
        return d
    if args.value:
        out.append(str(d["value"]))
        return None
    out.append(d["path"])
    rows = [("Type", d["type"]), ("Value", shown_value(d)),
            ("Default", shown_value(d, "default"))]
    if d["type"] == "integer":
        rows.append(("Range", "%d .. %d" % (d["minimum"], d["maximum"])))
    else:
        rows.append(("Valid characters", "%s  (%s)" % (
            char_ranges(d["valid_characters"]), quote(d["valid_characters"]))))
    rows += [("Hidden", "yes" if d["hidden"] else "no"), ("Description", d["description"])]
    for label, value in rows:
        out.append("  %-17s %s" % (label + ":", value))
    return None


def cmd_set(session, args, out):
    opt = session.option(args.path)
    before = session.describe(opt)
    if session.is_int(opt):
        value = parse_uint32(args.value, before["path"])
    else:
        value = args.value
    try:
        opt.SetValue(value)
    except session.q.HostCtlException as e:
        raise CliError(one_line(e), EXIT_REFUSED)
    session.save()
    after = session.describe(opt)
    return report_change(session, args, out, [(before, after)])


def cmd_reset(session, args, out):
    kind, obj, full = session.resolve(args.path)
    if kind == "option":
        options = [session.typed(obj)]
    else:
        options = [o for _, opts, _ in session.walk(obj, True) for o in opts]
    pairs = []
    for opt in options:
        before = session.describe(opt)
        opt.SetToDefault()
        pairs.append((before, session.describe(opt)))
    session.save()
    return report_change(session, args, out, pairs)


def report_change(session, args, out, pairs):
    if args.json:
        return {"config_file": session.config_path,
                "changes": [{"path": b["path"], "old": b["value"], "value": a["value"],
                             "changed": b["value"] != a["value"]} for b, a in pairs]}
    moved = [(b, a) for b, a in pairs if b["value"] != a["value"]]
    for b, a in moved:
        out.append("%s: %s -> %s" % (a["path"], shown_value(b), shown_value(a)))
    if not moved:
        out.append("%s: unchanged" % (pairs[0][1]["path"] if len(pairs) == 1 else
                                       "%d options" % len(pairs)))
    out.append("saved to %s" % session.config_path)
    return None


# ---- command line ----

class Parser(argparse.ArgumentParser):
    def error(self, message):
        # One line, like every other error of the tool.
        raise CliError("%s (see '%s --help')" % (message, self.prog), EXIT_USAGE)


def build_parser():
    common = argparse.ArgumentParser(add_help=False)
    # Accepted before or after the command; SUPPRESS keeps a value given
    # before the command from being reset by the command's own default.
    common.add_argument("--json", action="store_true", default=argparse.SUPPRESS,
                        help="print the result as JSON")
    common.add_argument("--config", metavar="FILE", default=argparse.SUPPRESS,
                        help="configuration file to load and save")

    parser = Parser(prog=PROG, description="Look at the host and read or change its "
                    "advanced options.", epilog=EPILOG, parents=[common],
                    formatter_class=argparse.RawDescriptionHelpFormatter)
    # Sub-parsers take the class of their parent: one-line errors everywhere.
    commands = parser.add_subparsers(dest="command", metavar="COMMAND")

    show = commands.add_parser("show", parents=[common], help="summary of the host",
                               description="Summary of the host: name, configuration "
                               "file, area roots and option counts.")
    show.set_defaults(func=cmd_show)

    options = commands.add_parser("options", help="list, read and change advanced options",
                                  description="List, read and change advanced options.")
    sub = options.add_subparsers(dest="action", metavar="ACTION")

    p = sub.add_parser("list", parents=[common], help="walk the option tree",
                       description="Walk the option tree from PATH (default: the root) and "
                       "list every branch with its options.")
    p.add_argument("path", metavar="PATH", nargs="?", help="branch or option path")
    p.add_argument("--all", action="store_true", help="include hidden options")
    p.set_defaults(func=cmd_list)

    p = sub.add_parser("get", parents=[common], help="show one option",
                       description="Show one option: value, default, limits, description.")
    p.add_argument("path", metavar="PATH")
    p.add_argument("--value", action="store_true", help="print only the value")
    p.set_defaults(func=cmd_get)

    p = sub.add_parser("set", parents=[common], help="change an option and save",
                       description="Change an option and save the configuration. Integer "
                       "values are decimal or 0x hexadecimal.")
    p.add_argument("path", metavar="PATH")
    p.add_argument("value", metavar="VALUE")
    p.set_defaults(func=cmd_set)

    p = sub.add_parser("reset", parents=[common], help="set back to the default and save",
                       description="Set an option, or every option below a branch (hidden "
                       "ones included), back to its default and save the configuration.")
    p.add_argument("path", metavar="PATH")
    p.set_defaults(func=cmd_reset)

    return parser


def run(argv, stdout, stderr):
    out = []
    try:
        args = build_parser().parse_args(argv)
        args.json = getattr(args, "json", False)
        session = HostSession(getattr(args, "config", None))
        try:
            result = args.func(session, args, out)
        except session.q.HostCtlException as e:
            raise CliError(one_line(e), EXIT_FAILURE)
        if args.json:
            stdout.write(json.dumps(result, indent=2, sort_keys=True, separators=(",", ": "))
                         + "\n")
        else:
            stdout.write("".join(line + "\n" for line in out))
        stdout.flush()
        return EXIT_OK
    except CliError as e:
        stderr.write("%s: error: %s\n" % (PROG, e))
        return e.status
    except KeyboardInterrupt:
        stderr.write("%s: interrupted\n" % PROG)
        return 130
    except IOError as e:
        if e.errno == errno.EPIPE:
            # The reader went away (| head); keep the interpreter's last
            # flush from complaining about the closed pipe.
            devnull = os.open(os.devnull, os.O_WRONLY)
            os.dup2(devnull, stdout.fileno())
            return EXIT_OK
        stderr.write("%s: error: %s\n" % (PROG, one_line(e)))
        return EXIT_FAILURE


def main():
    sys.exit(run(sys.argv[1:], sys.stdout, sys.stderr))


if __name__ == "__main__":
    main()
