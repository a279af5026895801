// What the API publishes about itself, and what follows from it for an answer.

import assert from 'node:assert/strict';
import { readFileSync } from 'node:fs';
import { inspect, isDeepStrictEqual } from 'node:util';

import { until, withHost } from './host.mjs';
import { withConnection } from './wire.mjs';

export const published = JSON.parse(readFileSync(new URL('../Catalogue/published-api.json', import.meta.url), 'utf8'));

const records = published.groups.flatMap(group => group.functions);

export const callbacks = records.filter(record => record.name.endsWith('Callback'));
export const functions = records.filter(record => !record.name.endsWith('Callback'));

// Those of the functions or callbacks that are in the group.
export function inGroup(group, list) {
  return list.filter(({ name }) => name.startsWith(`${group}.`));
}

const failureNames = [
  'Failed', 'FailedWithException', 'Finished', 'Stopping', 'NotImplemented', 'NotSupported', 'NotPermitted',
  'NotAvailable', 'NotConnected', 'NotSet', 'NotFound', 'NotRequired', 'AlreadyPresent', 'AlreadyInProgress',
  'AlreadySet', 'InvalidArgument', 'InvalidIndex', 'InvalidName', 'InvalidId', 'InvalidHandle', 'InvalidToken',
  'InvalidPointer', 'InvalidFormat', 'InvalidType', 'InvalidVersion', 'InvalidSession', 'InvalidInfo', 'InvalidValue',
  'InvalidSettings', 'ProtocolFailure', 'NetworkFailure', 'AllocationFailure', 'SerialisationFailure',
  'FileIOFailure', 'TimedOut', 'WouldBlock', 'EndOfData', 'Conflict', 'FileNotOpen', 'ShuttingDown', 'DiskFull',
  'Canceled', 'FileNotFound'];

// The result codes as unsigned numbers, by name.
export const codes = {
  Ok: 0,
  OkButNoEffect: 1,
  ...Object.fromEntries(failureNames.map((name, i) => [name, 0x80000000 + i])),
};

export const changed = 'BasicObjectServices.BasicObjectChangedCallback';
export const evaluationChanged = 'ObjectEvaluationServices.EvaluationChangedCallback';

export function inputs(record) {
  return record.arguments.filter(argument => argument.direction === 'input');
}

export function outputs(record) {
  return record.arguments.filter(argument => argument.direction === 'output');
}

// The failures that a function documents: [name, text]. One code is spelt in two ways.
export function documentedFailures(record) {
  return record.results.split('\n').filter(line => line !== '' && !/^(Ok|True) - /.test(line))
    .map(line => line.replace(/^Serialization/, 'Serialisation').split(/ - (.*)/, 2));
}

// The error member of a failed call.
export function failure(method, name) {
  const record = functions.find(known => known.name === method);
  const text = documentedFailures(record).find(([code]) => code === name)?.[1] ?? '';
  return { code: codes[name] | 0, message: name, data: { code: codes[name], text } };
}

// `returned`: what a query answers that answers a truth value.
export function success(values = {}, returned = undefined) {
  return { code: 0, name: 'Ok', outputs: values, ...(returned === undefined ? {} : { returned }) };
}

// Checks a whole answer, its envelope included.
export function assertSucceeds(answer, values = {}, returned = undefined) {
  assert.deepEqual(answer, { jsonrpc: '2.0', id: answer.id, result: success(values, returned) });
}

export function assertFails(answer, method, name) {
  assert.deepEqual(answer, { jsonrpc: '2.0', id: answer.id, error: failure(method, name) });
}

// Everything that the API tells about the basic objects: for each, the answers to all queries by name.
export async function snapshot(connection) {
  const list = await connection.call('BasicObjectServices.BasicObjectList');
  const queries = inGroup('BasicObjectServices', functions)
    .filter(record => inputs(record).length === 1 && outputs(record).length === 1);
  const objects = {};
  for (const name of list.result.outputs.Names) {
    const answers = await Promise.all(queries.map(query => connection.call(query.name, [name])));
    objects[name] = answers.map(({ result, error }) => result ?? error);
  }
  return objects;
}

// The outputs of a call that succeeds, in their order.
export async function outputsOf(connection, method, params) {
  const answer = await connection.call(method, params);
  assert.equal(answer.result?.code, codes.Ok, `${method} ${params}: ${JSON.stringify(answer)}`);
  return Object.values(answer.result.outputs);
}

// Asks until the answer is what it should come to.
export async function eventually(question, expected) {
  let answer;
  await until(inspect(expected), async () => isDeepStrictEqual(answer = await question(), expected),
              { pause: 10, seen: () => answer });
}

// Runs `body` with a connection to a host with these subjects.
export function withStage(subjects, body, options = {}) {
  return withHost({ subjects, ...options }, host => withConnection(host, connection => body(connection, host)));
}
