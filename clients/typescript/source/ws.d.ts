declare module 'ws' {
  export const WebSocket: unknown;
}
