#!/usr/bin/python3
"""WebSocket frames byte by byte, such as no well-behaved client sends: each is closed on with the code that says why, and
the host goes on to serve others. What the host sends is read by a protocol library that refuses what does not conform."""

import atexit
import base64
import json
import os
import pathlib
import signal
import socket
import struct
import subprocess
import sys
import tempfile
import time
import unittest

from wsproto import ConnectionType, WSConnection
from wsproto.events import AcceptConnection, CloseConnection, Ping, Pong, RejectConnection, Request, TextMessage

ROOT = pathlib.Path(__file__).resolve().parents[2]
HOST = os.environ.get('SUBJECT_STORE_HOST', str(ROOT / 'build/dev/bin/subject-store-host'))
PATIENCE = 5 * float(os.environ.get('SUBJECT_STORE_TEST_SLOWNESS', '1'))  # s
MESSAGE_BYTES = 1 << 20
CONTINUATION, TEXT, BINARY = 0, 1, 2
CONTROLS = CLOSE, PING, PONG = 8, 9, 10
CALL = json.dumps({'jsonrpc': '2.0', 'id': 7, 'method': 'BasicObjectServices.BasicObjectList'}).encode()
port = 0


def setUpModule():
    global host, folder, port
    folder = tempfile.TemporaryDirectory(prefix='subject-store-test-')
    ready = pathlib.Path(folder.name, 'ready.json')
    host = subprocess.Popen([HOST, '--headless', '--listen', '127.0.0.1:0', '--data', ':memory:', '--ready-file', ready],
                            stderr=open(pathlib.Path(folder.name, 'log'), 'w', encoding='utf-8'))
    atexit.register(host.kill)
    deadline = time.monotonic() + 3 * PATIENCE
    while not ready.exists():
        if host.poll() is not None or time.monotonic() > deadline:
            raise RuntimeError(f'the host did not come up within {3 * PATIENCE} s:\n' + host_log())
        time.sleep(0.005)
    port = int(json.loads(ready.read_text())['url'].rsplit(':', 1)[1])


def tearDownModule():
    host.send_signal(signal.SIGTERM)
    try:
        host.wait(timeout=3 * PATIENCE)
    except subprocess.TimeoutExpired as late:
        raise RuntimeError(f'the host did not end within {late.timeout} s:\n' + host_log()) from late
    log = host_log()
    folder.cleanup()
    for sign in ('Sanitizer', 'runtime error', 'could not be handled'):
        assert sign not in log, log
    assert host.returncode == 0, f'exit status {host.returncode}\n{log}'


def host_log():
    return pathlib.Path(folder.name, 'log').read_text(encoding='utf-8', errors='replace')


def resident_bytes():
    return int(pathlib.Path(f'/proc/{host.pid}/statm').read_text().split()[1]) * os.sysconf('SC_PAGE_SIZE')


