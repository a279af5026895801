/** What this package needs of a WebSocket: what browsers, Node.js and the package `ws` have in common. */
export interface Socket {
  onopen: (() => void) | null;
  onmessage: ((event: { data: unknown }) => void) | null;
  onerror: ((event: object) => void) | null;
  onclose: ((event: { code: number; reason: string }) => void) | null;
  send(text: string): void;
  close(code?: number, reason?: string): void;
  /** Ends the connection at once, where there is such a thing. */
  terminate?(): void;
}

export type SocketConstructor = new (url: string, protocols: string[]) => Socket;

/** The platform's own; in a Node.js without one, that of `ws`. */
export async function platformSocket(): Promise<SocketConstructor> {
  const { WebSocket: own } = globalThis as { WebSocket?: unknown };
  return (own ?? (await import('ws')).WebSocket) as SocketConstructor;
}

/** The WebSocket protocols with which a client presents its token, if it has one. */
export function protocolsFor(token: string | undefined): string[] {
  if (token === undefined)
    return [];
  const bytes = String.fromCharCode(...new TextEncoder().encode(token));
  const encoded = btoa(bytes).replaceAll('+', '-').replaceAll('/', '_').replace(/=+$/, '');
  return ['subject-store', `bearer.${encoded}`];
}
