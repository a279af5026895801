"""What the measuring scripts share: starts a host or another server, and asks the system what a process costs."""

import contextlib
import json
import os
import pathlib
import signal
import socket
import subprocess
import sys
import tempfile
import time

ROOT = pathlib.Path(__file__).resolve().parents[1]
BIN = ROOT / 'build/release/bin'
HANDSHAKE = ('GET {path} HTTP/1.1\r\nHost: 127.0.0.1:{port}\r\nUpgrade: websocket\r\nConnection: Upgrade\r\n'
             'Sec-WebSocket-Key: dGhlIHNhbXBsZSBub25jZQ==\r\nSec-WebSocket-Version: 13\r\n\r\n')


def build(*targets):
    """What is measured is built first; nothing when it is there."""
    subprocess.run([ROOT / 'scripts/setup'], check=True)
    targets = ('subject-store-host', 'RunaCorePluginSubjectStore', *targets)
    subprocess.run([ROOT / 'scripts/build', 'release', *targets], check=True)


def require(*programs):
    """Ends with what to install when a program is not there."""
    path = os.environ['PATH'] + ':/usr/sbin'
    for program, package in programs:
        if not any(os.access(pathlib.Path(folder, program), os.X_OK) for folder in path.split(':')):
            sys.exit(f'{program} is not there: apt-get install {package}')


def processor_seconds(pid):
    """Processor time of a process so far, from the scheduler, which counts in nanoseconds."""
    return sum(int(pathlib.Path(task, 'schedstat').read_text().split()[0])
               for task in pathlib.Path(f'/proc/{pid}/task').iterdir()) / 1e9


def resident_bytes(pid):
    """Memory of a process that no other process shares with it."""
    for line in pathlib.Path(f'/proc/{pid}/smaps_rollup').read_text().splitlines():
        if line.startswith('Private_Dirty:'):
            return int(line.split()[1]) * 1024
    raise RuntimeError('no figure of the memory')


def text_frame(text):
    """A client's text frame with a mask of zeros, which leaves the text as it is."""
    size = len(text)
    return bytes([0x81, 0x80 | size] if size < 126 else [0x81, 0xfe, size >> 8, size & 255]) + bytes(4) + text.encode()


def request_text(method, params=(), call_id=1):
    return json.dumps({'jsonrpc': '2.0', 'id': call_id, 'method': method, 'params': list(params)}, separators=(',', ':'))


def websocket(port, path='/rpc'):
    """A connection that has been upgraded; what came after the head of the answer is dropped."""
    raw = socket.create_connection(('127.0.0.1', port), 10)
    raw.sendall(HANDSHAKE.format(path=path, port=port).encode())
    head = b''
    while b'\r\n\r\n' not in head:
        part = raw.recv(65536)
        if not part:
            break
        head += part
    if not head.startswith(b'HTTP/1.1 101'):
        raise RuntimeError(f'no WebSocket: {head[:200]!r}')
    return raw


def answer(raw):
    """The next message of a server that has an id."""
    data = b''
    while True:
        while len(data) >= 10 or (len(data) >= 2 and data[1] < 126):
            wide = {126: 2, 127: 8}.get(data[1], 0)
            size = int.from_bytes(data[2:2 + wide], 'big') if wide else data[1]
            if len(data) < 2 + wide + size:
                break
            text, data = data[2 + wide:2 + wide + size], data[2 + wide + size:]
            if b'"id":' in text[:200]:
                return text
        part = raw.recv(1 << 20)
        if not part:
            raise RuntimeError('the connection was closed')
        data += part


def write_stage(file, count):
    """A subject configuration of so many objects with four markers each."""
    markers = '<Markers><Marker x="0" y="0" z="0"/><Marker x="120" y="0" z="0"/><Marker x="0" y="80" z="0"/>' \
              '<Marker x="40" y="60" z="30"/></Markers>'
    with open(file, 'w') as out:
        out.write('<SubjectConfiguration version="1"><Subjects>\n')
        out.writelines(f'<Subject kind="BasicObjects" name="Subject {i}">{markers}</Subject>\n' for i in range(count))
        out.write('</Subjects></SubjectConfiguration>\n')


@contextlib.contextmanager
def work_folder():
    with tempfile.TemporaryDirectory(prefix='subject-store-benchmark-') as name:
        yield pathlib.Path(name)


@contextlib.contextmanager
def process(arguments, ready, **options):
    """A process that has come so far that `ready` answers something true, which is what is given beside it."""
    child = subprocess.Popen([str(argument) for argument in arguments], **options)
    try:
        deadline = time.monotonic() + 60
        while not (answer := ready()):
            if child.poll() is not None or time.monotonic() > deadline:
                raise RuntimeError(f'{arguments[0]} did not come up')
            time.sleep(0.002)
        yield child, answer
    finally:
        child.send_signal(signal.SIGTERM)
        try:
            child.wait(20)
        except subprocess.TimeoutExpired:
            child.kill()


@contextlib.contextmanager
def host(folder, *options, data=':memory:'):
    """A host that serves: its process and its port."""
    file = pathlib.Path(folder, 'ready.json')
    file.unlink(missing_ok=True)
    arguments = [BIN / 'subject-store-host', '--headless', '--listen', '127.0.0.1:0', '--data', data, '--ready-file', file,
                 '--log', 'error', *options]
    with process(arguments, file.exists, stdout=subprocess.DEVNULL) as (child, _):
        yield child, int(json.loads(file.read_text())['url'].rsplit(':', 1)[1])


def mean(values):
    values = list(values)
    return sum(values) / len(values)
