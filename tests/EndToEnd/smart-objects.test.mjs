// The group "SmartObjectServices" over the wire: its functions and refusals, templates, patterns, devices, warnings.

import assert from 'node:assert/strict';
import { truncateSync } from 'node:fs';
import { join } from 'node:path';
import { describe, test } from 'node:test';
import { setTimeout as sleep } from 'node:timers/promises';

import { assertFails, assertSucceeds, codes, eventually, functions as allFunctions, inGroup, inputs, outputsOf, published,
         withStage } from './api.mjs';
import { runSync } from './children.mjs';
import { inTime, scaled, temporaryDirectory, temporaryFile } from './host.mjs';

const group = 'SmartObjectServices';
const changed = `${group}.SmartObjectChangedCallback`;
const functions = inGroup(group, allFunctions);
const most = 4294967295;

function named(name) {
  return name.includes('.') ? name : `${group}.${name}`;
}

// The outputs of a call that succeeds, in their order. A method without a group is one of this group.
function ask(connection, method, ...params) {
  return outputsOf(connection, named(method), params);
}

// What cannot be read as a number at all is refused with a detail besides.
async function refuses(connection, code, method, ...params) {
  const answer = await connection.call(named(method), params);
  if (params.some(value => typeof value === 'number' && !(Number.isInteger(value) && value >= 0 && value <= most)))
    delete answer.error?.data.detail;
  assertFails(answer, named(method), code);
}

function smart(name, ...clusters) {
  return { kind: 'SmartObjects', name, clusters };
}

async function list(connection) {
  return (await ask(connection, 'SmartObjectList'))[0];
}

// The answers about each cluster of an object.
async function clustersOf(connection, query, name) {
  const [count] = await ask(connection, 'SmartClusterCount', name);
  const asked = Array.from({ length: count }, (_, i) => ask(connection, `SmartCluster${query}`, name, i));
  return (await Promise.all(asked)).flat();
}

async function patterns(connection, names) {
  return (await Promise.all(names.map(name => clustersOf(connection, 'ActiveMarkerPattern', name)))).flat();
}

function upTo(count) {
  return Array.from({ length: count }, (_, i) => i + 1);
}

// How many notifications come of what the body does. A query after an edit is answered on the way on which the edit's
// notification went before; `late` is time for others.
async function notificationsOf(connection, body, late = 0) {
  connection.notifications.splice(0);
  await body();
  await sleep(scaled(late));
  await list(connection);
  assert.ok(connection.notifications.every(({ method }) => method === changed));
  return connection.notifications.splice(0).length;
}

function sot(content, root = 'SmartObjectTemplate') {
  return `<?xml version="1.0" encoding="UTF-8"?>\n<${root} version="1">${content}</${root}>\n`;
}

function clusters(...labels) {
  const elements = labels.map(label => `<SmartCluster label="${label}" type="Corvex1"/>`);
  return `<SmartClusters>${elements.join('')}</SmartClusters>`;
}

const staff = temporaryFile('Stäbe 🧰.sot', sot(clusters('Griff ä', 'Tip') +
  '<AdditionalMarkerPositions><Marker x="1.5" y="-2" z="1e1"/></AdditionalMarkerPositions>'));

const subjects = [
  { name: 'Crate' }, { kind: 'CFCs', name: 'Actor', slots: ['Belt'] },
  { ...smart('Sword', { label: 'Hilt', device: 'corvex1-1', pattern: 2 }),
    parameters: { ColourRGBA: '#80102030', ProximityGroupName: 'Stage left', AutoAssignEnabled: true } },
];
const devices = [{ urn: 'corvex1-1' }, { urn: 'corvex1-2', radio: 12 }];
const texts = new Map(published.enumerations.find(({ name }) => name === `${group}.ESmartObjectWarning`).values
  .map(({ number, text }) => [number, text]));
const [urn, pattern] = ['SmartClusterDeviceURN', 'SmartClusterActiveMarkerPattern'];

