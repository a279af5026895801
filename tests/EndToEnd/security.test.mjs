// What the server does not let strangers do: to listen in, to get in without the token, to keep others out.

import assert from 'node:assert/strict';
import { readFileSync } from 'node:fs';
import https from 'node:https';
import { join } from 'node:path';
import { describe, test } from 'node:test';
import { setTimeout as sleep } from 'node:timers/promises';
import tls from 'node:tls';

import { SubjectStoreClient } from '../../clients/typescript/dist/index.js';
import { outputOf, runSync } from './children.mjs';
import { askColor, crateColor, limits, subjects } from './crate.mjs';
import { binary, inTime, refusedStart, temporaryDirectory, temporaryFile, until, withHost } from './host.mjs';
import { Connection, handshake, post, RawSocket, rawRequest, request, withConnection } from './wire.mjs';

const folder = temporaryDirectory();
const [certificate, key, otherKey, lockedKey] = ['cert', 'key', 'other-key', 'locked-key']
  .map(name => join(folder, `${name}.pem`));
const openssl = (...options) => runSync('openssl', options);
openssl('req', '-x509', '-newkey', 'rsa:2048', '-nodes', '-days', '2', '-subj', '/CN=stage', '-addext',
        'subjectAltName=IP:127.0.0.1', '-keyout', key, '-out', certificate);
openssl('genrsa', '-out', otherKey, '2048');
openssl('rsa', '-in', key, '-aes256', '-passout', 'pass:secret', '-out', lockedKey);
const ca = readFileSync(certificate);
const encrypted = ['--tls-cert', certificate, '--tls-key', key];

function refusals(host, what) {
  return host.stderr.split('\n').filter(line => line.includes('Refused') && what.test(line));
}

// Waits until the host has written so many lines of refusal.
async function refused(host, what, count = 1) {
  await until(`${count} lines that refuse ${what}`, () => refusals(host, what).length >= count, { seen: () => host.stderr });
  assert.equal(refusals(host, what).length, count, host.stderr);
}

function askEncrypted(host, options = {}) {
  return inTime(new Promise((done, failed) => {
    const outgoing = https.request(`${host.url}/rpc`, { method: 'POST', agent: false, ca, ...options }, incoming => {
      let text = '';
      incoming.on('data', part => { text += part; }).on('end', () => done(JSON.parse(text))).on('error', failed);
    });
    outgoing.on('error', failed).end(askColor());
  }), 'an answer over https');
}

// What the program prints as a client of the host.
function commandLine(host, ...words) {
  return outputOf(binary, [...words, '--server', host.url]);
}

