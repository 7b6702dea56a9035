#!/usr/bin/python2.7
"""Call overhead of the generated bindings, against the floor and against
the tools a user would pick instead.

    python2.7 bench/run.py --build BUILD [--rounds R] [--sample-ms MS]
                           [--only KEY[,KEY...]]
    python2.7 bench/run.py --build BUILD --profile KEY [--variant V] [--calls N]

Every case is timed in this one process: our variants (the flat module
function and the shadow class method) and the comparison points for the
same library call:

  floor   hand-written C API module, METH_VARARGS + PyArg_ParseTuple
  cython  Cython 0.29 cdef class method
  ctypes  ctypes over an extern "C" shim library

Variants of a case are sampled in interleaved rounds (so a burst of load on
the machine hits all of them alike); each sample is one timeit run of N
calls sized to take about --sample-ms of CPU time. Samples measure the
process's CPU time, not wall time: the machine is shared, and time spent in
other processes would otherwise land in random samples. The table shows the
median time per call, its ratio to each baseline, and the spread
(interquartile range over the median) of our variant and of the noisiest
baseline of the row. Times include the timeit loop and the argument loads,
the same for every column. Each case checks afterwards that every variant
reached the library and gave the same result.

--profile KEY [--variant V] [--calls N] runs one variant of case KEY (flat
by default, or method, floor, cython, ctypes) N times under callgrind and
prints the instructions per call and where they go.
"""
from __future__ import print_function

import argparse
import ctypes
import os
import py_compile
import resource
import shutil
import subprocess
import sys
import time
import timeit

BASELINES = ('floor', 'cython', 'ctypes')


# ---------------------------------------------------------------------------
# Variants and cases

# The clocks: CPU time rather than wall time, so that other processes taking
# the CPU away (the machine is shared) do not count against a sample.
cpu_time = time.clock  # CLOCK_PROCESS_CPUTIME_ID on Linux, microseconds


def children_cpu_time():
    r = resource.getrusage(resource.RUSAGE_CHILDREN)
    return r.ru_utime + r.ru_stime


class Variant(object):
    """One way of making the call: a timeit statement over local names, or a
    command line for the import case (one fresh interpreter per sample)."""

    def __init__(self, stmt=None, names=None, argv=None, environ=None):
        self.stmt = stmt
        self.names = names or {}
        self.argv = argv
        self.environ = environ
        self.samples = []
        self.number = 1
        self.calls = 0            # every call made, calibration included

    def timer(self):
        setup = '\n'.join(['import __main__ as _m'] +
                          ['%s = _m.CTX[%r]' % (k, k) for k in sorted(self.names)])
        return timeit.Timer(self.stmt, setup, timer=cpu_time)

    def sample(self):
        if self.argv:
            t0 = children_cpu_time()
            rc = subprocess.call(self.argv, env=self.environ)
            dt = children_cpu_time() - t0
            if rc != 0:
                raise SystemExit('bench: %s failed with status %d' % (' '.join(self.argv), rc))
            return dt
        sys.modules['__main__'].CTX = self.names
        self.calls += self.number
        return self._timer.timeit(self.number) / self.number

    def calibrate(self, sample_s):
        if self.argv:
            self.sample()  # warm the file cache and compiled modules
            return
        self._timer = self.timer()
        n = 1
        while True:
            sys.modules['__main__'].CTX = self.names
            t = self._timer.timeit(n)
            self.calls += n
            if t >= sample_s / 4 or n >= 1 << 24:
                break
            n *= 4
        self.number = max(1, int(n * sample_s / max(t, 1e-9)))


class Case(object):
    def __init__(self, key, title, ours, base, ref=None, ref_label=None, check=None):
        self.key = key
        self.title = title
        self.ours = ours          # [(label, Variant)]
        self.base = base          # {baseline name: Variant or None}
        self.ref = ref            # Variant or None: the case's own baseline
        self.ref_label = ref_label
        self.check = check        # called after timing; raises on a fault

    def variants(self):
        out = [v for _, v in self.ours]
        out += [self.base[b] for b in BASELINES if self.base.get(b)]
        if self.ref:
            out.append(self.ref)
        return out


