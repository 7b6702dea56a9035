"""The generator's wrapper shapes, seen from Python through the fixture
module built from tests/gen/fixture.h."""
import unittest

import _genfixture as G
import genfixture as gf


class ShadowClasses(unittest.TestCase):
    def test_constructor_overloads_and_defaults(self):
        self.assertEqual(gf.Square().Describe(), "unit 1")
        self.assertEqual(gf.Square(3).Describe(), "square 3")
        self.assertEqual(gf.Square(3, "named").Describe(), "named 3")
        copy = gf.Square(gf.Square(5, "orig"))
        self.assertEqual(copy.Describe(), "orig copy 5")

    def test_constructor_overload_message_lists_prototypes_in_declared_order(self):
        with self.assertRaises(NotImplementedError) as cm:
            gf.Square(1, "a", 2)
        self.assertEqual(str(cm.exception),
                         "Wrong number of arguments for overloaded function 'new_Square'.\n"
                         "  Possible C/C++ prototypes are:\n"
                         "    Fx::Square()\n"
                         "    Fx::Square(uint32,std::string const &)\n"
                         "    Fx::Square(uint32)\n"
                         "    Fx::Square(Fx::Square const &)\n")

    def test_constructor_result_is_owned_bare_object(self):
        this = G.new_Square()
        self.assertEqual(type(this).__name__, "PySwigObject")
        self.assertTrue(this.own())
        G.delete_Square(this)
        self.assertFalse(this.own())

    def test_owned_object_of_unregistered_class_reports_the_leak(self):
        import subprocess
        import sys
        code = "import _genfixture as G\nx = G.Square_Make(2)\ndel x\nprint 'done'\n"
        out = subprocess.check_output([sys.executable, "-c", code])
        self.assertEqual(out, "swig/python detected a memory leak of type 'Fx::Square *', "
                              "no destructor found.\ndone\n")

    def test_abstract_class_has_no_constructor(self):
        self.assertFalse(hasattr(G, "new_Shape"))
        self.assertRaises(AttributeError, gf.Shape)

    def test_methods_are_unbound_builtins(self):
        self.assertIs(gf.Square.GetSide.im_func, G.Square_GetSide)


class VirtualBases(unittest.TestCase):
    def test_derived_object_accepted_by_every_base_method(self):
        sq = gf.Square(7, "seven")
        # Shape is two virtual levels up, Named a second root.
        self.assertEqual(G.Shape_Describe(sq), "seven 7")
        self.assertEqual(G.Shape_GetKind(sq), G.Shape_KIND_ANGULAR)
        self.assertEqual(G.Polygon_GetSides(sq), 4)
        self.assertEqual(G.Named_GetName(sq), "seven")

    def test_base_object_refused_by_derived_method(self):
        piece = gf.Square(2).Pieces()[0]
        self.assertIsInstance(piece, gf.Shape)
        with self.assertRaises(TypeError) as cm:
            G.Square_GetSide(piece)
        self.assertEqual(str(cm.exception),
                         "in method 'Square_GetSide', argument 1 of type 'Fx::Square const *'")

    def test_pointer_adjusted_through_virtual_base(self):
        sq = gf.Square(9, "nine")
        # The same object reached as a Shape describes itself correctly, so
        # the converted pointer pointed at the Shape sub-object.
        self.assertEqual(sq.Pick(sq), "shape:nine 9")


