import { ConnectionError } from './errors.js';
import { isMembers, readJson, type Members } from './json.js';
import { platformSocket, type Socket, type SocketConstructor } from './socket.js';

export interface ConnectionSettings {
  url: string;
  protocols: string[];
  /** Milliseconds from the attempt to connect to the greeting. */
  connectTimeout: number;
  /** Milliseconds before the first attempt to reconnect, and at most before a later one. */
  reconnectDelay: { first: number; longest: number };
  webSocket: SocketConstructor | undefined;
}

/** What a connection tells its owner. Nothing is told after `close` has been called. */
export interface ConnectionOwner {
  /** The greeting has arrived; from now on messages can be sent. */
  greeted(params: Members): void;
  received(message: Members): void;
  /** A greeted connection was lost, or an attempt to connect failed. Another follows. */
  lost(reason: ConnectionError, wasGreeted: boolean): void;
  /** Something that should not have been sent. */
  puzzled(problem: Error): void;
}

const closingTime = 2000;

/** A WebSocket that comes back: when it is lost, it is opened again, after ever longer waits. */
export class Connection {
  readonly #settings: ConnectionSettings;
  readonly #owner: ConnectionOwner;
  #socket: Socket | undefined;
  #greeted = false;
  #closed = false;
  #failures = 0;
  #timer: ReturnType<typeof setTimeout> | undefined;
  #ended: (() => void) | undefined;

  constructor(settings: ConnectionSettings, owner: ConnectionOwner) {
    this.#settings = settings;
    this.#owner = owner;
  }

  get greeted(): boolean {
    return this.#greeted;
  }

  /** Makes the first attempt. Throws (rejects) only for what no further attempt could mend, such as a wrong address. */
  async open(): Promise<void> {
    const Constructor = this.#settings.webSocket ?? await platformSocket();
    if (!this.#closed)
      this.#connect(Constructor);
  }

  /** The connection is greeted. */
  send(text: string): void {
    this.#socket?.send(text);
  }

  /** Says goodbye; done when the other side has answered, or did not within two seconds. */
  async close(): Promise<void> {
    this.#closed = true;
    this.#greeted = false;
    clearTimeout(this.#timer);
    const socket = this.#socket;
    if (!socket)
      return;
    const ended = new Promise<void>(done => { this.#ended = done; });
    const late = setTimeout(() => {
      socket.terminate?.();
      this.#ended?.();
    }, closingTime);
    socket.close(1000);
    await ended;
    clearTimeout(late);
  }

  #connect(Constructor: SocketConstructor): void {
    const socket = new Constructor(this.#settings.url, this.#settings.protocols);
    this.#socket = socket;
    const fail = (reason: string) => {
      this.#abandon(socket);
      this.#onClosed(Constructor, reason);
    };
    const { connectTimeout } = this.#settings;
    this.#timer = setTimeout(() => { fail(`no greeting within ${connectTimeout} ms`); }, connectTimeout);
    // Not every WebSocket says that it is closed after an error.
    socket.onerror = event => {
      fail('message' in event && event.message ? String(event.message) : 'the connection failed');
    };
    socket.onmessage = event => { this.#onMessage(event.data); };
    socket.onclose = ({ code, reason }) => { this.#onClosed(Constructor, `closed with ${code} ${reason}`.trim()); };
  }

  // Nothing of this socket is heard any more.
  #abandon(socket: Socket): void {
    socket.onclose = null;
    socket.onmessage = null;
    socket.onerror = () => {};
    socket.close();
    socket.terminate?.();
  }

  #onClosed(Constructor: SocketConstructor, reason: string): void {
    this.#socket = undefined;
    clearTimeout(this.#timer);
    if (this.#closed) {
      this.#ended?.();
      return;
    }
    const wasGreeted = this.#greeted;
    this.#greeted = false;
    const { first, longest } = this.#settings.reconnectDelay;
    const delay = Math.min(first * 2 ** this.#failures++, longest);
    // Not all clients of a host that comes back at the same time.
    this.#timer = setTimeout(() => this.#connect(Constructor), delay * (0.75 + Math.random() / 2));
    this.#owner.lost(new ConnectionError(`${this.#settings.url}: ${reason}`), wasGreeted);
  }

  #onMessage(data: unknown): void {
    if (this.#closed)
      return;
    let message: unknown;
    try {
      message = readJson(String(data));
    } catch (failure) {
      this.#owner.puzzled(new Error(`a message that is not JSON: ${String(failure)}`));
      return;
    }
    if (!isMembers(message))
      this.#owner.puzzled(new Error('a message that is not an object'));
    else if (this.#greeted)
      this.#owner.received(message);
    else if (message['method'] === 'Server.Hello' && isMembers(message['params']))
      this.#onGreeted(message['params']);
    else
      this.#owner.puzzled(new Error('the first message is not a greeting: this is no subject store'));
  }

  #onGreeted(params: Members): void {
    clearTimeout(this.#timer);
    this.#greeted = true;
    this.#failures = 0;
    this.#owner.greeted(params);
  }
}
