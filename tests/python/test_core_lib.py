"""Library base objects: exceptions and their texts, command execution,
the geometry records and the object roots' overloads."""
import os
import re
import signal
import subprocess
import sys
import unittest

import _qorctl as Q
import qorctl

FRAME = re.compile(r"^#(\d+) (\S.*) \(([^()]+)\)$")


def refused():
    """A library exception raised by a real refusal."""
    heap = qorctl.CastAdvInt(qorctl.AdvancedOptionImpl.FindOption("/Net/TcpipHeapSize"))
    try:
        heap.SetValue(5000)
    except qorctl.HostCtlException as e:
        return e
    raise AssertionError("the library accepted an out-of-range value")


class Exceptions(unittest.TestCase):
    MESSAGE = "Value 5000 for option /Net/TcpipHeapSize is out of range [0, 1024]"

    def test_texts_of_a_raised_exception(self):
        e = refused()
        self.assertIs(type(e), qorctl.HostCtlException)
        self.assertIsInstance(e, Exception)
        self.assertTrue(e.thisown)
        self.assertEqual(str(e), self.MESSAGE)
        self.assertEqual(e.what(), self.MESSAGE)
        self.assertEqual(e.GetMessage(), self.MESSAGE)
        self.assertEqual(e.GetMessage(0), self.MESSAGE)
        self.assertEqual(e.GetMessage("\0"), self.MESSAGE)
        verbose = e.GetMessage(1)
        self.assertEqual(e.GetMessage("y"), verbose)
        head = self.MESSAGE + "\nMessage: adv.option.refused(/Net/TcpipHeapSize)\nStack trace:\n"
        self.assertTrue(verbose.startswith(head), verbose)
        self.assertEqual(verbose[len(head):], e.GetStackTrace())
        vob = e.GetVobMessage()
        self.assertIn("HostCtl::Lib::VobMessage", repr(vob))

    def test_stack_trace(self):
        trace = refused().GetStackTrace()
        lines = trace.splitlines()
        self.assertTrue(len(lines) >= 3, trace)
        frames = [FRAME.match(l) for l in lines]
        self.assertTrue(all(frames), trace)
        self.assertEqual([int(f.group(1)) for f in frames], range(len(lines)))
        objects = [f.group(3) for f in frames]
        # Innermost first: the library, then the wrapper that called it.
        self.assertEqual(objects[0], "libqorctl.so")
        module = os.path.basename(Q.__file__)  # _qorctl_d.so for the debug interpreter
        self.assertIn(module, objects)
        self.assertLess(objects.index("libqorctl.so"), objects.index(module))

    def test_exceptions_made_in_python(self):
        e = qorctl.HostCtlException("boom")
        self.assertTrue(e.thisown)
        self.assertEqual(str(e), "boom")
        self.assertTrue(e.GetMessage(1).startswith("boom\nStack trace:\n#0 "))
        try:
            raise e
        except qorctl.HostCtlException as caught:
            self.assertIs(caught, e)
        # The message record belongs to its exception: keep that alive.
        source = refused()
        with_vob = qorctl.HostCtlException("again", source.GetVobMessage())
        self.assertTrue(with_vob.GetMessage(1).startswith(
            "again\nMessage: adv.option.refused(/Net/TcpipHeapSize)\n"))

    def test_derived_exception_accepted_by_base_methods(self):
        q = qorctl.QorCtlException("lost", "exec.cpp", 42)
        self.assertIsInstance(q, qorctl.HostCtlException)
        self.assertEqual(q.GetSource(), "exec.cpp:42")
        self.assertEqual(qorctl.QorCtlException("lost", "exec.cpp", 0).GetSource(), "exec.cpp")
        self.assertEqual(Q.HostCtlException_GetMessage(q), "lost")
        self.assertEqual(Q.HostCtlException_GetMessage(q, 0), "lost")
        self.assertEqual(Q.HostCtlException_what(q), "lost")
        self.assertEqual(Q.HostCtlException___str__(q), "lost")
        self.assertEqual(str(q), "lost")
        self.assertTrue(FRAME.match(Q.HostCtlException_GetStackTrace(q).splitlines()[0]))
        self.assertIsNotNone(Q.HostCtlException_GetVobMessage(q))
        copy = qorctl.QorCtlException(q)
        self.assertEqual((copy.GetSource(), str(copy)), ("exec.cpp:42", "lost"))

    def test_overload_messages(self):
        e = refused()
        with self.assertRaises(NotImplementedError) as cm:
            Q.HostCtlException_GetMessage(e, 0, 1)
        self.assertEqual(str(cm.exception),
                         "Wrong number of arguments for overloaded function "
                         "'HostCtlException_GetMessage'.\n"
                         "  Possible C/C++ prototypes are:\n"
                         "    GetMessage(HostCtl::Lib::HostCtlException const *,Bool)\n"
                         "    GetMessage(HostCtl::Lib::HostCtlException const *)\n")
        with self.assertRaises(NotImplementedError) as cm:
            Q.new_QorCtlException("a message", "a source")
        self.assertEqual(str(cm.exception),
                         "Wrong number of arguments for overloaded function "
                         "'new_QorCtlException'.\n"
                         "  Possible C/C++ prototypes are:\n"
                         "    QorCtl::Lib::QorCtlException(std::string,std::string,uint32,"
                         "HostCtl::Lib::VobMessage)\n"
                         "    QorCtl::Lib::QorCtlException(std::string,std::string,uint32)\n"
                         "    QorCtl::Lib::QorCtlException(QorCtl::Lib::QorCtlException const &)\n")


