#!/usr/bin/env python
# Packs the outputs of one survey run on the console into one bundle:
# bundle.json, summary.json, metrics.prom (when the run wrote one), and the
# result folders VPD/ and Trace/ as the run left them (the run's lock and
# temporary names, which start with a dot, left out). Says on standard
# output, as one JSON object, what the console's record needs: the bundle's
# path (null when the run left no summary, with the reason), the run's start,
# the exit status its summary keeps and the summary's age in seconds.
# Usage: pack_bundle.py CONSOLE MODE QUORVEX_SURVEY SUMMARY METRICS STAGE BUNDLE [EXIT_STATUS]
from __future__ import absolute_import, division, print_function

import datetime
import json
import os
import shutil
import subprocess
import sys
import tarfile
import time

__metaclass__ = type

RESULT_ROOT = '/var/adm/quorvex'
RESULT_FOLDERS = ('VPD', 'Trace')


def command_output(argv):
    try:
        return subprocess.check_output(argv, stderr=subprocess.STDOUT).decode('utf-8', 'replace').strip()
    except (OSError, subprocess.CalledProcessError) as error:
        return 'unknown (%s)' % error


def read_summary(path):
    with open(path, 'rb') as summary:
        return json.loads(summary.read().decode('utf-8'))


def stage_file(source, stage, name):
    target = os.path.join(stage, name)
    if os.path.abspath(source) != os.path.abspath(target):
        shutil.copyfile(source, target)


def without_hidden(member):
    return None if os.path.basename(member.name).startswith('.') else member


def pack(stage, bundle):
    temporary = bundle + '.part'
    with tarfile.open(temporary, 'w:gz') as archive:
        for name in sorted(os.listdir(stage)):
            archive.add(os.path.join(stage, name), arcname=name)
        for name in RESULT_FOLDERS:
            archive.add(os.path.join(RESULT_ROOT, name), arcname=name, filter=without_hidden)
    os.rename(temporary, bundle)


def main():
    console, mode, tool, summary, metrics, stage, bundle = sys.argv[1:8]
    run_status = int(sys.argv[8]) if len(sys.argv) > 8 else None
    if mode == 'collect':
        shutil.rmtree(stage, ignore_errors=True)
    if not os.path.isdir(stage):
        os.makedirs(stage, 0o700)
    try:
        document = read_summary(summary)
        age = max(int(time.time() - os.stat(summary).st_mtime), 0)
    except (OSError, IOError, ValueError) as error:
        shutil.rmtree(stage, ignore_errors=True)
        print(json.dumps({'bundle': None, 'summary_error': '%s: %s' % (summary, error)}))
        return
    stage_file(summary, stage, 'summary.json')
    if os.path.exists(metrics):
        stage_file(metrics, stage, 'metrics.prom')
    exit_status = run_status if mode == 'run' else document.get('exit_status')
    version = command_output([tool, '--version']).split()
    description = {'schema_version': 1, 'console': console, 'console_host': command_output(['hostname', '-f']),
                   'mode': mode, 'collected': datetime.datetime.now().astimezone().isoformat(timespec='seconds'),
                   'run_started': document.get('started'), 'exit_status': exit_status,
                   'product_version': version[-1] if version else 'unknown'}
    with open(os.path.join(stage, 'bundle.json'), 'w') as out:
        json.dump(description, out, indent=2, sort_keys=True)
    pack(stage, bundle)
    shutil.rmtree(stage)
    print(json.dumps({'bundle': bundle, 'summary_error': None, 'exit_status': exit_status, 'age_seconds': age}))


if __name__ == '__main__':
    main()
