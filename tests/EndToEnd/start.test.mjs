// Starting the host: what it refuses, in one line, and whom it lets in.

import assert from 'node:assert/strict';
import { existsSync, readFileSync, renameSync, symlinkSync, writeFileSync } from 'node:fs';
import { join, relative } from 'node:path';
import { describe, test } from 'node:test';

import { assertSucceeds } from './api.mjs';
import { configuration, refusedStart, temporaryDirectory, temporaryFile, withHost } from './host.mjs';
import { Connection, post, request, upgradeStatus } from './wire.mjs';

const subjects = [{ name: 'Crate' }];
const listen = ['--listen', '127.0.0.1:0'];
const nowhere = '/nonexistent/file';

function assertRefused({ status, signal, lines }, says, what) {
  assert.equal(status, 2, `${what}: ${signal ?? status}\n${lines.join('\n')}`);
  assert.equal(lines.length, 1, `${what}:\n${lines.join('\n')}`);
  assert.match(lines[0], says, what);
}

function escaped(text) {
  return new RegExp(text.replace(/[.*+?^${}()|[\]\\]/g, '\\$&'));
}

const noPlugin = temporaryFile('no-plugin.so', 'This is no plugin.');
const library = /\S*libc\.so\.6$/m.exec(readFileSync('/proc/self/maps', 'utf8'))[0];
const good = configuration([{ name: 'Crate' }, { name: 'Barrel' }]);
const token = temporaryFile('token', 'open sesame/42=\n');

const refusedOptions = {
  'an unknown option': [['--frobnicate'], /frobnicate/],
  'a stray argument': [['stray'], /stray|positional/],
  'an option without its value': [['--features'], /features/],
  'a mask that is no number': [['--features', '0xZZ'], /features|0xZZ/],
  'an empty mask': [['--features', ''], /features/],
  'a negative mask': [['--features', '-1'], /features|-1/],
  'a mask with a fraction': [['--features', '1.5'], /features|1\.5/],
  'a mask that is too large': [['--features', '4294967296'], /features|4294967296/],
  'a mask with more after it': [['--features', '1 2'], /features|1 2/],
  'a time for the T-pose that is no number': [['--t-pose-time', 'long'], /t-pose-time/],
  'a time for a calibration that is negative': [['--subject-calibration-time', '-1'], /subject-calibration-time/],
  'an unknown level': [['--level', '3'], /level/],
  'a level that is no number': [['--level', 'two'], /level|two/],
  'an unknown log level': [['--log', 'chatty'], /log|chatty/],
  'a listen address that is none': [['--listen', 'nonsense'], /listen|nonsense/],
  'a listen address without a port': [['--listen', '127.0.0.1'], /listen|127\.0\.0\.1/],
  'a listen address with an empty port': [['--listen', '127.0.0.1:'], /listen|127\.0\.0\.1/],
  'a port that is too large': [['--listen', '127.0.0.1:65536'], /listen|65536/],
  'a port with more after it': [['--listen', '127.0.0.1:80x'], /listen|80x/],
  'an address of another machine': [['--listen', '192.0.2.1:0', '--token-file', token], /192\.0\.2\.1/],
  'an open address without a token': [['--listen', '0.0.0.0:0'], /token/],
  'an open IPv6 address without a token': [['--listen', '[::]:0'], /token/],
  'a missing plugin': [[...listen, '--plugin-file', nowhere], escaped(nowhere)],
  'a file that is no plugin': [[...listen, '--plugin-file', noPlugin], escaped(noPlugin)],
  'a library that is no plugin': [[...listen, '--plugin-file', library], escaped(library)],
  'a missing configuration': [[...listen, '--config', nowhere], escaped(nowhere)],
  'a missing token file': [[...listen, '--token-file', nowhere], escaped(nowhere)],
  'an empty token file': [[...listen, '--token-file', temporaryFile('empty-token', '\n')], /token/],
  'a token that fits no header': [[...listen, '--token-file', temporaryFile('odd-token', 'spät\n')], /ASCII/],
  'a token without an end': [[...listen, '--token-file', temporaryFile('long-token', 'x'.repeat(1e6))], /512/],
  'an origin that is none': [[...listen, '--allow-origin', 'not an origin'], /allow-origin|not an origin/],
  'a ready file that cannot be written': [[...listen, '--ready-file', nowhere], escaped(nowhere)],
};

