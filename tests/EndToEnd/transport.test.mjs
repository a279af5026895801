// What carries the messages: WebSocket and HTTP, their limits, and visitors that mean no good.

import assert from 'node:assert/strict';
import http from 'node:http';
import { describe, test } from 'node:test';
import { setTimeout as sleep } from 'node:timers/promises';

import { assertSucceeds, success } from './api.mjs';
import { askColor, color, crateColor, limits, subjects } from './crate.mjs';
import { inTime, until, withHost } from './host.mjs';
import { handshake, post, RawSocket, rawRequest, request, withConnection } from './wire.mjs';

describe('WebSocket', () => {
  // A client's text frame, with an all-zero mask.
  function frame(text) {
    const payload = Buffer.from(text);
    const length = payload.length < 126 ? [0x80 | payload.length] : [0xfe, payload.length >> 8, payload.length & 255];
    return Buffer.concat([Buffer.from([0x81, ...length, 0, 0, 0, 0]), payload]);
  }

  async function upgraded(host) {
    const raw = await RawSocket.open(host);
    const headers = Object.entries(handshake).map(([name, value]) => `${name}: ${value}`);
    const upgrade = rawRequest(host, '', { method: 'GET', headers }).replace('Content-Length: 0\r\n', '');
    const head = await raw.exchange(upgrade, /^HTTP\/1\.1 101 .*\r\n\r\n/s);
    assert.match(head, /s3pPLMBiTxaQ9kYGzzhZRbK\+xOo=/);
    return raw;
  }

  test('greets first, also a client that does not wait for it', () => withHost({ subjects }, async host => {
    const raw = await upgraded(host);
    const text = await raw.exchange(Buffer.concat([frame(askColor({ id: 6 })), frame(askColor())]), /"id":7/);
    assert.match(text, /Server\.Hello.*"id":6.*"id":7/s);
    raw.socket.destroy();
  }));

  test('takes the longest message and closes on what it cannot take', () => withHost({ subjects }, async host => {
    const longest = askColor().padEnd(limits.messageBytes);
    const bytes = (...values) => Buffer.from([0x22, ...values, 0x22]);
    const unfit = [
      ['a message too long', 1009, socket => socket.send(`${longest} `)],
      ['a message too long in pieces', 1009, socket => {
        for (let i = 0; i <= 16; ++i)
          socket.send(' '.repeat(limits.messageBytes / 16), { fin: i === 16 });
      }],
      ['a binary message', 1003, socket => socket.send(Buffer.from(askColor()))],
      ['text that is not UTF-8', 1007, socket => socket.send(bytes(0xff, 0xfe), { binary: false })],
      ['text that UTF-8 says shorter', 1007, socket => socket.send(bytes(0xc0, 0xaf), { binary: false })],
    ];
    for (const [what, code, send] of unfit)
      await withConnection(host, async connection => {
        assert.deepEqual(JSON.parse(await connection.exchange(longest)), crateColor());
        send(connection.socket);
        assert.equal(await inTime(connection.closed, `the connection is closed on ${what}`), code, what);
      });
    await withConnection(host, async connection => {
      const message = askColor();
      connection.socket.send(message.slice(0, 10), { fin: false });
      connection.socket.ping();
      assert.deepEqual(JSON.parse(await connection.exchange(message.slice(10))), crateColor());
      assert.equal(await connection.close(1000), 1000);
    });
  }));

  test('answers each of many calls once', () => withHost({ subjects }, host =>
    withConnection(host, async connection => {
      const count = 3 * limits.callsInFlight;
      const calls = Array.from({ length: count }, () => connection.call(color.method, color.params));
      for (const { result } of await Promise.all(calls))
        assert.deepEqual(result, success({ ColorHtml: '#ff3366cc' }));
      assert.deepEqual(connection.unexpected, []);
    })));

  test('closes on clients that do not read their replies, and serves the others', () => withHost({ subjects }, host =>
    withConnection(host, late => withConnection(host, async other => {
      const description = JSON.stringify(await other.call('rpc.discover')).length;
      const calls = Array.from({ length: Math.ceil(8 * limits.outgoingBytes / description) },
                               (_, i) => JSON.stringify({ jsonrpc: '2.0', id: `d${i}`, method: 'rpc.discover' }));
      // The host says when it has judged a client; the others are served all the while.
      const judged = (count, what) => until(`${what} is judged`, async () => {
        assertSucceeds(await other.call(color.method, color.params), { ColorHtml: '#ff3366cc' });
        return host.stderr.split('reads too slowly').length > count;
      }, { seconds: 20, pause: 10, seen: () => host.stderr });
      late.socket.pause();
      for (const text of calls)
        late.socket.send(text);
      await judged(1, 'the client that reads late');
      late.socket.resume();
      assert.equal(await inTime(late.closed, 'the client that reads late is closed'), 1013);
      assert.ok(late.unexpected.length < calls.length);

      const never = await upgraded(host);
      never.socket.pause();
      for (const text of calls)
        never.socket.write(frame(text));
      await judged(2, 'the client that never reads');

      // Only who writes learns of the end without reading.
      const knocking = setInterval(() => never.socket.write(frame('')), 50);
      await inTime(never.ended, 'the client that never reads is closed', 10000).finally(() => clearInterval(knocking));
      assertSucceeds(await other.call(color.method, color.params), { ColorHtml: '#ff3366cc' });
    }))));
});

