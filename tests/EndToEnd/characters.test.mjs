// The group "CharacterFromClustersServices" over the wire: its functions and refusals, slots and what comes into them,
// warnings, calibration, restarts.

import assert from 'node:assert/strict';
import { readFileSync } from 'node:fs';
import { join } from 'node:path';
import { test } from 'node:test';
import { setTimeout as sleep } from 'node:timers/promises';
import { fileURLToPath } from 'node:url';

import { assertFails, assertSucceeds, eventually, functions as allFunctions, inGroup, inputs, outputs, outputsOf,
         published, withStage } from './api.mjs';
import { inTime, scaled, temporaryDirectory, temporaryFile } from './host.mjs';

const group = 'CharacterFromClustersServices';
const changed = `${group}.CharacterChangedCallback`;
const functions = inGroup(group, allFunctions);
const [basic, smart] = ['BasicObjectServices', 'SmartObjectServices'];
const [put, state] = ['SetSlotObject', 'CharacterCalibrationState'];
const most = 4294967295;

const named = name => name.includes('.') ? name : `${group}.${name}`;

// The outputs of a call that succeeds, in their order. A method without a group is one of this group.
const ask = (connection, method, ...params) => outputsOf(connection, named(method), params);

async function refuses(connection, code, method, ...params) {
  assertFails(await connection.call(named(method), params), named(method), code);
}

// How many notifications come of what the body does. A query after an edit is answered on the way on which the edit's
// notification went before.
async function notificationsOf(connection, body) {
  connection.notifications.splice(0);
  await body();
  await ask(connection, 'CharacterList');
  assert.ok(connection.notifications.every(({ method }) => method === changed));
  return connection.notifications.splice(0).length;
}

// Makes each edit, which is notified so many times, and looks at what comes of it.
async function follow(connection, look, rows) {
  for (const [told, expected, method, ...params] of rows) {
    const count = await notificationsOf(connection, () => ask(connection, method, ...params));
    assert.deepEqual(await look(connection), expected, `after ${method} ${params}`);
    assert.equal(count, told, `notifications of ${method} ${params}`);
  }
}

// Runs `body` with a connection to a host with these subjects that is told of changes.
function onStage(subjects, body, { calibration = 60000, options = [], ...others } = {}) {
  return withStage(subjects, async (connection, host) => {
    await connection.call('Server.Subscribe', [changed]);
    await body(connection, host);
  }, { options: ['--character-calibration-time', String(calibration), ...options], ...others });
}

const character = (name, slots, parameters = {}) => ({ kind: 'CFCs', name, slots, parameters });
const smartObject = (name, parameters, cluster) => ({ kind: 'SmartObjects', name, parameters, clusters: [cluster] });

const slots = (...names) => `<Slots>${names.map(name => `<Slot name="${name}" segment="Hips"/>`).join('')}</Slots>`;
const cct = (content, root = 'CharacterTemplate') => `<?xml version="1.0" encoding="UTF-8"?>\n<${root} version="1">` +
  `<Segments><Segment name="Hips"/></Segments>${content}</${root}>\n`;
const pair = temporaryFile('Gürtel 🧰.cct', cct(slots('Gürtel', 'Back')));
const biped = fileURLToPath(new URL('../../StandaloneHost/Characters/Templates/Biped.cct', import.meta.url));
const worn = [...readFileSync(biped, 'utf8').matchAll(/<Slot name="(\w+)"/g)].map(([, name]) => name);

// What is in the slots, of the characters in ascending order; '-' for nothing. On the way, every object says which slot
// it is in, if it may come there by itself.
async function occupants(connection) {
  const slotOf = {};
  const [names] = await ask(connection, 'CharacterList');
  const occupied = await Promise.all(names.map(async name => {
    const [labels] = await ask(connection, 'SlotNames', name);
    const objects = (await Promise.all(labels.map((_, i) => ask(connection, 'SlotObject', name, i)))).flat();
    objects.forEach((object, i) => { slotOf[object] = labels[i]; });
    return objects.map(object => object || '-').join(' ');
  }));
  for (const [kind, list] of [[basic, 'BasicObjectList'], [smart, 'SmartObjectList']])
    for (const name of (await ask(connection, `${kind}.${list}`))[0]) {
      const [enabled] = await ask(connection, `${kind}.AutoAssignEnabled`, name);
      const method = `${kind}.AutoAssignedName`;
      const answer = await connection.call(method, [name]);
      if (enabled && slotOf[name] !== undefined)
        assertSucceeds(answer, { AutoAssignedName: slotOf[name] });
      else
        assertFails(answer, method, 'NotSet');
    }
  return occupied.join(' | ');
}

