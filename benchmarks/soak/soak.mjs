// Puts the host under hundreds of clients that come and go, stop to read, send nonsense and vanish, and sees to it that the
// host keeps serving, keeps its memory, and says nothing but what is expected: node soak.mjs [SECONDS] [CONNECTIONS]
//
// Ends with status 1 when anything of that does not hold.

import assert from 'node:assert/strict';
import { readdirSync, readFileSync } from 'node:fs';
import http from 'node:http';
import net from 'node:net';
import { setTimeout as sleep } from 'node:timers/promises';
import { isMainThread, parentPort, Worker, workerData } from 'node:worker_threads';

import { inTime, scaled, startHost } from '../../tests/EndToEnd/host.mjs';
import { handshake, rawRequest, withConnection } from '../../tests/EndToEnd/wire.mjs';

const seconds = Number(process.argv[2] ?? 60);
const connections = Number(process.argv[3] ?? 500);
const stalledAtOnce = 4; // each may make the host keep eight megabytes for it
const growthBytes = scaled(48 << 20); // after the first third; queues of slow readers come and go within it
const answerMilliseconds = scaled(2000); // for the well-behaved client, at the 99th percentile
const expectedInLog = new RegExp('Refused.*(reads too slowly|broke the protocol or a limit|not a request that can be read|' +
                                 'handshake failed)|Loaded 200 subjects|^\\s*$');

const names = Array.from({ length: 200 }, (_, i) => `Subject ${i}`);
const kinds = [...Array(7).fill('BasicObjects'), 'SmartObjects', 'SmartObjects', 'CFCs'];
const subjects = names.map((name, i) => ({ name, kind: kinds[i % kinds.length] }));
const pick = list => list[Math.floor(Math.random() * list.length)];
const chance = share => Math.random() < share;
const counts = { connected: 0, raved: 0, calls: 0, answers: 0, notifications: 0, resets: 0, malformed: 0, stalled: 0,
                 refused: 0 };

let stalled = 0;

const groups = ['BasicObjectServices', 'SmartObjectServices', 'CharacterFromClustersServices', 'SubjectCalibrationServices',
                'ObjectEvaluationServices'];
function randomCall() {
  const name = pick(names);
  return pick([
    ['BasicObjectServices.BasicObjectList', []], ['BasicObjectServices.Color', [name]],
    ['BasicObjectServices.SetColor', [name, `#${Math.random().toString(16).slice(2, 8).padEnd(6, '0')}`]],
    ['BasicObjectServices.SetEnabled', [name, chance(0.5)]], ['BasicObjectServices.BasicObjectWarnings', { Name: name }],
    ['BasicObjectServices.Rename', [name, name]], ['SmartObjectServices.SmartObjectList', []],
    ['SmartObjectServices.SetEnabled', [name, chance(0.5)]], ['CharacterFromClustersServices.CharacterList', []],
    ['SubjectCalibrationServices.NewSubjectName', []], ['ObjectEvaluationServices.Progress', []],
    ['Server.Subscribe', [`${pick(groups)}.*`]], ['Server.Unsubscribe', [`${pick(groups)}.*`]], ['rpc.discover', []],
    ['Nobody.Knows', [1, { two: [3] }]], ['BasicObjectServices.Color', [7]],
  ]);
}

const message = () => {
  const [method, params] = randomCall();
  return JSON.stringify({ jsonrpc: '2.0', id: ++counts.calls, method, params });
};
const batch = () => `[${Array.from({ length: 1 + Math.floor(Math.random() * 20) }, message).join()}]`;
const nonsense = () =>
  pick(['{', 'null', '[[[[', '{"jsonrpc":"2.0"}', '\u0000', `{"a":"${'x'.repeat(5000)}`, '[]', '1e999']);

// A client's frame with a mask of zeros.
function frame(text, opcode = 0x81) {
  const payload = Buffer.from(text);
  const length = payload.length < 126 ? [0x80 | payload.length] : [0xfe, payload.length >> 8, payload.length & 255];
  return Buffer.concat([Buffer.from([opcode, ...length, 0, 0, 0, 0]), payload]);
}

const noise = length => Buffer.from(Array.from({ length }, () => Math.random() * 256));
const unfitFrames = [
  () => Buffer.from([0xf1, 0x80, 0, 0, 0, 0]), () => Buffer.from('\x81\x02{}', 'latin1'), () => frame('x', 0x82),
  () => Buffer.from([0x81, 0xff, 0, 0, 0, 0, 0x7f, 0, 0, 0, 0, 0, 0, 0]), () => frame(Buffer.from([3]), 0x88),
  () => noise(300),
];