describe('Encrypted', () => {
  test('calls and WebSockets are served, old protocols and plain requests are not',
       () => withHost({ subjects, options: encrypted }, async host => {
    assert.match(`${host.url} ${host.ws}`, /^https:\S+ wss:\S+\/rpc$/);
    for (const maxVersion of ['TLSv1.2', 'TLSv1.3'])
      assert.deepEqual(await askEncrypted(host, { maxVersion }), crateColor());
    await assert.rejects(askEncrypted(host, { minVersion: 'TLSv1', maxVersion: 'TLSv1.1', ciphers: 'ALL:@SECLEVEL=0' }));
    await assert.rejects(askEncrypted(host, { ca: undefined }), /self-signed/);

    const connection = await Connection.open(host, { ca, origin: host.url });
    await connection.call('Server.Subscribe', ['BasicObjectServices.*']);
    const longName = 'x'.repeat(200);
    for (let i = 0; i < 300; ++i)
      connection.notify('BasicObjectServices.SetProximityGroupName', ['Crate', `${longName}${i}`]);
    assert.equal((await connection.call('BasicObjectServices.ProximityGroupName', ['Crate']))
      .result.outputs.ProximityGroupName, `${longName}299`);
    assert.equal((await connection.nextNotification()).method, 'BasicObjectServices.BasicObjectChangedCallback');
    assert.equal(await connection.close(1000), 1000);

    assert.equal(await commandLine(host, 'call', 'BasicObjectServices.Color', 'Crate', '--tls-ca', certificate), '#ff3366cc\n');
    await assert.rejects(commandLine(host, 'call', 'BasicObjectServices.Color', 'Crate'), /not trusted/);

    const rsaKeyExchange = { maxVersion: 'TLSv1.2', ciphers: 'AES256-GCM-SHA384:AES128-SHA' };
    await assert.rejects(askEncrypted(host, rsaKeyExchange), /handshake failure/);

    const plain = await request({ url: host.url.replace('https', 'http') }, { body: askColor() });
    assert.deepEqual([plain.status, plain.body], [400, 'This port speaks https.\n']);
    await refused(host, /handshake failed/);
  }));

  test('a connection that stops in the middle harms nobody', () => withHost({ subjects, options: encrypted },
                                                                        async host => {
    for (const bytes of [Buffer.of(0x16, 3, 1), Buffer.from('no TLS at all\r\n\r\n'), Buffer.alloc(0)]) {
      const raw = await RawSocket.open(host);
      raw.socket.end(bytes);
      await inTime(raw.ended, 'the connection ends');
    }
    const halfway = tls.connect({ port: host.port, host: '127.0.0.1', ca });
    await inTime(new Promise(done => halfway.on('secureConnect', done)), 'the handshake');
    halfway.write('POST /rpc HTTP/1.1\r\nHost: 127.0.0.1\r\nContent-Le');
    halfway.destroy();
    const idle = tls.connect({ port: host.port, host: '127.0.0.1', ca });
    await inTime(new Promise(done => idle.on('secureConnect', done)), 'the handshake');
    assert.deepEqual(await askEncrypted(host), crateColor());
    idle.on('error', () => {});
  }));

  test('needs a certificate and its own key', async () => {
    const nothing = temporaryFile('nothing.pem', '');
    const refusedOptions = [
      [['--tls-cert', certificate], /--tls-key/], [['--tls-key', key], /--tls-cert/],
      [['--tls-cert', '/nonexistent', '--tls-key', key], /certificate "\/nonexistent"/],
      [['--tls-cert', nothing, '--tls-key', key], /certificate ".*nothing\.pem"/],
      [['--tls-cert', certificate, '--tls-key', nothing], /private key ".*nothing\.pem"/],
      [['--tls-cert', certificate, '--tls-key', folder], /private key/],
      [['--tls-cert', certificate, '--tls-key', otherKey], /private key ".*other-key\.pem"/],
      [['--tls-cert', certificate, '--tls-key', lockedKey], /private key ".*locked-key\.pem"/],
      [['--ping-after', '0'], /ping-after/], [['--max-connections', '99999'], /--max-connections: expected 4 to 65536/],
      [['--max-connections', '10', '--max-websockets', '11'], /--max-websockets: expected at most 10/],
    ];
    for (const [options, says] of refusedOptions) {
      const { status, lines } = await refusedStart(['--data', ':memory:', '--listen', '127.0.0.1:0', ...options]);
      assert.equal(status, 2);
      assert.equal(lines.length, 1);
      assert.match(lines[0], says);
    }
  });
});

test('A client that cannot set headers shows its token in the list of protocols', () => {
  const token = '??~~open sesame/42=';
  const file = temporaryFile('token', `${token}\n`);
  return withHost({ subjects, options: ['--token-file', file] }, async host => {
    const encoded = Buffer.from(token).toString('base64url');
    const connection = await Connection.open(host, { protocols: ['subject-store', `bearer.${encoded}`] });
    assert.equal(connection.socket.protocol, 'subject-store');
    assert.equal((await connection.call('BasicObjectServices.BasicObjectList')).result.code, 0);
    connection.socket.terminate();
    const typed = await SubjectStoreClient.connect(host.ws, { token });
    assert.deepEqual((await typed.basicObjectServices.basicObjectList()).Names, ['Barrel', 'Crate']);
    await typed.close();
    assert.equal(await commandLine(host, 'call', 'BasicObjectServices.Color', 'Crate', '--token-file', file), '#ff3366cc\n');
    for (const protocols of [['subject-store'], ['subject-store', 'bearer.wrong'], [`bearer.${encoded}x`]])
      await assert.rejects(Connection.open(host, { protocols }), /401/);
    for (const [path, status] of [['/', 200], ['/openrpc.json', 401], ['/nowhere', 401]])
      assert.equal((await request(host, { method: 'GET', path })).status, status, path);
    await refused(host, /without the right token/);
  });
});

test('Refusals do not fill the log', () => withHost({ subjects }, async host => {
  for (let i = 0; i < 200; ++i)
    assert.equal((await request(host, { headers: { Origin: `https://evil${i}.example` }, body: '' })).status, 403);
  await refused(host, /web page of another origin/);
  assert.equal(await host.stop(), 0);
}));