describe('HTTP', () => {
  test('offers what it says, and nothing else', () => withHost({ subjects }, async host => {
    const table = [
      ['GET', '/openrpc.json', 200, /^application\/json/], ['GET', '/', 200, /^text\/html/],
      ['GET', '/?x=1', 200, /^text\/html/], ['HEAD', '/', 200, /^text\/html/], ['HEAD', '/openrpc.json', 200],
      ['GET', '/rpc', 4], ['HEAD', '/rpc', 405], ['PUT', '/rpc', 405], ['DELETE', '/rpc', 405],
      ['POST', '/openrpc.json', 405], ['POST', '/', 405], ['GET', '/nowhere', 404], ['HEAD', '/nowhere', 404],
      ['POST', '/nowhere', 404], ['GET', '/rpc/', 404], ['GET', '/../etc/passwd', 404], ['GET', '//', 404],
      ['OPTIONS', '/nowhere', 204], ['POST', '/rpc?x=1', 200],
    ];
    for (const [method, path, status, type] of table) {
      const bodiless = ['GET', 'HEAD', 'OPTIONS'].includes(method);
      const answer = await request(host, { method, path, body: bodiless ? undefined : askColor() });
      assert.match(String(answer.status), new RegExp(`^${status}`), `${method} ${path}`);
      if (status === 405)
        assert.ok(answer.headers.allow, `${method} ${path} tells what is allowed`);
      if (type)
        assert.match(answer.headers['content-type'], type);
    }
    const [whole, head] = await Promise.all(['GET', 'HEAD'].map(method => request(host, { method, path: '/openrpc.json' })));
    assert.equal(Number(head.headers['content-length']), Buffer.byteLength(whole.body));
  }));

  test('reads each request in one way only, and nothing behind one that it refuses', () => withHost({ subjects },
                                                                                                  async host => {
    const at = `Host: 127.0.0.1:${host.port}\r\n`;
    const json = 'Content-Type: application/json\r\n';
    const body = askColor();
    const sized = `Content-Length: ${body.length}\r\n\r\n${body}`;
    const hidden = `POST /rpc HTTP/1.1\r\n${at}${sized}`;
    const table = [
      [`POST http://127.0.0.1:${host.port}/rpc HTTP/1.1\r\nHost: elsewhere\r\n${sized}`, 200],
      [`POST http://elsewhere/rpc HTTP/1.1\r\n${at}${sized}`, 403],
      [`HEAD / HTTP/1.1\r\n${at}\r\n`, 200],
      [`POST /rpc HTTP/1.1\r\n${at}expect: 100-Continue\r\n${json}Connection: close\r\nContent-Length: ${body.length}\r\n\r\n`, 100],
      [`POST /rpc HTTP/1.1\r\n${at}Expect: miracles\r\n${sized}`, 417],
      [`POST /rpc HTTP/1.1\r\n${at}Transfer-Encoding: gzip\r\n\r\n${hidden}`, 501],
      [`POST /rpc HTTP/1.1\r\n${sized}`, 400],
      [`POST /rpc HTTP/1.1\r\n${at}${at}${sized}`, 400],
      [`GET / HTTP/1.1\r\n${at}Content-Length: ${hidden.length}\r\n\r\n${hidden}`, 400],
      [`OPTIONS * HTTP/1.1\r\n${at}Transfer-Encoding: chunked\r\n\r\n0\r\n\r\n${hidden}`, 400],
      [`POST / HTTP/1.1\r\n${at}Content-Length: ${hidden.length}\r\n\r\n${hidden}`, 405],
    ];
    for (const [bytes, status] of table) {
      const raw = await RawSocket.open(host);
      await raw.exchange(bytes, /\r\n\r\n/);
      if (status >= 400)
        await inTime(raw.ended, `the connection is closed after ${status}`);
      assert.deepEqual([...raw.text.matchAll(/HTTP\/1\.1 (\d+)/g)].map(([, code]) => Number(code)), [status], bytes);
      if (status === 200)
        assert.equal(raw.text.includes('#ff3366cc'), bytes.startsWith('POST'), bytes);
      raw.socket.destroy();
    }
  }));

  test('keeps a connection for many requests', () => withHost({ subjects }, async host => {
    const agent = new http.Agent({ keepAlive: true, maxSockets: 1 });
    const ports = new Set();
    for (let id = 0; id < 50; ++id) {
      const fits = id % 10 !== 9;
      const { status, body, port } = await request(host, { agent, body: fits ? askColor({ id }) : 'nonsense' });
      assert.equal(status, 200);
      assert.equal(JSON.parse(body).id, fits ? id : null);
      ports.add(port);
    }
    agent.destroy();
    assert.equal(ports.size, 1);
  }));

  test('takes requests that come pipelined, in pieces and in chunks', () => withHost({ subjects }, async host => {
    const raw = await RawSocket.open(host);
    const questions = [{}, { method: 'rpc.discover', params: [] }, { method: 'foobar' }, { params: ['Barrel'] }];
    const ids = Array.from({ length: 40 }, (_, i) => i + 100);
    const pipeline = ids.map(id => rawRequest(host, askColor({ ...questions[id % questions.length], id })));
    const text = await raw.exchange(pipeline.join(''), /"id":139.*\}$/s);
    assert.deepEqual([...text.matchAll(/"id":(\d+)/g)].map(([, id]) => Number(id)), ids);

    for (const piece of rawRequest(host, askColor({ id: 140 })).match(/.{1,40}/gs)) {
      raw.socket.write(piece);
      await sleep(2);
    }
    await raw.until(/"id":140/);

    const head = rawRequest(host, '', { headers: ['Transfer-Encoding: chunked', 'Connection: close'] });
    const message = askColor({ id: 141 });
    const chunks = [message.slice(0, 20), message.slice(20), '']
      .map(chunk => `${chunk.length.toString(16)}\r\n${chunk}\r\n`);
    await raw.exchange(head.replace('Content-Length: 0\r\n', '') + chunks.join(''), /"id":141/);
    await inTime(raw.ended, 'the connection is closed as asked');
  }));

  test('takes the longest message and answers a longer one with 413', () => withHost({ subjects }, async host => {
    const longest = askColor().padEnd(limits.messageBytes);
    assert.deepEqual(JSON.parse((await request(host, { body: longest })).body), crateColor());
    const head = rawRequest(host, `${longest} `).split('\r\n\r\n')[0] + '\r\n\r\n';
    const chunked = head.replace(/Content-Length: \d+/, 'Transfer-Encoding: chunked');
    const chunk = `10000\r\n${' '.repeat(0x10000)}\r\n`;
    for (const bytes of [head, `${head}${longest} `, chunked + chunk.repeat(17),
                         head.replace(/Content-Length: \d+/, 'Content-Length: 18446744073709551615')]) {
      const raw = await RawSocket.open(host);
      const text = await raw.exchange(bytes, /\r\n\r\n/);
      assert.match(text, /^HTTP\/1\.1 413 /);
      raw.socket.destroy();
    }
    const { body } = await request(host, { body: askColor() });
    assert.deepEqual(JSON.parse(body), crateColor());
  }));

  test('refuses text that is not UTF-8', () => withHost({ subjects }, async host => {
    const edit = askColor({ method: 'BasicObjectServices.SetProximityGroupName', params: ['Crate', 'a?z'] });
    for (const bytes of [[0xff, 0xfe], [0xc0, 0xaf], [0xed, 0xa0, 0x80], [0xe2, 0x82], [0xf5, 0x80, 0x80, 0x80]]) {
      const message = Buffer.from(edit.replace('?', String.fromCharCode(...bytes)), 'latin1');
      const { body } = await request(host, { body: message });
      assert.equal(JSON.parse(body).error?.code, -32700);
    }
    assertSucceeds(await post(host, 'BasicObjectServices.ProximityGroupName', ['Crate']), { ProximityGroupName: '' });
  }));

  test('is not harmed by garbage', () => withHost({ subjects }, async host => {
    let state = 20240501;
    const random = below => {
      state = (Math.imul(state, 1664525) + 1013904223) >>> 0;
      return Math.floor(state / 2 ** 32 * below);
    };
    const good = rawRequest(host, askColor());
    const noise = Array.from({ length: 60 }, () => Buffer.alloc(random(4000)).map(() => random(256)));
    const bent = Array.from({ length: 60 }, () => {
      const bytes = Buffer.from(good);
      for (let i = random(4); i >= 0; --i)
        bytes[random(bytes.length)] = random(256);
      return bytes;
    });
    const crafted = [
      '\r\n\r\n', '\0'.repeat(100), 'GET / HTTP/9.9\r\n\r\n', 'POST /rpc HTTP/1.1\r\n\r\n',
      `GET /${'a'.repeat(1 << 20)}`,
      `GET / HTTP/1.1\r\n${'a: b\r\n'.repeat(100000)}`, 'PRI * HTTP/2.0\r\n\r\nSM\r\n\r\n',
      '\x16\x03\x01\x02\x00\x01\x00\x01\xfc\x03\x03', good.slice(0, -5),
      ...['-', '3\r\nContent-Length: ', '3\r\nTransfer-Encoding: chunked\r\nContent-Length: ']
        .map(value => good.replace('Content-Length: ', `Content-Length: ${value}`)),
    ];
    for (const bytes of [...noise, ...bent, ...crafted]) {
      const raw = await RawSocket.open(host);
      raw.socket.end(bytes, 'latin1');
      setTimeout(() => raw.socket.destroy(), 100).unref();
      if (random(2) === 0)
        await Promise.race([raw.ended, sleep(3)]);
    }
    const { body } = await request(host, { body: askColor() });
    assert.deepEqual(JSON.parse(body), crateColor());
  }));

  test('answers a connection too many with 503', () => withHost({ subjects, options: ['--max-connections', '20',
                                                                                       '--max-websockets', '20'] },
                                                                async host => {
    const ask = raw => raw.exchange(rawRequest(host, askColor()), /\r\n\r\n/);
    const upgrade = rawRequest(host, '', { method: 'GET', headers: Object.entries(handshake).map(h => h.join(': ')) });
    // WebSockets never make room.
    const webSockets = await Promise.all(Array.from({ length: 20 }, async () => {
      const raw = await RawSocket.open(host);
      return await raw.exchange(upgrade, /Server\.Hello/) && raw;
    }));
    const excess = await RawSocket.open(host);
    assert.match(await ask(excess), /^HTTP\/1\.1 503 /);
    await until('the refusal is in the log', () => /Refused 127\.0\.0\.1: there are too many connections/.test(host.stderr));
    for (const raw of [...webSockets, excess])
      raw.socket.destroy();
    await until('there is room again', async () => {
      const raw = await RawSocket.open(host);
      const text = await ask(raw);
      raw.socket.destroy();
      return text.startsWith('HTTP/1.1 200 ');
    }, { pause: 20 });
  }));
});
