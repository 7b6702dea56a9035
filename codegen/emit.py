"""Writes the C++ side of a module: wrappers, method table, type table, init."""

from cparse import Function
from ctype import CType, SCALARS, RANK_POINTER, RANK_STRING, RANK_CONTAINER, canonical_scalar_name
import clang.cindex as ci

TK = ci.TypeKind


def cstr(s):
    out = []
    for ch in s:
        if ch == '\\':
            out.append('\\\\')
        elif ch == '"':
            out.append('\\"')
        elif ch == '\n':
            out.append('\\n')
        elif 32 <= ord(ch) < 127:
            out.append(ch)
        else:
            out.append('\\%03o' % ord(ch))
    return '"' + ''.join(out) + '"'


class Descriptor:
    def __init__(self, mangled):
        self.mangled = mangled
        self.humans = []
        self.casts = []          # [(source Descriptor, converter name or None)]
        self.index = None

    def add_human(self, h):
        if h not in self.humans:
            self.humans.append(h)


class TypeTable:
    """Descriptors by mangled name, with their human names and cast lists."""

    def __init__(self):
        self.by_mangled = {}

    def get(self, mangled, human=None):
        d = self.by_mangled.get(mangled)
        if d is None:
            d = self.by_mangled[mangled] = Descriptor(mangled)
        if human:
            d.add_human(human)
        return d

    def pointer_to(self, ctype):
        """The descriptor of `ctype *` (const dropped)."""
        t = ctype.unconst()
        if t.kind == 'scalar':
            canon = canonical_scalar_name(t.canon)
            d = self.get('_p_' + canon.replace(' ', '_'))
            if t.name != canon:
                d.add_human(t.name + ' *')
            d.add_human(canon + ' *')
            return d
        if t.kind == 'pointer' and t.inner.kind == 'scalar' and t.inner.canon in (TK.CHAR_S, TK.CHAR_U):
            return self.get('_p_p_char', 'char **')
        return self.get('_p_' + t.mangle(), t.spell() + ' *')

    def finish(self):
        ds = sorted(self.by_mangled.values(), key=lambda d: d.mangled.encode())
        for i, d in enumerate(ds):
            d.index = i
        return ds


def ty_ref(d):
    # Resolved to the descriptor's index once the table is complete.
    return '@T{%s}@' % d.mangled


class ArgPlan:
    """How one parameter is converted, probed and passed."""

    def __init__(self, decl, expr, probe, rank, kind):
        self.decl = decl      # C++ lines converting `o<N>` (may `return 0`)
        self.expr = expr      # expression passed to the library
        self.probe = probe    # C++ expression testing `a[N]` without converting
        self.rank = rank
        self.kind = kind


def scalar_conv(t):
    """(converter suffix, C type) for a scalar or enum."""
    if t.kind == 'enum':
        return 'Int32', 'int32_t'
    conv = SCALARS.get(t.canon)
    if conv is None:
        raise ValueError('no conversion for %s' % t.spell())
    return conv[0], conv[1]


def scalar_rank(t):
    if t.kind == 'enum':
        return 45
    return SCALARS[t.canon][2]


def is_char(t):
    return t.kind == 'scalar' and t.canon in (TK.CHAR_S, TK.CHAR_U)


