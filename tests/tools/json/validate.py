#!/usr/bin/env python3
"""Validates JSON documents of projectctl against their schemas.

    validate.py SCHEMAS < DOCUMENTS

DOCUMENTS is any number of documents, one after the other. The members "format" and "version" of a document name its
schema; an event of `projectctl watch` has none, and is found by its member "event". Fails with the reasons.
"""

import json
import pathlib
import sys

import jsonschema


def documents(text: str):
    decoder = json.JSONDecoder()
    while text := text.lstrip():
        document, end = decoder.raw_decode(text)
        yield document
        text = text[end:]


def schema_for(document, folder: pathlib.Path) -> pathlib.Path:
    if "event" in document:
        return folder / "projectctl-watch-2.schema.json"
    return folder / f"{document['format']}-{document['version']}.schema.json"


def main() -> int:
    folder = pathlib.Path(sys.argv[1])
    problems = []
    for document in documents(sys.stdin.read()):
        if not isinstance(document, dict) or not {"format", "event"} & document.keys():
            problems.append(f"a document without a format: {json.dumps(document)}")
            continue
        schema = json.loads(schema_for(document, folder).read_text(encoding="utf-8"))
        jsonschema.Draft202012Validator.check_schema(schema)
        for error in jsonschema.Draft202012Validator(schema).iter_errors(document):
            problems.append(f"{schema['title']}: {error.json_path}: {error.message} in {json.dumps(document)}")
    print("\n".join(problems))
    return 1 if problems else 0


if __name__ == "__main__":
    sys.exit(main())
