"""A well-behaved client that calls over its WebSocket and over new connections while others misbehave."""

import socket
import time

import measure

CALL = measure.request_text('BasicObjectServices.Color', ['Subject 567'])


def post(port):
    """A call over a connection of its own."""
    with socket.create_connection(('127.0.0.1', port), 10) as raw:
        raw.sendall(f'POST /rpc HTTP/1.1\r\nHost: 127.0.0.1\r\nConnection: close\r\n'
                    f'Content-Length: {len(CALL)}\r\n\r\n{CALL}'.encode())
        answer = b''
        while part := raw.recv(65536):
            answer += part
    if b'"code":0' not in answer:
        raise RuntimeError(f'not answered: {answer[:200]!r}')


def behave(port, seconds, most):
    """Times in ms of calls over one WebSocket and over new connections, one after the other."""
    times = {'WebSocket': [], 'new connection': []}
    with measure.websocket(port) as raw:
        end = time.perf_counter() + seconds
        while time.perf_counter() < end:
            start = time.perf_counter()
            raw.sendall(measure.text_frame(CALL))
            measure.answer(raw)
            asked = time.perf_counter()
            post(port)
            times['WebSocket'].append((asked - start) * 1000)
            times['new connection'].append((time.perf_counter() - asked) * 1000)
            most()
            time.sleep(0.01)
    return times


def quantiles(times):
    ordered = sorted(times)
    p50, p99, longest = (ordered[int(q * (len(ordered) - 1))] for q in (0.5, 0.99, 1))
    return f'p50 {p50:.1f}, p99 {p99:.1f}, longest {longest:.1f} ms'


def report(what, pid, port, seconds):
    """Behaves for a while, and prints how long the calls took and what the host needed meanwhile."""
    memory = []
    before = measure.processor_seconds(pid)
    times = behave(port, seconds, lambda: memory.append(measure.resident_bytes(pid)))
    spent = (measure.processor_seconds(pid) - before) / seconds
    print(f'{what}: {len(times["WebSocket"])} calls each, none failed; WebSocket {quantiles(times["WebSocket"])}; '
          f'new connection {quantiles(times["new connection"])}; {spent * 100:.0f} % of a core, '
          f'at most {max(memory) / 1e6:.0f} MB', flush=True)
