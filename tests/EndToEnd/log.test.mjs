// The log: nobody who reads it, or does not, holds anybody up, and nobody who calls fills it.

import assert from 'node:assert/strict';
import { readlinkSync } from 'node:fs';
import { dirname } from 'node:path';
import { test } from 'node:test';
import { fileURLToPath } from 'node:url';

import { assertSucceeds } from './api.mjs';
import { refusedStart, startHost, temporaryDirectory, temporaryFile, withHost } from './host.mjs';
import { post, RawSocket, withConnection } from './wire.mjs';

const subjects = [{ name: 'Crate' }];
// A file that is no template, which as many paths name as one likes.
const name = '\u009b31m\u202e.xml';
const folder = dirname(temporaryFile(name, 'This is no template.'));
const stopped = fileURLToPath(new URL('stopped-output.py', import.meta.url));

// Calls that the log tells of, each with another path, after nonsense from somebody who may not even call.
async function fail(host, count) {
  for (let i = 0; i < 20; ++i) {
    const stranger = await RawSocket.open(host);
    stranger.socket.end(`nonsense ${i}\r\n\r\n`);
  }
  await withConnection(host, async connection => {
    const path = i => `${folder}${'/.'.repeat(100 + i % 100)}/${name}`;
    const calls = Array.from({ length: count }, (_, i) =>
      connection.call('SmartObjectServices.AddFromTemplate', [`Object ${i}`, path(i)]));
    for (const { error } of await Promise.all(calls))
      assert.ok(error);
  });
}

for (const [kind, what] of [['pipe', 'A pipe that nobody reads'], ['socket', 'A socket that nobody reads'],
                            ['terminal', 'A terminal that is stopped']])
  for (const signal of kind === 'terminal' ? ['SIGTERM', 'SIGINT'] : ['SIGTERM'])
    test(`${what} holds up neither clients nor the end of the host (${signal})`, async () => {
      const data = temporaryDirectory();
      const host = await startHost({ data, subjects, launcher: ['/usr/bin/python3', stopped, kind] });
      try {
        await fail(host, 2000);
        const begin = Date.now();
        assertSucceeds(await post(host, 'BasicObjectServices.SetColor', ['Crate', '#123456FF']));
        const taken = Date.now() - begin;
        assert.ok(taken < 1000, `${taken} ms`);
        assert.equal(await host.stop(signal, 5000), 0);
      } finally {
        await host.kill();
      }
      await withHost({ data }, async again =>
        assertSucceeds(await post(again, 'BasicObjectServices.Color', ['Crate']), { ColorHtml: '#123456ff' }));
    });

test('A host that does not start says so to nobody and ends all the same', async () => {
  const launcher = ['/usr/bin/python3', stopped, 'terminal'];
  const { status } = await refusedStart(['--frobnicate'], undefined, launcher);
  assert.equal(status, 2);
});

test('No file and no connection gets the number of a standard descriptor that is closed', async () => {
  const host = await startHost({ subjects, launcher: ['/usr/bin/python3', stopped, 'closed'] });
  try {
    for (const number of [1, 2])
      assert.equal(readlinkSync(`/proc/${host.pid}/fd/${number}`), '/dev/null');
    await fail(host, 200);
    assertSucceeds(await post(host, 'BasicObjectServices.BasicObjectList'), { Names: ['Crate'] });
    assert.equal(await host.stop(), 0);
  } finally {
    await host.kill();
  }
});

test('Many failing calls have a line each at first and are counted then, in lines of printable text', async () => {
  const count = 5000;
  const host = await startHost({ subjects });
  await fail(host, count);
  await host.assertEndsWell();
  const lines = host.stderr.split('\n').filter(line => line !== '');
  assert.ok(host.stderr.length < 40000, `${host.stderr.length} characters`);
  for (const line of lines) {
    assert.match(line, /^\d{4}-\d\d-\d\dT\d\d:\d\d:\d\d\.\d{3}[+-]\d\d:\d\d (error|notice) \[\w+\] /);
    assert.doesNotMatch(line, /[\p{Cc}\u202e]/u);
  }
  const told = lines.filter(line => line.includes('template cannot be used'));
  const counts = told.map(line => /Left out (\d+) more like this in \d+ s: /.exec(line)).filter(Boolean);
  assert.match(told[0], /\/\.\/\\u\{9b\}31m\\u\{202e\}\.xml/);
  assert.ok(told.length - counts.length >= 5, told.length);
  assert.equal(told.length - counts.length + counts.reduce((sum, [, more]) => sum + Number(more), 0), count);
});
