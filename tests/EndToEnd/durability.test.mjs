// What was answered stays, whatever ends the host; and a store that is not fit for use is left alone.

import assert from 'node:assert/strict';
import { readdirSync, readFileSync, statSync, truncateSync, writeFileSync } from 'node:fs';
import { join } from 'node:path';
import { test } from 'node:test';
import { setTimeout as sleep } from 'node:timers/promises';

import { snapshot } from './api.mjs';
import { inTime, refusedStart, scaled, startHost, temporaryDirectory, temporaryFile, withHost } from './host.mjs';
import { Connection, withConnection } from './wire.mjs';

const rounds = 20;
const inFlight = 24;

// Objects of one writer; it alone edits those whose names begin with its letter.
function objectsOf(letter) {
  const untouched = { enabled: true, colour: '#ffffffff', proximity: '', template: '' };
  return new Map(Array.from({ length: 60 }, (_, i) => [`${letter}${i}`, untouched]));
}

function pick(list) {
  return list[Math.floor(Math.random() * list.length)];
}

// A random edit, as a call and as what it does to the objects known by name.
function randomEdit(objects, letter, number) {
  const name = pick([...objects.keys()]);
  const change = (method, member, value) => ({
    method, params: [name, value], apply: known => known.set(name, { ...known.get(name), [member]: value }) });
  if (number % 40 === 39 && objects.size > 8)
    return { method: 'Remove', params: [name], apply: known => known.delete(name) };
  const newName = `${letter}${number}·${'ñ'.repeat(number % 50)}`;
  const rename = known => {
    known.set(newName, known.get(name));
    known.delete(name);
  };
  return pick([
    { method: 'Rename', params: [name, newName], apply: rename },
    change('SetEnabled', 'enabled', !objects.get(name).enabled),
    change('SetColor', 'colour', `#${(0x10000000 + number).toString(16)}`),
    change('SetProximityGroupName', 'proximity', `near ${number}`),
    change('SetTemplateGroupName', 'template', `like ${number}`),
  ]);
}

// Sends edits with many in flight until the connection breaks; `sent` has them in order, `answered` of them came back.
class Writer {
  sent = [];
  answered = 0;
  #objects;

  constructor(letter, objects) {
    this.letter = letter;
    this.before = objects;
    this.#objects = new Map(objects);
  }

