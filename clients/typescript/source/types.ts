import type { Callbacks, Functions, Hello, ResultName } from './generated.js';
import type { ConnectionError } from './errors.js';

/** The full name of a function, such as 'BasicObjectServices.Color'. */
export type Method = keyof Functions;
export type Inputs<M extends Method> = Functions[M]['inputs'];
export type Outputs<M extends Method> = Functions[M]['outputs'];

/** A successful answer. */
export interface Result<M extends Method> {
  /** 0, or what kind of success it was. */
  code: number;
  name: ResultName;
  outputs: Outputs<M>;
  /** The answer of a function that is a question. */
  returned: Functions[M]['returned'];
}

export interface CallOptions {
  /** Milliseconds to wait for the answer, in place of the client's. */
  timeout?: number;
  /** Gives the call up. The host may carry it out all the same. */
  signal?: AbortSignal;
}

/** Whoever can call the functions of the API. */
export interface Caller {
  call<M extends Method>(method: M, inputs: Inputs<M>, options?: CallOptions): Promise<Result<M>>;
}

/** What happens to the connection. */
export interface ConnectionEvents {
  /** The connection was lost; the client tries to get it back. */
  disconnected: { reason: ConnectionError };
  /** The connection is back, and its subscriptions are on their way. Changes in between were not told of. */
  reconnected: { hello: Hello };
  /** The host was started anew: everything that was read from it may be stale. */
  epoch: { previous: string; current: string };
}

/** Everything that `on` can tell of. */
export interface Events extends Callbacks, ConnectionEvents {}

/** Ends what `on` began. */
export interface Subscription {
  (): void;
  /** Fulfilled once the host tells of what happens from then on; rejected when it refuses to. */
  readonly ready: Promise<void>;
}
