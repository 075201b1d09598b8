#!/usr/bin/env python3
"""Checks an estate document against its JSON Schema:
validate-estate.py SCHEMA_FOLDER FILE. The estate's schema refers to the
run summary's schema by its file name (summary.schema.json), resolved from
SCHEMA_FOLDER: through a registry where jsonschema has one (4.18 and
later), through a resolver's store where it has not (Debian 12's 4.10).
Exit status 0 when valid; otherwise the problem is printed
and the status is 1."""

import json
import os
import sys

import jsonschema


def load(path):
    with open(path, encoding="utf-8") as file:
        return json.load(file)


def validator(folder):
    summary = load(os.path.join(folder, "summary.schema.json"))
    schema = load(os.path.join(folder, "estate.schema.json"))
    jsonschema.Draft202012Validator.check_schema(schema)
    try:
        from referencing import Registry, Resource  # pylint: disable=import-outside-toplevel
    except ImportError:
        resolver = jsonschema.RefResolver.from_schema(
            schema, store={"summary.schema.json": summary, summary["$id"]: summary})
        return jsonschema.Draft202012Validator(schema, resolver=resolver)
    registry = Registry().with_resource("summary.schema.json", Resource.from_contents(summary))
    return jsonschema.Draft202012Validator(schema, registry=registry)


def main():
    try:
        errors = sorted(validator(sys.argv[1]).iter_errors(load(sys.argv[2])),
                        key=lambda error: list(error.absolute_path))
    except (OSError, ValueError, jsonschema.SchemaError) as problem:
        print(problem)
        return 1
    for error in errors[:5]:
        print("/".join(str(part) for part in error.absolute_path) + ": " + error.message[:300])
    return 1 if errors else 0


if __name__ == "__main__":
    sys.exit(main())
