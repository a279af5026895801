// The group "BasicObjectServices" over the wire: what each function does, what it refuses, who is told.

import assert from 'node:assert/strict';
import { describe, test } from 'node:test';

import { assertFails, assertSucceeds, changed, codes, functions as allFunctions, inGroup, inputs, snapshot }
  from './api.mjs';
import { withHost } from './host.mjs';
import { post, withConnection } from './wire.mjs';

const functions = inGroup('BasicObjectServices', allFunctions);

const otherKinds = { SmartObjects: 'Handset', CFCs: 'Actor', GeneralSubjects: 'Dancer', LabellingClusters: 'Headband',
                     Markerless: 'Passer-by', Props: 'Chair', SceneMeshes: 'Floor' };

const subjects = [
  { name: 'Crate', parameters: { Enabled: true, ColourRGBA: '#ff3366cc' },
    markers: [[0, 0, 0], [120, 0, 0], [0, 80, 0]] },
  { name: 'Barrel',
    parameters: { Enabled: false, ColourRGBA: '#80102030', ProximityGroupName: 'Stage left', TemplateGroupName: 'Kegs',
                  AutoAssignEnabled: true },
    warnings: ['ObjectConfusion', 'BatteryLow'] },
  { name: 'Apple', warnings: ['ObjectConfusion'] },
  ...Object.entries(otherKinds).map(([kind, name]) => ({ kind, name, slots: ['Belt'] })),
];

const confusion = [5, 'Object could be confused with another object, or another view of itself.'];
const missingUnique = [0, 'Proximity group has no unique object.'];
const noProximityGroup = [2, "Object is in a template group, but isn't in a proximity group."];

function named(name) {
  return `BasicObjectServices.${name}`;
}

function record(method) {
  return functions.find(known => known.name === method);
}

// The same parameters by name, in the opposite order, because the order must not matter.
function byName(method, params) {
  return Object.fromEntries(inputs(record(method)).map((input, i) => [input.name, params[i]]).reverse());
}

// A value that each input of a function takes, the first one given.
function acceptable(method, first) {
  return inputs(record(method)).map(({ name, type }, i) => {
    if (i === 0 && first !== undefined)
      return first;
    return type === 'bool' ? true : name === 'ColorHtml' ? '#112233' : 'Any';
  });
}

function withConnectedHost(body, options = {}) {
  return withHost({ subjects, ...options }, host => withConnection(host, connection => body(connection, host)));
}

// Each call with its outputs, in an order in which each edit is seen by the query after it.
const walk = [
  ['BasicObjectList', [], { Names: ['Apple', 'Barrel', 'Crate'] }],
  ['Enabled', ['Crate'], { Enabled: true }],
  ['Enabled', ['Barrel'], { Enabled: false }],
  ['SetEnabled', ['Crate', false], {}],
  ['Enabled', ['Crate'], { Enabled: false }],
  ['SetAllEnabled', [true], {}],
  ['Enabled', ['Crate'], { Enabled: true }],
  ['Enabled', ['Barrel'], { Enabled: true }],
  ['Color', ['Crate'], { ColorHtml: '#ff3366cc' }],
  ['Color', ['Barrel'], { ColorHtml: '#80102030' }],
  ['SetColor', ['Crate', '#01020304'], {}],
  ['Color', ['Crate'], { ColorHtml: '#01020304' }],
  ['AutoAssignEnabled', ['Barrel'], { Enabled: true }],
  ['AutoAssignEnabled', ['Crate'], { Enabled: false }],
  ['SetAutoAssignEnabled', ['Crate', true], {}],
  ['AutoAssignEnabled', ['Crate'], { Enabled: true }],
  ['AutoAssignedName', ['Barrel'], { AutoAssignedName: 'Belt' }],
  ['ProximityGroupName', ['Barrel'], { ProximityGroupName: 'Stage left' }],
  ['SetProximityGroupName', ['Barrel', ''], {}],
  ['ProximityGroupName', ['Barrel'], { ProximityGroupName: '' }],
  ['SetProximityGroupName', ['Crate', ' Bühne\t"links" \\ '], {}],
  ['ProximityGroupName', ['Crate'], { ProximityGroupName: ' Bühne\t"links" \\ ' }],
  ['TemplateGroupName', ['Barrel'], { TemplateGroupName: 'Kegs' }],
  ['TemplateGroupName', ['Crate'], { TemplateGroupName: '' }],
  ['SetTemplateGroupName', ['Crate', '木箱 🧰\u0001\u2028'], {}],
  ['TemplateGroupName', ['Crate'], { TemplateGroupName: '木箱 🧰\u0001\u2028' }],
  ['BasicObjectWarnings', ['Crate'], { Warnings: [missingUnique] }],
  ['BasicObjectWarnings', ['Apple'], { Warnings: [confusion] }],
  ['BasicObjectWarnings', ['Barrel'], { Warnings: [noProximityGroup, confusion] }],
  ['Rename', ['Crate', 'Box'], {}],
  ['Color', ['Box'], { ColorHtml: '#01020304' }],
  ['BasicObjectList', [], { Names: ['Apple', 'Barrel', 'Box'] }],
  ['Remove', ['Apple'], {}],
  ['BasicObjectList', [], { Names: ['Barrel', 'Box'] }],
  ['Rename', ['Box', 'Apple'], {}],
  ['RemoveAll', [], {}],
  ['RemoveAll', [], {}],
  ['SetAllEnabled', [false], {}],
  ['BasicObjectList', [], { Names: [] }],
];

