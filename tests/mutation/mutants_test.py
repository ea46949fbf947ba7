"""The tokeniser and the changes that are made of its tokens, on lines of code worked out by hand."""
import contextlib
import io
import pathlib
import tempfile
import unittest

from mutants import mutants_of
from results import Reasons, Result, Results, report
from tokens import tokenise
from worker import KILLED, SURVIVED


def texts(code):
    """The texts of all tokens."""
    return [token.text for token in tokenise(code)]


def changed(code, *operators):
    """Every mutant of the code, in whole, of the operators that are named, or of all."""
    return [m.apply(code) for m in mutants_of('x.cpp', code)
            if not operators or m.operator in operators]


class Tokens(unittest.TestCase):
    def test_comments_and_white_space_are_left_out(self):
        self.assertEqual(texts('a /* b + c */ = // d\n e;'), ['a', '=', 'e', ';'])

    def test_a_string_is_one_token(self):
        self.assertEqual(texts(r'f("a + \" b", ' + r"'\'');"),
                         ['f', '(', r'"a + \" b"', ',', r"'\''", ')', ';'])

    def test_the_longest_operator_is_taken(self):
        self.assertEqual(texts('a<<=b>>c->d++ + --e;'),
                         ['a', '<<=', 'b', '>>', 'c', '->', 'd', '++', '+', '--', 'e', ';'])

    def test_directives_are_left_out_with_their_continued_lines(self):
        self.assertEqual(texts('#define A(x) \\\n  x + 1\nb;\n'), ['b', ';'])

    def test_what_another_processor_compiles_is_left_out(self):
        code = '#if defined(__SSE2__)\na;\n#elif defined(__ARM_NEON)\nb;\n#else\nc;\n#endif\n'
        self.assertEqual(texts(code), ['a', ';', 'c', ';'])

    def test_what_is_not_understood_is_named_with_its_line(self):
        with self.assertRaisesRegex(ValueError, 'line 2'):
            tokenise('a;\n@')


class Operators(unittest.TestCase):
    def test_binary_operators_are_replaced(self):
        self.assertEqual(changed('x = a % b;', 'arithmetic'), ['x = a * b;', 'x = a / b;'])
        self.assertEqual(changed('x = a >= b;', 'relational'), ['x = a <= b;', 'x = a > b;'])

    def test_brackets_of_templates_are_no_comparisons(self):
        self.assertEqual(changed('x = static_cast<std::array<int, N>>(y);', 'relational', 'shift'),
                         [])

    def test_pointers_and_references_are_no_operators(self):
        self.assertEqual(changed('void F(const int* a, int& b);', 'arithmetic', 'bitwise'), [])

    def test_signs_and_negations_are_taken_off(self):
        self.assertEqual(changed('x = -a - b;', 'unary'), ['x = a - b;'])
        self.assertEqual(changed('x = !a != b;', 'unary'), ['x = a != b;'])

    def test_steps_go_the_other_way(self):
        self.assertEqual(changed('++a;', 'unary'), [])  # nothing stands before it
        self.assertEqual(changed('{ ++a; }', 'unary'), ['{ --a; }'])

    def test_an_operator_function_keeps_its_name(self):
        self.assertEqual(changed('bool operator == (T a);', 'relational'), [])


class Constants(unittest.TestCase):
    def test_neighbours_and_zero_and_one(self):
        self.assertEqual(sorted(changed('x = 7U;', 'constant')),
                         ['x = 0U;', 'x = 1U;', 'x = 6U;', 'x = 8U;'])

    def test_zero_has_two_neighbours(self):
        self.assertEqual(sorted(changed('x = 0;', 'constant')), ['x = (-1);', 'x = 1;'])

    def test_hexadecimal_and_truth(self):
        self.assertIn('x = 254;', changed('x = 0xFF;', 'constant'))
        self.assertEqual(changed('x = true;', 'constant'), ['x = false;'])

    def test_extents_of_declared_arrays_stay(self):
        self.assertEqual(changed('uint8_t a[4][2];', 'constant'), [])
        self.assertEqual(len(changed('x = a[4];', 'constant')), 4)


