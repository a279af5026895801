import { ConnectionError, ProtocolError, SubjectStoreError, TimeoutError } from './errors.js';
import type { ResultName } from './generated.js';
import { isMembers, writeJson, type Members } from './json.js';
import type { CallOptions } from './types.js';

interface Call {
  method: string;
  text: string;
  sent: boolean;
  succeed(result: Members): void;
  fail(reason: unknown): void;
}

function failureOf(method: string, error: Members): Error {
  const { code, message, data } = error;
  if (!isMembers(data))
    return new ProtocolError(method, Number(code), String(message));
  const detail = data['detail'] === undefined ? undefined : String(data['detail']);
  return new SubjectStoreError(method, Number(data['code']), String(message) as ResultName, String(data['text']), detail);
}

/** The calls that wait for their answers, or for a connection. */
export class Calls {
  readonly #calls = new Map<number, Call>();
  #lastId = 0;
  #send: ((text: string) => void) | undefined;

  /**
   * There is a connection: sends what waits for one, after the calls that `first` makes. Those are subscriptions, so that
   * what a waiting call reads is not older than what is told of.
   */
  connected(send: (text: string) => void, first: () => void): void {
    const waiting = [...this.#calls.values()];
    this.#send = send;
    first();
    for (const call of waiting)
      this.#dispatch(call);
  }

  /** The connection is lost: calls that were sent fail, others wait for the next. */
  disconnected(reason: ConnectionError): void {
    this.#send = undefined;
    for (const call of [...this.#calls.values()].filter(({ sent }) => sent))
      call.fail(new ConnectionError(`${call.method}: the connection was lost before the answer: ${reason.message}`));
  }

  /** Nothing is sent or waited for any more. */
  close(reason: ConnectionError): void {
    this.#send = undefined;
    for (const call of [...this.#calls.values()])
      call.fail(reason);
  }

  /** The result of a call. */
  make(method: string, params: Members, timeout: number, { signal }: CallOptions = {}): Promise<Members> {
    return new Promise((done, failed) => {
      signal?.throwIfAborted();
      const id = ++this.#lastId;
      const text = writeJson({ jsonrpc: '2.0', id, method, params });
      const late = () => call.fail(new TimeoutError(`${method}: no answer within ${timeout} ms`));
      const abort = () => call.fail(signal?.reason);
      const timer = setTimeout(late, timeout);
      const finish = () => {
        clearTimeout(timer);
        signal?.removeEventListener('abort', abort);
        this.#calls.delete(id);
      };
      const call: Call = {
        method, text, sent: false,
        succeed: result => { finish(); done(result); },
        fail: reason => { finish(); failed(reason); },
      };
      signal?.addEventListener('abort', abort);
      this.#calls.set(id, call);
      this.#dispatch(call);
    });
  }

  /** True when the message was the answer to a call. */
  answered({ id, result, error }: Members): boolean {
    const call = typeof id === 'number' ? this.#calls.get(id) : undefined;
    if (!call)
      return typeof id === 'number' && id <= this.#lastId; // to one that was given up
    if (isMembers(result))
      call.succeed(result);
    else
      call.fail(isMembers(error) ? failureOf(call.method, error) : new ProtocolError(call.method, 0, 'an empty answer'));
    return true;
  }

  #dispatch(call: Call): void {
    if (!this.#send || call.sent)
      return;
    call.sent = true;
    this.#send(call.text);
  }
}
