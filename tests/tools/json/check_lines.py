#!/usr/bin/env python3
"""Compares the schema of the lines of a project's text with real texts.

    check_lines.py ROOT     ROOT is the checkout

Every line of the sample texts and of the examples in docs/store/format.md must be valid, and every form of a line in
the table there; lines that the reader rejects must not be.
"""

import json
import pathlib
import re
import sys

import jsonschema

MARKERS = ("<<<<<<<", "|||||||", "=======", ">>>>>>>")

# Strict JSON, but not lines of a text.
WRONG = [
    '""', "1", "null", "[]", "{}",
    '{"file":"a","at":["A","B"]}',
    '{"file":"a","unknown":1}',
    '{"file":""}',
    '{"at":["A"]}',
    '{"at":["A",1]}',
    '{"file":"a","node":true}',
    '{"file":"a","node":false,"keys":{"k":"v"}}',
    '{"file":"a","keys":{"k":1}}',
    '{"file":"a","children":[{"keys":{}}]}',
    '{"file":"a","children":[{"type":"T","node":false}]}',
    '{"remove":1}', '{"remove":"a","file":"a"}', '{"remove":[]}',
    '{"format":"project-definition","version":2}',
    '{"format":"another","version":1}',
    '{"end":"another"}',
    '{"batch":{"lines":1,"after":"x","sum":"y"}}',
    '{"batch":{"lines":1}}',
]  # fmt: skip


def lines_of_texts(root: pathlib.Path):
    samples = sorted((root / "tests/stores/text/golden").glob("*.jsonl"))
    for sample in samples:
        for line in sample.read_text(encoding="utf-8").split("\n"):
            if line and not line.startswith(MARKERS):
                yield sample.name, line
    document = (root / "docs/store/format.md").read_text(encoding="utf-8")
    for block in re.findall(r"```jsonl\n(.*?)```", document, re.S):
        for line in block.splitlines():
            yield "format.md", line
    for form in re.findall(r"^\| [^|]+ \| `([^`]+)` \|$", document, re.M):
        yield "format.md", form.replace(',...', "").replace("<uuid>", "5e0c7cf3")
    for form in re.findall(r"`(\{\"remove\":[^`]+\})`", document):
        yield "format.md", form


def main() -> int:
    root = pathlib.Path(sys.argv[1])
    schema = json.loads((root / "docs/json/project-line-1.schema.json").read_text(encoding="utf-8"))
    jsonschema.Draft202012Validator.check_schema(schema)
    validator = jsonschema.Draft202012Validator(schema)
    found = list(lines_of_texts(root))
    problems = [f"{name}: {line}" for name, line in found if not validator.is_valid(json.loads(line))]
    problems += [f"accepted: {line}" for line in WRONG if validator.is_valid(json.loads(line))]
    if len(found) < 50:
        problems.append(f"only {len(found)} lines were found")
    print("\n".join(problems) or f"{len(found)} lines are valid, and {len(WRONG)} wrong ones are not")
    return 1 if problems else 0


if __name__ == "__main__":
    sys.exit(main())
