// The client against the real host, and against one that misbehaves.

import assert from 'node:assert/strict';
import { readFileSync } from 'node:fs';
import { describe, test } from 'node:test';
import { fileURLToPath } from 'node:url';

import * as client from 'subject-store-client';

import { codes } from '../../../tests/EndToEnd/api.mjs';
import { outputOf } from '../../../tests/EndToEnd/children.mjs';
import { inTime, startHost, temporaryDirectory, withHost } from '../../../tests/EndToEnd/host.mjs';
import { apiFiles } from '../../../scripts/api/files.mjs';
import { hello, withFakeHost } from './fake-host.mjs';

const { ConnectionError, ProtocolError, ResultCode, SubjectStoreClient, SubjectStoreError, TimeoutError } = client;
const file = path => readFileSync(new URL(path, import.meta.url), 'utf8');
const subjects = [{ name: 'Crate', parameters: { ColourRGBA: '#ff3366cc' } }, { kind: 'SmartObjects', name: 'Handset' }];
const changed = 'BasicObjectServices.BasicObjectChangedCallback';
const quick = { first: 20, longest: 100 };

// Runs `body` with a client; a warning is a failure unless there is `onWarning`.
async function withClient(url, body, options = {}) {
  const warnings = [];
  const one = await SubjectStoreClient.connect(url, { reconnectDelay: quick, onWarning: warning => warnings.push(warning),
                                                      ...options });
  try {
    await inTime(body(one, warnings), 'the end of a test with a client', 60000, () => warnings);
  } finally {
    await inTime(one.close(), 'the client closes');
  }
  assert.deepEqual(warnings, []);
}

function withStage(body, options = {}) {
  return withHost({ subjects, ...options }, host => withClient(host.ws, one => body(one, host)));
}

// The next event, or an error that says which did not come.
function next(one, name, milliseconds) {
  return inTime(new Promise(done => {
    const end = one.on(name, event => {
      end();
      done(event);
    });
  }), name, milliseconds);
}

test('what is generated is of the API that is documented', () => {
  const document = name => file(`../../../docs/api/${name}.json`);
  const path = 'clients/typescript/source/generated.ts';
  assert.ok(apiFiles(document('openrpc'), document('asyncapi'))[path] === file('../source/generated.ts'),
            'run scripts/describe-api');
});

test('every function is that of its name', async () => {
  const { methods } = JSON.parse(file('../../../docs/api/openrpc.json'));
  const lowerFirst = name => name[0].toLowerCase() + name.slice(1);
  for (const { name, params, result: { schema: { properties } } } of methods) {
    const [group, method] = name.split('.');
    if (group === 'Server' || group === 'rpc')
      continue;
    const outputs = { out: name };
    const calls = [];
    const caller = { call: async (...call) => {
      calls.push(call);
      return { outputs, returned: true };
    } };
    const inputs = { in: name };
    const options = { timeout: 1 };
    const made = params.length > 0 ? [inputs, options] : [options];
    const answer = await new client[group](caller)[lowerFirst(method)](...made);
    assert.deepEqual(calls, [[name, params.length > 0 ? inputs : {}, options]]);
    const isVoid = !properties.returned && properties.outputs.required.length === 0;
    assert.deepEqual(answer, properties.returned ? { ...outputs, returned: true } : isVoid ? undefined : outputs);
  }
});

