// The description that the server gives of itself.

import assert from 'node:assert/strict';
import { createHash } from 'node:crypto';
import { after, before, describe, test } from 'node:test';

import { Parser } from '@asyncapi/parser';
import { validateOpenRPCDocument } from '@open-rpc/schema-utils-js';
import Ajv from 'ajv';

import { callbacks, changed, documentedFailures, codes, functions, inputs, outputs, published } from './api.mjs';
import { startHost, withHost } from './host.mjs';
import { post, request, withConnection } from './wire.mjs';

const own = ['Server.Subscribe', 'Server.Unsubscribe', 'rpc.discover'];
const groupOf = name => name.split('.')[0];
// Without the host's own group, which nobody published.
const ofPlugin = list => list.filter(({ name }) => groupOf(name) !== 'HostSimulation');

// Each: its name in a schema, and its least and greatest value where it has them.
const simpleTypes = {
  'text': ['string'],
  'bool': ['boolean'],
  'double': ['number'],
  'unsigned 32-bit': ['integer', 0, 2 ** 32 - 1],
  'unsigned 64-bit': ['integer', 0, 2 ** 64],
  'calibration session id': ['integer', 0, 2 ** 32 - 1],
};

// Checks what matters of the schema of a published type.
function assertSchema(schema, type) {
  const [, map, enumeration = map] = /^map (\w+) to text$|^(E[A-Z]\w+)$/.exec(type) ?? [];
  if (enumeration !== undefined) {
    const { values } = published.enumerations.find(({ name }) => name.endsWith(`.${enumeration}`));
    const { items } = schema;
    if (map !== undefined) {
      assert.deepEqual([schema.type, items.type, items.minItems, items.maxItems], ['array', 'array', 2, 2]);
      assert.equal(items.items[1].type, 'string');
    }
    const number = map !== undefined ? items.items[0] : schema;
    assert.deepEqual([number.type, number.enum], ['integer', values.map(value => value.number)]);
  } else if (type === 'set of texts' || type === 'list of texts') {
    const unique = type === 'set of texts' || undefined;
    assert.deepEqual([schema.type, schema.uniqueItems, schema.items.type], ['array', unique, 'string']);
  } else {
    const [name, minimum, maximum] = simpleTypes[type];
    assert.deepEqual([schema.type, schema.minimum, schema.maximum], [name, minimum, maximum]);
  }
}

// Checks the described parameters of a published function or callback.
function assertParams(params, record) {
  assert.deepEqual(params.map(({ name, description, required }) => ({ name, description, required })),
                   inputs(record).map(({ name, text }) => ({ name, description: text, required: true })));
  inputs(record).forEach(({ type }, i) => assertSchema(params[i].schema, type));
}

// A schema and all that stand within it.
function* within(schema) {
  yield schema;
  for (const inner of [...Object.values(schema.properties ?? {}), ...[schema.items ?? []].flat()])
    yield* within(inner);
}

