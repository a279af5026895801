// The same small walk through the API with clients that know nothing of each other.

import assert from 'node:assert/strict';
import { once } from 'node:events';
import { test } from 'node:test';

import { Client, HTTPTransport, RequestManager, WebSocketTransport } from '@open-rpc/client-js';
import jsonRpc from 'json-rpc-2.0';
import WebSocket from 'ws';

import { changed, failure, functions, inputs } from './api.mjs';
import { outputOf } from './children.mjs';
import { inTime, withHost } from './host.mjs';

const subjects = [
  { name: 'Crate', parameters: { ColourRGBA: '#ff3366cc' }, markers: [[0, 0, 0], [120, 0, 0], [0, 80, 0]] },
  { name: 'Barrel' },
  { kind: 'SmartObjects', name: 'Handset' },
];

// A queue of what arrives, and the wait for it.
function mailbox() {
  const messages = [];
  let wake = () => {};
  return {
    put(message) {
      messages.push(message);
      wake();
    },
    async take(matches, what) {
      await inTime(new Promise(done => {
        wake = () => messages.some(matches) && done();
        wake();
      }), what, undefined, () => messages);
      return messages.splice(messages.findIndex(matches), 1)[0];
    },
  };
}

function curl(host) {
  let id = 0;
  return {
    async call(method, params) {
      const options = ['--silent', '--show-error', '--fail', '--noproxy', '*',
                       '--header', 'Content-Type: application/json', '--data-binary', '@-'];
      const input = JSON.stringify({ jsonrpc: '2.0', id: ++id, method, params });
      const answer = JSON.parse(await outputOf('curl', [...options, `${host.url}/rpc`], { input }));
      assert.equal(answer.id, id);
      if (answer.error)
        throw answer.error;
      return answer.result;
    },
    close() {},
  };
}

async function plainWebSocket(host) {
  const socket = new WebSocket(host.ws);
  const mail = mailbox();
  socket.on('message', text => mail.put(JSON.parse(text)));
  await inTime(once(socket, 'open'), 'the upgrade');
  let id = 0;
  return {
    async call(method, params) {
      const mine = `call ${++id}`;
      socket.send(JSON.stringify({ jsonrpc: '2.0', id: mine, method, params }));
      const answer = await mail.take(message => message.id === mine, method);
      if (answer.error)
        throw answer.error;
      return answer.result;
    },
    notification: () => mail.take(message => message.method === changed, changed),
    close: () => socket.close(),
  };
}

async function jsonRpc2(host) {
  const socket = new WebSocket(host.ws);
  const mail = mailbox();
  const peer = new jsonRpc.JSONRPCServerAndClient(
    new jsonRpc.JSONRPCServer(), new jsonRpc.JSONRPCClient(payload => socket.send(JSON.stringify(payload))));
  peer.addMethod('Server.Hello', () => {});
  peer.addMethod(changed, params => mail.put({ params }));
  socket.on('message', text => peer.receiveAndSend(JSON.parse(text)));
  await inTime(once(socket, 'open'), 'the upgrade');
  return {
    call: (method, params) => inTime(peer.request(method, params), method),
    notification: () => mail.take(() => true, changed),
    close: () => socket.close(),
  };
}

function openRpc(transport) {
  const client = new Client(new RequestManager([transport]));
  const mail = mailbox();
  client.onError(() => {});
  client.onNotification(message => mail.put(message));
  return {
    // Its own time-outs would outlive their calls.
    call: (method, params) => inTime(client.request({ method, params }, null), method),
    notification: () => mail.take(message => message.method === changed, changed),
    close: () => client.close(),
  };
}