// Everything that the group tells.
async function everything(connection) {
  const queries = functions.filter(method => inputs(method).length === 1 && outputs(method).length === 1);
  const [names] = await ask(connection, 'CharacterList');
  const asked = names.flatMap(name => queries.map(query => ask(connection, query.name, name)));
  return [names, await Promise.all(asked), await occupants(connection)];
}

const texts = new Map(published.enumerations.find(({ name }) => name === `${group}.ECharacterWarning`).values
  .map(({ number, text }) => [number, text]));
const withTexts = (...numbers) => ({ Warnings: numbers.map(number => [number, texts.get(number)]) });

async function warningsOf(connection) {
  return (await ask(connection, 'CharacterWarnings', 'Actor'))[0].map(([number]) => number);
}

const subjects = [{ name: 'Crate' }, smartObject('Sword'), { kind: 'Props', name: 'Chair' },
                  character('Actor', ['Hat', { name: 'Belt', object: 'Sword' }],
                            { Enabled: false, Calibration: 2, Retarget: 'C:\\left.retarget' })];
const folder = temporaryDirectory();
const retarget = temporaryFile('Größe 木箱 🧰.retarget', '');

// Each call with its outputs, in an order in which each edit is seen by the query after it; an edit is notified once,
// and not when it is made again.
const walk = [
  ['CharacterList', [], { Names: ['Actor'] }], ['SlotNames', ['Actor'], { SlotNames: ['Hat', 'Belt'] }],
  ['SlotObject', ['Actor', 0], { ObjectName: '' }], ['SlotObject', ['Actor', 1], { ObjectName: 'Sword' }],
  [put, ['Actor', 0, 'Crate'], {}, 1], ['SlotObject', ['Actor', 0], { ObjectName: 'Crate' }],
  ['CharacterEnabled', ['Actor'], { Enabled: false }], ['SetCharacterEnabled', ['Actor', true], {}, 1],
  ['CharacterEnabled', ['Actor'], { Enabled: true }], ['CreateCharacter', ['Größe ≤ 箱', biped], {}, 1],
  ['CharacterList', [], { Names: ['Actor', 'Größe ≤ 箱'] }], ['CharacterEnabled', ['Größe ≤ 箱'], { Enabled: true }],
  ['SlotNames', ['Größe ≤ 箱'], { SlotNames: worn }], ['SlotObject', ['Größe ≤ 箱', 14], { ObjectName: '' }],
  ['CreateCharacter', ['Dancer', pair], {}, 1], ['SlotNames', ['Dancer'], { SlotNames: ['Gürtel', 'Back'] }],
  ['CharacterWarnings', ['Dancer'], withTexts(1, 2, 3)], [state, ['Dancer'], { CalibrationState: 0 }],
  ['SetAllCharactersEnabled', [false], {}, 1], ['CharacterEnabled', ['Actor'], { Enabled: false }],
  ['CharacterEnabled', ['Dancer'], { Enabled: false }], ['CharacterWarnings', ['Dancer'], withTexts(1, 2)],
  ['CharacterWarnings', ['Actor'], withTexts(0)], [state, ['Actor'], { CalibrationState: 2 }],
  ['CalibrateCharacter', ['Actor'], {}, 1], [state, ['Actor'], { CalibrationState: 1 }],
  ['ClearCharacterCalibration', ['Actor'], {}, 1], [state, ['Actor'], { CalibrationState: 0 }],
  ['CharacterRetargetPath', ['Dancer'], { RetargetPath: '' }],
  ['CharacterRetargetPath', ['Actor'], { RetargetPath: 'C:\\left.retarget' }],
  ...[retarget, folder, ''].flatMap(path => [['SetCharacterRetargetPath', ['Actor', path], {}, 1],
                                             ['CharacterRetargetPath', ['Actor'], { RetargetPath: path }]]),
  ['RemoveCharacter', ['Actor'], {}, 1], ['CharacterList', [], { Names: ['Dancer', 'Größe ≤ 箱'] }],
  ['RemoveAllCharacters', [], {}, 1], ['CharacterList', [], { Names: [] }],
];

