// The group "SubjectCalibrationServices" over the wire: its functions and refusals, what is told of them, time-outs,
// the user's files, restarts.

import assert from 'node:assert/strict';
import { mkdirSync, rmSync, writeFileSync } from 'node:fs';
import { dirname, join } from 'node:path';
import { test } from 'node:test';
import { setTimeout as sleep } from 'node:timers/promises';

import { assertFails, assertSucceeds, callbacks, codes, eventually, functions as allFunctions, inGroup, inputs,
         withStage } from './api.mjs';
import { scaled, sharedFolder, temporaryDirectory } from './host.mjs';

const group = 'SubjectCalibrationServices';
const functions = inGroup(group, allFunctions);
const argumentsOf = callback => inputs(callbacks.find(({ name }) => name === callback)).map(({ name }) => name);
const named = name => name.includes('.') ? name : `${group}.${name}`;

const [start, recalibrate] = ['StartSubjectCalibration', 'StartSubjectRecalibration'];
const [accept, stop, cancel] = ['AcceptTPose', 'StopSubjectCalibration', 'CancelSubjectCalibration'];
const [canStart, canRecalibrate] = [`Can${start}`, `Can${recalibrate}`];
const [canAccept, canStop, canCancel] = [`Can${accept}`, `Can${stop}`, `Can${cancel}`];
const [setName, setTemplate, setSkin] = ['SetNewSubjectName', 'SetSubjectLabellingTemplate', 'SetSubjectSkin'];
const rename = 'BasicObjectServices.Rename';
const most = 4294967295;

// What may be possible, as the tests call it. "end" is the older name of "stop", and has no query of its own.
const queries = { start: canStart, recalibrate: canRecalibrate, accept: canAccept, stop: canStop, cancel: canCancel };
const possibilities = new Map(Object.entries({ ...queries, end: 'CanEndSubjectCalibration' })
  .map(([what, name]) => [`${group}.${name}ChangedCallback`, what]));

async function possible(connection) {
  const answers = await Promise.all(Object.values(queries).map(name => connection.call(named(name), [])));
  const able = Object.fromEntries(Object.keys(queries).map((what, i) => [what, answers[i].result.returned]));
  return { ...able, end: able.stop };
}

// Notifications in short: "settings" if any changed, then sessions with their states, then what became possible (+) or
// impossible (-). Those of one sort are in their order; it is left to the host which sort comes first, and how many
// changes of settings one notification stands for.
function inShort(notifications) {
  const texts = notifications.map(({ method, params: { SessionId, State, Able } }) => {
    const what = possibilities.get(method);
    return what ? what + (Able ? '+' : '-') : State === undefined ? 'settings' : `${SessionId}:${State}`;
  });
  const those = pattern => texts.filter(text => pattern.test(text));
  return [...those(/settings/).slice(0, 1), ...those(/:/), ...those(/[+-]$/)].join(' ');
}

// Makes each call, [what is told of it, outputs or refusal, method, parameters...], and follows what is possible. A
// query is answered after what was told before.
async function play(connection, ...rows) {
  for (const [told, expected, method, ...params] of rows) {
    const answer = await connection.call(named(method), params);
    if (typeof expected === 'string')
      assertFails(answer, named(method), expected);
    else
      assertSucceeds(answer, expected, expected.Reason === undefined ? undefined : expected.Reason === '');
    await possible(connection);
    await eventually(() => `${method} ${params}: ${inShort(connection.notifications)}`, `${method} ${params}: ${told}`);
    for (const { method: callback, params: { sequence, ...values } } of connection.notifications.splice(0)) {
      assert.ok(sequence > connection.sequence);
      connection.sequence = sequence;
      assert.deepEqual(Object.keys(values), argumentsOf(callback), callback);
      if (possibilities.has(callback))
        connection.possible[possibilities.get(callback)] = values.Able;
    }
    assert.deepEqual(await possible(connection), connection.possible, `after ${method} ${params}`);
  }
}

