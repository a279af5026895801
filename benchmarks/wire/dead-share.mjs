// Eight clients that ask for files of a share, over and over, until they are stopped: node dead-share.mjs URL FOLDER

const [url, folder] = process.argv.slice(2);

const calls = [
  ['SmartObjectServices.AddFromTemplate', ['Far', `${folder}/Far.sot`]],
  ['CharacterFromClustersServices.CreateCharacter', ['Far', `${folder}/Far.cct`]],
  ['CharacterFromClustersServices.SetCharacterRetargetPath', ['Ada', `${folder}/Far`]],
];

async function ask(client) {
  for (let number = client; ; ++number) {
    const [method, params] = calls[number % calls.length];
    await fetch(`${url}/rpc`, { method: 'POST', headers: { 'Content-Type': 'application/json' },
                                body: JSON.stringify({ jsonrpc: '2.0', id: 1, method, params }) });
    await new Promise(later => setTimeout(later, 50)); // refusals come at once
  }
}

process.on('SIGTERM', () => process.exit(0));
for (let client = 0; client < 8; ++client)
  ask(client).catch(() => process.exit(0));
