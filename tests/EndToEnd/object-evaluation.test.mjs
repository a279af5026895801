// The group "ObjectEvaluationServices" over the wire: its settings, what it finds, and that nobody waits for it.

import assert from 'node:assert/strict';
import { readFileSync } from 'node:fs';
import { test } from 'node:test';
import { setTimeout as sleep } from 'node:timers/promises';
import { isDeepStrictEqual } from 'node:util';

import { assertFails, assertSucceeds, changed, codes, evaluationChanged, eventually, functions, inGroup, outputsOf, withStage }
  from './api.mjs';
import { inTime, scaled, temporaryDirectory } from './host.mjs';

const group = 'ObjectEvaluationServices';
const greatest = 1.7976931348623157e+308;
const most = '18446744073709551615';

// The outputs of a call that succeeds, in their order. A method without a group is one of this group.
function ask(connection, method, ...params) {
  return outputsOf(connection, method.includes('.') ? method : `${group}.${method}`, params);
}

function edit(connection, name, ...params) {
  return ask(connection, `BasicObjectServices.${name}`, ...params);
}

async function progress(connection) {
  const [done, required] = await ask(connection, 'Progress');
  assert.ok(done <= required, `${done} of ${required}`);
  return [done, required];
}

// The numbers of each object's warnings.
function warnings(connection, names) {
  return Promise.all(names.map(async name => {
    const [list] = await edit(connection, 'BasicObjectWarnings', name);
    return list.map(([number]) => number);
  }));
}

// The match distance, or null without a match.
async function distance(connection, first, second) {
  const [matches, millimetres] = await ask(connection, 'MatchDistance', first, second);
  if (!matches)
    assert.equal(millimetres, greatest, `${first}, ${second}`);
  return matches ? millimetres : null;
}

function finished(connection, count) {
  return eventually(() => progress(connection), [count, count]);
}

// Waits until all of these were notified, in whatever order.
async function told(connection, ...callbacks) {
  for (const missing = new Set(callbacks); missing.size > 0;)
    missing.delete((await connection.nextNotification()).method);
}

// Calls that are sent without waiting for one another's answers, so that nothing has time to happen between them.
function atOnce(...calls) {
  return Promise.all(calls.map(call => call()));
}

// A call with an argument as it is written here: the answer as text.
function exchange(connection, name, argument) {
  return connection.exchange(`{"jsonrpc":"2.0","id":"text","method":"${group}.${name}","params":[${argument}]}`);
}

async function setMost(connection) {
  assertSucceeds(JSON.parse(await exchange(connection, 'SetMaximumEvaluationStepCount', most)));
}

// Markers as they are when the object lies elsewhere, and the other way round.
function posed(markers) {
  const [c, s, d, t] = [Math.cos(0.7), Math.sin(0.7), Math.cos(2.1), Math.sin(2.1)];
  return markers.map(([x, y, z]) => [c * x - s * y, s * x + c * y, z])
    .map(([x, y, z]) => [x + 500, d * y - t * z - 300, t * y + d * z + 40]).reverse();
}

// Markers of which none could be another, in any view.
const odd = [[0, 0, 0], [410, 0, 0], [0, 190, 0], [70, 90, 280], [310, 250, 60]];
const other = [[0, 0, 0], [350, 0, 0], [0, 230, 0], [40, 60, 120], [190, 310, 70]];
const large = [[0, 0, 0], [300, 0, 0], [0, 220, 0], [90, 60, 170], [210, 130, 80], [30, 160, 60],
               [250, 40, 120], [130, 250, 200], [60, 20, 260]];
const small = large.slice(0, 6);
const hexagon = [0, 1, 2, 3, 4, 5].map(i => [100 * Math.cos(i * Math.PI / 3), 100 * Math.sin(i * Math.PI / 3), 0]);

// Four in a plane, and the last one lifted out of it; the motion that is best for all leaves each 3 mm or so.
const flat = [[0, 0, 0], [200, 0, 0], [260, 90, 0], [120, 180, 0]];
const bent = posed([...flat.slice(0, 3), [120, 180, 20]]);

