"""The choice of the files that the linter compiles."""
import os
import sys
import unittest

sys.path.insert(0, os.path.join(os.path.dirname(__file__), "../../scripts"))
from lint_units import reach_of, units_for  # noqa: E402

INCLUDES = {
    "a/One.cpp": {"a/One.h"},
    "a/Two.cpp": {"a/One.h", "a/Two.h"},
    "a/Two.h": {"a/Deep.h"},
    "b/Wide.cpp": {"a/Two.h", "a/One.h", "b/Inline.h"},
    "b/Small.cpp": {"b/Inline.h"},
    # Each includes the other.
    "a/Deep.h": {"a/Two.h"},
}
COMPILED = {"a/One.cpp", "a/Two.cpp", "b/Wide.cpp", "b/Small.cpp"}


def chosen(*paths, with_headers=True):
    return units_for(list(paths), COMPILED, INCLUDES, with_headers)


class LintUnits(unittest.TestCase):
    def test_what_the_build_does_not_compile_is_left_out(self):
        self.assertEqual(["a/One.cpp"], chosen("a/One.cpp", "examples/Other.cpp", "README.md"))

    def test_headers_count_only_when_asked_for(self):
        self.assertEqual([], chosen("a/One.h", with_headers=False))

    def test_a_header_is_seen_through_its_own_file(self):
        self.assertEqual(["a/Two.cpp"], chosen("a/Two.h"))

    def test_a_header_without_a_file_of_its_own_is_seen_through_the_smallest(self):
        self.assertEqual(["b/Small.cpp"], chosen("b/Inline.h"))

    def test_a_header_that_is_included_by_a_changed_file_brings_no_other(self):
        self.assertEqual(["b/Wide.cpp"], chosen("b/Wide.cpp", "a/One.h", "b/Inline.h"))

    def test_a_header_is_found_behind_other_headers(self):
        self.assertEqual(["a/Two.cpp"], chosen("a/Deep.h"))

    def test_a_header_that_nobody_includes_brings_nothing(self):
        self.assertEqual([], chosen("c/Lonely.h"))

    def test_files_that_include_each_other_end(self):
        self.assertEqual({"a/Two.h", "a/Deep.h"}, reach_of("a/Two.h", INCLUDES))


if __name__ == "__main__":
    unittest.main()
