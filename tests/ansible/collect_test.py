#!/usr/bin/env python3
"""The collection quorvex.pylon through the real ansible-playbook, against an
inventory of ten simulated consoles on this one machine:

- seven reached with the local connection, each entering a sandbox of its own
  (tools/sandbox) with its own simulated console and result folders: the
  inventory gives each a shell (ansible_shell_executable) that is a small
  script running /bin/sh inside that console's sandbox, so every module the
  play runs there sees that console at the fixed paths;
- two over real SSH: each an sshd listening on a loopback address of its own
  (127.0.0.2, 127.0.0.3), started inside a sandbox of its own, that is a
  private mount namespace where its simulated console sits at the fixed
  paths; a key pair and known_hosts made for the test;
- one unreachable (127.0.0.4, where nothing listens).

The first sshd (ssh-run) is given the product's Debian package (--package,
the survey role's quorvex_survey_package): the role copies it there and
installs it with the apt module (dpkg -i) before running the survey it
installed, /usr/bin/quorvex-survey. That sshd starts inside private-system
(beside this script), a mount namespace where /usr, /etc and /var are
overlays whose writable layers are in memory, and /run/systemd an empty
tmpfs: before the first collection its mount table must show an overlay or
tmpfs of its own on every place dpkg, its triggers and apt write, or the
test stops there. The libraries the package depends on (the C and C++
runtimes, Expat, pugixml, SQLite) are installed here already, so apt
fetches nothing. The first collection installs it (changed), the second
finds it installed (ok); dpkg on this machine must know nothing of it, its
status database the same bytes before and after.

Among them: a survey run now, timer runs collected (one of them stale), a
console whose machine listing fails (tool error, exit 69), one whose survey
hangs past the deadline, one without Python and one whose variable fails
the role's check (tool errors with Ansible's message). Two collections, the
scenarios changed in between, the second naming its folder relative to the
current one. Everything lives in a folder of the build tree, removed at the
end; every process started carries a marker in its environment, and none
may be left.

Usage: collect_test.py --source-root DIR --work-root DIR --survey FILE
                       --simulator FILE --collection FILE --package FILE.deb
"""
import argparse
import csv
import hashlib
import json
import os
import re
import shutil
import signal
import socket
import subprocess
import sys
import tempfile
import time
import unittest
import uuid

OPTIONS = None
MARKER_VARIABLE = 'QUORVEX_ANSIBLE_TEST'
RESULT_NAMES = ('VPD', 'Trace')

# name, how it is reached, mode, scenario of the first and of the second
# collection, the records expected of them.
CONSOLES = [
    ('local-run', 'local', 'run', 'console.scn', 'several-machines.scn', ('collected', 'collected')),
    ('local-timer', 'local', 'collect', 'several-machines.scn', 'console.scn', ('collected', 'collected')),
    ('local-stale', 'local', 'collect', 'console.scn', 'several-machines.scn', ('stale', 'collected')),
    ('local-busy', 'local', 'run', 'listing-fails.scn', 'listing-fails.scn', ('tool_error', 'tool_error')),
    ('local-hung', 'local', 'run', 'hanging.scn', 'hanging.scn', ('timed_out', 'timed_out')),
    ('ssh-run', '127.0.0.2', 'run', 'several-machines.scn', 'console.scn', ('collected', 'collected')),
    ('ssh-timer', '127.0.0.3', 'collect', 'console.scn', 'several-machines.scn', ('collected', 'collected')),
    ('ssh-gone', '127.0.0.4', 'run', 'console.scn', 'console.scn', ('unreachable', 'unreachable')),
    ('local-no-python', 'local', 'run', 'console.scn', 'console.scn', ('tool_error', 'tool_error')),
    ('local-bad-variable', 'local', 'run', 'console.scn', 'console.scn', ('tool_error', 'tool_error')),
]
# What sets those two apart: a Python that is not there, a variable that
# fails the survey role's check.
BROKEN_VARIABLES = {
    'local-no-python': {'ansible_python_interpreter': '/nonexistent/python3'},
    'local-bad-variable': {'quorvex_survey_poll_seconds': 'often'},
}
# The console that first installs the product's package from the controller
# (the survey role's quorvex_survey_package) and then runs the survey it
# installed. Its sshd starts inside private-system (beside this script):
# /usr, /etc and /var are overlays in memory there, proven by its mount
# table before the first collection, so that dpkg and apt change nothing on
# this machine.
PACKAGE_CONSOLE = 'ssh-run'
INSTALLED_SURVEY = '/usr/bin/quorvex-survey'
# Where dpkg, its triggers and apt write when the package is installed; each
# must lie on an overlay or tmpfs of the console's own. /run/systemd, where
# the host has it, hides the running systemd from the maintainer scripts.
PACKAGE_WRITES = ('/usr', '/usr/bin', '/usr/sbin', '/usr/lib', '/usr/share', '/etc', '/var/lib/dpkg',
                  '/var/lib/apt', '/var/cache/apt', '/var/cache/man', '/var/cache/debconf', '/var/log',
                  '/var/lib/systemd')
