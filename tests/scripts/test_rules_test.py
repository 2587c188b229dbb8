"""The rules that the tests are held against: what breaks them is told, what keeps them is not."""
import os
import sys
import unittest

sys.path.insert(0, os.path.join(os.path.dirname(__file__), "../../scripts"))
from test_rules import faults_of  # noqa: E402

SOURCE = "tests/unit/frame/FrameTest.cpp"
LIST = "tests/unit/frame/CMakeLists.txt"


def faults(source="", cmake="mrtu_test(frame_check_test SOURCES FrameTest.cpp)"):
    """Faults of the source and the list given, without the file's name in front."""
    return [fault.split(": ", 1)[1] for fault in faults_of({SOURCE: source, LIST: cmake})]


def reversed_lines(*lines):
    """The numbers of the lines whose comparison stands the wrong way round."""
    return [int(fault.split(":")[1]) for fault in faults_of({SOURCE: "\n".join(lines)})
            if fault.endswith("what is expected stands on the right")]


class Equalities(unittest.TestCase):
    def test_what_can_be_read_off_belongs_on_the_left(self):
        for right in ("5", "-1", "0x1FU", "2.5e3", "'c'", '"text"', "nullptr", "true", "kLimit",
                      "Kind::reply", "std::nullopt", "std::string(3, 'x')", "(Bytes{1, 2})",
                      "static_cast<int>(Kind::reply)", "row.answer", "expected", "ETIMEDOUT",
                      'R"(a, b)"', '"a" "b"', "1 + 2 * kLimit", "sizeof(frame)"):
            with self.subTest(right):
                self.assertEqual([1], reversed_lines(f"EXPECT_EQ(answer(1, {{2}}), {right});"))
                self.assertEqual([], reversed_lines(f"EXPECT_EQ({right}, answer(1, {{2}}));"))

    def test_a_literal_goes_before_a_named_constant(self):
        self.assertEqual([1], reversed_lines("EXPECT_EQ(kLimit, 5);"))
        self.assertEqual([], reversed_lines("EXPECT_EQ(5, kLimit);"))

    def test_what_has_to_be_computed_may_stand_on_either_side(self):
        for left, right in (("before", "after"), ("f(1)", "g(2)"), ("5", "6"), ("kA", "kB"),
                            ("f(row.x)", "row.x.size()"), ("a", "Table::make(1)"),
                            ("a", "expected.front()"), ("a", '"x" + path')):
            with self.subTest(right):
                self.assertEqual([], reversed_lines(f"EXPECT_EQ({left}, {right});"))

    def test_every_kind_of_equality_is_looked_at(self):
        self.assertEqual([1, 2, 3], reversed_lines(
            "ASSERT_EQ(f(), 1);", 'EXPECT_STREQ(f(), "x");', 'ASSERT_STREQ(f(), "x") << "why";'))

    def test_commas_and_parentheses_in_quotes_and_braces_separate_nothing(self):
        self.assertEqual([2, 4], reversed_lines(
            'EXPECT_EQ("a, )b", f(","));', 'EXPECT_EQ(f(",", \'(\'), 1);',
            "EXPECT_EQ(1, f(Bytes{1, 2}));", "EXPECT_EQ(f(\n  g[1, 2]),", "  1);"))

    def test_comments_hold_no_comparisons(self):
        self.assertEqual([], reversed_lines("// EXPECT_EQ(f(), 1);", "/* EXPECT_EQ(f(), 1); */",
                                            'say("EXPECT_EQ(f(), 1)");'))


class Suites(unittest.TestCase):
    def test_a_suite_has_its_files_name(self):
        for macro in ("TEST", "TEST_F", "TEST_P", "TYPED_TEST"):
            with self.subTest(macro):
                self.assertEqual([], faults(source=f"{macro}(FrameTest, EndsWithItsCheck) {{\n"))
                self.assertEqual(["the suite Frame has not its file's name"],
                                 faults(source=f"{macro}(Frame, EndsWithItsCheck) {{\n"))

    def test_two_files_of_one_name_are_told(self):
        found = list(faults_of({SOURCE: "", "tests/line/FrameTest.cpp": ""}))
        self.assertEqual([f"{SOURCE}: the name stands elsewhere too: tests/line/FrameTest.cpp"],
                         found)


class Programs(unittest.TestCase):
    def test_a_program_has_its_rooms_name_in_front_and_says_that_it_is_a_test(self):
        self.assertEqual([], faults(cmake="mrtu_test(frame_check_test SOURCES FrameTest.cpp)"))
        for name in ("check_test", "frame_check", "frame_test", "Frame_check_test"):
            with self.subTest(name):
                self.assertEqual([f"the program {name} is not called frame_<subject>_test"],
                                 faults(cmake=f"mrtu_test({name}\n  SOURCES FrameTest.cpp)"))

    def test_a_room_outside_the_unit_tests_is_its_folder(self):
        self.assertEqual([], list(faults_of(
            {"tests/line/CMakeLists.txt": "mrtu_test(line_frame_test SOURCES FrameTest.cpp)"})))

    def test_a_suite_belongs_to_one_program(self):
        self.assertEqual(
            ["belongs to frame_a_test and frame_b_test"],
            faults("TEST(FrameTest, EndsWithItsCheck) {",
                   "mrtu_test(frame_a_test SOURCES FrameTest.cpp)\n"
                   "mrtu_test(frame_b_test SOURCES More.cpp FrameTest.cpp)"))

    def test_a_suite_in_no_program_is_told(self):
        self.assertEqual(["belongs to no program"],
                         faults("TEST(FrameTest, EndsWithItsCheck) {", cmake=""))


if __name__ == "__main__":
    unittest.main()
