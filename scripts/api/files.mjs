// The files of the repository that follow from what the host says of its API.

import { createHash } from 'node:crypto';

import { generate } from '../../clients/typescript/generate.mjs';
import { compact, spread } from './layout.mjs';
import { reference } from './reference.mjs';

export const command = 'scripts/describe-api';

// The host's greeting has the same text.
export function apiHash(openrpc, asyncapi) {
  return createHash('sha256').update(compact(openrpc) + compact(asyncapi)).digest('hex');
}

// Path in the repository and content of each file. The documents are texts as they were served.
export function apiFiles(openrpc, asyncapi) {
  const hash = apiHash(openrpc, asyncapi);
  return {
    'docs/api/openrpc.json': spread(openrpc),
    'docs/api/asyncapi.json': spread(asyncapi),
    'docs/api/README.md': reference(JSON.parse(openrpc), hash),
    'clients/typescript/source/generated.ts': generate(JSON.parse(openrpc), JSON.parse(asyncapi), hash),
  };
}
