// The wire protocol: envelopes, arguments, notifications, limits, and what HTTP and WebSocket add.

import assert from 'node:assert/strict';
import http from 'node:http';
import { after, afterEach, before, beforeEach, describe, test } from 'node:test';
import { setTimeout as sleep } from 'node:timers/promises';

import { assertSucceeds, changed, codes, snapshot, success } from './api.mjs';
import { inTime, startHost, withHost } from './host.mjs';
import { Connection, post, RawSocket, rawRequest, request, withConnection } from './wire.mjs';

const subjects = [{ name: 'Crate', parameters: { ColourRGBA: '#ff3366cc' } }, { name: 'Barrel' }];

const limits = { messageBytes: 1048576, nesting: 32, batchCalls: 256, connections: 1100, subscriptions: 64,
                 callsInFlight: 1024, outgoingBytes: 8388608 };

const color = { jsonrpc: '2.0', method: 'BasicObjectServices.Color', params: ['Crate'] };
const crateColor = id => ({ jsonrpc: '2.0', id, result: success({ ColorHtml: '#ff3366cc' }) });

// A request for a colour, with members replaced or (when undefined) left out.
function variant(members) {
  return JSON.stringify({ ...color, id: 7, ...members });
}

function call(method, params) {
  return JSON.stringify({ jsonrpc: '2.0', id: 7, method, params });
}

function nested(depth) {
  return '['.repeat(depth) + ']'.repeat(depth);
}

function assertRpcError(answer, code, ids, says = /./) {
  assert.deepEqual(Object.keys(answer).sort(), ['error', 'id', 'jsonrpc']);
  assert.equal(answer.jsonrpc, '2.0');
  assert.equal(answer.error.code, code);
  assert.match(answer.error.message, says);
  assert.ok(ids.includes(answer.id), `id ${answer.id}`);
}