// Each call with its outputs, in an order in which each edit is seen by the query after it; an edit of an object is
// notified once, and not when it is made again.
const walk = [
  ['CompatibleDeviceTypes', [], { DeviceTypes: ['Corvex1'] }], ['AutoPatternManagementEnabled', [], { Enabled: false }],
  ['SmartObjectList', [], { Names: ['Sword'] }], ['Add', ['Axe'], {}, 1], ['SmartClusterCount', ['Axe'], { Count: 1 }],
  ['SmartClusterLabel', ['Axe', 0], { Label: 'Cluster' }], [urn, ['Axe', 0], { DeviceURN: '' }],
  [pattern, ['Axe', 0], { Pattern: 1 }], ['Color', ['Axe'], { ColorHtml: '#ffffffff' }],
  ['SmartObjectWarnings', ['Axe'], { Warnings: [[5, texts.get(5)]] }], ['AddFromTemplate', ['Staff', staff], {}, 1],
  ['SmartClusterCount', ['Staff'], { Count: 2 }], ['SmartClusterLabel', ['Staff', 0], { Label: 'Griff ä' }],
  [pattern, ['Staff', 0], { Pattern: 3 }], [pattern, ['Staff', 1], { Pattern: 4 }],
  ['SetSmartClusterLabel', ['Staff', 1, 'Spitze "ß"'], {}, 1],
  ['SmartClusterLabel', ['Staff', 1], { Label: 'Spitze "ß"' }],
  ['SmartClusterLabel', ['Staff', 0], { Label: 'Griff ä' }], [`Set${pattern}`, ['Staff', 0, 8], {}, 1],
  [pattern, ['Staff', 0], { Pattern: 8 }], [`Set${pattern}`, ['Staff', 0, 0], {}, 1],
  [`Set${urn}`, ['Staff', 1, 'not there yet'], {}, 1], [urn, ['Staff', 1], { DeviceURN: 'not there yet' }],
  [urn, ['Sword', 0], { DeviceURN: 'corvex1-1' }], ['AssignOptimalActiveMarkerPatterns', [], {}, 1],
  [pattern, ['Staff', 0], { Pattern: 3 }],
  ['SmartObjectWarnings', ['Staff'], { Warnings: [[4, texts.get(4)], [5, texts.get(5)]] }],
  ['CreateSmartObjects', [], {}, 1], [urn, ['corvex1-2', 0], { DeviceURN: 'corvex1-2' }],
  [pattern, ['corvex1-2', 0], { Pattern: 5 }], ['SetAutoPatternManagementEnabled', [true], {}],
  ['AutoPatternManagementEnabled', [], { Enabled: true }], ['SetAutoPatternManagementEnabled', [false], {}],
  ['Enabled', ['Sword'], { Enabled: true }], ['SetEnabled', ['Sword', false], {}, 1],
  ['Enabled', ['Sword'], { Enabled: false }], ['SetAllEnabled', [true], {}, 1],
  ['Enabled', ['Sword'], { Enabled: true }], ['Color', ['Sword'], { ColorHtml: '#80102030' }],
  ['SetColor', ['Sword', '#ABCDEF'], {}, 1], ['Color', ['Sword'], { ColorHtml: '#ffabcdef' }],
  ['ActiveMarkersOnWhileCharging', ['Sword'], { OnWhileCharging: false }],
  ['SetActiveMarkersOnWhileCharging', ['Sword', true], {}, 1],
  ['ActiveMarkersOnWhileCharging', ['Sword'], { OnWhileCharging: true }],
  ['AutoAssignedName', ['Sword'], { AutoAssignedName: 'Belt' }], ['SetAutoAssignEnabled', ['Axe', true], {}, 1],
  ['AutoAssignEnabled', ['Axe'], { Enabled: true }],
  ['ProximityGroupName', ['Sword'], { ProximityGroupName: 'Stage left' }],
  ['SetProximityGroupName', ['Sword', 'Bühne'], {}, 1],
  ['ProximityGroupName', ['Sword'], { ProximityGroupName: 'Bühne' }],
  ['SetTemplateGroupName', ['Sword', 'Blades'], {}, 1],
  ['TemplateGroupName', ['Sword'], { TemplateGroupName: 'Blades' }],
  ['SmartObjectWarnings', ['Sword'], { Warnings: [[6, texts.get(6)]] }], ['Rename', ['Sword', 'Sabre'], {}, 1],
  ['SmartObjectList', [], { Names: ['Axe', 'Sabre', 'Staff', 'corvex1-2'] }], ['Remove', ['Axe'], {}, 1],
  ['RemoveAll', [], {}, 1], ['SmartObjectList', [], { Names: [] }],
];