class Arguments(unittest.TestCase):
    def setUp(self):
        self.sq = gf.Square(2, "two")

    def test_default_arguments(self):
        self.sq.Scale(3)
        self.assertEqual(self.sq.GetSide(), 6)
        self.sq.Scale(1, False)
        self.assertEqual(self.sq.GetSide(), 7)
        self.sq.Scale(1, True, -2)
        self.assertEqual(self.sq.GetSide(), 5)

    def test_overload_probe_order(self):
        self.assertEqual(self.sq.Pick(self.sq), "shape:two 2")
        self.assertEqual(self.sq.Pick(None), "shape:null")
        self.assertEqual(self.sq.Pick("hi"), "text:hi")
        self.assertEqual(self.sq.Pick(12), "number:12")
        with self.assertRaises(NotImplementedError):
            self.sq.Pick(1.5)

    def test_uint32_boundaries(self):
        self.sq.SetSide(4294967295L)
        self.assertEqual(self.sq.GetSide(), 4294967295L)
        self.assertIsInstance(self.sq.GetSide(), long)
        self.sq.SetSide(2147483647)
        self.assertIsInstance(self.sq.GetSide(), int)
        self.assertRaises(OverflowError, self.sq.SetSide, -1)
        self.assertRaises(TypeError, self.sq.SetSide, -1L)
        self.assertRaises(TypeError, self.sq.SetSide, 4294967296L)
        self.assertRaises(TypeError, self.sq.SetSide, 3.0)
        with self.assertRaises(OverflowError) as cm:
            self.sq.SetSide(-5)
        self.assertEqual(str(cm.exception), "in method 'Square_SetSide', argument 2 of type 'uint32'")

    def test_small_integer_and_char_arguments(self):
        self.assertEqual(self.sq.Shift(1, 4, 0xff, "\x01", 1), 16 + 1 + 1)
        self.assertRaises(OverflowError, self.sq.Shift, 1, 256, 0, "a", 0)
        self.assertRaises(OverflowError, self.sq.Shift, 1, 0, 65536, "a", 0)
        self.assertRaises(OverflowError, self.sq.Shift, 1, 0, 0, 128, 0)
        self.assertEqual(self.sq.Shift(-1, 0, 0xffff, 0, "\x00"), 0xffff)

    def test_enum_argument_and_result(self):
        self.assertEqual(self.sq.Paint(G.RED), G.BLUE)
        self.assertEqual(self.sq.Paint(G.GREEN), G.RED)

    def test_string_arguments(self):
        self.assertEqual(self.sq.Join(["a", "b", "c"], "-"), "a-b-c")
        self.assertEqual(self.sq.Join(("x\0y",), ""), "x\0y")
        with self.assertRaises(ValueError) as cm:
            G.Tally(None)
        self.assertEqual(str(cm.exception),
                         "invalid null reference in method 'Tally', argument 1 of type 'std::string const &'")
        # The only form taking one argument is called directly, so its own
        # conversion reports the argument.
        with self.assertRaises(TypeError) as cm:
            G.Tally(u"unicode")
        self.assertEqual(str(cm.exception), "in method 'Tally', argument 1 of type 'std::string const &'")
        self.assertRaises(TypeError, self.sq.Join, ["a"], u"unicode")
        self.assertRaises(TypeError, self.sq.Join, ["a"], None)
        self.assertEqual(G.Tally("abc", True), 6)

    def test_sequence_arguments(self):
        self.assertEqual(self.sq.Sum([1, 2, 3]), 6)
        self.assertEqual(self.sq.Sum((2 ** 64 - 1,)), 2 ** 64 - 1)
        with self.assertRaises(TypeError) as cm:
            self.sq.Sum([1, -1])
        self.assertEqual(str(cm.exception),
                         "in method 'Square_Sum', argument 2 of type "
                         "'std::vector< uint64,std::allocator< uint64 > > const &'")
        self.assertRaises(TypeError, self.sq.Sum, 5)
        self.assertEqual(self.sq.Join("abc", "+"), "a+b+c")

    def test_none_self_is_refused(self):
        with self.assertRaises(ValueError) as cm:
            G.Square_GetSide(None)
        self.assertIn("invalid null reference in method 'Square_GetSide', argument 1", str(cm.exception))


