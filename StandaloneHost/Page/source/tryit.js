// The form in which a function is tried out: its arguments, the call, the answer, and the call as snippets.

import { code, copyButton, h } from './dom.js';
import { makeField, toParams } from './fields.js';
import { pretty } from './json.js';
import { snippetTabs } from './panels.js';
import { post, TokenWanted } from './rpc.js';
import { snippetsOfCall } from './snippets.js';
import { codeText, valueOf } from './types.js';

const longest = 100000;

function exchange(title, text) {
  const whole = pretty(text);
  const shown = whole.length > longest
    ? `${whole.slice(0, longest)}\n… ${whole.length - longest} characters more; Copy takes all of them` : whole;
  return h('div', { className: 'exchange' },
           h('div', { className: 'row' }, h('h4', {}, title), copyButton(() => whole, `Copy the ${title.toLowerCase()}`)),
           h('pre', { tabIndex: 0, 'aria-label': title }, code(shown)));
}

// What the function's documentation says of a result.
const documented = (record, name) => record.results.find(result => result.name === name)?.text ?? '';

function outcome(className, headline, took, ...details) {
  return h('div', { className: `outcome ${className}` },
           h('p', {}, h('strong', {}, headline), ' ', h('span', { className: 'muted' }, `in ${took} ms`)), details);
}

function succeeded(record, result, took, enumerations) {
  if (typeof result?.code !== 'number')
    return outcome('good', 'Answered', took);
  const { code: number, name, outputs = {}, ...rest } = result;
  const values = Object.entries({ ...rest, ...outputs });
  return outcome('good', `${name} (${codeText(number)})`, took,
                 h('p', {}, documented(record, name)),
                 values.length > 0 && h('dl', { className: 'outputs' }, values.map(([output, value]) => {
                   const schema = record.outputs.find(known => known.name === output)?.schema ?? {};
                   return h('div', {}, h('dt', {}, code(output)), h('dd', {}, valueOf(value, schema, enumerations)));
                 })));
}

function failed(error, took) {
  const { code: number, text, detail } = error.data ?? {};
  return outcome('bad', `${error.message} (${codeText(number ?? error.code)})`, took,
                 text && h('p', {}, text), detail && h('p', {}, detail));
}

// All texts in lists that answers brought, to be suggested where a text is typed.
function textsIn(value) {
  return Array.isArray(value) ? value.filter(text => typeof text === 'string' && text !== '').slice(0, 200) : [];
}

// The form. `services`: { live, enumerations, suggestions, wantToken }.
export function tryOut(record, services) {
  const { live, enumerations, suggestions, wantToken } = services;
  const fields = record.inputs.map(input => makeField(input, enumerations, suggestions.id));
  const values = () => record.inputs.map(({ name }, i) => [name, fields[i].read()]);
  const snippets = snippetTabs(() => snippetsOfCall(record.name, values()), record.name);
  const result = h('div', { className: 'result', role: 'status' });
  const exchanged = h('div', { className: 'exchanges' });
  const button = h('button', { type: 'submit', className: 'primary' }, 'Call');

  // Only the connection that notifications come over can be subscribed.
  function send(params) {
    const subscribes = record.name.startsWith('Server.');
    return subscribes ? live.change(record.name, JSON.parse(params).Name) : post(record.name, params);
  }

  async function call() {
    const params = toParams(values());
    const begin = performance.now();
    const answer = await send(params);
    const took = (performance.now() - begin).toFixed(1);
    if (answer === undefined)
      throw new Error('There is no connection for notifications at the moment; this is done when there is one.');
    const { request, text, message } = answer;
    if (message.result !== undefined)
      Object.values(message.result?.outputs ?? {}).forEach(value => suggestions.add(textsIn(value)));
    result.replaceChildren(
      message.error ? failed(message.error, took) : succeeded(record, message.result, took, enumerations));
    exchanged.replaceChildren(exchange('Request', request), exchange('Answer', text));
  }

  async function submit(event) {
    event.preventDefault();
    if (button.disabled)
      return;
    button.disabled = true;
    try {
      await call();
    } catch (failure) {
      const text = failure instanceof TokenWanted ? 'The host wants its token.' : failure.message;
      result.replaceChildren(h('div', { className: 'outcome bad' }, h('p', {}, text)));
      exchanged.replaceChildren();
      if (failure.cause instanceof Element)
        failure.cause.focus();
      if (failure instanceof TokenWanted)
        wantToken();
    } finally {
      button.disabled = false;
    }
  }

  const form = h('form', { className: 'form', 'aria-label': `Call ${record.name}`, noValidate: true,
                           on: { submit, input: snippets.refresh } },
                 fields.length > 0 ? fields.map(field => field.element) : h('p', { className: 'muted' }, 'No arguments.'),
                 h('p', { className: 'actions' }, button));
  return h('div', { className: 'try' }, h('div', { className: 'call' }, form, snippets.element), result, exchanged);
}
