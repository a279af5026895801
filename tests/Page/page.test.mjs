// The page, in a browser, on a real host.

import assert from 'node:assert/strict';
import { readFileSync } from 'node:fs';
import { createServer } from 'node:http';
import { createRequire } from 'node:module';
import { join } from 'node:path';
import { after, before, describe, test } from 'node:test';
import { promisify } from 'node:util';

import { callbacks, changed, functions, inGroup, inputs, outputs, outputsOf, published } from '../EndToEnd/api.mjs';
import { outputOf } from '../EndToEnd/children.mjs';
import { startHost, temporaryDirectory, temporaryFile, withHost } from '../EndToEnd/host.mjs';
import { request, withConnection } from '../EndToEnd/wire.mjs';
import { about, closeBrowser, connected, launchBrowser, openForm, send, snippet, withPage } from './browser.mjs';
import { built, description, files, markup, withStrangeHost } from './strange.mjs';

const axe = readFileSync(createRequire(import.meta.url).resolve('axe-core/axe.min.js'), 'utf8');
const awkward = ["O'Brien's axe & 50 % $HOME `id`", 'Élan 🗡'];
const spaces = text => text.replace(/\s+/g, ' ').trim();

// Texts that are missing from what is shown.
function missing(shown, texts) {
  const all = spaces(shown);
  return texts.map(spaces).filter(text => !all.includes(text));
}