class Results(unittest.TestCase):
    def test_vector_results_are_tuples(self):
        sq = gf.Square(3, "three")
        self.assertEqual(sq.Words(), ("three", "has", "3"))
        pieces = sq.Pieces()
        self.assertEqual(len(pieces), 3)
        self.assertIsNone(pieces[1])
        self.assertFalse(pieces[0].thisown)
        self.assertEqual(pieces[2].Describe(), "largest 1000")

    def test_borrowed_and_owned_pointer_results(self):
        self.assertFalse(gf.Square.Largest().thisown)
        made = gf.Square.Make(6)
        self.assertTrue(made.thisown)
        self.assertEqual(made.Describe(), "made 6")

    def test_type_named_otherwise_has_its_own_descriptor(self):
        opaque = gf.Square.Unnamed()
        self.assertTrue(repr(opaque).startswith("<Swig Object of type 'Square *' at 0x"))
        self.assertEqual(gf.Square(1).Measure(opaque), "1000")
        with self.assertRaises(TypeError) as cm:
            G.Square_GetSide(opaque)
        self.assertEqual(str(cm.exception), "in method 'Square_GetSide', argument 1 of type 'Fx::Square const *'")
        with self.assertRaises(TypeError) as cm:
            gf.Square(1).Measure(gf.Square(2))
        self.assertEqual(str(cm.exception), "in method 'Square_Measure', argument 2 of type 'Square const &'")

    def test_operator(self):
        self.assertTrue(gf.Square(2) == gf.Square(2, "other"))
        self.assertFalse(gf.Square(2) == gf.Square(3))

    def test_free_functions_and_static_members(self):
        self.assertEqual(gf.Version(), "1.0")
        before = gf.Shape.Count()
        keep = gf.Square()
        self.assertEqual(gf.Shape.Count(), before + 1)
        del keep
        self.assertEqual(gf.Shape.Count(), before)


class Exceptions(unittest.TestCase):
    def test_declared_exception_raised_as_registered_class(self):
        sq = gf.Square(1)
        with self.assertRaises(gf.Error) as cm:
            sq.SetSide(0)
        self.assertEqual(str(cm.exception), "side must be positive")
        self.assertEqual(cm.exception.GetText(), "side must be positive")
        self.assertTrue(cm.exception.thisown)

    def test_undeclared_exception_becomes_runtime_error(self):
        with self.assertRaises(RuntimeError) as cm:
            gf.Square(1).SetSide(13)
        self.assertEqual(str(cm.exception), "unlucky side")


class Fields(unittest.TestCase):
    def setUp(self):
        self.r = gf.Record()

    def test_numbers(self):
        r = self.r
        r.count = -5
        r.size = 4294967295L
        r.big = 2 ** 64 - 1
        r.delta = -2 ** 63
        r.enabled = []
        self.assertEqual((r.count, r.size, r.big, r.delta, r.enabled), (-5, 4294967295L, 2 ** 64 - 1, -2 ** 63, False))
        self.assertRaises(OverflowError, setattr, r, "size", -1)

    def test_chars(self):
        r = self.r
        r.flag = "x"
        self.assertEqual(r.flag, "x")
        r.flag = 1
        self.assertEqual(r.flag, "\x01")
        self.assertEqual(r.letter, "a")

    def test_string_and_char_array(self):
        r = self.r
        r.label = "label\0with zero"
        self.assertEqual(r.label, "label\0with zero")
        self.assertRaises(ValueError, setattr, r, "label", None)
        r.code = "12345678"
        self.assertEqual(r.code, "12345678")
        r.code = "ab"
        self.assertEqual(r.code, "ab")
        self.assertRaises(TypeError, setattr, r, "code", "123456789")

    def test_record_pointer_and_array_fields(self):
        r = self.r
        p = gf.Point()
        p.x, p.y = 3, 4
        r.origin = p
        p.x = 99
        self.assertEqual((r.origin.x, r.origin.y), (3, 4))
        self.assertFalse(r.origin.thisown)
        r.link = p
        self.assertEqual(r.link.x, 99)
        r.link = None
        self.assertIsNone(r.link)
        self.assertRaises(ValueError, setattr, r, "origin", None)
        slots = r.slots
        self.assertEqual(type(slots).__name__, "PySwigObject")
        with self.assertRaises(ValueError) as cm:
            r.slots = None
        self.assertEqual(str(cm.exception), "invalid null reference in variable 'slots' of type 'uint32 [4]'")

    def test_field_pointer_keeps_parent_record_alive(self):
        r = gf.Record()
        r.origin.x = 41
        origin = r.origin
        del r
        import gc
        gc.collect()
        # The record is still alive through the field's wrapped pointer.
        self.assertEqual(origin.x, 41)
        origin.x = 42
        self.assertEqual(origin.x, 42)

    def test_readonly_field_and_none_self_setter(self):
        self.assertEqual(self.r.fixed, 7)
        self.assertFalse(hasattr(G, "Record_fixed_set"))
        self.assertIsNone(G.Record_count_set(None, 5))

    def test_enum_field(self):
        self.assertEqual(self.r.colour, G.GREEN)
        self.r.colour = G.BLUE
        self.assertEqual(self.r.colour, G.BLUE)