assert.deepEqual(new Set(walk.map(([name]) => named(name))), new Set(functions.map(({ name }) => name)));

test('Every function does what it says, and tells of it once', () => onStage(subjects, async connection => {
  for (const [name, params, values, told = 0] of walk) {
    const call = () => connection.call(named(name), params);
    const count = await notificationsOf(connection, async () => assertSucceeds(await call(), values));
    assert.equal(count, told, `${name} ${params}`);
    assert.equal(await notificationsOf(connection, call), 0, `${name} ${params} again`);
  }
}));

test('Who is not known is refused, then a slot, then an object or a path', () => onStage(subjects, async connection => {
  const perName = functions.filter(method => inputs(method)[0]?.type === 'text' && !/\.Create/.test(method.name));
  assert.equal(perName.length, 12);
  const rows = [...['Nobody', 'crate', ' '].map(object => ['NotFound', put, 'Actor', 0, object]),
                ...['Actor', 'Chair'].map(object => ['InvalidType', put, 'Actor', 1, object]),
                ...['/not/there', `${retarget}x`, join(retarget, 'below')].map(
                  path => ['FileNotFound', 'SetCharacterRetargetPath', 'Actor', path]),
                ['InvalidArgument', 'SetCharacterRetargetPath', 'Actor', `${retarget}\0`]];
  for (const [name, code] of [['Nobody', 'NotFound'], ['actor', 'NotFound'], ['', 'NotFound'],
                              ...['Crate', 'Sword', 'Chair'].map(other => [other, 'NotSupported'])])
    for (const method of perName)
      for (const value of [{ bool: true, text: '/not/there' }, { bool: false, text: '', 'unsigned 32-bit': 0 }])
        rows.push([code, method.name, name, ...inputs(method).slice(1).map(({ type }) => value[type] ?? most)]);
  for (const index of [2, most])
    rows.push(['InvalidIndex', 'SlotObject', 'Actor', index],
              ...['Nobody', 'Chair', 'Crate', ''].map(object => ['InvalidIndex', put, 'Actor', index, object]));
  const before = await everything(connection);
  assert.equal(await notificationsOf(connection, () => Promise.all(rows.map(row => refuses(connection, ...row)))), 0);
  assert.deepEqual(await everything(connection), before);
}));

test('Nothing is made of a name or a template that is not fit', () => onStage(subjects, async connection => {
  const broken = ['', cct(slots('Belt')).slice(0, -9), cct(''), cct(slots()), cct(slots('Belt', 'Belt')),
                  cct(slots('Belt'), 'SmartObjectTemplate'), cct(slots('Belt').replace('Hips', 'hips')),
                  Buffer.from(cct(slots('Gürtel')), 'latin1'), cct(slots('Belt') + '<Roles><Solving/></Roles>')];
  const paths = Object.entries({
    InvalidArgument: ['', `${pair}\0`], FileIOFailure: [folder, '/dev/zero'],
    FileNotFound: [`${pair}x`, '/not/there.cct', join(pair, 'below.cct')],
    SerialisationFailure: broken.map((content, i) => temporaryFile(`${i}.cct`, content)) });
  const names = Object.entries({ AlreadyPresent: ['Actor', 'Crate', 'Sword', 'Chair'],
                                 InvalidName: ['', ' ', ' x', 'x ', 'a/b', 'x\0', 'x\n', 'ß'.repeat(128)] });
  const before = await everything(connection);
  for (const [code, name, path] of [...paths.flatMap(([code, list]) => list.map(path => [code, 'New', path])),
                                    ...names.flatMap(([code, list]) => list.map(name => [code, name, pair]))]) {
    const call = () => inTime(refuses(connection, code, 'CreateCharacter', name, path), 'a prompt answer', 1000);
    assert.equal(await notificationsOf(connection, call), 0, `${name} ${path}`);
  }
  assert.deepEqual(await everything(connection), before);
}));

