// A stage with a crate on it, and the question for its colour: the call with which the protocol is tried.

import { success } from './api.mjs';

export const subjects = [{ name: 'Crate', parameters: { ColourRGBA: '#ff3366cc' } }, { name: 'Barrel' }];

export const color = { jsonrpc: '2.0', method: 'BasicObjectServices.Color', params: ['Crate'] };

// The question as text, with members replaced or (when undefined) left out.
export function askColor(members = {}) {
  return JSON.stringify({ ...color, id: 7, ...members });
}

export function crateColor(id = 7) {
  return { jsonrpc: '2.0', id, result: success({ ColorHtml: '#ff3366cc' }) };
}

// The limits that the server promises in its greeting.
export const limits = { messageBytes: 1048576, nesting: 32, batchCalls: 256, connections: 1100, webSockets: 1024,
                        subscriptions: 64, callsInFlight: 1024, callsInFlightOverall: 65536, outgoingBytes: 8388608,
                        outgoingBytesOverall: 268435456, outgoingNotifications: 256, pingAfterSeconds: 30 };
