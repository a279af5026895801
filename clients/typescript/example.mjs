import { EBasicObjectWarning, SubjectStoreClient, SubjectStoreError } from 'subject-store-client';

const client = await SubjectStoreClient.connect(process.argv[2] ?? 'ws://127.0.0.1:8420/rpc');
const { basicObjectServices, objectEvaluationServices } = client;

// Told of every change, after a loss of the connection too.
const watch = client.on('BasicObjectServices.BasicObjectChangedCallback',
                        ({ sequence }) => console.log(`changed (${sequence})`));
await watch.ready;

const { Names } = await basicObjectServices.basicObjectList();
for (const Name of Names) {
  const { ColorHtml } = await basicObjectServices.color({ Name });
  const { Warnings } = await basicObjectServices.basicObjectWarnings({ Name });
  const isConfusing = Warnings.some(([warning]) => warning === EBasicObjectWarning.ObjectConfusion);
  console.log(Name, ColorHtml, isConfusing ? 'looks like another' : '');
}

// Whole numbers of 64 bits are bigints.
await objectEvaluationServices.setMaximumEvaluationStepCount({ MaximumStepCount: 10n ** 18n });

try {
  await basicObjectServices.rename({ OldName: 'Nobody', NewName: 'Somebody' });
} catch (failure) {
  if (!(failure instanceof SubjectStoreError) || failure.name !== 'NotFound')
    throw failure;
  console.log(failure.message);
}

watch();
await client.close();
