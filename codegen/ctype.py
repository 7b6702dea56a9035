"""C++ types as the bindings see them: spelling, mangling and conversion kind.

A `CType` is a small tree built from a libclang type. Names are spelled the
way the module's messages and human names spell them: qualified names,
library typedef names kept (uint32, Bool, std::string), `const` after the
type ("char const *"), and containers with their allocator arguments.
"""

import clang.cindex as ci

TK = ci.TypeKind

# Scalar conversions by canonical kind: (converter suffix, C type, rank).
# The rank orders overload candidates (pointers first, then numbers, then
# characters and strings, containers last).
SCALARS = {
    TK.BOOL: ('Bool', 'bool', 15),
    TK.UCHAR: ('Uint8', 'uint8_t', 20),
    TK.USHORT: ('Uint16', 'uint16_t', 30),
    TK.UINT: ('Uint32', 'uint32_t', 40),
    TK.INT: ('Int32', 'int32_t', 45),
    TK.SHORT: ('Int32', 'int32_t', 46),
    TK.SCHAR: ('Int32', 'int32_t', 47),
    TK.ULONG: ('Uint64', 'uint64_t', 50),
    TK.ULONGLONG: ('Uint64', 'uint64_t', 50),
    TK.LONG: ('Int64', 'int64_t', 55),
    TK.LONGLONG: ('Int64', 'int64_t', 55),
    TK.CHAR_S: ('Char', 'char', 130),
    TK.CHAR_U: ('Char', 'char', 130),
}

BUILTIN_NAMES = {
    TK.VOID: 'void', TK.BOOL: 'bool', TK.CHAR_S: 'char', TK.CHAR_U: 'char',
    TK.SCHAR: 'signed char', TK.UCHAR: 'unsigned char', TK.SHORT: 'short',
    TK.USHORT: 'unsigned short', TK.INT: 'int', TK.UINT: 'unsigned int',
    TK.LONG: 'long', TK.ULONG: 'unsigned long', TK.LONGLONG: 'long long',
    TK.ULONGLONG: 'unsigned long long', TK.FLOAT: 'float', TK.DOUBLE: 'double',
}

RANK_POINTER = 0
RANK_STRING = 140
RANK_CONTAINER = 1000


def qualified_name(cursor):
    parts = []
    c = cursor
    while c is not None and c.kind != ci.CursorKind.TRANSLATION_UNIT:
        if c.kind in (ci.CursorKind.NAMESPACE, ci.CursorKind.CLASS_DECL, ci.CursorKind.STRUCT_DECL,
                      ci.CursorKind.CLASS_TEMPLATE, ci.CursorKind.ENUM_DECL, ci.CursorKind.TYPEDEF_DECL,
                      ci.CursorKind.TYPE_ALIAS_DECL, ci.CursorKind.UNION_DECL,
                      ci.CursorKind.FUNCTION_DECL, ci.CursorKind.VAR_DECL, ci.CursorKind.CXX_METHOD,
                      ci.CursorKind.FIELD_DECL):
            # Inline namespaces of the standard library are not spelled.
            if c.spelling and not (c.kind == ci.CursorKind.NAMESPACE and c.spelling.startswith('__')):
                parts.append(c.spelling)
        c = c.semantic_parent
    parts.reverse()
    return '::'.join(parts)