  async run(host, numbers) {
    const connection = await Connection.open(host);
    const lane = async () => {
      for (;;) {
        const edit = randomEdit(this.#objects, this.letter, numbers.next++);
        edit.apply(this.#objects);
        const place = this.sent.push(edit);
        const { result } = await connection.call(`BasicObjectServices.${edit.method}`, edit.params);
        assert.deepEqual(result, { code: 0, name: 'Ok', outputs: {} }, `${edit.method} ${edit.params}`);
        assert.equal(this.answered, place - 1, 'answers come in order');
        this.answered = place;
      }
    };
    const lanes = await Promise.allSettled(Array.from({ length: inFlight }, lane));
    for (const { reason } of lanes)
      if (reason instanceof assert.AssertionError)
        throw reason;
  }

  // Finds how many of the edits the store has: all that were answered, and perhaps more of those that were sent.
  assertKept(stored) {
    const state = new Map(this.before);
    let differences;
    for (let count = 0; count <= this.sent.length; ++count) {
      if (count >= this.answered) {
        const names = new Set([...state.keys(), ...stored.keys()]);
        const told = [...names].map(name => [name, JSON.stringify(state.get(name)), JSON.stringify(stored.get(name))])
          .filter(([, expected, found]) => expected !== found);
        if (told.length === 0)
          return state;
        differences ??= told;
      }
      this.sent[count]?.apply(state);
    }
    assert.fail(`${this.answered} of ${this.sent.length} edits were answered; after those, the state differs:\n${
      differences.map(([name, expected, found]) => `${name}: ${expected} expected, ${found} found`).join('\n')}`);
  }
}

async function storedObjects(host) {
  const objects = new Map();
  await withConnection(host, async connection => {
    const ask = async (name, params) => {
      const { result } = await connection.call(`BasicObjectServices.${name}`, params);
      return Object.values(result.outputs)[0];
    };
    const names = await ask('BasicObjectList', []);
    await Promise.all(names.map(async name => {
      const [enabled, colour, proximity, template] = await Promise.all(
        ['Enabled', 'Color', 'ProximityGroupName', 'TemplateGroupName'].map(query => ask(query, [name])));
      objects.set(name, { enabled, colour, proximity, template });
    }));
  });
  return objects;
}

test(`An answered edit survives a kill, ${rounds} times over`, async () => {
  const data = temporaryDirectory();
  const letters = ['A', 'B', 'C'];
  let known = new Map(letters.map(letter => [letter, objectsOf(letter)]));
  const subjects = [...known.values()].flatMap(objects => [...objects.keys()].map(name => ({ name })));
  const numbers = { next: 1000 };
  let answered = 0;
  let unanswered = 0;
  for (let round = 0; round < rounds; ++round) {
    const host = await startHost({ data, subjects });
    const writers = letters.map(letter => new Writer(letter, known.get(letter)));
    const ends = writers.map(writer => writer.run(host, numbers));
    await sleep(scaled(20 + Math.random() * 200));
    await host.kill();
    await inTime(Promise.all(ends), 'the writers notice');

    await withHost({ data }, async again => {
      const stored = await storedObjects(again);
      known = new Map(writers.map(writer => [writer.letter, writer.assertKept(
        new Map([...stored].filter(([name]) => name.startsWith(writer.letter))))]));
    });
    for (const writer of writers) {
      answered += writer.answered;
      unanswered += writer.sent.length - writer.answered;
    }
  }
  assert.ok(answered > rounds && unanswered > rounds, `${answered} answered, ${unanswered} not`);
});

const subjects = Array.from({ length: 200 }, (_, i) => ({
  name: `Object ${i}`,
  parameters: { ColourRGBA: '#80402010', ProximityGroupName: `Group ${i}` },
  markers: [[0, 0, 0], [i, 0, 0]],
}));

function assertRefused({ status, lines }, says) {
  assert.equal(status, 2, lines.join('\n'));
  assert.equal(lines.length, 1, lines.join('\n'));
  assert.match(lines[0], says);
}

function refusedStore(data) {
  return refusedStart(['--listen', '127.0.0.1:0', '--data', data]);
}

test('A store outlives a clean end, and a configuration does not overwrite it', async () => {
  const data = join(temporaryDirectory(), 'made', 'on demand');
  let before;
  await withHost({ data, subjects }, host => withConnection(host, async connection => {
    await connection.call('BasicObjectServices.Rename', ['Object 0', 'First']);
    await connection.call('BasicObjectServices.SetEnabled', ['First', false]);
    before = await snapshot(connection);
  }));
  assert.equal(Object.keys(before).length, subjects.length);
  await withHost({ data, subjects: [{ name: 'Stranger' }] }, host => withConnection(host, async connection =>
    assert.deepEqual(await snapshot(connection), before)));
});

test('A store is used by one host at a time', async () => {
  const data = temporaryDirectory();
  await withHost({ data, subjects: subjects.slice(0, 3) }, host => withConnection(host, async connection => {
    const before = await snapshot(connection);
    assertRefused(await refusedStore(data), /another|already|in use|open/);
    await connection.call('BasicObjectServices.Rename', ['Object 0', 'Still mine']);
    assert.equal(Object.keys(await snapshot(connection)).length, Object.keys(before).length);
  }));
  await withHost({ data }, host => withConnection(host, async connection =>
    assert.ok('Still mine' in await snapshot(connection))));
});

const noise = Buffer.from(Array.from({ length: 8192 }, (_, i) => (i * 2654435761 >>> 7) & 255));

for (const [what, damage] of [
  ['that is all noise', (file, size) => writeFileSync(file, noise.subarray(0, Math.min(size, noise.length)))],
  ['that is another file', file => writeFileSync(file, 'Not a store at all.\n'.repeat(100))],
  ['that was cut in half', (file, size) => truncateSync(file, Math.floor(size / 2))],
  ['that was cut to its head', file => truncateSync(file, 100)],
  ['with noise in its middle', (file, size) => {
    const bytes = readFileSync(file);
    noise.copy(bytes, Math.floor(size / 2 / 4096) * 4096, 0, 4096);
    writeFileSync(file, bytes);
  }],
]) {
  test(`A store ${what} is refused and left as it is`, async () => {
    const data = temporaryDirectory();
    await withHost({ data, subjects }, () => {});
    const sizes = readdirSync(data).map(name => [statSync(join(data, name)).size, join(data, name)]);
    const [size, file] = sizes.sort(([a], [b]) => b - a)[0];
    damage(file, size);
    const damaged = readFileSync(file);
    for (let attempt = 0; attempt < 2; ++attempt) {
      assertRefused(await refusedStore(data), /damaged|not a store|another program|not a database/i);
      assert.ok(readFileSync(file).equals(damaged));
    }
  });
}

test('A data folder that is a file is refused', async () => {
  const file = temporaryFile('taken', 'mine');
  for (const data of [file, join(file, 'below')])
    assertRefused(await refusedStore(data), /taken/);
  assert.equal(readFileSync(file, 'utf8'), 'mine');
});