test('Slots hold one object each, which is in no other', () => onStage(
  [{ name: 'Crate' }, smartObject('Sword'), character('Guard', ['Belt']), character('Rider', ['Hat', 'Belt'])],
  connection => follow(connection, occupants, [
    [0, '- | - -', 'CharacterList'], [1, '- | Sword -', put, 'Rider', 0, 'Sword'],
    [1, '- | - Sword', put, 'Rider', 1, 'Sword'], [1, '- | Crate Sword', put, 'Rider', 0, 'Crate'],
    [1, '- | - Crate', put, 'Rider', 1, 'Crate'], [1, 'Crate | - -', put, 'Guard', 0, 'Crate'],
    [1, 'Sword | - -', put, 'Guard', 0, 'Sword'], [0, 'Sword | - -', put, 'Rider', 0, ''],
    [1, '- | - -', put, 'Guard', 0, ''], [1, '- | Crate -', put, 'Rider', 0, 'Crate'],
    [1, 'Sword | Crate -', put, 'Guard', 0, 'Sword'], [0, 'Sword | Crate -', `${smart}.SetColor`, 'Sword', '#112233'],
    [1, 'Sabre | Crate -', `${smart}.Rename`, 'Sword', 'Sabre'],
    [1, 'Sabre | Box -', `${basic}.Rename`, 'Crate', 'Box'], [1, 'Sabre | - -', `${basic}.Remove`, 'Box'],
    [0, 'Sabre | - -', `${smart}.Add`, 'Axe'], [1, 'Sabre | - Axe', put, 'Rider', 1, 'Axe'],
    [1, '- Axe', 'RemoveCharacter', 'Guard'], [1, 'Sabre Axe', put, 'Rider', 0, 'Sabre'],
    [1, '', 'RemoveAllCharacters'], [1, '- -', 'CreateCharacter', 'Guard', pair],
    [1, '- Sabre', put, 'Guard', 1, 'Sabre'], [1, '- -', `${smart}.RemoveAll`],
  ])));

const auto = { AutoAssignEnabled: true, AutoAssignedName: 'Nowhere' };
test('Slots are filled by themselves, in the order in which all was added', () => onStage(
  [smartObject('Right', auto), { name: 'Left', parameters: auto }, { name: 'Cart' },
   { name: 'Wheel', parent: 'Cart', parameters: auto }, smartObject('Axe', auto),
   { name: 'Crate', parameters: { AutoAssignedName: 'Nowhere' } },
   ...[['Zoe', 'Hat', 'Belt'], ['Adam', 'Belt']].map(([name, ...of]) => character(name, of, { Enabled: false }))],
  connection => follow(connection, occupants, [
    [0, '- | - -', 'CharacterList'], [1, 'Axe | Right Left', 'SetAllCharactersEnabled', true],
    [0, 'Axe | Right Left', `${basic}.SetAutoAssignEnabled`, 'Crate', true],
    [1, 'Right | Axe Left', put, 'Zoe', 0, 'Axe'],
    [1, 'Right | Axe Left', `${smart}.SetAutoAssignEnabled`, 'Axe', false],
    [1, 'Right | Crate Left', put, 'Zoe', 0, ''],
    [0, 'Right | Crate Left', `${smart}.SetAutoAssignEnabled`, 'Axe', true],
    [1, 'Right | Crate Axe', `${basic}.Remove`, 'Left'],
    [1, 'Right | - - | Crate Axe', 'CreateCharacter', 'New', pair], [1, 'Right | Axe Crate', 'RemoveCharacter', 'Zoe'],
    [1, 'Right | Axe Crate', 'SetCharacterEnabled', 'New', false], [1, 'Right | - Crate', put, 'New', 0, ''],
    [1, '- Crate', 'RemoveCharacter', 'Adam'], [1, 'Right Crate', 'SetCharacterEnabled', 'New', true],
    [1, 'Axe - | Right Crate', 'CreateCharacter', 'Last', pair], [1, '', 'RemoveAllCharacters'],
    [1, 'Right Axe', 'CreateCharacter', 'Late', pair], [1, 'Crate -', `${smart}.RemoveAll`],
  ])));