class Exec(unittest.TestCase):
    def test_overload_message(self):
        message = ("Wrong number of arguments for overloaded function 'QorCtl_Exec'.\n"
                   "  Possible C/C++ prototypes are:\n"
                   "    QorCtl::Util::QorCtl_Exec(std::string,bool,bool,bool)\n"
                   "    QorCtl::Util::QorCtl_Exec(std::string,bool,bool)\n"
                   "    QorCtl::Util::QorCtl_Exec(std::string,bool)\n"
                   "    QorCtl::Util::QorCtl_Exec(std::string)\n")
        for args in ((), ("true", True, False, False, False)):
            with self.assertRaises(NotImplementedError) as cm:
                qorctl.QorCtl_Exec(*args)
            self.assertEqual(str(cm.exception), message)

    def test_exit_statuses(self):
        self.assertEqual(qorctl.QorCtl_Exec("true"), 0)
        # Without check a failing status is returned, not raised.
        self.assertEqual(qorctl.QorCtl_Exec("exit 3"), 3)
        self.assertEqual(qorctl.QorCtl_Exec("exit 3", True, False), 3)
        self.assertEqual(qorctl.QorCtl_Exec("kill -TERM $$"), 128 + signal.SIGTERM)
        self.assertEqual(qorctl.QorCtl_Exec("exit 0", True, True, True), 0)

    def test_check_raises_with_the_end_of_the_output(self):
        with self.assertRaises(qorctl.HostCtlException) as cm:
            qorctl.QorCtl_Exec("echo first; echo detail-7; exit 4", True, True, True)
        self.assertEqual(str(cm.exception), "Command 'echo first; echo detail-7; exit 4' "
                         "exited with status 4; its output ends with:\nfirst\ndetail-7")
        with self.assertRaises(qorctl.HostCtlException) as cm:
            qorctl.QorCtl_Exec("kill -KILL $$", True, False, True)
        self.assertEqual(str(cm.exception), "Command 'kill -KILL $$' was ended by signal 9")

    def test_without_wait_the_pid_is_returned(self):
        pid = qorctl.QorCtl_Exec("exit 7", False)
        done, status = os.waitpid(pid, 0)
        self.assertEqual(done, pid)
        self.assertTrue(os.WIFEXITED(status))
        self.assertEqual(os.WEXITSTATUS(status), 7)

    def test_commands_that_cannot_run(self):
        for command, why in (("", "cannot be run: it is empty"),
                             ("  \t", "cannot be run: it is empty"),
                             ("echo a\0b", "cannot be run: it contains a NUL character")):
            with self.assertRaises(qorctl.HostCtlException) as cm:
                qorctl.QorCtl_Exec(command)
            self.assertEqual(str(cm.exception), "Command '%s' %s" % (command, why))

    def test_default_flags_and_quiet(self):
        # Standard output of the commands is the child interpreter's own.
        code = ("import qorctl, sys\n"
                "s = qorctl.QorCtl_Exec('echo passed-through; exit 5')\n"
                "print 'status', s\n"
                "sys.stdout.flush()\n"
                "s = qorctl.QorCtl_Exec('echo captured; exit 6', True, True)\n"
                "print 'status', s\n")
        child = subprocess.Popen([sys.executable, "-c", code], stdout=subprocess.PIPE,
                                 stderr=subprocess.PIPE)
        out, err = child.communicate()
        self.assertEqual(child.returncode, 0, err)
        # Defaults: wait (a status, not a pid), not quiet, no check.
        self.assertEqual(out.splitlines(), ["passed-through", "status 5", "status 6"])