class Statements(unittest.TestCase):
    def test_conditions_are_forced(self):
        self.assertEqual(changed('if (a < f(b)) c();', 'condition'),
                         ['if (false) c();', 'if (true) c();'])
        self.assertEqual(changed('for (i = 0; i < n; ++i) c();', 'condition'),
                         ['for (i = 0; false; ++i) c();'])
        self.assertEqual(changed('x = a && b ? c : d;', 'condition'),
                         ['x = false ? c : d;', 'x = true ? c : d;'])

    def test_expression_statements_and_jumps_are_left_out(self):
        self.assertEqual(changed('{ f(a); }', 'deletion'), ['{ ; }'])
        self.assertEqual(changed('{ *a = b; }', 'deletion'), ['{ ; }'])
        self.assertEqual(changed('for (;;) break;', 'deletion'), ['for (;;) ;'])

    def test_declarations_stay(self):
        self.assertEqual(changed('{ const int a = 1; std::array<int, 2> b; T* c = d; }', 'deletion'),
                         [])

    def test_returned_values_become_the_zero_of_their_type(self):
        self.assertEqual(changed('return a + b;', 'return'), ['return {};'])
        self.assertEqual(changed('return 0;', 'return'), [])


class Keys(unittest.TestCase):
    def test_lines_added_above_change_no_key(self):
        before = mutants_of('x.cpp', 'x = a + b;')
        after = mutants_of('x.cpp', '// more\n\n    x = a + b;')
        self.assertEqual([m.key for m in before], [m.key for m in after])
        self.assertEqual({m.line for m in after}, {3})

    def test_every_mutant_has_its_own(self):
        found = mutants_of('x.cpp', 'x = a + a + a;\nx = a + a + a;\n')
        self.assertEqual(len({m.key for m in found}), len(found))


class Files(unittest.TestCase):
    def setUp(self):
        self._folder = tempfile.TemporaryDirectory()
        self.addCleanup(self._folder.cleanup)
        self.path = pathlib.Path(self._folder.name, 'file')
        self.mutant = mutants_of('x.cpp', '    x = a + 3;')[0]

    def test_results_are_read_again_and_the_last_counts(self):
        results = Results(self.path, {'x.cpp': 'd'})
        results.add(self.mutant, Result(SURVIVED, '', ''))
        results.add(self.mutant, Result(KILLED, 'unit tests', 'A.B'))
        self.assertEqual(Results(self.path, {'x.cpp': 'd'}).of(self.mutant),
                         Result(KILLED, 'unit tests', 'A.B'))

    def test_results_of_another_version_of_the_file_do_not_count(self):
        Results(self.path, {'x.cpp': 'd'}).add(self.mutant, Result(KILLED, '', ''))
        self.assertIsNone(Results(self.path, {'x.cpp': 'e'}).of(self.mutant))

    def test_a_reason_is_found_by_the_lines_text(self):
        self.path.write_text('# why\n\nfile: x.cpp\nline: x = a + 3;\n'
                             f'change: {Reasons.change(self.mutant)}\nreason: never read\n'
                             '  afterwards\n')
        self.assertEqual(Reasons(self.path).of(self.mutant), 'never read afterwards')

    def test_a_reason_is_for_one_of_equal_lines(self):
        first, second = [m for m in mutants_of('x.cpp', 'x = a + 3;\nx = a + 3;\n')
                         if m.after == '4']
        self.path.write_text('file: x.cpp\nline 2: x = a + 3;\n'
                             f'change: {Reasons.change(second)}\nreason: r\n')
        self.assertIsNone(Reasons(self.path).of(first))
        self.assertEqual(Reasons(self.path).of(second), 'r')

    def outcome(self, verdict, reason_for):
        """What the report of one mutant with this verdict says, given a reason for this change."""
        self.path.write_text('' if reason_for is None else
                             f'file: x.cpp\nline: x = a + 3;\nchange: {reason_for}\nreason: r\n')
        results = Results(self.path.with_name('results'), {'x.cpp': 'd'})
        results.add(self.mutant, Result(verdict, '', ''))
        with contextlib.redirect_stdout(io.StringIO()):
            return report([self.mutant], [self.mutant], results, Reasons(self.path))

    def test_every_survivor_needs_a_reason(self):
        change = Reasons.change(self.mutant)
        self.assertTrue(self.outcome(KILLED, None))
        self.assertFalse(self.outcome(SURVIVED, None))
        self.assertTrue(self.outcome(SURVIVED, change))

    def test_a_reason_that_cannot_be_true_is_a_failure(self):
        self.assertFalse(self.outcome(KILLED, Reasons.change(self.mutant)))
        self.assertFalse(self.outcome(KILLED, '1 constant: 9 -> 8'))


if __name__ == '__main__':
    unittest.main()
