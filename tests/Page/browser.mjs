// The browser in which the page is tested, and pages in it that are watched for what a page must not do.

import assert from 'node:assert/strict';

import { chromium } from 'playwright-core';

import { inTime, scaled } from '../EndToEnd/waiting.mjs';

const executablePath = process.env.SUBJECT_STORE_BROWSER ?? '/usr/bin/chromium';

export function launchBrowser(...args) {
  return chromium.launch({ executablePath, timeout: scaled(30000),
                           args: ['--no-sandbox', '--disable-gpu', '--disable-dev-shm-usage', ...args] });
}

// Browsers do not always end when they are asked to.
export function closeBrowser(browser) {
  return inTime(browser?.close(), 'the browser ends', 10000);
}

// Runs `body` with the page of a host, opened at `hash`. Afterwards the page must have raised no error, have broken no
// policy and have asked nobody else for anything. `expected`: errors that the test brings about.
export async function withPage(browser, host, { hash = '', expected = /^$/, ...options }, body) {
  const context = await browser.newContext({ viewport: { width: 1440, height: 900 }, ...options });
  context.setDefaultTimeout(scaled(10000));
  const page = await context.newPage();
  const wrong = [];
  page.on('pageerror', error => wrong.push(`error: ${error.message}`));
  page.on('console', message => {
    if (['error', 'warning'].includes(message.type()) && !expected.test(message.text()))
      wrong.push(`console: ${message.text()}`);
  });
  page.on('request', request => {
    if (!request.url().startsWith(`${host.url}/`) && !request.url().startsWith('data:'))
      wrong.push(`request: ${request.url()}`);
  });
  page.on('websocket', socket => {
    if (socket.url() !== host.ws)
      wrong.push(`WebSocket: ${socket.url()}`);
  });
  try {
    await page.goto(`${host.url}/${hash}`);
    await inTime(body(page), 'the end of a test with a page', 120000, () => wrong);
    assert.deepEqual(wrong, []);
  } finally {
    await context.close();
  }
}

// The part of the page that is about a function, group, callback or enumeration.
export function about(page, name) {
  return page.locator(`[id="/${name}"]`);
}

// Waits until the page is connected.
export function connected(page) {
  return page.getByText(/^Connected, session/).waitFor();
}

// The form of a function, opened and filled: by label, a text or a truth value.
export async function openForm(page, name, values = {}) {
  const article = about(page, name);
  await article.getByRole('button', { name: `Try it, copy it: ${name}` }).click();
  for (const [label, value] of Object.entries(values)) {
    const field = article.getByLabel(label, { exact: true });
    await (typeof value === 'boolean' ? field.setChecked(value) : field.fill(value));
  }
  return article;
}

// Sends a form; the outcome as text.
export async function send(article) {
  await article.getByRole('status').evaluate(status => status.replaceChildren());
  await article.getByRole('button', { name: 'Call', exact: true }).click();
  return article.locator('.outcome').innerText();
}

// The snippet in a language.
export async function snippet(article, language) {
  await article.getByRole('tab', { name: language }).click();
  return article.getByRole('tabpanel').innerText();
}