describe('every function', () => {
  assert.deepEqual(new Set(walk.map(([name]) => named(name))), new Set(functions.map(known => known.name)));

  for (const [how, form] of [['by position', (method, params) => params], ['by name', byName]])
    test(`does what it says, ${how}`, () => withConnectedHost(async connection => {
      for (const [name, params, values] of walk) {
        const method = named(name);
        assertSucceeds(await connection.call(method, form(method, params)), values);
      }
      // Only basic objects were removed.
      for (const name of Object.values(otherKinds))
        assertFails(await connection.call(named('Enabled'), [name]), named('Enabled'), 'InvalidArgument');
    }));

  test('does over HTTP what it says', () => withHost({ subjects }, async host => {
    for (const [name, params, values] of walk)
      assertSucceeds(await post(host, named(name), params), values);
  }));

  test('refuses an unknown name and a subject of another kind', () => withConnectedHost(async connection => {
    const before = await snapshot(connection);
    const refused = [...['Nobody', 'crate', 'Crate ', ''].map(name => [name, 'NotFound']),
                     ...Object.values(otherKinds).map(name => [name, 'InvalidArgument'])];
    const perName = functions.filter(({ name }) => inputs(record(name))[0]?.type === 'text');
    assert.equal(perName.length, 14);
    for (const { name: method } of perName)
      for (const [name, code] of refused)
        for (const params of [acceptable(method, name), byName(method, acceptable(method, name))])
          assertFails(await connection.call(method, params), method, code);
    // Who is meant is asked first.
    assertFails(await connection.call(named('Rename'), ['Nobody', ' x']), named('Rename'), 'NotFound');
    assertFails(await connection.call(named('Rename'), ['Handset', ' x']), named('Rename'), 'InvalidArgument');
    assertFails(await connection.call(named('SetColor'), ['Nobody', 'red']), named('SetColor'), 'NotFound');
    assert.deepEqual(await snapshot(connection), before);
  }));
});

test('Colours are taken with and without alpha, in any case, and nothing else is', () => withConnectedHost(
  async connection => {
    const taken = { '#FF0000': '#ffff0000', '#80ABCDEF': '#80abcdef', '#00000000': '#00000000', '#aBcDeF': '#ffabcdef',
                    '#ffffffff': '#ffffffff', '#012345': '#ff012345' };
    for (const [colour, answered] of Object.entries(taken)) {
      assertSucceeds(await connection.call(named('SetColor'), ['Crate', colour]));
      assertSucceeds(await connection.call(named('Color'), ['Crate']), { ColorHtml: answered });
    }
    const refused = ['', '#', '#ff000', '#ff00000', '#ff0000000', 'ff00000', 'ff0000000', 'ff000000', '#gg0000',
                     '#ff 000', '#+f0000', '#-10000', '#0x1234', '#ff0000 ', ' #ff0000', '#ff000\u0000', '#ff00é',
                     '#ff0000é', '＃ff0000', '##f0000', 'red'];
    for (const colour of refused) {
      assertFails(await connection.call(named('SetColor'), ['Crate', colour]), named('SetColor'), 'InvalidArgument');
      assertSucceeds(await connection.call(named('Color'), ['Crate']), { ColorHtml: '#ff012345' });
    }
  }));

