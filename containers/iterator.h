// Iterator objects of the vector and set classes.
//
// PySwigIterator is the one Python-visible iterator class; the generator
// binds it from this header like a library class (its annotations below say
// which exceptions each method raises and how results are owned). The
// templates underneath carry every container and element type and are not
// bound: the container operations create them.
//
//   PySwigIterator_T<It>        an iterator position `current` of type It,
//                               the container it belongs to, equal/distance
//   PySwigIteratorOpen_T<...>   unbounded (begin, end, find, ...)
//   PySwigIteratorClosed_T<...> bounded by [begin, end) (iterator())
//
// Every iterator made by the container operations remembers its container
// and a function giving that container's current bounds, so that:
//   - an unbounded iterator never reads outside [begin, end) (value() at a
//     bound raises StopIteration) and a set iterator never steps past a
//     bound of its tree;
//   - a bounded iterator over a vector follows the vector when it grows,
//     shrinks or moves its storage (the position is kept as an index), and
//     ends when the vector object was destroyed;
//   - erase and insert refuse iterators of another container object.
// The remaining hazard is an unbounded iterator whose container was freed,
// or a set iterator whose element was erased: nothing can detect those.
#ifndef QORCTL_CONTAINERS_ITERATOR_H
#define QORCTL_CONTAINERS_ITERATOR_H

#include "../hostctl/annotate.h"

#include <cstddef>
#include <iterator>
#include <memory>
#include <stdexcept>
#include <type_traits>

#ifdef QORCTL_CODEGEN
// The generator reads only the bound class; it needs no interpreter headers.
typedef struct _object PyObject;
#else
#include "seq.h"
#endif

namespace swig {

// Thrown when an iterator would move past a bound or read at one; the
// wrappers raise it as StopIteration.
struct QC_HIDDEN stop_iteration {};

class PySwigIterator {
public:
    virtual ~PySwigIterator();

    // The element under the iterator: a new reference, or null with a
    // Python exception set.
    QC_ANNOTATE("throws:swig::stop_iteration") virtual PyObject *value() const = 0;
    QC_ANNOTATE("throws:swig::stop_iteration") virtual PySwigIterator *incr(size_t n = 1) = 0;
    QC_ANNOTATE("throws:swig::stop_iteration") virtual PySwigIterator *decr(size_t n = 1);
    // Steps from this iterator to x.
    QC_ANNOTATE("throws:std::invalid_argument") virtual ptrdiff_t distance(const PySwigIterator &x) const;
    QC_ANNOTATE("throws:std::invalid_argument") virtual bool equal(const PySwigIterator &x) const;
    QC_OWNED virtual PySwigIterator *copy() const = 0;

    // value(), then one step forward.
    QC_ANNOTATE("throws:swig::stop_iteration") PyObject *next();
    // One step back, then value().
    QC_ANNOTATE("throws:swig::stop_iteration") PyObject *previous();
    QC_ANNOTATE("throws:swig::stop_iteration") PySwigIterator *advance(ptrdiff_t n);

    QC_ANNOTATE("throws:std::invalid_argument") bool operator==(const PySwigIterator &x) const;
    QC_ANNOTATE("throws:std::invalid_argument") bool operator!=(const PySwigIterator &x) const;
    // Moves this iterator and hands it over: the wrapper disowns argument 1
    // and returns the same iterator owned by a new wrapped object.
    QC_PYNAME("__iadd__") QC_ANNOTATE("throws:swig::stop_iteration") QC_ANNOTATE("self-disown") QC_OWNED
    PySwigIterator *iadd(ptrdiff_t n);
    QC_PYNAME("__isub__") QC_ANNOTATE("throws:swig::stop_iteration") QC_ANNOTATE("self-disown") QC_OWNED
    PySwigIterator *isub(ptrdiff_t n);
    // A moved copy.
    QC_PYNAME("__add__") QC_ANNOTATE("throws:swig::stop_iteration") QC_OWNED
    PySwigIterator *add(ptrdiff_t n) const;
    QC_PYNAME("__sub__") QC_ANNOTATE("throws:swig::stop_iteration") QC_OWNED
    PySwigIterator *sub(ptrdiff_t n) const;
    // x.distance(*this): the steps from x to this iterator.
    QC_PYNAME("__sub__") QC_ANNOTATE("throws:std::invalid_argument")
    ptrdiff_t sub(const PySwigIterator &x) const;

protected:
    // Keeps seq (may be null) alive until the iterator is destroyed.
    explicit PySwigIterator(PyObject *seq);
    PySwigIterator(const PySwigIterator &other);
    PySwigIterator &operator=(const PySwigIterator &) = delete;

