"""Two modules of the same runtime family in one process: _qorctl and the
test-only _genfixture share one descriptor ring."""
import subprocess
import sys
import unittest

CHECKS = r"""
import sys
%(imports)s
import _qorctl, _genfixture, qorctl, genfixture
ring = sys.modules["swig_runtime_data4"]
assert type(ring.type_pointer).__name__ == "PyCObject", ring.type_pointer
sq = genfixture.Square(2, "two")
# The vector of strings has the same mangled name in both modules: a vector
# made by _qorctl converts in _genfixture ...
v = qorctl.StringVector(["a", "b"])
assert sq.Join(v, "-") == "a-b"
# ... and a vector wrapped by _genfixture is a shadow instance of the class
# that qorctl registered.
labels = sq.Labels()
assert isinstance(labels, qorctl.StringVector), type(labels)
assert list(labels) == ["two", "label"]
assert _qorctl.StringVector_size(labels) == 2
# Objects of one module's own classes are still refused by the other's.
try:
    _qorctl.StringVector_size(sq)
except TypeError:
    pass
else:
    raise AssertionError("a Square passed as a StringVector")
print "ok"
"""


def run(imports):
    return subprocess.check_output([sys.executable, "-c", CHECKS % {"imports": imports}],
                                   stderr=subprocess.STDOUT)


class SharedRing(unittest.TestCase):
    def test_fixture_first(self):
        self.assertEqual(run("import _genfixture\nimport _qorctl"), "ok\n")

    def test_qorctl_first(self):
        self.assertEqual(run("import _qorctl\nimport _genfixture"), "ok\n")

    def test_shadow_modules_first(self):
        self.assertEqual(run("import genfixture\nimport qorctl"), "ok\n")


if __name__ == "__main__":
    unittest.main()