const twins = [{ name: 'Crate', markers: odd }, { name: 'Barrel', markers: posed(odd) }];

test('Settings have defaults, take what is fit, and tell of every change', () => withStage([], async connection => {
  const outputs = { Enabled: 'Enabled', MaximumEvaluationStepCount: 'MaximumStepCount', WarningThreshold: 'Threshold' };
  const assertSettings = async settings => {
    for (const [name, output] of Object.entries(outputs))
      assertSucceeds(await connection.call(`${group}.${name}`), { [output]: settings[name] });
  };
  const settings = { Enabled: false, MaximumEvaluationStepCount: 10000, WarningThreshold: 5 };
  await assertSettings(settings);
  await connection.call('Server.Subscribe', [`${group}.*`]);
  for (const [name, value] of [
    ['MaximumEvaluationStepCount', 1], ['MaximumEvaluationStepCount', 2 ** 53], ['WarningThreshold', 0],
    ['WarningThreshold', 0.1], ['WarningThreshold', greatest], ['Enabled', true], ['MaximumEvaluationStepCount', 7],
    ['WarningThreshold', 2.5], ['Enabled', false]]) {
    assertSucceeds(await connection.call(`${group}.Set${name}`, [value]));
    settings[name] = value;
    await told(connection, evaluationChanged);
    await assertSettings(settings);
  }

  const [steps, threshold] = ['SetMaximumEvaluationStepCount', 'SetWarningThreshold'];
  for (const [name, argument, code] of [
    [steps, '0', 'InvalidValue'], [steps, '-1', 'InvalidValue'], [steps, '1.5', 'InvalidValue'],
    [steps, '18446744073709551616', 'InvalidValue'], [steps, '"7"', 'InvalidFormat'],
    [threshold, '-0.001', 'InvalidValue'], [threshold, '1e999', 'InvalidValue'], [threshold, '-1e999', 'InvalidValue'],
    [threshold, '"2.5"', 'InvalidFormat'], [threshold, 'null', 'InvalidFormat'], ['SetEnabled', '1', 'InvalidFormat']])
    assert.equal(JSON.parse(await exchange(connection, name, argument)).error?.message, code, `${name} ${argument}`);
  await assertSettings(settings);

  await setMost(connection);
  const answer = await exchange(connection, 'MaximumEvaluationStepCount', '');
  assert.match(answer, new RegExp(`"MaximumStepCount":${most}[,}]`));
}));

test('What cannot be answered is refused, and why is asked in this order', () => withStage([
  ...twins, { name: 'Dark', parameters: { Enabled: false }, markers: odd },
  { name: 'Hedge', markers: Array.from({ length: 65 }, (_, i) => [i * 50, i * i, 0]) },
  { name: 'Far', markers: [[0, 0, 0], [1, 0, 0], [0, 1, 0], [1e300, -1e300, greatest]] },
  { kind: 'SmartObjects', name: 'Handset', markers: other }, { kind: 'CFCs', name: 'Actor' },
  { kind: 'Props', name: 'Chair' }], async connection => {
  const refuses = async (code, name, ...params) =>
    assertFails(await connection.call(`${group}.${name}`, params), `${group}.${name}`, code);
  const refusesNames = async () => {
    for (const name of ['Nobody', '', 'crate', 'Crate ', 'Actor', 'Chair'])
      for (const pair of [['Crate', name], [name, 'Dark'], [name, name]])
        await refuses('InvalidArgument', 'MatchDistance', ...pair);
  };
  await refuses('NotAvailable', 'Progress');
  await refuses('NotAvailable', 'HighestStepCountReached');
  await refusesNames();
  for (const pair of [['Crate', 'Handset'], ['Dark', 'Crate'], ['Hedge', 'Crate']])
    await refuses('NotAvailable', 'MatchDistance', ...pair);

  await ask(connection, 'SetEnabled', true);
  await finished(connection, 9);
  await refusesNames();
  for (const pair of [['Dark', 'Crate'], ['Crate', 'Dark'], ['Dark', 'Dark'], ['Dark', 'Hedge'], ['Hedge', 'Dark']])
    await refuses('NotRequired', 'MatchDistance', ...pair);
  for (const pair of [['Hedge', 'Crate'], ['Crate', 'Hedge'], ['Hedge', 'Hedge'],
                      ['Far', 'Crate'], ['Crate', 'Far']])
    await refuses('NotSupported', 'MatchDistance', ...pair);
  const strangers = { SecondObjectName: 'Crate', FirstObjectName: 'Handset' };
  const answer = await connection.call(`${group}.MatchDistance`, strangers);
  assertSucceeds(answer, { Matches: false, MatchDistance: greatest });
}));