function byName(name, params) {
  const record = functions.find(known => known.name === named(name));
  return Object.fromEntries(inputs(record).map((input, i) => [input.name, params[i]]).reverse());
}

describe('every function', () => {
  assert.equal(functions.length, 33);
  assert.deepEqual(new Set(walk.map(([name]) => named(name))), new Set(functions.map(({ name }) => name)));

  for (const [how, form] of [['by position', (name, params) => params], ['by name', byName]])
    test(`does what it says, and tells of it once, ${how}`, () => withStage(subjects, async connection => {
      await connection.call('Server.Subscribe', [changed]);
      for (const [name, params, values, told = 0] of walk) {
        const call = () => connection.call(named(name), form(name, params));
        const count = await notificationsOf(connection, async () => assertSucceeds(await call(), values));
        assert.equal(count, told, `${name} ${params}`);
        if (!/^(Add|AddFromTemplate|Remove|Rename)$/.test(name))
          assert.equal(await notificationsOf(connection, call), 0, `${name} ${params} again`);
      }
      for (const { name } of subjects.slice(0, 2))
        await refuses(connection, 'InvalidArgument', 'Enabled', name);
    }, { devices }));

  test('refuses who is not known, then a cluster that is not there', () => withStage(subjects, async connection => {
    const acceptable = (method, ...first) => inputs(method).map(({ name, type }, i) => first[i] ?? (
      type === 'bool' ? true : type === 'text' ? name === 'ColorHtml' ? '#112233' : 'Any' : 9));
    const perName = functions.filter(method => inputs(method)[0]?.type === 'text' && !/\.Add/.test(method.name));
    assert.equal(perName.length, 23);
    for (const method of perName)
      for (const [name, code] of [['Nobody', 'NotFound'], ['sword', 'NotFound'], ['', 'NotFound'],
                                  ['Crate', 'InvalidArgument'], ['Actor', 'InvalidArgument']])
        await refuses(connection, code, method.name, ...acceptable(method, name));
    const perCluster = perName.filter(method => inputs(method)[1]?.name === 'SmartClusterIndex');
    assert.equal(perCluster.length, 6);
    for (const method of perCluster)
      for (const [index, code] of [[1, 'InvalidIndex'], [most, 'InvalidIndex'], [-1, 'InvalidValue'],
                                   [1.5, 'InvalidValue'], [most + 1, 'InvalidValue']])
        await refuses(connection, code, method.name, ...acceptable(method, 'Sword', index));
    for (const value of [9, 64, most, -1, 0.5, most + 1])
      await refuses(connection, 'InvalidValue', `Set${pattern}`, 'Sword', 0, value);
    assert.deepEqual(await patterns(connection, ['Sword']), [2]);
    assert.deepEqual(await list(connection), ['Sword']);
  }));

  test('makes nothing of a name or a template that is not fit', () => withStage(subjects, async connection => {
    const huge = temporaryFile('huge.sot', '');
    truncateSync(huge, 100 << 20);
    const pipe = join(temporaryDirectory(), 'pipe.sot');
    runSync('mkfifo', [pipe]);
    const broken = { 'cut.sot': sot(clusters('Tip')).slice(0, -9), 'empty.sot': '', 'bare.sot': sot(''),
                     'none.sot': sot(clusters()), 'root.sot': sot(clusters('Tip'), 'SmartObject'),
                     'twice.sot': sot(clusters('Tip', 'Tip')), 'many.sot': sot(clusters(...upTo(65))),
                     'latin.sot': Buffer.from(sot(clusters('Größe')), 'latin1'),
                     'wide.sot': Buffer.from(`\ufeff${sot(clusters('Tip'))}`, 'utf16le'),
                     'type.sot': sot(clusters('Tip').replace('Corvex1', 'Nothing1')) };
    const files = Object.entries(broken).map(([name, content]) => temporaryFile(name, content));
    const refused = [
      ...['', join(temporaryDirectory(), 'missing.sot'), `${staff}x`].map(file => ['New', file, 'FileNotFound']),
      ...[temporaryDirectory(), huge, pipe, '/dev/zero', ...files].map(file => ['New', file, 'Failed']),
    ];
    for (const [name, code] of [['Sword', 'AlreadyPresent'], ['Crate', 'AlreadyPresent'], ['Actor', 'AlreadyPresent'],
                                ...['', ' x', 'x ', 'a/b', 'n'.repeat(256)].map(name => [name, 'InvalidName'])])
      refused.push([name, staff, code], [name, undefined, code], [name, 'missing.sot', code]);
    const failures = [];
    for (const [name, file, code] of refused) {
      const params = file === undefined ? [name] : [name, file];
      const call = refuses(connection, code, file === undefined ? 'Add' : 'AddFromTemplate', ...params);
      await inTime(call, 'a prompt answer', 1000).catch(({ message }) => failures.push(`${params}: ${message}`));
      assert.deepEqual(await list(connection), ['Sword'], params);
    }
    assert.deepEqual(failures, []);
  }));
});

