import { ConnectionError } from './errors.js';
import type { Members } from './json.js';
import type { Subscription } from './types.js';

type Handler = (event: unknown) => void;

interface Topic {
  handlers: Set<{ handler: Handler }>;
  ready: Promise<void>;
  established(): void;
  refused(reason: unknown): void;
}

export interface SubscriptionsHost {
  request(method: string, params: Members): Promise<Members>;
  warn(warning: Error): void;
}

function newTopic(): Topic {
  let established = () => {};
  let refused: (reason: unknown) => void = () => {};
  const ready = new Promise<void>((done, failed) => {
    established = done;
    refused = failed;
  });
  ready.catch(() => {}); // whoever wants to know waits for it
  return { handlers: new Set(), ready, established, refused };
}

// Callbacks have a group; what happens to the connection has none, and the host is not asked for it.
function isCallback(name: string): boolean {
  return name.includes('.');
}

/** Who listens to what, and what the host has been asked to tell. */
export class Subscriptions {
  readonly #host: SubscriptionsHost;
  readonly #topics = new Map<string, Topic>();
  #connected = false;
  #closed: ConnectionError | undefined;

  constructor(host: SubscriptionsHost) {
    this.#host = host;
  }

  add(name: string, handler: Handler): Subscription {
    const entry = { handler };
    let topic = this.#topics.get(name);
    const isNew = topic === undefined;
    topic ??= newTopic();
    topic.handlers.add(entry);
    this.#topics.set(name, topic);
    if (this.#closed)
      topic.refused(this.#closed);
    else if (isNew)
      this.#establish(name, topic);
    const end = () => { this.#remove(name, entry); };
    return Object.assign(end, { ready: topic.ready });
  }

  /** There is a connection: asks for everything that is listened to. */
  connected(): void {
    this.#connected = true;
    for (const [name, topic] of this.#topics)
      this.#establish(name, topic);
  }

  disconnected(): void {
    this.#connected = false;
  }

  close(reason: ConnectionError): void {
    this.#connected = false;
    this.#closed = reason;
    for (const topic of this.#topics.values())
      topic.refused(reason);
    this.#topics.clear();
  }

  tell(name: string, event: unknown): void {
    for (const { handler } of [...this.#topics.get(name)?.handlers ?? []])
      try {
        handler(event);
      } catch (failure) {
        this.#host.warn(new Error(`a handler of ${name} failed`, { cause: failure }));
      }
  }

  #establish(name: string, topic: Topic): void {
    if (!isCallback(name))
      topic.established();
    else if (this.#connected)
      void this.#subscribe(name, topic);
  }

  async #subscribe(name: string, topic: Topic): Promise<void> {
    try {
      await this.#host.request('Server.Subscribe', { Name: name });
      topic.established();
    } catch (failure) {
      if (failure instanceof ConnectionError)
        return; // asked for again with the next connection
      topic.refused(failure);
      this.#host.warn(new Error(`${name} is not told of`, { cause: failure }));
    }
  }

  #remove(name: string, entry: { handler: Handler }): void {
    const topic = this.#topics.get(name);
    if (!topic?.handlers.delete(entry) || topic.handlers.size > 0)
      return;
    this.#topics.delete(name);
    if (isCallback(name) && this.#connected)
      this.#host.request('Server.Unsubscribe', { Name: name }).catch(() => {}); // the host forgets it with the connection
  }
}