// The package of the repository, as the test TypeScriptClient.Build has compiled it.
async function subjectStoreClient(host) {
  const { SubjectStoreClient } = await import('../../clients/typescript/dist/index.js');
  const mail = mailbox();
  const client = await SubjectStoreClient.connect(host.ws, { onWarning: warning => mail.put({ warning }) });
  const byName = (method, params) => {
    const names = inputs(functions.find(({ name }) => name === method)).map(({ name }) => name);
    return Array.isArray(params) ? Object.fromEntries(params.map((value, i) => [names[i], value])) : params;
  };
  return {
    async call(method, params) {
      if (method === 'Server.Subscribe') {
        await client.on(params[0], told => mail.put({ params: told })).ready; // it keeps the answer to itself
        return { code: 0, sequence: 0n };
      }
      try {
        return await client.call(method, byName(method, params));
      } catch (failure) {
        const { code, name, text } = failure;
        throw text === undefined ? failure : { code: code | 0, message: name, data: { code, text } };
      }
    },
    notification: () => mail.take(({ warning }) => assert.ifError(warning) ?? true, changed),
    close: () => client.close(),
  };
}

const clients = {
  'curl': { connect: curl },
  'a plain WebSocket': { connect: plainWebSocket, isTold: true },
  'json-rpc-2.0 over WebSocket': { connect: jsonRpc2, isTold: true },
  '@open-rpc/client-js over WebSocket': { connect: host => openRpc(new WebSocketTransport(host.ws)), isTold: true },
  'the package for TypeScript': { connect: subjectStoreClient, isTold: true },
  '@open-rpc/client-js over HTTP': { connect: host => openRpc(new HTTPTransport(`${host.url}/rpc`)) },
};

async function assertRefused(call, { code, message, data }) {
  await assert.rejects(call, error => {
    assert.deepEqual({ code: error.code, message: error.message, data: error.data }, { code, message, data });
    return true;
  });
}

async function walk(client, isTold) {
  const call = async (name, params) => {
    const { outputs, ...rest } = await client.call(`BasicObjectServices.${name}`, params);
    assert.deepEqual(rest, { code: 0, name: 'Ok' });
    return outputs;
  };
  assert.deepEqual(await call('BasicObjectList', []), { Names: ['Barrel', 'Crate'] });
  assert.deepEqual(await call('Color', ['Crate']), { ColorHtml: '#ff3366cc' });
  assert.deepEqual(await call('Rename', ['Crate', 'Kiste ½']), {});
  assert.deepEqual(await call('SetColor', { ColorHtml: '#CC8844', Name: 'Kiste ½' }), {});
  assert.deepEqual(await call('Color', { Name: 'Kiste ½' }), { ColorHtml: '#ffcc8844' });
  assert.deepEqual(await call('SetEnabled', ['Kiste ½', false]), {});
  assert.deepEqual(await call('Enabled', ['Kiste ½']), { Enabled: false });
  for (const group of ['ProximityGroupName', 'TemplateGroupName']) {
    assert.deepEqual(await call(`Set${group}`, ['Kiste ½', 'Stage left']), {});
    assert.deepEqual(await call(group, ['Kiste ½']), { [group]: 'Stage left' });
  }
  await assertRefused(client.call('BasicObjectServices.Rename', ['Kiste ½', 'Barrel']),
                      failure('BasicObjectServices.Rename', 'AlreadyPresent'));

  const subscription = client.call('Server.Subscribe', [changed]);
  if (isTold) {
    const { code, sequence } = await subscription;
    assert.equal(code, 0);
    await call('SetAllEnabled', [true]);
    assert.ok((await client.notification()).params.sequence > sequence);
  } else {
    await assert.rejects(subscription, { message: 'NotSupported' });
  }
  assert.deepEqual(await call('Remove', ['Barrel']), {});
  assert.deepEqual(await call('BasicObjectList', []), { Names: ['Kiste ½'] });
}

for (const [name, { connect, isTold = false }] of Object.entries(clients)) {
  test(`${name} can list, edit, remove and be told`, () => withHost({ subjects }, async host => {
    const client = await connect(host);
    try {
      await walk(client, isTold);
    } finally {
      await client.close();
    }
  }));
}
