// Reads the server's description and makes the page of it.

import { Contents, followReading } from './contents.js';
import { readDescription } from './description.js';
import { h } from './dom.js';
import { parse } from './json.js';
import { Live } from './live.js';
import { Notifications } from './notifications.js';
import { groupSection, overview } from './reference.js';
import { descriptionUrl, eventsUrl, fetchDescription, hasToken, rpcUrl, setToken, socketUrl, TokenWanted } from './rpc.js';
import { askForToken } from './token.js';

const main = document.getElementById('main');
const nav = document.getElementById('contents');

// Shows why there is nothing to be shown, with a way to try again.
function showFailure(text) {
  main.replaceChildren(h('section', { className: 'overview', role: 'alert' },
                         h('h1', {}, 'The description could not be read'), h('p', {}, text),
                         h('p', { className: 'actions' },
                           h('button', { type: 'button', className: 'primary', on: { click: start } }, 'Try again'))));
}

// The description's text; nothing when it was given up, which is then shown.
async function read() {
  for (;;) {
    try {
      return await fetchDescription();
    } catch (failure) {
      if (!(failure instanceof TokenWanted)) {
        showFailure(failure.message);
        return undefined;
      }
      if (!await askForToken(hasToken())) {
        showFailure('The host asks for a token.');
        return undefined;
      }
    }
  }
}

// Texts that answers brought, to be suggested in fields.
function suggestionList() {
  const list = h('datalist', { id: 'suggestions' });
  const known = new Set();
  document.body.append(list);
  return {
    id: list.id,
    add(texts) {
      for (const text of texts) {
        if (known.has(text) || known.size >= 500)
          continue;
        known.add(text);
        list.append(h('option', { value: text }));
      }
    },
  };
}

// Goes to what the address names after "#/".
function follow(contents) {
  if (!location.hash.startsWith('#/'))
    return;
  let target;
  try {
    target = document.getElementById(decodeURIComponent(location.hash.slice(1)));
  } catch {
    return; // not an address that this page made
  }
  if (!target)
    return;
  contents.clear();
  target.scrollIntoView();
  target.querySelector('h1, h2, h3')?.focus({ preventScroll: true });
}

// A token is forgotten by reading everything anew without it.
function forgetButton() {
  return h('button', { type: 'button', className: 'quiet', on: { click() {
    setToken('');
    location.reload();
  } } }, 'Forget the token');
}

function show(text) {
  const description = readDescription(parse(text));
  const live = new Live(description.callbacks.map(({ name }) => name));
  const notifications = new Notifications(live, { pane: document.getElementById('live'),
                                                  callbacks: description.callbacks,
                                                  enumerations: description.enumerations });
  const services = {
    live,
    notifications,
    enumerations: description.enumerations,
    suggestions: suggestionList(),
    async wantToken() {
      if (await askForToken(hasToken()))
        live.reconnect();
    },
  };
  const sections = description.groups.map(group => groupSection(group, services));
  const first = overview(description, { rpcUrl, socketUrl, descriptionUrl, eventsUrl });
  if (hasToken())
    first.append(forgetButton());
  main.replaceChildren(first, ...sections.map(({ element }) => element));
  const contents = new Contents(sections, { nav, input: document.getElementById('search'),
                                            found: document.getElementById('found'), overview: first,
                                            enumerations: description.enumerations });
  followReading(sections, nav);
  addEventListener('hashchange', () => follow(contents));
  follow(contents);

  // What is closed to calls at present is marked so; after a restart it may be another.
  live.addEventListener('state', () => {
    const granted = live.greeting?.levels?.granted;
    document.documentElement.classList.toggle('previews-open', granted !== undefined && granted <= 1);
  });
  live.addEventListener('epoch', async () => {
    const now = await fetchDescription().catch(() => text);
    if (now !== text)
      notifications.note('The host now describes itself in another way. ',
                         h('button', { type: 'button', on: { click: () => location.reload() } }, 'Read it anew'));
  });
  // A hidden page is given no time to try again.
  document.addEventListener('visibilitychange', () => {
    if (!document.hidden)
      live.connect();
  });
  live.connect();
}

async function start() {
  const text = await read();
  if (text === undefined)
    return;
  try {
    show(text);
  } catch (failure) {
    showFailure(`The host's description cannot be understood: ${failure.message}`);
  }
}

start();