PRIVATE_FILE_SYSTEMS = ('overlay', 'tmpfs')
# The console whose run writes its metrics file; a wrapper around
# quorvex-survey keeps a copy of it to compare with the bundle's.
METRICS_CONSOLE = 'local-run'
UNREACHABLE = 'ssh-gone'
DEADLINE_SECONDS = 6
SURVEY_OPTIONS = ['-t', '2']
STALE_AGE_SECONDS = 2 * 24 * 3600
# Whether each collection ends with the records role's estate merge
# (quorvex-survey estate, its default) into the test's own history database;
# switching it off here also switches it off in bench/ansible-collect.
ESTATE_MERGE = True
# The records whose runs the estate records in the history.
RECORDED = ('collected', 'stale')


def scenario_path(name):
    if os.path.isabs(name):
        return name
    local = os.path.join(os.path.dirname(os.path.abspath(__file__)), 'scenarios', name)
    if os.path.exists(local):
        return local
    return os.path.join(OPTIONS.source_root, 'sim', 'scenarios', name)


def free_port(address):
    with socket.socket() as probe:
        probe.bind((address, 0))
        return probe.getsockname()[1]


def wait_for_listener(address, port, process):
    for _ in range(100):
        if process.poll() is not None:
            raise AssertionError('sshd on %s ended with status %d' % (address, process.returncode))
        try:
            socket.create_connection((address, port), timeout=1).close()
            return
        except OSError:
            time.sleep(0.1)
    raise AssertionError('sshd on %s:%d does not listen' % (address, port))


def tree_files(folder):
    """The files of a result folder as the run left them, by relative path,
    without the run's lock and temporary names (a leading dot)."""
    found = set()
    for parent, folders, files in os.walk(folder):
        folders[:] = [name for name in folders if not name.startswith('.')]
        for name in files:
            if not name.startswith('.'):
                found.add(os.path.relpath(os.path.join(parent, name), folder))
    return found


def mount_namespace(pid):
    return os.readlink('/proc/%s/ns/mnt' % pid)


def is_test_process(pid, marker, folder, namespaces):
    """Whether a process belongs to the test: the marker in its environment,
    the test's folder in its command line, or its place in the mount
    namespace of one of the test's sshds. ssh and sshd write their process
    title over their environment, so a connection master ("ssh: ... [mux]")
    or an sshd session ("sshd: root@notty") shows no marker."""
    try:
        with open('/proc/%s/environ' % pid, 'rb') as environ:
            if (MARKER_VARIABLE + '=' + marker).encode() in environ.read().split(b'\0'):
                return True
        with open('/proc/%s/cmdline' % pid, 'rb') as cmdline:
            if folder.encode() in cmdline.read():
                return True
        return mount_namespace(pid) in namespaces
    except OSError:
        return False


def marked_processes(marker, folder, namespaces):
    return [int(pid) for pid in os.listdir('/proc')
            if pid.isdigit() and int(pid) != os.getpid() and is_test_process(pid, marker, folder, namespaces)]


def mount_table(pid):
    """The mounts process pid sees, in the order they were made, each as
    (mount point, file system type, source, options of the file system)."""
    mounts = []
    with open('/proc/%s/mountinfo' % pid) as mountinfo:
        for line in mountinfo:
            fields, described = line.split(' - ', 1)
            kind, source, options = described.split()
            mounts.append((fields.split()[4], kind, source, options))
    return mounts


def covering_mount(mounts, path):
    """The mount that holds path: the deepest mount point above it, the
    newest of those on the same point."""
    found = None
    for mount in mounts:
        point = mount[0]
        if (path == point or path.startswith(point.rstrip('/') + '/')) and (
                found is None or len(point) >= len(found[0])):
            found = mount
    return found


def unshared_writes(pid):
    """The places where dpkg and apt write that process pid shares with this
    test: on its own overlay or tmpfs, one this test does not see, each is
    private to it."""
    ours = set(mount_table('self'))
    theirs = mount_table(pid)
    paths = PACKAGE_WRITES + (('/run/systemd',) if os.path.isdir('/run/systemd') else ())
    return [path for path in paths if covering_mount(theirs, path) in ours
            or covering_mount(theirs, path)[1] not in PRIVATE_FILE_SYSTEMS]