test('Connections that do nothing make room for others', () => withHost({ subjects }, async host => {
  const open = async count => {
    const some = [];
    while (some.length < count)
      some.push(...await Promise.all(Array.from({ length: Math.min(50, count - some.length) },
                                                () => RawSocket.open(host))));
    return some;
  };
  const webSockets = await open(limits.webSockets);
  const upgrade = rawRequest(host, '', { method: 'GET', headers: Object.entries(handshake).map(h => h.join(': ')) });
  await Promise.all(webSockets.map(raw => raw.exchange(upgrade, /Server\.Hello/)));
  const idle = await open(limits.connections - limits.webSockets);
  for (const raw of idle)
    raw.socket.write('POST /rpc HTTP/1.1\r\n'); // and no more
  assert.equal((await request(host, { headers: handshake, method: 'GET' })).status, 503);
  await sleep(1100);
  for (let i = 0; i < 5; ++i)
    assert.deepEqual(await post(host, 'BasicObjectServices.Color', ['Crate']), crateColor(1));
  await inTime(Promise.race(idle.map(raw => raw.ended)), 'an idle connection is ended');
  assert.match(await webSockets[0].exchange('', /$/), /Server\.Hello/);
  for (const raw of [...webSockets, ...idle])
    raw.socket.destroy();
}));

// What the host takes up in memory, in bytes.
function residentBytes(host) {
  return Number(readFileSync(`/proc/${host.pid}/statm`, 'utf8').split(' ')[1]) * 4096;
}

// Runs `during`, and all the while asks over new connections.
async function newcomersDuring(host, during, headers = {}) {
  let over = false;
  const asking = (async () => {
    while (!over) {
      assert.equal((await post(host, 'BasicObjectServices.Color', ['Crate'], headers)).result?.code, 0);
      await sleep(5);
    }
  })();
  try {
    await during();
  } finally {
    over = true;
    await asking;
  }
}

test('Framing without end takes no memory, whether a token is shown or not', () => {
  const token = 'open sesame';
  const options = ['--token-file', temporaryFile('token', token)];
  return withHost({ subjects, options }, async host => {
    const at = `HTTP/1.1\r\nHost: 127.0.0.1:${host.port}\r\n`;
    const known = `Authorization: Bearer ${token}\r\n`;
    const flood = 'x'.repeat(65536);
    const endless = [
      [`OPTIONS * ${at}Transfer-Encoding: chunked\r\n\r\n0\r\na: `, flood], [`OPTIONS * ${at}a: `, flood],
      [`GET / ${at}Transfer-Encoding: chunked\r\n\r\n`, '0'.repeat(65536)],
      [`POST /rpc ${at}${known}Transfer-Encoding: chunked\r\n\r\n1;`, flood],
      [`POST /rpc ${at}${known}Transfer-Encoding: chunked\r\n\r\n`, '0'.repeat(65536)],
      [`POST /rpc ${at}${known}Transfer-Encoding: chunked\r\n\r\n0\r\n`, 'a: b\r\n'.repeat(10000)],
    ];
    const before = residentBytes(host);
    await newcomersDuring(host, () => Promise.all(endless.map(async ([head, more]) => {
      const raw = await RawSocket.open(host);
      raw.socket.write(head);
      for (let sent = 0; sent < 64 << 20 && !raw.socket.destroyed && raw.text === ''; sent += more.length) {
        await inTime(new Promise(done => raw.socket.write(more, done)), 'the host reads or ends the connection', 20000);
        await sleep(1); // what is answered is read as well
      }
      await raw.until(/^HTTP\/1\.1 4(00|31) /);
      raw.socket.destroy();
    })), { Authorization: `Bearer ${token}` });
    assert.ok(residentBytes(host) - before < 16 << 20, `${residentBytes(host) - before} bytes more`);
    await refused(host, /127\.0\.0\.1: not a request that can be read/);
  });
});