// Runs `body` with a connection to a host with these subjects that is told of everything.
function onStage(body, { pose = 600000, calibration = 600000, ...others } = {}) {
  const subjects = [{ name: 'Crate' }, { kind: 'GeneralSubjects', name: 'Old' }];
  const options = ['--t-pose-time', String(pose), '--subject-calibration-time', String(calibration)];
  return withStage(subjects, async (connection, host) => {
    assert.equal((await connection.call('Server.Subscribe', [`${group}.*`])).result?.code, codes.Ok);
    Object.assign(connection, { sequence: 0, possible: await possible(connection), notifications: [] });
    await body(connection, host);
  }, { options, ...others });
}

const says = (Reason, ...methods) => methods.map(method => ['', { Reason }, method]);
const nothingRuns = says('No subject calibration is running.', canAccept, canStop, canCancel);
const runs = says('A subject calibration is running.', canStart, canRecalibrate);
const inUse = name => says(`There is a subject named "${name}" already.`, canStart);
const unfit = name => says(`"${name}" is not a subject that can be calibrated.`, canRecalibrate);
const unnamed = says('No subject to recalibrate has been named.', canRecalibrate);
const latest = (SessionId, State) => ['', { SessionId, State }, 'LatestSubjectCalibrationState'];
const isNamed = SubjectName => ['', { SubjectName }, 'NewSubjectName'];
const refused = (code, method, params) => params.map(param => ['', code, method, param]);

// The object "Crate" cannot be called by a name that a subject has; by one that is free it is for a moment.
const taken = (...names) => names.map(name => ['', 'AlreadyPresent', rename, 'Crate', name]);
const free = (...names) => names.flatMap(name => [['', {}, rename, 'Crate', name], ['', {}, rename, name, 'Crate']]);

// Where templates and skins are, in the folder that comes with the host or in that of its data.
const [inTemplates, inSkins] = [name => `LabellingTemplates/${name}.lbt`, name => `SubjectSkins/${name}.skin`];
const hasTemplate = (LabellingTemplate, folder = sharedFolder()) => ['', {
  LabellingTemplate, LabellingTemplatePath: join(folder, inTemplates(LabellingTemplate)) }, 'SubjectLabellingTemplate'];
const hasSkin = (Skin, folder = sharedFolder()) => ['', { Skin, SkinPath: join(folder, inSkins(Skin)) }, 'SubjectSkin'];
const templates = ['Performer', 'Performer with staff'];
const family = ['Zoe', 'Zoe Staff', 'Zoe Staff head'];

// The steps of a run; `before` is what cannot be any more once it has begun.
const begins = (id, method, before) => (
  [`settings ${id}:1 ${before}- accept+ cancel+`, { SubjectCalibrationSession: id }, method, '']);
const starts = id => begins(id, start, 'start');
const startsAgain = id => begins(id, recalibrate, 'recalibrate');
const accepts = id => [`${id}:2 accept- stop+ end+`, {}, accept, id];
const stops = id => [`settings ${id}:3 recalibrate+ stop- end- cancel-`, {}, stop, id];
const cancels = id => [`settings ${id}:4 recalibrate+ accept- cancel-`, {}, cancel, id];

