"""Tests the filter that Doxygen reads the headers through, and the check of the groups.

    test_reference.py REPOSITORY
"""
import sys
import tempfile
from pathlib import Path

root = Path(sys.argv[1])
sys.path.insert(0, str(root / "docs/site"))

from check_groups import problems_of  # noqa: E402
from reference_filter import filtered  # noqa: E402

HEADER = """namespace project::session {

/// A sample.
class Sample {
public:
    Sample(Sample const&) = default;
    /// Rolls back.
    ~Sample();
    ~Sample();
    friend bool operator==(Sample const&, Sample const&) = default;

    /// Commits.
    void commit();
};

} // namespace project::session
"""


def class_page(title, groups):
    return f'<title>{title} Class Reference</title>{groups and "<div class=" + chr(34) + "ingroups" + chr(34) + ">"}'


def expect(found, expected, situation):
    assert found == expected, f"{situation}: {found} instead of {expected}"


lines = filtered("x/include/project/session/Move.hpp", HEADER).split("\n")
expect(len(lines), len(HEADER.split("\n")), "each line keeps its number")
expect(lines[0], "namespace project::session { /** @addtogroup files */ /** @{ */", "the names are in the group of the header")
expect(lines[15], "/** @} */ } // namespace project::session", "the group ends with the namespace")
expect([lines[5], lines[8], lines[9]], ["", "", ""], "generated operations without a description are left out")
expect(lines[7], "    ~Sample();", "a described operation keeps its description")
expect(filtered("x/include/other/Sample.hpp", HEADER).split("\n")[0], HEADER.split("\n")[0], "a header of no group")

with tempfile.TemporaryDirectory() as name:
    pages = {"index.html": '<a href="group__files.html">', "group__files.html": "memItemLeft", "group__empty.html": "",
             "classp_1_1Listed.html": class_page("p::Listed", True), "classp_1_1Lost.html": class_page("p::Lost", ""),
             "classp_1_1Listed_1_1Part.html": class_page("p::Listed::Part", "")}
    for page, text in pages.items():
        (Path(name) / page).write_text(text)
    expect(sorted(problems_of(Path(name))),
           ["group__empty.html: the first page does not lead to the group", "group__empty.html: the group is empty",
            "p::Lost is in no group: add its header to docs/site/reference_filter.py"], "wrong groups")