// What never ends: framing around nothing, questions that need no token. Each is written over and over.
const at = host => `Host: 127.0.0.1:${host.port}\r\n`;
const endless = [
  host => [`POST /rpc HTTP/1.1\r\n${at(host)}Transfer-Encoding: chunked\r\n\r\n1;`, 'x'.repeat(16384)],
  host => [`POST /rpc HTTP/1.1\r\n${at(host)}Transfer-Encoding: chunked\r\n\r\n0\r\n`, 'a: b\r\n'.repeat(2000)],
  host => [`POST /rpc HTTP/1.1\r\n${at(host)}Transfer-Encoding: chunked\r\n\r\n`, '0'.repeat(16384)],
  host => ['', `OPTIONS * HTTP/1.1\r\n${at(host)}\r\n`],
  host => ['', `HEAD / HTTP/1.1\r\n${at(host)}\r\n`],
];

// Writes without end for a while, and does not care what is answered.
async function rave(host) {
  const socket = net.connect(host.port, '127.0.0.1').on('error', () => {});
  socket.resume();
  const [first, more] = pick(endless)(host);
  socket.write(first);
  for (let i = 0; i < 20 && !socket.destroyed; ++i) {
    socket.write(more);
    await sleep(10 + Math.random() * 50);
  }
  socket.destroy();
  ++counts.raved;
}

// One client's life: it sends for a while, and ends in one of several ways.
function live(host, running) {
  return new Promise(done => {
    const socket = net.connect(host.port, '127.0.0.1');
    const isWebSocket = chance(0.7);
    let timer;
    let stalls = false;
    socket.on('error', () => {}).on('close', () => {
      clearTimeout(timer);
      stalled -= stalls ? 1 : 0;
      done();
    });
    socket.on('data', data => {
      const text = data.toString('latin1');
      counts.answers += text.split('"id":').length - 1;
      counts.notifications += text.split('"sequence":').length - 1;
      counts.refused += text.startsWith('HTTP/1.1 503') ? 1 : 0;
    });
    socket.on('connect', () => {
      ++counts.connected;
      if (isWebSocket) {
        const headers = Object.entries(handshake).map(([name, value]) => `${name}: ${value}`);
        socket.write(rawRequest(host, '', { method: 'GET', headers }).replace('Content-Length: 0\r\n', ''));
      }
      step();
    });

    const end = () => {
      socket.resume();
      if (chance(0.4)) {
        ++counts.resets;
        socket.resetAndDestroy();
      } else if (isWebSocket && chance(0.5)) {
        socket.end(frame(Buffer.from([3, 0xe8]), 0x88));
      } else {
        socket.destroy();
      }
    };
    const write = text => socket.write(isWebSocket ? frame(text) : rawRequest(host, text));

    function step() {
      if (!running() || chance(0.03))
        return end();
      if (chance(0.01)) {
        ++counts.malformed;
        socket.write(isWebSocket ? pick(unfitFrames)() : noise(200));
      } else if (chance(0.05)) {
        write(nonsense());
      } else if (stalled < stalledAtOnce && chance(0.05)) {
        // Stops to read while much is asked for; the host has to give it up.
        stalls = true;
        ++stalled;
        ++counts.stalled;
        socket.pause();
        for (let i = 0; i < 10; ++i)
          write(`[${Array.from({ length: 200 }, () => '{"jsonrpc":"2.0","id":1,"method":"rpc.discover"}').join()}]`);
        for (let i = 0; i < 200; ++i)
          write(JSON.stringify({ jsonrpc: '2.0', id: ++counts.calls, method: 'rpc.discover' }));
        timer = setTimeout(end, 2000 + Math.random() * 4000);
        return;
      } else {
        write(chance(0.1) ? batch() : message());
      }
      timer = setTimeout(step, 20 + Math.random() * 250);
    }
  });
}

// Opens a client whenever one has ended, until it is over.
async function crowd(host, running) {
  await Promise.all(Array.from({ length: connections }, async () => {
    await sleep(Math.random() * 1000);
    while (running())
      await (chance(0.03) ? rave(host) : live(host, running));
  }));
}

