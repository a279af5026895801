// Clients that come and go, and a host that ends while they are busy.

import assert from 'node:assert/strict';
import http from 'node:http';
import { test } from 'node:test';

import WebSocket from 'ws';

import { assertSucceeds, changed, codes } from './api.mjs';
import { inTime, temporaryDirectory, until, withHost } from './host.mjs';
import { Connection, post, RawSocket, rawRequest, request, withConnection } from './wire.mjs';

const subjects = Array.from({ length: 16 }, (_, i) => ({ name: `Object ${i}` }));

test('A thousand clients come and go, many of them in the middle of calls', () => withHost({ subjects }, async host => {
  const endings = [socket => socket.close(), socket => socket.terminate(), socket => socket._socket?.destroy(),
                   socket => socket._socket?.end()];
  let left = 1000;
  const visitor = async () => {
    while (left-- > 0) {
      const number = left;
      const socket = new WebSocket(host.ws);
      const closed = new Promise(done => socket.on('close', done).on('error', () => {}));
      await inTime(new Promise(done => socket.on('open', done).on('close', done)), 'a client comes');
      socket.send(JSON.stringify({ jsonrpc: '2.0', method: 'Server.Subscribe', params: [changed] }));
      for (let id = 0; id < 5; ++id)
        socket.send(JSON.stringify({ jsonrpc: '2.0', id, method: 'BasicObjectServices.SetEnabled',
                                     params: [`Object ${number % 16}`, id % 2 === 0] }));
      if (number % 3 === 0)
        await inTime(new Promise(done => socket.once('message', done).once('close', done)), 'a client hears something');
      endings[number % endings.length](socket);
      await inTime(closed, 'a client goes');
    }
  };
  await Promise.all(Array.from({ length: 20 }, visitor));
  await withConnection(host, async connection => {
    const list = await connection.call('BasicObjectServices.BasicObjectList');
    assert.equal(list.result.outputs.Names.length, subjects.length);
    await connection.call('Server.Subscribe', [changed]);
    assertSucceeds(await connection.call('BasicObjectServices.SetColor', ['Object 1', '#123456']));
    assert.equal((await connection.nextNotification()).method, changed);
  });
}));

for (const signal of ['SIGTERM', 'SIGINT'])
  test(`${signal} under load ends the host in time, and leaves no call open`, async () => {
    const data = temporaryDirectory();
    const lastAnswered = new Map();
    const ended = [];
    let answers = 0;
    await withHost({ data, subjects }, async host => {
      // What might hold up the end: an idle HTTP connection, half a request, no request, a client that does not read.
      const agent = new http.Agent({ keepAlive: true });
      await request(host, { agent, method: 'GET', path: '/' });
      const half = await RawSocket.open(host);
      half.socket.write(rawRequest(host, '{"jsonrpc":"2.0"').slice(0, -5));
      const silent = await RawSocket.open(host);
      const lazy = await Connection.open(host);
      lazy.socket.pause();
      for (let id = 0; id < 200; ++id)
        lazy.socket.send(JSON.stringify({ jsonrpc: '2.0', id: `d${id}`, method: 'rpc.discover' }));

      const connections = await Promise.all(subjects.map(() => Connection.open(host)));
      const load = connections.flatMap((connection, i) => Array.from({ length: 8 }, async (_, lane) => {
        for (let number = lane; ; number += 8) {
          const group = `Group ${number}`;
          let answer;
          try {
            answer = await connection.call('BasicObjectServices.SetProximityGroupName', [`Object ${i}`, group]);
          } catch {
            ended.push(connection.socket.readyState);
            return;
          }
          if (answer.error) {
            assert.deepEqual([answer.error.code, answer.error.message], [codes.ShuttingDown | 0, 'ShuttingDown']);
            continue;
          }
          assertSucceeds(answer);
          ++answers;
          lastAnswered.set(`Object ${i}`, Math.max(number, lastAnswered.get(`Object ${i}`) ?? 0));
        }
      }));
      const busy = Promise.all(load);
      busy.catch(() => {});
      await until('calls are answered', () => answers > 20 * subjects.length, { seen: () => answers });
      assert.equal(await host.stop(signal, 5000), 0);
      await inTime(busy, 'every call is answered, or its connection closed');
      await inTime(Promise.all(connections.map(connection => connection.closed)), 'the connections are closed');
      for (const connection of connections)
        assert.deepEqual(connection.unexpected, []);
      assert.ok(ended.length === load.length && ended.every(state => state === WebSocket.CLOSED));
      agent.destroy();
      for (const { socket } of [half, silent])
        socket.destroy();
      lazy.socket.terminate();
    });

    // What was answered was kept. Calls that were not answered may have been carried out.
    await withHost({ data }, async host => {
      for (const [name, number] of lastAnswered) {
        const { result } = await post(host, 'BasicObjectServices.ProximityGroupName', [name]);
        assert.ok(Number(result.outputs.ProximityGroupName.slice('Group '.length)) >= number - 8, name);
      }
    });
  });