def host_package_state(package):
    """What dpkg knows on this machine, to show it untouched: its status
    database (its digest) and what it says of the package."""
    with open('/var/lib/dpkg/status', 'rb') as status:
        database = hashlib.sha256(status.read()).hexdigest()
    query = subprocess.run(['dpkg-query', '-W', package], capture_output=True, text=True)
    return {'status': database, 'package': (query.returncode, query.stdout),
            'survey': os.path.exists(INSTALLED_SURVEY)}


def package_field(name):
    return subprocess.run(['dpkg-deb', '-f', OPTIONS.package, name], capture_output=True, text=True,
                          check=True).stdout.strip()


def task_results(output, task):
    """The consoles' results of the task named task in ansible-playbook's
    output: console name to ok, changed, skipping, failed or fatal. Each
    result follows its task's banner, repeated where the free strategy
    interleaved another task's; a retry's line does not."""
    results = {}
    inside = False
    for line in output.splitlines():
        result = re.match(r'(ok|changed|skipping|failed|fatal): \[([^]]+)\]', line)
        if line.startswith('TASK ['):
            inside = line.split(']', 1)[0].endswith(' : ' + task)
        elif inside and result:
            results[result.group(2)] = result.group(1)
    return results


def process_description(pid):
    """A process by its id and command line, to name one left running."""
    try:
        with open('/proc/%d/cmdline' % pid, 'rb') as cmdline:
            return '%d %s' % (pid, cmdline.read().replace(b'\0', b' ').decode(errors='replace').strip())
    except OSError:
        return '%d (ended)' % pid


def sshd_listener(config):
    """The pid of the sshd that reads the configuration file config."""
    for pid in os.listdir('/proc'):
        try:
            with open('/proc/%s/comm' % pid) as comm, open('/proc/%s/cmdline' % pid, 'rb') as cmdline:
                if comm.read().strip() == 'sshd' and config.encode() in cmdline.read():
                    return int(pid)
        except OSError:
            continue
    raise AssertionError('no sshd reads ' + config)


