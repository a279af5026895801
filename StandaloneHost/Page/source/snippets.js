// A call, or a subscription, in the languages of those who copy it.

import { toJson, toParams } from './fields.js';
import { hasToken, rpcUrl, socketUrl } from './rpc.js';

const shellQuoted = text => /^[\w@%+:,./-]+$/.test(text) ? text : `'${text.replaceAll("'", "'\\''")}'`;

// The parts of a request, a line each.
const requestOf = (method, values) => [
  '{"jsonrpc": "2.0", "id": 1,', ` "method": ${JSON.stringify(method)},`, ` "params": ${toParams(values)}}`];

function curl(method, values) {
  return [
    ...hasToken() ? ["TOKEN='the host’s token'"] : [],
    `curl -s ${shellQuoted(rpcUrl)} \\`,
    "  -H 'Content-Type: application/json' \\",
    ...hasToken() ? ['  -H "Authorization: Bearer $TOKEN" \\'] : [],
    `  -d ${shellQuoted(requestOf(method, values).join('\n   '))}`,
  ].join('\n');
}

function openSocket() {
  if (!hasToken())
    return [`const socket = new WebSocket(${JSON.stringify(socketUrl)});`];
  return [
    "const token = 'the host’s token';",
    "const coded = btoa(String.fromCharCode(...new TextEncoder().encode(token)))",
    "  .replaceAll('+', '-').replaceAll('/', '_').replaceAll('=', '');",
    `const socket = new WebSocket(${JSON.stringify(socketUrl)}, ['subject-store', 'bearer.' + coded]);`,
  ];
}

// A text in single quotes.
const javascriptQuoted = text => `'${text.replaceAll('\\', '\\\\').replaceAll("'", "\\'")}'`;

const send = lines => [
  'socket.onopen = () => socket.send(', `  ${lines.map(javascriptQuoted).join(' +\n  ')});`];

// What is printed is the answer's own text: JavaScript's numbers would lose digits of the longest.
function javascript(method, values) {
  return [
    ...openSocket(),
    ...send(requestOf(method, values)),
    'socket.onmessage = ({ data }) => {',
    '  if (JSON.parse(data).id === 1) {',
    '    console.log(data);',
    '    socket.close();',
    '  }',
    '};',
  ].join('\n');
}

function listening(method, values) {
  return [...openSocket(), ...send(requestOf(method, values)), 'socket.onmessage = ({ data }) => console.log(data);']
    .join('\n');
}

function pythonValue(value) {
  if (value.kind === 'truth')
    return value.truth ? 'True' : 'False';
  return value.kind === 'json' ? `json.loads(${JSON.stringify(value.text)})` : toJson(value);
}

function python(method, values) {
  const params = values.map(([name, value]) => `${JSON.stringify(name)}: ${pythonValue(value)}`);
  return [
    'import json',
    'import urllib.request',
    '',
    ...hasToken() ? ['token = "the host’s token"'] : [],
    `call = {"jsonrpc": "2.0", "id": 1, "method": ${JSON.stringify(method)},`,
    `        "params": {${params.join(', ')}}}`,
    'request = urllib.request.Request(',
    `    ${JSON.stringify(rpcUrl)}, json.dumps(call).encode(),`,
    `    {"Content-Type": "application/json"${hasToken() ? ', "Authorization": b"Bearer " + token.encode()' : ''}})`,
    'with urllib.request.urlopen(request) as answer:',
    '    print(json.load(answer))',
  ].join('\n');
}

// The host's own client knows where it listens unless told otherwise.
function options() {
  const address = new URL('.', rpcUrl).href.replace(/\/$/, '');
  return [...address === 'http://127.0.0.1:8420' ? [] : ['--server', shellQuoted(address)],
          ...hasToken() ? ['--token-file', 'FILE'] : []];
}

// By name where a value could be taken for an option or for another argument's name.
function commandLine(method, values) {
  const plain = values.map(([name, value]) => [name, value.kind === 'text' ? value.text : toJson(value)]);
  const named = plain.some(([, text]) => text.startsWith('-') || text.includes('='));
  const words = plain.map(([name, text]) => shellQuoted(named ? `${name}=${text}` : text));
  return ['subject-store-host', 'call', ...options(), method, ...words].join(' ');
}

// For the call of a method with these values ([name, value] each): [language, text] each.
export function snippetsOfCall(method, values) {
  if (method.startsWith('Server.'))
    return [['JavaScript', listening(method, values)]];
  return [['curl', curl(method, values)], ['JavaScript', javascript(method, values)],
          ['Python', python(method, values)], ['Command line', commandLine(method, values)]];
}

// For listening to a callback: [language, text] each.
export function snippetsOfCallback(name) {
  return [['JavaScript', listening('Server.Subscribe', [['Name', { kind: 'text', text: name }]])],
          ['Command line', ['subject-store-host', 'subscribe', ...options(), name].join(' ')]];
}
