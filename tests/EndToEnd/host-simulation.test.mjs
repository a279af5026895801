// The host's own group "HostSimulation" over the wire, and what its devices do to smart objects.

import assert from 'node:assert/strict';
import { test } from 'node:test';

import { assertSucceeds, codes, inGroup } from './api.mjs';
import { withHost } from './host.mjs';
import { withConnection } from './wire.mjs';

const group = 'HostSimulation';

const config = `<SubjectConfiguration version="1">
  <Devices>
    <Device urn="corvex1-0411" type="Corvex1" connected="false" charging="true" battery="87" radio="12"/>
  </Devices>
  <Subjects>
    <Subject kind="SmartObjects" name="Handset">
      <SmartObject><SmartClusters><SmartCluster label="Grip" pattern="3" type="Corvex1"/></SmartClusters></SmartObject>
    </Subject>
  </Subjects>
</SubjectConfiguration>
`;

function withStage(options, body) {
  return withHost({ config, options }, host => withConnection(host, body));
}

function call(connection, name, ...params) {
  return connection.call(`${group}.${name}`, params);
}

test('A preview is listed and not permitted', () => withStage([], async connection => {
  const { result: { methods, 'x-types': types } } = await connection.call('rpc.discover');
  const own = inGroup(group, methods);
  assert.deepEqual(own.map(({ name }) => name.slice(group.length + 1)),
                   ['Devices', 'DeviceState', 'AddDevice', 'RemoveDevice', 'SetConnected', 'SetCharging', 'SetBattery',
                    'SetRadio']);
  assert.deepEqual(types.filter(({ name }) => name === group).map(type => type['x-level']), [1]);
  for (const { name, params, 'x-level': level } of own) {
    assert.equal(level, 1, name);
    const { error } = await connection.call(name, params.map(() => 'corvex1-0411'));
    assert.equal(error?.code, codes.NotPermitted | 0, name);
  }
}));

test('Devices come, go and change', () => withStage(['--level', '1'], async connection => {
  const state = (type, connected, charging, battery, radio) => (
    { Type: type, Connected: connected, Charging: charging, Battery: battery, Radio: radio });
  for (const [name, params, outputs] of [
    ['Devices', [], { Urns: ['corvex1-0411'] }],
    ['DeviceState', ['corvex1-0411'], state('Corvex1', false, true, 87, 12)],
    ['AddDevice', ['a Gerät "1"', 'Any'], {}],
    ['Devices', [], { Urns: ['a Gerät "1"', 'corvex1-0411'] }],
    ['DeviceState', ['a Gerät "1"'], state('Any', true, false, 100, 0)],
    ['SetConnected', { Connected: false, Urn: 'a Gerät "1"' }, {}],
    ['SetCharging', ['a Gerät "1"', true], {}],
    ['SetBattery', ['a Gerät "1"', 7], {}],
    ['SetRadio', ['a Gerät "1"', 4294967295], {}],
    ['DeviceState', ['a Gerät "1"'], state('Any', false, true, 7, 4294967295)],
    ['RemoveDevice', ['corvex1-0411'], {}],
    ['Devices', [], { Urns: ['a Gerät "1"'] }],
  ])
    assertSucceeds(await connection.call(`${group}.${name}`, params), outputs);

  for (const [name, params, result, text, detail] of [
    ['DeviceState', ['corvex1-0411'], 'NotFound', 'If there is no device with the URN supplied.'],
    ['AddDevice', ['a Gerät "1"', 'Other'], 'AlreadyPresent', 'If there is a device with the URN supplied.'],
    ['SetBattery', ['a Gerät "1"', 101], 'InvalidValue', 'If the charge supplied is greater than 100.'],
    ['SetRadio', ['a Gerät "1"', -1], 'InvalidValue', '',
     'argument 2 "Radio": expected a whole number from 0 to 4294967295'],
    ['SetConnected', ['a Gerät "1"'], 'InvalidFormat', '', 'argument 2 "Connected": expected true or false'],
    ['Devices', [1], 'InvalidFormat', '', 'after 0 arguments: expected no further argument'],
  ]) {
    const { error } = await call(connection, name, ...params);
    const data = { code: codes[result], text, ...detail && { detail } };
    assert.deepEqual(error, { code: codes[result] | 0, message: result, data }, name);
  }
}));

test('A smart object is warned of its device', () => withStage(['--level', '1'], async connection => {
  const urn = 'corvex1-0500';
  const link = device => connection.call('SmartObjectServices.SetSmartClusterDeviceURN', ['Handset', 0, device]);
  const simulate = (name, ...params) => call(connection, name, urn, ...params);
  const changed = 'SmartObjectServices.SmartObjectChangedCallback';
  assertSucceeds(await connection.call('SmartObjectServices.SetEnabled', ['Handset', true]));
  assert.equal((await connection.call('Server.Subscribe', [changed])).result?.code, codes.Ok);
  for (const [edit, expected] of [
    [() => link('corvex1-0411'), [3, 13]],
    [() => link(urn), [4]],
    [() => simulate('AddDevice', 'Corvex1'), []],
    [() => simulate('SetConnected', false), [3]],
    [() => simulate('SetCharging', true), [3, 13]],
    [() => simulate('SetConnected', true), [13]],
    [() => simulate('SetCharging', false), []],
    [() => simulate('RemoveDevice'), [4]],
    [() => link(''), [5]],
  ]) {
    assertSucceeds(await edit());
    assert.equal((await connection.nextNotification()).method, changed, edit.toString());
    const { result } = await connection.call('SmartObjectServices.SmartObjectWarnings', ['Handset']);
    assert.deepEqual(result.outputs.Warnings.map(([number]) => number), expected, edit.toString());
  }
}));