class Emitter:
    def __init__(self, model, table, module):
        self.model = model
        self.table = table
        self.module = module
        self.records = set(c.qname for c in model.classes)
        self.containers = {}     # spelled container type -> CType (for SeqIn/SeqOut)
        self.owned = {}          # descriptor mangled name -> C++ type of owned copies

    # -- descriptors used by a type ---------------------------------------
    def desc(self, ctype):
        return self.table.pointer_to(ctype)

    def owned_desc(self, ctype):
        """The descriptor of an object Python will own: types without a
        wrapper class get a deleter, so freeing them loses nothing."""
        d = self.desc(ctype)
        t = ctype.unconst()
        if not (t.kind == 'record' and (t.name in self.records or t.alias is None and t.name in self.records)):
            if t.kind in ('record', 'scalar', 'enum', 'string', 'vector', 'set') and t.name not in self.records:
                self.owned.setdefault(d.mangled, t.cxx())
        return d

    def container(self, t):
        t = t.unconst()
        self.containers[t.spell()] = t
        e = t.args[0]
        self.desc(t)
        if e.kind == 'pointer':
            self.desc(e.inner)
        elif e.kind in ('record', 'scalar', 'enum', 'string'):
            self.desc(e)
        return t

    def elem_desc(self, ct):
        e = ct.args[0]
        if e.kind == 'pointer':
            return self.desc(e.inner)
        return self.owned_desc(e)      # element copies are owned

    # -- parameters ----------------------------------------------------------
    def plan_arg(self, fn, n, i, param_t):
        """Conversion of Python argument o<i> (argument number n) to param_t."""
        t = param_t
        spelled = t.spell()
        o = 'o[%d]' % i
        a = 'a%d' % i
        base = t.strip_ref()
        if t.kind == 'ref' and base.kind in ('scalar', 'enum') and base.const:
            t = base.unconst()
            base = t
        if base.kind in ('scalar', 'enum') and t.kind != 'ref':
            conv, ctyp = scalar_conv(base)
            decl = '%s %s; if (!qr::Arg%s(%s, &%s, F, %d, %s)) return 0;' % (ctyp, a, conv, o, a, n, cstr(spelled))
            expr = a if base.kind == 'scalar' else '(%s)%s' % (base.name, a)
            return ArgPlan(decl, expr, 'qr::Probe%s(%%s)' % conv, scalar_rank(base), 'scalar')
        if base.kind == 'string' and (t.kind != 'ref' or base.const):
            by_value = t.kind != 'ref'
            decl = 'qr::StrArg %s; if (!%s.Convert(%s, %s, F, %d, %s)) return 0;' % (
                a, a, o, 'true' if by_value else 'false', n, cstr(spelled))
            return ArgPlan(decl, '%s.get()' % a, 'qr::ProbeString(%s)', RANK_STRING, 'string')
        if t.kind == 'pointer' and is_char(t.inner):
            decl = 'qr::CharPtrArg %s; if (!%s.Convert(%s, F, %d, %s)) return 0;' % (a, a, o, n, cstr(spelled))
            return ArgPlan(decl, '%s.get()' % a, 'qr::ProbeString(%s)', RANK_STRING, 'string')
        if base.kind in ('vector', 'set'):
            ct = self.container(base)
            d = self.desc(ct)
            ed = self.elem_desc(ct)
            cname = ct.cxx()
            decl = ('qr::SeqArg< %s > %s; if (!%s.Convert(%s, %s, %s, F, %d, %s)) return 0;'
                    % (cname, a, a, o, ty_ref(d), ty_ref(ed), n, cstr(spelled)))
            return ArgPlan(decl, '%s.get()' % a, 'qr::SeqProbe< %s >(%%s, %s, %s)' % (cname, ty_ref(d), ty_ref(ed)),
                           RANK_CONTAINER, 'container')
        if t.kind == 'pointer' or t.kind == 'array':
            # An array parameter is passed as a pointer to its first element.
            inner = t.inner
            d = self.desc(inner)
            ctyp = inner.unconst().cxx()
            decl = '%s *%s; if (!qr::ArgPtr(%s, (void **)&%s, %s, F, %d, %s)) return 0;' % (
                ctyp, a, o, a, ty_ref(d), n, cstr(spelled))
            return ArgPlan(decl, a, 'qr::ProbePtr(%%s, %s)' % ty_ref(d), RANK_POINTER, 'pointer')
        if base.kind in ('record', 'string', 'scalar', 'enum') or t.kind == 'ref':
            d = self.desc(base)
            ctyp = base.unconst().cxx()
            decl = '%s *%s; if (!qr::ArgRef(%s, (void **)&%s, %s, F, %d, %s)) return 0;' % (
                ctyp, a, o, a, ty_ref(d), n, cstr(spelled))
            return ArgPlan(decl, '*' + a, 'qr::ProbePtr(%%s, %s)' % ty_ref(d), RANK_POINTER, 'record')
        raise ValueError('%s: cannot convert parameter of type %s' % (fn, spelled))

    # -- results -------------------------------------------------------------
    def result_expr(self, t, call, owned, parent=None):
        """A C++ expression building the Python result of `call`. `parent` is
        the Python argument whose storage a reference result points into."""
        if t is None or t.kind == 'void':
            return None
        base = t.strip_ref()
        if base.kind in ('scalar', 'enum') and (t.kind != 'ref' or base.const):
            conv, _ = scalar_conv(base)
            builder = {'Bool': 'qr::FromBool', 'Int32': 'qr::FromInt', 'Uint8': 'qr::FromInt',
                       'Uint16': 'qr::FromInt', 'Uint32': 'qr::FromUint32', 'Uint64': 'qr::FromUint64',
                       'Int64': 'qr::FromInt64', 'Char': 'qr::FromChar'}[conv]
            cast = '(long)' if builder == 'qr::FromInt' else ''
            return '%s(%s%s)' % (builder, cast, call)
        if base.kind == 'string':
            return 'qr::FromStdString(%s)' % call
        if t.kind == 'pointer' and is_char(t.inner):
            return 'qr::FromCString(%s)' % call
        if t.kind == 'pointer' and t.inner.name == 'PyObject':
            # Already a Python object: a new reference, or null with an error.
            return call
        if base.kind in ('vector', 'set'):
            ct = self.container(base)
            return 'qr::SeqOut< %s >(%s, %s)' % (ct.cxx(), call, ty_ref(self.elem_desc(ct)))
        if t.kind == 'pointer':
            d = self.owned_desc(t.inner) if owned else self.desc(t.inner)
            return 'qr::WrapPointer((void *)(%s), %s, %s)' % (call, ty_ref(d), 'qr::POINTER_OWN' if owned else '0')
        if t.kind == 'ref':
            d = self.desc(base)
            if parent:
                return 'qr::WrapPointerKeep((void *)&(%s), %s, %s)' % (call, ty_ref(d), parent)
            return 'qr::WrapPointer((void *)&(%s), %s, 0)' % (call, ty_ref(d))
        if base.kind == 'record':
            d = self.owned_desc(base)
            return 'qr::WrapPointer(new %s(%s), %s, qr::POINTER_OWN)' % (base.unconst().cxx(), call, ty_ref(d))
        raise ValueError('cannot convert result of type %s' % t.spell())


# ---------------------------------------------------------------------------
# Signatures and wrappers

class Sig:
    """One callable form: a function with a given number of parameters."""

    def __init__(self, func, cls, nparams):
        self.func = func
        self.cls = cls              # Class or None
        self.params = func.params[:nparams]
        self.self_arg = func.kind == 'method' or func.kind == 'extend'

    def self_type(self):
        t = CType('record', self.cls.qname, const=self.func.const)
        return CType('pointer', inner=t)

    def prototype(self):
        f = self.func
        types = [p.ctype.spell() for p in self.params]
        if f.kind == 'ctor':
            return '%s(%s)' % (self.cls.qname, ','.join(types))
        if self.self_arg:
            return '%s(%s)' % (f.pyname or f.name, ','.join([self.self_type().spell()] + types))
        return '%s(%s)' % (f.qname, ','.join(types))