const walk = [
  ...says('No name is given.', canStart), ...unnamed, ...nothingRuns, latest(0, 0), isNamed(''),
  ['', { LabellingTemplates: templates }, 'SubjectLabellingTemplates'], hasTemplate(templates[0]),
  ['', { Skins: ['Adult', 'Child'] }, 'SubjectSkins'], hasSkin('Adult'), ['settings', {}, setTemplate, templates[1]],
  hasTemplate(templates[1]), ['settings', {}, setSkin, 'Child'], hasSkin('Child'),
  ['settings start+', {}, setName, 'Zoe'], isNamed('Zoe'), ...says('', canStart), ['', {}, setTemplate, templates[1]],
  ['', {}, setSkin, 'Child'], ['', {}, setName, 'Zoe'], ...free(...family.slice(1)),
  [...starts(1).slice(0, -1), 'take 1'], latest(1, 1), ...runs, ...says('', canAccept, canCancel), ...taken(...family),
  ...says('The T-pose has not been accepted yet.', canStop), accepts(1), latest(1, 2), ...runs,
  ...says('', canStop, canCancel), ...says('The T-pose has been accepted already.', canAccept),
  stops(1), latest(1, 3), ...inUse('Zoe'), ...says('', canRecalibrate), ...nothingRuns, startsAgain(2), latest(2, 1),
  ...runs, cancels(2), latest(2, 4), ...nothingRuns, ...taken(...family),
  ['settings recalibrate-', {}, setName, family[1]], ...unfit(family[1]), ...inUse(family[1]),
  ['settings', {}, setName, family[2]], ...unfit(family[2]), ...inUse(family[2]),
];

test('A subject is made, calibrated and calibrated again, and all is told of it', async () => {
  const called = new Set(walk.filter(([, expected]) => typeof expected !== 'string').map(row => named(row[2])));
  assert.deepEqual(functions.map(({ name }) => name).filter(name => !called.has(name)), []);
  await onStage(connection => play(connection, ...walk));
});

test('An action is refused when it is not possible, then for another session', () => onStage(async connection => {
  const none = [accept, stop, cancel].flatMap(method => refused('NotAvailable', method, [0, 1, 2, 3, most]));
  const refusals = (id, early, ...methods) => [
    ...refused('NotAvailable', early, [id, 0, most]),
    ...methods.flatMap(method => refused('InvalidSession', method, [0, id - 1, id + 1, most]))];
  const begun = id => [...refusals(id, stop, accept, cancel), ...refused('NotAvailable', recalibrate, ['', 'a.b'])];
  await play(connection, ...none, ['settings start+', {}, setName, 'Zoe'], starts(1), ...begun(1),
    ['', 'AlreadyPresent', start, ''], accepts(1), ...refusals(1, accept, stop, cancel),
    // A start that comes too early makes its subject all the same.
    ['settings', {}, setName, 'Max'], ['', 'InvalidArgument', start, 'a.b'], ...free('Max'),
    ['', 'NotAvailable', start, ''], ...taken('Max'), latest(1, 2), stops(1), ...none, ...inUse('Max'), latest(1, 3),
    startsAgain(2), ...begun(2), accepts(2), ...refusals(2, accept, stop, cancel),
    ['settings 2:4 recalibrate+ stop- end- cancel-', {}, cancel, 2], ...none, latest(2, 4),
    ['settings start+', {}, setName, 'Eve'], begins(3, start, 'start- recalibrate'), ...begun(3), cancels(3), ...none);
  for (const id of [-1, most + 1, 1.5])
    assert.equal((await connection.call(named(accept), [id])).error?.message, 'InvalidValue', id);
}));

