// The disk is full, refuses, or loses the store's files while the host runs: edits are refused whole, reading goes on,
// and nothing that was answered is lost once the fault has gone.

import assert from 'node:assert/strict';
import { chmodSync, cpSync, existsSync, mkdirSync, readdirSync, readFileSync, renameSync, rmSync, statfsSync, symlinkSync,
         unlinkSync, writeFileSync } from 'node:fs';
import { join } from 'node:path';
import { test } from 'node:test';
import { setTimeout as sleep } from 'node:timers/promises';

import { assertFails, assertSucceeds, changed, outputsOf, snapshot } from './api.mjs';
import { runSync } from './children.mjs';
import { refusedStart, scaled, startHost, temporaryDirectory, until, withHost } from './host.mjs';
import { withConnection } from './wire.mjs';

const subjects = Array.from({ length: 40 }, (_, i) => ({ name: `Object ${i}` }));
const setColor = 'BasicObjectServices.SetColor';

// The lines of the log that match, once there are some: an answer may come before the line that the host wrote first.
async function lines(host, pattern) {
  const found = () => host.stderr.split('\n').filter(line => pattern.test(line));
  await until(`a line with ${pattern}`, () => found().length > 0, { seen: () => host.stderr });
  await sleep(20);
  return found();
}

let colour = 0x10000000;

// Edits, each of which would change something, one after the other.
async function edit(connection, count, check) {
  for (let i = 0; i < count; ++i)
    check(await connection.call(setColor, [subjects[i % subjects.length].name, `#${(colour += 4099).toString(16)}`]));
}

// What a host finds that starts with these files.
async function stored(data) {
  let found;
  await withHost({ data }, host => withConnection(host, async connection => { found = await snapshot(connection); }));
  return found;
}

// A fault comes and goes. `place(host)`: the data folder as the test sees it.
async function passes({ data, launcher, place = () => data, begin, end, result, says }) {
  const host = await startHost({ data, subjects, launcher });
  try {
    let held;
    await withConnection(host, async connection => {
      await edit(connection, 60, answer => assertSucceeds(answer));
      held = await snapshot(connection);
      await outputsOf(connection, 'Server.Subscribe', [changed]);
      await begin(host);
      await edit(connection, 60, answer => assertFails(answer, setColor, result));
      assert.deepEqual(await snapshot(connection), held, 'what is refused changes nothing, and is read on');
      assert.equal(connection.notifications.length, 0, 'and nobody is told');
      assert.equal((await lines(host, /cannot keep changes/)).length, 1, host.stderr);
      assert.match((await lines(host, /cannot keep changes/))[0], says);
      assert.ok((await lines(host, /cannot keep changes/))[0].includes(join(data, 'store.sqlite')));
      await end(host);
      await sleep(scaled(200));
      await edit(connection, 1, answer => assertSucceeds(answer));
      await edit(connection, 60, answer => assertSucceeds(answer));
      assert.equal((await lines(host, /cannot keep changes/)).length, 1, host.stderr);
      assert.equal((await lines(host, /keeps changes again.* 60 edits/)).length, 1, host.stderr);
      assert.ok(!readdirSync(place(host)).some(name => name.includes('unfinished')));
      held = await snapshot(connection);
    });
    const copy = join(temporaryDirectory(), 'copy'); // a disk of the host's own goes with it
    cpSync(place(host), copy, { recursive: true });
    await host.kill();
    for (const folder of existsSync(join(data, 'store.sqlite')) ? [copy, data] : [copy])
      assert.deepEqual(await stored(folder), held);
  } catch (failure) {
    await host.kill();
    failure.message += `\nThe host wrote:\n${host.stderr.slice(-4000)}`;
    throw failure;
  }
}

function newFolder() {
  const above = temporaryDirectory();
  return { above, data: join(above, 'data'), away: join(above, 'away') };
}

function fill(file) {
  const block = Buffer.alloc(4096, 'x');
  assert.throws(() => { for (;;) writeFileSync(file, block, { flag: 'a' }); }, { code: 'ENOSPC' });
}