describe('Patterns', () => {
  test('are the lowest that is free, of a set that grows', () => withStage([], async connection => {
    const full = upTo(8).map(i => `Object ${9 - i}`);
    for (const name of full)
      await ask(connection, 'Add', name);
    assert.deepEqual(await patterns(connection, full), upTo(8));
    await ask(connection, 'Remove', full[2]);
    await ask(connection, 'Add', full[2]);
    assert.deepEqual(await patterns(connection, full), upTo(8));
    await refuses(connection, 'InvalidValue', `Set${pattern}`, full[0], 0, 9);
    await ask(connection, 'Add', 'Ninth');
    assert.deepEqual(await patterns(connection, [...full, 'Ninth']), upTo(9));
    await ask(connection, `Set${pattern}`, full[0], 0, 16);
    await refuses(connection, 'InvalidValue', `Set${pattern}`, full[0], 0, 17);

    await ask(connection, 'RemoveAll');
    await ask(connection, 'AddFromTemplate', 'Fence', temporaryFile('fence.sot', sot(clusters(...upTo(64)))));
    await ask(connection, 'Add', 'Late');
    assert.deepEqual(await patterns(connection, ['Fence', 'Late']), [...upTo(64), 0]);
  }));

  test('go to those that were made first, at once', () => {
    const names = upTo(500).map(i => `Object ${1000 - i}`);
    return withStage(names.map(name => smart(name, {})), async connection => {
      await connection.call('Server.Subscribe', [changed]);
      const assign = () => ask(connection, 'AssignOptimalActiveMarkerPatterns');
      assert.equal(await notificationsOf(connection, assign, 100), 1);
      assert.deepEqual(await patterns(connection, names), [...upTo(64), ...Array(436).fill(0)]);
      await ask(connection, `Set${pattern}`, names[0], 0, 64);
      await refuses(connection, 'InvalidValue', `Set${pattern}`, names[0], 0, 65);
    });
  });

  for (const [what, given, expected] of [
    ['stay when they are distinct', [8, 3, 1], [8, 3, 1]],
    ['stay with the first of those that share one', [3, 5, 3, 0, 5], [3, 5, 1, 2, 4]],
    ['move into a set that is small enough', [64, 1, 9], [2, 1, 3]],
  ])
    test(what, () => withStage(given.map((number, i) => smart(`Object ${9 - i}`, { pattern: number })),
                               async connection => {
      await ask(connection, 'AssignOptimalActiveMarkerPatterns');
      assert.deepEqual(await patterns(connection, given.map((_, i) => `Object ${9 - i}`)), expected);
    }));

  for (const [types, code] of [[['Corvex1', 'Quarex10'], 'NotSupported'], [['Corvex1', 'Nothing1'], 'NotFound'],
                               [['Nothing1'], 'NotFound']])
    test(`are not assigned to ${types.join(' and ')}`, () => withStage(
      [smart('First', {}), smart('Second', ...types.map(type => ({ type, pattern: 7 })))], async connection => {
        await refuses(connection, code, 'AssignOptimalActiveMarkerPatterns');
        assert.deepEqual(await patterns(connection, ['First', 'Second']), [0, ...types.map(() => 7)]);
      }));

  test('are managed once that is switched on, and after a restart', async () => {
    const data = temporaryDirectory();
    const names = ['Sword', 'Axe'];
    const become = (connection, expected) => eventually(() => patterns(connection, names), expected);
    const duplicates = async connection => {
      await ask(connection, `Set${pattern}`, 'Axe', 0, (await patterns(connection, ['Sword']))[0]);
      await become(connection, [5, 1]);
    };
    await withStage(names.map(name => smart(name, { pattern: 5 })), async (connection, host) => {
      await ask(connection, `Set${pattern}`, 'Axe', 0, 5);
      await sleep(scaled(50));
      assert.deepEqual(await patterns(connection, names), [5, 5]);
      await ask(connection, 'SetAutoPatternManagementEnabled', true);
      await become(connection, [5, 1]);
      await duplicates(connection);
      await host.kill();
    }, { data });
    await withStage(undefined, async connection => {
      assert.deepEqual(await ask(connection, 'AutoPatternManagementEnabled'), [true]);
      await duplicates(connection);
      await ask(connection, 'SetAutoPatternManagementEnabled', false);
      await ask(connection, `Set${pattern}`, 'Axe', 0, 5);
      await sleep(scaled(50));
      assert.deepEqual(await patterns(connection, names), [5, 5]);
    }, { data });
  });
});

