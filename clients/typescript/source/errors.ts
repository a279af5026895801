import type { ResultName } from './generated.js';

/** The host answered with a failure. */
export class SubjectStoreError extends Error {
  /** Name of the result code, such as 'NotFound'. */
  override readonly name: ResultName;

  constructor(
    /** The function that failed. */
    readonly method: string,
    /** The result code; its highest bit is set. */
    readonly code: number,
    name: ResultName,
    /** What the code means for this function; empty when its documentation does not mention it. */
    readonly text: string,
    /** What there is to say besides, for people; mostly nothing. */
    readonly detail: string | undefined,
  ) {
    super([`${method}: ${name}`, text, detail].filter(part => part).join(': '));
    this.name = name;
  }
}

/** The host did not understand a call: a function or a parameter that it does not have. */
export class ProtocolError extends Error {
  override readonly name = 'ProtocolError';

  constructor(
    readonly method: string,
    /** The code of JSON-RPC, such as -32601. */
    readonly code: number,
    message: string,
  ) {
    super(`${method}: ${message}`);
  }
}

/** There was no answer in time. The host may carry the call out all the same. */
export class TimeoutError extends Error {
  override readonly name = 'TimeoutError';
}

/** There is no connection, or no longer. What was called and not answered may have been carried out or not. */
export class ConnectionError extends Error {
  override readonly name = 'ConnectionError';
}
