// Starts the standalone host for a test, and sees to it that the host ends as it should.

import assert from 'node:assert/strict';
import { spawn } from 'node:child_process';
import { existsSync, mkdtempSync, readFileSync, realpathSync, rmSync, writeFileSync } from 'node:fs';
import { tmpdir } from 'node:os';
import { join, resolve } from 'node:path';
import { setTimeout as sleep } from 'node:timers/promises';
import { fileURLToPath } from 'node:url';

export const binary = resolve(process.env.SUBJECT_STORE_HOST ??
                              fileURLToPath(new URL('../../build/dev/bin/subject-store-host', import.meta.url)));

// The folder with the files that come with the host.
export function sharedFolder() {
  return join(realpathSync(binary), '../../share/subject-store');
}

const slowness = Number(process.env.SUBJECT_STORE_TEST_SLOWNESS ?? 1);

const directories = [];
const running = new Set();

for (const signal of ['SIGINT', 'SIGTERM', 'SIGHUP'])
  process.on(signal, () => process.exit(1));
process.on('exit', () => {
  for (const child of running)
    child.kill('SIGKILL');
  for (const directory of directories)
    rmSync(directory, { recursive: true, force: true });
});

// A time-out in milliseconds, longer for a build that is slow.
export function scaled(milliseconds) {
  return milliseconds * slowness;
}

// The promise's outcome, or a failure that says what did not happen in time.
export async function inTime(promise, what, milliseconds = 5000) {
  const timer = new AbortController();
  const late = sleep(scaled(milliseconds), undefined, { signal: timer.signal })
    .then(() => { throw new Error(`not within ${scaled(milliseconds)} ms: ${what}`); });
  late.catch(() => {});
  try {
    return await Promise.race([promise, late]);
  } finally {
    timer.abort();
  }
}

// A directory that lives as long as the test process.
export function temporaryDirectory() {
  const directory = mkdtempSync(join(tmpdir(), 'subject-store-test-'));
  directories.push(directory);
  return directory;
}

export function temporaryFile(name, content) {
  const file = join(temporaryDirectory(), name);
  writeFileSync(file, content);
  return file;
}