test('Many long batches take no more than they may, and newcomers are served', () => withHost({ subjects }, async host => {
  const describe = Array.from({ length: limits.batchCalls }, (_, id) => ({ jsonrpc: '2.0', id, method: 'rpc.discover' }));
  const batch = JSON.stringify([...describe.slice(1), { jsonrpc: '2.0', id: 'edit', method: 'BasicObjectServices.SetEnabled',
                                                        params: ['Crate', false] }]);
  const { body } = await request(host, { body: batch });
  assert.ok(Buffer.byteLength(body) < limits.outgoingBytes + (1 << 20));
  const parts = JSON.parse(body);
  assert.equal(parts.length, limits.batchCalls);
  const codes = [...new Set(parts.map(part => part.error?.code ?? 'described'))];
  assert.deepEqual(codes, ['described', -32000]);
  assert.deepEqual(parts.at(-1), { jsonrpc: '2.0', id: 'edit',
                                   error: { code: -32000, message: parts.at(-1).error.message } });
  assert.equal((await post(host, 'BasicObjectServices.Enabled', ['Crate'])).result.outputs.Enabled, true);
  await withConnection(host, async connection => {
    assert.equal((await connection.exchange(batch)).length, body.length);
  });

  const before = residentBytes(host);
  const posted = await Promise.all(Array.from({ length: 100 }, () => RawSocket.open(host)));
  let most = 0;
  await newcomersDuring(host, async () => {
    for (const raw of posted) {
      raw.socket.pause();
      raw.socket.write(rawRequest(host, batch));
    }
    for (let i = 0; i < 20; ++i) {
      await sleep(50);
      most = Math.max(most, residentBytes(host) - before);
    }
  });
  assert.ok(most < 64 << 20, `${most} bytes more`);
  for (const raw of posted)
    raw.socket.destroy();
}));

test('Strangers that keep talking keep nobody out', () => {
  const options = ['--max-connections', '100', '--token-file', temporaryFile('token', 'sesame')];
  return withHost({ subjects, options }, async host => {
    const headers = { Authorization: 'bearer sesame' };
    let talking = true;
    const talk = async () => {
      while (talking) {
        const raw = await RawSocket.open(host);
        while (talking && !raw.socket.destroyed) {
          raw.socket.write(`OPTIONS * HTTP/1.1\r\nHost: 127.0.0.1:${host.port}\r\n\r\n`);
          await Promise.race([raw.ended, sleep(300)]);
        }
        raw.socket.destroy();
        await sleep(50);
      }
    };
    const strangers = Array.from({ length: 120 }, talk);
    await sleep(500);
    for (let i = 0; i < 50; ++i)
      assert.equal((await post(host, 'BasicObjectServices.Color', ['Crate'], headers)).result?.code, 0);
    talking = false;
    await Promise.all(strangers);
  });
});

test('Newcomers are told, not kept waiting, when there are no more open files', () => {
  const launcher = ['prlimit', '--nofile=90', '--'];
  return withHost({ subjects, launcher, options: ['--max-connections', '40'] }, async host => {
    runSync('prlimit', ['--pid', String(host.pid), '--nofile=40:40']);
    const waiting = [];
    for (let i = 0; i < 40; ++i)
      waiting.push(await RawSocket.open(host));
    assert.equal((await post(host, 'BasicObjectServices.Color', ['Crate'])).result.code, 0);
    const webSockets = [];
    const full = (async () => {
      while (webSockets.length < 40)
        webSockets.push(await Connection.open(host));
    })();
    await assert.rejects(full);
    assert.equal((await webSockets[0].call('BasicObjectServices.BasicObjectList')).result.code, 0);
    for (const one of webSockets)
      one.socket.terminate();
    for (const raw of waiting)
      raw.socket.destroy();
  });
});

test('Who was stopped for a while ends nobody for it', () => withHost({ subjects, options: ['--ping-after', '1'] },
                                                                      async host => {
  const idle = await Promise.all(Array.from({ length: 10 }, () => Connection.open(host)));
  const half = await RawSocket.open(host);
  half.socket.write('POST /rpc HTTP/1.1\r\n');
  await sleep(1200); // some have been pinged
  process.kill(host.pid, 'SIGSTOP');
  await sleep(4000);
  process.kill(host.pid, 'SIGCONT');
  await sleep(2500);
  for (const one of idle)
    assert.equal((await one.call('BasicObjectServices.BasicObjectList')).result.code, 0);
  assert.ok(!half.socket.destroyed);
  half.socket.destroy();
  for (const one of idle)
    one.socket.terminate();
}));

test('A client that does not answer pings is ended, one that answers stays',
     () => withHost({ subjects, options: ['--ping-after', '1'] }, async host => {
  const [silent, lively] = await Promise.all([Connection.open(host, { autoPong: false }), Connection.open(host)]);
  let pings = 0;
  lively.socket.on('ping', () => { ++pings; });
  await inTime(silent.closed, 'the silent client is ended', 6000);
  await until('more pings than one', () => pings >= 2, { seen: () => pings });
  assert.equal((await lively.call('BasicObjectServices.BasicObjectList')).result.code, 0);
  await refused(host, /does not answer pings/);
  lively.socket.terminate();
}));
