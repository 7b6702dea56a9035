"""Reads the library's declarations with libclang into a small model.

Everything the bindings expose is taken from the headers named by the
binding manifests: public constructors, methods, fields, enumerations, static
members, free functions and namespace variables, in declaration order.
"""

import os
import clang.cindex as ci

from ctype import build, qualified_name

CK = ci.CursorKind

LIBCLANG = os.environ.get('QORCTL_LIBCLANG', '/usr/lib/x86_64-linux-gnu/libclang-14.so.1')
if not ci.Config.loaded:
    ci.Config.set_library_file(LIBCLANG)


class Param:
    def __init__(self, name, ctype, default):
        self.name = name
        self.ctype = ctype
        self.default = default      # C++ expression text or None


class Function:
    """A method, constructor, static member or free function."""

    def __init__(self, kind, name, qname, result, params, annotations, const=False,
                 static=False, virtual=False, pure=False):
        self.kind = kind            # 'method' | 'ctor' | 'static' | 'free'
        self.name = name
        self.qname = qname
        self.result = result
        self.params = params
        self.annotations = annotations
        self.const = const
        self.static = static
        self.virtual = virtual
        self.pure = pure

    @property
    def throws(self):
        return [a.split(':', 1)[1] for a in self.annotations if a.startswith('throws:')]

    @property
    def owned(self):
        return 'owned' in self.annotations

    @property
    def pyname(self):
        for a in self.annotations:
            if a.startswith('pyname:'):
                return a.split(':', 1)[1]
        return None


class Field:
    def __init__(self, name, ctype, readonly):
        self.name = name
        self.ctype = ctype
        self.readonly = readonly


class Constant:
    def __init__(self, pyname, ctype, value_expr, value=None):
        self.pyname = pyname
        self.ctype = ctype
        self.value_expr = value_expr   # C++ expression
        self.value = value             # evaluated integer, when known


class Variable:
    def __init__(self, pyname, qname, ctype, readonly, owner=None):
        self.pyname = pyname
        self.qname = qname
        self.ctype = ctype
        self.readonly = readonly
        self.owner = owner          # the class of a static member, or None


class Class:
    def __init__(self, qname, name, cursor):
        self.qname = qname
        self.name = name            # Python name
        self.cursor = cursor
        self.bases = []             # [(qname, virtual)]
        self.ctors = []
        self.methods = []
        self.fields = []
        self.abstract = False
        self.has_declared_ctor = False
        self.public_dtor = True
        self.annotations = []


class Container:
    """A container class: a typedef of std::vector / std::set names it."""

    def __init__(self, name, ctype):
        self.name = name
        self.ctype = ctype
        self.qname = ctype.spell()


class Model:
    def __init__(self):
        self.containers = []        # Container, in declaration order
        self.classes = []           # in declaration order
        self.by_qname = {}
        self.functions = []         # free functions
        # Constants and variables, interleaved in declaration order:
        # ('const', Constant) | ('var', Variable)
        self.values = []
        self.headers = []


def is_deleted(cursor):
    """A function declared `= delete`."""
    toks = [t.spelling for t in cursor.get_tokens()]
    return len(toks) >= 2 and toks[-2:] == ['=', 'delete'] or toks[-3:] == ['=', 'delete', ';']


def annotations_of(cursor):
    return [c.spelling for c in cursor.get_children() if c.kind == CK.ANNOTATE_ATTR]


def default_text(parm):
    """The default argument's text, or None when the parameter has none.
    The default is the parameter's expression child."""
    exprs = [ch for ch in parm.get_children() if ch.kind.is_expression()]
    if parm.type.kind == ci.TypeKind.CONSTANTARRAY:
        exprs = exprs[1:]      # the first is the array bound
    if exprs:
        return ' '.join(t.spelling for t in exprs[-1].get_tokens()) or '?'
    return None


def make_function(kind, c, name, qname):
    params = []
    for p in c.get_arguments():
        t = build(p.type)
        for a in annotations_of(p):
            if a.startswith('name:'):
                # The library names this parameter's type otherwise: a
                # descriptor of its own, without casts to the class.
                t = t.aliased(a.split(':', 1)[1])
        params.append(Param(p.spelling, t, default_text(p)))
    result = build(c.result_type) if kind != 'ctor' else None
    for a in annotations_of(c):
        if a.startswith('result-name:') and result is not None:
            result = result.aliased(a.split(':', 1)[1])
    return Function(kind, name, qname, result, params, annotations_of(c),
                    const=c.is_const_method() if c.kind == CK.CXX_METHOD else False,
                    static=c.is_static_method() if c.kind == CK.CXX_METHOD else False,
                    virtual=c.is_virtual_method() if c.kind == CK.CXX_METHOD else False,
                    pure=c.is_pure_virtual_method() if c.kind == CK.CXX_METHOD else False)