describe('The description', () => {
  let host;
  let document;

  before(async () => {
    host = await startHost();
    document = (await post(host, 'rpc.discover', [])).result;
  });

  after(() => host.assertEndsWell());

  test('is the same as a page', async () => {
    const page = await request(host, { method: 'GET', path: '/openrpc.json' });
    assert.equal(page.status, 200);
    assert.deepEqual(JSON.parse(page.body), document);
    // A double does not hold it, nor does JSON.parse.
    assert.match(page.body, /"maximum":18446744073709551615[,}]/);
  });

  test('has every result code', () => {
    const described = Object.fromEntries(document['x-results'].map(({ name, code }) => [name, code]));
    assert.deepEqual({ ...described, ...codes }, described);
    assert.deepEqual([described.OkButModified, described.RPCNotConnected, described.NoResult],
                     [4, 0x8000002e, 0x80010002]);
  });

  test('is a valid OpenRPC document', () => {
    assert.equal(validateOpenRPCDocument(document), true);
    const { methods: [{ params, ...spoiled }] } = document;
    assert.notEqual(validateOpenRPCDocument({ ...document, methods: [spoiled] }), true, 'the validator sees faults');
  });

  test('has every function with its texts, in their order', () => {
    const methods = ofPlugin(document.methods);
    const names = methods.map(method => method.name);
    assert.deepEqual(names.splice(0, functions.length), functions.map(({ name }) => name));
    assert.deepEqual(names.sort(), own);
    for (const [i, record] of functions.entries()) {
      const method = methods[i];
      assert.equal(method.description, record.description);
      assert.equal(method['x-resultDocumentation'], record.results);
      assert.equal(method['x-group'], groupOf(record.name));
      assert.equal(method['x-level'], 2);

      assertParams(method.params, record);

      const { properties, required } = method.result.schema;
      const asks = record.results.startsWith('True - ');
      assert.deepEqual([properties.returned?.type, required.includes('returned')],
                       [asks ? 'boolean' : undefined, asks]);
      const described = Object.entries(properties.outputs.properties);
      assert.deepEqual(described.map(([name, schema]) => [name, schema.description]),
                       outputs(record).map(({ name, text }) => [name, text]));
      outputs(record).forEach(({ type }, k) => assertSchema(described[k][1], type));

      assert.deepEqual(method.errors, documentedFailures(record).map(([name, text]) => (
        { code: codes[name] | 0, message: name, data: { code: codes[name], text } })));
    }
  });

  test('has every callback and every type, in their order', () => {
    const described = document['x-callbacks'];
    assert.deepEqual(described.map(({ name, description, 'x-level': level }) => ({ name, description, level })),
                     callbacks.map(({ name, description }) => ({ name, description, level: 2 })));
    callbacks.forEach((record, i) => assertParams(described[i].params, record));

    const types = published.groups.flatMap(({ name, description }) => [
      { name, description, values: [] },
      ...published.enumerations.filter(enumeration => groupOf(enumeration.name) === name)]);
    assert.deepEqual(ofPlugin(document['x-types']), types.map(({ name, description, values }) => ({
      name, description, 'x-level': 2,
      values: values.map(value => ({ name: value.name, value: value.number, description: value.text })) })));
  });

  test('gives every schema a title of its own', () => {
    const contents = [...document.methods.map(({ result }) => result),
                      ...[...document.methods, ...document['x-callbacks']].flatMap(({ params }) => params)];
    const titles = contents.flatMap(({ schema }) => [...within(schema)].map(inner => inner.title));
    assert.ok(titles.length > functions.length);
    assert.ok(titles.every(title => typeof title === 'string' && title !== ''));
    assert.deepEqual(titles.filter((title, i) => titles.indexOf(title) !== i), []);
  });
});