const layouts = {
  Odd: { markers: odd },
  Turned: { markers: posed(odd) },
  Mirrored: { markers: odd.map(([x, y, z]) => [-x, y, z]) },
  Handset: { kind: 'SmartObjects', markers: posed(odd) },
  Small: { markers: posed(small) },
  Large: { markers: large },
  'Seen early': { parameters: { EntranceThreshold: 4 }, markers: [...other, ...large.slice(-1)] },
  Part: { kind: 'SmartObjects', parameters: { EntranceThreshold: 5 }, markers: [...posed(other).slice(1), [0, 0, 0]] },
  Hexagon: { markers: hexagon },
  Flat: { markers: flat },
  Bent: { markers: bent },
  Trio: { markers: odd.slice(0, 3) },
  'Other trio': { markers: odd.slice(0, 3) },
  Bare: {},
};
const distances = {
  'Odd as Turned': 0, 'Odd as Handset': 0, 'Turned as Odd': 0, 'Turned as Handset': 0, 'Handset as Odd': 0,
  'Handset as Turned': 0, 'Small as Large': 0, 'Seen early as Part': 0, 'Hexagon as Hexagon': 0, 'Flat as Bent': 3.05,
  'Bent as Flat': 3.05,
};

test('An object matches what it could be taken for, and nothing else', () => withStage(
  Object.entries(layouts).map(([name, layout]) => ({ name, ...layout })), async connection => {
    const names = Object.keys(layouts);
    await ask(connection, 'SetEnabled', true);
    await finished(connection, names.length ** 2);
    for (const one of names)
      for (const it of names) {
        const found = await distance(connection, one, it);
        const expected = distances[`${one} as ${it}`];
        if (expected === undefined)
          assert.equal(found, null, `${one} as ${it}`);
        else
          assert.ok(Math.abs((found ?? NaN) - expected) < (expected ? 0.01 : 1e-6), `${one} as ${it}: ${found}`);
      }
    const critical = ['Odd', 'Turned', 'Small', 'Seen early', 'Hexagon'];
    const basic = names.filter(name => layouts[name].kind === undefined);
    assert.deepEqual(await warnings(connection, basic),
                     basic.map(name => critical.includes(name) ? [6] : /Flat|Bent/.test(name) ? [5] : []));
  }));

