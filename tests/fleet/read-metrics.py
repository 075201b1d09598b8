#!/usr/bin/python3
"""Reads a metrics file with the Prometheus client's own text parser:
read-metrics.py FILE. Prints one line per sample, "name{label="value",...} value",
labels sorted by name and values as the parser read them (unescaped), whole
numbers without a fraction, samples sorted; the families' types first,
"# TYPE name type". Exit status 0 when the file parses; otherwise the
problem is printed and the status is 1."""

import sys

from prometheus_client.parser import text_string_to_metric_families


def sample_line(sample):
    labels = ",".join(f'{name}="{value}"' for name, value in sorted(sample.labels.items()))
    value = int(sample.value) if sample.value.is_integer() else sample.value
    return f"{sample.name}{{{labels}}} {value}"


def main():
    try:
        with open(sys.argv[1], encoding="utf-8") as metrics_file:
            families = list(text_string_to_metric_families(metrics_file.read()))
    except (OSError, ValueError) as problem:
        print(problem)
        return 1
    lines = [f"# TYPE {family.name} {family.type}" for family in families]
    lines += sorted(sample_line(sample) for family in families for sample in family.samples)
    sys.stdout.write("".join(line + "\n" for line in lines))
    return 0


if __name__ == "__main__":
    sys.exit(main())