// Asks one question at a time, over each transport in turn; how long each answer took, in ms. It has a thread of its own,
// so that it does not wait for the crowd.
async function wellBehaved(host, running) {
  const times = [];
  const agent = new http.Agent({ keepAlive: true });
  await withConnection(host, async connection => {
    while (running()) {
      const start = performance.now();
      const { result } = await connection.call('BasicObjectServices.BasicObjectList');
      assert.ok(result.outputs.Names.length > 100);
      times.push(performance.now() - start);
      const posted = performance.now();
      await new Promise((done, failed) => http.request(`${host.url}/rpc`, { method: 'POST', agent }, answer =>
        answer.on('end', done).resume()).on('error', failed).end(message()));
      times.push(performance.now() - posted);
      await sleep(5);
    }
  });
  agent.destroy();
  return times.sort((a, b) => a - b);
}

function processState(pid) {
  const kilobytes = Number(/^Rss:\s+(\d+)/m.exec(readFileSync(`/proc/${pid}/smaps_rollup`, 'utf8'))[1]);
  const spent = readdirSync(`/proc/${pid}/task`)
    .map(task => Number(readFileSync(`/proc/${pid}/task/${task}/schedstat`, 'utf8').split(' ')[0]));
  return { memory: kilobytes * 1024, processor: spent.reduce((sum, time) => sum + time) / 1e9 };
}

async function watch(host, running, start) {
  const samples = [];
  let before = processState(host.pid);
  for (let round = 0; running(); ++round) {
    await sleep(500);
    const now = processState(host.pid);
    const at = (performance.now() - start) / 1000;
    samples.push({ at, memory: now.memory });
    if (round % Math.max(1, Math.round(seconds / 10)) === 0)
      console.log(`${at.toFixed(0).padStart(5)} s  ${(now.memory / 1e6).toFixed(1)} MB  ` +
                  `${((now.processor - before.processor) * 200).toFixed(0)} % of a core  ${counts.calls} calls`);
    before = now;
  }
  return samples;
}

async function soak() {
  const host = await startHost({ subjects, options: ['--log', 'notice'] });
  const { url, ws, port } = host;
  const start = performance.now();
  const running = () => performance.now() - start < seconds * 1000;
  const worker = new Worker(new URL(import.meta.url), { argv: process.argv.slice(2), workerData: { url, ws, port } });
  const answered = new Promise((done, failed) => worker.on('message', done).on('error', failed));
  const everything = Promise.all([answered, watch(host, running, start), crowd(host, running)]);
  const [times, samples] = await inTime(everything, 'the end of all clients', (seconds + 60) * 1000, () => counts);
  await sleep(2500); // for those who were closed and did not read
  report(times, samples, processState(host.pid).memory);
  const unexpected = host.stderr.split('\n').filter(line => !expectedInLog.test(line));
  await host.assertEndsWell();
  assert.deepEqual(unexpected.slice(0, 10), [], 'unexpected lines in the log');
}

function report(times, samples, left) {
  const quantile = q => times[Math.floor(q * (times.length - 1))];
  const most = (from, to) =>
    Math.max(...samples.filter(({ at }) => at >= seconds * from && at <= seconds * to).map(({ memory }) => memory));
  const early = most(0, 1 / 3);
  const later = most(1 / 3, 2);
  const inMegabytes = bytes => (bytes / 1e6).toFixed(1);
  const inMilliseconds = q => quantile(q).toFixed(1);
  console.log(JSON.stringify(counts));
  console.log(`the well-behaved client: ${times.length} answers, p50 ${inMilliseconds(0.5)} ms, ` +
              `p99 ${inMilliseconds(0.99)} ms, longest ${inMilliseconds(1)} ms`);
  console.log(`memory: at most ${inMegabytes(early)} MB in the first third, ${inMegabytes(later)} MB later, ` +
              `${inMegabytes(left)} MB when all have gone`);
  assert.ok(counts.answers > counts.calls / 5, 'calls are answered');
  assert.equal(counts.refused, 0, 'no connection is refused');
  assert.ok(later - early < growthBytes, `the memory grew by ${later - early} bytes`);
  assert.ok(quantile(0.99) < answerMilliseconds, 'the well-behaved client is answered in time');
}

if (isMainThread) {
  await soak();
} else {
  const start = performance.now();
  parentPort.postMessage(await wellBehaved(workerData, () => performance.now() - start < seconds * 1000));
}
