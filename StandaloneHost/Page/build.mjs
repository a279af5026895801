// Builds the page from source/ into a folder (built/ unless another is named): the same bytes from the same sources.

import { copyFileSync } from 'node:fs';
import { resolve } from 'node:path';
import { fileURLToPath } from 'node:url';
import { build } from 'esbuild';

const here = fileURLToPath(new URL('.', import.meta.url));
const folder = resolve(process.argv[2] ?? `${here}built`);

await build({
  absWorkingDir: here,
  entryPoints: [{ in: 'source/main.js', out: 'page' }, { in: 'source/style.css', out: 'page' }],
  bundle: true,
  minify: true,
  format: 'esm',
  target: 'es2022',
  charset: 'utf8',
  outdir: folder,
});
copyFileSync(`${here}source/index.html`, `${folder}/index.html`);
