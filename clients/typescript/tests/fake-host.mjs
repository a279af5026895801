// A host that says what a test wants it to.

import { WebSocketServer } from 'ws';

import { inTime } from '../../../tests/EndToEnd/waiting.mjs';

export const hello = { session: 1, epoch: 'one', api: 'of another', limits: {}, levels: {} };

// Runs `body` with its address. `answer` gets each call and its connection; `greeting`: none when null.
export async function withFakeHost({ greeting = hello, answer = () => {} }, body) {
  const server = new WebSocketServer({ host: '127.0.0.1', port: 0, handleProtocols: () => 'subject-store' });
  const offered = [];
  server.on('connection', (socket, { headers }) => {
    offered.push(headers['sec-websocket-protocol']);
    if (greeting)
      socket.send(JSON.stringify({ jsonrpc: '2.0', method: 'Server.Hello', params: greeting }));
    socket.on('message', text => answer(JSON.parse(text), socket));
  });
  await inTime(new Promise(done => { server.on('listening', done); }), 'the host listens');
  try {
    await inTime(body(`ws://127.0.0.1:${server.address().port}/rpc`, offered), 'the end of a test with a host', 60000);
  } finally {
    for (const socket of server.clients)
      socket.terminate();
    await inTime(new Promise(done => { server.close(done); }), 'the host ends');
  }
}