test('A slot that is cleared gets its object back, if there is no other', () => onStage(
  [{ name: 'Crate', parameters: auto }, character('Actor', ['Belt'])],
  connection => follow(connection, occupants, [[1, 'Crate', put, 'Actor', 0, '']])));

test('Warnings come and go with their causes', () => onStage(
  [smartObject('Sword', {}, { device: 'ready', pattern: 1 }), smartObject('Axe', {}, { pattern: 2 }), { name: 'Crate' },
   character('Actor', ['Hat', 'Belt'], { Calibration: 2 })],
  connection => follow(connection, warningsOf, [
    [0, [2, 3], 'CharacterList'], [1, [3], put, 'Actor', 0, 'Sword'], [1, [], put, 'Actor', 1, 'Crate'],
    [1, [1], 'ClearCharacterCalibration', 'Actor'], [1, [0, 1], 'HostSimulation.SetConnected', 'ready', false],
    [1, [1], 'HostSimulation.SetConnected', 'ready', true], [1, [0, 1], put, 'Actor', 1, 'Axe'],
    [1, [1], `${smart}.SetSmartClusterDeviceURN`, 'Axe', 0, 'spare'],
    [1, [0, 1], `${smart}.SetSmartClusterDeviceURN`, 'Axe', 0, ''], [1, [1], put, 'Actor', 1, 'Crate'],
    [1, [0, 1], `${basic}.SetTemplateGroupName`, 'Crate', 'Boxes'],
    [1, [1], `${basic}.SetTemplateGroupName`, 'Crate', ''],
    [1, [1, 3], put, 'Actor', 1, ''], [1, [1], 'SetCharacterEnabled', 'Actor', false],
    [0, [1], `${basic}.SetAutoAssignEnabled`, 'Crate', true], [1, [1], 'SetAllCharactersEnabled', true],
    [1, [1, 2], `${smart}.SetAutoAssignEnabled`, 'Sword', true],
    [1, [1], `${basic}.SetAutoAssignEnabled`, 'Crate', false], [1, [1, 2, 3], `${basic}.Remove`, 'Crate'],
    [1, [0, 1], put, 'Actor', 1, 'Axe'], [1, [0, 1, 3], `${smart}.Remove`, 'Sword'],
    [1, [1, 2, 3], `${smart}.Remove`, 'Axe'],
  ]), { devices: [{ urn: 'ready' }, { urn: 'spare' }], options: ['--level', '1'] }));

const time = scaled(400);
const stateOf = connection => ask(connection, state, 'Actor');
const start = [1, [1], 'CalibrateCharacter', 'Actor'];
const clear = [1, [0], 'ClearCharacterCalibration', 'Actor'];

for (const [what, ...rows] of [['takes its time'], ['starts afresh when it was cleared', clear, start],
                               ['starts afresh while it runs', [0, ...start.slice(1)]]])
  test(`A calibration ${what}`, () => onStage([character('Actor', ['Belt'])], async connection => {
    for (let round = 0; round < 2; ++round) {
      let since = performance.now();
      await follow(connection, stateOf, [start]);
      assert.deepEqual(await warningsOf(connection), [1, 2, 3]);
      if (rows.length > 0) {
        await sleep(time / 2);
        since = performance.now();
        await follow(connection, stateOf, rows);
      }
      assert.equal((await connection.nextNotification()).method, changed);
      assert.ok(performance.now() - since > time - 5);
      assert.deepEqual([await stateOf(connection), await warningsOf(connection)], [[2], [2, 3]]);
      assert.deepEqual(connection.notifications, []);
    }
  }, { calibration: time }));

