#include "iterator.h"

namespace swig {

PySwigIterator::PySwigIterator(PyObject *seq) : seq_(seq) { Py_XINCREF(seq_); }

PySwigIterator::PySwigIterator(const PySwigIterator &other) : seq_(other.seq_) { Py_XINCREF(seq_); }

PySwigIterator::~PySwigIterator() { Py_XDECREF(seq_); }

PySwigIterator *PySwigIterator::decr(size_t) { throw stop_iteration(); }

ptrdiff_t PySwigIterator::distance(const PySwigIterator &) const {
    throw std::invalid_argument("operation not supported");
}

bool PySwigIterator::equal(const PySwigIterator &) const { throw std::invalid_argument("operation not supported"); }

PyObject *PySwigIterator::next() {
    PyObject *v = value();
    if (!v) return nullptr;
    try {
        incr();
    } catch (...) {
        Py_DECREF(v);
        throw;
    }
    return v;
}

PyObject *PySwigIterator::previous() {
    decr();
    return value();
}

PySwigIterator *PySwigIterator::advance(ptrdiff_t n) {
    // -n of the most negative value does not fit: step it as two halves.
    if (n > 0) return incr(static_cast<size_t>(n));
    return decr(static_cast<size_t>(-(n + 1)) + 1);
}

bool PySwigIterator::operator==(const PySwigIterator &x) const { return equal(x); }

bool PySwigIterator::operator!=(const PySwigIterator &x) const { return !equal(x); }

PySwigIterator *PySwigIterator::iadd(ptrdiff_t n) { return advance(n); }

PySwigIterator *PySwigIterator::isub(ptrdiff_t n) {
    if (n > 0) return decr(static_cast<size_t>(n));
    return incr(static_cast<size_t>(-(n + 1)) + 1);
}

PySwigIterator *PySwigIterator::add(ptrdiff_t n) const {
    std::unique_ptr<PySwigIterator> c(copy());
    c->advance(n);
    return c.release();
}

PySwigIterator *PySwigIterator::sub(ptrdiff_t n) const {
    std::unique_ptr<PySwigIterator> c(copy());
    c->isub(n);
    return c.release();
}

ptrdiff_t PySwigIterator::sub(const PySwigIterator &x) const { return x.distance(*this); }

bool PySwigIterator::sequence_destroyed() const {
    // Only a destroyed wrapped object reports ERR_VALUE; any other object
    // (or none) is taken as alive.
    return seq_ && qr::SWIG_Python_ConvertPtrAndOwn(seq_, nullptr, nullptr, 0) == qr::ERR_VALUE;
}

}  // namespace swig

namespace qr {

PyObject *RaiseStopIteration() {
    PyErr_SetObject(PyExc_StopIteration, Py_None);
    return nullptr;
}

}  // namespace qr