function escaped(value) {
  return String(value).replace(/[&<>"]/g, character => `&#${character.charCodeAt(0)};`);
}

// An element for each entry, within one of that name; nothing when there are none.
function group(name, entries) {
  const content = entries.map(([entry, value]) => `<${entry}>${escaped(value)}</${entry}>`).join('');
  return content && `<${name}>${content}</${name}>`;
}

// An empty element with these attributes.
function leaf(name, attributes) {
  return `<${name}${Object.entries(attributes).map(([key, value]) => ` ${key}="${escaped(value)}"`).join('')}/>`;
}

// The content in an element; nothing when there is none.
function within(name, content) {
  return content && `<${name}>${content}</${name}>`;
}

// Where in a subject its markers, clusters and slots stand.
function partsOf(kind, markers, clusters, slots) {
  if (kind === 'CFCs')
    return within('Slots', slots.map(slot => leaf('Slot', typeof slot === 'string' ? { name: slot } : slot)).join(''));
  const positions = markers.map(([x, y, z]) => leaf('Marker', { x, y, z })).join('');
  if (kind !== 'SmartObjects')
    return within('Markers', positions);
  const usual = { label: 'Cluster', pattern: 0, type: 'Corvex1' };
  const made = clusters.map(cluster => leaf('SmartCluster', { ...usual, ...cluster }));
  return within('SmartObject', within('AdditionalMarkerPositions', positions) + within('SmartClusters', made.join('')));
}

// The text of a subject configuration. A subject: { kind, name, parent, parameters, warnings, markers, clusters,
// slots }; the name is enough. A cluster: { label, device, pattern, type }, of which each may be left out. A slot:
// { name, object }, or its name. A device: its attributes; the URN is enough.
export function configuration(subjects, devices = []) {
  const lines = subjects.map(subject => {
    const { kind = 'BasicObjects', name, parent, parameters = {}, warnings = [], markers = [], clusters = [],
            slots = [] } = subject;
    const of = parent === undefined ? '' : ` parent="${escaped(parent)}"`;
    const content = group('Parameters', Object.entries(parameters)) +
                    group('Warnings', warnings.map(warning => [`Warning${warning}`, true])) +
                    partsOf(kind, markers, clusters, slots);
    return `    <Subject kind="${kind}" name="${escaped(name)}"${of}>${content}</Subject>`;
  });
  const usual = { type: 'Corvex1', connected: true, charging: false, battery: 50, radio: 11 };
  const stage = devices.map(device => leaf('Device', { ...usual, ...device })).join('');
  return [`<SubjectConfiguration version="1">${within('Devices', stage)}`, '  <Subjects>', ...lines, '  </Subjects>',
          '</SubjectConfiguration>', ''].join('\n');
}

// Without a window, whatever the display, unless an environment is given. `launcher`: a command that becomes the host.
function launch(options, environment, launcher = []) {
  const [command, ...rest] = [...launcher, binary, ...(environment ? [] : ['--headless']), ...options];
  const child = spawn(command, rest, { stdio: ['ignore', 'pipe', 'pipe'], env: environment });
  running.add(child);
  const process = { child, stderr: '' };
  process.listening = new Promise(done => child.stdout.setEncoding('utf8').on('data', text => {
    if (text.includes('listening'))
      done({ status: 'listening' });
  }));
  child.stderr.setEncoding('utf8').on('data', text => { process.stderr += text; });
  process.ended = new Promise((done, failed) => {
    child.on('error', failed);
    child.on('close', (status, signal) => {
      running.delete(child);
      done({ status, signal });
    });
  });
  process.ended.catch(() => {});
  return process;
}

function assertNoSanitizerReport(stderr) {
  assert.doesNotMatch(stderr, /Sanitizer|runtime error/);
}

// Runs the host with options that keep it from starting.
export async function refusedStart(options, environment, launcher) {
  const process = launch(options, environment, launcher);
  try {
    const { status, signal } = await inTime(Promise.race([process.ended, process.listening]),
                                            `${options.join(' ')} ends the host`, 10000);
    assertNoSanitizerReport(process.stderr);
    return { status, signal, lines: process.stderr.split('\n').filter(line => line !== '') };
  } finally {
    process.child.kill('SIGKILL');
  }
}

class Host {
  #process;
  #killed = false;

  constructor(process, { url, ws }, readyFile) {
    this.#process = process;
    this.readyFile = readyFile;
    this.url = url;
    this.ws = ws;
    this.port = Number(new URL(url).port);
  }

  get stderr() {
    return this.#process.stderr;
  }

  get pid() {
    return this.#process.child.pid;
  }

  // Asks the host to end, and answers its exit status.
  async stop(signal = 'SIGTERM', milliseconds = 10000) {
    this.#process.child.kill(signal);
    const { status } = await inTime(this.#process.ended, `the host ends after ${signal}`, milliseconds);
    return status;
  }

  // Takes the host's life at once.
  async kill() {
    this.#killed = true;
    this.#process.child.kill('SIGKILL');
    await this.#process.ended;
  }

  async assertEndsWell(signal = 'SIGTERM') {
    const status = await this.stop(signal);
    if (!this.#killed)
      assert.equal(status, 0, `exit status of the host\n${this.stderr}`);
    assertNoSanitizerReport(this.stderr);
  }
}

// Starts a host and waits until it serves calls. `subjects` with `devices`, or `config` (a text) fill an empty
// store. `environment` takes the place of the environment; only with one may the host have a window.
export async function startHost({ subjects, devices, config, data = ':memory:', listen = '127.0.0.1:0',
                                  options = [], environment, launcher } = {}) {
  const readyFile = join(temporaryDirectory(), 'ready.json');
  const text = subjects ? configuration(subjects, devices) : config;
  const configurationOptions = text === undefined ? [] : ['--config', temporaryFile('stage.xml', text)];
  const process = launch(['--listen', listen, '--data', data, '--ready-file', readyFile, ...configurationOptions,
                          ...options], environment, launcher);
  let ended;
  process.ended.then(how => { ended = how; }, failure => { ended = failure; });
  const deadline = Date.now() + scaled(15000);
  while (!existsSync(readyFile)) {
    if (ended === undefined && Date.now() < deadline) {
      await sleep(5);
      continue;
    }
    process.child.kill('SIGKILL');
    throw new Error(`the host did not come up (${JSON.stringify(ended) ?? 'too late'}):\n${process.stderr}`);
  }
  // The file appears whole: no second look.
  const ready = JSON.parse(readFileSync(readyFile, 'utf8'));
  assert.equal(ready.pid, process.child.pid);
  return new Host(process, ready, readyFile);
}

// Runs `body` with a host, which has to end well afterwards.
export async function withHost(options, body) {
  const host = await startHost(options);
  try {
    await body(host);
  } catch (failure) {
    await host.kill();
    if (host.stderr !== '' && failure instanceof Error)
      failure.message += `\nThe host wrote:\n${host.stderr.slice(-4000)}`;
    throw failure;
  }
  await host.assertEndsWell();
}
