// The reference: a section for each group, an article for each function, callback and enumeration.

import { breakable, code, copyButton, h, linkTo } from './dom.js';
import { enumerationNamed } from './description.js';
import { disclosure, snippetTabs } from './panels.js';
import { hasToken } from './rpc.js';
import { snippetsOfCall, snippetsOfCallback } from './snippets.js';
import { tryOut } from './tryit.js';
import { codeText, typeOf } from './types.js';

export const counted = (number, one, many = `${one}s`) => `${number} ${number === 1 ? one : many}`;

function mark(className, ...text) {
  return h('span', { className: `mark ${className}` }, ...text);
}

// Which of them are a preview is known; whether the host has opened them, once it has greeted.
function previewMark() {
  return mark('preview', 'preview', h('span', { className: 'needs' }, ': needs --level 1'));
}

function heading(record) {
  const at = record.name.length - record.short.length;
  return h('h3', { tabIndex: -1 },
           h('span', { className: 'prefix' }, record.name.slice(0, at)), h('wbr'), breakable(record.short),
           record.kind !== 'function' && mark('kind', record.kind),
           record.level === 1 && previewMark(), record.deprecated && mark('deprecated', 'deprecated'),
           h('a', { className: 'anchor', href: `#/${encodeURIComponent(record.name)}`,
                    'aria-label': `Link to ${record.name}` }, '#'));
}

function rows(title, entries) {
  return entries.length > 0 && h('tbody', {}, h('tr', {}, h('th', { colSpan: 2, scope: 'rowgroup' }, title)), entries);
}

function row(name, about, ...text) {
  return h('tr', {}, h('th', { scope: 'row' }, code(breakable(name)), ' ', h('span', { className: 'type' }, about)),
           h('td', {}, text));
}

const outputRow = ({ name, text, schema }) => row(name, typeOf(schema), text);
const resultRow = ({ name, text, code: number }) => row(name, number === undefined ? '' : codeText(number), text);

// With the numbers that an enumeration allows.
function inputRow({ name, text, schema }, enumerations) {
  const choices = enumerations.get(enumerationNamed(schema))?.values ?? [];
  return row(name, typeOf(schema), text, choices.length > 0 && h('ul', { className: 'choices' }, choices.map(
    choice => h('li', {}, code(String(choice.value)), ` ${choice.name}`))));
}

function details(record, enumerations) {
  const { inputs, outputs, results } = record;
  return inputs.length + outputs.length + results.length > 0 &&
    h('table', { className: 'details', 'aria-label': `Arguments and results of ${record.name}` },
      h('colgroup', {}, h('col'), h('col')),
      rows(record.kind === 'callback' ? 'Arguments' : 'Inputs', inputs.map(input => inputRow(input, enumerations))),
      rows('Outputs', outputs.map(outputRow)),
      rows('Results', results.map(resultRow)));
}

function article(record, ...content) {
  return h('article', { id: `/${record.name}`, className: record.kind }, heading(record),
           h('p', { className: 'text' }, record.text), content);
}

function functionArticle(record, services) {
  return article(record, details(record, services.enumerations),
                 disclosure('Try it, copy it', record.name, () => tryOut(record, services)));
}

// A button that follows whether the callback is subscribed to.
function subscription(record, live, notifications) {
  const button = h('button', {
    type: 'button',
    on: {
      click() {
        const method = live.subscribed.has(record.name) ? 'Server.Unsubscribe' : 'Server.Subscribe';
        live.change(method, record.name).then(answer => notifications.tell(answer, record.name), notifications.complain);
      },
    },
  });
  const follow = () => {
    const subscribed = live.subscribed.has(record.name);
    button.textContent = subscribed ? 'Unsubscribe' : 'Subscribe';
    button.setAttribute('aria-label', `${button.textContent}: ${record.name}`);
    button.classList.toggle('subscribed', subscribed);
  };
  live.addEventListener('subscriptions', follow);
  follow();
  return button;
}

function callbackArticle(record, { live, notifications, enumerations }) {
  return article(record, details(record, enumerations), subscription(record, live, notifications),
                 disclosure('Copy it', record.name, () => snippetTabs(() => snippetsOfCallback(record.name),
                                                                      record.name).element));
}

function enumerationArticle(record) {
  return article(record, h('table', { className: 'enumeration', 'aria-label': `Values of ${record.name}` },
    h('thead', {}, h('tr', {}, ['Value', 'Name', 'Meaning'].map(title => h('th', { scope: 'col' }, title)))),
    h('tbody', {}, record.values.map(({ value, name, description }) => h('tr', {},
      h('td', {}, String(value)), h('th', { scope: 'row' }, code(breakable(name))), h('td', {}, description ?? ''))))));
}

const kinds = [
  ['functions', 'function', functionArticle],
  ['callbacks', 'callback', callbackArticle],
  ['enumerations', 'enumeration', enumerationArticle],
];

// What a group has, in numbers.
export function countsOf(group) {
  return kinds.filter(([kind]) => group[kind].length > 0).map(([kind, one]) => counted(group[kind].length, one)).join(', ');
}

// The section of a group, and what stands in it: { element, entries: [{ record, element }] }.
export function groupSection(group, services) {
  const entries = kinds.flatMap(([kind, , make]) => (
    group[kind].map(record => ({ record, element: make(record, services) }))));
  const element = h('section', { id: `/${group.name}`, className: 'group', 'aria-label': group.name },
                    h('h2', { tabIndex: -1 }, group.name, h('span', { className: 'count' }, countsOf(group))),
                    group.text && h('p', { className: 'text' }, group.text),
                    entries.map(entry => entry.element));
  return { group, element, entries };
}

// A call that needs nothing to be known, ready to be copied.
function firstCall({ functions }) {
  const first = functions.find(({ inputs, level }) => inputs.length === 0 && level !== 1);
  return first && [h('h2', {}, 'A first call'), h('p', { className: 'text' }, linkTo(first.name), ': ', first.text),
                   snippetTabs(() => snippetsOfCall(first.name, []), first.name).element];
}

// How to call and to listen, above all groups.
export function overview(description, { rpcUrl, socketUrl, descriptionUrl, eventsUrl }) {
  const link = !hasToken(); // a link could not show it
  const address = (label, url, text, linked) => h('div', {}, h('dt', {}, label), h('dd', {},
    linked ? h('a', { href: url }, code(url)) : code(url), ' ', copyButton(() => url, `Copy the address: ${label}`),
    h('span', { className: 'muted' }, text)));
  return h('section', { id: '/', className: 'overview', 'aria-label': 'Overview' },
           h('h1', { tabIndex: -1 }, description.title), h('p', { className: 'text' }, description.text),
           h('dl', { className: 'addresses' },
             address('Calls', rpcUrl, 'JSON-RPC 2.0: post one request or a batch'),
             address('Calls and notifications', socketUrl, 'WebSocket: the same, and notifications of changes'),
             address('Description', descriptionUrl, 'for programs (OpenRPC); this page is made from it', link),
             address('Notifications', eventsUrl, 'what is told over a WebSocket, for programs (AsyncAPI)', link)),
           firstCall(description),
           h('h2', {}, 'Groups'),
           h('ul', { className: 'groups' }, description.groups.map(group => h('li', {},
             linkTo(group.name), h('span', { className: 'muted' }, countsOf(group)),
             h('p', {}, group.text)))));
}