describe('a message', () => {
  let host;
  let connection;
  let untouched;

  before(async () => {
    host = await startHost({ subjects });
    connection = await Connection.open(host);
    untouched = await snapshot(connection);
    connection.socket.terminate();
  });

  beforeEach(async () => {
    connection = await Connection.open(host);
  });

  // Whatever a test sends, nothing has changed after it, and each message was answered once.
  afterEach(async () => {
    try {
      assert.deepEqual(await snapshot(connection), untouched);
      assert.deepEqual(connection.unexpected, []);
    } finally {
      connection.socket.terminate();
    }
  });

  after(() => host.assertEndsWell());

  // The answers to one message over both transports, as texts.
  async function answers(message) {
    const { status, headers, body } = await request(host, { body: message });
    assert.equal(status, 200);
    assert.match(headers['content-type'], /^application\/json/);
    return [body, await connection.exchange(message)];
  }

  const notJson = [
    '', ' ', '{', 'nonsense', '{"jsonrpc": "2.0", "method": "foobar, "params": "bar", "baz]',
    '[{"jsonrpc": "2.0", "method": "sum", "params": [1,2,4], "id": "1"},{"jsonrpc": "2.0", "method"]',
    `${variant({})}x`, `${variant({})}${variant({})}`, `[${variant({})},]`, variant({}).replace('"id":7', '"id":7,'),
    variant({}).replace('7', '07'), variant({}).replace('7', '+7'), variant({}).replace('7', '.7'), variant({}).replace('7', '0x7'),
    variant({}).replace('7', 'NaN'), variant({}).replaceAll('"', "'"), variant({}).replace('Crate', 'Cr\nate'),
    variant({}).replace('Crate', 'Cr\\xate'), `\ufeff${variant({})}`, `${variant({})}\u0000`,
    variant({}).replace('["Crate"]', nested(limits.nesting + 2)), nested(100000), '{"a":'.repeat(100000),
  ];
  test('that is not JSON is a parse error', async () => {
    for (const message of notJson)
      for (const answer of await answers(message))
        assertRpcError(JSON.parse(answer), -32700, [null]);
  });

  const notRequests = [
    '1', '"text"', 'null', 'true', '{}', '[]', '{"jsonrpc": "2.0", "method": 1, "params": "bar"}',
    variant({ jsonrpc: '1.0' }), variant({ jsonrpc: 2.0 }), variant({ jsonrpc: '2' }), variant({ jsonrpc: undefined }),
    variant({ jsonrpc: null }), variant({ method: undefined }), variant({ method: 1 }), variant({ method: null }),
    variant({ params: 'Crate' }), variant({ params: null }), variant({ params: 1 }), variant({ id: {} }), variant({ id: [1] }),
    variant({ id: true }),
    ...['"jsonrpc":"2.0"', '"method":"BasicObjectServices.BasicObjectList"', '"params":["Barrel"]', '"id":7', '"i\\u0064":7']
      .map(member => `${variant({}).slice(0, -1)},${member}}`),
    `[${Array(limits.batchCalls + 1).fill(variant({})).join()}]`,
  ];
  test('that is no request is refused', async () => {
    for (const message of notRequests)
      for (const answer of await answers(message))
        assertRpcError(JSON.parse(answer), -32600, [null, 7]);
  });

  const requests = [
    ['by position', variant({}), crateColor(7)],
    ['by name', variant({ params: { Name: 'Crate' } }), crateColor(7)],
    ['with white space', ` \t\r\n${JSON.stringify({ ...color, id: 7 }, null, '\t')} \r\n`, crateColor(7)],
    ['in escapes', variant({}).replace('Color', '\\u0043olor').replace('Crate', 'C\\u0072ate').replace('2.0', '2\\u002e0'),
     crateColor(7)],
    ['with another member', variant({ extra: { deep: [1] } }), crateColor(7)],
    ['without params', call('BasicObjectServices.BasicObjectList'), { jsonrpc: '2.0', id: 7, result: success({ Names: ['Barrel', 'Crate'] }) }],
    ['with empty by-name params', call('BasicObjectServices.BasicObjectList', {}),
     { jsonrpc: '2.0', id: 7, result: success({ Names: ['Barrel', 'Crate'] }) }],
    ...[null, 0, -1, '', '1', 'é "\\\u0001 \u2028', 1.5].map(id => [`with id ${JSON.stringify(id)}`, variant({ id }), crateColor(id)]),
    ['as the only one of a batch', `[${variant({})}]`, [crateColor(7)]],
    ['as one of the most that a batch takes', `[${Array(limits.batchCalls).fill(variant({})).join()}]`,
     Array(limits.batchCalls).fill(crateColor(7))],
  ];
  for (const [how, message, expected] of requests)
    test(`that asks ${how} is answered`, async () => {
      for (const answer of await answers(message))
        assert.deepEqual(JSON.parse(answer), expected);
    });

  test('has its id answered digit by digit', async () => {
    for (const id of ['9007199254740993', '18446744073709551615', '-9223372036854775808', '0.1000'])
      for (const answer of await answers(variant({}).replace('"id":7', `"id":${id}`)))
        assert.match(answer, new RegExp(`"id":${id}[,}]`));
  });

  test('of many requests is answered for each that is not a notification', async () => {
    const mix = [{ ...color, id: '1' }, color, { foo: 'boo' }, { ...color, method: 'foo.get', id: '5' }, 1,
                 { ...color, method: 'foo.get' }, { ...color, params: { Name: 'Crate' }, id: 9 },
                 { ...color, method: 'BasicObjectServices.BasicObjectList', params: [], id: 10 }];
    for (const text of await answers(JSON.stringify(mix))) {
      const list = JSON.parse(text);
      const withId = id => list.filter(answer => answer.id === id);
      assert.equal(list.length, 6);
      assert.deepEqual(withId('1'), [crateColor('1')]);
      assert.deepEqual(withId(9), [crateColor(9)]);
      assert.deepEqual(withId(10), [{ jsonrpc: '2.0', id: 10, result: success({ Names: ['Barrel', 'Crate'] }) }]);
      assertRpcError(withId('5')[0], -32601, ['5']);
      assert.equal(withId(null).length, 2);
      for (const answer of withId(null))
        assertRpcError(answer, -32600, [null]);
    }
    for (const text of await answers('[1,2,3]')) {
      const list = JSON.parse(text);
      assert.equal(list.length, 3);
      for (const answer of list)
        assertRpcError(answer, -32600, [null]);
    }
  });

  const unknownMethods = ['foobar', '', 'BasicObjectServices', 'BasicObjectServices.', 'BasicObjectServices.color',
                          'BasicObjectServices.Color ', 'Color', 'Server.Hello', 'Server.subscribe', 'rpc.', 'rpc.Discover', changed];
  test('for an unknown method is refused', async () => {
    for (const method of unknownMethods)
      for (const answer of await answers(variant({ method })))
        assertRpcError(JSON.parse(answer), -32601, [7]);
  });

  const badNames = [
    [variant({ params: {} }), /"Name"/],
    [variant({ params: { name: 'Crate' } }), /"[Nn]ame"/],
    [variant({ params: { Name: 'Crate', ColorHtml: '#112233' } }), /"ColorHtml"/],
    [variant({ params: { Name: 'Crate', 'N "b"\n': 1 } }), /N/],
    [variant({}).replace('["Crate"]', '{"Name":"Crate","Name":"Crate"}'), /"Name"/],
    [variant({}).replace('["Crate"]', '{"Name":"Crate","\\u004eame":"Barrel"}'), /"Name"/],
    [call('BasicObjectServices.SetEnabled', { Name: 'Crate' }), /"Enabled"/],
    [call('BasicObjectServices.BasicObjectList', { Name: 'Crate' }), /"Name"/],
    ...['Subscribe', 'Unsubscribe'].flatMap(name => [undefined, [], [1], [changed, changed], [[changed]], { Name: 1 }, {},
                                                      { Callback: changed }]
      .map(params => [call(`Server.${name}`, params), /./])),
  ];
  test('with wrong parameter names is refused with the name', async () => {
    for (const [message, says] of badNames)
      for (const answer of await answers(message))
        assertRpcError(JSON.parse(answer), -32602, [7], says);
  });

  const set = params => call('BasicObjectServices.SetEnabled', params);
  const first = 'argument 1 "Name": expected a text';
  const second = 'argument 2 "Enabled": expected true or false';
  const badArguments = [
    [set(undefined), first], [set([]), first], [set([1, false]), first], [set([null, false]), first],
    [set([['Crate'], false]), first], [set([{ Name: 'Crate' }, false]), first], [set({ Enabled: false, Name: 1 }), first],
    [set(['Crate']), second], [set(['Crate', 'false']), second], [set(['Crate', 0]), second], [set(['Crate', null]), second],
    [set(['Crate', [false]]), second], [set({ Enabled: 0, Name: 'Crate' }), second],
    [set(['Crate', 18446744073709551616]), second], [set(['Crate', -1e300]), second],
    [set(['Crate', 'x']).replace('"x"', '1e400'), second], [set(['Crate', 'x']).replace('"x"', '9'.repeat(400)), second],
    [set(['Crate', false, 1]), 'no further argument'], [call('BasicObjectServices.BasicObjectList', [1]), 'no further argument'],
    [variant({ params: ['Crate', '#112233'] }), 'no further argument'],
    [variant({}).replace('["Crate"]', nested(limits.nesting / 2)), 'expected a text'],
  ];
  test('with wrong arguments is refused with the argument', async () => {
    for (const [message, says] of badArguments)
      for (const text of await answers(message)) {
        const { id, error } = JSON.parse(text);
        const { detail, ...data } = error.data ?? {};
        assert.deepEqual({ id, error: { ...error, data } },
                         { id: 7, error: { code: codes.InvalidFormat | 0, message: 'InvalidFormat',
                                           data: { code: codes.InvalidFormat, text: '' } } }, message);
        assert.ok(detail?.includes(says), `${message}: ${detail}`);
      }
  });

  test('with half a surrogate pair changes nothing', async () => {
    for (const half of ['\\ud800', '\\udc00', '\\ud800x', '\\udc00\\ud800'])
      for (const text of await answers(call('BasicObjectServices.Rename', ['Crate', 'half']).replace('half', half)))
        assert.ok(JSON.parse(text).error, text);
  });

  test('without an id is carried out and not answered', async () => {
    const edit = colour => ({ jsonrpc: '2.0', method: 'BasicObjectServices.SetColor', params: ['Barrel', colour] });
    const silent = [edit('#010101'), [edit('#020202'), edit('#030303')], edit('red'), { ...color, method: 'foobar' },
                    { ...color, params: { Nobody: 1 } }, { jsonrpc: '2.0', method: 'rpc.discover' }, edit('#ffffffff')];
    for (const message of silent) {
      const { status, body } = await request(host, { body: JSON.stringify(message) });
      assert.ok(status >= 200 && status < 300 && body === '', `${status} ${body}`);
      connection.socket.send(JSON.stringify(message));
      const answer = await connection.call('BasicObjectServices.Color', ['Barrel']);
      const last = [message].flat().at(-1);
      if (last.method.endsWith('SetColor') && last.params[1] !== 'red')
        assertSucceeds(answer, { ColorHtml: last.params[1].replace(/^#(?=.{6}$)/, '#ff') });
    }
    assert.deepEqual(connection.unexpected, []);
  });
});

describe('notifications', () => {
  const group = 'BasicObjectServices.*';
  const edit = (connection, colour) => connection.call('BasicObjectServices.SetColor', ['Crate', colour]);

  function assertSubscription(answer, connection, name) {
    const { sequence } = answer.result;
    assert.ok(Number.isInteger(sequence) && sequence >= 0);
    assert.deepEqual(answer.result, { code: codes[name], name, outputs: {}, epoch: connection.hello.params.epoch, sequence });
    return sequence;
  }

  test('begin with a greeting, new in session and epoch', async () => {
    const epochs = new Set();
    for (let start = 0; start < 2; ++start)
      await withHost({ subjects }, host => withConnection(host, one => withConnection(host, another => {
        for (const { hello } of [one, another]) {
          const { session, epoch } = hello.params;
          assert.deepEqual(hello, { jsonrpc: '2.0', method: 'Server.Hello', params: {
            session, epoch, limits, levels: { open: 2, preview: 1, granted: 2 } } });
          assert.ok(Number.isInteger(session));
          assert.equal(epoch, one.hello.params.epoch);
          epochs.add(epoch);
        }
        assert.notEqual(one.hello.params.session, another.hello.params.session);
      })));
    assert.equal(epochs.size, 2);
  });

  test('come to whoever subscribed, as often as there was a change', () => withHost({ subjects }, host =>
    withConnection(host, connection => withConnection(host, async editor => {
      const ask = async (name, what, result) =>
        assertSubscription(await connection.call(`Server.${name}`, what), connection, result);
      // How many notifications come for one change: those that are there before the answer to a later query.
      let latest = -1;
      const told = async colour => {
        await edit(editor, colour);
        await connection.call('BasicObjectServices.BasicObjectList');
        const arrived = connection.notifications.splice(0);
        for (const { method, params } of arrived) {
          assert.equal(method, changed);
          assert.ok(params.sequence > latest);
          latest = params.sequence;
        }
        return arrived.length;
      };

      await ask('Unsubscribe', [changed], 'OkButNoEffect');
      assert.equal(await told('#000001'), 0);
      latest = await ask('Subscribe', [changed], 'Ok');
      assert.equal(await told('#000002'), 1);
      await ask('Subscribe', { Name: changed }, 'OkButNoEffect');
      assert.equal(await told('#000003'), 1);
      await ask('Unsubscribe', { Name: changed }, 'Ok');
      assert.equal(await told('#000004'), 0);
      await ask('Subscribe', [group], 'Ok');
      await ask('Subscribe', [group], 'OkButNoEffect');
      assert.equal(await told('#000005'), 1);
      await connection.call('Server.Subscribe', [changed]);
      assert.equal(await told('#000006'), 1);
      await ask('Unsubscribe', [group], 'Ok');
      await connection.call('Server.Unsubscribe', [changed]);
      assert.equal(await told('#000007'), 0);
      connection.notify('Server.Subscribe', [changed]);
      assert.equal(await told('#000008'), 1);
      connection.notify('Server.Unsubscribe', [group]);
      await connection.call('Server.Unsubscribe', [changed]);
      assert.equal(await told('#000009'), 0);
      assert.deepEqual(editor.notifications, []);

      for (const name of ['', 'Nobody', '*', '.*', 'Basic*', 'BasicObjectServices', 'BasicObjectServices.', 'Basic.*', 'Nobody.*',
                          'BasicObjectServices.Color', changed.toLowerCase(), `${changed}.*`, 'Server.Hello'])
        for (const ask of ['Server.Subscribe', 'Server.Unsubscribe']) {
          const { error } = await connection.call(ask, [name]);
          assert.deepEqual([error?.code, error?.message, error?.data.code], [codes.NotFound | 0, 'NotFound', codes.NotFound], name);
        }
      for (const ask of ['Server.Subscribe', 'Server.Unsubscribe'])
        for (const name of [changed, group]) {
          const { error } = await post(host, ask, [name]);
          assert.deepEqual([error?.code, error?.message, error?.data.code],
                           [codes.NotSupported | 0, 'NotSupported', codes.NotSupported]);
        }
    }))));

  test('count for the whole server, the last of a burst too', () => withHost({ subjects }, host =>
    withConnection(host, one => withConnection(host, async another => {
      const sequences = await Promise.all([one, another].map(async connection =>
        assertSubscription(await connection.call('Server.Subscribe', [changed]), connection, 'Ok')));
      const colours = Array.from({ length: 3000 }, (_, i) => `#${(0x100000 + i).toString(16)}`);
      await Promise.all(colours.map((colour, i) => edit([one, another][i % 2], colour)));
      await Promise.all([one, another].map(connection => connection.call('BasicObjectServices.BasicObjectList')));
      const now = assertSubscription(await one.call('Server.Subscribe', [changed]), one, 'OkButNoEffect');
      for (const [i, { notifications }] of [one, another].entries()) {
        const received = notifications.map(({ params }) => params.sequence);
        assert.deepEqual(received, [...new Set(received)].sort((a, b) => a - b));
        assert.ok(received[0] > sequences[i]);
        assert.equal(received.at(-1), now);
      }
    }))));
});

describe('WebSocket', () => {
  // A client's text frame, with an all-zero mask.
  function frame(text) {
    const payload = Buffer.from(text);
    const head = payload.length < 126 ? [0x81, 0x80 | payload.length] : [0x81, 0xfe, payload.length >> 8, payload.length & 255];
    return Buffer.concat([Buffer.from([...head, 0, 0, 0, 0]), payload]);
  }

  async function upgraded(host) {
    const raw = await RawSocket.open(host);
    const upgrade = rawRequest(host, '', { method: 'GET', headers: [
      'Connection: Upgrade', 'Upgrade: websocket', 'Sec-WebSocket-Version: 13', 'Sec-WebSocket-Key: dGhlIHNhbXBsZSBub25jZQ=='] });
    const head = await raw.exchange(upgrade.replace('Content-Length: 0\r\n', ''), /^HTTP\/1\.1 101 .*\r\n\r\n/s);
    assert.match(head, /s3pPLMBiTxaQ9kYGzzhZRbK\+xOo=/);
    return raw;
  }

  test('greets first, also a client that does not wait for it', () => withHost({ subjects }, async host => {
    const raw = await upgraded(host);
    const text = await raw.exchange(Buffer.concat([frame(variant({ id: 6 })), frame(variant({}))]), /"id":7/);
    assert.match(text, /Server\.Hello.*"id":6.*"id":7/s);
    raw.socket.destroy();
  }));

  test('takes the longest message and closes on what it cannot take', () => withHost({ subjects }, async host => {
    const longest = variant({}).padEnd(limits.messageBytes);
    const unfit = [
      ['a message too long', 1009, socket => socket.send(`${longest} `)],
      ['a message too long in pieces', 1009, socket => {
        for (let i = 0; i <= 16; ++i)
          socket.send(' '.repeat(limits.messageBytes / 16), { fin: i === 16 });
      }],
      ['a binary message', 1003, socket => socket.send(Buffer.from(variant({})))],
      ['text that is not UTF-8', 1007, socket => socket.send(Buffer.from([0x22, 0xff, 0xfe, 0x22]), { binary: false })],
      ['text that UTF-8 could say shorter', 1007, socket => socket.send(Buffer.from([0x22, 0xc0, 0xaf, 0x22]), { binary: false })],
    ];
    for (const [what, code, send] of unfit)
      await withConnection(host, async connection => {
        assert.deepEqual(JSON.parse(await connection.exchange(longest)), crateColor(7));
        send(connection.socket);
        assert.equal(await inTime(connection.closed, `the connection is closed on ${what}`), code, what);
      });
    await withConnection(host, async connection => {
      const message = variant({});
      connection.socket.send(message.slice(0, 10), { fin: false });
      connection.socket.ping();
      assert.deepEqual(JSON.parse(await connection.exchange(message.slice(10))), crateColor(7));
      assert.equal(await connection.close(1000), 1000);
    });
  }));

  test('answers each of many calls once', () => withHost({ subjects }, host => withConnection(host, async connection => {
    const count = 3 * limits.callsInFlight;
    const answers = await Promise.all(Array.from({ length: count }, () => connection.call(color.method, color.params)));
    assert.deepEqual(new Set(answers.map(({ id }) => id)).size, count);
    for (const { result } of answers)
      assert.deepEqual(result, success({ ColorHtml: '#ff3366cc' }));
    assert.deepEqual(connection.unexpected, []);
  })));

  test('closes on clients that do not read their replies, and serves the others', () => withHost({ subjects }, host =>
    withConnection(host, late => withConnection(host, async other => {
      const description = JSON.stringify(await other.call('rpc.discover')).length;
      const calls = Array.from({ length: Math.ceil(8 * limits.outgoingBytes / description) },
                               (_, i) => JSON.stringify({ jsonrpc: '2.0', id: `d${i}`, method: 'rpc.discover' }));
      const never = await upgraded(host);
      for (const { socket } of [late, never])
        socket.pause();
      for (const text of calls) {
        late.socket.send(text);
        never.socket.write(frame(text));
      }
      for (let i = 0; i < 20; ++i) {
        assertSucceeds(await other.call(color.method, color.params), { ColorHtml: '#ff3366cc' });
        await sleep(10);
      }
      late.socket.resume();
      assert.equal(await inTime(late.closed, 'the client that reads late is closed'), 1013);
      assert.ok(late.unexpected.length < calls.length);

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
      ['GET', '/rpc', 4], ['PUT', '/rpc', 405], ['DELETE', '/rpc', 405], ['POST', '/openrpc.json', 405], ['POST', '/', 405],
      ['GET', '/nowhere', 404], ['POST', '/nowhere', 404], ['GET', '/rpc/', 404], ['GET', '/../etc/passwd', 404], ['GET', '//', 404],
    ];
    for (const [method, path, status, type] of table) {
      const answer = await request(host, { method, path, body: method === 'GET' ? undefined : variant({}) });
      assert.match(String(answer.status), new RegExp(`^${status}`), `${method} ${path}`);
      if (status === 405)
        assert.ok(answer.headers.allow, `${method} ${path} tells what is allowed`);
      if (type)
        assert.match(answer.headers['content-type'], type);
    }
  }));

  test('keeps a connection for many requests, also pipelined, in pieces, or the last one', () => withHost({ subjects }, async host => {
    const agent = new http.Agent({ keepAlive: true, maxSockets: 1 });
    const ports = new Set();
    for (let i = 0; i < 50; ++i) {
      const { status, body, port } = await request(host, { agent, body: i % 10 === 9 ? 'nonsense' : variant({ id: i }) });
      assert.equal(status, 200);
      assert.equal(JSON.parse(body).id, i % 10 === 9 ? null : i);
      ports.add(port);
    }
    agent.destroy();
    assert.equal(ports.size, 1);

    const raw = await RawSocket.open(host);
    const methods = [color.method, 'rpc.discover', 'BasicObjectServices.BasicObjectList', 'foobar'];
    const ids = Array.from({ length: 40 }, (_, i) => i + 100);
    const requests = ids.map(id => rawRequest(host, variant({ id, method: methods[id % 4], params: id % 4 ? [] : ['Crate'] })));
    const text = await raw.exchange(requests.join(''), /"id":139.*\}$/s);
    assert.deepEqual([...text.matchAll(/"id":(\d+)/g)].map(([, id]) => Number(id)), ids);
    raw.text = '';
    for (const piece of rawRequest(host, variant({ id: 140 })).match(/.{1,40}/gs)) {
      raw.socket.write(piece);
      await sleep(2);
    }
    await raw.until(/"id":140/);
    const chunked = rawRequest(host, '', { headers: ['Transfer-Encoding: chunked', 'Connection: close'] })
      .replace('Content-Length: 0\r\n', '');
    const message = variant({ id: 141 });
    const chunks = [message.slice(0, 20), message.slice(20), ''].map(chunk => `${chunk.length.toString(16)}\r\n${chunk}\r\n`);
    await raw.exchange(chunked + chunks.join(''), /"id":141/);
    await inTime(raw.ended, 'the connection is closed as asked');
  }));

  test('takes the longest message and answers a longer one with 413', () => withHost({ subjects }, async host => {
    const longest = variant({}).padEnd(limits.messageBytes);
    assert.deepEqual(JSON.parse((await request(host, { body: longest })).body), crateColor(7));
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
    const { body } = await request(host, { body: variant({}) });
    assert.deepEqual(JSON.parse(body), crateColor(7));
  }));

  test('refuses text that is not UTF-8', () => withHost({ subjects }, async host => {
    for (const bytes of [[0xff, 0xfe], [0xc0, 0xaf], [0xed, 0xa0, 0x80], [0xe2, 0x82], [0xf5, 0x80, 0x80, 0x80]]) {
      const [start, end] = call('BasicObjectServices.SetProximityGroupName', ['Crate', 'a?z']).split('?');
      const { body } = await request(host, { body: Buffer.concat([Buffer.from(start), Buffer.from(bytes), Buffer.from(end)]) });
      assertRpcError(JSON.parse(body), -32700, [null]);
    }
    assertSucceeds(await post(host, 'BasicObjectServices.ProximityGroupName', ['Crate']), { ProximityGroupName: '' });
  }));

  test('is not harmed by garbage', () => withHost({ subjects }, async host => {
    let state = 20240501;
    const random = below => {
      state = (Math.imul(state, 1664525) + 1013904223) >>> 0;
      return Math.floor(state / 2 ** 32 * below);
    };
    const good = rawRequest(host, variant({}));
    const noise = Array.from({ length: 60 }, () => Buffer.from(Array.from({ length: random(4000) }, () => random(256))));
    const bent = Array.from({ length: 60 }, () => {
      const bytes = Buffer.from(good);
      for (let i = random(4); i >= 0; --i)
        bytes[random(bytes.length)] = random(256);
      return bytes;
    });
    const crafted = ['\r\n\r\n', '\0'.repeat(100), 'GET / HTTP/9.9\r\n\r\n', `GET /${'a'.repeat(1 << 20)}`, 'POST /rpc HTTP/1.1\r\n\r\n',
                     `GET / HTTP/1.1\r\n${'a: b\r\n'.repeat(100000)}`, 'PRI * HTTP/2.0\r\n\r\nSM\r\n\r\n',
                     '\x16\x03\x01\x02\x00\x01\x00\x01\xfc\x03\x03', good.slice(0, -5),
                     good.replace(/Content-Length: /, 'Content-Length: -'), good.replace(/(?=Content-Length)/, 'Transfer-Encoding: chunked\r\n'),
                     good.replace(/(?=Content-Length)/, 'Content-Length: 3\r\n')];
    for (const bytes of [...noise, ...bent, ...crafted]) {
      const raw = await RawSocket.open(host);
      raw.socket.end(bytes, 'latin1');
      setTimeout(() => raw.socket.destroy(), 100).unref();
      if (random(2) === 0)
        await Promise.race([raw.ended, sleep(3)]);
    }
    const { body } = await request(host, { body: variant({}) });
    assert.deepEqual(JSON.parse(body), crateColor(7));
  }));

  test('answers a connection too many with 503', () => withHost({ subjects }, async host => {
    const idle = [];
    while (idle.length < limits.connections)
      idle.push(...await Promise.all(Array.from({ length: 50 }, () => RawSocket.open(host))));
    const ask = raw => raw.exchange(rawRequest(host, variant({})), /\r\n\r\n/);
    const excess = await RawSocket.open(host);
    assert.match(await ask(excess), /^HTTP\/1\.1 503 /);
    assert.match(await ask(idle[0]), /^HTTP\/1\.1 200 /);
    for (const raw of [...idle, excess])
      raw.socket.destroy();
    let last = '';
    for (let i = 0; i < 50 && !last.startsWith('HTTP/1.1 200 '); ++i) {
      const raw = await RawSocket.open(host);
      last = await ask(raw);
      raw.socket.destroy();
      await sleep(20);
    }
    assert.match(last, /^HTTP\/1\.1 200 /);
  }));
});