class CType:
    """kind: 'void' | 'scalar' | 'enum' | 'string' | 'cstring' | 'record' |
    'pointer' | 'ref' | 'vector' | 'set' | 'array' | 'other'."""

    def __init__(self, kind, name='', inner=None, const=False, size=None, canon=None, args=()):
        self.kind = kind
        self.name = name          # spelled name of a named type
        self.inner = inner        # pointee / referee / element
        self.const = const
        self.size = size          # array length
        self.canon = canon        # canonical clang kind of a scalar
        self.args = list(args)    # template arguments
        self.alias = None         # the name messages and descriptors use, when
                                  # the library names the type otherwise

    # -- spelling --------------------------------------------------------
    def cxx(self):
        """The type as C++ code names it (aliases resolved)."""
        return self.spell(real=True)

    def spell(self, real=False):
        if not real and self.alias:
            s = self.alias
            if self.const:
                s += ' const'
            return s
        inner_spell = (lambda t: t.spell(real)) if real else (lambda t: t.spell())
        if self.kind == 'pointer':
            s = inner_spell(self.inner) + ' *'
        elif self.kind == 'ref':
            s = inner_spell(self.inner) + ' &'
        elif self.kind == 'array':
            s = '%s [%s]' % (inner_spell(self.inner), self.size if self.size is not None else '')
        elif self.kind == 'vector':
            e = inner_spell(self.args[0])
            s = 'std::vector< %s,std::allocator< %s > >' % (e, e)
        elif self.kind == 'set':
            e = inner_spell(self.args[0])
            s = 'std::set< %s,std::less< %s >,std::allocator< %s > >' % (e, e, e)
        else:
            s = self.name
        if self.const:
            s += ' const'
        return s

    def mangle(self):
        """The mangled body (without the leading "_p_") of this type."""
        if self.kind == 'pointer':
            return self.inner.mangle() + '_p'
        if self.kind == 'ref':
            return self.inner.mangle() + '_r'
        if self.kind == 'array':
            return 'a_%s__%s' % (self.size, self.inner.mangle())
        pre = 'q_const__' if self.const else ''
        if self.alias:
            return pre + mangle_name(self.alias)
        if self.kind in ('vector', 'set'):
            e = self.args[0].mangle()
            if self.kind == 'vector':
                body = 'std__vectorT_%s_std__allocatorT_%s_t_t' % (e, e)
            else:
                body = 'std__setT_%s_std__lessT_%s_t_std__allocatorT_%s_t_t' % (e, e, e)
            return pre + body
        return pre + mangle_name(self.name)

    def unconst(self):
        c = CType(self.kind, self.name, self.inner, False, self.size, self.canon, self.args)
        c.alias = self.alias
        return c

    def aliased(self, name):
        """This type with its named base type called `name` in messages and
        descriptors (a pointer, reference or const around it kept)."""
        if self.kind in ('pointer', 'ref'):
            c = CType(self.kind, self.name, self.inner.aliased(name), self.const, self.size, self.canon, self.args)
            return c
        c = self.unconst()
        c.const = self.const
        c.alias = name
        return c

    # -- classification --------------------------------------------------
    def strip_ref(self):
        return self.inner if self.kind == 'ref' else self

    def is_scalar(self):
        return self.kind in ('scalar', 'enum')

    def __repr__(self):
        return 'CType(%s)' % self.spell()


def mangle_name(name):
    import re
    # Blanks around template punctuation do not count.
    name = re.sub(r'\s*([<>,*&])\s*', r'\1', name.strip())
    out = name.replace('::', '__').replace('<', 'T_').replace('>', '_t')
    out = out.replace(',', '_').replace(' ', '_').replace('*', '_p').replace('&', '_r')
    return out


def canonical_scalar_name(kind):
    return BUILTIN_NAMES.get(kind, 'int')


def build(t):
    """CType for a libclang Type."""
    const = t.is_const_qualified()
    k = t.kind
    if k == TK.ELABORATED:
        inner = build(t.get_named_type())
        inner.const = inner.const or const
        return inner
    if k == TK.POINTER:
        pt = t.get_pointee()
        return CType('pointer', inner=build(pt), const=const)
    if k == TK.LVALUEREFERENCE:
        return CType('ref', inner=build(t.get_pointee()), const=const)
    if k == TK.CONSTANTARRAY:
        return CType('array', inner=build(t.get_array_element_type()), size=t.get_array_size(), const=const)
    if k == TK.INCOMPLETEARRAY:
        return CType('array', inner=build(t.get_array_element_type()), size=None, const=const)
    if k == TK.TYPEDEF:
        decl = t.get_declaration()
        name = qualified_name(decl)
        canon = t.get_canonical()
        if name == 'std::string':
            return CType('string', 'std::string', const=const)
        if canon.kind in SCALARS or canon.kind in BUILTIN_NAMES:
            return CType('scalar', name, const=const, canon=canon.kind)
        if canon.kind == TK.ENUM:
            return CType('enum', name, const=const)
        c = build(canon)
        if c.kind == 'record':
            # A typedef of a record keeps its own spelling.
            c = CType('record', name, const=const)
        c.const = c.const or const
        return c
    if k == TK.ENUM:
        return CType('enum', qualified_name(t.get_declaration()), const=const)
    if k == TK.RECORD or k == TK.UNEXPOSED:
        decl = t.get_declaration()
        if k == TK.UNEXPOSED and decl.kind == ci.CursorKind.NO_DECL_FOUND:
            c = build(t.get_canonical())
            c.const = c.const or const
            return c
        name = qualified_name(decl)
        nargs = t.get_num_template_arguments()
        if nargs > 0:
            args = [build(t.get_template_argument_type(i)) for i in range(nargs)]
            if name == 'std::vector':
                return CType('vector', name, args=args[:1], const=const)
            if name == 'std::set':
                return CType('set', name, args=args[:1], const=const)
            if name == 'std::basic_string':
                return CType('string', 'std::string', const=const)
            return CType('record', '%s< %s >' % (name, ','.join(a.spell() for a in args)), const=const)
        return CType('record', name, const=const)
    if k in BUILTIN_NAMES:
        if k == TK.VOID:
            return CType('void', 'void', const=const)
        return CType('scalar', BUILTIN_NAMES[k], const=const, canon=k)
    return CType('other', t.spelling, const=const)
