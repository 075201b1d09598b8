#!/usr/bin/env python3
"""Checks a run summary against its JSON Schema: validate-summary.py SCHEMA FILE.
Exit status 0 when valid; otherwise the problem is printed and the status is 1."""

import json
import sys

import jsonschema


def main():
    with open(sys.argv[1], encoding="utf-8") as schema_file:
        schema = json.load(schema_file)
    try:
        with open(sys.argv[2], encoding="utf-8") as summary_file:
            jsonschema.Draft202012Validator(schema).validate(json.load(summary_file))
    except (OSError, ValueError, jsonschema.ValidationError) as problem:
        print(problem)
        return 1
    return 0


if __name__ == "__main__":
    sys.exit(main())