// A small disk that the host alone sees; undefined where that is not allowed.
function ownDisk(options = 'size=2m') {
  for (const namespaces of [['--mount'], ['--map-root-user', '--mount']]) {
    const { data } = newFolder();
    mkdirSync(data);
    const script = `mount -t tmpfs -o ${options},mode=700 none "$0" && exec "$@"`;
    const launcher = ['unshare', ...namespaces, 'sh', '-c', script, data];
    try {
      runSync(launcher[0], [...launcher.slice(1), 'true']);
    } catch {
      continue;
    }
    const user = namespaces.length > 1 ? ['--user', '--preserve-credentials'] : [];
    const run = (host, ...command) =>
      runSync('nsenter', ['--target', String(host.pid), '--mount', '--root', ...user, ...command]);
    return { data, launcher, run, place: host => join('/proc', String(host.pid), 'root', data) };
  }
  return undefined;
}

// The memory of a container, which is a small disk too.
function sharedMemory() {
  const { blocks, bsize } = statfsSync('/dev/shm');
  assert.ok(blocks * bsize <= 256 << 20, 'no small disk: nothing may be mounted, and /dev/shm is large');
  const data = `/dev/shm/subject-store-test-${process.pid}`;
  process.on('exit', () => rmSync(data, { recursive: true, force: true }));
  return { data, place: () => data };
}

test('A full disk', () => {
  const disk = ownDisk() ?? sharedMemory();
  const ballast = host => join(disk.place(host), 'ballast');
  return passes({ ...disk, begin: host => fill(ballast(host)), end: host => unlinkSync(ballast(host)),
                  result: 'DiskFull', says: /the disk is full/ });
});

test('A disk that has room, but not for one more file', async t => {
  const disk = ownDisk('size=2m,nr_inodes=4');
  if (!disk)
    return t.skip('nothing may be mounted');
  const place = host => join(disk.place(host), 'ballast');
  const host = await startHost({ data: disk.data, subjects, launcher: disk.launcher });
  try {
    await withConnection(host, async connection => {
      unlinkSync(join(disk.place(host), 'store.sqlite'));
      unlinkSync(join(disk.place(host), 'store.sqlite-wal'));
      assert.throws(() => { for (let i = 0; ; ++i) writeFileSync(`${place(host)}${i}`, ''); }, { code: 'ENOSPC' });
      assertFails(await connection.call(setColor, ['Object 1', '#123456']), setColor, 'DiskFull');
      assert.match((await lines(host, /cannot keep changes/))[0], /not for one more file/);
    });
  } finally {
    await host.kill();
  }
  const none = ownDisk('size=2m,nr_inodes=1');
  const refused = await refusedStart(['--data', none.data], undefined, none.launcher);
  assert.match(refused.lines.join('\n'), /cannot use the store .*not for one more file/);
});

test('A store that may not be written is refused by the name of what is in the way', async () => {
  const { data } = newFolder();
  const file = join(data, 'store.sqlite');
  await withHost({ data, subjects }, () => {});
  const other = process.getuid() === 0 ? ['setpriv', '--reuid', '65534', '--clear-groups'] : [];
  const refusal = async () =>
    (await refusedStart(['--data', data, '--listen', '127.0.0.1:0'], undefined, other)).lines.join('\n');
  for (const folder of [join(data, '..'), data])
    chmodSync(folder, 0o777);
  for (const [folderMode, fileMode, says] of [[0o777, 0o444, /the file is read-only for this user$/],
                                              [0o555, 0o666, /its folder is read-only for this user$/],
                                              [0o777, 0o222, /this user may not read the file$/]]) {
    chmodSync(file, fileMode);
    chmodSync(data, folderMode);
    assert.match(await refusal(), says);
  }
  chmodSync(data, 0o777);
  chmodSync(file, 0o666);
});

test('A file system that is read-only', () => {
  const disk = ownDisk();
  if (disk)
    return passes({ ...disk, begin: host => disk.run(host, 'mount', '-t', 'tmpfs', '-o', 'ro', 'none', disk.data),
                    end: host => disk.run(host, 'umount', disk.data),
                    result: 'FileIOFailure', says: /Read-only file system/ });
  // Nothing can be made among the processes.
  const { data, away } = newFolder();
  const link = target => {
    rmSync(data, { force: true });
    symlinkSync(target, data);
  };
  mkdirSync(away);
  link(away);
  return passes({ data, begin: () => link('/proc/1'), end: () => link(away),
                  result: 'FileIOFailure', says: /cannot be written anew/ });
});