class Console:
    """One simulated console: its folders, its scenario and how it is reached."""

    def __init__(self, estate, spec):
        self.name, self.address, self.mode, self.records = spec[0], spec[1], spec[2], spec[5]
        self.scenarios = (spec[3], spec[4])
        self.estate = estate
        self.folder = os.path.join(estate.work, 'consoles', self.name)
        for name in RESULT_NAMES + ('state', 'home', 'vartmp', 'tmp', 'run-sshd', 'layers'):
            os.makedirs(os.path.join(self.folder, name))
        # The shipped scenarios name their documents relative to themselves.
        os.symlink(os.path.join(OPTIONS.source_root, 'sim', 'scenarios', 'documents'), self.path('documents'))
        self.sshd = None

    @property
    def is_local(self):
        return self.address == 'local'

    def path(self, *names):
        return os.path.join(self.folder, *names)

    def use_scenario(self, collection):
        shutil.copyfile(scenario_path(self.scenarios[collection]), self.path('scenario.scn'))

    def sandbox_command(self, extra_binds=()):
        binds = ['--bind', self.path('state') + ':/var/lib/quorvex-survey']
        for bind in extra_binds:
            binds += ['--bind', bind]
        return [os.path.join(OPTIONS.source_root, 'tools', 'sandbox'), '--sim', OPTIONS.simulator,
                '--vpd', self.path('VPD'), '--trace', self.path('Trace')] + binds + ['--']

    def write_shell(self):
        """The console's shell for the local connection: /bin/sh in its sandbox."""
        words = ' '.join("'%s'" % word for word in self.sandbox_command())
        with open(self.path('shell'), 'w') as shell:
            shell.write('#!/bin/sh\n# Runs the command in the sandbox of console %s.\n' % self.name)
            shell.write("PYLON_SIM_SCENARIO='%s' exec %s /bin/sh \"$@\"\n" % (self.path('scenario.scn'), words))
        os.chmod(self.path('shell'), 0o755)

    def write_metrics_keeper(self):
        """quorvex-survey, keeping a copy of the metrics file each run writes."""
        with open(self.path('survey-keeping-metrics'), 'w') as keeper:
            keeper.write('#!/bin/sh\n\'%s\' "$@"\nstatus=$?\n' % OPTIONS.survey)
            keeper.write('while [ $# -gt 1 ]; do\n')
            keeper.write('    if [ "$1" = --metrics ]; then cp "$2" \'%s\'; fi\n' % self.path('metrics.prom'))
            keeper.write('    shift\ndone\nexit $status\n')
        os.chmod(self.path('survey-keeping-metrics'), 0o755)

    def start_sshd(self, port):
        subprocess.run(['ssh-keygen', '-q', '-t', 'ed25519', '-N', '', '-f', self.path('host_key')], check=True)
        config = [
            'ListenAddress %s:%d' % (self.address, port), 'HostKey ' + self.path('host_key'),
            'AuthorizedKeysFile ' + self.estate.path('client_key.pub'), 'PidFile none', 'UsePAM no',
            'StrictModes no', 'PasswordAuthentication no', 'KbdInteractiveAuthentication no',
            'PermitRootLogin prohibit-password', 'Subsystem sftp internal-sftp',
            'SetEnv PYLON_SIM_SCENARIO=%s %s=%s' % (
                self.path('scenario.scn'), MARKER_VARIABLE, self.estate.marker)]
        with open(self.path('sshd_config'), 'w') as sshd_config:
            sshd_config.write('\n'.join(config) + '\n')
        binds = [self.path('home') + ':/root', self.path('vartmp') + ':/var/tmp',
                 self.path('run-sshd') + ':/run/sshd']
        private_system = []
        environment = self.estate.environment
        if self.name == PACKAGE_CONSOLE:
            private_system = [os.path.join(os.path.dirname(os.path.abspath(__file__)), 'private-system'),
                              self.path('layers')]
            # dpkg needs root's capabilities, which proot would drop; where
            # private-system makes its namespace, the sandbox can make one.
            environment = dict(environment, QUORVEX_SANDBOX='namespace')
        log = open(self.path('sshd.log'), 'wb')
        self.sshd = subprocess.Popen(
            private_system + self.sandbox_command(binds)
            + ['/usr/sbin/sshd', '-D', '-e', '-f', self.path('sshd_config')],
            stdout=log, stderr=subprocess.STDOUT, env=environment)
        log.close()
        wait_for_listener(self.address, port, self.sshd)
        listener = sshd_listener(self.path('sshd_config'))
        unshared = unshared_writes(listener) if private_system else []
        if unshared:
            raise AssertionError('the package would be installed on this machine: %s of console %s not '
                                 'private to it' % (', '.join(unshared), self.name))
        namespace = mount_namespace(listener)
        if namespace != mount_namespace('self'):
            self.estate.namespaces.add(namespace)
            self.estate.namespace_handles.append(os.open('/proc/%d/ns/mnt' % listener, os.O_RDONLY))
        with open(self.path('host_key.pub')) as key:
            host_key = ' '.join(key.read().split()[:2])
        with open(self.estate.path('known_hosts'), 'a') as known_hosts:
            known_hosts.write('[%s]:%d %s\n' % (self.address, port, host_key))

    def stop_sshd(self):
        if self.sshd and self.sshd.poll() is None:
            self.sshd.terminate()
            self.sshd.wait(timeout=10)

    def run_on_console(self, words):
        """A command run on the console itself, as its timer would."""
        if self.is_local:
            argv = [self.path('shell'), '-c', ' '.join(words)]
        else:
            argv = ['ssh'] + self.estate.ssh_options() + ['-p', str(self.estate.port),
                                                          'root@' + self.address] + words
        return subprocess.run(argv, env=self.estate.environment, capture_output=True, text=True, timeout=120)

    def installed_package(self):
        """What dpkg on the console says of the package and of the survey
        program the role runs."""
        words = ['dpkg-query', '-W', '-f', "'${Status} ${Version}\\n'", package_field('Package'), ';',
                 'dpkg-query', '-S', INSTALLED_SURVEY]
        run = self.run_on_console(words)
        return run.stdout

    def run_timer(self):
        run = self.run_on_console([OPTIONS.survey, '--all', '--quiet'] + SURVEY_OPTIONS
                                  + ['--summary', '/var/lib/quorvex-survey/summary.json'])
        if run.returncode not in (0, 4, 8):
            raise AssertionError('timer run on %s: status %d: %s' % (self.name, run.returncode, run.stderr))
        if self.records[0] == 'stale' and self.estate.collection == 0:
            old = time.time() - STALE_AGE_SECONDS
            os.utime(self.path('state', 'summary.json'), (old, old))

    def host_variables(self):
        variables = {'quorvex_survey_mode': self.mode}
        if self.name == 'local-hung':
            variables['quorvex_survey_options'] = ['-t', '0']
        if self.is_local:
            variables.update({
                'ansible_connection': 'local', 'ansible_shell_executable': self.path('shell'),
                'ansible_remote_tmp': self.path('tmp'), 'ansible_async_dir': self.path('tmp', 'async'),
                'quorvex_survey_work_dir': self.path('work')})
        else:
            variables.update({'ansible_host': self.address, 'ansible_port': self.estate.port,
                              'ansible_user': 'root', 'ansible_remote_tmp': self.path('tmp'),
                              'ansible_ssh_common_args': ' '.join(self.estate.ssh_options())})
        if self.name == PACKAGE_CONSOLE:
            variables.update({'quorvex_survey_package': OPTIONS.package,
                              'quorvex_survey_command': INSTALLED_SURVEY})
        if self.name == METRICS_CONSOLE:
            variables.update({'quorvex_survey_metrics': True,
                              'quorvex_survey_command': self.path('survey-keeping-metrics')})
        variables.update(BROKEN_VARIABLES.get(self.name, {}))
        return variables


