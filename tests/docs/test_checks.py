"""The checks of the documentation find mistakes: in sessions, in blocks that no test runs, and in commands of the text.

    test_checks.py PROJECTCTL
"""
import contextlib
import io
import sys
import tempfile
import unittest
from pathlib import Path

import check_blocks
import check_commands
from run_sessions import Shell, is_expected, run_page

ROOT = Path(__file__).resolve().parents[2]


class Folder(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.folder = Path(folder.name)


class Sessions(Folder):
    """Each test has a page of one session."""

    def problems_of(self, page, **limits):
        path = self.folder / "page.md"
        path.write_text(page)
        shell = Shell(Path(tempfile.mkdtemp(dir=self.folder)), [], **limits)
        self.addCleanup(shell.end)
        return run_page(path, shell)[0]

    def test_output_that_differs_is_a_problem(self):
        self.assertEqual(self.problems_of("```console\n$ echo one\none\n```"), [])
        self.assertEqual(len(self.problems_of("```console\n$ echo one\ntwo\n```")), 1)
        self.assertEqual(len(self.problems_of("```console\n$ echo one\n```")), 1)

    def test_a_command_that_fails_silently_is_a_problem(self):
        self.assertEqual(len(self.problems_of("```console\n$ false\n```")), 1)

    def test_hidden_commands_that_fail_are_a_problem(self):
        self.assertEqual(len(self.problems_of("<!-- before: false -->\n```console\n$ true\n```")), 1)

    def test_a_block_is_stored_in_its_file_and_read_by_its_command(self):
        page = "<!-- file: notes -->\n```text\none\n```\n<!-- input: cat > copy -->\n```text\ntwo\n```\n"
        self.assertEqual(self.problems_of(page + "```console\n$ cat notes copy\none\ntwo\n```"), [])

    def test_a_command_that_rejects_a_block_is_a_problem(self):
        page = "<!-- input: grep three -->\n```text\none\n```\n```console\n$ true\n```"
        self.assertEqual(len(self.problems_of(page)), 1)

    def test_a_command_runs_until_it_has_written_its_lines(self):
        page = "<!-- meanwhile: written 1 && echo two > more -->\n```console\n$ echo one; until cat more; do sleep 0.1; done 2> /dev/null; sleep 99\n"
        self.assertEqual(self.problems_of(page + "one\ntwo\n```"), [])
        self.assertEqual(len(self.problems_of(page + "one\nthree\n```")), 1)

    def test_a_session_has_a_terminal_if_it_says_so(self):
        self.assertEqual(self.problems_of("<!-- terminal -->\n```console\n$ test -t 1 && echo yes\nyes\n```"), [])
        self.assertEqual(len(self.problems_of("```console\n$ test -t 1 && echo yes\nyes\n```")), 1)

    def test_a_command_that_does_not_end_is_ended_and_shown(self):
        with contextlib.redirect_stdout(io.StringIO()) as shown, self.assertRaises(SystemExit) as ended:
            self.problems_of("```console\n$ echo one; sleep 99\none\n```", seconds=0.5)
        self.assertEqual(ended.exception.code, 1)
        self.assertIn("sleep 99\none\n", shown.getvalue())

    def test_a_session_that_lacks_a_program_is_skipped(self):
        with contextlib.redirect_stdout(io.StringIO()), self.assertRaises(SystemExit) as ended:
            self.problems_of("```console\n$ exit 77\n```")
        self.assertEqual(ended.exception.code, 77)

    def test_text_that_varies_stands_for_text_of_its_form_only(self):
        self.assertTrue(is_expected(["3f0c6a5e-6c5e-4a8e-9d55-0a5b2f8a4c11 4f0c1b2a9d"],
                                    ["00000000-0000-0000-0000-000000000000 91d3e07c55"]))
        self.assertFalse(is_expected(["3f0c6a5e"], ["00000000-0000-0000-0000-000000000000"]))
        self.assertTrue(is_expected(["2026-11-23 01:48:16 UTC"], ["2026-03-01 09:12:44 UTC"]))
        self.assertFalse(is_expected(["one", "two"], ["one"]))
        self.assertTrue(is_expected(["one", "two"], ["one", "..."]))
        self.assertTrue(is_expected(["one two three"], ["one ... three"]))
        self.assertFalse(is_expected(["name    Passed"], ["name....Passed"]))


class Blocks(unittest.TestCase):
    def problems_of(self, page, name="docs/page.md"):
        return check_blocks.check_page(name, page, {"docs/compiled.md"}, {"docs/run.md"}, ROOT)[0]

    def test_a_session_on_a_page_that_no_test_runs_is_a_problem(self):
        self.assertEqual(self.problems_of("```console\n$ true\n```", "docs/run.md"), [])
        self.assertEqual(len(self.problems_of("```console\n$ true\n```")), 1)

    def test_a_block_of_cpp_on_a_page_that_no_test_compiles_is_a_problem(self):
        self.assertEqual(self.problems_of("```cpp\nint x;\n```", "docs/compiled.md"), [])
        self.assertEqual(len(self.problems_of("```cpp\nint x;\n```", "docs/run.md")), 1)

    def test_a_language_is_tested_on_the_pages_that_a_test_names_only(self):
        self.assertEqual(self.problems_of("```meson\nx\n```", "docs/guide/builds.md"), [])
        self.assertEqual(len(self.problems_of("```meson\nx\n```")), 1)

    def test_a_session_with_an_installed_library_is_tested_on_the_page_of_that_test_only(self):
        page = "<!-- installed -->\n```console\n$ true\n```"
        self.assertEqual(self.problems_of(page, "docs/guide/start.md"), [])
        self.assertEqual(len(self.problems_of(page, "docs/run.md")), 1)

    def test_statements_that_no_session_runs_are_a_problem(self):
        self.assertEqual(self.problems_of("<!-- input: sql -->\n```sql\nSELECT 1;\n```", "docs/run.md"), [])
        self.assertEqual(len(self.problems_of("```sql\nSELECT 1;\n```", "docs/run.md")), 1)

    def test_commands_and_code_elsewhere_are_a_problem(self):
        self.assertEqual(len(self.problems_of("```text\n$ true\n```")), 1)
        self.assertEqual(len(self.problems_of("Do this:\n\n    make\n")), 1)
        self.assertEqual(len(self.problems_of("```\nx\n```")), 1)

    def test_a_block_that_is_not_run_is_counted(self):
        self.assertEqual(check_blocks.check_page("docs/page.md", "<!-- not run: why -->\n```console\n$ x\n```", set(), set(), ROOT),
                         ([], 0, 1))

    def test_every_page_of_the_repository_is_read(self):
        names = {str(path.relative_to(ROOT)) for path in check_blocks.pages(ROOT)}
        self.assertLessEqual({"README.md", "docs/store/format.md", "examples/label_build/README.md"}, names)


class Commands(unittest.TestCase):
    projectctl = None

    @classmethod
    def setUpClass(cls):
        cls.tool = check_commands.Tool(cls.projectctl)

    def is_right(self, code):
        return check_commands.problem_of(code, self.tool, ROOT) is None

    def test_a_verb_exists(self):
        self.assertTrue(self.is_right("projectctl label put CATEGORY LABEL src"))
        self.assertTrue(self.is_right("projectctl -C DIR list"))
        self.assertFalse(self.is_right("projectctl lits"))
        self.assertFalse(self.is_right("projectctl label putt"))

    def test_an_option_exists_for_its_verb(self):
        self.assertTrue(self.is_right("projectctl list --tree"))
        self.assertTrue(self.is_right("list --label Status=Open"))
        self.assertTrue(self.is_right("label --personal"))
        self.assertFalse(self.is_right("projectctl list --repair"))
        self.assertFalse(self.is_right("list --repair"))
        self.assertFalse(self.is_right("--forever"))

    def test_a_script_exists_with_its_options(self):
        self.assertTrue(self.is_right("scripts/bench --quick"))
        self.assertFalse(self.is_right("scripts/bench --forever"))
        self.assertFalse(self.is_right("scripts/brench"))


if __name__ == "__main__":
    Commands.projectctl = sys.argv.pop()
    unittest.main()