describe('The host refuses in one line', () => {
  for (const [what, [options, says]] of Object.entries(refusedOptions))
    test(what, async () => assertRefused(await refusedStart(['--data', ':memory:', ...options]), says, what));
});

test('A ready file that would replace a file of the host is refused, and that file stays', async () => {
  const data = temporaryDirectory();
  await withHost({ data, subjects }, () => {});
  const link = join(temporaryDirectory(), 'link');
  symlinkSync(data, link);
  const storeLink = join(temporaryDirectory(), 'ready.json');
  symlinkSync(join(data, 'store.sqlite'), storeLink);
  const config = temporaryFile('stage.xml', good);
  const configLink = join(link, '../stage.xml');
  symlinkSync(config, configLink);
  const [certificate, key] = ['cert', 'key'].map(name => temporaryFile(name, 'PEM'));
  const encrypted = ['--tls-cert', certificate, '--tls-key', key];
  const bytes = readFileSync(join(data, 'store.sqlite'));
  for (const [file, options = []] of [
    ...['store.sqlite', 'store.sqlite-wal', 'store.sqlite-shm', 'store.sqlite.unfinished', 'window.ini']
      .map(name => [join(data, name)]),
    [join(link, 'store.sqlite')], [storeLink], [join(data, 'none/../store.sqlite')],
    [relative(process.cwd(), join(data, 'store.sqlite'))], [configLink, ['--config', config]],
    [token, ['--token-file', token]], [certificate, encrypted], [key, encrypted],
    [noPlugin, ['--plugin-file', noPlugin]],
  ])
    assertRefused(await refusedStart([...listen, '--data', data, '--ready-file', file, ...options]),
                  /--ready-file: .*replace/, file);
  assert.ok(readFileSync(join(data, 'store.sqlite')).equals(bytes));
});

test('The ready file goes with the host, unless it is another\'s by then', async () => {
  let file;
  await withHost({ options: ['--log', 'error'] }, host => { file = host.readyFile; });
  assert.ok(!existsSync(file));
  await withHost({}, host => {
    file = host.readyFile;
    writeFileSync(`${file}.new`, 'another');
    renameSync(`${file}.new`, file);
  });
  assert.equal(readFileSync(file, 'utf8'), 'another');
});

test('A port in use is refused', () => withHost({}, async host => {
  const address = `127.0.0.1:${host.port}`;
  assertRefused(await refusedStart(['--data', ':memory:', '--listen', address]), escaped(String(host.port)), address);
}));

const barrel = '<Subject kind="BasicObjects" name="Barrel"></Subject>';

// Each: what stands in the place of the fourth line's subject, and in which line the fault is.
const faults = [
  ['<Subject kind="BasicObjects" name="Barrel">', 5], ['<Subject kind="BasicObjects" name=Barrel></Subject>', 4],
  ['<Subject kind="Basics" name="Barrel"></Subject>', 4], ['<Subject name="Barrel"></Subject>', 4],
  ['<Subject kind="BasicObjects"></Subject>', 4], ['<Subject kind="BasicObjects" name="Crate"></Subject>', 4],
  ['<Subject kind="BasicObjects" name=" Barrel"></Subject>', 4], ['<Subject kind="BasicObjects" name=""></Subject>', 4],
  ['<Thing/>', 4], [barrel.replace('Barrel', 'Barr&what;el'), 4],
  ...[['<Things/>', 4],
      ['<Parameters><Weight>3</Weight></Parameters>', 4],
      ['<Parameters><Enabled>maybe</Enabled></Parameters>', 4],
      ['<Parameters>\n\n<ColourRGBA>red</ColourRGBA></Parameters>', 6],
      ['<Markers>\n<Marker x="0" y="0"/></Markers>', 5],
      ['<Markers>\n<Marker x="0" y="0" z="nan"/></Markers>', 5],
      ['<Warnings><WarningOfNothing>true</WarningOfNothing></Warnings>', 4],
  ].map(([content, number]) => [barrel.replace('><', `>${content}<`), number]),
].map(([line, number]) => [good.replace(barrel, line), number]);

faults.push(
  ['', 1], ['Not XML.\n', 1], ['<Configuration version="1"/>', 1], [good.replace(' version="1"', ''), 1],
  [good.replace('version="1"', 'version="2"'), 1], [`${good}<More/>`, 7], [good.slice(0, -40), 4]);

