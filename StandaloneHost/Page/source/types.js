// Types in words, and values as people read them.

import { code, h, linkTo } from './dom.js';
import { enumerationNamed } from './description.js';

const shortName = name => name.slice(name.indexOf('.') + 1);

function rangeOf({ minimum, maximum }) {
  if (minimum === undefined && maximum === undefined)
    return '';
  return maximum === undefined ? `, at least ${minimum}` : `, ${minimum ?? '…'} to ${maximum}`;
}

// The type of a schema, as text and links; that of an enumeration's number is the enumeration.
export function typeOf(schema) {
  const enumeration = enumerationNamed(schema);
  if (enumeration !== undefined)
    return [linkTo(enumeration, shortName(enumeration))];
  if (schema.type === 'array' && Array.isArray(schema.items))
    return ['[', ...schema.items.flatMap((item, i) => [i > 0 ? ', ' : '', ...typeOf(item)]), ']'];
  if (schema.type === 'array') {
    const kind = schema.uniqueItems ? 'set' : 'list';
    return schema.items?.type === 'string' ? [`${kind} of strings`] : [`${kind} of `, ...typeOf(schema.items ?? {})];
  }
  return [`${schema.type ?? 'any'}${rangeOf(schema)}`];
}

// A result code as people write it.
export function codeText(number) {
  return number >= 2 ** 31 ? `0x${number.toString(16).toUpperCase()}` : String(number);
}

// What an enumeration's number is called, or nothing.
export function nameOfValue(schema, number, enumerations) {
  const values = enumerations.get(enumerationNamed(schema))?.values ?? [];
  return values.find(({ value }) => value === number)?.name;
}

const shown = 1000;

function listOf(values, schema, enumerations) {
  if (values.length === 0)
    return h('span', { className: 'muted' }, 'none');
  const items = values.slice(0, shown).map(value => h('li', {}, valueOf(value, schema.items ?? {}, enumerations)));
  if (values.length > shown)
    items.push(h('li', { className: 'muted' }, `… ${values.length - shown} more, in the answer below`));
  return h('ul', { className: 'values' }, items);
}

// A value that a call brought, for people.
export function valueOf(value, schema, enumerations) {
  if (Array.isArray(value) && Array.isArray(schema.items))
    return value.map((part, i) => [i > 0 ? ': ' : '', typeof part === 'string'
      ? part : valueOf(part, schema.items[i] ?? {}, enumerations)]);
  if (Array.isArray(value))
    return listOf(value, schema, enumerations);
  const name = nameOfValue(schema, value, enumerations);
  if (name !== undefined)
    return [code(String(value)), ` ${name}`];
  if (value === '')
    return h('span', { className: 'muted' }, 'empty');
  return code(typeof value === 'object' ? JSON.stringify(value, (_, v) => typeof v === 'bigint' ? String(v) : v)
                                        : String(value));
}
