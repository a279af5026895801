// Compiled, never run: what the compiler has to accept, and what it has to refuse.

import {
  EBasicObjectWarning, type ECharacterCalibrationState, ResultCode, SubjectStoreClient, SubjectStoreError,
} from 'subject-store-client';

const client = await SubjectStoreClient.connect('ws://127.0.0.1:8420/rpc', { token: 'secret' });
const { basicObjectServices: basic, objectEvaluationServices: evaluation } = client;

const color: string = (await basic.color({ Name: 'Crate' })).ColorHtml;
const warnings: [EBasicObjectWarning, string][] = (await basic.basicObjectWarnings({ Name: color })).Warnings;
const steps: bigint = (await evaluation.progress()).Done;
const distance: { Matches: boolean; MatchDistance: number } =
  await evaluation.matchDistance({ FirstObjectName: 'Crate', SecondObjectName: 'Barrel' }, { timeout: 500 });
const able: { returned: boolean; Reason: string } = await client.subjectCalibrationServices.canAcceptTPose();
const nothing: void = await basic.remove({ Name: 'Crate' });
const session: number = (await client.call('SubjectCalibrationServices.StartSubjectCalibration', { CaptureName: '' }))
  .outputs.SubjectCalibrationSession;
const { State } = await client.subjectCalibrationServices.latestSubjectCalibrationState();
const end: () => void = client.on('SubjectCalibrationServices.CanAcceptTPoseChangedCallback', ({ Able, sequence }) => {
  const told: [boolean, bigint] = [Able, sequence];
  void told;
});
client.on('epoch', ({ previous, current }) => previous === current);
void [warnings, steps, distance, able, nothing, session, end, client.hello.limits.messageBytes.toFixed()];

// @ts-expect-error no such function
await basic.colour({ Name: 'Crate' });
// @ts-expect-error no such function by name
await client.call('BasicObjectServices.Colour', { Name: 'Crate' });
// @ts-expect-error an input is missing
await basic.setColor({ Name: 'Crate' });
// @ts-expect-error an input of another name
await basic.color({ name: 'Crate' });
// @ts-expect-error an input of another type
await basic.setEnabled({ Name: 'Crate', Enabled: 'yes' });
// @ts-expect-error a function without inputs
await basic.basicObjectList({ Name: 'Crate' });
// @ts-expect-error a number is not exact enough
await evaluation.setMaximumEvaluationStepCount({ MaximumStepCount: 1 });
// @ts-expect-error an output of another name
void (await basic.color({ Name: 'Crate' })).Color;
// @ts-expect-error a value of another enumeration
const other: ECharacterCalibrationState = 17;
// @ts-expect-error the state has no such value
void (State === 99);
// @ts-expect-error no such callback
client.on('BasicObjectServices.BasicObjectChanged', () => {});
// @ts-expect-error the callback tells of something else
client.on('SubjectCalibrationServices.CanAcceptTPoseChangedCallback', ({ SessionId }) => SessionId);
// @ts-expect-error no such result
void (new SubjectStoreError('', 0, 'Ok', '', undefined).name === 'NotThere');
// @ts-expect-error codes are constants
ResultCode.NotFound = 0;
void other;
