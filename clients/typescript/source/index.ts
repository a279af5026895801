export { SubjectStoreClient, type ClientOptions } from './client.js';
export { ConnectionError, ProtocolError, SubjectStoreError, TimeoutError } from './errors.js';
export * from './generated.js';
export type { Socket, SocketConstructor } from './socket.js';
export type {
  CallOptions, Caller, ConnectionEvents, Events, Inputs, Method, Outputs, Result, Subscription,
} from './types.js';