describe('Smart objects for devices', () => {
  const unlinked = count => upTo(count).map(i => ({ urn: `corvex1-${i + 100}` }));

  for (const [present, linked, count] of [[[], [], 64], [subjects.slice(2), devices.slice(0, 1), 3],
                                          [[smart('Sword', { pattern: 5 })], [], 63]])
    test(`are made for each of ${count} beside ${present.length}`, () => withStage(present, async connection => {
      const urns = unlinked(count).map(device => device.urn);
      const all = [...present.map(({ name }) => name), ...urns];
      await connection.call('Server.Subscribe', [changed]);
      for (const told of [1, 0]) {
        assert.equal(await notificationsOf(connection, () => ask(connection, 'CreateSmartObjects'), 50), told);
        assert.deepEqual(await list(connection), all);
        for (const name of urns)
          assert.deepEqual(await clustersOf(connection, 'DeviceURN', name), [name]);
        assert.deepEqual((await patterns(connection, all)).sort((a, b) => a - b), upTo(all.length));
      }
    }, { devices: [...linked, ...unlinked(count)] }));

  for (const [what, code, present, stage] of [
    ['a device of another type', 'NotFound', [], [...unlinked(2), { urn: 'quarex10-1', type: 'Quarex10' }]],
    ['more devices than patterns', 'AllocationFailure', [], unlinked(65)],
    ['more devices than patterns left', 'AllocationFailure', upTo(3).map(it => ({ pattern: it })), unlinked(62)],
    ['clusters of another type', 'NotSupported', [{ type: 'Quarex10' }], unlinked(2)],
  ])
    test(`are not made with ${what}`, () => withStage([smart('Sword', ...present)], async connection => {
      await refuses(connection, code, 'CreateSmartObjects');
      assert.deepEqual(await list(connection), ['Sword']);
      assert.deepEqual(await patterns(connection, ['Sword']), present.map(({ pattern: given = 0 }) => given));
    }, { devices: stage }));
});