describe('against the host, the client', () => {
  test('calls functions of every group', () => withStage(async one => {
    assert.equal(one.hello.levels.granted, 1);
    await one.basicObjectServices.rename({ OldName: 'Crate', NewName: 'Kiste ½' });
    assert.deepEqual(await one.basicObjectServices.color({ Name: 'Kiste ½' }), { ColorHtml: '#ff3366cc' });
    assert.deepEqual(await one.smartObjectServices.smartClusterCount({ Name: 'Handset' }), { Count: 0 });
    const template = { TemplateGroupName: 'Shields', Name: 'Kiste ½' };
    assert.equal(await one.basicObjectServices.setTemplateGroupName(template), undefined);
    const { TemplateGroupNoProximityGroup } = client.EBasicObjectWarning;
    const { Warnings } = await one.basicObjectServices.basicObjectWarnings({ Name: 'Kiste ½' });
    assert.deepEqual(Warnings.map(([warning, text]) => [warning, typeof text]), [[TemplateGroupNoProximityGroup, 'string']]);
    await one.objectEvaluationServices.setWarningThreshold({ Threshold: 0.25 });
    assert.deepEqual(await one.objectEvaluationServices.warningThreshold(), { Threshold: 0.25 });
    assert.deepEqual(await one.characterFromClustersServices.characterList(), { Names: [] });
    const able = await one.subjectCalibrationServices.canAcceptTPose();
    assert.deepEqual(able, { returned: false, Reason: able.Reason });
    await one.hostSimulation.addDevice({ Urn: 'corvex1-7', Type: 'Corvex1' });
    assert.equal((await one.hostSimulation.deviceState({ Urn: 'corvex1-7' })).Battery, 100);
    assert.deepEqual(await one.call('BasicObjectServices.RemoveAll', {}),
                     { code: ResultCode.Ok, name: 'Ok', outputs: {} });
  }, { options: ['--level', '1'] }));

  test('keeps all digits of whole numbers', () => withStage(async ({ objectEvaluationServices: evaluation }) => {
    for (const MaximumStepCount of [1n, 2n ** 53n + 1n, 2n ** 64n - 1n]) {
      await evaluation.setMaximumEvaluationStepCount({ MaximumStepCount });
      assert.deepEqual(await evaluation.maximumEvaluationStepCount(), { MaximumStepCount });
    }
    for (const Threshold of [0.1, 123456789012345680, 2.5e300]) {
      await evaluation.setWarningThreshold({ Threshold });
      assert.deepEqual(await evaluation.warningThreshold(), { Threshold });
    }
  }));

  test('fails as the host says', () => withStage(async one => {
    await assert.rejects(one.basicObjectServices.color({ Name: 'Nobody' }), failure => {
      assert.ok(failure instanceof SubjectStoreError);
      const { method, code, name, text, detail } = failure;
      assert.deepEqual({ method, code, name, text, detail }, {
        method: 'BasicObjectServices.Color', code: codes.NotFound, name: 'NotFound',
        text: 'If the basic object name supplied is invalid.', detail: undefined });
      assert.equal(failure.message, `${method}: NotFound: ${text}`);
      return true;
    });
    await assert.rejects(one.basicObjectServices.setEnabled({ Name: 'Crate', Enabled: 'no' }),
                         { name: 'InvalidFormat', code: ResultCode.InvalidFormat, detail: /argument 2 "Enabled"/ });
    await assert.rejects(one.hostSimulation.devices(), { name: 'NotPermitted', detail: /--level 1/ });
    const misunderstood = failure => failure instanceof ProtocolError;
    await assert.rejects(one.call('Nobody.Knows', {}), misunderstood);
    await assert.rejects(one.basicObjectServices.color({ Title: 'Crate' }), misunderstood);
  }));

  test('is told of what it listens to, and of nothing else', () => withStage(async one => {
    const heard = [];
    const all = one.on(changed, ({ sequence }) => heard.push(['all', typeof sequence]));
    const first = one.on(changed, () => { heard.push(['first']); first(); });
    await Promise.all([all.ready, first.ready]);
    const edit = async Enabled => {
      await one.basicObjectServices.setAllEnabled({ Enabled });
      await one.basicObjectServices.basicObjectList(); // what there was to tell comes before this answer
    };
    await edit(false);
    await edit(true);
    all();
    await edit(false);
    assert.deepEqual(heard, [['all', 'bigint'], ['first'], ['all', 'bigint']]);

    const able = next(one, 'SubjectCalibrationServices.CanStartSubjectCalibrationChangedCallback');
    const { LabellingTemplates: [template] } = await one.subjectCalibrationServices.subjectLabellingTemplates();
    const { Skins: [skin] } = await one.subjectCalibrationServices.subjectSkins();
    await one.subjectCalibrationServices.setSubjectLabellingTemplate({ LabellingTemplate: template });
    await one.subjectCalibrationServices.setSubjectSkin({ Skin: skin });
    await one.subjectCalibrationServices.setNewSubjectName({ SubjectName: 'Somebody' });
    assert.equal((await able).Able, true);
  }));

  test('comes back with its subscriptions when the host does', async () => {
    const data = temporaryDirectory();
    let host = await startHost({ subjects, data });
    const listen = `127.0.0.1:${host.port}`;
    try {
      await withClient(host.ws, async one => {
        let told = 0;
        await one.on(changed, () => { ++told; }).ready;
        const [disconnected, reconnected, restarted] =
          ['disconnected', 'reconnected', 'epoch'].map(name => next(one, name, 20000));
        const { epoch } = one.hello;
        await host.kill();
        assert.ok((await disconnected).reason instanceof ConnectionError);
        assert.equal(one.connected, false);
        const waiting = one.basicObjectServices.color({ Name: 'Crate' });
        host = await startHost({ data, listen });
        assert.deepEqual(await waiting, { ColorHtml: '#ff3366cc' });
        assert.equal((await reconnected).hello, one.hello);
        const { previous, current } = await restarted;
        assert.deepEqual([previous, current], [epoch, one.hello.epoch]);
        assert.notEqual(previous, current);
        await one.basicObjectServices.setAllEnabled({ Enabled: false });
        await one.basicObjectServices.basicObjectList();
        assert.equal(told, 1);
      });
    } finally {
      await host.assertEndsWell();
    }
  });

  test('runs the example of the README', () => withStage(async (_, host) => {
    const example = fileURLToPath(new URL('../example.mjs', import.meta.url));
    assert.ok(file('../README.md').includes(file('../example.mjs').trim()));
    assert.match(await outputOf(process.execPath, [example, host.ws]), /^Crate #ff3366cc *\nBasicObjectServices\.Rename: NotFound: .*\n$/);
  }));
});

describe('against a host that misbehaves, the client', () => {
  test('gives up what is not answered in time, or is not wanted any more', () => withFakeHost({}, url =>
    withClient(url, async (one, warnings) => {
      assert.match(warnings.pop().message, /of another/); // the API
      await assert.rejects(one.basicObjectServices.removeAll({ timeout: 20 }), failure => failure instanceof TimeoutError);
      const abort = new AbortController();
      const call = one.basicObjectServices.removeAll({ signal: abort.signal });
      abort.abort(new Error('enough'));
      await assert.rejects(call, /enough/);
      await assert.rejects(one.basicObjectServices.removeAll({ signal: abort.signal }), /enough/);
    })));

  test('does not wait for answers that cannot come', () => {
    const cut = ({ method }, socket) => method.endsWith('RemoveAll') && socket.terminate();
    return withFakeHost({ answer: cut }, url => withClient(url, async (one, warnings) => {
      warnings.length = 0;
      const lost = failure => failure instanceof ConnectionError;
      const back = next(one, 'reconnected');
      await assert.rejects(one.basicObjectServices.removeAll(), lost);
      await back; // to a host of the same epoch and the same other API: neither is told of again
      const open = one.basicObjectServices.basicObjectList();
      const watch = one.on(changed, () => {});
      await Promise.all([assert.rejects(open, lost), assert.rejects(watch.ready, lost), one.close()]);
      await assert.rejects(one.basicObjectServices.basicObjectList(), lost);
      await assert.rejects(one.on(changed, () => {}).ready, lost);
    }));
  });

  test('goes on after what it cannot read, and after handlers that throw', () => {
    const notification = { jsonrpc: '2.0', method: changed, params: { sequence: 7 } };
    const answer = ({ id, method }, socket) => {
      for (const text of ['{', '[]', '1', '{"id": 99}', JSON.stringify(notification)])
        socket.send(text);
      const ok = { code: 0, name: 'Ok', outputs: method.endsWith('Color') ? { ColorHtml: '#12345678' } : {} };
      socket.send(JSON.stringify({ jsonrpc: '2.0', id, result: ok }));
    };
    return withFakeHost({ answer }, url => withClient(url, async (one, warnings) => {
      const heard = [];
      one.on(changed, () => { throw new Error('spilt'); });
      await one.on(changed, ({ sequence }) => heard.push(sequence)).ready;
      assert.deepEqual(await one.basicObjectServices.color({ Name: 'Crate' }), { ColorHtml: '#12345678' });
      assert.deepEqual(heard, [7n, 7n]);
      assert.equal(warnings.splice(0).length, 1 + 2 * 5);
    }));
  });

  test('says why there is no connection', async () => {
    const refused = async (url, expected, options) =>
      assert.rejects(SubjectStoreClient.connect(url, options), expected);
    let free;
    await withFakeHost({ greeting: null }, async url => {
      free = url;
      await refused(url, { name: 'ConnectionError', message: /no greeting within 50 ms/ }, { connectTimeout: 50 });
    });
    await refused(free, { name: 'ConnectionError', message: /ECONNREFUSED|network error|failed/ });
    await refused('nowhere', { name: 'SyntaxError' });
  });

  test('presents its token', () => withFakeHost({}, async (url, offered) => {
    for (const token of ['secret', '???>>>~~~', 'späte Grüße'])
      await withClient(url, (_, warnings) => {
        warnings.length = 0;
        assert.equal(offered.pop().replace(' ', ''), `subject-store,bearer.${Buffer.from(token).toString('base64url')}`);
      }, { token });
    await withClient(url, (_, warnings) => { warnings.length = 0; });
    assert.equal(offered.pop(), undefined);
  }));
});