describe('The description of notifications', () => {
  let host;
  let text;
  let document;

  before(async () => {
    host = await startHost({ subjects: [{ name: 'Crate' }] });
    text = (await request(host, { method: 'GET', path: '/asyncapi.json' })).body;
    document = JSON.parse(text);
  });

  after(() => host.assertEndsWell());

  // What the parser finds wrong with a document; that there is a newer AsyncAPI is not wrong.
  async function faults(content) {
    const found = await new Parser().validate(content);
    return found.filter(({ severity, code }) => severity <= 1 || code !== 'asyncapi-latest-version');
  }

  test('is a valid AsyncAPI document', async () => {
    assert.deepEqual(await faults(text), []);
    const [name] = Object.keys(document.operations);
    const { action, ...spoiled } = document.operations[name];
    const lost = { ...spoiled, action, messages: [{ $ref: '#/channels/rpc/messages/nowhere' }] };
    for (const operation of [spoiled, { ...spoiled, action: 'shout' }, lost])
      assert.notDeepEqual(await faults({ ...document, operations: { ...document.operations, [name]: operation } }), [],
                          'the parser sees faults');
  });

  test('has the greeting, every callback, and how they are subscribed to', () => {
    const told = ['Server.Hello', ...callbacks.map(({ name }) => name)];
    const operations = Object.entries(document.operations);
    const withAction = wanted => operations.filter(([, { action }]) => action === wanted).map(([name]) => name);
    assert.deepEqual(withAction('send'), told);
    assert.deepEqual(withAction('receive'), ['Server.Subscribe', 'Server.Unsubscribe']);
    const { messages } = document.channels.rpc;
    for (const record of callbacks) {
      const { description, 'x-level': level, 'x-group': group, 'x-deprecated': old } = document.operations[record.name];
      assert.deepEqual([description, level, group, old ?? false],
                       [record.description, 2, groupOf(record.name), record.description.startsWith('@deprecated')]);
      const { properties: { method, params } } = messages[record.name].payload;
      assert.equal(method.const, record.name);
      const { sequence, ...schemas } = params.properties;
      const described = Object.entries(schemas).map(([name, schema]) => (
        { name, description: schema.description, required: params.required.includes(name), schema }));
      assertParams(described, record);
      assertSchema(sequence, 'unsigned 64-bit');
    }
    const titles = Object.values(messages).flatMap(({ payload }) => [...within(payload)].map(({ title }) => title));
    assert.deepEqual(titles.filter((title, i) => titles.indexOf(title) !== i), []);
  });

  test('fits what goes over the wire', () => withConnection(host, async connection => {
    const ajv = new Ajv({ strict: false, allErrors: true });
    const { messages } = document.channels.rpc;
    const assertFits = (message, name) => {
      const fits = ajv.compile({ ...messages[name].payload });
      assert.ok(fits(message), `${name}: ${JSON.stringify(message)}: ${ajv.errorsText(fits.errors)}`);
      // Nothing is said that is not described.
      const content = message.params ?? message.result ?? message.error;
      const { properties } = messages[name].payload;
      assert.deepEqual(Object.keys(content).sort(),
                       Object.keys((properties.params ?? properties.result ?? properties.error).properties).sort());
    };
    assertFits(connection.hello, 'Server.Hello');
    const { limits } = messages['Server.Hello'].payload.properties.params.properties;
    assert.deepEqual(Object.keys(connection.hello.params.limits), Object.keys(limits.properties));
    for (const method of ['Server.Subscribe', 'Server.Unsubscribe', 'Server.Subscribe']) {
      assertFits(await connection.call(method, [changed]), `${method}.Success`);
      assertFits(await connection.call(method, ['Nobody']), `${method}.Failure`);
    }
    await connection.call('Server.Subscribe', ['SubjectCalibrationServices.*']);
    await connection.call('BasicObjectServices.SetAllEnabled', [false]);
    await connection.call('SubjectCalibrationServices.SetNewSubjectName', ['Somebody']);
    const told = new Set();
    while (!told.has(changed) || told.size < 2) {
      const notification = await connection.nextNotification();
      assertFits(notification, notification.method);
      told.add(notification.method);
    }
  }));

  test('has, with that of the functions, a hash in the greeting', async () => {
    const hashOf = async (of, level) => {
      const documents = await Promise.all(['/openrpc.json', '/asyncapi.json'].map(path =>
        request(of, { method: 'GET', path })));
      const hash = createHash('sha256').update(documents.map(({ body }) => body).join('')).digest('hex');
      await withConnection(of, ({ hello }) => {
        assert.deepEqual([hello.params.api, hello.params.levels.granted], [hash, level]);
      });
      return hash;
    };
    const mine = await hashOf(host, 2);
    await withHost({ options: ['--level', '1'] }, async other => {
      assert.equal(await hashOf(other, 1), mine, 'it does not tell who may call what');
    });
    await withHost({ options: ['--features', '0'] }, async other => {
      assert.notEqual(await hashOf(other, 2), mine, 'it tells that functions are missing');
    });
  });
});
