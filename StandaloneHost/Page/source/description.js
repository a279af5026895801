// The server's description, as the page shows it: groups with their functions, callbacks and enumerations.

const short = name => name.slice(name.indexOf('.') + 1);
const groupOf = name => name.slice(0, name.indexOf('.'));

// Beside the mark that the description's format has for it, a text may say so.
function isDeprecated({ deprecated, description = '' }) {
  return deprecated === true || /\bdeprecated\b/i.test(description);
}

// An argument or output: { name, text, schema }.
const argument = ({ name, description = '', schema = {} }) => ({ name, text: description, schema });

// The documented results of a method: { name, text, code }; `code` is unknown where the description has none.
function resultsOf(method) {
  const failures = [...method.errors ?? []];
  const lines = (method['x-resultDocumentation'] ?? '').split('\n').filter(line => line.trim() !== '');
  return lines.map(line => {
    const [, name, text] = /^(\w+) - (.*)$/.exec(line) ?? [, '', line];
    const found = failures.findIndex(({ data }) => name !== '' && data?.text === text);
    const [failure] = found < 0 ? [] : failures.splice(found, 1);
    return { name: failure?.message ?? name, text, code: failure?.data.code ?? (name === 'Ok' ? 0 : undefined) };
  });
}

function functionOf(method) {
  const { code, name, outputs, returned, ...rest } = method.result?.schema?.properties ?? {};
  const described = Object.entries({ ...outputs?.properties, ...rest })
    .map(([output, schema]) => argument({ name: output, description: schema.description, schema }));
  if (returned !== undefined)
    described.unshift(argument({ name: 'returned', description: 'The answer to the question.', schema: returned }));
  return {
    kind: 'function',
    name: method.name,
    short: short(method.name),
    group: method['x-group'] ?? groupOf(method.name),
    text: method.description ?? '',
    level: method['x-level'],
    deprecated: isDeprecated(method),
    inputs: (method.params ?? []).map(argument),
    outputs: described,
    results: resultsOf(method),
  };
}

function callbackOf(callback) {
  return {
    kind: 'callback',
    name: callback.name,
    short: short(callback.name),
    group: callback['x-group'] ?? groupOf(callback.name),
    text: callback.description ?? '',
    level: callback['x-level'],
    deprecated: isDeprecated(callback),
    inputs: (callback.params ?? []).map(argument),
    outputs: [],
    results: [],
  };
}

function enumerationOf(type) {
  return {
    kind: 'enumeration',
    name: type.name,
    short: short(type.name),
    group: groupOf(type.name),
    text: type.description ?? '',
    level: type['x-level'],
    values: type.values,
  };
}

// The name of the enumeration that a schema's numbers are of, if they are.
export function enumerationNamed(schema) {
  return schema['x-enumeration'];
}

// { title, text, groups: [{ name, text, functions, callbacks, enumerations }], functions, callbacks, enumerations:
// Map }, in the server's order. What the document lacks is empty; what is no description at all throws.
export function readDescription(document) {
  if (!Array.isArray(document?.methods))
    throw new Error('the answer is not a description of an API');
  const types = document['x-types'] ?? [];
  const functions = document.methods.map(functionOf);
  const callbacks = (document['x-callbacks'] ?? []).map(callbackOf);
  const enumerations = types.filter(({ name }) => name.includes('.')).map(enumerationOf);
  const names = new Set([...functions, ...callbacks, ...enumerations].map(({ group }) => group));
  const within = (group, list) => list.filter(entry => entry.group === group);
  return {
    title: document.info?.title ?? '',
    text: document.info?.description ?? '',
    groups: [...names].map(name => ({
      kind: 'group',
      name,
      text: types.find(type => type.name === name)?.description ?? '',
      functions: within(name, functions),
      callbacks: within(name, callbacks),
      enumerations: within(name, enumerations),
    })),
    functions,
    callbacks,
    enumerations: new Map(enumerations.map(entry => [entry.name, entry])),
  };
}