test('What is not fit changes nothing', () => {
  const captures = [...'/:*?"<>|.,;\\'].flatMap(character => [character, `take${character}1`]);
  const names = ['', ' ', ' x', 'x ', ...[...'/\\:*?"<>|'].map(character => `a${character}b`), 'x\0', 'x\n',
                 'ß'.repeat(128), 'x'.repeat(500000)]; // a byte more than a name may have, and very many
  const choices = ['Nobody', '', 'performer', 'adult', 'Adult.skin', join(sharedFolder(), inSkins('Adult'))];
  const bad = [...refused('InvalidArgument', setName, names), ...refused('Failed', setTemplate, [...choices, 'Adult']),
               ...refused('Failed', setSkin, [...choices, 'Performer'])];
  const still = name => [isNamed(name), hasTemplate(templates[1]), hasSkin('Child'), latest(0, 0)];
  return onStage(connection => play(connection,
    ...bad, ['', 'InvalidName', start, ''], ['', 'NotAvailable', recalibrate, 'a.b'], isNamed(''),
    hasTemplate(templates[0]), hasSkin('Adult'), ['settings', {}, setTemplate, templates[1]],
    ['settings', {}, setSkin, 'Child'], ['settings start+', {}, setName, 'Zoë 木箱 🧰'], ...bad,
    ...refused('InvalidArgument', start, captures), ...says('', canStart), ...still('Zoë 木箱 🧰'),
    ['settings start- recalibrate+', {}, setName, 'Old'], ...bad, ['', 'AlreadyPresent', start, ''],
    ...refused('InvalidArgument', recalibrate, captures), ...still('Old'),
    // The name of what comes last beneath the subject is in use.
    ['settings start+', {}, setName, 'Zoe'], ['', {}, rename, 'Crate', family[2]], ['', 'AlreadyPresent', start, ''],
    ...says('', canStart), ...still('Zoe'), ['', {}, rename, family[2], 'Crate'], ...free(family[1]),
    [...begins(1, start, 'start- recalibrate').slice(0, -1), 'Zoë take 木箱']));
});

test('Who is named last is calibrated again, if that can be', () => onStage(connection => play(connection,
  ['settings start+', {}, setName, 'New'], ...unnamed, ['', 'NotAvailable', recalibrate, ''],
  ['settings start- recalibrate+', {}, setName, 'Old'], ...inUse('Old'), ...says('', canRecalibrate),
  ['settings recalibrate-', {}, setName, 'Crate'], isNamed('Crate'), ...unfit('Crate'),
  ...refused('NotAvailable', recalibrate, ['', 'a.b']), ['', 'AlreadyPresent', start, ''],
  ['settings start+', {}, 'BasicObjectServices.Remove', 'Crate'], ...says('', canStart),
  ...says('The subject to calibrate does not exist any more.', canRecalibrate), ['', 'NotAvailable', recalibrate, ''],
  ['settings start-', {}, 'SmartObjectServices.Add', 'Crate'], ...inUse('Crate'),
  // The name of one who is not there yet leaves the last one as it was.
  ['settings recalibrate+', {}, setName, 'Old'], ['settings start+', {}, setName, 'New'],
  begins(1, recalibrate, 'start- recalibrate'), ['settings 1:4 start+ recalibrate+ accept- cancel-', {}, cancel, 1],
  begins(2, start, 'start- recalibrate'), accepts(2), stops(2), startsAgain(3), accepts(3), stops(3))));

const time = scaled(400);
async function takesItsTime(connection, row) {
  const since = performance.now();
  await play(connection, row);
  assert.ok(performance.now() - since > time - 5);
}

test('A run that nobody accepts is over in time', () => onStage(async connection => {
  const over = ([told, ...call], id) => [`${told.replace(':1', `:1 ${id}:3`)} recalibrate+ accept- cancel-`, ...call];
  await play(connection, ['settings start+', {}, setName, 'Zoe']);
  await takesItsTime(connection, over(starts(1), 1));
  await play(connection, latest(1, 3), ...nothingRuns, startsAgain(2));
  await sleep(time / 2);
  await play(connection, cancels(2));
  await takesItsTime(connection, over(startsAgain(3), 3));
}, { pose: time }));

test('A run that nobody stops is over in time', () => onStage(async connection => {
  await play(connection, ['settings start+', {}, setName, 'Zoe'], starts(1));
  const told = 'settings 1:2 1:2 1:3 accept- stop+ end+ recalibrate+ stop- end- cancel-';
  await takesItsTime(connection, [told, {}, accept, 1]);
  await play(connection, latest(1, 3), ...nothingRuns, startsAgain(2));
}, { calibration: time }));

