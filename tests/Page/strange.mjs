// A server with the page and a description of its own, for what no host describes today, and what none should.

import { once } from 'node:events';
import { readFileSync } from 'node:fs';
import { createServer } from 'node:http';

import { inTime } from '../EndToEnd/waiting.mjs';

// The file of the built page.
export const built = name => readFileSync(new URL(`../../StandaloneHost/Page/built/${name}`, import.meta.url));

// By where they are read: type and name.
export const files = { '/': ['text/html', 'index.html'], '/page.js': ['text/javascript', 'page.js'],
                       '/page.css': ['text/css', 'page.css'] };

export const markup = '<img src=x onerror=alert(1)>';

// An argument of each kind that the format knows.
export const description = {
  openrpc: '1.3.2',
  info: { title: markup, description: markup },
  methods: [{
    name: `Strange.${markup}`, description: markup, 'x-group': 'Strange',
    'x-resultDocumentation': `Ok - ${markup}\nno code`,
    params: [
      { name: 'Choice', schema: { type: 'integer', enum: [0, 7], 'x-enumeration': 'Strange.EChoice' } },
      { name: 'Texts', schema: { type: 'array', items: { type: 'string' } } },
      { name: 'Big', schema: { type: 'integer' } },
      { name: 'Ratio', schema: { type: 'number' } },
      { name: 'Other', schema: { type: 'object' } },
    ],
  }, { name: 'Strange.Old', deprecated: true }],
  'x-types': [{ name: 'Strange.EChoice', values: [{ name: 'None', value: 0 }, { name: markup, value: 7 }] }],
};

// Runs `body` with such a server, which answers each call with what `reply` makes of the request's text, and anybody who
// asks for the description with `text`.
export async function withStrangeHost(text, reply, body) {
  const server = createServer(async (request, response) => {
    const [type, file] = files[request.url] ?? [];
    if (file)
      return response.writeHead(200, { 'Content-Type': type }).end(built(file));
    if (request.url === '/openrpc.json')
      return response.end(text());
    if (request.method !== 'POST') // the page tries now and then whether there is a WebSocket
      return response.end();
    let asked = '';
    for await (const part of request)
      asked += part;
    response.end(reply(asked));
  });
  server.listen(0, '127.0.0.1');
  await inTime(once(server, 'listening'), 'the server listens');
  const { port } = server.address();
  try {
    await body({ url: `http://127.0.0.1:${port}`, ws: `ws://127.0.0.1:${port}/rpc` });
  } finally {
    server.closeAllConnections();
    server.close();
  }
}
