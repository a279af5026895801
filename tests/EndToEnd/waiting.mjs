// The waits of the tests: each ends when its time is up, and says what it waited for and what was there instead.

import { setTimeout as sleep } from 'node:timers/promises';
import { inspect } from 'node:util';

const slowness = Number(process.env.SUBJECT_STORE_TEST_SLOWNESS ?? 1);

// A time-out in milliseconds, longer for a build that is slow.
export function scaled(milliseconds) {
  return milliseconds * slowness;
}

// The promise's outcome, or a failure that says what did not happen in time. `seen`: returns what there is instead.
export async function inTime(promise, what, milliseconds = 5000, seen = () => undefined) {
  const timer = new AbortController();
  const late = sleep(scaled(milliseconds), undefined, { signal: timer.signal }).then(() => {
    const instead = seen();
    const text = typeof instead === 'string' ? instead : inspect(instead);
    throw new Error(`not within ${scaled(milliseconds)} ms: ${what}${instead === undefined ? '' : `\nbut: ${text}`}`);
  });
  late.catch(() => {});
  try {
    return await Promise.race([promise, late]);
  } finally {
    timer.abort();
  }
}

// Asks again and again until the condition, which may be a promise, is met; what it is then. A condition that throws
// ends the wait at once. `seen`: returns what there is instead; without it, what the condition was last.
export async function until(what, condition, { seconds = 5, pause = 5, seen } = {}) {
  let last;
  let over = false;
  const met = (async () => {
    while (!over && !(last = await condition()))
      await sleep(pause);
    return last;
  })();
  try {
    return await inTime(met, what, seconds * 1000, seen ?? (() => last));
  } finally {
    over = true;
  }
}
