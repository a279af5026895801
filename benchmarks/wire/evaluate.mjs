// Has a host evaluate its objects to the end, over and over, until it is told to stop: node evaluate.mjs URL
// Tells how often and how long it took. With --stage it writes a stage of 200 objects instead.

const random = (seed => () => {
  seed = (seed * 1103515245 + 12345) % 2147483648;
  return seed / 2147483648;
})(42);

function stage() {
  const objects = Array.from({ length: 200 }, (_, i) => {
    const markers = Array.from({ length: 8 + Math.floor(random() * 8) }, () =>
      `<Marker x="${(random() * 200).toFixed(1)}" y="${(random() * 160).toFixed(1)}" z="${(random() * 80).toFixed(1)}"/>`);
    return `<Subject kind="BasicObjects" name="Subject ${i}"><Markers>${markers.join('')}</Markers></Subject>`;
  });
  return `<SubjectConfiguration version="1"><Subjects>${objects.join('\n')}</Subjects></SubjectConfiguration>`;
}

async function call(url, method, params = []) {
  const response = await fetch(`${url}/rpc`, { method: 'POST', headers: { 'Content-Type': 'application/json' },
    body: JSON.stringify({ jsonrpc: '2.0', id: 1, method: `ObjectEvaluationServices.${method}`, params }) });
  return (await response.json()).result.outputs;
}

async function evaluateUntilStopped(url) {
  const times = [];
  let required = 0;
  let stopped = false;
  process.on('SIGTERM', () => { stopped = true; });
  while (!stopped) {
    const start = performance.now();
    await call(url, 'SetEnabled', [true]);
    for (let done = -1; (done !== required || required === 0) && performance.now() - start < 60000;) {
      await new Promise(later => setTimeout(later, 5));
      ({ Done: done, Required: required } = await call(url, 'Progress'));
    }
    times.push(performance.now() - start);
    await call(url, 'SetEnabled', [false]);
    await new Promise(later => setTimeout(later, 50)); // until it has forgotten everything
  }
  const mean = times.reduce((sum, time) => sum + time, 0) / times.length;
  console.log(`evaluated ${times.length} times, ${required} comparisons in ${mean.toFixed(0)} ms`);
}

if (process.argv[2] === '--stage')
  console.log(stage());
else
  await evaluateUntilStopped(process.argv[2]);
