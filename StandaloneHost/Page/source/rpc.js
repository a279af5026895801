// Calls over HTTP, and the token that a host may ask for.

import { parse } from './json.js';

const tokenKey = 'subject-store.token';
const patience = 30000;

export const rpcUrl = new URL('rpc', document.baseURI).href;
export const socketUrl = rpcUrl.replace(/^http/, 'ws');
export const descriptionUrl = new URL('openrpc.json', document.baseURI).href;
export const eventsUrl = new URL('asyncapi.json', document.baseURI).href;

// The token as long as this tab lives, where the browser keeps anything; otherwise as long as this page.
let token = '';
try {
  token = sessionStorage.getItem(tokenKey) ?? '';
} catch {
  // Kept in memory only.
}

export const hasToken = () => token !== '';

export function setToken(text) {
  token = text;
  try {
    if (text === '')
      sessionStorage.removeItem(tokenKey);
    else
      sessionStorage.setItem(tokenKey, text);
  } catch {
    // Kept in memory only.
  }
}

// A header holds bytes: those of the token's UTF-8.
function tokenBytes() {
  return String.fromCharCode(...new TextEncoder().encode(token));
}

const tokenHeaders = () => hasToken() ? { Authorization: `Bearer ${tokenBytes()}` } : {};

// What a WebSocket is opened with instead of a header, which a page cannot send.
export function subprotocols() {
  if (!hasToken())
    return [];
  const text = btoa(tokenBytes()).replaceAll('+', '-').replaceAll('/', '_').replaceAll('=', '');
  return ['subject-store', `bearer.${text}`];
}

// The host wants a token, or another one.
export class TokenWanted extends Error {}

// The answer's text. Throws a TokenWanted, or an Error that says in words what was wrong.
async function fetched(url, options) {
  let response;
  let text;
  try {
    response = await fetch(url, { ...options, cache: 'no-store', credentials: 'omit', redirect: 'error',
                                  signal: AbortSignal.timeout(patience) });
    text = await response.text();
  } catch (failure) {
    const late = failure.name === 'TimeoutError';
    throw new Error(late ? `There was no answer within ${patience / 1000} seconds.`
                         : `The host at ${new URL(url).host} cannot be reached.`);
  }
  if (response.status === 401)
    throw new TokenWanted(text);
  if (!response.ok)
    throw new Error(`The host answered with status ${response.status}: ${text.slice(0, 500).trim() || 'no text'}`);
  return text;
}

// The text of the server's description of itself.
export function fetchDescription() {
  return fetched(descriptionUrl, { headers: tokenHeaders() });
}

// A call, of which `params` is JSON text: { request, text, message }, the last two of the answer.
export async function post(method, params) {
  const request = `{"jsonrpc": "2.0", "id": 1, "method": ${JSON.stringify(method)}, "params": ${params}}`;
  const headers = { 'Content-Type': 'application/json', ...tokenHeaders() };
  const text = await fetched(rpcUrl, { method: 'POST', headers, body: request });
  try {
    return { request, text, message: parse(text) };
  } catch {
    throw new Error(`The answer is not JSON: ${text.slice(0, 500)}`);
  }
}
