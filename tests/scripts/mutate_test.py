#!/usr/bin/env python3
"""mutate_test.py SCRIPTS_DIR: the mutations that scripts/mutate makes of a text, and those that it must not."""
import pathlib
import random
import sys
import tempfile
import time
import unittest

sys.dont_write_bytecode = True
sys.path.insert(0, sys.argv.pop(1))
from mutation.patterns import PATTERNS
from mutation.sources import drawn, mutations_of
from mutation.trial import run

SAMPLE = """\
// x = a + 1;
#include "a + 1.h"
#define TWICE(a) a + 1 + \\
    1
namespace a1 {
static_assert(kFirst + 1 == 2, "a + 1");
/* a + 1
   x < 1 */
int32_t Sum(int32_t a) {
    Trace("a + 1", '1');
    return a + 7; // a + 1
}
} // namespace a1
"""


def after(text):
    return [mutation.after for mutation in mutations_of("a.cpp", text)]


class Patterns(unittest.TestCase):
    def test_each_changes_its_example_as_it_says(self):
        for pattern in PATTERNS:
            with self.subTest(pattern.name):
                before, expected = pattern.example
                made = [before[:start] + new + before[end:] for start, end, new in pattern.changes(before)]
                self.assertIn(expected, made)
                self.assertNotIn(before, made)

    def test_only_code_is_changed(self):
        self.assertCountEqual(after(SAMPLE), [f"return a {changed}; // a + 1" for changed in ("+ 6", "+ 8", "- 7")])

    def test_a_mutation_is_one_change_at_the_place_that_it_names(self):
        for mutation in mutations_of("a.cpp", SAMPLE):
            before, changed = SAMPLE.splitlines(), mutation.applied(SAMPLE).splitlines()
            differ = [i for i, (one, other) in enumerate(zip(before, changed, strict=True), 1) if one != other]
            self.assertEqual(differ, [mutation.line])
            self.assertEqual((before[mutation.line - 1].strip(), changed[mutation.line - 1].strip()),
                             (mutation.before, mutation.after))

    def test_templates_and_references_have_no_operators(self):
        self.assertEqual(after("std::vector<float>& Rows(const Image& image, F32&& x);\n"), [])

    def test_declared_names_and_sizes_stay(self):
        self.assertEqual(after("void Row(const uint8_t* source, int32_t width);\n"), [])
        self.assertEqual(after("    uint8_t pixels[4];\n"), [])
        self.assertCountEqual(after("    x = pixels[4];\n"), ["x = pixels[5];", "x = pixels[3];", ";"])

    def test_nested_brackets_belong_to_a_condition(self):
        self.assertIn("if (!(IsRaster(Depth(f)) && x)) y();", after("    if (IsRaster(Depth(f)) && x) y();\n"))

    def test_a_float_stays_a_float(self):
        self.assertIn("x = 2.00048828f;", after("    x = 2.0f;\n"))
        self.assertIn("x = 1.000244140625;", after("    x = 0x1p0;\n"))


class Samples(unittest.TestCase):
    mutations = mutations_of("a.cpp", "".join(f"    x = a + {i} * b;\n    Row(first, last{i});\n" for i in range(20)))

    def test_are_those_of_the_seed(self):
        one, same, other = (drawn(self.mutations, 30, random.Random(seed)) for seed in (1, 1, 2))
        self.assertEqual(one, same)
        self.assertNotEqual(one, other)

    def test_have_the_size_and_no_place_twice(self):
        sample = drawn(self.mutations, 30, random.Random(1))
        self.assertEqual(len({(mutation.path, mutation.start) for mutation in sample}), 30)

    def test_take_of_each_pattern(self):
        patterns = {mutation.pattern for mutation in self.mutations}
        sample = drawn(self.mutations, len(patterns), random.Random(1))
        self.assertEqual({mutation.pattern for mutation in sample}, patterns)

    def test_without_a_size_are_all(self):
        self.assertCountEqual(drawn(self.mutations, 0, random.Random(1)), self.mutations)


class Processes(unittest.TestCase):
    def test_the_first_failure_ends_all(self):
        start = time.monotonic()
        status, output = run([(["sh", "-c", "echo a; exit 3"], {}), (["sleep", "60"], {})], 60)
        self.assertEqual((status, output), (3, "a\n"))
        self.assertLess(time.monotonic() - start, 30)

    def test_what_takes_too_long_is_late_and_ended_with_all_that_it_started(self):
        with tempfile.TemporaryDirectory() as folder:
            status, _ = run([(["bash", "-c", "set -m; sleep 60 & echo $! > child; wait"], {})], 1, folder)
            self.assertEqual(status, "late")
            child = pathlib.Path("/proc", pathlib.Path(folder, "child").read_text().strip(), "stat")
            self.assertTrue(not child.exists() or child.read_text().split()[2] == "Z")

    def test_silence_is_late_too_and_words_are_not(self):
        speaker = ["sh", "-c", "for i in 1 2 3 4 5; do echo; sleep 0.2; done"]
        self.assertEqual(run([(speaker, {})], 60, silence=3)[0], 0)
        self.assertEqual(run([(speaker, {}), (["sleep", "60"], {})], 60, silence=3)[0], "late")

    def test_success_is_the_output_of_all(self):
        self.assertEqual(run([(["echo", "a"], {}), (["sh", "-c", "echo $NAME"], {"NAME": "b"})], 60), (0, "a\nb\n"))


unittest.main()
