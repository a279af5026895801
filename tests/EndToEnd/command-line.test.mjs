// The host's command line as a client: calls, subscriptions, descriptions, completion, and hosts that mean no good.

import assert from 'node:assert/strict';
import { readFileSync } from 'node:fs';
import http from 'node:http';
import net from 'node:net';
import { dirname, join } from 'node:path';
import { describe, test } from 'node:test';
import tls from 'node:tls';
import { WebSocketServer } from 'ws';

import { changed } from './api.mjs';
import { Child, leavingNothing, runSync } from './children.mjs';
import { binary, inTime, startHost, temporaryDirectory, temporaryFile, until, withHost } from './host.mjs';
import { post, request } from './wire.mjs';

const subjects = [{ name: 'Crate' }, { name: 'Lantern' }];

// Starts the program with these words against a host.
function start(host, words, { environment = {}, wordsFirst = false } = {}) {
  const server = host ? ['--server', host.url] : [];
  const [command, ...others] = words;
  return new Child(binary, wordsFirst ? [...words, ...server] : [command, ...server, ...others],
                   { env: { ...process.env, ...environment } });
}

function run(host, words, options) {
  return start(host, words, options).end(words.join(' '), 15000);
}

async function prints(host, words, stdout, options) {
  assert.deepEqual(await run(host, words, options), { status: 0, stdout, stderr: '' }, words.join(' '));
}

// Ends with the status and one line on standard error.
async function fails(host, words, status, says, options) {
  const ended = await run(host, words, options);
  const what = `${words.join(' ')}:\n${ended.stdout}${ended.stderr}`;
  assert.equal(ended.status, status, what);
  assert.match(ended.stderr, /^subject-store-host: [^\n]*\n$/, what);
  assert.match(ended.stderr, says, what);
}

async function json(host, words) {
  const { status, stdout, stderr } = await run(host, [...words, '--json']);
  assert.equal(stderr, '');
  assert.match(stdout, /^[^\n]*\n$/);
  return { status, value: JSON.parse(stdout) };
}