describe('The page', () => {
  let browser;
  let host;

  before(async () => {
    browser = await launchBrowser();
    host = await startHost({ subjects: ['Crate', ...awkward].map(name => ({ name })) });
  });

  after(async () => {
    await closeBrowser(browser);
    await host?.assertEndsWell();
  });

  const onPage = (options, body) => withPage(browser, host, options, body);

  test('shows everything that is published, with its texts', () => onPage({}, async page => {
    await connected(page);
    for (const record of [...functions, ...callbacks]) {
      const results = record.results?.split('\n') ?? [];
      const texts = [record.name, record.description, ...results.flatMap(line => line.split(/^\w+ - /)),
                     ...[...inputs(record), ...outputs(record)].flatMap(({ name, text }) => [name, text])];
      assert.deepEqual(missing(await about(page, record.name).innerText(), texts), [], record.name);
    }
    for (const { name, values } of published.enumerations) {
      const rows = values.flatMap(value => [`${value.number} ${value.name}`, value.text]);
      assert.deepEqual(missing(await about(page, name).innerText(), rows), [], name);
    }
    for (const { name } of published.groups) {
      const counts = `${inGroup(name, functions).length} functions, ${inGroup(name, callbacks).length} callback`;
      assert.ok(spaces(await about(page, name).locator('h2').innerText()).startsWith(`${name} ${counts}`), counts);
    }
    assert.match(await about(page, 'ObjectEvaluationServices.SetMaximumEvaluationStepCount').innerText(),
                 /0 to 18446744073709551615\b/);
    assert.match(await about(page, 'BasicObjectServices.Rename').innerText(), /NotFound\s+0x8000000A/);
    assert.match(await about(page, 'HostSimulation.AddDevice').innerText(), /preview: needs --level 1/);
    const deprecated = await page.locator('article:has(.deprecated)').evaluateAll(all => all.map(({ id }) => id));
    assert.deepEqual(deprecated, ['/SubjectCalibrationServices.CanEndSubjectCalibrationChangedCallback']);
  }));

  test('finds what has all words of a search', () => onPage({}, async page => {
    const shown = () => page.locator('article:visible').evaluateAll(all => all.map(({ id }) => id.split('.')[1]));
    await connected(page);
    await page.keyboard.press('/');
    await page.keyboard.type('proximity UPDATE');
    assert.deepEqual(await shown(), ['SetProximityGroupName', 'SetProximityGroupName']);
    assert.equal(await page.locator('#found').innerText(), '2 functions');
    assert.equal(await page.locator('nav a.function:visible').count(), 2);
    await page.keyboard.press('Escape');
    assert.equal((await shown()).length, await page.locator('article').count());
    await page.keyboard.type('no such words');
    assert.match(await page.locator('#found').innerText(), /Nothing/);
    // An address leads to what it names even when the search has hidden that.
    await page.evaluate(() => { location.hash = '#/BasicObjectServices.Color'; });
    await page.waitForFunction(() => document.activeElement.closest('article')?.id === '/BasicObjectServices.Color');
  }));

  test('calls, and shows what came back to the last digit', () => onPage({}, async page => {
    const color = await openForm(page, 'BasicObjectServices.Color', { Name: 'Crate' });
    assert.match(spaces(await send(color)), /^Ok \(0\) in [\d.]+ ms On success\. ColorHtml #ff/);
    assert.match(await color.locator('.exchanges').innerText(), /"Name": "Crate"[^]*"ColorHtml": "#ff/);
    await color.getByLabel('Name', { exact: true }).fill('Nobody');
    assert.match(spaces(await send(color)), /^NotFound \(0x8000000A\) .* If the basic object name supplied is invalid\.$/);

    const enabled = await openForm(page, 'BasicObjectServices.SetEnabled', { Name: 'Crate', Enabled: false });
    assert.match(await send(enabled), /^Ok/);
    assert.match(await send(await openForm(page, 'BasicObjectServices.Enabled', { Name: 'Crate' })), /false$/);
    assert.match(spaces(await send(await openForm(page, 'BasicObjectServices.BasicObjectList'))),
                 /Names Crate .* Élan 🗡$/);

    const set = await openForm(page, 'ObjectEvaluationServices.SetMaximumEvaluationStepCount',
                               { MaximumStepCount: '18446744073709551615' });
    assert.match(await send(set), /^Ok/);
    const get = await openForm(page, 'ObjectEvaluationServices.MaximumEvaluationStepCount');
    assert.match(await send(get), /18446744073709551615$/);
    assert.match(await get.locator('.exchanges').innerText(), /: 18446744073709551615\b/);
    const count = set.getByLabel('MaximumStepCount');
    await count.fill('18446744073709551616');
    assert.match(await send(set), /^InvalidValue [^]*argument 1/);
    await count.fill('many');
    assert.match(await send(set), /MaximumStepCount: expected a whole number/);
    assert.equal(await count.getAttribute('aria-invalid'), 'true');
    assert.equal(await set.locator('.exchanges').innerText(), '', 'nothing was sent');

    assert.match(await send(await openForm(page, 'HostSimulation.Devices')), /^NotPermitted/);
    const subscribe = await openForm(page, 'Server.Subscribe', { Name: 'BasicObjectServices.*' });
    assert.match(await send(subscribe), /^Ok[^]*sequence/);
    assert.equal(await about(page, changed).getByRole('button', { name: 'Unsubscribe' }).count(), 1);
  }));

  test('hears of what another client does', () => onPage({}, async page => {
    const list = page.getByRole('list', { name: /^Notifications/ });
    let lastGroup = 0;
    const change = number => withConnection(host, async connection => {
      for (let i = 0; i < number; ++i)
        await outputsOf(connection, 'BasicObjectServices.SetTemplateGroupName', ['Crate', `group ${++lastGroup}`]);
    });
    await connected(page);
    await about(page, changed).getByRole('button', { name: 'Subscribe' }).click();
    await about(page, changed).getByRole('button', { name: 'Unsubscribe' }).waitFor();
    await change(1);
    await list.getByText(/^sequence \d+$/).first().waitFor();
    assert.match(spaces(await list.innerText()),
                 /^\d\d:\d\d:\d\d\.\d{3} sequence \d+ BasicObjectServices\. BasicObjectChangedCallback$/);

    await page.getByRole('button', { name: 'Pause' }).click();
    await change(1);
    await page.getByRole('button', { name: 'Go on (1)' }).click();
    await page.waitForFunction(element => element.children.length === 2, await list.elementHandle());
    await page.getByRole('button', { name: 'Clear', exact: true }).click();
    assert.equal(await list.getByRole('listitem').count(), 0);
    await change(300);
    await page.waitForFunction(element => element.children.length > 20, await list.elementHandle());
    assert.ok(await list.getByRole('listitem').count() <= 200);

    await about(page, changed).getByRole('button', { name: 'Unsubscribe' }).click();
    await about(page, changed).getByRole('button', { name: 'Subscribe' }).waitFor();
  }));

  test('gives snippets that work as they are copied', () => onPage({ permissions: ['clipboard-read', 'clipboard-write'] },
                                                                   async page => {
    for (const name of awkward) {
      await page.reload();
      const enabled = await openForm(page, 'BasicObjectServices.SetEnabled', { Name: name, Enabled: false });
      const answered = text => assert.deepEqual(JSON.parse(text.replaceAll("'", '"')).result,
                                                { code: 0, name: 'Ok', outputs: {} }, text);
      await enabled.getByRole('tab', { name: 'curl' }).click();
      await enabled.getByRole('button', { name: /^Copy the snippet/ }).click();
      const copied = await page.evaluate(() => navigator.clipboard.readText());
      answered(await outputOf('bash', ['-c', copied]));
      const python = temporaryFile('call.py', await snippet(enabled, 'Python'));
      answered(await outputOf('python3', [python]));
      const printed = page.waitForEvent('console');
      await page.evaluate(await snippet(enabled, 'JavaScript'));
      answered((await printed).text());
    }
  }));

  test('is used with nothing but the keyboard', () => onPage({}, async page => {
    await connected(page);
    await page.keyboard.press('Tab');
    assert.equal(await page.evaluate(() => document.activeElement.className), 'skip');
    await page.keyboard.press('Enter');
    assert.equal(await page.evaluate(() => document.activeElement.id), 'main');
    await page.keyboard.press('/');
    await page.keyboard.type('BasicObjectServices.Color');
    await page.keyboard.press('Enter');
    for (const expected of ['Link to BasicObjectServices.Color', 'Try it, copy it: BasicObjectServices.Color']) {
      await page.keyboard.press('Tab');
      assert.equal(await page.evaluate(() => document.activeElement.getAttribute('aria-label')), expected);
      assert.notEqual(await page.evaluate(() => getComputedStyle(document.activeElement).outlineStyle), 'none');
    }
    await page.keyboard.press('Enter');
    await page.keyboard.press('Tab');
    await page.keyboard.type('Crate');
    await page.keyboard.press('Enter');
    await about(page, 'BasicObjectServices.Color').getByText('Ok (0)').waitFor();
    await page.keyboard.press('Tab');
    await page.keyboard.press('Tab');
    await page.keyboard.press('ArrowRight');
    assert.equal(await page.evaluate(() => document.activeElement.textContent), 'JavaScript');
  }));

  // In the dark, everything but the colours is the same.
  for (const [colorScheme, rules] of [['light', {}], ['dark', { runOnly: ['color-contrast'] }]])
    test(`is accessible and fits, ${colorScheme}`, () => onPage({ colorScheme }, async page => {
      await connected(page);
      await send(await openForm(page, 'BasicObjectServices.SetEnabled', { Name: 'Nobody' }));
      await send(await openForm(page, 'ObjectEvaluationServices.SetMaximumEvaluationStepCount', { MaximumStepCount: 'x' }));
      await about(page, changed).getByRole('button', { name: /^Copy it/ }).click();
      await page.evaluate(axe);
      for (const width of [1440, 360]) {
        await page.setViewportSize({ width, height: 900 });
        const { violations } = await page.evaluate(options => axe.run(options), rules);
        assert.deepEqual(violations.map(({ id, nodes }) => [id, ...nodes.map(({ html }) => html)]), [], `${width}`);
      }
      for (const width of [1440, 1280, 960, 640, 360, 320]) { // 640: 1280 at 200 %
        await page.setViewportSize({ width, height: 600 });
        assert.ok(await page.evaluate(() => document.documentElement.scrollWidth <= innerWidth), `fits into ${width}`);
      }
    }));

  test('is carried by the host as it was built', async () => {
    for (const [path, [type, file]] of Object.entries(files)) {
      const { status, headers, body } = await request(host, { method: 'GET', path });
      assert.deepEqual([status, headers['content-type']], [200, `${type}; charset=utf-8`]);
      assert.equal(body, String(built(file)));
    }
  });

  test('keeps what could be markup as text, and would not carry it out',
       () => onPage({ expected: /Content Security Policy/ }, async page => {
    assert.match(await send(await openForm(page, 'BasicObjectServices.SetProximityGroupName',
                                           { Name: 'Crate', ProximityGroupName: markup })), /^Ok/);
    const get = await openForm(page, 'BasicObjectServices.ProximityGroupName', { Name: 'Crate' });
    assert.ok((await send(get)).endsWith(markup));
    assert.equal(await page.locator('img').count(), 0);
    const injected = await page.evaluate(() => {
      const script = document.createElement('script');
      script.textContent = 'window.injected = true';
      document.body.append(script);
      document.body.setAttribute('onclick', 'window.injected = true');
      document.body.click();
      return window.injected;
    });
    assert.equal(injected, undefined);
  }));
});

describe('The page of another host', () => {
  let browser;

  before(async () => {
    browser = await launchBrowser('--host-resolver-rules=MAP evil.example 127.0.0.1');
  });

  after(() => closeBrowser(browser));

  test('connects again to a host that was started anew', async () => {
    const first = await startHost({ subjects: [{ name: 'Crate' }] });
    await withPage(browser, first, { expected: /ERR_CONNECTION_REFUSED/ }, async page => {
      await connected(page);
      await about(page, changed).getByRole('button', { name: 'Subscribe' }).click();
      await about(page, changed).getByRole('button', { name: 'Unsubscribe' }).waitFor();
      await first.assertEndsWell();
      await page.getByText(/^Not connected/).waitFor();
      assert.match(await send(await openForm(page, 'BasicObjectServices.BasicObjectList')), /cannot be reached/);
      await withHost({ subjects: [{ name: 'Crate' }], listen: `127.0.0.1:${first.port}` }, async second => {
        await connected(page);
        await page.getByText(/^The host was started anew/).waitFor();
        await withConnection(second, connection => outputsOf(connection, 'BasicObjectServices.Remove', ['Crate']));
        await page.getByText(/^sequence \d+$/).waitFor();
        await page.goto('about:blank');
      });
    });
  });

  test('takes nothing from a description but text, and types what it may hold', async () => {
    let text = 'not JSON';
    let asked;
    const reply = request => {
      asked = request;
      return `{"jsonrpc":"2.0","id":1,"result":{"code":0,"name":"Ok","outputs":{"${markup}":[1,12345678901234567890]}}}`;
    };
    await withStrangeHost(() => text, reply, host => withPage(browser, host, { expected: /WebSocket/ }, async page => {
      for (const wrong of ['not JSON', '{"methods": [{}]}', '[]', '{"methods": 7}']) {
        text = wrong;
        await page.getByRole('button', { name: 'Try again' }).click();
        await page.getByText(/^The host's description cannot be understood: /).waitFor();
      }
      text = JSON.stringify(description);
      await page.getByRole('button', { name: 'Try again' }).click();
      const form = await openForm(page, `Strange.${markup}`, {
        Texts: 'a, "b"\n\nc ', Big: '12345678901234567890', Ratio: '1e-7', Other: '{"x": [12345678901234567890]}' });
      await form.getByLabel('Choice').selectOption(`${markup} (7)`);
      assert.match(await send(form), /12345678901234567890$/);
      const params = '{"Choice": 7, "Texts": ["a, \\"b\\"", "c "], "Big": 12345678901234567890, "Ratio": 1e-7, ' +
                     '"Other": {"x": [12345678901234567890]}}';
      assert.ok(asked.endsWith(`"params": ${params}}`), asked);
      await form.getByLabel('Other').fill('{');
      assert.match(await send(form), /Other: expected JSON/);
      assert.match(await about(page, 'Strange.Old').innerText(), /deprecated/);
      assert.equal(await page.locator('img').count(), 0);
    }));
  });

  test('asks for the token, and uses it; all of it encrypted', async () => {
    const [folder, token] = [temporaryDirectory(), 'Secret+/=~token'];
    const [certificate, key] = [join(folder, 'cert.pem'), join(folder, 'key.pem')];
    await outputOf('openssl', ['req', '-x509', '-newkey', 'rsa:2048', '-nodes', '-days', '2', '-subj', '/CN=stage', '-addext',
                               'subjectAltName=IP:127.0.0.1', '-keyout', key, '-out', certificate]);
    const options = ['--token-file', temporaryFile('token', `${token}\n`), '--tls-cert', certificate, '--tls-key', key];
    const trusting = { env: { ...process.env, CURL_CA_BUNDLE: certificate, SSL_CERT_FILE: certificate } };
    await withHost({ subjects: [{ name: 'Crate' }], options },
                   host => withPage(browser, host, { expected: /401/, ignoreHTTPSErrors: true }, async page => {
      const field = page.getByLabel('Token', { exact: true });
      assert.equal(await field.getAttribute('type'), 'password');
      await field.fill('wrong');
      await page.keyboard.press('Enter');
      await page.getByText('The host did not accept that token.').waitFor();
      await field.fill(token);
      await page.keyboard.press('Enter');
      await connected(page);
      const list = await openForm(page, 'BasicObjectServices.BasicObjectList');
      assert.match(await send(list), /Crate$/);
      const filled = async (language, assignment) => (
        (await snippet(list, language)).replace(/(token =|TOKEN=).*/, assignment));
      assert.match(await outputOf('bash', ['-c', await filled('curl', `TOKEN='${token}'`)], trusting), /"Crate"/);
      const python = await filled('Python', `token = "${token}"`);
      assert.match(await outputOf('python3', [temporaryFile('call.py', python)], trusting), /'Crate'/);
      const printed = page.waitForEvent('console', message => message.text().startsWith('{'));
      await page.evaluate(await filled('JavaScript', `token = '${token}';`));
      assert.match((await printed).text(), /"Crate"/);
      await page.reload();
      await connected(page);
      assert.equal(await page.evaluate(() => localStorage.length + document.cookie.length), 0);
    }));
  });

  test('is refused when it is of another origin, or under a name that was made to point here', async () => {
    const attempt = async ({ url, ws, type }) => {
      const body = JSON.stringify({ jsonrpc: '2.0', id: 1, method: 'BasicObjectServices.RemoveAll' });
      const posted = await fetch(`${url}/rpc`, { method: 'POST', headers: { 'Content-Type': type }, body })
        .then(response => response.status, () => 'blocked');
      const socket = await new Promise(done => {
        const opened = new WebSocket(ws);
        opened.onopen = () => done('open');
        opened.onerror = () => done('blocked');
      });
      return [posted, socket];
    };
    const elsewhere = createServer((request, response) => response.end('<!DOCTYPE html><title>Elsewhere</title>'));
    await promisify(elsewhere.listen.bind(elsewhere))(0, '127.0.0.1');
    try {
      await withHost({ subjects: [{ name: 'Crate' }] }, async host => {
        const page = await browser.newPage();
        const evil = { url: `http://evil.example:${host.port}`, ws: `ws://evil.example:${host.port}/rpc` };
        const attempts = [
          [`http://127.0.0.1:${elsewhere.address().port}/`, host, 'blocked'],
          [`http://evil.example:${elsewhere.address().port}/`, host, 'blocked'],
          [`http://evil.example:${elsewhere.address().port}/`, evil, 'blocked'],
          [`${evil.url}/`, evil, 403],
        ];
        for (const [from, { url, ws }, posted] of attempts) {
          await page.goto(from);
          for (const type of ['application/json', 'text/plain'])
            assert.deepEqual(await page.evaluate(attempt, { url, ws, type }), [posted, 'blocked'], `${from} ${type}`);
        }
        await withConnection(host, async connection => {
          assert.deepEqual(await outputsOf(connection, 'BasicObjectServices.BasicObjectList'), [['Crate']]);
        });
        await page.close();
      });
    } finally {
      elsewhere.close();
      elsewhere.closeAllConnections();
    }
  });
});