test('Warnings come and go with their causes', () => withStage([
  ...twins, { name: 'Lamp', markers: other, parameters: { TemplateGroupName: 'Lamps' }, warnings: ['ObjectConfusion'] },
], async connection => {
  const all = ['Crate', 'Barrel', 'Lamp'];
  assert.deepEqual(await warnings(connection, all), [[], [], [2, 5]]);
  for (const callback of [evaluationChanged, changed])
    assert.equal((await connection.call('Server.Subscribe', [callback])).result.code, codes.Ok);

  await ask(connection, 'SetEnabled', true);
  await told(connection, changed, evaluationChanged);
  await finished(connection, 9);
  assert.deepEqual(await warnings(connection, all), [[6], [6], [2]]);

  // The counts are those of the object that is back; any other edit has them begin at 0 at once, and stay there.
  const pair = ['Crate', 'Barrel'];
  for (const [name, ...params] of [['Rename', 'Crate', 'Box'], ['SetColor', 'Lamp', '#112233'],
                                   ['Rename', 'Box', 'Crate']]) {
    connection.notifications.splice(0);
    await edit(connection, 'SetEnabled', 'Barrel', false);
    await eventually(() => warnings(connection, pair), [[], []]);
    await told(connection, changed, evaluationChanged);
    assert.deepEqual(await progress(connection), [0, 0]);
    await edit(connection, 'SetEnabled', 'Barrel', true);
    await finished(connection, 5);
    assert.deepEqual(await warnings(connection, pair), [[6], [6]]);

    connection.notifications.splice(0);
    const [, counts] = await atOnce(() => edit(connection, name, ...params), () => progress(connection));
    assert.deepEqual(counts, [0, 0], name);
    if (name === 'Rename')
      pair[0] = params[1];
    await eventually(async () => (await distance(connection, ...pair) ?? greatest) < 1e-6, true);
    await told(connection, evaluationChanged);
    assert.deepEqual(await progress(connection), [0, 0], name);
    assert.deepEqual(await warnings(connection, pair), [[6], [6]], name);
  }

  // Off and on again sooner than anyone could look.
  const [, cleared] = await atOnce(() => ask(connection, 'SetEnabled', false), () => warnings(connection, all),
                                   () => ask(connection, 'SetEnabled', true));
  assert.deepEqual(cleared, [[], [], [2]]);
  await eventually(() => warnings(connection, all), [[6], [6], [2]]);

  await edit(connection, 'Remove', 'Barrel');
  await eventually(() => warnings(connection, ['Crate', 'Lamp']), [[], [2]]);
  assert.deepEqual(await progress(connection), [0, 0]);
}));

test('The threshold tells what is warned of, and how', () => withStage([
  { name: 'Flat', markers: flat }, { name: 'Bent', markers: bent }], async connection => {
  const found = () => warnings(connection, ['Flat', 'Bent']);
  await ask(connection, 'SetEnabled', true);
  for (const [threshold, expected] of [[8, [6]], [5, [5]], [2, []], [5, [5]], [4, [5]], [0, []], [60, [6]]]) {
    await ask(connection, 'SetWarningThreshold', threshold);
    // An update is not done before its warnings are there.
    await finished(connection, 4);
    assert.deepEqual(await found(), [expected, expected], threshold);
  }
  assert.ok(await distance(connection, 'Flat', 'Flat') > 10, 'with a greater threshold, matches are more distant');

  const [, cleared, off] = await atOnce(() => ask(connection, 'SetEnabled', false), found,
                                        () => connection.call(`${group}.Progress`));
  assert.deepEqual(cleared, [[], []]);
  assertFails(off, `${group}.Progress`, 'NotAvailable');
  await sleep(scaled(50));
  assert.deepEqual(await found(), [[], []]);
}));

test('Settings and warnings outlive the host, however it ends', async () => {
  const data = temporaryDirectory();
  const run = (body, subjects) => withStage(subjects, body, { data });
  const names = ['Crate', 'Barrel'];
  const assertSettings = async (connection, enabled) => {
    const settings = ['Enabled', 'MaximumEvaluationStepCount', 'WarningThreshold'];
    assert.deepEqual(await Promise.all(settings.map(name => ask(connection, name))), [[enabled], [777], [6.25]]);
  };
  await run(async (connection, host) => {
    await ask(connection, 'SetMaximumEvaluationStepCount', 777);
    await ask(connection, 'SetWarningThreshold', 6.25);
    await ask(connection, 'SetEnabled', true);
    await host.kill();
  }, twins);
  await run(async connection => {
    await assertSettings(connection, true);
    await finished(connection, 4);
    assert.deepEqual(await warnings(connection, names), [[6], [6]]);
  });
  await run(async (connection, host) => {
    // They stay while their causes are looked for again.
    await eventually(async () => {
      assert.deepEqual(await warnings(connection, names), [[6], [6]]);
      return progress(connection);
    }, [4, 4]);
    await assertSettings(connection, true);
    await ask(connection, 'SetEnabled', false);
    await host.kill();
  });
  await run(async connection => {
    await assertSettings(connection, false);
    assert.deepEqual(await warnings(connection, names), [[], []]);
  });
});

