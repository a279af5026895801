import { Calls } from './calls.js';
import { Connection } from './connection.js';
import { ConnectionError } from './errors.js';
import { apiHash, Groups, wideMembers, type Hello } from './generated.js';
import { isMembers, typed, type Members } from './json.js';
import { protocolsFor, type SocketConstructor } from './socket.js';
import { Subscriptions } from './subscriptions.js';
import type { CallOptions, ConnectionEvents, Events, Inputs, Method, Outputs, Result, Subscription } from './types.js';

export interface ClientOptions {
  /** The host's token, if it has one. */
  token?: string;
  /** Milliseconds to wait for an answer: 10000 unless told otherwise. */
  timeout?: number;
  /** Milliseconds from the attempt to connect to the greeting: 5000 unless told otherwise. */
  connectTimeout?: number;
  /** Milliseconds before the first attempt to reconnect, and at most before a later one: 250 and 10000. */
  reconnectDelay?: { first: number; longest: number };
  /** Takes the place of the platform's WebSocket, such as one with certificates of its own. */
  webSocket?: SocketConstructor;
  /** Hears of what nobody else would: another API, a refused subscription, a handler that throws. Else the console. */
  onWarning?: (warning: Error) => void;
}

const closedByClient = 'the client was closed';

/** A client of one host. It reconnects by itself, and subscribes again, until it is closed. */
export class SubjectStoreClient extends Groups {
  readonly #timeout: number;
  readonly #warn: (warning: Error) => void;
  readonly #calls = new Calls();
  readonly #subscriptions: Subscriptions;
  readonly #connection: Connection;
  #hello: Hello | undefined;
  #warnedOf: string | undefined;
  #closing: Promise<void> | undefined;
  #first: { done: () => void; failed: (reason: unknown) => void } | undefined;

  /**
   * A client that has been greeted by the host at `url`, such as 'ws://127.0.0.1:8420/rpc'.
   * @throws ConnectionError when there is none; SyntaxError when the address is none.
   */
  static async connect(url: string, options: ClientOptions = {}): Promise<SubjectStoreClient> {
    const client = new SubjectStoreClient(url, options);
    try {
      await client.#open();
    } catch (failure) {
      await client.close();
      throw failure;
    }
    return client;
  }

  private constructor(url: string, options: ClientOptions) {
    super();
    this.#timeout = options.timeout ?? 10000;
    this.#warn = options.onWarning ?? (warning => { console.warn(warning); });
    this.#subscriptions = new Subscriptions({
      request: (method, params) => this.#calls.make(method, params, this.#timeout),
      warn: warning => { this.#warn(warning); },
    });
    this.#connection = new Connection({
      url,
      protocols: protocolsFor(options.token),
      connectTimeout: options.connectTimeout ?? 5000,
      reconnectDelay: options.reconnectDelay ?? { first: 250, longest: 10000 },
      webSocket: options.webSocket,
    }, {
      greeted: params => { this.#onGreeted(params as unknown as Hello); },
      received: message => { this.#onMessage(message); },
      lost: (reason, wasGreeted) => { this.#onLost(reason, wasGreeted); },
      puzzled: problem => { this.#warn(problem); },
    });
  }

  /** The latest greeting: session, epoch, limits, levels. */
  get hello(): Hello {
    if (!this.#hello)
      throw new ConnectionError('the host has not greeted');
    return this.#hello;
  }

  /** False while the client tries to reconnect, and once it is closed. */
  get connected(): boolean {
    return this.#connection.greeted;
  }

  /**
   * Calls a function by its full name. While there is no connection, the call waits for one, as long as for an answer.
   * @throws SubjectStoreError, ProtocolError, TimeoutError, ConnectionError, or the reason of the signal.
   */
  override async call<M extends Method>(method: M, inputs: Inputs<M>, options: CallOptions = {}): Promise<Result<M>> {
    if (this.#closing)
      throw new ConnectionError(`${method}: ${closedByClient}`);
    const result = await this.#calls.make(method, inputs, options.timeout ?? this.#timeout, options);
    const outputs = isMembers(result['outputs']) ? result['outputs'] : {};
    return { ...result, outputs: typed(outputs, wideMembers[method]) as Outputs<M> } as Result<M>;
  }

  /** Calls `handler` whenever something happens: a callback of the API, or what becomes of the connection. */
  on<Name extends keyof Events>(name: Name, handler: (event: Events[Name]) => void): Subscription {
    return this.#subscriptions.add(name, handler as (event: unknown) => void);
  }

  /** Ends all calls with a ConnectionError and closes the connection. */
  close(): Promise<void> {
    if (!this.#closing) {
      const reason = new ConnectionError(closedByClient);
      this.#closing = this.#connection.close();
      this.#subscriptions.close(reason);
      this.#calls.close(reason);
      this.#first?.failed(reason);
    }
    return this.#closing;
  }

  async #open(): Promise<void> {
    const greeted = new Promise<void>((done, failed) => { this.#first = { done, failed }; });
    greeted.catch(() => {});
    await this.#connection.open();
    await greeted;
  }

  #onGreeted(hello: Hello): void {
    const before = this.#hello;
    this.#hello = hello;
    this.#calls.connected(text => { this.#connection.send(text); }, () => { this.#subscriptions.connected(); });
    if (hello.api !== apiHash && hello.api !== this.#warnedOf) {
      this.#warnedOf = hello.api;
      this.#warn(new Error(`the host's API (${hello.api}) is not the one that this client was made for (${apiHash})`));
    }
    this.#first?.done();
    if (!before)
      return;
    this.#tell('reconnected', { hello });
    if (before.epoch !== hello.epoch)
      this.#tell('epoch', { previous: before.epoch, current: hello.epoch });
  }

  #onMessage(message: Members): void {
    const { method, params } = message;
    if (typeof method === 'string' && isMembers(params))
      this.#subscriptions.tell(method, typed(params, wideMembers[method]));
    else if (!this.#calls.answered(message))
      this.#warn(new Error('an answer to no call'));
  }

  #onLost(reason: ConnectionError, wasGreeted: boolean): void {
    this.#calls.disconnected(reason);
    this.#subscriptions.disconnected();
    this.#first?.failed(reason); // without effect once it was done
    if (wasGreeted)
      this.#tell('disconnected', { reason });
  }

  #tell<Name extends keyof ConnectionEvents>(name: Name, event: ConnectionEvents[Name]): void {
    this.#subscriptions.tell(name, event);
  }
}
