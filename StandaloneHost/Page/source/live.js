// The page's WebSocket: keeps it open, keeps what was subscribed, tells of notifications.

import { parse } from './json.js';
import { socketUrl, subprotocols } from './rpc.js';

const shortestPause = 500;
const longestPause = 15000;
const patience = 30000;

// Events: "state" when `state` has changed, "subscriptions" when `subscribed` has, "notification" with the message in
// `detail`, "epoch" when the host was started anew.
// `state`: { name: 'connecting' | 'open' | 'waiting', seconds, session, epoch, ... }.
export class Live extends EventTarget {
  state = { name: 'connecting' };
  greeting = undefined;
  subscribed = new Set();
  #callbacks;
  #socket;
  #calls = new Map();
  #lastId = 0;
  #failures = 0;
  #timer;

  // `callbacks`: the names that may be subscribed to.
  constructor(callbacks) {
    super();
    this.#callbacks = callbacks;
  }

  // Opens the connection; now, if it waits to try again.
  connect() {
    clearTimeout(this.#timer);
    if (this.#socket)
      return;
    this.#become({ name: 'connecting' });
    const socket = new WebSocket(socketUrl, subprotocols());
    this.#socket = socket;
    socket.addEventListener('message', ({ data }) => this.#receive(data));
    socket.addEventListener('close', ({ reason }) => this.#onClosed(socket, reason));
  }

  // Leaves the connection, to open another: the token is a new one.
  reconnect() {
    this.#failures = 0;
    const socket = this.#socket;
    if (socket) {
      this.#onClosed(socket, '');
      socket.close();
    }
    this.connect();
  }

  // Sends a request, of which `params` is JSON text: { request, text, message }, the last two of the answer.
  call(method, params) {
    if (this.state.name !== 'open')
      return Promise.reject(new Error('There is no connection for notifications at the moment.'));
    const id = ++this.#lastId;
    const request = `{"jsonrpc": "2.0", "id": ${id}, "method": ${JSON.stringify(method)}, "params": ${params}}`;
    return new Promise((done, failed) => {
      const timer = setTimeout(() => {
        this.#calls.delete(id);
        failed(new Error(`There was no answer within ${patience / 1000} seconds.`));
      }, patience);
      this.#calls.set(id, { done, failed, timer, request });
      this.#socket.send(request);
    });
  }

  // Subscribes to or unsubscribes from a callback, or a group's with ".*". While there is no connection, it is done
  // once there is one again. Answers as `call`, or nothing.
  async change(method, name) {
    const wanted = method === 'Server.Subscribe';
    if (this.state.name !== 'open') {
      this.#note(wanted, name);
      return undefined;
    }
    const answer = await this.call(method, JSON.stringify({ Name: name }));
    if (answer.message.result !== undefined)
      this.#note(wanted, name);
    return answer;
  }

  #note(wanted, name) {
    const names = name.endsWith('.*') ? this.#callbacks.filter(known => known.startsWith(name.slice(0, -1))) : [name];
    for (const each of names)
      wanted ? this.subscribed.add(each) : this.subscribed.delete(each);
    this.dispatchEvent(new Event('subscriptions'));
  }

  #become(state) {
    this.state = state;
    this.dispatchEvent(new Event('state'));
  }

  #receive(text) {
    let message;
    try {
      message = parse(text);
    } catch {
      return; // not of this protocol
    }
    const waiting = this.#calls.get(message?.id);
    if (waiting) {
      this.#calls.delete(message.id);
      clearTimeout(waiting.timer);
      waiting.done({ request: waiting.request, text, message });
    } else if (message?.method === 'Server.Hello') {
      this.#onGreeting(message.params ?? {});
    } else if (typeof message?.method === 'string') {
      this.dispatchEvent(new CustomEvent('notification', { detail: message }));
    }
  }

  #onGreeting(greeting) {
    const before = this.greeting?.epoch;
    this.greeting = greeting;
    this.#failures = 0;
    this.#become({ name: 'open' });
    if (before !== undefined && before !== greeting.epoch)
      this.dispatchEvent(new Event('epoch'));
    for (const name of this.subscribed)
      this.call('Server.Subscribe', JSON.stringify({ Name: name })).then(({ message }) => {
        if (message.error)
          this.#note(false, name);
      }, () => {});
  }

  #onClosed(socket, reason) {
    if (socket !== this.#socket)
      return;
    this.#socket = undefined;
    for (const { failed, timer } of this.#calls.values()) {
      clearTimeout(timer);
      failed(new Error('The connection was lost before the answer came.'));
    }
    this.#calls.clear();
    const pause = Math.min(longestPause, shortestPause * 2 ** this.#failures++) * (0.75 + Math.random() / 2);
    this.#become({ name: 'waiting', until: Date.now() + pause, reason });
    this.#timer = setTimeout(() => this.connect(), pause);
  }
}
