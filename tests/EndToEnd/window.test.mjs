// The host with its window, on a display that nobody sees.

import assert from 'node:assert/strict';
import { existsSync, readFileSync, writeFileSync } from 'node:fs';
import { join } from 'node:path';
import { test } from 'node:test';
import { setTimeout as sleep } from 'node:timers/promises';

import { assertSucceeds } from './api.mjs';
import { refusedStart, scaled, startHost, temporaryDirectory } from './host.mjs';
import { post } from './wire.mjs';

const { DISPLAY, WAYLAND_DISPLAY, QT_QPA_PLATFORM, ...noDisplay } = process.env;
const display = { ...noDisplay, QT_QPA_PLATFORM: 'offscreen', QT_QUICK_BACKEND: 'software' };
const subjects = [{ name: 'Crate' }];

// What Qt complains of goes to the log; a fault of the window's QML is among that.
function assertNoComplaint(host) {
  assert.doesNotMatch(host.stderr, /\[Qt\]|qrc:|\.qml/);
}

test('A host with a window serves calls and ends well', async () => {
  const data = temporaryDirectory();
  writeFileSync(join(data, 'window.ini'), '[window]\nwidth=none\nx=99999\n\u0000]]theme=');
  const host = await startHost({ subjects, data, environment: display });
  try {
    assertSucceeds(await post(host, 'BasicObjectServices.BasicObjectList'), { Names: ['Crate'] });
    await sleep(scaled(1500)); // the window is drawn, and has looked at the server: it does so once a second
    assertSucceeds(await post(host, 'BasicObjectServices.BasicObjectList'), { Names: ['Crate'] });
  } catch (failure) {
    await host.kill();
    throw failure;
  }
  await host.assertEndsWell('SIGINT');
  assertNoComplaint(host);
});

test('A signal that comes while the host starts is not lost', async () => {
  const host = await startHost({ subjects, environment: display });
  await host.assertEndsWell('SIGTERM'); // at once, before the event loop has had a turn
  assertNoComplaint(host);
});

test('Without a display there is no window, and no need for one', async () => {
  const data = temporaryDirectory();
  const host = await startHost({ subjects, data, environment: noDisplay });
  assertSucceeds(await post(host, 'BasicObjectServices.BasicObjectList'), { Names: ['Crate'] });
  const mapped = readFileSync(`/proc/${host.pid}/maps`, 'utf8');
  await host.assertEndsWell();
  assert.ok(!/plugins\/platforms/.test(mapped), 'no plugin of Qt for a window system is loaded');
  assert.ok(!existsSync(join(data, 'window.ini')));
});

test('A display that cannot be used is refused in one line', async () => {
  const environment = { ...noDisplay, QT_QPA_PLATFORM: 'nowhere' };
  const { status, lines } = await refusedStart(['--data', ':memory:', '--listen', '127.0.0.1:0'], environment);
  assert.equal(status, 2, lines.join('\n'));
  assert.equal(lines.length, 1, lines.join('\n'));
  assert.match(lines[0], /window.*--headless/);
});
