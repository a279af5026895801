// Speaks to the host: plain HTTP requests, WebSocket connections, raw sockets.

import http from 'node:http';
import net from 'node:net';
import WebSocket from 'ws';

import { inTime } from './waiting.mjs';

// One HTTP request: { status, headers, body }. `port` is the local one, to tell connections apart.
export function request(host, { method = 'POST', path = '/rpc', headers = {}, body, agent = false } = {}) {
  const exchange = new Promise((done, failed) => {
    const outgoing = http.request(host.url + path, { method, headers, agent }, incoming => {
      const port = incoming.socket.localPort;
      let text = '';
      incoming.setEncoding('utf8').on('data', part => { text += part; }).on('error', failed)
        .on('end', () => done({ status: incoming.statusCode, headers: incoming.headers, body: text, port }));
    });
    outgoing.on('error', failed);
    outgoing.on('upgrade', (incoming, socket) => {
      socket.destroy();
      done({ status: incoming.statusCode, headers: incoming.headers, body: '' });
    });
    outgoing.end(body);
  });
  return inTime(exchange, `${method} ${path}`);
}

// The headers that ask for a WebSocket, with the key of which everyone knows the answer.
export const handshake = { Connection: 'Upgrade', Upgrade: 'websocket', 'Sec-WebSocket-Version': '13',
                           'Sec-WebSocket-Key': 'dGhlIHNhbXBsZSBub25jZQ==' };

// The status that a WebSocket upgrade with these headers is answered with.
export async function upgradeStatus(host, headers = {}) {
  return (await request(host, { method: 'GET', headers: { ...handshake, ...headers } })).status;
}

// A call over HTTP: the answer's envelope.
export async function post(host, method, params, headers = {}) {
  const answer = await request(host, { headers, body: JSON.stringify({ jsonrpc: '2.0', id: 1, method, params }) });
  return JSON.parse(answer.body);
}

// A WebSocket connection that has been greeted.
export class Connection {
  notifications = [];
  #waiting = [];
  #calls = new Map();
  #others = [];
  #lastId = 0;

  static async open(host, { protocols = [], ...options } = {}) {
    const connection = new Connection();
    connection.socket = new WebSocket(host.ws, protocols, options);
    connection.closed = new Promise(done => {
      connection.socket.on('close', (code, reason) => {
        done(code);
        const failure = new Error(`the connection was closed with ${code} ${reason}`);
        for (const { failed } of [...connection.#calls.values(), ...connection.#waiting])
          failed(failure);
      });
    });
    connection.socket.on('message', (data, binary) => connection.#receive(data, binary));
    await inTime(new Promise((done, failed) => connection.socket.on('open', done).on('error', failed)), 'the upgrade');
    connection.socket._socket.unref(); // only a wait keeps the test's process alive
    connection.hello = await connection.#next(connection.notifications, 'the greeting');
    return connection;
  }

  // A call; its answer's envelope.
  call(method, params, milliseconds = 5000) {
    const id = ++this.#lastId;
    const answer = new Promise((done, failed) => this.#calls.set(id, { done, failed }));
    this.socket.send(JSON.stringify({ jsonrpc: '2.0', id, method, params }));
    return inTime(answer, `an answer to ${method}`, milliseconds);
  }

  notify(method, params) {
    this.socket.send(JSON.stringify({ jsonrpc: '2.0', method, params }));
  }

  // Sends a message as it stands and answers the next one that answers no call of this connection, as text.
  exchange(text) {
    this.socket.send(text);
    return this.#next(this.#others, `an answer to ${String(text).slice(0, 200)}`);
  }

  // The next notification that was not yet taken.
  nextNotification() {
    return this.#next(this.notifications, 'a notification');
  }

  // Messages that answered no call and that nobody took.
  get unexpected() {
    return this.#others;
  }

  async close(code) {
    this.socket.close(code);
    return inTime(this.closed, 'the connection closes');
  }

  #receive(data, binary) {
    const text = data.toString('utf8');
    const message = binary ? undefined : JSON.parse(text);
    const call = this.#calls.get(message?.id);
    if (call) {
      this.#calls.delete(message.id);
      call.done(message);
    } else if (message?.method !== undefined) {
      this.#deliver(this.notifications, message);
    } else {
      this.#deliver(this.#others, text);
    }
  }

  #deliver(queue, message) {
    const index = this.#waiting.findIndex(waiting => waiting.queue === queue);
    if (index < 0)
      queue.push(message);
    else
      this.#waiting.splice(index, 1)[0].done(message);
  }

  #next(queue, what) {
    if (queue.length > 0)
      return queue.shift();
    return inTime(new Promise((done, failed) => this.#waiting.push({ queue, done, failed })), what);
  }
}

// Runs `body` with a connection, which is closed afterwards.
export async function withConnection(host, body) {
  const connection = await Connection.open(host);
  try {
    await body(connection);
  } finally {
    connection.socket.terminate();
  }
}

// A raw connection to the port that gathers what it is sent in `text`.
export class RawSocket {
  text = '';
  #changed = () => {};

  static async open(host) {
    const raw = new RawSocket();
    raw.socket = net.connect(host.port, '127.0.0.1').unref();
    raw.ended = new Promise(done => raw.socket.on('close', done));
    raw.socket.setEncoding('latin1').on('data', part => {
      raw.text += part;
      raw.#changed();
    });
    await inTime(new Promise((done, failed) => raw.socket.once('connect', done).once('error', failed)), 'a connection');
    raw.socket.on('error', () => {});
    return raw;
  }

  // Writes, and waits until all that arrived matches.
  async exchange(bytes, pattern) {
    this.socket.write(bytes);
    return this.until(pattern);
  }

  until(pattern) {
    const arrived = new Promise(done => {
      this.#changed = () => pattern.test(this.text) && done(this.text);
      this.#changed();
    });
    return inTime(arrived, `${pattern} arrives`, undefined, () => this.text.slice(0, 2000));
  }
}

// The text of an HTTP request as it goes through the socket.
export function rawRequest(host, body, { method = 'POST', path = '/rpc', headers = [] } = {}) {
  return [`${method} ${path} HTTP/1.1`, `Host: 127.0.0.1:${host.port}`, 'Content-Type: application/json',
          `Content-Length: ${Buffer.byteLength(body)}`, ...headers, '', body].join('\r\n');
}