test('A new name is taken when it is fit and free', () => withConnectedHost(async connection => {
  const rename = (from, to) => connection.call(named('Rename'), [from, to]);
  let name = 'Crate';
  for (const fit of ['crate', 'A', "O'Neil & Sons; [2] {a} 100%", 'Größe ≤ 5', '箱 🧰', 'two  spaces',
                     'n'.repeat(255)]) {
    assertSucceeds(await rename(name, fit));
    assertSucceeds(await connection.call(named('Color'), [fit]), { ColorHtml: '#ff3366cc' });
    assertFails(await rename(name, 'Elsewhere'), named('Rename'), 'NotFound');
    name = fit;
  }
  assertSucceeds(await rename(name, 'Crate'));
  assertSucceeds(await rename('Crate', 'Crate'));
  // One name in two forms: kept as given, found by either.
  assertSucceeds(await rename('Crate', 'Caf\u00e9'));
  assertFails(await rename('Barrel', 'Cafe\u0301'), named('Rename'), 'AlreadyPresent');
  assertSucceeds(await rename('Cafe\u0301', 'Crate'));

  const before = await snapshot(connection);
  for (const unfit of ['', ' ', ' Box', 'Box ', '\u0000', 'Bo\u0000x', 'Bo\nx', '\u001fBox', 'Box\u007f', 'a/b', 'a\\b',
                       'a:b', 'a*b', 'a?b', 'a"b', 'a<b', 'a>b', 'a|b', 'n'.repeat(256), 'ß'.repeat(128), '..',
                       '\u00a0', 'Box\u2003', 'B\u0085x', 'B\u200bx', '\u202exoB'])
    assertFails(await rename('Crate', unfit), named('Rename'), 'InvalidName');
  for (const setter of ['SetProximityGroupName', 'SetTemplateGroupName'])
    for (const long of ['x'.repeat(1025), 'ß'.repeat(513), 'x'.repeat(1_000_000)])
      assertFails(await connection.call(named(setter), ['Crate', long]), named(setter), 'InvalidValue');
  for (const held of ['Barrel', ...Object.values(otherKinds)])
    assertFails(await rename('Crate', held), named('Rename'), 'AlreadyPresent');
  assert.deepEqual(await snapshot(connection), before);
}));

test('An object without a slot has no auto-assigned name', () => withConnectedHost(async connection => {
  const method = named('AutoAssignedName');
  assertFails(await connection.call(method, ['Crate']), method, 'NotSet');
  assertSucceeds(await connection.call(named('SetAutoAssignEnabled'), ['Crate', true]));
  assertFails(await connection.call(method, ['Crate']), method, 'NotSet');
}));