test('A configuration with a fault is refused with its place, and nothing is kept of it', async () => {
  for (const [text, line] of faults) {
    const data = temporaryDirectory();
    const file = temporaryFile('stage.xml', text);
    const refused = await refusedStart([...listen, '--data', data, '--config', file]);
    assertRefused(refused, /\d/, text);
    const [, place] = new RegExp(`${escaped(file).source}:(\\d+):\\d+`).exec(refused.lines[0]) ?? [];
    assert.equal(Number(place), line, `${text}\n${refused.lines[0]}`);
    await withHost({ data }, async host =>
      assertSucceeds(await post(host, 'BasicObjectServices.BasicObjectList'), { Names: [] }));
  }
});

test('Several configurations fill a store together, or not at all', async () => {
  const data = temporaryDirectory();
  const [first, second, again] = [good, configuration([{ name: 'Apple' }]), configuration([{ name: 'Crate' }])]
    .map((text, i) => temporaryFile(`stage${i}.xml`, text));
  const refused = await refusedStart([...listen, '--data', data, '--config', first, '--config', again]);
  assertRefused(refused, escaped(again), 'a repeated name');
  await withHost({ data, options: ['--config', first, '--config', second] }, async host =>
    assertSucceeds(await post(host, 'BasicObjectServices.BasicObjectList'), { Names: ['Apple', 'Barrel', 'Crate'] }));
});

const list = JSON.stringify({ jsonrpc: '2.0', id: 1, method: 'BasicObjectServices.BasicObjectList' });

// Whether the host lets in a call, an upgrade and a look at the description with these headers.
async function assertLetsIn(host, headers, refusal) {
  const call = await request(host, { headers, body: list });
  assert.equal(call.status, refusal ?? 200, JSON.stringify(headers));
  assert.equal(await upgradeStatus(host, headers), refusal ?? 101, JSON.stringify(headers));
  if (refusal === undefined)
    assert.deepEqual(JSON.parse(call.body).result.outputs, { Names: ['Crate'] });
  else
    assert.ok(!call.body.includes('Crate'));
  return call;
}

const tokenOptions = ['--token-file', token];
test('A token, once asked for, has to be shown', () => withHost({ subjects, options: tokenOptions }, async host => {
  const wrong = ['', 'Bearer', 'Bearer ', 'Bearer wrong', 'Bearer open sesame/42', 'Bearer open sesame/42==',
                 'Bearer Open Sesame/42=', 'Basic open sesame/42=', 'open sesame/42='];
  for (const headers of [{}, ...wrong.map(Authorization => ({ Authorization }))]) {
    const refused = await assertLetsIn(host, headers, 401);
    assert.match(refused.headers['www-authenticate'] ?? '', /^Bearer/);
  }
  const headers = { Authorization: 'Bearer open sesame/42=' };
  await assertLetsIn(host, headers);
  const connection = await Connection.open(host, { headers });
  assert.equal((await connection.call('BasicObjectServices.BasicObjectList')).result.code, 0);
  connection.socket.terminate();
}));

const originOptions = ['--allow-origin', 'https://panel.example', '--allow-origin', 'http://localhost:3000'];
test('A web page of an allowed origin gets in', () => withHost({ subjects, options: originOptions }, async host => {
  for (const Origin of [`http://127.0.0.1:${host.port}`, 'https://panel.example', 'http://localhost:3000']) {
    const { headers } = await assertLetsIn(host, { Origin });
    assert.equal(headers['access-control-allow-origin'], Origin);
  }
  for (const Origin of ['https://evil.example', 'null', 'http://panel.example', 'https://panel.example.evil.example',
                        'https://panel.example:8443', 'http://127.0.0.1:1', `https://127.0.0.1:${host.port}`,
                        'http://localhost:3001'])
    await assertLetsIn(host, { Origin }, 403);
}));

test('A foreign host name is not served', () => withHost({ subjects }, async host => {
  await assertLetsIn(host, { Host: `127.0.0.1:${host.port}` });
  for (const Host of ['evil.example', `evil.example:${host.port}`, `127.0.0.1.evil.example:${host.port}`])
    await assertLetsIn(host, { Host, Origin: `http://${Host}` }, 403);
  await assertLetsIn(host, { Host: `evil.example@127.0.0.1:${host.port}` }, 400);
  for (const path of ['/openrpc.json', '/'])
    assert.equal((await request(host, { method: 'GET', path, headers: { Host: 'evil.example' } })).status, 403);
  await assertLetsIn(host, { Origin: 'https://evil.example' }, 403);
}));