class Estate:
    """The consoles, the controller's home and the collections."""

    def __init__(self):
        self.work = tempfile.mkdtemp(prefix='collect.', dir=OPTIONS.work_root)
        self.marker = str(uuid.uuid4())
        self.collection = 0
        self.environment = dict(os.environ)
        self.environment.update({
            MARKER_VARIABLE: self.marker, 'HOME': self.path('home'), 'ANSIBLE_NOCOLOR': '1',
            'ANSIBLE_HOME': self.path('home', '.ansible'), 'ANSIBLE_COLLECTIONS_PATH': self.path('collections'),
            'ANSIBLE_REMOTE_TEMP': self.path('home', '.ansible', 'tmp'),
            'ANSIBLE_LOCAL_TEMP': self.path('home', 'tmp'), 'ANSIBLE_RETRY_FILES_ENABLED': 'false',
            'ANSIBLE_PYTHON_INTERPRETER': '/usr/bin/python3', 'ANSIBLE_SSH_RETRIES': '0',
            'ANSIBLE_SSH_CONTROL_PATH_DIR': self.path('control'),
            # One shell on the console per task rather than four: each enters a sandbox.
            'ANSIBLE_PIPELINING': '1'})
        os.makedirs(self.path('home'))
        self.port = free_port('127.0.0.2')
        self.consoles = [Console(self, spec) for spec in CONSOLES]
        self.results = []
        self.namespaces = set()
        # Held open so that each sshd's namespace outlives it: a freed one's
        # number may name a namespace of another program's a moment later.
        self.namespace_handles = []

    def path(self, *names):
        return os.path.join(self.work, *names)

    def installed_package(self):
        """What dpkg on the package console says, where the estate has one
        (bench/ansible-collect's has not)."""
        found = [console for console in self.consoles if console.name == PACKAGE_CONSOLE]
        return found[0].installed_package() if found else None

    def ssh_options(self):
        return ['-o', 'UserKnownHostsFile=' + self.path('known_hosts'), '-o', 'StrictHostKeyChecking=yes',
                '-o', 'IdentitiesOnly=yes', '-o', 'ConnectTimeout=5', '-o', 'BatchMode=yes',
                '-i', self.path('client_key')]

    def start(self):
        subprocess.run(['ssh-keygen', '-q', '-t', 'ed25519', '-N', '', '-f', self.path('client_key')], check=True)
        open(self.path('known_hosts'), 'w').close()
        self.run(['ansible-galaxy', 'collection', 'install', '-p', self.path('collections'), OPTIONS.collection])
        for console in self.consoles:
            console.use_scenario(0)
            if console.is_local:
                console.write_shell()
            elif console.name != UNREACHABLE:
                console.start_sshd(self.port)
            if console.name == METRICS_CONSOLE:
                console.write_metrics_keeper()
        self.write_inventory()

    def stop(self):
        self.close_connections()
        for console in self.consoles:
            console.stop_sshd()

    def close_connections(self):
        """Ends the connections Ansible keeps open to reuse (ControlPersist):
        their masters, and the sshd sessions serving them, would outlive the
        test by a minute."""
        if not os.path.isdir(self.path('control')):
            return
        for name in os.listdir(self.path('control')):
            subprocess.run(['ssh', '-o', 'ControlPath=' + self.path('control', name), '-O', 'exit', 'console'],
                           env=self.environment, capture_output=True, timeout=30)

    def left_processes(self):
        """The processes of the test still running once the sshds are
        stopped, after a grace of a few seconds for those ending."""
        deadline = time.monotonic() + 5
        while self.running_processes() and time.monotonic() < deadline:
            time.sleep(0.2)
        return self.running_processes()

    def kill(self, pids):
        """Ends what was left running, so that a failing test leaves nothing either."""
        for pid in pids:
            try:
                os.kill(pid, signal.SIGKILL)
            except ProcessLookupError:
                continue

    def release_namespaces(self):
        for handle in self.namespace_handles:
            os.close(handle)
        self.namespace_handles = []

    def running_processes(self):
        return marked_processes(self.marker, self.work, self.namespaces)

    def run(self, argv, timeout=300):
        run = subprocess.run(argv, env=self.environment, cwd=self.work, capture_output=True, text=True,
                             timeout=timeout)
        if run.returncode != 0:
            raise AssertionError('%s: status %d\n%s%s' % (argv[0], run.returncode, run.stdout, run.stderr))
        return run

    def write_inventory(self):
        hosts = {console.name: console.host_variables() for console in self.consoles}
        common = {'quorvex_survey_command': OPTIONS.survey, 'quorvex_survey_options': SURVEY_OPTIONS,
                  'quorvex_survey_metrics': False, 'quorvex_survey_deadline_seconds': DEADLINE_SECONDS,
                  'quorvex_survey_poll_seconds': 1, 'quorvex_survey_transfer_throttle': 2}
        with open(self.path('inventory.json'), 'w') as inventory:
            json.dump({'all': {'vars': common, 'hosts': hosts}}, inventory, indent=1)

    def collect(self, forks=10, timeout=300):
        """One collection: the timers' runs, then the playbook."""
        for console in self.consoles:
            console.use_scenario(self.collection)
            if console.mode == 'collect':
                console.run_timer()
        folder = self.path('collect%d' % self.collection)
        # The second names its folder relative to the one ansible-playbook
        # starts in, as an operator may.
        given = folder if self.collection == 0 else os.path.relpath(folder, self.work)
        started = time.monotonic()
        run = self.run(['ansible-playbook', 'quorvex.pylon.collect', '-i', self.path('inventory.json'),
                        '-f', str(forks), '-e', 'quorvex_pylon_collect_dir=' + given,
                        '-e', json.dumps(estate_variables(self.path('history.sqlite')))], timeout)
        self.results.append({'folder': folder, 'seconds': time.monotonic() - started, 'output': run.stdout,
                             'consoles': {console.name: snapshot(console) for console in self.consoles},
                             'installed': self.installed_package()})
        self.collection += 1
        sys.stderr.write('collection %d: %.1f s\n' % (self.collection, self.results[-1]['seconds']))