test('A host without the feature has no such group', () => withStage(twins, async connection => {
  for (const { name } of inGroup(group, functions))
    assert.equal((await connection.call(name, [])).error?.code, -32601, name);
  for (const name of [evaluationChanged, `${group}.*`])
    assert.equal((await connection.call('Server.Subscribe', [name])).error?.message, 'NotFound');
  const { result: { methods, 'x-callbacks': callbacks, 'x-types': types } } = await connection.call('rpc.discover');
  assert.deepEqual(inGroup(group, [...methods, ...callbacks, ...types]), []);
  assert.deepEqual(await warnings(connection, ['Crate', 'Barrel']), [[], []]);
}, { options: ['--features', '0xFFFFFDFF'] }));

test('The highest step count is the maximum when that was too small', () => withStage(twins, async connection => {
  await ask(connection, 'SetMaximumEvaluationStepCount', 3);
  await ask(connection, 'SetEnabled', true);
  await finished(connection, 4);
  assert.deepEqual(await ask(connection, 'HighestStepCountReached'), [3]);
  assert.equal(await distance(connection, 'Crate', 'Barrel'), null);
  await ask(connection, 'SetMaximumEvaluationStepCount', 10000);
  await eventually(() => warnings(connection, ['Crate', 'Barrel']), [[6], [6]]);
  await finished(connection, 4);
  const [steps] = await ask(connection, 'HighestStepCountReached');
  assert.ok(steps > 3 && steps < 10000, steps);
}));

// The milliseconds that the host's threads were at work.
function workOf(host) {
  const fields = readFileSync(`/proc/${host.pid}/stat`, 'latin1').replace(/^.*\) /s, '').split(' ');
  return (Number(fields[11]) + Number(fields[12])) * 10;
}

test('Nothing waits for a comparison that does not end', () => {
  let seed = 1;
  const next = () => (seed = seed * 48271 % 2147483647) / 2147483647 * 60;
  const crowd = Array.from({ length: 40 }, (_, i) => (
    { name: `Object ${i}`, parameters: { EntranceThreshold: 30 },
      markers: Array.from({ length: 40 }, () => [next(), next(), next()]) }));
  return withStage(crowd, async (connection, host) => {
    const prompt = promise => inTime(promise, 'a prompt answer', 1000);
    const counts = () => prompt(progress(connection));
    await setMost(connection);
    await prompt(ask(connection, 'SetEnabled', true));
    await eventually(counts, [0, 1600]);
    for (let i = 0; i < 40; i += 2) {
      await prompt(edit(connection, 'SetColor', `Object ${i}`, '#102030'));
      await prompt(warnings(connection, [`Object ${i}`]));
      assert.equal(await prompt(distance(connection, 'Object 0', `Object ${i}`)), null);
      await prompt(ask(connection, 'HighestStepCountReached'));
    }
    // The first of these is the one that is being compared.
    for (let i = 0; i < 40; i += 10)
      await prompt(edit(connection, 'SetEnabled', `Object ${i}`, false));
    await eventually(counts, [0, 36 * 36]);

    await prompt(ask(connection, 'SetEnabled', false));
    await eventually(async () => {
      const before = workOf(host);
      await sleep(200);
      return workOf(host) - before < 100;
    }, true);

    // A maximum that was too large can be lowered while it lasts.
    await prompt(ask(connection, 'SetEnabled', true));
    await eventually(counts, [0, 36 * 36]);
    await connection.call('Server.Subscribe', [evaluationChanged]);
    await prompt(ask(connection, 'SetMaximumEvaluationStepCount', 300));
    do // A client need not ask before it is told.
      await told(connection, evaluationChanged);
    while (!isDeepStrictEqual(await counts(), [36 * 36, 36 * 36]));
    assert.deepEqual(await ask(connection, 'HighestStepCountReached'), [300]);

    await setMost(connection);
    await eventually(counts, [0, 36 * 36]);
    assert.equal(await host.stop('SIGTERM', 2000), 0);
  });
});