def frame(opcode, payload=b'', fin=True, reserved=0, masked=True, declared=None, wide=0):
    """A client's frame. `declared`: the length that it states; `wide`: in so many bytes, whether it needs them or not."""
    size = len(payload) if declared is None else declared
    wide = wide or (0 if size < 126 else 2 if size < 65536 else 8)
    short = {0: size, 2: 126, 8: 127}[wide]
    head = bytes([fin << 7 | reserved << 4 | opcode, masked << 7 | short]) + (size.to_bytes(wide, 'big') if wide else b'')
    if not masked:
        return head + payload
    mask = bytes([0x5a, 0xa5, 0x01, 0xfe])
    pattern = mask * (len(payload) // 4 + 1)
    mixed = int.from_bytes(payload, 'big') ^ int.from_bytes(pattern[:len(payload)], 'big')
    return head + mask + mixed.to_bytes(len(payload), 'big')


def fragments(*parts):
    """A text message in several frames."""
    last = len(parts) - 1
    return b''.join(frame(TEXT if i == 0 else CONTINUATION, part, fin=i == last) for i, part in enumerate(parts))


def named(value):
    """A call with these bytes in a text."""
    return CALL[:-1] + b', "params": ["' + value + b'"]}'


class Client:
    """A WebSocket connection that has been greeted, and that sends what it is told to."""

    def __init__(self):
        self.socket = socket.create_connection(('127.0.0.1', port), PATIENCE)
        self.protocol = WSConnection(ConnectionType.CLIENT)
        self.queue = []
        self.ended = False
        self.send(self.protocol.send(Request(host=f'127.0.0.1:{port}', target='/rpc')))
        assert isinstance(self.next(), AcceptConnection)
        assert self.message()['method'] == 'Server.Hello'

    def __enter__(self):
        return self

    def __exit__(self, *_):
        self.socket.close()

    def send(self, data):
        self.socket.sendall(data)

    def next(self):
        """What comes next, as the library sees it: an event, or None at the end of the connection."""
        while not self.queue and not self.ended:
            data = self.socket.recv(65536)
            self.ended = not data
            if data:
                self.protocol.receive_data(data)
                self.queue = list(self.protocol.events())
        return self.queue.pop(0) if self.queue else None

    def message(self):
        text = ''
        while True:
            event = self.next()
            assert isinstance(event, TextMessage), event
            text += event.data
            if event.message_finished:
                return json.loads(text)

    def closed(self):
        """The code that the host closes with; then it ends the connection, too. Answers before it are passed over."""
        code = None
        while (event := self.next()) is not None:
            assert code is None, f'{event} after the close frame'
            if isinstance(event, CloseConnection):
                code = event.code
        return code


def http(text, half_close=False):
    """The whole answer to what may be an HTTP request."""
    with socket.create_connection(('127.0.0.1', port), PATIENCE) as raw:
        raw.sendall(text)
        if half_close:
            raw.shutdown(socket.SHUT_WR)
        answer = b''
        while data := raw.recv(65536):
            answer += data
            if b'\r\n\r\n' in answer and b'101 Switching' in answer:
                break
        return answer


def handshake(line='GET /rpc HTTP/1.1', **changes):
    headers = {'Host': f'127.0.0.1:{port}', 'Connection': 'Upgrade', 'Upgrade': 'websocket', 'Sec-WebSocket-Version': '13',
               'Sec-WebSocket-Key': base64.b64encode(bytes(16)).decode()}
    headers.update({name.replace('_', '-'): value for name, value in changes.items()})
    lines = [line] + [f'{name}: {value}' for name, value in headers.items() if value is not None]
    return ('\r\n'.join(lines) + '\r\n\r\n').encode()


class RawFrames(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        cls.other = Client()

    @classmethod
    def tearDownClass(cls):
        cls.other.socket.close()

    def tearDown(self):
        with Client() as client:
            self.answered(client)

    def answered(self, client, sent=frame(TEXT, CALL)):
        client.send(sent)
        answer = client.message()
        self.assertEqual((answer['id'], answer['result']['code']), (7, 0))

    def closes(self, cases):
        for what, code, sent in cases:
            with self.subTest(what), Client() as client:
                try:
                    client.send(sent)
                except ConnectionError:
                    pass  # the host may have judged before it had everything
                self.assertEqual(client.closed(), code)
                self.answered(self.other)

    def test_what_breaks_the_framing_is_a_protocol_error(self):
        self.closes([
            ('a frame that is not masked', 1002, frame(TEXT, CALL, masked=False)),
            ('a control frame that is not masked', 1002, frame(PING, b'x', masked=False)),
            ('a continuation of nothing', 1002, frame(CONTINUATION, CALL)),
            ('a continuation after the end', 1002, frame(TEXT, CALL) + frame(CONTINUATION, b' ')),
            ('a new message within another', 1002, frame(TEXT, CALL[:9], fin=False) + frame(TEXT, CALL)),
            ('a binary message within another', 1002, frame(TEXT, CALL[:9], fin=False) + frame(BINARY, b'x')),
            *[(f'a control frame {opcode} of 126 bytes', 1002, frame(opcode, b'x' * 126)) for opcode in CONTROLS],
            *[(f'a control frame {opcode} in pieces', 1002, frame(opcode, b'', fin=False)) for opcode in CONTROLS],
            *[(f'reserved bits {bits}', 1002, frame(TEXT, CALL, reserved=bits)) for bits in range(1, 8)],
            *[(f'opcode {opcode}', 1002, frame(opcode, CALL)) for opcode in (3, 4, 5, 6, 7, 11, 12, 13, 14, 15)],
            ('a short length in two bytes', 1002, frame(TEXT, CALL, wide=2)),
            ('a short length in eight bytes', 1002, frame(TEXT, CALL, wide=8)),
        ])

    def test_text_that_is_not_utf8_is_refused(self):
        self.closes([
            *[(f'{value!r}', 1007, frame(TEXT, named(value)))
              for value in (b'\xff', b'\xc0\xaf', b'\xe0\x80\x80', b'\xed\xa0\x80', b'\xf4\x90\x80\x80', b'\xe2\x82',
                            b'\x80')],
            ('a character that ends with the message', 1007, frame(TEXT, b'"\xe2\x82')),
            ('a wrong second half in another frame', 1007, fragments(b'"\xe2', b'\x28"')),
            ('the first half of a character, and the end', 1007, fragments(b'"\xe2', b'')),
        ])

    def test_what_is_too_long_or_of_the_wrong_kind_is_refused(self):
        longest = CALL.ljust(MESSAGE_BYTES)
        piece = b' ' * (MESSAGE_BYTES // 4)
        self.closes([
            ('a length that is one too many', 1009, frame(TEXT, declared=MESSAGE_BYTES + 1)),
            ('a length of 2^62', 1009, frame(TEXT, declared=1 << 62)),
            ('a message that is one byte too long', 1009, frame(TEXT, longest + b' ')),
            ('pieces that are one byte too long', 1009, fragments(*[piece] * 4, b' ')),
            ('a last piece whose length says so', 1009,
             frame(TEXT, longest, fin=False) + frame(CONTINUATION, declared=1)),
            ('a binary message', 1003, frame(BINARY, CALL)),
            ('an empty binary message', 1003, frame(BINARY)),
        ])
        with Client() as client:
            self.answered(client, fragments(*[longest[i:i + 65536] for i in range(0, MESSAGE_BYTES, 65536)]))

    def test_a_message_in_pieces_is_one_message(self):
        with Client() as client:
            self.answered(client, fragments(*[CALL[i:i + 1] for i in range(len(CALL))]))
            self.answered(client, fragments(b'', CALL[:9], b'', CALL[9:], b''))
            # Each ping between the pieces is answered before the message is.
            last = len(CALL) - 1
            pieces = [frame(CONTINUATION if i else TEXT, CALL[i:i + 1], fin=i == last) for i in range(len(CALL))]
            client.send(b''.join(piece + frame(PING, bytes([i])) for i, piece in enumerate(pieces[:-1])))
            for i in range(len(pieces) - 1):
                self.assertEqual(bytes(client.next().payload), bytes([i]))
            self.answered(client, pieces[-1])
            client.send(frame(PONG, b'nobody asked'))
            self.answered(client)

    def test_a_character_may_be_split_between_pieces(self):
        text = '{"jsonrpc":"2.0","id":"½€😀","method":"BasicObjectServices.BasicObjectList"}'.encode()
        with Client() as client:
            client.send(fragments(*[text[i:i + 1] for i in range(len(text))]))
            self.assertEqual(client.message()['id'], '½€😀')

    def test_a_goodbye_is_answered_and_ends_the_connection(self):
        def close(code, reason=b''):
            return frame(CLOSE, struct.pack('>H', code) + reason)

        self.closes([
            ('no code', 1000, frame(CLOSE)),
            *[(f'code {code}', code, close(code, 'até logo'.encode()))
              for code in (1000, 1001, 1002, 1003, 1007, 1011, 3000, 4999)],
            ('the longest reason', 1000, close(1000, b'x' * 123)),
            ('half a code', 1002, frame(CLOSE, b'\x03')),
            *[(f'code {code}', 1002, close(code)) for code in (0, 999, 1004, 1005, 1006, 1015, 1016, 2999)],
            # Whatever comes after a goodbye is not looked at.
            ('a call after it', 1000, close(1000) + frame(TEXT, CALL)),
            ('garbage after it', 1000, close(1000) + b'\xff' * 1000),
            ('a second one after it', 1000, close(1000) + close(1001)),
        ])
        for code in (5000, 65535):  # the library reads these as 1002, whatever the host says
            with self.subTest(f'code {code}'), Client() as client:
                client.send(close(code, b'x' * 123))
                self.assertEqual(client.socket.recv(4), b'\x88\x02\x03\xea')
        with self.subTest('a reason that is not UTF-8'), Client() as client:
            client.send(close(1000, b'\xff\xfe'))
            self.assertIn(client.closed(), (1002, 1007))

    def test_pings_without_end_do_no_harm(self):
        with self.subTest('that are read'), Client() as client:
            for start in range(0, 20000, 200):
                client.send(b''.join(frame(PING, struct.pack('>I', i) * 31) for i in range(start, start + 200)))
                for i in range(start, start + 200):
                    event = client.next()
                    self.assertIsInstance(event, Pong)
                    self.assertEqual(bytes(event.payload), struct.pack('>I', i) * 31)
            self.answered(client)
        with self.subTest('that are not read'), Client() as client, Client() as other:
            before = resident_bytes()
            flood = memoryview(frame(PING, b'x' * 125) * 5000)
            client.socket.settimeout(0.5)
            sent = 0
            try:
                while sent < 256 << 20:
                    sent += client.socket.send(flood)
            except TimeoutError:
                pass  # the host waits until somebody reads
            self.assertLess(sent, 256 << 20)
            self.assertLess(resident_bytes() - before, PATIENCE * (4 << 20))
            self.answered(self.other)

    def test_a_connection_that_is_only_half_there_does_no_harm(self):
        idle = [socket.create_connection(('127.0.0.1', port), PATIENCE) for _ in range(20)]
        for raw in idle[:10]:
            raw.sendall(handshake())
        for raw in idle[15:]:
            raw.sendall(handshake()[:30])
        self.answered(self.other)
        for raw in idle:
            raw.close()
        with self.subTest('a client that sends nothing more'), Client() as client:
            client.send(frame(TEXT, CALL))
            client.socket.shutdown(socket.SHUT_WR)
            client.closed()
        with self.subTest('an end within a frame'), Client() as client:
            client.send(frame(TEXT, CALL)[:9])
            client.socket.shutdown(socket.SHUT_WR)
            client.closed()
        with self.subTest('a reset'), Client() as client:
            client.send(frame(TEXT, CALL) * 100)
            client.socket.setsockopt(socket.SOL_SOCKET, socket.SO_LINGER, struct.pack('ii', 1, 0))
        post = f'POST /rpc HTTP/1.1\r\nHost: 127.0.0.1:{port}\r\nContent-Length: {len(CALL)}\r\n\r\n'.encode() + CALL
        self.assertIn(b'"id":7', http(post, half_close=True))

    def test_an_upgrade_that_is_not_right_is_told_by_status(self):
        for what, status, sent in [
            ('as it should be', b'101', handshake()),
            ('in other words', b'101', handshake(Connection='keep-alive, upgrade', Upgrade='WebSocket')),
            ('without a key', b'400', handshake(Sec_WebSocket_Key=None)),
            ('with too long a key', b'400', handshake(Sec_WebSocket_Key='a' * 200)),
            ('without a version', b'400', handshake(Sec_WebSocket_Version=None)),
            ('of version 8', b'426', handshake(Sec_WebSocket_Version='8')),
            ('of version 14', b'426', handshake(Sec_WebSocket_Version='14')),
            ('of HTTP/1.0', b'405', handshake('GET /rpc HTTP/1.0')),
            ('posted', b'405', handshake('PUT /rpc HTTP/1.1', Content_Length='0')),
            ('elsewhere', b'404', handshake('GET / HTTP/1.1')),
            ('without Connection', b'405', handshake(Connection=None)),
            ('without Upgrade', b'405', handshake(Upgrade=None)),
            ('to something else', b'405', handshake(Upgrade='h2c')),
            ('without Host', b'400', handshake(Host=None)),
            ('with a foreign origin', b'403', handshake(Origin='https://elsewhere.example')),
            ('with a long header', b'431', handshake(X_Long='a' * 20000)),
            ('with many headers', b'431', handshake(**{f'X_{i}': 'a' for i in range(3000)})),
            ('with a space before the colon', b'400', handshake().replace(b'Upgrade:', b'Upgrade :')),
            ('with NUL in a header', b'400', handshake(X_Nul='a\0b')),
            ('with two keys', b'400', handshake().replace(b'Upgrade: w', b'Sec-WebSocket-Key: AAAA\r\nUpgrade: w')),
            ('with a body', b'400', handshake(Content_Length='5') + b'12345'),
            ('with a frame that comes before the answer', b'400', handshake() + frame(TEXT, CALL)),
        ]:
            with self.subTest(what):
                answer = http(sent.replace(b'\r\n\r\n', b'\r\nX-End: 1\r\n\r\n', 1), half_close=not status.startswith(b'1'))
                self.assertEqual(answer[:13], b'HTTP/1.1 ' + status + b' ', answer)
                if status == b'426':
                    self.assertIn(b'Sec-WebSocket-Version: 13', answer)


if __name__ == '__main__':
    if not os.access(HOST, os.X_OK):
        sys.exit(f'{HOST}: build it first')
    unittest.main()