test('A calibration that was cleared, or whose character was removed, comes to nothing', () => onStage(
  [character('Actor', ['Belt']), character('Rider', ['Belt'])], async connection => {
    await follow(connection, stateOf, [start, clear, [1, [0], 'CalibrateCharacter', 'Rider'],
                                       [1, [0], 'RemoveCharacter', 'Rider'],
                                       [1, [0], 'CreateCharacter', 'Rider', pair]]);
    const before = await everything(connection);
    assert.equal(await notificationsOf(connection, () => sleep(time * 1.5)), 0);
    assert.deepEqual(await everything(connection), before);
  }, { calibration: time }));

for (const [how, end] of [['a clean end', host => host.stop()], ['a kill', host => host.kill()]])
  test(`All outlives ${how}, and a calibration goes on`, async () => {
    const data = temporaryDirectory();
    const names = ['Walker', 'Rider', 'Guard'];
    const states = async connection => (await Promise.all(names.map(name => ask(connection, state, name)))).flat();
    let before;
    await onStage([smartObject('Sword'), { name: 'Crate' }, smartObject('Axe')], async (connection, host) => {
      for (const [method, ...params] of [
        ...names.map(name => ['CreateCharacter', name, pair]), [`${smart}.SetAutoAssignEnabled`, 'Axe', true],
        [put, 'Rider', 1, 'Crate'], ['SetCharacterRetargetPath', 'Rider', retarget],
        ['SetCharacterEnabled', 'Guard', false], ['CalibrateCharacter', 'Rider']])
        await ask(connection, method, ...params);
      await eventually(() => states(connection), [0, 2, 0]);
      before = await everything(connection);
      assert.equal(before.at(-1), '- - | - Crate | Axe -');
      await end(host);
    }, { data, calibration: 1 });
    await onStage(undefined, async (connection, host) => {
      assert.deepEqual(await everything(connection), before);
      await follow(connection, states, [
        [1, [1, 2, 0], 'CalibrateCharacter', 'Walker'], [1, [1, 2, 1], 'CalibrateCharacter', 'Guard'],
        [1, [1, 2, 0], 'ClearCharacterCalibration', 'Guard']]);
      await end(host);
    }, { data });
    await onStage(undefined, connection => eventually(() => states(connection), [2, 2, 0]), { data, calibration: 100 });
  });

test('Without auto-assign, slots are filled by hand alone, and nothing is missing', async () => {
  const data = temporaryDirectory();
  const stage = [{ name: 'Crate' }, smartObject('Sword'), character('Actor', ['Hat', 'Belt'])];
  const look = async connection => [await occupants(connection), ...await warningsOf(connection)];
  for (const [features, ...rows] of [
    ['0xFFFFFFFF', [0, ['- -', 1, 2, 3], 'CharacterList']],
    ['0xFFFF7FFF', [0, ['- -', 1], 'CharacterList'], [0, ['- -', 1], `${basic}.SetAutoAssignEnabled`, 'Crate', true],
     [1, ['- -', 1], 'SetCharacterEnabled', 'Actor', false], [1, ['- -', 1], 'SetCharacterEnabled', 'Actor', true],
     [1, ['- Sword', 0, 1], put, 'Actor', 1, 'Sword'], [1, ['- -', 1], put, 'Actor', 1, '']],
    ['0xFFFFFFFF', [0, ['Crate -', 1, 2, 3], 'CharacterList']],
  ])
    await onStage(stage, connection => follow(connection, look, rows),
                  { data, options: ['--features', features, '--level', '1'] });
});

const ungated = 'SubjectCalibrationServices'; // is there with any features
for (const [features, groups] of [['0x4000', [group, ungated]], ['0x3', [basic, smart, ungated]]])
  test(`The groups with --features ${features} are ${groups.join(' and ')}`, () => withStage([], async connection => {
    const { result: description } = await connection.call('rpc.discover');
    const there = groups.includes(group);
    assert.deepEqual(new Set(description.methods.map(({ name }) => name.split('.')[0])),
                     new Set([...groups, 'HostSimulation', 'Server', 'rpc']));
    assert.equal(description['x-callbacks'].some(({ name }) => name === changed), there);
    assert.equal((await connection.call('Server.Subscribe', [changed])).error?.message, there ? undefined : 'NotFound');
    for (const { name } of functions)
      assert.equal((await connection.call(name, [])).error?.code === -32601, !there, name);
  }, { options: ['--features', features] }));
