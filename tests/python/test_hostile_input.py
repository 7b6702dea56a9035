"""Faults the hostile-input sweep found in the runtime, each held down by a
direct case: input a script may pass must not crash, hang or leak."""
import gc
import os
import sys
import unittest

import _genfixture as G
import genfixture as gf

sys.path.insert(0, os.path.join(os.path.dirname(os.path.abspath(__file__)), "..", "robust"))
import hostile  # noqa: E402


class CountedGrowing(hostile.Growing):
    def __init__(self, item):
        hostile.Growing.__init__(self, item)
        self.reads = 0

    def __len__(self):
        self.reads += 1
        return hostile.Growing.__len__(self)


class SequencesThatChange(unittest.TestCase):
    def setUp(self):
        self.sq = gf.Square(2, "two")

    def test_growing_sequence_is_refused_not_read_for_ever(self):
        for arg, call in ((1, self.sq.Sum), ("x", lambda s: self.sq.Join(s, "-"))):
            seq = CountedGrowing(arg)
            with self.assertRaises(TypeError) as cm:
                call(seq)
            self.assertIn("argument 2 of type 'std::vector<", str(cm.exception))
            self.assertLessEqual(seq.reads, 3)

    def test_shrinking_sequence_gives_what_was_there(self):
        # Lengths read: 5, then 2 before element 0, 0 before element 1.
        self.assertEqual(self.sq.Sum(hostile.Shrinking(7)), 7)

    def test_sequence_emptied_by_its_own_element(self):
        # Element 1's "this" lookup empties the list: the conversion ends
        # there and refuses the element it could not convert.
        self.assertRaises(TypeError, self.sq.Join, hostile._mutating_list(), "")


class DeletedObjects(unittest.TestCase):
    def test_object_deleted_through_another_module_is_refused(self):
        # A vector made and deleted by _qorctl, passed to _genfixture, whose
        # own copy of the runtime must still see that it was deleted.
        import _qorctl
        import qorctl  # noqa: F401  (registers the vector classes)
        dead = _qorctl.new_StringVector()
        _qorctl.StringVector_append(dead, "a")
        _qorctl.delete_StringVector(dead)
        with self.assertRaises(TypeError) as cm:
            gf.Square(1).Join(dead, "-")
        self.assertIn("argument 2 of type 'std::vector< std::string", str(cm.exception))


class ComputedThis(unittest.TestCase):
    def test_this_made_by_the_lookup_is_not_a_wrapped_object(self):
        # Each lookup makes a new owning object that nothing keeps: accepting
        # it would destroy the first argument's library object while the
        # second one is looked up.
        def made():
            return hostile.ThisComputedNoDict(lambda: G.new_Square(3))
        gc.collect()  # earlier tests' cycles may still hold squares
        before = gf.Shape.Count()
        with self.assertRaises(TypeError) as cm:
            G.Square___eq__(made(), made())
        self.assertEqual(str(cm.exception), "in method 'Square___eq__', argument 1 of type 'Fx::Square const *'")
        self.assertEqual(gf.Shape.Count(), before)

    def test_this_kept_elsewhere_still_counts(self):
        keep = G.new_Square(4)

        class Holder(object):
            __slots__ = ()
            this = property(lambda self: keep)
        self.assertEqual(G.Square_GetSide(Holder()), 4)


class Registration(unittest.TestCase):
    def tearDown(self):
        G.Square_swigregister(gf.Square)

    def test_registering_again_releases_the_previous_class_data(self):
        G.Square_swigregister(gf.Square)
        before = sys.getrefcount(gf.Square)
        for _ in range(5):
            G.Square_swigregister(gf.Square)
        self.assertEqual(sys.getrefcount(gf.Square), before)
        self.assertIsInstance(gf.Square.Largest(), gf.Square)

    def test_borrowed_builtin_new_is_not_used_as_an_allocation_slot(self):
        # dict.__new__ would lay the instance out as a dict: the class gets
        # __new__'s own type check, which refuses it, and the result stays
        # a bare wrapped object.
        G.Square_swigregister(hostile.BorrowedNew)
        largest = gf.Square.Largest()
        self.assertEqual(type(largest).__name__, "PySwigObject")
        self.assertEqual(G.Square_GetSide(largest), 1000)

    def test_destroy_function_that_registers_the_class_again(self):
        calls = []

        def destroy(obj):
            calls.append(1)
            G.Square_swigregister(gf.Square)  # frees the class data in use
            G.delete_Square(obj)

        Rereg = type("Rereg", (object,), {"__swig_destroy__": staticmethod(destroy)})
        G.Square_swigregister(Rereg)
        del Rereg.__swig_destroy__  # the class data holds the only reference
        del destroy
        gc.collect()
        before = gf.Shape.Count()
        made = gf.Square.Make(5)
        self.assertIsInstance(made, Rereg)
        del made
        self.assertEqual(calls, [1])
        self.assertEqual(gf.Shape.Count(), before)


if __name__ == "__main__":
    unittest.main()
