// Asks a running host for its documents and writes the files that follow from them.

import { mkdirSync, writeFileSync } from 'node:fs';
import { dirname, join } from 'node:path';
import { fileURLToPath } from 'node:url';

import { withHost } from '../../tests/EndToEnd/host.mjs';
import { apiFiles } from './files.mjs';

const root = fileURLToPath(new URL('../..', import.meta.url));

async function served(host, path) {
  const answer = await fetch(host.url + path);
  if (!answer.ok)
    throw new Error(`${path}: HTTP status ${answer.status}`);
  return answer.text();
}

await withHost({}, async host => {
  const files = apiFiles(await served(host, '/openrpc.json'), await served(host, '/asyncapi.json'));
  for (const [path, content] of Object.entries(files)) {
    mkdirSync(dirname(join(root, path)), { recursive: true });
    writeFileSync(join(root, path), content);
    console.log(path);
  }
});
