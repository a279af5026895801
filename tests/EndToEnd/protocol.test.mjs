// The messages of the wire protocol: envelopes, arguments, answers, notifications.

import assert from 'node:assert/strict';
import { after, afterEach, before, beforeEach, describe, test } from 'node:test';

import { assertSucceeds, changed, codes, snapshot, success } from './api.mjs';
import { askColor, color, crateColor, limits, subjects } from './crate.mjs';
import { startHost, withHost } from './host.mjs';
import { Connection, post, request, withConnection } from './wire.mjs';

const list = 'BasicObjectServices.BasicObjectList';
const bothNames = { jsonrpc: '2.0', id: 7, result: success({ Names: ['Barrel', 'Crate'] }) };

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

  const spoil = (from, to) => askColor().replace(from, to);
  const notJson = [
    '', ' ', '{', 'nonsense', '{"jsonrpc": "2.0", "method": "foobar, "params": "bar", "baz]',
    '[{"jsonrpc": "2.0", "method": "sum", "params": [1,2,4], "id": "1"},{"jsonrpc": "2.0", "method"]',
    `${askColor()}x`, `${askColor()}${askColor()}`, `[${askColor()},]`, `\ufeff${askColor()}`, `${askColor()}\0`,
    ...['7,', '07', '+7', '.7', '7.', '0x7', 'NaN', '-', 'nul', '"7'].map(id => spoil('7', id)),
    ...['Cr\nate', 'Cr\\xate', 'Cr\\u12ate', 'Cr"ate'].map(name => spoil('Crate', name)),
    askColor().replaceAll('"', "'"), spoil('["Crate"]', nested(limits.nesting + 2)), nested(100000),
    '{"a":'.repeat(100000),
  ];
  test('that is not JSON is a parse error', async () => {
    for (const message of notJson)
      for (const answer of await answers(message))
        assertRpcError(JSON.parse(answer), -32700, [null]);
  });

  const notRequests = [
    '1', '"text"', 'null', 'true', '{}', '[]', '{"jsonrpc": "2.0", "method": 1, "params": "bar"}',
    ...[
      { jsonrpc: undefined }, { jsonrpc: '1.0' }, { jsonrpc: 2.0 }, { jsonrpc: '2' }, { jsonrpc: null },
      { method: undefined }, { method: 1 }, { method: null }, { params: 'Crate' }, { params: null }, { params: 1 },
      { id: {} }, { id: [1] }, { id: true },
    ].map(askColor),
    ...['"jsonrpc":"2.0"', '"method":"foobar"', '"params":["Barrel"]', '"id":7', '"i\\u0064":7']
      .map(member => `${askColor().slice(0, -1)},${member}}`),
    `[${Array(limits.batchCalls + 1).fill(askColor()).join()}]`,
  ];
  test('that is no request is refused', async () => {
    for (const message of notRequests)
      for (const answer of await answers(message))
        assertRpcError(JSON.parse(answer), -32600, [null, 7]);
  });

  const requests = [
    ['by position', askColor(), crateColor()],
    ['by name', askColor({ params: { Name: 'Crate' } }), crateColor()],
    ['with white space', ` \t\r\n${JSON.stringify({ ...color, id: 7 }, null, '\t')} \r\n`, crateColor()],
    ['with a method in escapes', spoil('Color', '\\u0043olor'), crateColor()],
    ['with a name in escapes', spoil('Crate', 'C\\u0072ate'), crateColor()],
    ['with a version in escapes', spoil('2.0', '2\\u002e0'), crateColor()],
    ['with another member', askColor({ extra: { deep: [1] } }), crateColor()],
    ['without params', call(list), bothNames],
    ['with empty by-name params', call(list, {}), bothNames],
    ...[null, 0, -1, 1.5, '', '1', 'é "\\\u0001 \u2028']
      .map(id => [`with id ${JSON.stringify(id)}`, askColor({ id }), crateColor(id)]),
    ['as the only one of a batch', `[${askColor()}]`, [crateColor()]],
    ['as one of the most that a batch takes', `[${Array(limits.batchCalls).fill(askColor()).join()}]`,
     Array(limits.batchCalls).fill(crateColor())],
  ];
  for (const [how, message, expected] of requests)
    test(`that asks ${how} is answered`, async () => {
      for (const answer of await answers(message))
        assert.deepEqual(JSON.parse(answer), expected);
    });

  test('has its id answered digit by digit', async () => {
    for (const id of ['9007199254740993', '18446744073709551615', '-9223372036854775808', '0.1000'])
      for (const answer of await answers(spoil('7', id)))
        assert.match(answer, new RegExp(`"id":${id}[,}]`));
  });

  test('of many requests is answered for each that is not a notification', async () => {
    const mix = [{ ...color, id: '1' }, color, { foo: 'boo' }, { ...color, method: 'foo.get', id: '5' }, 1,
                 { ...color, method: 'foo.get' }, { ...color, params: { Name: 'Crate' }, id: 9 },
                 { ...color, method: list, params: [], id: 10 }];
    for (const text of await answers(JSON.stringify(mix))) {
      const batch = JSON.parse(text);
      const withId = id => batch.filter(answer => answer.id === id);
      assert.equal(batch.length, 6);
      assert.deepEqual(withId('1'), [crateColor('1')]);
      assert.deepEqual(withId(9), [crateColor(9)]);
      assert.deepEqual(withId(10), [{ ...bothNames, id: 10 }]);
      assertRpcError(withId('5')[0], -32601, ['5']);
      assert.equal(withId(null).length, 2);
      for (const answer of withId(null))
        assertRpcError(answer, -32600, [null]);
    }
    for (const [invalid, count] of [['[1]', 1], ['[1,2,3]', 3]])
      for (const text of await answers(invalid)) {
        const batch = JSON.parse(text);
        assert.equal(batch.length, count);
        for (const answer of batch)
          assertRpcError(answer, -32600, [null]);
      }
  });

  const unknownMethods = ['foobar', '', 'BasicObjectServices', 'BasicObjectServices.', 'BasicObjectServices.color',
                          'BasicObjectServices.Color ', 'Color', 'Server.Hello', 'Server.subscribe', 'rpc.',
                          'rpc.Discover', changed];
  test('for an unknown method is refused', async () => {
    for (const method of unknownMethods)
      for (const answer of await answers(askColor({ method })))
        assertRpcError(JSON.parse(answer), -32601, [7]);
  });

  const badNames = [
    [askColor({ params: {} }), /"Name"/],
    [askColor({ params: { name: 'Crate' } }), /"[Nn]ame"/],
    [askColor({ params: { Name: 'Crate', ColorHtml: '#112233' } }), /"ColorHtml"/],
    [askColor({ params: { Name: 'Crate', 'N "b"\n': 1 } }), /N/],
    [spoil('["Crate"]', '{"Name":"Crate","Name":"Crate"}'), /"Name"/],
    [spoil('["Crate"]', '{"Name":"Crate","\\u004eame":"Barrel"}'), /"Name"/],
    [call('BasicObjectServices.SetEnabled', { Name: 'Crate' }), /"Enabled"/],
    [call(list, { Name: 'Crate' }), /"Name"/],
    ...[undefined, [], [1], [changed, changed], [[changed]], { Name: 1 }, {}, { Callback: changed }]
      .flatMap(params => [[call('Server.Subscribe', params), /./], [call('Server.Unsubscribe', params), /./]]),
  ];
  test('with wrong parameter names is refused with the name', async () => {
    for (const [message, says] of badNames)
      for (const answer of await answers(message))
        assertRpcError(JSON.parse(answer), -32602, [7], says);
  });

  const firstRefused = [undefined, [], [1, false], [null, false], [['Crate'], false], [{ Name: 'Crate' }, false],
                        { Enabled: false, Name: 1 }];
  const secondRefused = [['Crate'], ['Crate', 'false'], ['Crate', 0], ['Crate', null], ['Crate', [false]],
                         ['Crate', 2 ** 64], ['Crate', -1e300], { Enabled: 0, Name: 'Crate' }];
  const outOfRange = ['1e400', '9'.repeat(400)];
  const set = params => call('BasicObjectServices.SetEnabled', params);
  const badArguments = [
    ...firstRefused.map(params => [set(params), 'argument 1 "Name": expected a text']),
    ...[...secondRefused.map(set), ...outOfRange.map(number => set(['Crate', '?']).replace('"?"', number))]
      .map(message => [message, 'argument 2 "Enabled": expected true or false']),
    ...[set(['Crate', false, 1]), call(list, [1]), askColor({ params: ['Crate', '#112233'] })]
      .map(message => [message, 'no further argument']),
    [spoil('["Crate"]', nested(limits.nesting / 2)), 'expected a text'],
  ];
  test('with wrong arguments is refused with the argument', async () => {
    for (const [message, says] of badArguments)
      for (const text of await answers(message)) {
        const { id, error } = JSON.parse(text);
        const { detail, ...data } = error.data ?? {};
        const { InvalidFormat: code } = codes;
        assert.deepEqual({ id, ...error, data },
                         { id: 7, code: code | 0, message: 'InvalidFormat', data: { code, text: '' } });
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
    const { epoch } = connection.hello.params;
    assert.deepEqual(answer.result, { code: codes[name], name, outputs: {}, epoch, sequence });
    return sequence;
  }

  test('begin with a greeting, new in session and epoch', async () => {
    const epochs = new Set();
    for (let start = 0; start < 2; ++start)
      await withHost({ subjects }, host => withConnection(host, one => withConnection(host, another => {
        for (const { hello } of [one, another]) {
          const { session, epoch, api } = hello.params;
          assert.deepEqual(hello, { jsonrpc: '2.0', method: 'Server.Hello', params: {
            session, epoch, api, limits, levels: { open: 2, preview: 1, granted: 2 } } });
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
        await connection.call(list);
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

      const assertRefused = ({ error }, name) =>
        assert.deepEqual([error?.code, error?.message, error?.data.code], [codes[name] | 0, name, codes[name]]);
      for (const ask of ['Server.Subscribe', 'Server.Unsubscribe']) {
        for (const name of ['', 'Nobody', '*', '.*', 'Basic*', 'Basic.*', 'Nobody.*', 'BasicObjectServices',
                            'BasicObjectServices.', 'BasicObjectServices.Color', 'Server.Hello', changed.toLowerCase(),
                            `${changed}.*`])
          assertRefused(await connection.call(ask, [name]), 'NotFound');
        for (const name of [changed, group])
          assertRefused(await post(host, ask, [name]), 'NotSupported');
      }
    }))));

  test('count for the whole server, the last of a burst too', () => withHost({ subjects }, host =>
    withConnection(host, one => withConnection(host, async another => {
      const sequences = await Promise.all([one, another].map(async connection =>
        assertSubscription(await connection.call('Server.Subscribe', [changed]), connection, 'Ok')));
      const colours = Array.from({ length: 3000 }, (_, i) => `#${(0x100000 + i).toString(16)}`);
      await Promise.all(colours.map((colour, i) => edit([one, another][i % 2], colour)));
      await Promise.all([one, another].map(connection => connection.call(list)));
      const now = assertSubscription(await one.call('Server.Subscribe', [changed]), one, 'OkButNoEffect');
      for (const [i, { notifications }] of [one, another].entries()) {
        const received = notifications.map(({ params }) => params.sequence);
        assert.deepEqual(received, [...new Set(received)].sort((a, b) => a - b));
        assert.ok(received[0] > sequences[i]);
        assert.equal(received.at(-1), now);
      }
    }))));
});