def estate_variables(database):
    """The records role's estate merge, switched by ESTATE_MERGE, with the
    test's own history database."""
    if not ESTATE_MERGE:
        return {'quorvex_records_estate': False}
    return {'quorvex_records_estate': True, 'quorvex_records_estate_command': OPTIONS.survey,
            'quorvex_records_history_file': database}


def snapshot(console):
    """What the console's result folders and timer summary hold right after a
    collection, to compare with its bundle."""
    files = {}
    for name in RESULT_NAMES:
        for relative in tree_files(console.path(name)):
            with open(console.path(name, relative), 'rb') as content:
                files[os.path.join(name, relative)] = content.read()
    summary = console.path('state', 'summary.json')
    if console.mode == 'collect' and os.path.exists(summary):
        with open(summary, 'rb') as content:
            files['summary.json'] = content.read()
    kept = console.path('metrics.prom')
    if os.path.exists(kept):
        with open(kept, 'rb') as content:
            files['metrics.prom'] = content.read()
        os.remove(kept)
    return files


def bundle_files(folder):
    files = {}
    for parent, _, names in os.walk(folder):
        for name in names:
            with open(os.path.join(parent, name), 'rb') as content:
                files[os.path.relpath(os.path.join(parent, name), folder)] = content.read()
    return files