const file = (root, content) => `<${root} version="1"><Segments><Segment name="Hips"/></Segments>${content}</${root}>`;
const lbt = (child, kind = 'Props') => (
  file('LabellingTemplate', `<Children><Child kind="${kind}" name="${child}"/></Children>`));
const skin = (solving = true) => file('SubjectSkin', `<Roles><Solving>${solving}</Solving></Roles>`);
const robber = 'Räuber 🧰';

// A folder for the host's data in which a user has these files.
function dataWith(files) {
  const data = temporaryDirectory();
  for (const [name, content] of files) {
    mkdirSync(dirname(join(data, name)), { recursive: true });
    writeFileSync(join(data, name), content);
  }
  return data;
}

test('Files of the user are there, before those that come with the host', () => {
  const broken = ['', lbt('Hat').slice(0, -1), lbt(''), lbt('Hat', 'Actors'), skin()];
  const brokenSkins = ['', skin().slice(0, -1), skin('yes'), lbt('Hat')];
  const data = dataWith([
    ...['Performer', robber].map(name => [inTemplates(name), lbt('Hat')]), ['LabellingTemplates/Notes.txt', lbt('Hat')],
    ...['Child', 'Wolf'].map(name => [inSkins(name), skin()]), ['SubjectSkins/Notes.lbt', lbt('Hat')],
    ...broken.map((content, i) => [inTemplates(`X${i}`), content]),
    ...brokenSkins.map((content, i) => [inSkins(`X${i}`), content])]);
  const fails = (method, list) => list.flatMap((_, i) => [
    ['settings', {}, method, `X${i}`], ['', 'SerialisationFailure', start, ''], ...says('', canStart)]);
  return onStage(async connection => {
    await play(connection, ['', { Skins: ['Adult', 'Child', 'Wolf', 'X0', 'X1', 'X2', 'X3'] }, 'SubjectSkins'],
      ['', { LabellingTemplates: [...templates, robber, 'X0', 'X1', 'X2', 'X3', 'X4'] }, 'SubjectLabellingTemplates'],
      hasTemplate('Performer', data), hasSkin('Adult'), ['settings', {}, setSkin, 'Child'], hasSkin('Child', data),
      ['settings start+', {}, setName, 'Zoe'], ...fails(setTemplate, broken),
      ['settings', {}, setTemplate, 'Performer'], ...fails(setSkin, brokenSkins), ...free('Zoe Hat'),
      ['settings', {}, setSkin, 'Wolf'], starts(1), ...taken('Zoe', 'Zoe Hat'), cancels(1),
      ['settings start+', {}, setName, 'Max'], ['settings', {}, setTemplate, robber]);
    rmSync(join(data, inTemplates(robber)));
    await play(connection, ['', 'FileNotFound', start, ''], ...says('', canStart));
  }, { data });
});

for (const [how, end] of [['a clean end', host => host.stop()], ['a kill', host => host.kill()]])
  test(`Name, template and skin outlive ${how}, and a run does not`, async () => {
    const data = dataWith([[inTemplates(robber), lbt('Hat')], [inSkins('Wolf'), skin()]]);
    const after = [...nothingRuns, latest(0, 0), hasTemplate(robber, data), hasSkin('Wolf', data)];
    const afterRun = [...after, ...says('', canRecalibrate), ...inUse('Zoe'), isNamed('Zoe'), ...taken('Zoe', 'Zoe Hat')];
    const naming = ['settings start+', {}, setName];
    for (const rows of [
      [['settings', {}, setTemplate, robber], ['settings', {}, setSkin, 'Wolf'], [...naming, 'Zoe'], starts(1)],
      [...afterRun, startsAgain(1), accepts(1)], [...afterRun, [...naming, 'Max']],
      [...after, ...unnamed, isNamed('Max'), ...says('', canStart), begins(1, start, 'start')]])
      await onStage(async (connection, host) => {
        await play(connection, ...rows);
        await end(host);
      }, { data });
  });
