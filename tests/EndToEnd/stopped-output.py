#!/usr/bin/python3
# Becomes a command whose standard output and error are taken by nobody. Usage: stopped-output.py KIND COMMAND...
# KIND: pipe (nobody reads it), terminal (stopped as with Ctrl+S), socket (nobody reads it), closed (both are).

import fcntl
import os
import socket
import sys
import termios
import time


def output(kind):
    """The end that is held and the end that is written to, which takes little."""
    if kind == 'pipe':
        held, written = os.pipe()
        fcntl.fcntl(written, fcntl.F_SETPIPE_SZ, 4096)
        return held, written
    if kind == 'socket':
        held, written = socket.socketpair()
        written.setsockopt(socket.SOL_SOCKET, socket.SO_SNDBUF, 4096)
        return held.detach(), written.detach()
    held, written = os.openpty()
    termios.tcflow(written, termios.TCOOFF)
    return held, written


kind, *command = sys.argv[1:]
if kind == 'closed':
    os.close(1)
    os.close(2)
    os.execvp(command[0], command)

held, written = output(kind)
parent = os.getpid()
if os.fork() == 0:
    os.setsid()
    for descriptor in (0, 1, 2, written):
        os.close(descriptor)
    while os.getppid() == parent:
        time.sleep(0.05)
    os._exit(0)
for descriptor in (1, 2):
    os.dup2(written, descriptor)
os.close(held)
os.close(written)
os.execvp(command[0], command)