class Records(unittest.TestCase):
    def test_point(self):
        p = qorctl.VMPoint()
        self.assertTrue(p.thisown)
        self.assertEqual((p.x, p.y), (0, 0))
        p.x, p.y = -7, 2147483647
        self.assertEqual((p.x, p.y), (-7, 2147483647))
        Q.VMPoint_y_set(p, -2147483648)
        self.assertEqual(Q.VMPoint_y_get(p), -2147483648)
        self.assertEqual(p.x, -7)
        with self.assertRaises(TypeError) as cm:
            p.x = 2 ** 31
        self.assertEqual(str(cm.exception), "in method 'VMPoint_x_set', argument 2 of type 'int'")
        with self.assertRaises(TypeError):
            p.y = 1.5
        self.assertEqual((p.x, p.y), (-7, -2147483648))

    def test_rect_fields_are_independent(self):
        r = qorctl.VMRect()
        self.assertEqual((r.left, r.top, r.right, r.bottom), (0, 0, 0, 0))
        for i, field in enumerate(("left", "top", "right", "bottom")):
            setattr(r, field, (i + 1) * 10)
        self.assertEqual((r.left, r.top, r.right, r.bottom), (10, 20, 30, 40))
        Q.VMRect_top_set(r, -1)
        self.assertEqual((r.left, r.top, r.right, r.bottom), (10, -1, 30, 40))
        Q.delete_VMRect(r)
        self.assertFalse(r.thisown)
        with self.assertRaises(TypeError) as cm:
            Q.delete_VMRect(qorctl.VMPoint())
        self.assertEqual(str(cm.exception), "in method 'delete_VMRect', argument 1 of type 'VMRect *'")


class ObjectRoots(unittest.TestCase):
    def test_print_overload_message(self):
        with self.assertRaises(NotImplementedError) as cm:
            Q.QorCtlObject_Print(qorctl.HostImpl(), "no stream")
        self.assertEqual(str(cm.exception),
                         "Wrong number of arguments for overloaded function "
                         "'QorCtlObject_Print'.\n"
                         "  Possible C/C++ prototypes are:\n"
                         "    Print(QorCtl::Lib::QorCtlObject *,std::ostream &)\n"
                         "    Print(QorCtl::Lib::QorCtlObject *,std::ostream &,std::string,"
                         "std::string)\n"
                         "    Print(QorCtl::Lib::QorCtlObject *,QorCtl::Util::ObjectPrinter *)\n")

    def test_config_dirty_is_always_true(self):
        objects = [qorctl.HostImpl(),
                   qorctl.AdvancedOptionBranchImpl(),
                   qorctl.CastAdvString(qorctl.AdvancedOptionImpl.FindOption("/UserVars/Locale")),
                   qorctl.AdvancedIntegerOptionImpl(["Mem"], "MinFreePct")]
        for obj in objects:
            self.assertIs(Q.QorCtlObject_IsConfigDirty(obj), True)
            obj.MarkConfigDirty()
            self.assertIs(obj.IsConfigDirty(), True)


if __name__ == "__main__":
    unittest.main()