// Edits of Sword, Axe and Staff (two clusters), with the warnings that each has then.
const raised = [
  [`Set${urn}`, ['Axe', 0, 'ready'], [0], [0]], [`Set${urn}`, ['Axe', 0, 'gone'], [], [4]],
  [`Set${urn}`, ['Axe', 0, 'far'], [], [3]], [`Set${urn}`, ['Axe', 0, 'plugged in'], [], [13]],
  ['SetEnabled', ['Axe', false], [], [13]], ['SetEnabled', ['Axe', true], [], [13]],
  ['SetActiveMarkersOnWhileCharging', ['Axe', true], [], []],
  ['SetActiveMarkersOnWhileCharging', ['Axe', false], [], [13]], [`Set${urn}`, ['Axe', 0, ''], [], [5]],
  [`Set${pattern}`, ['Axe', 0, 1], [1], [1, 5]], ['SetEnabled', ['Sword', false], [], [5]],
  ['SetEnabled', ['Sword', true], [1], [1, 5]], [`Set${pattern}`, ['Axe', 0, 0], [], [2, 5]],
  ['SetEnabled', ['Axe', false], [], [5]], [`Set${pattern}`, ['Axe', 0, 1], [], [5]],
  ['SetEnabled', ['Axe', true], [1], [1, 5]], ['AssignOptimalActiveMarkerPatterns', [], [], [5]],
  [`Set${urn}`, ['Axe', 0, 'spare'], [], []], ['SetTemplateGroupName', ['Sword', 'Blades'], [8], []],
  ['SetProximityGroupName', ['Sword', 'Stage'], [6], []], ['SetProximityGroupName', ['Axe', 'Stage'], [], []],
  ['SetTemplateGroupName', ['Axe', 'Blades'], [6, 7], [6, 7]],
  ['BasicObjectServices.SetProximityGroupName', ['Crate', 'Stage'], [7], [7]],
  ['BasicObjectServices.SetEnabled', ['Crate', false], [6, 7], [6, 7]],
  ['BasicObjectServices.SetEnabled', ['Crate', true], [7], [7]],
  ['SetProximityGroupName', ['Axe', 'Elsewhere'], [], [6]],
  ['SetTemplateGroupName', ['Staff', 'Blades'], [9], [6, 9], [5, 8, 9]], ['SetEnabled', ['Staff', false], [], [6]],
  ['SetEnabled', ['Staff', true], [9], [6, 9], [5, 8, 9]], ['SetTemplateGroupName', ['Staff', ''], [], [6]],
  [`Set${urn}`, ['Staff', 1, 'spare'], [], [0, 6], [0, 5]], ['Rename', ['Staff', 'Pole'], [], [0, 6], null],
  ['Remove', ['Pole'], [], [6], null],
];

test('Warnings come and go with their causes', () => withStage(
  [{ name: 'Crate' }, smart('Sword', { device: 'ready', pattern: 1 }), smart('Axe', { pattern: 2 }),
   smart('Staff', { label: 'Grip', pattern: 3 }, { label: 'Tip', pattern: 4 })], async connection => {
    for (const [method, params, sword, axe, pole = [5]] of [['SmartObjectList', [], [], [5]], ...raised]) {
      await ask(connection, method, ...params);
      for (const [name, numbers] of Object.entries({ Sword: sword, Axe: axe, ...(pole && { Staff: pole }) })) {
        const [found] = await ask(connection, 'SmartObjectWarnings', name);
        assert.deepEqual(found, numbers.map(it => [it, texts.get(it)]), `${name} after ${method} ${params}`);
      }
    }
  }, { devices: [{ urn: 'ready' }, { urn: 'spare', radio: 12 }, { urn: 'far', connected: false, radio: 0 },
                 { urn: 'plugged in', charging: true, radio: 13 }] }));
