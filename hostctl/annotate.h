// Facts about the library's declarations that C++ cannot state itself, read
// by the binding generator. They expand to nothing in ordinary builds.
//
// Put an annotation first in the declaration it describes:
//     HC_THROWS virtual void Refresh() = 0;
//     QC_OWNED static Foo *Make();
#ifndef HOSTCTL_ANNOTATE_H
#define HOSTCTL_ANNOTATE_H

#ifdef QORCTL_CODEGEN
#define QC_ANNOTATE(text) __attribute__((annotate(text)))
#else
#define QC_ANNOTATE(text)
#endif

// The method declares HostCtl::Lib::HostCtlException (the wrapper catches it
// and raises it into Python).
#define HC_THROWS QC_ANNOTATE("throws:HostCtl::Lib::HostCtlException")
// The method declares QorCtl::Lib::QorCtlException (and HostCtlException).
#define QC_THROWS QC_ANNOTATE("throws:QorCtl::Lib::QorCtlException") \
    QC_ANNOTATE("throws:HostCtl::Lib::HostCtlException")
// A returned pointer belongs to the caller (Python owns it).
#define QC_OWNED QC_ANNOTATE("owned")
// Not bound into Python.
#define QC_HIDDEN QC_ANNOTATE("hidden")
// Bind under another Python name (methods: the part after "<Class>_").
#define QC_PYNAME(name) QC_ANNOTATE("pyname:" name)
// The library names a type differently from its declaration (for example
// without its namespace): the bindings give that name a descriptor of its
// own, with no wrapper class and no cast to the declared class. QC_RESULT_NAME
// goes first in a function's declaration, QC_NAME first in a parameter's.
#define QC_RESULT_NAME(name) QC_ANNOTATE("result-name:" name)
#define QC_NAME(name) QC_ANNOTATE("name:" name)

#endif