    PyObject *sequence() const { return seq_; }
    // True when the kept sequence is a wrapped object whose library object
    // was destroyed (delete_<Class>).
    bool sequence_destroyed() const;

private:
    PyObject *seq_;
};

#ifndef QORCTL_CODEGEN

// Element to Python, by the element's kind (seq.h): numbers by their
// builder, wrapped scalars and class values as owned copies, class pointers
// borrowed, strings as str.
template <class V>
struct from_oper {
    explicit from_oper(swig_type_info *ty = nullptr) : ety(ty) {}
    PyObject *operator()(const V &v) const { return qr::ElemOut(v, ety); }
    swig_type_info *ety;
};

template <class It>
class PySwigIterator_T : public PySwigIterator {
public:
    typedef It iterator;
    // Stores the current bounds [*first, *last) of the container `owner`
    // for this iterator type.
    typedef void (*RangeFn)(const void *owner, It *first, It *last);
    static constexpr bool random_access = std::is_base_of<
        std::random_access_iterator_tag, typename std::iterator_traits<It>::iterator_category>::value;

    PySwigIterator_T(It cur, PyObject *seq, const void *owner, RangeFn range)
        : PySwigIterator(seq), current(cur), owner_(owner), range_(range) {}

    const It &get_current() const { return current; }
    // The container this iterator belongs to (null: unknown).
    const void *owner() const { return owner_; }

    bool equal(const PySwigIterator &x) const override { return current == Same(x).current; }

    ptrdiff_t distance(const PySwigIterator &x) const override {
        const PySwigIterator_T &other = Same(x);
        if (owner_ != other.owner_) throw std::invalid_argument("iterators of different containers");
        if constexpr (random_access) {
            return other.current - current;
        } else {
            // Walk within the container's bounds only: a bidirectional
            // iterator stepped past end() is undefined.
            It first, last;
            if (!bounds(&first, &last)) throw std::invalid_argument("operation not supported");
            ptrdiff_t n = 0;
            for (It i = current; ; ++i, ++n) {
                if (i == other.current) return n;
                if (i == last) break;
            }
            n = 0;
            for (It i = other.current; ; ++i, ++n) {
                if (i == current) return -n;
                if (i == last) break;
            }
            throw std::invalid_argument("iterator out of range");
        }
    }

protected:
    const PySwigIterator_T &Same(const PySwigIterator &x) const {
        const PySwigIterator_T *other = dynamic_cast<const PySwigIterator_T *>(&x);
        if (!other) throw std::invalid_argument("bad iterator type");
        return *other;
    }

    // The owner's current bounds; false when unknown.
    bool bounds(It *first, It *last) const {
        if (!range_ || !owner_) return false;
        range_(owner_, first, last);
        return true;
    }

    // Whether `current` may be read: inside [first, last) of the owner.
    // Without known bounds the iterator is trusted.
    bool readable() const {
        It first, last;
        if (!bounds(&first, &last)) return true;
        if constexpr (random_access) {
            ptrdiff_t d = current - first;
            return d >= 0 && d < last - first;
        } else {
            return current != last;
        }
    }