def enum_constants(cursor, prefix, model):
    ectype = build(cursor.type)
    for e in cursor.get_children():
        if e.kind == CK.ENUM_CONSTANT_DECL:
            scope = qualified_name(cursor.semantic_parent)
            expr = (scope + '::' if scope else '') + e.spelling
            model.values.append(('const', Constant(prefix + e.spelling, ectype, expr, e.enum_value)))


def integer_literal_value(cursor):
    try:
        v = cursor.get_definition() or cursor
        for ch in v.walk_preorder():
            if ch.kind == CK.INTEGER_LITERAL:
                return int(list(ch.get_tokens())[0].spelling.rstrip('uUlL'), 0)
    except Exception:
        pass
    return None


def macro_value(c):
    """The value of an object-like macro that is a string or an integer
    expression; None for anything else (guards, annotations, functions)."""
    toks = [t.spelling for t in c.get_tokens()][1:]
    if not toks:
        return None
    if len(toks) >= 2 and toks[0] == '(' and toks[1] != ')' and c.extent.start.column + len(c.spelling) == \
            list(c.get_tokens())[1].extent.start.column:
        return None   # function-like: "(" straight after the name
    if all(t.startswith('"') for t in toks):
        import ast
        return ''.join(ast.literal_eval(t) for t in toks)
    expr = []
    for t in toks:
        if t[0].isdigit():
            t = t.rstrip('uUlL')
            if t.startswith('0') and len(t) > 1 and t[1] not in 'xXbB':
                t = '0o' + t[1:]
        elif t not in ('(', ')', '-', '+', '~', '*', '<<', '>>', '|', '&'):
            return None
        expr.append(t)
    try:
        v = eval(' '.join(expr), {'__builtins__': {}})
    except Exception:
        return None
    return v if isinstance(v, int) else None


def is_const_value(ctype):
    t = ctype
    return t.const and t.kind in ('scalar', 'enum')