def expand_defaults(func, cls):
    """One signature per accepted argument count, longest first."""
    n = len(func.params)
    sigs = [Sig(func, cls, n)]
    while n > 0 and func.params[n - 1].default is not None:
        n -= 1
        sigs.append(Sig(func, cls, n))
    return sigs


# Python method name and template function of each container slot, in the
# order of the slot enums in containers/container.h.
VECTOR_SLOTS = [(p, p.strip('_') if p.startswith('__') else p) for p in (
    'iterator', '__nonzero__', '__len__', 'pop', '__getslice__', '__setslice__', '__delslice__',
    '__delitem__', '__getitem__', '__setitem__', 'append', 'empty', 'size', 'clear', 'swap',
    'get_allocator', 'begin', 'end', 'rbegin', 'rend', 'pop_back', 'erase', 'push_back', 'front',
    'back', 'assign', 'resize', 'insert', 'reserve', 'capacity')]
SET_SLOTS = [(p, p.strip('_') if p.startswith('__') else p) for p in (
    'iterator', '__nonzero__', '__len__', 'append', '__contains__', '__getitem__', 'empty', 'size',
    'clear', 'swap', 'count', 'begin', 'end', 'rbegin', 'rend', 'erase', 'find', 'lower_bound',
    'upper_bound', 'equal_range', 'insert')]


class Wrapper:
    def __init__(self, pyname, cname, code, cls=None):
        self.pyname = pyname
        self.cname = cname
        self.code = code
        self.cls = cls


