#!/usr/bin/env python3
"""Runs a command where statx, faccessat2 and openat2 fail with ENOSYS.

Part of tools/sandbox, which runs it in front of proot when no private mount
namespace can be made. Debian 12's proot translates the paths of the stat and
access system calls but not of their newer forms (statx, faccessat2,
openat2), which would then look at the host's paths. A seccomp filter makes
those three return ENOSYS, so the C library falls back to the older calls
that proot translates. The filter is installed before the command starts and
is inherited by every process it runs.

Exit status: the command's (this process becomes it); 120 when the filter
cannot be installed or the command cannot be started (the reason goes to
standard error); 125 for a bad command line.
"""

import ctypes
import os
import platform
import struct
import sys

EXIT_SETUP_FAILED = 120
EXIT_USAGE = 125

USAGE = """\
Usage: tools/sandbox-seccomp.py COMMAND [ARGS...]

Runs COMMAND with the system calls statx, faccessat2 and openat2 failing
with ENOSYS, so that the C library uses the older calls that proot
translates. tools/sandbox runs it in front of proot; see tools/sandbox --help.

Options:
  -h, --help   print this text
"""

ENOSYS = 38

# Per machine: the audit architecture seccomp reports, and the numbers of
# statx, faccessat2 and openat2.
ARCHITECTURES = {
    "x86_64": (0xC000003E, (332, 439, 437)),
    "aarch64": (0xC00000B7, (291, 439, 437)),
}

# Classic BPF: load a word of struct seccomp_data, jump if equal, return.
BPF_LOAD = 0x20
BPF_JUMP_EQUAL = 0x15
BPF_RETURN = 0x06
SECCOMP_DATA_NR = 0
SECCOMP_DATA_ARCH = 4
SECCOMP_RET_ALLOW = 0x7FFF0000
SECCOMP_RET_ERRNO = 0x00050000

PR_SET_SECCOMP = 22
PR_SET_NO_NEW_PRIVS = 38
SECCOMP_MODE_FILTER = 2


class SockFprog(ctypes.Structure):
    """struct sock_fprog: the filter's length and its instructions."""

    _fields_ = [("len", ctypes.c_ushort), ("filter", ctypes.c_void_p)]


def fail(status, message):
    sys.stderr.write("sandbox: proot sandbox: " + message + "\n")
    sys.exit(status)


def last_error():
    return os.strerror(ctypes.get_errno())


def instruction(code, k, jump_true=0, jump_false=0):
    return struct.pack("HBBI", code, jump_true, jump_false, k)


def filter_program(architecture, calls):
    """Allows everything but the given calls of the given architecture."""
    program = [
        instruction(BPF_LOAD, SECCOMP_DATA_ARCH),
        instruction(BPF_JUMP_EQUAL, architecture, 1, 0),
        instruction(BPF_RETURN, SECCOMP_RET_ALLOW),
        instruction(BPF_LOAD, SECCOMP_DATA_NR),
    ]
    program += [
        instruction(BPF_JUMP_EQUAL, number, len(calls) - index, 0)
        for index, number in enumerate(calls)
    ]
    program += [
        instruction(BPF_RETURN, SECCOMP_RET_ALLOW),
        instruction(BPF_RETURN, SECCOMP_RET_ERRNO | ENOSYS),
    ]
    return program


def install_filter():
    machine = platform.machine()
    if machine not in ARCHITECTURES:
        known = ", ".join(sorted(ARCHITECTURES))
        fail(EXIT_SETUP_FAILED,
             f"unsupported machine {machine} (known: {known});"
             " use a private mount namespace")
    program = filter_program(*ARCHITECTURES[machine])
    code = ctypes.create_string_buffer(b"".join(program))
    fprog = SockFprog(len(program), ctypes.cast(code, ctypes.c_void_p))
    libc = ctypes.CDLL(None, use_errno=True)
    if libc.prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0) != 0:
        fail(EXIT_SETUP_FAILED,
             "prctl(PR_SET_NO_NEW_PRIVS): " + last_error())
    if libc.prctl(PR_SET_SECCOMP, SECCOMP_MODE_FILTER, ctypes.byref(fprog),
                  0, 0) != 0:
        fail(EXIT_SETUP_FAILED,
             "installing the seccomp filter: " + last_error())


def main(arguments):
    if not arguments:
        sys.stderr.write(
            "sandbox-seccomp.py: no command given\n"
            "sandbox-seccomp.py: try 'tools/sandbox-seccomp.py --help'\n")
        return EXIT_USAGE
    if arguments[0] in ("-h", "--help"):
        sys.stdout.write(USAGE)
        return 0
    install_filter()
    try:
        os.execvp(arguments[0], arguments)
    except OSError as error:
        fail(EXIT_SETUP_FAILED,
             "cannot start " + arguments[0] + ": " + error.strerror)
    return EXIT_SETUP_FAILED


if __name__ == "__main__":
    sys.exit(main(sys.argv[1:]))