test('A file that may not grow', () => {
  const { data } = newFolder();
  const limit = (host, bytes) => runSync('prlimit', ['--pid', host.pid, `--fsize=${bytes}:`].map(String));
  return passes({ data, begin: host => limit(host, 0), end: host => limit(host, 'unlimited'),
                  result: 'FileIOFailure', says: /File too large/ });
});

test('A folder that is moved away and put back', () => {
  const { data, away } = newFolder();
  return passes({ data, begin: () => renameSync(data, away), end: () => renameSync(away, data),
                  result: 'FileIOFailure', says: /its folder is gone/ });
});

test('A folder that is removed with all that is in it, and made again', () => {
  const { data } = newFolder();
  return passes({ data, begin: () => rmSync(data, { recursive: true }), end: () => mkdirSync(data),
                  result: 'FileIOFailure', says: /its folder is gone/ });
});

test("Another host's file in the place of the store's, which stays as it is", async () => {
  const { data, above } = newFolder();
  const other = join(above, 'other');
  await withHost({ data: other, subjects: subjects.slice(0, 2) }, () => {});
  const file = join(other, 'store.sqlite');
  const bytes = readFileSync(file);
  const inPlace = join(data, 'store.sqlite');
  await passes({ data, begin: () => renameSync(file, inPlace), end: () => renameSync(inPlace, file),
                 result: 'FileIOFailure', says: /another file.*Move that file away/ });
  assert.ok(readFileSync(file).equals(bytes));
});

for (const [what, disturb] of [
  ['database', ({ data }) => unlinkSync(join(data, 'store.sqlite'))],
  ['log', ({ data }) => unlinkSync(join(data, 'store.sqlite-wal'))],
  ['whole folder, in whose place there is an empty one', ({ data, away }) => {
    renameSync(data, away);
    mkdirSync(data);
  }],
])
  test(`The ${what} is gone: the next edit writes all of it anew`, async () => {
    const folders = newFolder();
    const { data } = folders;
    const host = await startHost({ data, subjects });
    let held;
    await withConnection(host, async connection => {
      await edit(connection, 60, answer => assertSucceeds(answer));
      disturb(folders);
      await edit(connection, 1, answer => assertSucceeds(answer));
      held = await snapshot(connection);
    });
    await host.kill();
    assert.deepEqual(await stored(data), held);
    assert.equal((await lines(host, /written anew/)).length, 1, host.stderr);
  });

test('Thousands of edits while a fault lasts are refused fast and fill no log', async () => {
  const { data, away } = newFolder();
  const count = 5000;
  await withHost({ data, subjects }, host => withConnection(host, async connection => {
    renameSync(data, away);
    const begin = Date.now();
    const calls = Array.from({ length: count }, () => connection.call(setColor, ['Object 1', '#123456']));
    const answers = await Promise.all(calls);
    answers.forEach(answer => assertFails(answer, setColor, 'FileIOFailure'));
    assert.ok(Date.now() - begin < scaled(10000), `${Date.now() - begin} ms`);
    assert.equal((await lines(host, /cannot|Error/i)).length, 1, host.stderr);
    renameSync(away, data);
    await sleep(scaled(200));
    await edit(connection, 1, answer => assertSucceeds(answer));
    assert.match((await lines(host, /keeps changes again/))[0], new RegExp(` ${count} edits`));
  }));
});

test('A host that ends during a fault ends well, keeps what it can and tells of the rest', async () => {
  const { data } = newFolder();
  const host = await startHost({ data, subjects });
  rmSync(data, { recursive: true });
  await host.assertEndsWell();
  assert.match((await lines(host, /ends/))[0], /40 subjects.* not in that file.*its folder is gone/);
  assert.ok(!existsSync(data));

  const again = await startHost({ data, subjects });
  rmSync(join(data, 'store.sqlite'));
  await again.assertEndsWell();
  assert.equal(Object.keys(await stored(data)).length, subjects.length);
});
