// Starts the programs that a test needs, and sees to it that none of them outlives it.

import assert from 'node:assert/strict';
import { execFileSync, spawn } from 'node:child_process';

import { inTime, scaled, until } from './waiting.mjs';

const running = new Set();

for (const signal of ['SIGINT', 'SIGTERM', 'SIGHUP'])
  process.on(signal, () => process.exit(1));
process.on('exit', () => {
  for (const child of running)
    child.kill();
});

// A program that runs. It does not keep the test's process alive: only a wait does, and each of those ends.
export class Child {
  stdout = '';
  stderr = '';
  #process;
  #words;

  constructor(command, words, { env = process.env, input } = {}) {
    this.#words = [command, ...words].join(' ');
    // The leader of a process group, so that what it starts can be ended with it.
    const stdin = input === undefined ? 'ignore' : 'pipe';
    this.#process = spawn(command, words, { stdio: [stdin, 'pipe', 'pipe'], env, detached: true });
    running.add(this);
    this.ended = new Promise((done, failed) => {
      this.#process.on('error', failure => {
        running.delete(this);
        failed(failure);
      });
      this.#process.on('close', (status, signal) => {
        running.delete(this);
        this.outcome = { status, signal };
        done(this.outcome);
      });
    });
    this.ended.catch(failure => { this.outcome = { failure }; });
    for (const stream of ['stdout', 'stderr'])
      this.#process[stream].setEncoding('utf8').on('data', text => { this[stream] += text; }).unref();
    this.#process.stdin?.on('error', () => {}).end(input);
    this.#process.unref();
  }

  get pid() {
    return this.#process.pid;
  }

  get hasEnded() {
    return this.outcome !== undefined;
  }

  // What it has written, and how it has ended.
  get report() {
    const { status, signal, failure } = this.outcome ?? {};
    const end = failure ? `did not start: ${failure.message}` : `has ended with ${signal ?? status}`;
    const state = this.hasEnded ? end : 'runs';
    return `${this.#words}\n${state}, and wrote:\n${this.stdout.slice(-4000)}${this.stderr.slice(-4000)}`;
  }

  signal(name) {
    this.#process.kill(name);
  }

  // Nobody reads its output any longer.
  hangUp() {
    this.#process.stdout.destroy();
  }

  // Takes its life, and that of all that it has started, at once.
  kill() {
    if (this.hasEnded || this.pid === undefined)
      return;
    try {
      process.kill(-this.pid, 'SIGKILL');
    } catch {
      // It has gone by itself.
    }
  }

  // How it ends: its status, or the signal that has ended it, and what it has written.
  async end(what = 'the end of a program', milliseconds = 5000) {
    try {
      const { status, signal } = await inTime(this.ended, what, milliseconds, () => this.report);
      return { status: status ?? signal, stdout: this.stdout, stderr: this.stderr };
    } catch (failure) {
      this.kill();
      throw failure;
    }
  }

  // Waits until it has written what matches to the stream.
  async written(stream, expression, seconds = 10) {
    const what = `${stream} has ${expression}`;
    await until(what, () => {
      if (!expression.test(this[stream]) && this.hasEnded)
        throw new Error(`${what} no more: ${this.report}`);
      return expression.test(this[stream]);
    }, { seconds, seen: () => this.report });
  }
}

// Runs a program to its end: how it ended and what it wrote.
export function run(command, words, { milliseconds = 15000, ...options } = {}) {
  return new Child(command, words, options).end(`${[command, ...words].join(' ')} ends`, milliseconds);
}

// What a program writes that has to succeed.
export async function outputOf(command, words, options) {
  const { status, stdout, stderr } = await run(command, words, options);
  assert.equal(status, 0, `${[command, ...words].join(' ')}\n${stdout}${stderr}`);
  return stdout;
}

// Runs a program to its end while everything else stands still; what it wrote to standard output.
export function runSync(command, words, options) {
  return execFileSync(command, words, { timeout: scaled(15000), killSignal: 'SIGKILL', stdio: 'pipe', encoding: 'utf8',
                                        ...options });
}

// Runs `body`, and kills whatever it has started and not seen end.
export async function leavingNothing(body) {
  const before = new Set(running);
  try {
    return await body();
  } finally {
    for (const child of running)
      if (!before.has(child))
        child.kill();
  }
}
