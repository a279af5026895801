// A share that does not answer: those who name files on it wait for them, and nobody else does.

import assert from 'node:assert/strict';
import { copyFileSync, mkdirSync, rmSync, writeFileSync } from 'node:fs';
import { join } from 'node:path';
import { test } from 'node:test';
import { setTimeout as sleep } from 'node:timers/promises';

import { assertFails, assertSucceeds, codes, eventually } from './api.mjs';
import { binary, inTime, scaled, sharedFolder, temporaryDirectory, withHost } from './host.mjs';
import { Connection } from './wire.mjs';

const preloaded = process.env.SUBJECT_STORE_DEAD_SHARE_LIBRARY ?? join(binary, '../../lib/libDeadShare.so');
const patience = 5000;

const basic = 'BasicObjectServices';
const characters = 'CharacterFromClustersServices';
const smart = 'SmartObjectServices';
const calibration = 'SubjectCalibrationServices';

// Runs `body` with a host whose folder of the user's labelling templates lies on a share that can be dead.
function withShare(body) {
  const data = temporaryDirectory();
  const share = join(data, 'LabellingTemplates');
  mkdirSync(share);
  copyFileSync(join(sharedFolder(), 'LabellingTemplates/Performer.lbt'), join(share, 'Far.lbt'));
  copyFileSync(join(sharedFolder(), 'SmartObjectTemplates/Corvex.sot'), join(share, 'Far.sot'));
  copyFileSync(join(sharedFolder(), 'CharacterTemplates/Biped.cct'), join(share, 'Far.cct'));
  const sanitizer = `${process.env.ASAN_OPTIONS ?? ''}:verify_asan_link_order=0`;
  const launcher = ['env', `LD_PRELOAD=${preloaded}`, `SUBJECT_STORE_DEAD_SHARE=${share}`, `ASAN_OPTIONS=${sanitizer}`];
  const subjects = [{ name: 'Crate' }, { kind: 'CFCs', name: 'Ada' }];
  return withHost({ data, subjects, launcher }, host => body({
    host, share, die: () => writeFileSync(`${share}.dead`, ''), revive: () => rmSync(`${share}.dead`),
  }));
}

// The four kinds of calls that look at a file: [method, parameters, what comes of a file that does not answer].
const looks = share => [
  [`${smart}.AddFromTemplate`, ['Far object', join(share, 'Far.sot')], 'Failed'],
  [`${characters}.CreateCharacter`, ['Far character', join(share, 'Far.cct')], 'FileIOFailure'],
  [`${characters}.SetCharacterRetargetPath`, ['Ada', join(share, 'Far.cct')], 'FileNotFound'],
  [`${calibration}.StartSubjectCalibration`, [''], 'FileIOFailure'],
];

async function chooseFarTemplate(connection) {
  assertSucceeds(await connection.call(`${calibration}.SetNewSubjectName`, ['Zoe']));
  assertSucceeds(await connection.call(`${calibration}.SetSubjectLabellingTemplate`, ['Far']));
}

// Calls in all groups, reading and editing, until it is stopped; the longest time that a call took.
async function callAround(connection, still) {
  const calls = [[`${basic}.SetEnabled`, ['Crate', true]], [`${characters}.SetCharacterEnabled`, ['Ada', false]],
                 [`${smart}.SmartObjectList`, []], [`${calibration}.SetNewSubjectName`, ['Zoe']]];
  let longest = 0;
  for (let number = 0; still(); ++number) {
    const begun = performance.now();
    assert.equal((await connection.call(...calls[number % calls.length])).result?.code, codes.Ok);
    longest = Math.max(longest, performance.now() - begun);
    await sleep(2);
  }
  return longest;
}

test('A dead share keeps waiting those who ask for its files, for 5 s, and nobody else', () =>
  withShare(async ({ host, share, die, revive }) => {
    const [other, ...clients] = await Promise.all(Array.from({ length: 5 }, () => Connection.open(host)));
    await chooseFarTemplate(other);
    die();
    const begun = performance.now();
    const inOrder = clients.map(() => []);
    const waiting = looks(share).map(async ([method, params, code], i) => {
      const group = method.split('.')[0];
      const following = { [smart]: 'SmartObjectList', [characters]: 'CharacterList', [calibration]: 'NewSubjectName' };
      const note = name => answer => {
        inOrder[i].push(name);
        return answer;
      };
      const asked = clients[i].call(method, params, 2 * patience).then(note('look'));
      const behind = clients[i].call(`${group}.${following[group]}`, [], 2 * patience).then(note('behind'));
      const elsewhere = await clients[i].call(`${basic}.BasicObjectList`).then(note('elsewhere'));
      assert.equal(elsewhere.result.code, codes.Ok);
      assertFails(await asked, method, code);
      const time = performance.now() - begun;
      assert.ok(time > patience - 100 && time < patience + scaled(2000), `${method} was answered after ${time} ms`);
      assert.equal((await behind).result.code, codes.Ok);
      assert.deepEqual(inOrder[i], ['elsewhere', 'look', 'behind']);
    });
    let done = false;
    const longest = callAround(other, () => !done);
    await inTime(Promise.all(waiting), 'every call is answered', patience + 5000);
    done = true;
    assert.ok(await longest < scaled(1000), `a call of another client took ${await longest} ms`);
    for (const [method] of looks(share))
      assert.match(host.stderr, new RegExp(`${method}: "${share}/Far\\.[a-z]+" did not answer within 5 s`));

    // Each of the four threads hangs: for the fifth there is none, and it is told at once.
    const asked = performance.now();
    const [[fifth, itsParams]] = looks(share);
    assertFails(await other.call(fifth, itsParams), fifth, 'Failed');
    assert.ok(performance.now() - asked < scaled(1000));
    assert.match(host.stderr, /AddFromTemplate: ".*Far\.sot" is not looked at, as too many files do not answer/);
    assert.deepEqual((await other.call(`${smart}.SmartObjectList`)).result.outputs, { Names: [] });

    revive();
    await eventually(async () => (await other.call(fifth, itsParams)).result?.code, codes.Ok);
    for (const [method, params] of looks(share).slice(1))
      assert.equal((await other.call(method, params)).result?.code, codes.Ok, method);
  }));

test('The host ends in its usual time while files do not answer, and every call is answered', () =>
  withShare(async ({ host, share, die }) => {
    const clients = await Promise.all(looks(share).map(() => Connection.open(host)));
    await chooseFarTemplate(clients[0]);
    die();
    const answers = looks(share).map(([method, params], i) => clients[i].call(method, params));
    const behind = clients[0].call(`${smart}.SmartObjectList`);
    assert.equal((await clients[0].call(`${basic}.BasicObjectList`)).result.code, codes.Ok);
    await sleep(scaled(300));
    const begun = performance.now();
    assert.equal(await host.stop('SIGTERM', 4000), 0);
    assert.ok(performance.now() - begun < scaled(3000));
    for (const answer of await Promise.all([...answers, behind]))
      assert.equal(answer.error?.message, 'ShuttingDown', JSON.stringify(answer));
  }));
