"""Every text and every name on disk survives the way into the library and back."""

from __future__ import annotations

import os
import re
from pathlib import Path
from tempfile import TemporaryDirectory

import project_management as pm
from hypothesis import HealthCheck, given, settings
from hypothesis import strategies as st

# Any characters, also surrogates.
texts = st.text(st.characters(blacklist_categories=()))

# Any bytes that a name on disk can have.
names = st.binary(min_size=1, max_size=60).filter(lambda name: not set(name) & {0, ord("/")}
                                                  and name not in (b".", b"..", b".git", b".projectdata"))

ONE_PROJECT = settings(deadline=None, max_examples=200, suppress_health_check=[HealthCheck.function_scoped_fixture])


def with_joined_pairs(text: str) -> str:
    """The one exception: two surrogates that form a pair are the character that they encode."""
    return re.sub("[\ud800-\udbff][\udc00-\udfff]",
                  lambda pair: pair[0].encode("utf-16-le", "surrogatepass").decode("utf-16-le"), text)


@given(texts)
@ONE_PROJECT
def test_any_text_survives(p: pm.Project, text: str) -> None:
    p.description = text
    assert p.description == with_joined_pairs(text)


@given(texts)
@ONE_PROJECT
def test_any_text_survives_in_the_store(folder: Path, text: str) -> None:
    with TemporaryDirectory() as root:
        with pm.open(root, create_as=text) as created:
            created.description = text
        with pm.open(root) as opened:
            assert (opened.name, opened.description) == (with_joined_pairs(text), with_joined_pairs(text))


def test_a_pair_of_two_surrogates_is_the_character_that_it_encodes(p: pm.Project) -> None:
    p.description = "\ud83d\ude00"
    assert p.description == "\U0001f600"
    p.description = "\ude00\ud83d"
    assert p.description == "\ude00\ud83d"


@given(st.lists(names, unique=True, max_size=5))
@settings(deadline=None, max_examples=100)
def test_any_name_on_disk_survives(found: list[bytes]) -> None:
    with TemporaryDirectory() as root:
        for name in found:
            with open(os.path.join(os.fsencode(root), name), "wb"):
                pass
        with pm.open(root, create_as="Names") as p:
            for name in found:
                p.files.add(name)
            assert {os.fsencode(str(file)) for file in p.files} == set(found)
            assert {str(file) for file in p.files} == set(map(os.fsdecode, found))
            for name in found:
                assert name in p.files and os.fsdecode(name) in p.files and Path(os.fsdecode(name)) in p.files
            for file in p.files:
                with open(file, "rb"):
                    pass


def test_a_path_with_surrogates_that_are_the_bytes_of_a_character_is_that_name(p: pm.Project) -> None:
    (p.root / "ä").touch()
    p.files.add("ä")
    assert b"\xc3\xa4".decode("ascii", "surrogateescape") in p.files


def test_a_path_that_python_cannot_encode_raises_as_python_does(p: pm.Project) -> None:
    for path, error in (("\ud800", UnicodeEncodeError), ("a\0b", ValueError), (b"a\0b", ValueError)):
        try:
            os.stat(path)
        except error:
            pass
        try:
            p.files.add(path)
        except error:
            continue
        raise AssertionError(f"{path!r} was accepted")