    It current;
    const void *owner_;
    RangeFn range_;
};

// An unbounded iterator: moves freely. It reads only inside its container
// (a random-access iterator may stand outside it, as a position); a set
// iterator stops at the bounds of its tree.
template <class It, class V = typename std::iterator_traits<It>::value_type, class FromOper = from_oper<V>>
class PySwigIteratorOpen_T : public PySwigIterator_T<It> {
public:
    typedef PySwigIterator_T<It> base;

    PySwigIteratorOpen_T(It cur, PyObject *seq, FromOper from = FromOper(), const void *owner = nullptr,
                         typename base::RangeFn range = nullptr)
        : base(cur, seq, owner, range), from_(from) {}

    PyObject *value() const override {
        if (!this->readable()) throw stop_iteration();
        return from_(static_cast<const V &>(*this->current));
    }

    PySwigIterator *incr(size_t n = 1) override {
        if constexpr (base::random_access) {
            this->current += static_cast<ptrdiff_t>(n);
        } else {
            It first, last;
            bool known = this->bounds(&first, &last);
            for (; n; --n) {
                if (known && this->current == last) throw stop_iteration();
                ++this->current;
            }
        }
        return this;
    }

    PySwigIterator *decr(size_t n = 1) override {
        if constexpr (base::random_access) {
            this->current -= static_cast<ptrdiff_t>(n);
        } else {
            It first, last;
            bool known = this->bounds(&first, &last);
            for (; n; --n) {
                if (known && this->current == first) throw stop_iteration();
                --this->current;
            }
        }
        return this;
    }

    PySwigIterator *copy() const override { return new PySwigIteratorOpen_T(*this); }

private:
    FromOper from_;
};

// A bounded iterator over [begin, end), from iterator(). It keeps the
// container's Python object alive.
template <class It, class V = typename std::iterator_traits<It>::value_type, class FromOper = from_oper<V>>
class PySwigIteratorClosed_T : public PySwigIterator_T<It> {
public:
    typedef PySwigIterator_T<It> base;

    PySwigIteratorClosed_T(It cur, It first, It last, PyObject *seq, FromOper from = FromOper(),
                           const void *owner = nullptr, typename base::RangeFn range = nullptr)
        : base(cur, seq, owner, range), begin_(first), end_(last), from_(from) {}

    PyObject *value() const override {
        const_cast<PySwigIteratorClosed_T *>(this)->follow();
        if (this->current == end_) throw stop_iteration();
        return from_(static_cast<const V &>(*this->current));
    }

    PySwigIterator *incr(size_t n = 1) override {
        follow();
        for (; n; --n) {
            if (this->current == end_) throw stop_iteration();
            ++this->current;
        }
        return this;
    }

    PySwigIterator *decr(size_t n = 1) override {
        follow();
        for (; n; --n) {
            if (this->current == begin_) throw stop_iteration();
            --this->current;
        }
        return this;
    }

    PySwigIterator *copy() const override { return new PySwigIteratorClosed_T(*this); }

private:
    // Catches up with changes of the container since the last operation.
    // A destroyed container ends the iteration. A vector keeps the position
    // as an index into its current storage, clipped to its current size.
    void follow() {
        if (this->sequence_destroyed()) throw stop_iteration();
        if constexpr (base::random_access) {
            It first, last;
            if (!this->bounds(&first, &last)) return;
            if (first == begin_ && last == end_) return;
            // Positions are compared as numbers; no element is read.
            ptrdiff_t pos = this->current - begin_, size = last - first;
            if (pos < 0) pos = 0;
            if (pos > size) pos = size;
            begin_ = first;
            end_ = last;
            this->current = first + pos;
        }
    }

    It begin_, end_;
    FromOper from_;
};

#endif  // QORCTL_CODEGEN

}  // namespace swig

#ifndef QORCTL_CODEGEN
namespace qr {
// StopIteration with the value None; returns null. The wrappers of the
// iterator methods call it for swig::stop_iteration.
PyObject *RaiseStopIteration();
}  // namespace qr
#endif

#endif
