#!/usr/bin/env python3
"""The binding generator: library headers to a Python 2 extension module.

    qorgen.py --module _qorctl --include hostctl --bindings bindings/core ...
              --out build/gen/_qorctl --shadow build/python/qorctl.py

Reads each bindings directory's headers.txt (header paths relative to the
include directory, in binding order) and, where present, its extend.h
(binding-only methods). Writes the wrapper chunks, module.cpp, the shadow
module and a surface report. Nothing is written wrapper by wrapper by hand.
"""

import argparse
import os
import sys

sys.path.insert(0, os.path.dirname(os.path.abspath(__file__)))

from cparse import Parser, annotations_of  # noqa: E402
from emit import ModuleGen, write_if_changed  # noqa: E402
from shadow import write_shadow  # noqa: E402


def read_manifest(path):
    out = []
    with open(path) as f:
        for line in f:
            line = line.split('#', 1)[0].strip()
            if line:
                out.append(line)
    return out


def split_extends(model):
    """Free functions annotated extend:<Class> become methods of that class:
    their first parameter is self."""
    extends = []
    rest = []
    for f in model.functions:
        target = [a.split(':', 1)[1] for a in f.annotations if a.startswith('extend:')]
        if target:
            f.kind = 'extend'
            f.ext_class = target[0]
            f.params = f.params[1:]
            extends.append(f)
        else:
            rest.append(f)
    model.functions = rest
    return extends


def main():
    ap = argparse.ArgumentParser()
    ap.add_argument('--module', required=True)
    ap.add_argument('--include', required=True)
    ap.add_argument('--bindings', action='append', default=[])
    ap.add_argument('--out', required=True)
    ap.add_argument('--shadow', required=True)
    ap.add_argument('--surface')
    ap.add_argument('--totals', help='file of "<count name> <number>" lines: the complete surface')
    ap.add_argument('--chunks', type=int, default=4)
    ap.add_argument('-I', dest='incdirs', action='append', default=[], help='further include directories')
    args = ap.parse_args()

    headers = []
    support = []
    extra_inc = []
    for b in args.bindings:
        headers += read_manifest(os.path.join(b, 'headers.txt'))
        ext = os.path.join(b, 'extend.h')
        if os.path.exists(ext):
            support.append(os.path.abspath(ext))
    # Binding extras are parsed with the library headers, as absolute paths.
    parser = Parser(args.include, headers + support, extra_args=['-I' + os.path.abspath(b) for b in args.bindings + args.incdirs])
    model = parser.parse()
    extends = split_extends(model)
    gen = ModuleGen(model, args.module, extends)
    gen.generate()
    gen.write(args.out, args.chunks, headers, support)
    os.makedirs(os.path.dirname(os.path.abspath(args.shadow)), exist_ok=True)
    write_shadow(gen, args.shadow)
    if args.surface:
        totals = {}
        if args.totals:
            for line in open(args.totals):
                line = line.split('#', 1)[0].strip()
                if line:
                    k, v = line.rsplit(None, 1)
                    totals[k] = int(v)
        write_if_changed(args.surface, gen.surface(totals))


if __name__ == '__main__':
    main()
