// Starts the standalone host for a test, and sees to it that the host ends as it should.

import assert from 'node:assert/strict';
import { existsSync, mkdtempSync, readFileSync, realpathSync, rmSync, writeFileSync } from 'node:fs';
import { tmpdir } from 'node:os';
import { join, resolve } from 'node:path';
import { fileURLToPath } from 'node:url';

import { Child, leavingNothing } from './children.mjs';
import { inTime, scaled, until } from './waiting.mjs';

export { inTime, scaled, until };

export const binary = resolve(process.env.SUBJECT_STORE_HOST ??
                              fileURLToPath(new URL('../../build/dev/bin/subject-store-host', import.meta.url)));

// The folder with the files that come with the host.
export function sharedFolder() {
  return join(realpathSync(binary), '../../share/subject-store');
}

const directories = [];

process.on('exit', () => {
  for (const directory of directories)
    rmSync(directory, { recursive: true, force: true });
});

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
  const [command, ...words] = [...launcher, binary, ...(environment ? [] : ['--headless']), ...options];
  return new Child(command, words, { env: environment });
}

function assertNoSanitizerReport(stderr) {
  assert.doesNotMatch(stderr, /Sanitizer|runtime error/);
}

// Runs the host with options that keep it from starting.
export async function refusedStart(options, environment, launcher) {
  const process = launch(options, environment, launcher);
  try {
    await until(`${options.join(' ')} ends the host`, () => process.hasEnded || process.stdout.includes('listening'),
                { seconds: 10, seen: () => process.report });
    const { status, signal } = process.outcome ?? { status: 'listening' };
    assertNoSanitizerReport(process.stderr);
    return { status, signal, lines: process.stderr.split('\n').filter(line => line !== '') };
  } finally {
    process.kill();
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
    return this.#process.pid;
  }

  // Asks the host to end, and answers its exit status. One that does not end in time is killed.
  async stop(signal = 'SIGTERM', milliseconds = 10000) {
    this.#process.signal(signal);
    return (await this.#process.end(`the host ends after ${signal}`, milliseconds)).status;
  }

  // Takes the host's life at once.
  async kill() {
    this.#killed = true;
    this.#process.kill();
    await this.#process.end('the host ends when it is killed');
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
  try {
    await until('the host comes up', () => {
      assert.ok(!process.hasEnded, `the host did not come up: ${process.report}`);
      return existsSync(readyFile);
    }, { seconds: 15, seen: () => process.report });
    // The file appears whole: no second look.
    const ready = JSON.parse(readFileSync(readyFile, 'utf8'));
    assert.equal(ready.pid, process.pid);
    return new Host(process, ready, readyFile);
  } catch (failure) {
    process.kill();
    throw failure;
  }
}

const longestTest = 120000;

// Runs `body` with a host, which has to end well afterwards. Neither the host nor what else the body starts outlives it.
export function withHost(options, body) {
  return leavingNothing(async () => {
    const host = await startHost(options);
    try {
      await inTime(body(host), 'the end of a test with a host', longestTest);
    } catch (failure) {
      await host.kill();
      if (host.stderr !== '' && failure instanceof Error)
        failure.message += `\nThe host wrote:\n${host.stderr.slice(-4000)}`;
      throw failure;
    }
    await host.assertEndsWell();
  });
}