describe('call', () => {
  test('types its arguments, and shows answers to people and programs', () => withHost({ subjects }, async host => {
    const evaluation = 'ObjectEvaluationServices';
    const rows = [
      [['call', 'BasicObjectServices.SetColor', 'Crate', '#cc8844'], 'Ok\n'],
      [['call', 'basicobjectservices.color', 'Name=Crate'], '#ffcc8844\n'],
      [['call', 'BasicObjectServices.Rename', 'NewName=a=b', 'OldName=Lantern'], 'Ok\n'],
      [['call', 'BasicObjectList'], 'Crate\na=b\n'],
      [['call', `${evaluation}.SetMaximumEvaluationStepCount`, '18446744073709551615'], 'Ok\n'],
      [['call', 'MaximumEvaluationStepCount'], '18446744073709551615\n'],
      [['call', 'SetWarningThreshold', '0.30000000000000004'], 'Ok\n'],
      [['call', 'WarningThreshold'], '0.30000000000000004\n'],
      [['call', 'CanStartSubjectCalibration'], 'returned  false\nReason    No name is given.\n'],
      [['call', 'BasicObjectServices.Color', '--json', 'Crate'],
       '{"code":0,"name":"Ok","outputs":{"ColorHtml":"#ffcc8844"}}\n']];
    for (const [words, stdout] of rows)
      await prints(host, words, stdout);
    await fails(host, ['call', 'BasicObjectServices.Color', 'Nobody'], 1, /NotFound: If the basic object name/);
    await fails(host, ['call', 'SetWarningThreshold', '-5'], 1, /InvalidValue|InvalidArgument/);
    await fails(host, ['call', 'SetRadio', 'a', '1'], 1, /NotPermitted.*--level 1/);
    assert.deepEqual(await json(host, ['call', 'BasicObjectServices.Color', 'Nobody']),
                     { status: 1, value: (await post(host, 'BasicObjectServices.Color', ['Nobody'])).error });
  }));

  test('shows warnings with their names', () => {
    const stage = [{ name: 'Crate', parameters: { TemplateGroupName: 'Crates' } }];
    return withHost({ subjects: stage }, host => prints(host, ['call', 'BasicObjectWarnings', 'Crate'],
      "2  TemplateGroupNoProximityGroup  Object is in a template group, but isn't in a proximity group.\n"));
  });

  test('refuses a wrong command line', () => withHost({ subjects }, async host => {
    const rows = [
      [['call'], /which function/], [['call', 'BasicObjectServices.Colour', 'x'], /did you mean BasicObjectServices\.Color/],
      [['call', 'SetColor', 'Crate', '#fff'], /BasicObjectServices\.SetColor, SmartObjectServices\.SetColor/],
      [['call', 'BasicObjectServices.Color'], /"Name" is missing: call BasicObjectServices\.Color Name/],
      [['call', 'BasicObjectServices.SetEnabled', 'Crate', 'yes'], /"Enabled": expected true or false, got "yes"/],
      [['call', '--frobnicate'], /frobnicate/], [['call', 'x', '--wait-time', '5'], /--wait/],
      [['call', 'x', '--timeout', '0'], /--timeout/], [['call', 'x', '--token-file', '/nonexistent'], /\/nonexistent/],
      [['subscribe'], /which callbacks/], [['subscribe', 'Color'], /no callback "Color"/],
      [['subscribe', changed, '--count', '0'], /--count/], [['describe', 'a', 'b'], /one name/]];
    for (const [words, says] of rows)
      await fails(host, words, 2, says, { wordsFirst: true });
    await fails(undefined, ['frobnicate'], 2, /"frobnicate" is neither an option nor a command \(call, /);
    await fails(undefined, ['completion', 'csh'], 2, /bash, zsh or fish/);
    await fails(undefined, ['call', 'x', '--server', 'nowhere'], 2, /--server: expected/);
    await fails(undefined, ['call', 'x'], 3, /127\.0\.0\.1:1: /, { environment: { SUBJECT_STORE_SERVER: 'ws://127.0.0.1:1' } });
  }));

  test('presents its token', async () => {
    const token = temporaryFile('token', 'open sesame/42=\n');
    await withHost({ subjects, options: ['--token-file', token] }, async host => {
      await prints(host, ['call', 'BasicObjectList', '--token-file', token], 'Crate\nLantern\n');
      await prints(host, ['call', 'BasicObjectList'], 'Crate\nLantern\n', { environment: { SUBJECT_STORE_TOKEN_FILE: token } });
      await fails(host, ['call', 'BasicObjectList'], 3, /401.*--token-file/);
      await fails(host, ['call', 'BasicObjectList', '--token-file', temporaryFile('wrong', 'x\n')], 3, /401/);
      const spoilt = temporaryFile('spoilt', 'a\rX-Other: b\n');
      await fails(host, ['call', 'BasicObjectList', '--token-file', spoilt], 2, /printable ASCII/);
      const open = await run(undefined, ['call', 'x', '--token-file', token, '--server', 'http://[::ffff:127.0.0.1]:1']);
      assert.match(open.stderr, /can read the token/);
    });
  });
});

describe('call --wait', () => {
  const evaluate = ['call', 'ObjectEvaluationServices.SetEnabled', 'true'];
  const calibrate = ['call', 'CalibrateCharacter', 'Miner'];
  const stage = [{ name: 'Crate' }, { kind: 'CFCs', name: 'Miner', slots: ['Lamp'] }];

  test('follows object evaluation to its end', () => withHost({ subjects }, async host => {
    const hinted = await run(host, evaluate);
    assert.match(hinted.stderr, /^subject-store-host: .*--wait[^\n]*\n$/);
    const ended = await run(host, [...evaluate, '--wait']);
    assert.equal(ended.status, 0, ended.stderr);
    assert.match(ended.stderr, /100% {2}4 of 4 comparisons[^\n]*\n$/);
    const { outputs } = (await post(host, 'ObjectEvaluationServices.Progress', [])).result;
    assert.equal(outputs.Done, outputs.Required);
    assert.deepEqual(await json(host, evaluate), { status: 0, value: { code: 0, name: 'Ok', outputs: {} } });
  }));

  test('ends when there is nothing to compare', () => withHost({}, async host => {
    const ended = await run(host, [...evaluate, '--wait']);
    assert.equal(ended.status, 0);
    assert.match(ended.stderr, /no object to compare/);
  }));

  test('follows a character, whose calibration may come to nothing', () =>
    withHost({ subjects: stage, options: ['--character-calibration-time', '500'] }, async host => {
      const ended = await run(host, [...calibrate, '--wait']);
      assert.deepEqual([ended.status, ended.stdout], [0, 'Ok\n']);
      assert.equal(ended.stderr, '"Miner" is being calibrated\n"Miner" is calibrated\n');
    }));

  test('leaves the work when it is interrupted', () =>
    withHost({ subjects: stage, options: ['--character-calibration-time', '600000'] }, async host => {
      for (const [signal, status] of [['SIGINT', 130], ['SIGTERM', 143]]) {
        const waiting = start(host, [...calibrate, '--wait']);
        await waiting.written('stderr', /being calibrated/);
        waiting.signal(signal);
        assert.equal((await waiting.end('the waiting ends')).status, status);
        assert.match(waiting.stderr, /the work goes on\n$/);
      }
      await prints(host, ['call', 'CharacterCalibrationState', 'Miner'], 'Calibrating (1)\n');
      const late = await run(host, [...calibrate, '--wait', '--wait-time', '0.2']);
      assert.deepEqual([late.status, /--wait-time/.test(late.stderr)], [1, true]);

      const waiting = start(host, [...calibrate, '--wait']);
      await waiting.written('stderr', /being calibrated/);
      await prints(host, ['call', 'ClearCharacterCalibration', 'Miner'], 'Ok\n');
      assert.equal((await waiting.end('the calibration was cleared')).status, 1);
      assert.match(waiting.stderr, /was cleared/);
    }));

  // A host on which a new subject can be calibrated, whose T-pose is waited for so many milliseconds.
  const withPerformer = (pose, body) => {
    const options = ['--t-pose-time', String(pose), '--subject-calibration-time', '600000'];
    return withHost({ subjects, options }, async host => {
      for (const [name, value] of [['LabellingTemplate', 'Performer'], ['Skin', 'Adult']])
        await post(host, `SubjectCalibrationServices.SetSubject${name}`, [value]);
      await post(host, 'SubjectCalibrationServices.SetNewSubjectName', ['Zoe']);
      await body(host);
    });
  };

  test('tells when nobody accepts the T-pose of a subject', () => withPerformer(300, async host => {
    const ended = await run(host, ['call', 'StartSubjectCalibration', 'take', '--wait']);
    assert.deepEqual([ended.status, ended.stdout], [1, '1\n'], ended.stderr);
    assert.match(ended.stderr, /AcceptTPose 1 .*\n.*without a T-pose/);
  }));

  test('follows the calibration of a subject', () => withPerformer(600000, async host => {
    const runs = [['StartSubjectCalibration', 'StopSubjectCalibration', 0, /calibrates\n.* has ended\n$/],
                  ['StartSubjectRecalibration', 'CancelSubjectCalibration', 1, /was cancelled\n$/]];
    for (const [begin, end, status, says] of runs) {
      const waiting = start(host, ['call', begin, '', '--wait']);
      await waiting.written('stdout', /^\d+\n$/);
      const session = waiting.stdout.trim();
      await prints(host, ['call', 'AcceptTPose', session], 'Ok\n');
      await prints(host, ['call', end, session], 'Ok\n');
      assert.equal((await waiting.end(`${end} ends it`)).status, status, waiting.stderr);
      assert.match(waiting.stderr, says);
    }
  }));
});

describe('subscribe', () => {
  const recolour = host => post(host, 'BasicObjectServices.SetColor', ['Crate', `#${Date.now() % 900000 + 100000}`]);
  // Programs are not told from when on they are told of changes: there are changes until they are.
  const toldOf = (host, programs) => until('a change is printed', async () => {
    await recolour(host);
    return /sequence.*\n/.test(programs.stdout);
  }, { pause: 50, seen: () => programs.report });

  test('prints a line for each change', () => withHost({ subjects }, async host => {
    const people = start(host, ['subscribe', 'basicobjectchangedcallback', '--once']);
    const programs = start(host, ['subscribe', 'SubjectCalibrationServices.*', 'BasicObjectServices.*', '--json', '--count', '2']);
    await people.written('stderr', /listening/);
    await toldOf(host, programs);
    assert.equal((await people.end('one is enough')).status, 0);
    assert.match(people.stdout, new RegExp(`^\\d\\d:\\d\\d:\\d\\d\\.\\d\\d\\d  ${changed}\n$`));
    await post(host, 'SubjectCalibrationServices.SetNewSubjectName', ['Zoe']);
    assert.equal((await programs.end('two are enough')).status, 0);
    const lines = programs.stdout.trim().split('\n').map(line => JSON.parse(line));
    assert.deepEqual(Object.keys(lines[0]), ['time', 'epoch', 'name', 'params']);
    assert.equal(lines[0].name, changed);
    assert.ok(lines[1].params.sequence > lines[0].params.sequence);
    assert.equal(programs.stderr, '');
  }));

  test('ends quietly with a signal, or when nobody reads on', () => withHost({ subjects }, async host => {
    for (const end of [run => run.signal('SIGTERM'), run => run.signal('SIGINT'), run => run.hangUp()]) {
      const listening = start(host, ['subscribe', changed]);
      await listening.written('stderr', /listening/);
      end(listening);
      assert.deepEqual(await listening.end('it ends'),
                       { status: 0, stdout: '', stderr: 'subject-store-host: listening\n' });
    }
  }));

  test('connects again, and tells of a host that was started anew', () => leavingNothing(async () => {
    const first = await startHost({ subjects });
    const listening = start(first, ['subscribe', changed, '--json']);
    const epochs = () => new Set(listening.stdout.trim().split('\n').map(line => JSON.parse(line).epoch));
    await toldOf(first, listening);
    await first.assertEndsWell();
    await listening.written('stderr', /is lost: .*trying to connect again\n/);
    assert.equal(epochs().size, 1);
    await withHost({ subjects, listen: `127.0.0.1:${first.port}` }, async second => {
      await listening.written('stderr', /started anew/);
      const before = listening.stdout;
      await recolour(second);
      await until('another change is printed', () => listening.stdout !== before, { seen: () => listening.report });
      assert.equal(epochs().size, 2);
      listening.signal('SIGTERM');
      assert.equal((await listening.end('it ends')).status, 0);
    });
  }));
});

describe('describe and completion', () => {
  test('describe shows all that the host says', () => withHost({ subjects }, async host => {
    const document = JSON.parse((await request(host, { method: 'GET', path: '/openrpc.json' })).body);
    assert.deepEqual((await json(host, ['describe'])).value, document);
    const { stdout } = await run(host, ['describe']);
    const entries = [...document.methods, ...document['x-callbacks']];
    for (const { name, 'x-level': level } of entries)
      assert.match(stdout, new RegExp(`^    ${name.replace(/^\w+\./, '')} *${level === 1 ? '\\[preview\\]' : '[^[]?'}`, 'm'));
    for (const entry of entries.filter((_, i) => i % 16 === 0)) {
      assert.deepEqual((await json(host, ['describe', entry.name])).value, entry);
      const { stdout: text } = await run(host, ['describe', entry.name]);
      for (const { name, description } of entry.params)
        assert.ok(text.includes(name) && text.includes(description), `${name} of ${entry.name}:\n${text}`);
    }
    const [group] = (await json(host, ['describe', 'BasicObjectServices'])).value.methods;
    assert.equal(group.name, document.methods[0].name);
    assert.match((await run(host, ['describe', 'ESubjectCalibrationState'])).stdout, /^ {2}3 {2}Completed +Subject cal/m);
  }));

  test('bash completes commands, options, names and values', () => withHost({ subjects }, async host => {
    const complete = (line, environment = { SUBJECT_STORE_SERVER: host.url }) => {
      const script = `source <(subject-store-host completion bash)
        complete -p subject-store-host >/dev/null || exit 1
        COMP_LINE=$1 COMP_POINT=\${#1}; COMP_WORDS=($1); [[ $1 == *' ' ]] && COMP_WORDS+=("")
        COMP_CWORD=$((\${#COMP_WORDS[@]} - 1)); _subject_store_host; printf '%s\\n' "\${COMPREPLY[@]}"`;
      const env = { ...process.env, PATH: `${dirname(binary)}:${process.env.PATH}`, ...environment };
      return runSync('bash', ['-c', script, 'bash', line], { env }).trim().split('\n');
    };
    const rows = [
      ['', ['call', 'completion', 'describe', 'subscribe']], ['call --wa', ['--wait', '--wait-time']],
      ['call BasicObjectServices.BasicObjectL', ['BasicObjectServices.BasicObjectList']], ['call SmartClusterC', ['SmartClusterCount']],
      ['call BasicObjectServices.SetEnabled "Red shield" ', ['false', 'true']],
      [`call --server ${host.url} --json WarningThr`, ['WarningThreshold']],
      ['subscribe ObjectEv', ['ObjectEvaluationServices.*', 'ObjectEvaluationServices.EvaluationChangedCallback']],
      ['describe SubjectCalibrationServices.E', ['SubjectCalibrationServices.ESubjectCalibrationState']],
      ['completion ', ['bash', 'fish', 'zsh']], ['call --server ', ['']], ['frobnicate ', ['']]];
    for (const [words, candidates] of rows)
      assert.deepEqual(complete(`subject-store-host ${words}`), candidates, words);
    const gone = complete('subject-store-host call Basic', { SUBJECT_STORE_SERVER: 'http://127.0.0.1:1' });
    assert.deepEqual(gone, ['']);
  }));
});

// Serves what a host of that kind would, and takes the server down afterwards.
async function withServer(server, body) {
  const sockets = new Set();
  server.on('connection', socket => {
    sockets.add(socket.on('error', () => {}));
    socket.on('close', () => sockets.delete(socket));
  });
  await new Promise(done => server.listen(0, '127.0.0.1', done));
  try {
    await inTime(body({ url: `http://127.0.0.1:${server.address().port}` }), 'the end of a test with a server', 60000);
  } finally {
    for (const socket of sockets)
      socket.destroy();
    server.close();
  }
}

const answering = (status, headers = {}, text = '') =>
  http.createServer().on('upgrade', (_, socket) => socket.end(
    [`HTTP/1.1 ${status} X`, ...Object.entries({ 'Content-Length': text.length, ...headers }).map(pair => pair.join(': ')),
     '', text].join('\r\n')));

const hello = '{"jsonrpc":"2.0","method":"Server.Hello","params":{"epoch":"e"}}';
const discovered = (methods, id = 1) => JSON.stringify({ jsonrpc: '2.0', id, result: { methods } });
const method = { name: 'G.Names', params: [], result: { schema: { properties: { outputs: { properties: { Names: {} } } } } } };

// Greets, and then answers each message with the next of these texts; a function gets the socket instead.
function speaking(greeting, ...answers) {
  const server = http.createServer();
  new WebSocketServer({ server }).on('connection', socket => {
    const left = [...answers];
    const say = answer => typeof answer === 'function' ? answer(socket) : answer !== undefined && socket.send(answer);
    socket.on('message', () => say(left.shift())).on('error', () => {});
    say(greeting);
  });
  return server;
}

const raw = text => net.createServer(socket => socket.once('data', () => socket.end(text)));

describe('A host that means no good ends a command with one line', () => {
  const names = outputs => JSON.stringify({ jsonrpc: '2.0', id: 2, result: { code: 0, name: 'Ok', outputs } });
  const kinds = {
    'that is forbidden': [() => answering(403, {}, 'Not by that name.\n'), /403: "Not by that name\."/],
    'that is full': [() => answering(503), /503.*later/],
    'that redirects': [() => answering(302, { Location: 'http://elsewhere.example/' }), /redirects to "http:\/\/elsewhere/],
    'that is another server': [() => answering(404), /404.*is it a subject store host/],
    'that does not speak HTTP': [() => raw('SSH-2.0-x\r\n'), /does not answer like/],
    'that hangs up': [() => raw(''), /does not answer like/],
    'that says nothing': [() => net.createServer(), /does not answer in time/],
    'that does not greet': [() => speaking(undefined), /does not answer in time/],
    'that greets otherwise': [() => speaking('{"method":"Hi"}'), /does not greet/],
    'that does not speak JSON': [() => speaking('\x1b[2J'), /not JSON/],
    'that breaks off': [() => speaking(hello, socket => socket._socket.destroy()), /is lost/],
    'that closes with a reason': [() => speaking(hello, socket => socket.close(1013, 'too\x1bslow')), /is lost: too\\x1bslow/],
    'that sends half an answer': [() => speaking(hello, '{"jsonrpc":"2.0","id":1,"resu'), /not JSON/],
    'that answers something else': [() => speaking(hello, '{"jsonrpc":"2.0","id":9,"result":{}}'), /not an answer/],
    'that answers nothing': [() => speaking(hello, '{"jsonrpc":"2.0","id":1}'), /not an answer/],
    'that announces too much': [() => speaking(hello, socket => socket._socket.write(Buffer.from('817f0000ffffffffffff', 'hex'))), /longer than/],
    'that nests too deeply': [() => speaking(hello, '['.repeat(100000)), /not JSON/],
    'that describes nothing': [() => speaking(hello, '{"jsonrpc":"2.0","id":1,"result":[]}'), /no methods/],
    'that describes no names': [() => speaking(hello, discovered([{}])), /has no name/],
    'that answers no outputs': [() => speaking(hello, discovered([method]), '{"id":2,"result":7}'), /not as expected/],
  };
  for (const [what, [make, says]] of Object.entries(kinds))
    test(what, () => withServer(make(), host =>
      fails(host, ['call', 'G.Names', '--timeout', /time/.test(says.source) ? '0.5' : '5'], 3, says)));

  test('and never speaks to the terminal', () =>
    withServer(speaking(hello, discovered([method]), names({ Names: ['a\x1b[2Jb', 'c\u202ed', 1] })), host =>
      prints(host, ['call', 'Names'], 'a\\x1b[2Jb\nc\\u{202e}d\n1\n')));
});

test('TLS is spoken with hosts whose certificate is trusted and for them', () => withHost({ subjects }, async host => {
  const directory = temporaryDirectory();
  const certificate = (name, subject) => {
    const [key, cert] = [join(directory, `${name}.key`), join(directory, `${name}.pem`)];
    runSync('openssl', ['req', '-x509', '-newkey', 'ec', '-pkeyopt', 'ec_paramgen_curve:prime256v1', '-nodes', '-days', '2',
                        '-subj', '/CN=stage', '-addext', `subjectAltName=${subject}`, '-addext', 'basicConstraints=CA:FALSE',
                        '-keyout', key, '-out', cert]);
    return { file: cert, options: { key: readFileSync(key), cert: readFileSync(cert) } };
  };
  const own = certificate('own', 'IP:127.0.0.1,DNS:localhost');
  const other = certificate('other', 'DNS:stage.example');
  const serving = ({ options }, body) => withServer(tls.createServer(options, socket => {
    const inner = net.connect(host.port, '127.0.0.1');
    socket.on('error', () => {}).on('close', () => inner.destroy()).pipe(inner).on('error', () => {}).pipe(socket);
  }), ({ url }) => body({ url: url.replace('http', 'https') }));
  const list = (authority, ...others) => ['call', 'BasicObjectList', ...(authority ? ['--tls-ca', authority.file] : []), ...others];

  await serving(own, async secure => {
    await prints(secure, list(own), 'Crate\nLantern\n');
    await prints({ url: secure.url.replace('127.0.0.1', 'localhost').replace('https', 'wss') }, list(own), 'Crate\nLantern\n');
    const listening = start(secure, ['subscribe', changed, '--once', '--tls-ca', own.file]);
    await listening.written('stderr', /listening/);
    await post(host, 'BasicObjectServices.SetColor', ['Crate', '#123456']);
    assert.equal((await listening.end('a change comes over TLS')).status, 0);
    await fails(secure, list(), 3, /not trusted.*--tls-ca/);
    await fails(secure, list(other), 3, /not trusted/);
    await fails(secure, list({ file: '/nonexistent' }), 2, /--tls-ca: .*\/nonexistent/);
    await fails({ url: secure.url.replace('https', 'http') }, list(), 3, /https:\/\/ perhaps/);
  });
  await serving(other, secure => fails(secure, list(other), 3, /for another host/));
  await fails({ url: host.url.replace('http', 'https') }, list(own), 3, /http:\/\/ perhaps/);
}));
