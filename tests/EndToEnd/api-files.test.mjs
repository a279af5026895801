// The files that follow from the API are those of the host that was built.

import assert from 'node:assert/strict';
import { readFileSync } from 'node:fs';
import { test } from 'node:test';

import { apiFiles, command } from '../../scripts/api/files.mjs';
import { compact } from '../../scripts/api/layout.mjs';
import { withHost } from './host.mjs';
import { request } from './wire.mjs';

test('the files of the repository describe this API', () => withHost({}, async host => {
  const [openrpc, asyncapi] = await Promise.all(['/openrpc.json', '/asyncapi.json'].map(async path =>
    (await request(host, { method: 'GET', path })).body));
  for (const [path, content] of Object.entries(apiFiles(openrpc, asyncapi))) {
    const file = readFileSync(new URL(`../../${path}`, import.meta.url), 'utf8');
    assert.ok(file === content, `${path} is of another API: run ${command}`);
  }
  // Laid out, they are still what was served, with the greatest numbers digit by digit.
  const file = readFileSync(new URL('../../docs/api/openrpc.json', import.meta.url), 'utf8');
  assert.equal(compact(file), openrpc);
  assert.match(file, /"maximum": 18446744073709551615\b/);
}));
