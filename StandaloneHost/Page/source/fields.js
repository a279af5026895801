// The fields in which the arguments of a call are typed, one for each type of the description.
//
// A value is what an argument may be, with numbers as they were typed: { kind: 'text', text }, { kind: 'truth', truth },
// { kind: 'number', text }, { kind: 'texts', texts } or { kind: 'json', text }.

import { h, newId } from './dom.js';
import { enumerationNamed } from './description.js';
import { typeOf } from './types.js';

const jsonNumber = /^-?(0|[1-9]\d*)(\.\d+)?([eE][+-]?\d+)?$/;

// The value as JSON text.
export function toJson(value) {
  switch (value.kind) {
  case 'text':
    return JSON.stringify(value.text);
  case 'truth':
    return String(value.truth);
  case 'texts':
    return `[${value.texts.map(text => JSON.stringify(text)).join(', ')}]`;
  default:
    return value.text;
  }
}

// The params of a call, by name, as JSON text. `values`: [name, value] each.
export function toParams(values) {
  return `{${values.map(([name, value]) => `${JSON.stringify(name)}: ${toJson(value)}`).join(', ')}}`;
}

function checkbox(id) {
  const input = h('input', { type: 'checkbox', id });
  return { input, read: () => ({ kind: 'truth', truth: input.checked }) };
}

function choice(id, enumeration) {
  const input = h('select', { id }, enumeration.values.map(({ name, value }) => (
    h('option', { value: String(value) }, `${name} (${value})`))));
  return { input, read: () => ({ kind: 'number', text: input.value }) };
}

// The server says which numbers it takes; here it only has to be one.
function number(id, schema) {
  const whole = schema.type === 'integer';
  const input = h('input', { type: 'text', id, inputmode: whole ? 'numeric' : 'decimal', value: '0',
                             autocomplete: 'off', spellcheck: 'false' });
  return {
    input,
    read() {
      const text = input.value.trim();
      if (!jsonNumber.test(text))
        throw new Error(`expected ${whole ? 'a whole number' : 'a number'}`);
      return { kind: 'number', text };
    },
  };
}

function line(id, suggestions) {
  const input = h('input', { type: 'text', id, list: suggestions, autocomplete: 'off', spellcheck: 'false' });
  return { input, read: () => ({ kind: 'text', text: input.value }) };
}

function lines(id) {
  const input = h('textarea', { id, rows: 3, spellcheck: 'false' });
  return {
    input,
    hint: 'One a line.',
    read: () => ({ kind: 'texts', texts: input.value.split('\n').filter(text => text !== '') }),
  };
}

// For types that no function takes today.
function json(id) {
  const input = h('textarea', { id, rows: 3, spellcheck: 'false' });
  return {
    input,
    hint: 'As JSON.',
    read() {
      try {
        JSON.parse(input.value);
      } catch {
        throw new Error('expected JSON');
      }
      return { kind: 'json', text: input.value };
    },
  };
}

function control(id, schema, enumerations, suggestions) {
  const enumeration = enumerations.get(enumerationNamed(schema));
  if (enumeration)
    return choice(id, enumeration);
  if (schema.type === 'boolean')
    return checkbox(id);
  if (schema.type === 'integer' || schema.type === 'number')
    return number(id, schema);
  if (schema.type === 'string')
    return line(id, suggestions);
  return schema.type === 'array' && schema.items?.type === 'string' ? lines(id) : json(id);
}

// The field of an argument: { element, read }. `read` answers the value, or throws when it is none, and says so at
// the field. `suggestions`: id of a list of texts that may be meant.
export function makeField(argument, enumerations, suggestions) {
  const id = newId('argument');
  const { input, hint, read } = control(id, argument.schema, enumerations, suggestions);
  const complaint = h('p', { id: `${id}-complaint`, className: 'complaint' });
  const about = h('p', { id: `${id}-about`, className: 'hint' }, argument.text, hint ? ` ${hint}` : '');
  input.setAttribute('aria-describedby', `${about.id} ${complaint.id}`);
  return {
    element: h('div', { className: `field ${input.type}` },
               h('p', { className: 'name' }, h('label', { for: id }, argument.name),
                 h('span', { className: 'type' }, typeOf(argument.schema))),
               input, about, complaint),
    input,
    read() {
      try {
        const value = read();
        input.removeAttribute('aria-invalid');
        complaint.textContent = '';
        return value;
      } catch (failure) {
        input.setAttribute('aria-invalid', 'true');
        complaint.textContent = `${argument.name}: ${failure.message}`;
        throw new Error(complaint.textContent, { cause: input });
      }
    },
  };
}