class Parser:
    def __init__(self, include_dir, headers, extra_args=()):
        self.include_dir = os.path.abspath(include_dir)
        self.extra_args = list(extra_args)
        dirs = [self.include_dir] + [a[2:] for a in self.extra_args if a.startswith('-I')]
        self.headers = [self.find(h, dirs) for h in headers]
        self.model = Model()
        self.model.headers = list(headers)
        self.seen = set()

    @staticmethod
    def find(header, dirs):
        """A manifest's header, relative to the first include directory that
        has it."""
        for d in dirs:
            p = os.path.join(d, header)
            if os.path.exists(p):
                return p
        raise SystemExit('header not found: %s' % header)

    def parse(self):
        src = ''.join('#include "%s"\n' % h for h in self.headers)
        index = ci.Index.create()
        tu = index.parse('qorctl_all.cpp', args=['-x', 'c++', '-std=c++17', '-DQORCTL_CODEGEN',
                                                 '-I' + self.include_dir] + self.extra_args,
                         unsaved_files=[('qorctl_all.cpp', src)],
                         options=ci.TranslationUnit.PARSE_SKIP_FUNCTION_BODIES
                         | ci.TranslationUnit.PARSE_DETAILED_PROCESSING_RECORD)
        errors = [d for d in tu.diagnostics if d.severity >= ci.Diagnostic.Error]
        if errors:
            raise SystemExit('\n'.join(str(d) for d in errors))
        wanted = set(os.path.realpath(h) for h in self.headers)
        # Walk the top-level declarations of the wanted headers, in the
        # manifest's header order, then by position within each header.
        by_file = {}
        for c in tu.cursor.get_children():
            self._collect(c, wanted, by_file)
        for h in self.headers:
            # Macros are listed apart from declarations: restore source order.
            decls = sorted(by_file.get(os.path.realpath(h), []), key=lambda c: c.extent.start.offset)
            for c in decls:
                self._decl(c, '')
        return self.model

    def _collect(self, c, wanted, by_file):
        f = c.location.file
        if f is None:
            return
        path = os.path.realpath(f.name)
        if c.kind == CK.NAMESPACE:
            for ch in c.get_children():
                self._collect(ch, wanted, by_file)
            return
        if path in wanted:
            by_file.setdefault(path, []).append(c)

    def _decl(self, c, prefix):
        m = self.model
        if c.kind in (CK.CLASS_DECL, CK.STRUCT_DECL):
            if c.is_definition():
                self._class(c)
        elif c.kind == CK.ENUM_DECL:
            if 'hidden' not in annotations_of(c):
                enum_constants(c, '', m)
        elif c.kind == CK.FUNCTION_DECL:
            ann = annotations_of(c)
            if 'hidden' not in ann:
                m.functions.append(make_function('free', c, c.spelling, qualified_name(c)))
        elif c.kind == CK.VAR_DECL:
            self._var(c, '', qualified_name(c))
        elif c.kind == CK.TYPEDEF_DECL:
            t = build(c.underlying_typedef_type)
            if t.kind in ('vector', 'set') and 'hidden' not in annotations_of(c):
                m.containers.append(Container(c.spelling, t.unconst()))
        elif c.kind == CK.MACRO_DEFINITION:
            value = macro_value(c)
            if value is not None:
                m.values.append(('const', Constant(c.spelling, None, None, value)))

    def _var(self, c, prefix, qname, owner=None):
        """A constant when it is a const number with its value in the
        declaration; otherwise a library variable read through cvar."""
        if 'hidden' in annotations_of(c):
            return
        ctype = build(c.type)
        name = prefix + c.spelling
        has_value = any(ch.kind.is_expression() for ch in c.get_children())
        if is_const_value(ctype) and has_value:
            self.model.values.append(('const', Constant(name, ctype, qname, integer_literal_value(c))))
        else:
            readonly = ctype.const or ctype.kind == 'array'
            self.model.values.append(('var', Variable(name, qname, ctype, readonly, owner)))

    def _class(self, c):
        qname = qualified_name(c)
        if qname in self.seen:
            return
        self.seen.add(qname)
        ann = annotations_of(c)
        if 'hidden' in ann:
            return
        cls = Class(qname, c.spelling, c)
        cls.annotations = ann
        cls.abstract = c.is_abstract_record()
        m = self.model
        m.classes.append(cls)
        m.by_qname[qname] = cls
        prefix = cls.name + '_'
        for ch in c.get_children():
            k = ch.kind
            if k == CK.CXX_BASE_SPECIFIER:
                if ch.access_specifier == ci.AccessSpecifier.PUBLIC:
                    virtual = any(t.spelling == 'virtual' for t in ch.get_tokens())
                    cls.bases.append((qualified_name(ch.type.get_declaration()), virtual))
                continue
            if k == CK.CONSTRUCTOR:
                cls.has_declared_ctor = True
            if k == CK.DESTRUCTOR and ch.access_specifier != ci.AccessSpecifier.PUBLIC:
                cls.public_dtor = False
            if ch.access_specifier != ci.AccessSpecifier.PUBLIC:
                continue
            ann = annotations_of(ch)
            if 'hidden' in ann:
                continue
            if k == CK.CONSTRUCTOR:
                if not ch.is_move_constructor() and not is_deleted(ch):
                    cls.ctors.append(make_function('ctor', ch, cls.name, qname))
            elif k == CK.CXX_METHOD:
                if ch.spelling.startswith('operator'):
                    op = OPERATORS.get(ch.spelling)
                    if op is None:
                        continue
                    f = make_function('method', ch, op, qname + '::' + ch.spelling)
                    f.cpp_name = ch.spelling
                else:
                    f = make_function('static' if ch.is_static_method() else 'method', ch,
                                      ch.spelling, qname + '::' + ch.spelling)
                cls.methods.append(f)
            elif k == CK.FIELD_DECL:
                t = build(ch.type)
                cls.fields.append(Field(ch.spelling, t, t.const))
            elif k == CK.ENUM_DECL:
                enum_constants(ch, prefix, m)
            elif k == CK.VAR_DECL:
                self._var(ch, prefix, qname + '::' + ch.spelling, owner=cls)
            elif k in (CK.CLASS_DECL, CK.STRUCT_DECL):
                if ch.is_definition():
                    self._class(ch)


# Operators bound under Python's special-method names.
OPERATORS = {
    'operator==': '__eq__',
    'operator!=': '__ne__',
    'operator<': '__lt__',
    'operator>': '__gt__',
    'operator<=': '__le__',
    'operator>=': '__ge__',
}