class ConstantsAndVariables(unittest.TestCase):
    def test_constants(self):
        self.assertEqual(G.FX_LIMIT, 42)
        self.assertEqual(G.FX_LABEL, "fixture")
        self.assertEqual((G.RED, G.GREEN, G.BLUE), (1, 2, 4))
        self.assertEqual(G.Record_MAX_SLOTS, 4)
        self.assertFalse(hasattr(G, "QORCTL_TESTS_GEN_FIXTURE_H"))

    def test_variables_read_live_values(self):
        before = G.cvar.Record_instances
        gf.Record()
        self.assertEqual(G.cvar.Record_instances, before + 1)
        self.assertEqual(G.cvar.Counter, 5)
        self.assertEqual(G.cvar.Motto, "measure twice")

    def test_writable_variables(self):
        G.cvar.Note = "second"
        self.assertEqual(G.cvar.Note, "second")
        p = gf.Point()
        p.x, p.y = 8, 9
        G.cvar.Origin = p
        self.assertEqual((G.cvar.Origin.x, G.cvar.Origin.y), (8, 9))
        with self.assertRaises(AttributeError) as cm:
            G.cvar.Counter = 1
        self.assertEqual(str(cm.exception), "Variable Counter is read-only.")

    def test_variable_order(self):
        self.assertEqual(str(G.cvar),
                         "(Origin, Note, Motto, Counter, Record_Names, Record_Corner, Record_LIMIT, Record_instances)")

    def test_const_member_without_value_is_a_variable(self):
        self.assertFalse(hasattr(G, "Record_LIMIT"))
        self.assertEqual(G.cvar.Record_LIMIT, 4294967295L)
        self.assertRaises(AttributeError, setattr, G.cvar, "Record_LIMIT", 1)

    def test_static_member_accessors(self):
        corner = G.Record_Corner_get()
        self.assertEqual((corner.x, corner.y), (1, 2))
        p = gf.Point()
        p.x, p.y = 5, 6
        self.assertIsNone(G.Record_Corner_set(p))
        self.assertEqual((G.cvar.Record_Corner.x, G.cvar.Record_Corner.y), (5, 6))
        self.assertRaises(ValueError, G.Record_Corner_set, None)
        names = G.Record_Names_get()
        self.assertEqual(type(names).__name__, "PySwigObject")
        with self.assertRaises(AttributeError) as cm:
            G.Record_Names_set(names)
        self.assertEqual(str(cm.exception), "in variable 'read-only Fx::Record::Names' of type 'char const * []'")
        self.assertRaises(TypeError, G.Record_Corner_set)


if __name__ == "__main__":
    unittest.main()