test('Whoever subscribed is told once of each change, and of nothing else', () => withConnectedHost(
  async (connection, host) => withConnection(host, async editor => {
    const answer = await connection.call('Server.Subscribe', [changed]);
    let { sequence } = answer.result;

    // A query after an edit is answered on the way on which the edit's notification went before.
    const silent = async (name, params, refusal) => {
      const method = named(name);
      const edited = await connection.call(method, params);
      refusal ? assertFails(edited, method, refusal) : assertSucceeds(edited);
      await connection.call(named('BasicObjectList'));
      assert.deepEqual(connection.notifications, [], `${name} ${params}`);
    };
    const told = async (from, name, params) => {
      assertSucceeds(await from.call(named(name), params));
      const notification = await connection.nextNotification();
      const { sequence: number } = notification.params;
      assert.deepEqual(notification, { jsonrpc: '2.0', method: changed, params: { sequence: number } });
      assert.ok(number > sequence);
      sequence = number;
      await connection.call(named('BasicObjectList'));
      assert.deepEqual(connection.notifications, [], `${name} ${params}`);
    };

    for (const [name, params, noEffect] of [
      ['SetEnabled', ['Crate', false], ['Crate', false]],
      ['SetAllEnabled', [true], [true]],
      ['SetColor', ['Crate', '#FF0000'], ['Crate', '#ffff0000']],
      ['SetAutoAssignEnabled', ['Crate', true], ['Crate', true]],
      ['SetProximityGroupName', ['Crate', 'Stage'], ['Crate', 'Stage']],
      ['SetTemplateGroupName', ['Crate', 'Boxes'], ['Crate', 'Boxes']],
      ['Rename', ['Crate', 'Box'], ['Box', 'Box']],
    ]) {
      await told(connection, name, params);
      await silent(name, noEffect);
    }
    await told(editor, 'SetColor', ['Box', '#000001']);

    await silent('Rename', ['Box', ' Box'], 'InvalidName');
    await silent('Rename', ['Box', 'Handset'], 'AlreadyPresent');
    await silent('SetColor', ['Box', 'red'], 'InvalidArgument');
    await silent('SetEnabled', ['Handset', false], 'InvalidArgument');
    await silent('Remove', ['Nobody'], 'NotFound');

    await told(connection, 'Remove', ['Apple']);
    await told(editor, 'RemoveAll', []);
    await silent('RemoveAll', []);
    await silent('SetAllEnabled', [false]);
    assert.deepEqual(editor.notifications, []);
  })));

const grouping = ['ProximityGroupName', 'SetProximityGroupName', 'TemplateGroupName', 'SetTemplateGroupName']
  .map(named);
const autoAssign = ['AutoAssignEnabled', 'SetAutoAssignEnabled', 'AutoAssignedName'].map(named);

for (const [options, previews, granted] of [
  [['--features', '0x1'], [...grouping, ...autoAssign], false],
  [['--features', '257'], autoAssign, false],
  [['--features', '0x8001'], grouping, false],
  [['--features', '0x8101'], [], false],
  [['--features', '0x1', '--level', '1'], [...grouping, ...autoAssign], true],
]) {
  test(`Preview functions with ${options.join(' ')}`, () => withConnectedHost(async connection => {
    assert.deepEqual(connection.hello.params.levels, { open: 2, preview: 1, granted: granted ? 1 : 2 });
    const { result: description } = await connection.call('rpc.discover');
    const levels = Object.fromEntries(description.methods.map(method => [method.name, method['x-level']]));
    const before = await snapshot(connection);
    for (const { name: method } of functions) {
      const preview = previews.includes(method);
      assert.equal(levels[method], preview ? 1 : 2, method);
      if (/\.(Remove|RemoveAll|Rename|SetAllEnabled)$/.test(method))
        continue;
      const answer = await connection.call(method, acceptable(method, 'Barrel'));
      if (preview && !granted) {
        assert.match(answer.error?.data.detail ?? '', /--level 1/, method);
        delete answer.error.data.detail;
        assertFails(answer, method, 'NotPermitted');
      } else if (preview && method === named('AutoAssignedName'))
        assertFails(answer, method, 'NotSet'); // nothing is assigned then
      else
        assert.equal(answer.result?.code, codes.Ok, method);
    }
    if (granted)
      assert.notDeepEqual(await snapshot(connection), before);
    const callbacks = inGroup('BasicObjectServices', description['x-callbacks']);
    assert.deepEqual(callbacks.map(callback => [callback.name, callback['x-level']]), [[changed, 2]]);
  }, { options }));
}

test('A group whose feature is off does not exist', () => withConnectedHost(async connection => {
  for (const method of [...functions.map(({ name }) => name), changed])
    assert.equal((await connection.call(method, [])).error?.code, -32601, method);
  assert.equal((await connection.call('Server.Subscribe', [changed])).error.message, 'NotFound');
  const { result: description } = await connection.call('rpc.discover');
  assert.ok(description.methods.every(method => !method.name.startsWith('BasicObjectServices.')));
  for (const [list, others] of Object.entries({ 'x-callbacks': [], 'x-types': ['HostSimulation'] }))
    assert.deepEqual(new Set(description[list].map(({ name }) => name.split('.')[0])),
                     new Set(['SubjectCalibrationServices', ...others]));
}, { options: ['--features', '0'] }));