class Collection(unittest.TestCase):
    estate = None

    @classmethod
    def setUpClass(cls):
        cls.host_before = host_package_state(package_field('Package'))
        cls.estate = Estate()
        try:
            cls.estate.start()
            cls.estate.collect()
            cls.estate.collect()
        finally:
            cls.estate.stop()
            cls.host_after = host_package_state(package_field('Package'))
            left = cls.estate.left_processes()
            cls.left_processes = [process_description(pid) for pid in left]
            cls.estate.kill(left)
            cls.estate.release_namespaces()
            if sys.exc_info()[0] is not None:
                shutil.rmtree(cls.estate.work)

    @classmethod
    def tearDownClass(cls):
        shutil.rmtree(cls.estate.work)

    def records(self, collection):
        with open(os.path.join(self.estate.results[collection]['folder'], 'records.json')) as records:
            return json.load(records)

    def record(self, collection, name):
        return [entry for entry in self.records(collection)['consoles'] if entry['console'] == name][0]

    def test_every_console_has_exactly_one_record_of_the_expected_kind(self):
        for collection in (0, 1):
            records = self.records(collection)
            self.assertEqual(1, records['schema_version'])
            self.assertEqual(sorted(spec[0] for spec in CONSOLES),
                             sorted(entry['console'] for entry in records['consoles']))
            expected = {spec[0]: spec[5][collection] for spec in CONSOLES}
            self.assertEqual(expected, {entry['console']: entry['record'] for entry in records['consoles']})

    def test_unreachable_console_carries_ansibles_message(self):
        record = self.record(0, UNREACHABLE)
        self.assertIn('127.0.0.4', record['message'])
        self.assertEqual((None, None), (record['bundle'], record['exit_status']))

    def test_hung_survey_is_timed_out_without_a_bundle(self):
        record = self.record(0, 'local-hung')
        self.assertIn('deadline of %d s' % DEADLINE_SECONDS, record['message'])
        self.assertIsNone(record['bundle'])

    def test_failing_listing_is_a_tool_error_with_status_and_message(self):
        record = self.record(0, 'local-busy')
        self.assertEqual(69, record['exit_status'])
        self.assertIn('lsvtc: console busy', record['message'])
        self.assertEqual('consoles/local-busy', record['bundle'])

    def test_stale_run_has_its_age_and_its_bundle(self):
        record = self.record(0, 'local-stale')
        self.assertGreaterEqual(record['age_seconds'], STALE_AGE_SECONDS)
        self.assertLess(record['age_seconds'], STALE_AGE_SECONDS + 600)
        self.assertEqual('consoles/local-stale', record['bundle'])
        self.assertIsNotNone(self.record(1, 'local-stale')['age_seconds'])

    def test_bundles_hold_what_the_survey_wrote_on_each_console(self):
        for collection, result in enumerate(self.estate.results):
            for entry in self.records(collection)['consoles']:
                if entry['bundle'] is None:
                    continue
                bundle = bundle_files(os.path.join(result['folder'], entry['bundle']))
                written = result['consoles'][entry['console']]
                for name, content in written.items():
                    self.assertEqual(content, bundle.get(name), '%s of %s' % (name, entry['console']))
                self.assertEqual(set(written) | {'bundle.json', 'summary.json'}, set(bundle),
                                 entry['console'])
                self.check_bundle_description(entry, bundle)

    def check_bundle_description(self, entry, bundle):
        description = json.loads(bundle['bundle.json'])
        summary = json.loads(bundle['summary.json'])
        mode = [spec[2] for spec in CONSOLES if spec[0] == entry['console']][0]
        self.assertEqual({'schema_version': 1, 'console': entry['console'], 'mode': mode,
                          'run_started': summary['started'], 'exit_status': entry['exit_status'],
                          'product_version': OPTIONS.version, 'console_host': OPTIONS.host},
                         {key: value for key, value in description.items() if key != 'collected'})
        statuses = {name for name in bundle if name.startswith('VPD/') and name.endswith('.status')}
        for machine in summary['machines']:
            self.assertIn('VPD/' + machine['status_file'].rsplit('/', 1)[-1], statuses)

    def test_second_collection_after_the_scenarios_changed_brings_new_bundles(self):
        for name in ('local-run', 'local-timer', 'ssh-run', 'ssh-timer'):
            machines = []
            for collection, result in enumerate(self.estate.results):
                bundle = os.path.join(result['folder'], self.record(collection, name)['bundle'])
                with open(os.path.join(bundle, 'summary.json')) as summary:
                    machines.append(sorted(m['identity'] for m in json.load(summary)['machines']))
            self.assertNotEqual(machines[0], machines[1], name)

    def test_console_without_python_is_a_tool_error_with_ansibles_message(self):
        for collection in (0, 1):
            record = self.record(collection, 'local-no-python')
            self.assertTrue(record['message'].startswith(
                'Reach the console: The module failed to execute correctly, you probably need to set the '
                'interpreter.'), record['message'])
            self.assertIn('/nonexistent/python3: not found', record['message'])
            self.assertEqual((None, None), (record['bundle'], record['exit_status']))

    def test_variable_failing_the_roles_check_is_a_tool_error_naming_it(self):
        record = self.record(0, 'local-bad-variable')
        self.assertIn('Validation of arguments failed', record['message'])
        self.assertIn("argument 'quorvex_survey_poll_seconds'", record['message'])
        self.assertEqual((None, None), (record['bundle'], record['exit_status']))

    def test_metrics_in_the_bundle_are_what_the_survey_wrote(self):
        for collection, result in enumerate(self.estate.results):
            written = result['consoles'][METRICS_CONSOLE]
            self.assertIn('metrics.prom', written, collection)
            bundle = os.path.join(result['folder'], self.record(collection, METRICS_CONSOLE)['bundle'])
            with open(os.path.join(bundle, 'metrics.prom'), 'rb') as metrics:
                self.assertEqual(written['metrics.prom'], metrics.read(), collection)

    def test_relative_collect_dir_is_taken_from_the_current_folder(self):
        folder = self.estate.results[1]['folder']
        self.assertTrue(os.path.isfile(os.path.join(folder, 'bundles', METRICS_CONSOLE + '.tar.gz')))
        playbooks = self.estate.path('collections', 'ansible_collections', 'quorvex', 'pylon', 'playbooks')
        self.assertEqual(['collect.yml'], os.listdir(playbooks))

    def estate_file(self, collection, name):
        return os.path.join(self.estate.results[collection]['folder'], 'report', name)

    def history(self, *words):
        run = self.estate.run([OPTIONS.survey, 'history'] + list(words)
                              + ['--history', self.estate.path('history.sqlite'), '--json'])
        return json.loads(run.stdout)

    def test_estate_json_has_every_console_once_with_its_record_and_reason(self):
        for collection in (0, 1):
            with open(self.estate_file(collection, 'estate.json')) as estate:
                consoles = json.load(estate)['consoles']
            self.assertEqual(sorted(spec[0] for spec in CONSOLES), sorted(c['console'] for c in consoles))
            for entry in consoles:
                record = self.record(collection, entry['console'])
                self.assertEqual((record['record'], record['message']), (entry['record'], entry['message']))
                self.assertEqual(record['record'] in RECORDED, entry['since_last_run'] is not None,
                                 entry['console'])

    def test_estate_csv_has_every_console_with_its_record(self):
        for collection in (0, 1):
            with open(self.estate_file(collection, 'estate.csv'), newline='') as table:
                rows = list(csv.reader(table))[1:]
            records = {}
            for row in rows:
                records.setdefault(row[0], set()).add((row[1], row[2]))
            expected = {entry['console']: {(entry['record'], entry['message'] or '')}
                        for entry in self.records(collection)['consoles']}
            self.assertEqual(expected, records)

    def test_history_has_each_recorded_console_once_per_collection(self):
        consoles = [run['console'] for run in sorted(self.history('runs')['runs'], key=lambda run: run['id'])]
        for collection in (0, 1):
            expected = sorted(spec[0] for spec in CONSOLES if spec[5][collection] in RECORDED)
            # Recorded in the estate's order: stale consoles before collected ones.
            recorded, consoles = consoles[:len(expected)], consoles[len(expected):]
            self.assertEqual(expected, sorted(recorded))
        self.assertEqual([], consoles)

    def test_second_collection_reports_the_changed_consoles_changes(self):
        changes = self.history('changes', '--console', 'local-run')
        self.assertIsNotNone(changes['run']['previous_run'])
        self.assertNotEqual([], changes['appeared'] + changes['disappeared'])
        with open(self.estate_file(1, 'estate.json')) as estate:
            entry = [c for c in json.load(estate)['consoles'] if c['console'] == 'local-run'][0]
        self.assertEqual(changes['run']['id'], entry['since_last_run']['run_id'])
        self.assertEqual(changes['run']['previous_run'], entry['since_last_run']['previous_run_id'])

    def test_package_is_installed_by_the_first_collection_and_kept_by_the_second(self):
        for collection, expected in enumerate(('changed', 'ok')):
            output = self.estate.results[collection]['output']
            for task in ('Copy the package to the console', 'Install or upgrade the package'):
                self.assertEqual({PACKAGE_CONSOLE: expected}, task_results(output, task), (collection, task))
            self.assertEqual('install ok installed %s\n%s: %s\n' % (
                package_field('Version'), package_field('Package'), INSTALLED_SURVEY),
                self.estate.results[collection]['installed'], collection)

    def test_package_console_runs_the_survey_it_installed(self):
        self.assertFalse(self.host_before['survey'], INSTALLED_SURVEY + ' on this machine')
        for collection in (0, 1):
            record = self.record(collection, PACKAGE_CONSOLE)
            self.assertEqual('collected', record['record'], collection)
            bundle = bundle_files(os.path.join(self.estate.results[collection]['folder'], record['bundle']))
            self.assertEqual(package_field('Version'), json.loads(bundle['bundle.json'])['product_version'])

    def test_private_system_proof_finds_this_tests_own_mounts_shared(self):
        paths = PACKAGE_WRITES + (('/run/systemd',) if os.path.isdir('/run/systemd') else ())
        self.assertEqual(list(paths), unshared_writes('self'))

    def test_host_package_database_is_unchanged(self):
        self.assertEqual((1, ''), self.host_before['package'])
        self.assertEqual(self.host_before, self.host_after)

    def test_nothing_is_left_running(self):
        self.assertEqual([], self.left_processes)


def main():
    global OPTIONS
    parser = argparse.ArgumentParser(description=__doc__.split('\n\n')[0])
    for option in ('--source-root', '--work-root', '--survey', '--simulator', '--collection', '--package'):
        parser.add_argument(option, required=True)
    OPTIONS, rest = parser.parse_known_args()
    OPTIONS.version = subprocess.run([OPTIONS.survey, '--version'], capture_output=True,
                                     text=True).stdout.split()[-1]
    OPTIONS.host = subprocess.run(['hostname', '-f'], capture_output=True, text=True).stdout.strip()
    os.makedirs(OPTIONS.work_root, exist_ok=True)
    unittest.main(argv=[sys.argv[0]] + rest, verbosity=2)


if __name__ == '__main__':
    main()