def median(xs):
    s = sorted(xs)
    n = len(s)
    return s[n // 2] if n % 2 else 0.5 * (s[n // 2 - 1] + s[n // 2])


def quartiles(xs):
    s = sorted(xs)
    n = len(s)
    return median(s[:n // 2]), median(s[(n + 1) // 2:])


def spread(xs):
    q1, q3 = quartiles(xs)
    return (q3 - q1) / median(xs)


# ---------------------------------------------------------------------------
# The modules under comparison

class Env(object):
    def __init__(self, build):
        self.build = os.path.abspath(build)
        self.bench_dir = os.path.join(self.build, 'bench')
        self.py_dir = os.path.join(self.build, 'python')
        for d in (self.py_dir, self.bench_dir):
            if d not in sys.path:
                sys.path.insert(0, d)
        import _qorctl
        import qorctl
        import _qorbench
        import qorbench
        import _benchfloor
        self.Q, self.qc, self.B, self.qb, self.F = _qorctl, qorctl, _qorbench, qorbench, _benchfloor
        try:
            import benchcy
            self.C = benchcy
        except ImportError as e:
            print('bench: no Cython module (%s); the cython column is empty' % e)
            self.C = None
        self.shim_path = os.path.join(self.bench_dir, 'libbenchshim.so')
        self.L = self.load_shim()

    def load_shim(self):
        L = ctypes.CDLL(self.shim_path)
        vp, u32, sz = ctypes.c_void_p, ctypes.c_uint32, ctypes.c_size_t

        def fn(name, restype, *argtypes):
            f = getattr(L, name)
            f.restype = restype
            f.argtypes = list(argtypes)
            return f
        fn('bench_shared_impl', vp)
        fn('bench_shared_widget', vp)
        fn('bench_impl_get_name', ctypes.c_char_p, vp)
        fn('bench_impl_set_size', None, vp, u32)
        fn('bench_widget_get_size', u32, vp)
        fn('bench_impl_widget_get_size', u32, vp)
        fn('bench_impl_get_items', sz, vp, ctypes.POINTER(vp), sz)
        fn('bench_impl_sum', ctypes.c_uint64, vp, ctypes.POINTER(ctypes.c_uint64), sz)
        fn('bench_impl_fail', ctypes.c_int, vp, ctypes.c_char_p, sz)
        fn('bench_option', vp, ctypes.c_char_p, ctypes.c_char_p, ctypes.c_char_p, sz)
        fn('bench_int_option', vp, ctypes.c_char_p, ctypes.c_char_p, ctypes.c_char_p, sz)
        fn('bench_option_name', ctypes.c_char_p, vp)
        fn('bench_int_option_get', ctypes.c_int64, vp)
        fn('bench_int_option_set', ctypes.c_int, vp, u32)
        return L


class ShimError(Exception):
    pass


def make_cases(env):
    Q, qc, B, qb, F, C, L = env.Q, env.qc, env.B, env.qb, env.F, env.C, env.L
    vp = ctypes.c_void_p
    cases = []

    # The bench library's objects in each binding.
    w, iw = qb.WidgetImpl.Shared(), qb.WidgetImpl.SharedWidget()
    fw, fiw = F.shared_impl(), F.shared_widget()
    cw, ciw = (C.shared_impl(), C.shared_widget()) if C else (None, None)
    pw, piw = vp(L.bench_shared_impl()), vp(L.bench_shared_widget())
    if not (pw.value and piw.value):
        raise SystemExit('bench: the shim returned no widget')

    def cy(stmt, **names):
        return Variant(stmt, names) if C else None

    def same(case, *values):
        if any(v != values[0] for v in values):
            raise SystemExit('bench: %s: the variants disagree: %r' % (case, values))

    # -- string getter -------------------------------------------------------
    def check_name():
        same('getter', B.WidgetImpl_GetName(w), w.GetName(), F.WidgetImpl_GetName(fw),
             *([cw.GetName()] if C else []) + [L.bench_impl_get_name(pw)])
    cases.append(Case('getter', 'string getter (bench)', [
        ('flat', Variant('f(o)', dict(f=B.WidgetImpl_GetName, o=w))),
        ('method', Variant('o.GetName()', dict(o=w))),
    ], {
        'floor': Variant('f(o)', dict(f=F.WidgetImpl_GetName, o=fw)),
        'cython': cy('o.GetName()', o=cw),
        'ctypes': Variant('f(p)', dict(f=L.bench_impl_get_name, p=pw)),
    }, check=check_name))

    # -- uint32 setter -------------------------------------------------------
    def check_size():
        setters = [lambda v: B.WidgetImpl_SetSize(w, v), lambda v: w.SetSize(v),
                   lambda v: F.WidgetImpl_SetSize(fw, v), lambda v: L.bench_impl_set_size(pw, v)]
        if C:
            setters.append(lambda v: cw.SetSize(v))
        for setter in setters:
            setter(11)
            same('setter', w.GetSize(), 11)
            setter(7)
        same('setter', w.GetSize(), 7)
    cases.append(Case('setter', 'uint32 setter (bench)', [
        ('flat', Variant('f(o, v)', dict(f=B.WidgetImpl_SetSize, o=w, v=7))),
        ('method', Variant('o.SetSize(v)', dict(o=w, v=7))),
    ], {
        'floor': Variant('f(o, v)', dict(f=F.WidgetImpl_SetSize, o=fw, v=7)),
        'cython': cy('o.SetSize(v)', o=cw, v=7),
        'ctypes': Variant('f(p, v)', dict(f=L.bench_impl_set_size, p=pw, v=7)),
    }, check=check_size))

    # -- product: string getter, uint32 getter and setter ---------------------
    opt = qc.HostFactory.GetHost().GetAdvancedOptions().GetBranchByName('Net').GetOptionByName('TcpipHeapSize')
    iopt = Q.CastAdvInt(opt) if hasattr(Q, 'CastAdvInt') else None
    if iopt is None:
        raise SystemExit('bench: _qorctl has no CastAdvInt; the integer option cannot be reached')
    fopt, fiopt = F.option('Net', 'TcpipHeapSize'), F.int_option('Net', 'TcpipHeapSize')
    copt, ciopt = (C.option('Net', 'TcpipHeapSize'), C.int_option('Net', 'TcpipHeapSize')) if C else (None, None)
    err = ctypes.create_string_buffer(256)
    popt = vp(L.bench_option('Net', 'TcpipHeapSize', err, 256))
    piopt = vp(L.bench_int_option('Net', 'TcpipHeapSize', err, 256))
    if not (popt.value and piopt.value):
        raise SystemExit('bench: the shim found no option: %s' % err.value)
    value = Q.AdvancedIntegerOptionImpl_GetValue(iopt)

    def check_option_name():
        same('product getter', Q.AdvancedOption_GetOptionName(opt), F.AdvancedOption_GetOptionName(fopt),
             L.bench_option_name(popt), *([copt.GetOptionName()] if C else []))
    cases.append(Case('pgetter', 'string getter (_qorctl GetOptionName)', [
        ('flat', Variant('f(o)', dict(f=Q.AdvancedOption_GetOptionName, o=opt))),
        ('method', Variant('o.GetOptionName()', dict(o=opt))),
    ], {
        'floor': Variant('f(o)', dict(f=F.AdvancedOption_GetOptionName, o=fopt)),
        'cython': cy('o.GetOptionName()', o=copt),
        'ctypes': Variant('f(p)', dict(f=L.bench_option_name, p=popt)),
    }, check=check_option_name))

    def check_int_value():
        same('product uint32', Q.AdvancedIntegerOptionImpl_GetValue(iopt), F.AdvancedIntegerOptionImpl_GetValue(fiopt),
             L.bench_int_option_get(piopt), *([ciopt.GetValue()] if C else []))
    cases.append(Case('pvalue', 'uint32 getter (_qorctl GetValue)', [
        ('flat', Variant('f(o)', dict(f=Q.AdvancedIntegerOptionImpl_GetValue, o=iopt))),
        ('method', Variant('o.GetValue()', dict(o=iopt))),
    ], {
        'floor': Variant('f(o)', dict(f=F.AdvancedIntegerOptionImpl_GetValue, o=fiopt)),
        'cython': cy('o.GetValue()', o=ciopt),
        'ctypes': Variant('f(p)', dict(f=L.bench_int_option_get, p=piopt)),
    }, check=check_int_value))

    def check_set_value():
        same('product setter', Q.AdvancedIntegerOptionImpl_GetValue(iopt), value)
        Q.AdvancedIntegerOptionImpl_SetValue(iopt, value + 1)
        same('product setter', F.AdvancedIntegerOptionImpl_GetValue(fiopt), value + 1)
        Q.AdvancedIntegerOptionImpl_SetValue(iopt, value)
    cases.append(Case('psetter', 'uint32 setter (_qorctl SetValue)', [
        ('flat', Variant('f(o, v)', dict(f=Q.AdvancedIntegerOptionImpl_SetValue, o=iopt, v=value))),
        ('method', Variant('o.SetValue(v)', dict(o=iopt, v=value))),
    ], {
        'floor': Variant('f(o, v)', dict(f=F.AdvancedIntegerOptionImpl_SetValue, o=fiopt, v=value)),
        'cython': cy('o.SetValue(v)', o=ciopt, v=value),
        'ctypes': Variant('f(p, v)', dict(f=L.bench_int_option_set, p=piopt, v=value)),
    }, check=check_set_value))

    # -- interface method, implementation object (cast) vs exact type ---------
    def check_cast():
        same('cast', B.Widget_GetSize(w), B.Widget_GetSize(iw), F.Widget_GetSize(fw),
             L.bench_impl_widget_get_size(pw), *([C.Widget.GetSize(cw)] if C else []))
    cases.append(Case('cast', 'interface method, impl object (bench)', [
        ('flat', Variant('f(o)', dict(f=B.Widget_GetSize, o=w))),
    ], {
        'floor': Variant('f(o)', dict(f=F.Widget_GetSize, o=fw)),
        'cython': cy('f(o)', f=C.Widget.GetSize if C else None, o=cw),
        'ctypes': Variant('f(p)', dict(f=L.bench_impl_widget_get_size, p=pw)),
    }, ref=Variant('f(o)', dict(f=B.Widget_GetSize, o=iw)), ref_label='exact type', check=check_cast))
    cases.append(Case('exact', 'interface method, exact type (bench)', [
        ('flat', Variant('f(o)', dict(f=B.Widget_GetSize, o=iw))),
    ], {
        'floor': Variant('f(o)', dict(f=F.Widget_GetSize, o=fiw)),
        'cython': cy('f(o)', f=C.Widget.GetSize if C else None, o=ciw),
        'ctypes': Variant('f(p)', dict(f=L.bench_widget_get_size, p=piw)),
    }))
    cases.append(Case('pcast', 'interface method, impl object (_qorctl)', [
        ('flat', Variant('f(o)', dict(f=Q.AdvancedIntegerOption_GetValue, o=iopt))),
    ], {
        'floor': Variant('f(o)', dict(f=F.AdvancedIntegerOption_GetValue, o=fiopt)),
        'cython': cy('f(o)', f=C.AdvancedIntegerOption.GetValue if C else None, o=ciopt),
    }, ref=Variant('f(o)', dict(f=Q.AdvancedIntegerOptionImpl_GetValue, o=iopt)), ref_label='exact type'))

    # -- vector of 1,000 library pointers as a tuple of borrowed objects -------
    cap = 1000
    buf = (vp * cap)()

    def check_items():
        ours = B.WidgetImpl_GetItems(w)
        same('items', len(ours), len(F.WidgetImpl_GetItems(fw)), L.bench_impl_get_items(pw, buf, cap),
             *([len(cw.GetItems())] if C else []))
        same('items', [i.GetId() for i in ours], range(len(ours)))
        same('items', [int(i.this) for i in ours], [int(p) for p in buf])
        if any(i.thisown for i in ours):
            raise SystemExit('bench: items: a borrowed item is owned')
    cases.append(Case('items', 'vector<Item*> result, 1000 items', [
        ('flat', Variant('f(o)', dict(f=B.WidgetImpl_GetItems, o=w))),
        ('method', Variant('o.GetItems()', dict(o=w))),
    ], {
        'floor': Variant('f(o)', dict(f=F.WidgetImpl_GetItems, o=fw)),
        'cython': cy('o.GetItems()', o=cw),
        'ctypes': Variant('f(p, buf, cap); tuple(buf)', dict(f=L.bench_impl_get_items, p=pw, buf=buf, cap=cap)),
    }, check=check_items))

    # -- vector<uint64> const & from a 10,000-element list ----------------------
    values = [i * 7919 % 100003 for i in range(10000)]
    arr = ctypes.c_uint64 * len(values)

    def check_sum():
        same('sum', B.WidgetImpl_Sum(w, values), sum(values), F.WidgetImpl_Sum(fw, values),
             L.bench_impl_sum(pw, arr(*values), len(values)), *([cw.Sum(values)] if C else []))
    cases.append(Case('sum', 'vector<uint64> const & from 10000-int list', [
        ('flat', Variant('f(o, l)', dict(f=B.WidgetImpl_Sum, o=w, l=values))),
        ('method', Variant('o.Sum(l)', dict(o=w, l=values))),
    ], {
        'floor': Variant('f(o, l)', dict(f=F.WidgetImpl_Sum, o=fw, l=values)),
        'cython': cy('o.Sum(l)', o=cw, l=values),
        'ctypes': Variant('f(p, A(*l), n)', dict(f=L.bench_impl_sum, p=pw, A=arr, l=values, n=len(values))),
    }, check=check_sum))

    # -- a library exception raised into Python and caught ----------------------
    catch = 'try:\n    %s\nexcept E:\n    pass'
    before = [w.GetFailures()]

    def check_fail():
        # Every timed call must have reached the library and thrown.
        calls = sum(v.calls for v in fail_case.variants()) + 1
        try:
            w.Fail()
        except qb.Error as e:
            same('exception', e.what(), 'widget refused')
        same('exception', w.GetFailures() - before[0], calls)
    fail_case = Case('raise', 'library exception raised and caught', [
        ('flat', Variant(catch % 'f(o)', dict(f=B.WidgetImpl_Fail, o=w, E=qb.Error))),
        ('method', Variant(catch % 'o.Fail()', dict(o=w, E=qb.Error))),
    ], {
        'floor': Variant(catch % 'f(o)', dict(f=F.WidgetImpl_Fail, o=fw, E=F.Error)),
        'cython': cy(catch % 'o.Fail()', o=cw, E=RuntimeError),
        'ctypes': Variant(catch % 'if f(p, m, 256): raise E(m.value)',
                          dict(f=L.bench_impl_fail, p=pw, m=ctypes.create_string_buffer(256), E=ShimError)),
    }, check=check_fail)
    cases.append(fail_case)

    # -- importing the module: a fresh interpreter per sample --------------------
    # The shadow modules are imported from compiled copies: a user's
    # interpreter writes bytecode next to them, while the build tree's test
    # environment usually keeps it from doing so.
    cache = os.path.join(env.bench_dir, 'import-cache')
    if not os.path.isdir(cache):
        os.makedirs(cache)
    for src in (env.qc.__file__, env.qb.__file__):
        src = os.path.splitext(src)[0] + '.py'
        dst = os.path.join(cache, os.path.basename(src))
        shutil.copyfile(src, dst)
        py_compile.compile(dst, doraise=True)
    environ = dict(os.environ)
    environ['PYTHONPATH'] = os.pathsep.join([cache, env.bench_dir, env.py_dir])
    environ.pop('PYTHONDONTWRITEBYTECODE', None)
    py = sys.executable

    def imp(code):
        return Variant(argv=[py, '-c', code], environ=environ)
    cases.append(Case('import', 'import, fresh interpreter', [
        ('_qorctl', imp('import _qorctl')),
        ('qorctl (shadow .pyc)', imp('import qorctl; assert qorctl.__file__.endswith(".pyc")')),
        ('_qorbench', imp('import _qorbench')),
    ], {
        'floor': imp('import _benchfloor'),
        'cython': imp('import benchcy') if C else None,
        'ctypes': imp('import ctypes; ctypes.CDLL(%r)' % env.shim_path),
    }, ref=imp('pass'), ref_label='interpreter alone'))
    return cases


# ---------------------------------------------------------------------------
# Running and reporting

def fmt_time(s):
    if s is None:
        return '-'
    if s >= 1e-3:
        return '%.2f ms' % (s * 1e3)
    if s >= 1e-6:
        return '%.2f us' % (s * 1e6)
    return '%.0f ns' % (s * 1e9)


def run_case(case, rounds, sample_s):
    vs = case.variants()
    for v in vs:
        v.calibrate(sample_s)
    for r in range(rounds):
        # Rotate the order so no variant always runs first or last.
        k = r % len(vs)
        for v in vs[k:] + vs[:k]:
            v.samples.append(v.sample())
    if case.check:
        case.check()


def report(cases):
    cols = ['case', 'ours', 'time', 'floor', 'cython', 'ctypes', 'ref', '/floor', '/cython', '/ctypes', '/ref',
            'spread ours/base', 'reps']
    rows = []
    for c in cases:
        base = dict((b, c.base.get(b)) for b in BASELINES)
        bmed = dict((b, median(v.samples) if v else None) for b, v in base.items())
        rmed = median(c.ref.samples) if c.ref else None
        bspread = max([spread(v.samples) for v in base.values() if v] +
                      ([spread(c.ref.samples)] if c.ref else []) or [0])
        for label, v in c.ours:
            m = median(v.samples)
            ratio = lambda b: '%.2f' % (m / b) if b else '-'
            rows.append([c.title, label, fmt_time(m)] + [fmt_time(bmed[b]) for b in BASELINES] +
                        [fmt_time(rmed) if c.ref else '-'] + [ratio(bmed[b]) for b in BASELINES] +
                        [ratio(rmed)] +
                        ['%4.1f%% / %4.1f%%' % (100 * spread(v.samples), 100 * bspread),
                         '%d x %d' % (len(v.samples), v.number)])
    widths = [max(len(str(r[i])) for r in rows + [cols]) for i in range(len(cols))]
    line = lambda r: '  '.join(str(x).ljust(widths[i]) if i < 2 else str(x).rjust(widths[i])
                               for i, x in enumerate(r))
    print(line(cols))
    print('  '.join('-' * w for w in widths))
    last = None
    for r in rows:
        print(line([r[0] if r[0] != last else ''] + r[1:]))
        last = r[0]
    print()
    print('Times are medians per call; /X is ours divided by X (below 1: ours is faster).')
    print('ref: the case\'s own baseline (%s).' % ', '.join(sorted(set(
        '%s: %s' % (c.key, c.ref_label) for c in cases if c.ref))))
    print('spread: interquartile range / median, of ours and of the noisiest baseline of the row.')
    print('reps: samples x calls per sample (import: one interpreter per sample).')


def loop_overhead():
    t = timeit.Timer('pass', timer=cpu_time)
    return min(t.repeat(5, 1000000)) / 1000000


def find_variant(case, name):
    for label, v in case.ours:
        if label == name:
            return v
    return case.base.get(name) if name in BASELINES else None


def callgrind(env, case, variant, calls, out):
    """Total instructions of a run of `calls` calls of the variant."""
    cmd = ['valgrind', '--tool=callgrind', '--callgrind-out-file=' + out, '--dump-instr=no',
           sys.executable, os.path.abspath(__file__), '--build', env.build, '--only', case.key,
           '--variant', variant, '--loop', str(calls)]
    p = subprocess.Popen(cmd, stderr=subprocess.PIPE)
    err = p.communicate()[1]
    if p.returncode != 0:
        raise SystemExit('bench: callgrind failed:\n' + err)
    for ln in err.splitlines():
        if 'Collected :' in ln:
            return int(ln.split(':')[-1].strip())
    raise SystemExit('bench: no instruction count in the callgrind output')


def profile(env, case, variant, calls):
    """The variant of `case` in a loop under callgrind: instructions per call
    (the difference to a one-call run) and where they go."""
    out = os.path.join(env.bench_dir, 'callgrind.%s.%s.out' % (case.key, variant))
    print('bench: callgrind, case %s, variant %s, %d calls (profile in %s)' % (case.key, variant, calls, out))
    one = callgrind(env, case, variant, 1, out + '.one')
    os.unlink(out + '.one')
    total = callgrind(env, case, variant, calls + 1, out)
    print('instructions per call: %d' % ((total - one) // calls))
    for incl in ('no', 'yes'):
        print('\n---- %s cost, whole run (%d instructions) ----' % ('inclusive' if incl == 'yes' else 'self', total))
        ann = subprocess.check_output(['callgrind_annotate', '--inclusive=' + incl, '--threshold=99', out])
        shown = 0
        for ln in ann.splitlines():
            if shown >= 30:
                break
            if ln.strip() and ln.lstrip()[:1].isdigit() and 'PROGRAM TOTALS' not in ln:
                print(ln[:170])
                shown += 1


def main():
    ap = argparse.ArgumentParser(description=__doc__.split('\n\n')[0])
    ap.add_argument('--build', default=os.environ.get('QORCTL_BUILD', 'build'))
    ap.add_argument('--rounds', type=int, default=15)
    ap.add_argument('--sample-ms', type=float, default=30.0)
    ap.add_argument('--import-samples', type=int, default=41)
    ap.add_argument('--only', help='comma-separated case keys')
    ap.add_argument('--profile', metavar='KEY', help='profile a variant of case KEY under callgrind')
    ap.add_argument('--variant', default='flat', help='the variant to profile: flat, method or a baseline')
    ap.add_argument('--calls', type=int, default=2000, help='calls in the profiled loop')
    ap.add_argument('--loop', type=int, default=0, help=argparse.SUPPRESS)
    args = ap.parse_args()

    env = Env(args.build)
    cases = make_cases(env)
    keys = [c.key for c in cases]
    if args.only:
        want = args.only.split(',')
        bad = [k for k in want if k not in keys]
        if bad:
            raise SystemExit('bench: unknown case %s; cases: %s' % (', '.join(bad), ', '.join(keys)))
        cases = [c for c in cases if c.key in want]

    if args.loop:
        # The body of a profiled run: one variant, nothing else timed.
        v = find_variant(cases[0], args.variant)
        sys.modules['__main__'].CTX = v.names
        v.timer().timeit(args.loop)
        return
    if args.profile:
        case = [c for c in cases if c.key == args.profile]
        v = find_variant(case[0], args.variant) if case else None
        if not v or v.argv:
            raise SystemExit('bench: cannot profile %s/%s; cases: %s' % (
                args.profile, args.variant, ', '.join(keys[:-1])))
        profile(env, case[0], args.variant, args.calls)
        return

    print('qorctl call-overhead benchmarks: %s %s, build %s' % (
        sys.executable, sys.version.split()[0], env.build))
    print('modules: %s, %s, %s, %s, ctypes %s' % (
        env.Q.__file__, env.B.__file__, env.F.__file__, env.C.__file__ if env.C else 'no cython', env.shim_path))
    print('empty timeit loop: %s per iteration (included in every time below)' % fmt_time(loop_overhead()))
    print()
    for c in cases:
        sys.stdout.write('timing %-8s %s ...' % (c.key, c.title))
        sys.stdout.flush()
        t0 = time.time()
        if c.key == 'import':
            run_case(c, args.import_samples, 0)
        else:
            run_case(c, args.rounds, args.sample_ms / 1000.0)
        print(' %.1f s' % (time.time() - t0))
    print()
    report(cases)
    for c in cases:
        if c.key == 'import':
            ref = c.ref.samples
            print('\nimport cost net of the interpreter start (median / best of %d): %s' % (len(ref), ', '.join(
                '%s %s / %s' % (label, fmt_time(median(v.samples) - median(ref)), fmt_time(min(v.samples) - min(ref)))
                for label, v in c.ours)))
    if not any(c.key != 'import' for c in cases):
        return
    worst = max(((median(v.samples) / median(c.base['floor'].samples), c, label)
                 for c in cases if c.base.get('floor') for label, v in c.ours if not v.argv),
                key=lambda x: x[0])
    print('\nslowest against the floor: %s, %s (%.1fx); profile it with\n'
          '  python2.7 bench/run.py --build %s --profile %s --variant %s   (and --variant floor)'
          % (worst[1].title, worst[2], worst[0], env.build, worst[1].key, worst[2]))


if __name__ == '__main__':
    main()