class ModuleGen:
    def __init__(self, model, module, extends=()):
        self.model = model
        self.module = module
        self.table = TypeTable()
        self.em = Emitter(model, self.table, module)
        self.wrappers = []          # public wrappers in method-table order
        self.chunks = {}            # class qname or '' -> list of code
        self.shadow = []            # per class: info for the Python shadow module
        self.extends = extends
        self.docs = {}              # class qname -> prototypes, for doc strings

    # -- exceptions caught around the library call --------------------------
    def catch_clauses(self, func):
        out = []
        for exc in sorted(func.throws, key=lambda e: 0 if e.startswith('QorCtl') else 1):
            if exc == 'swig::stop_iteration':
                out.append('catch (swig::stop_iteration &) { return qr::RaiseStopIteration(); }')
                continue
            d = self.em.owned_desc(CType('record', exc))
            out.append('catch (%s &e) { return qr::RaiseLibraryException(new %s(e), %s); }' % (exc, exc, ty_ref(d)))
        for exc, helper in getattr(func, 'std_catches', []):
            out.append('catch (%s &e) { return %s(e.what()); }' % (exc, helper))
        out.append('catch (...) { return qr::RaiseForeign(); }')
        return ' '.join(out)

    def sig_body(self, sig, wname, cname):
        """The wrapper function for one signature (full call sequence)."""
        f = sig.func
        em = self.em
        lines = ['  (void)F;']
        nargs = len(sig.params) + (1 if sig.self_arg else 0)
        if nargs:
            lines.append('  PyObject *o[%d];' % nargs)
            fmt = 'O' * nargs + ':' + wname
            if nargs > 8:
                lines.append('  if (!PyArg_ParseTuple(args, %s, %s)) return 0;'
                             % (cstr(fmt), ', '.join('&o[%d]' % i for i in range(nargs))))
            else:
                lines.append('  if (!qr::Unpack(args, %s, %d, o)) return 0;' % (cstr(fmt), nargs))
        else:
            lines.append('  if (!PyArg_ParseTuple(args, %s)) return 0;' % cstr(':' + wname))
        i = 0
        if sig.self_arg:
            st = sig.self_type()
            d = self.table.pointer_to(st.inner)
            if 'self-disown' in f.annotations:
                # The result takes over the object: the argument stops owning it.
                lines.append('  %s *self; if (!qr::ArgPtr(o[0], (void **)&self, %s, F, 1, %s, qr::POINTER_DISOWN)) return 0;'
                             % (sig.cls.qname, ty_ref(d), cstr(st.spell())))
                lines.append('  if (!self) return qr::NullRefError(F, 1, %s);' % cstr(st.spell()))
            else:
                lines.append('  %s *self; if (!qr::ArgSelf(o[0], (void **)&self, %s, F, %s)) return 0;'
                             % (sig.cls.qname, ty_ref(d), cstr(st.spell())))
            i = 1
        exprs = []
        for p in sig.params:
            plan = em.plan_arg(wname, i + 1, i, p.ctype)
            lines.append('  ' + plan.decl)
            exprs.append(plan.expr)
            i += 1
        call_args = ', '.join(exprs)
        if f.kind == 'ctor':
            d = self.table.pointer_to(CType('record', sig.cls.qname))
            result = 'qr::WrapPointer(new %s(%s), %s, qr::POINTER_OWN | qr::POINTER_NO_SHADOW)' % (
                sig.cls.qname, call_args, ty_ref(d))
        else:
            if f.kind == 'method':
                call = 'self->%s(%s)' % (f.name if not f.name.startswith('__') else f.cpp_name, call_args)
            elif f.kind == 'extend':
                call = '%s(%s)' % (f.qname, ', '.join(['self'] + exprs))
            else:
                call = '%s(%s)' % (f.qname, call_args)
            result = em.result_expr(f.result, call, f.owned, 'o[0]' if sig.self_arg else None)
            if result is None:
                result = '(%s, qr::NoneResult())' % call
        lines.append('  try { return %s; } %s' % (result, self.catch_clauses(f)))
        return ('PyObject *%s(PyObject *, PyObject *args) {\n  static const char *const F = %s;\n%s\n}\n'
                % (cname, cstr(wname), '\n'.join(lines)))

    def add_group(self, pyname, funcs, cls):
        """Wrappers for one Python name: a plain wrapper, or a dispatcher over
        the signatures of all overloads and default-argument forms."""
        sigs = []
        for f in funcs:
            sigs.extend(expand_defaults(f, cls))
        key = cls.qname if cls else ''
        self.docs.setdefault(key, []).extend(s.prototype() for s in sigs)
        code = self.chunks.setdefault(key, [])
        cname = 'qw_' + pyname
        if len(sigs) == 1:
            code.append(self.sig_body(sigs[0], pyname, cname))
            self.wrappers.append(Wrapper(pyname, cname, None, cls))
            return
        sub = []
        for k, s in enumerate(sigs):
            sname = '%s__%d' % (cname, k)
            code.append('static ' + self.sig_body(s, pyname, sname))
            sub.append((s, sname))
        code.append(self.dispatcher(pyname, cname, sub))
        self.wrappers.append(Wrapper(pyname, cname, None, cls))

    def dispatcher(self, pyname, cname, sub):
        em = self.em
        protos = [s.prototype() for s, _ in sub]
        maxargs = max(len(s.params) + (1 if s.self_arg else 0) for s, _ in sub)
        # Probe plans per signature.
        cands = []
        for order, (s, sname) in enumerate(sub):
            plans = []
            i = 0
            if s.self_arg:
                d = self.table.pointer_to(CType('record', s.cls.qname))
                plans.append(('qr::ProbePtr(%%s, %s)' % ty_ref(d), RANK_POINTER))
                i = 1
            for p in s.params:
                pl = em.plan_arg(pyname, i + 1, i, p.ctype)
                plans.append((pl.probe, pl.rank))
                i += 1
            cands.append((len(plans), [r for _, r in plans], order, plans, sname))
        # Fewer arguments first, then by parameter kind position by position;
        # ties keep the listed order.
        cands.sort(key=lambda c: (c[0], c[1], c[2]))
        lines = ['PyObject *%s(PyObject *self, PyObject *args) {' % cname,
                 '  static const char *const protos[] = {%s, 0};' % ', '.join(cstr(p) for p in protos),
                 '  if (!PyTuple_Check(args)) return qr::OverloadError(%s, protos);' % cstr(pyname),
                 '  Py_ssize_t argc = PyTuple_GET_SIZE(args);']
        counts = {}
        for c in cands:
            counts[c[0]] = counts.get(c[0], 0) + 1
        if any(counts[c[0]] > 1 for c in cands):
            lines.append('  PyObject *a[%d] = {0};' % max(maxargs, 1))
            lines.append('  for (Py_ssize_t i = 0; i < argc && i < %d; ++i) a[i] = PyTuple_GET_ITEM(args, i);'
                         % max(maxargs, 1))
        for n, _, _, plans, sname in cands:
            if counts[n] == 1:
                # The only form taking this many arguments: called directly,
                # so its own conversion reports what is wrong.
                lines.append('  if (argc == %d) return %s(self, args);' % (n, sname))
                continue
            conds = ['argc == %d' % n] + [pr % ('a[%d]' % j) for j, (pr, _) in enumerate(plans)]
            lines.append('  if (%s) return %s(self, args);' % (' && '.join(conds), sname))
        lines.append('  return qr::OverloadError(%s, protos);' % cstr(pyname))
        lines.append('}\n')
        return '\n'.join(lines)

    # -- classes ------------------------------------------------------------
    def ancestors(self, cls):
        """All bases of cls, transitively, nearest first, each once."""
        out = []
        todo = [q for q, _ in cls.bases]
        while todo:
            q = todo.pop(0)
            if q in out:
                continue
            out.append(q)
            b = self.model.by_qname.get(q)
            if b is not None:
                todo.extend(bq for bq, _ in b.bases)
        return out

    def add_class(self, cls):
        d = self.table.pointer_to(CType('record', cls.qname))
        code = self.chunks.setdefault(cls.qname, [])
        info = {'cls': cls, 'methods': [], 'statics': [], 'mixed': [], 'fields': [], 'new': None, 'delete': None}
        # Constructors (an implicit default constructor when none is declared).
        if not cls.abstract:
            ctors = list(cls.ctors)
            if not cls.has_declared_ctor:
                ctors = [Function('ctor', cls.name, cls.qname, None, [], [])]
            if ctors:
                self.add_group('new_' + cls.name, ctors, cls)
                info['new'] = 'new_' + cls.name
        # Methods grouped by Python name, in order of first declaration.
        groups = {}
        order = []
        for m in cls.methods:
            pyname = m.pyname or m.name
            if pyname not in groups:
                groups[pyname] = []
                order.append(pyname)
            groups[pyname].append(m)
        for ext in self.extends:
            if ext.ext_class == cls.qname:
                pyname = ext.pyname or ext.name
                if pyname not in groups:
                    groups[pyname] = []
                    order.append(pyname)
                groups[pyname].append(ext)
        for pyname in order:
            funcs = groups[pyname]
            self.add_group(cls.name + '_' + pyname, funcs, cls)
            if all(f.kind == 'static' for f in funcs):
                info['statics'].append(pyname)
            elif any(f.kind == 'static' for f in funcs):
                info['mixed'].append(pyname)
            else:
                info['methods'].append(pyname)
        # Fields.
        for fld in cls.fields:
            self.add_field(cls, fld)
            info['fields'].append((fld.name, not fld.readonly))
        if cls.public_dtor:
            self.chunks[cls.qname].append(
                'PyObject *qw_delete_%s(PyObject *, PyObject *args) {\n'
                '  PyObject *o0; %s *p;\n'
                '  if (!PyArg_ParseTuple(args, "O:delete_%s", &o0)) return 0;\n'
                '  if (!qr::ArgPtr(o0, (void **)&p, %s, "delete_%s", 1, %s, qr::POINTER_DISOWN | qr::POINTER_DESTROY)) return 0;\n'
                '  try { delete p; } catch (...) { return qr::RaiseForeign(); }\n'
                '  return qr::NoneResult();\n}\n'
                % (cls.name, cls.qname, cls.name, ty_ref(d), cls.name, cstr(cls.qname + ' *')))
            self.wrappers.append(Wrapper('delete_' + cls.name, 'qw_delete_' + cls.name, None, cls))
            info['delete'] = 'delete_' + cls.name
        code.append('PyObject *qw_%s_swigregister(PyObject *, PyObject *args) { return qr::SwigRegister(args, %s); }\n'
                    % (cls.name, ty_ref(d)))
        self.wrappers.append(Wrapper(cls.name + '_swigregister', 'qw_%s_swigregister' % cls.name, None, cls))
        # Casts: every class that derives from cls, directly or not.
        self.shadow.append(info)

    def add_casts(self):
        for cls in self.model.classes:
            d = self.table.pointer_to(CType('record', cls.qname))
            for aq in self.ancestors(cls):
                if aq not in self.model.by_qname:
                    continue
                bd = self.table.pointer_to(CType('record', aq))
                conv = 'qc_%s__to__%s' % (d.mangled, bd.mangled)
                bd.casts.append((d, conv, cls.qname, aq))

    def add_field(self, cls, fld):
        em = self.em
        t = fld.ctype
        code = self.chunks[cls.qname]
        d = self.table.pointer_to(CType('record', cls.qname))
        selfty = cstr(cls.qname + ' *')
        base = t.strip_ref()
        get_name = '%s_%s_get' % (cls.name, fld.name)
        set_name = '%s_%s_set' % (cls.name, fld.name)
        f = 'self->' + fld.name
        # Getter.
        if t.kind == 'array' and is_char(t.inner):
            gexpr = 'qr::FromCharArray(%s, %d)' % (f, t.size)
        elif t.kind == 'array':
            ed = self.table.pointer_to(t.inner)
            gexpr = 'qr::WrapPointerKeep((void *)%s, %s, o0)' % (f, ty_ref(ed))
        elif base.kind == 'record' or base.kind in ('vector', 'set'):
            if base.kind in ('vector', 'set'):
                em.container(base)
            bd = self.table.pointer_to(base)
            # A pointer into the parent record: the result keeps it alive.
            gexpr = 'qr::WrapPointerKeep((void *)&%s, %s, o0)' % (f, ty_ref(bd))
        else:
            gexpr = em.result_expr(t, f, False)
        code.append('PyObject *qw_%s(PyObject *, PyObject *args) {\n'
                    '  PyObject *o0; %s *self;\n'
                    '  if (!PyArg_ParseTuple(args, "O:%s", &o0)) return 0;\n'
                    '  if (!qr::ArgSelf(o0, (void **)&self, %s, "%s", %s)) return 0;\n'
                    '  return %s;\n}\n' % (get_name, cls.qname, get_name, ty_ref(d), get_name, selfty, gexpr))
        if not fld.readonly:
            spelled = cstr(t.spell())
            if t.kind == 'array' and is_char(t.inner):
                conv = ('  char v[%d]; if (!qr::ArgCharArray(o1, v, %d, F, 2, %s)) return 0;\n'
                        '  if (self) memcpy(%s, v, %d);\n' % (t.size, t.size, spelled, f, t.size))
            elif t.kind == 'array':
                ed = self.table.pointer_to(t.inner)
                ety = t.inner.unconst().cxx()
                conv = ('  %s *v; if (!qr::ArgPtr(o1, (void **)&v, %s, F, 2, %s)) return 0;\n'
                        '  if (!v) return qr::NullVarError(%s, %s);\n'
                        '  if (self) for (size_t i = 0; i < %d; ++i) %s[i] = v[i];\n'
                        % (ety, ty_ref(ed), cstr(t.inner.spell() + ' *'), cstr(fld.name), spelled, t.size, f))
            elif base.kind in ('record', 'vector', 'set') and t.kind != 'pointer':
                bd = self.table.pointer_to(base)
                conv = ('  %s *v; if (!qr::ArgPtr(o1, (void **)&v, %s, F, 2, %s)) return 0;\n'
                        '  if (!v) return qr::NullRefError(F, 2, %s);\n'
                        '  if (self) %s = *v;\n' % (base.unconst().cxx(), ty_ref(bd), cstr(base.spell() + ' *'),
                                                    cstr(base.spell() + ' *'), f))
            else:
                if base.kind == 'string':
                    # A string field is set from a std::string const &.
                    t = CType('ref', inner=CType('string', 'std::string', const=True))
                plan = em.plan_arg(set_name, 2, 1, t)
                conv = '  %s\n  if (self) %s = %s;\n' % (plan.decl.replace('o[1]', 'o1'), f, plan.expr)
            code.append('PyObject *qw_%s(PyObject *, PyObject *args) {\n'
                        '  static const char *const F = %s; (void)F;\n'
                        '  PyObject *o0, *o1; %s *self;\n'
                        '  if (!PyArg_ParseTuple(args, "OO:%s", &o0, &o1)) return 0;\n'
                        '  if (!qr::ArgPtr(o0, (void **)&self, %s, F, 1, %s)) return 0;\n'
                        '%s  return qr::NoneResult();\n}\n'
                        % (set_name, cstr(set_name), cls.qname, set_name, ty_ref(d), selfty, conv))
            self.wrappers.append(Wrapper(set_name, 'qw_' + set_name, None, cls))
        self.wrappers.append(Wrapper(get_name, 'qw_' + get_name, None, cls))

    # -- free functions -------------------------------------------------------
    def add_free_functions(self):
        groups = {}
        order = []
        for f in self.model.functions:
            pyname = f.pyname or f.name
            if pyname not in groups:
                groups[pyname] = []
                order.append(pyname)
            groups[pyname].append(f)
        for pyname in order:
            self.add_group(pyname, groups[pyname], None)

    # -- constants and variables ----------------------------------------------
    def value_code(self):
        """Statements of the init function installing constants and cvar, and
        the getter/setter functions of the variables."""
        em = self.em
        init = []
        funcs = []
        cvar_done = False
        for kind, v in self.model.values:
            if kind == 'const':
                init.append('  qr::InstallConstant(d, %s, %s);' % (cstr(v.pyname), self.const_expr(v)))
                continue
            if not cvar_done:
                init.append('  PyDict_SetItemString(d, "cvar", qr::GlobalVarLink());')
                cvar_done = True
            g, s = self.var_functions(v)
            funcs.append(g)
            funcs.append(s)
            if v.owner is not None and self.has_static_accessors(v):
                funcs.append(self.static_accessors(v))
            init.append('  qr::AddGlobalVariable(qr::GlobalVarLink(), %s, qv_get_%s, qv_set_%s);'
                        % (cstr(v.pyname), v.pyname, v.pyname))
        if not cvar_done:
            init.append('  PyDict_SetItemString(d, "cvar", qr::GlobalVarLink());')
        return funcs, init

    @staticmethod
    def has_static_accessors(v):
        """Writable static members of array and record type also get
        functions in the method table; constant ones do not."""
        t = v.ctype
        if t.const:
            return False
        if t.kind == 'array':
            return not t.inner.const
        return t.kind == 'record'

    def static_accessors(self, v):
        """<Class>_<member>_get / _set in the method table, for static members
        of array and record type: the same getter and setter as cvar's."""
        n = v.pyname
        self.wrappers.append(Wrapper(n + '_get', 'qw_%s_get' % n, None, v.owner))
        self.wrappers.append(Wrapper(n + '_set', 'qw_%s_set' % n, None, v.owner))
        return ('PyObject *qw_%s_get(PyObject *, PyObject *) { return qv_get_%s(); }\n'
                'PyObject *qw_%s_set(PyObject *, PyObject *args) {\n'
                '  PyObject *value;\n'
                '  if (!PyArg_ParseTuple(args, "O:set", &value)) return 0;\n'
                '  if (qv_set_%s(value)) return 0;\n'
                '  return qr::NoneResult();\n}\n' % (n, n, n, n))

    def const_expr(self, c):
        t = c.ctype
        if c.value_expr is None and isinstance(c.value, str):
            return 'PyString_FromString(%s)' % cstr(c.value)
        if t is None:
            v = c.value
            if isinstance(v, str):
                return 'PyString_FromString(%s)' % cstr(v)
            if -2**31 <= v < 2**31:
                return 'PyInt_FromLong(%dL)' % v
            if v < 0:
                return 'qr::FromInt64(%dLL)' % v if v > -2**63 else 'qr::FromInt64(INT64_MIN)'
            return 'qr::FromUint64(%dULL)' % v
        e = self.em.result_expr(t.unconst(), c.value_expr, False)
        return e

    def var_functions(self, v):
        t = v.ctype
        name = v.pyname
        base = t.unconst()
        getter = 'static PyObject *qv_get_%s() { return %%s; }\n' % name
        if base.kind == 'array':
            ed = self.table.pointer_to(base.inner)
            g = getter % ('qr::WrapPointer((void *)%s, %s, 0)' % (v.qname, ty_ref(ed)))
            arr = base.inner.spell() + ' []'
            s = ('static int qv_set_%s(PyObject *) { return qr::ReadOnlyArrayVariable(%s, %s); }\n'
                 % (name, cstr(v.qname), cstr(arr)))
            return g, s
        if base.kind == 'record':
            d = self.table.pointer_to(base)
            g = getter % ('qr::WrapPointer((void *)&%s, %s, 0)' % (v.qname, ty_ref(d)))
            if v.readonly:
                s = 'static int qv_set_%s(PyObject *) { return qr::ReadOnlyVariable(%s); }\n' % (name, cstr(name))
            else:
                s = ('static int qv_set_%s(PyObject *value) { void *p; if (!qr::VarRecord(value, &p, %s, %s, %s)) return 1;\n'
                     '  %s = *(%s *)p; return 0; }\n' % (name, ty_ref(d), cstr(v.qname), cstr(base.spell()),
                                                          v.qname, base.cxx()))
            return g, s
        if t.kind == 'pointer' and is_char(t.inner):
            g = getter % ('qr::FromCString(%s)' % v.qname)
            if v.readonly:
                s = 'static int qv_set_%s(PyObject *) { return qr::ReadOnlyVariable(%s); }\n' % (name, cstr(name))
            else:
                s = ('static int qv_set_%s(PyObject *value) { char *p; if (!qr::VarCString(value, &p, %s, %s)) return 1;\n'
                     '  %s = p; return 0; }\n' % (name, cstr(v.qname), cstr(t.spell()), v.qname))
            return g, s
        g = getter % self.em.result_expr(base, v.qname, False)
        s = 'static int qv_set_%s(PyObject *) { return qr::ReadOnlyVariable(%s); }\n' % (name, cstr(name))
        return g, s

    # -- the type table ---------------------------------------------------------
    def type_table_code(self, descs):
        out = []
        for d in descs:
            for src, conv, dq, bq in d.casts:
                if conv:
                    out.append('static void *%s(void *p, int *) { return (void *)static_cast< %s * >((%s *)p); }'
                               % (conv, bq, dq))
        out.append('')
        out.append('static swig_type_info qt_types[%d] = {' % max(len(descs), 1))
        for d in descs:
            human = '|'.join(d.humans) if d.humans else None
            out.append('  {%s, %s, 0, 0, 0, 0},' % (cstr(d.mangled), cstr(human) if human else '0'))
        if not descs:
            out.append('  {0, 0, 0, 0, 0, 0},')
        out.append('};')
        for d in descs:
            entries = ['{&qt_types[%d], 0, 0, 0}' % d.index]
            for src, conv, _, _ in d.casts:
                entries.append('{&qt_types[%d], %s, 0, 0}' % (src.index, conv or '0'))
            entries.append('{0, 0, 0, 0}')
            out.append('static swig_cast_entry qt_cast_%d[] = {%s};' % (d.index, ', '.join(entries)))
        out.append('static swig_type_info *qt_initial[%d] = {%s};'
                   % (len(descs) + 1, ', '.join(['&qt_types[%d]' % d.index for d in descs] + ['0'])))
        out.append('static swig_cast_entry *qt_cast_initial[%d] = {%s};'
                   % (len(descs) + 1, ', '.join(['qt_cast_%d' % d.index for d in descs] + ['0'])))
        out.append('swig_type_info *qt_in_use[%d];' % (len(descs) + 1))
        out.append('static swig_module_record qt_module = {qt_in_use, %d, 0, qt_initial, qt_cast_initial, 0};'
                   % len(descs))
        return '\n'.join(out)

    # -- container classes ------------------------------------------------------
    def add_container(self, cont):
        """A vector or set class: one-line wrappers over the container
        templates, which do the whole call protocol."""
        t = cont.ctype
        em = self.em
        em.container(t)
        cd = self.table.pointer_to(t)
        ed = em.elem_desc(t)
        e = t.args[0]
        is_set = t.kind == 'set'
        slots = SET_SLOTS if is_set else VECTOR_SLOTS
        ops = 'qr::SetOps< %s >' % t.cxx() if is_set else 'qr::VectorOps< %s >' % t.cxx()
        short = '%s< %s >' % ('std::set' if is_set else 'std::vector', e.spell())
        alloc = CType('record', 'std::allocator< %s >' % e.spell())
        ad = em.owned_desc(alloc)
        itd = self.table.get('_p_swig__PySwigIterator', 'swig::PySwigIterator *')
        if e.kind == 'pointer':
            # The element's value_type shares the pointee's descriptor family.
            vt = self.table.get('_%s__value_type' % t.mangle(), e.spell())
            vt.add_human('%s::value_type' % short)
            pd = self.table.pointer_to(e.inner)
            vt.casts.append((pd, None, None, None))
            pd.casts.append((vt, None, None, None))
        code = self.chunks.setdefault(cont.qname, [])
        names = ['%s_%s' % (cont.name, py) for py, _ in slots] + ['new_' + cont.name]
        code.append('static const char *const qn_%s[] = {%s};' % (cont.name, ', '.join(cstr(n) for n in names)))
        extra = ''
        if is_set:
            cmp_d = self.table.pointer_to(CType('record', 'std::less< %s >' % e.spell()))
            extra = ', &%s' % ty_ref(cmp_d)
        code.append('static const qr::ContainerInfo qi_%s = {qn_%s, %s, &%s, &%s, &%s, &%s%s};'
                    % (cont.name, cont.name, cstr(short), ty_ref(cd), ty_ref(ed), ty_ref(itd), ty_ref(ad), extra))
        info = {'cls': cont, 'methods': [], 'statics': [], 'mixed': [], 'fields': [], 'new': 'new_' + cont.name,
                'delete': 'delete_' + cont.name, 'container': True}
        for (py, fn), name in zip(slots + [('new', 'new_')], names):
            code.append('PyObject *qw_%s(PyObject *, PyObject *args) { return %s::%s(args, qi_%s); }'
                        % (name, ops, fn, cont.name))
            self.wrappers.append(Wrapper(name, 'qw_' + name, None, cont))
            if py != 'new':
                info['methods'].append(py)
        code.append('PyObject *qw_delete_%s(PyObject *, PyObject *args) {\n'
                    '  PyObject *o0; %s *p;\n'
                    '  if (!PyArg_ParseTuple(args, "O:delete_%s", &o0)) return 0;\n'
                    '  if (!qr::ArgPtr(o0, (void **)&p, %s, "delete_%s", 1, %s, qr::POINTER_DISOWN | qr::POINTER_DESTROY)) return 0;\n'
                    '  delete p;\n  return qr::NoneResult();\n}\n'
                    % (cont.name, t.spell(), cont.name, ty_ref(cd), cont.name, cstr(short + ' *')))
        self.wrappers.append(Wrapper('delete_' + cont.name, 'qw_delete_' + cont.name, None, cont))
        code.append('PyObject *qw_%s_swigregister(PyObject *, PyObject *args) { return qr::SwigRegister(args, %s); }\n'
                    % (cont.name, ty_ref(cd)))
        self.wrappers.append(Wrapper(cont.name + '_swigregister', 'qw_%s_swigregister' % cont.name, None, cont))
        self.shadow.append(info)

    # -- output -------------------------------------------------------------------
    def generate(self):
        for cont in self.model.containers:
            self.add_container(cont)
        for cls in self.model.classes:
            self.add_class(cls)
        self.add_free_functions()
        self.add_casts()
        self.var_funcs, self.init_values = self.value_code()
        self.descs = self.table.finish()

    def resolve(self, text):
        import re
        idx = {d.mangled: d.index for d in self.descs}
        return re.sub(r'@T\{([^}]*)\}@', lambda m: 'QT(%d)' % idx[m.group(1)], text)

    def write(self, out_dir, nchunks, includes, support_headers):
        import os
        os.makedirs(out_dir, exist_ok=True)
        common = ['// Generated by codegen/qorgen.py. Do not edit.',
                  '#include "qorrt.h"', '#include "varsetters.h"', '#include "seq.h"', '#include "container_ops.h"',
                  '#include <cstring>']
        common += ['#include "%s"' % h for h in includes]
        common += ['#include "%s"' % h for h in support_headers]
        common += ['extern swig_type_info *qt_in_use[];', '#define QT(i) qt_in_use[i]', '']
        head = '\n'.join(common) + '\n'
        # Spread the classes over the chunk files by size.
        keys = list(self.chunks.keys())
        sizes = [0] * nchunks
        files = [[] for _ in range(nchunks)]
        for k in keys:
            text = '\n'.join(self.chunks[k])
            j = sizes.index(min(sizes))
            files[j].append(text)
            sizes[j] += len(text)
        written = []
        for j in range(nchunks):
            path = os.path.join(out_dir, 'wrap_%02d.cpp' % j)
            body = head + '\n'.join(files[j])
            write_if_changed(path, self.resolve(body))
            written.append(path)
        # The module file: method table, type table, variables, init.
        m = [head]
        for w in self.wrappers:
            m.append('PyObject *%s(PyObject *, PyObject *);' % w.cname)
        m.append('')
        m.append('static PyMethodDef qt_methods[] = {')
        for w in self.wrappers:
            m.append('  {%s, %s, METH_VARARGS, 0},' % (cstr(w.pyname), w.cname))
        m.append('  {0, 0, 0, 0}\n};\n')
        m.append(self.type_table_code(self.descs))
        m.append('static swig_const_entry qt_consts[] = {{0, 0, 0, 0, 0, 0}};\n')
        m.extend(self.var_funcs)
        for mangled, cxx in sorted(self.em.owned.items()):
            m.append('static void qd_%s(void *p) { delete static_cast< %s * >(p); }' % (mangled, cxx))
        m.append('extern "C" __attribute__((visibility("default"))) void init%s() {' % self.module)
        m.append('  PyObject *d = qr::InitModule(%s, qt_methods, &qt_module, qt_consts);' % cstr(self.module))
        m.append('  if (!d) return;')
        for mangled in sorted(self.em.owned):
            m.append('  qr::RegisterDeleter(@T{%s}@, qd_%s);' % (mangled, mangled))
        m.extend(self.init_values)
        m.append('}\n')
        write_if_changed(os.path.join(out_dir, 'module.cpp'), self.resolve('\n'.join(m)))

    def surface(self, totals={}):
        lines = []
        fam = {'new_': 0, 'delete_': 0, '_swigregister': 0}
        for w in self.wrappers:
            cls = w.cls.qname if w.cls else '(module)'
            lines.append('function %s %s' % (w.pyname, cls))
            if w.pyname.startswith('new_'):
                fam['new_'] += 1
            elif w.pyname.startswith('delete_'):
                fam['delete_'] += 1
            elif w.pyname.endswith('_swigregister'):
                fam['_swigregister'] += 1
        nconst = sum(1 for k, _ in self.model.values if k == 'const')
        nvar = sum(1 for k, _ in self.model.values if k == 'var')
        for k, v in self.model.values:
            lines.append('%s %s' % ('constant' if k == 'const' else 'variable', v.pyname))
        ncast = sum(1 + len(d.casts) for d in self.descs)
        nconv = sum(1 for d in self.descs for c in d.casts if c[1])
        for d in self.descs:
            lines.append('descriptor %s %s' % (d.mangled, '|'.join(d.humans)))
        counts = [('functions', len(self.wrappers)),
                  ('classes', len(self.model.classes) + len(self.model.containers)),
                  ('new_', fam['new_']), ('delete_', fam['delete_']),
                  ('_swigregister', fam['_swigregister']), ('descriptors', len(self.descs)),
                  ('cast entries', ncast), ('casts with converter', nconv),
                  ('constants', nconst), ('variables', nvar)]
        # Each count against the complete surface's, where the totals are known.
        summary = ['%s %d%s' % (k, v, ' of %d' % totals[k] if k in totals else '') for k, v in counts]
        return '\n'.join(['# ' + s for s in summary] + lines) + '\n'


def write_if_changed(path, text):
    try:
        with open(path) as f:
            if f.read() == text:
                return
    except OSError:
        pass
    with open(path + '.tmp', 'w') as f:
        f.write(text)
    import os
    os.replace(path + '.tmp', path)
