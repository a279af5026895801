// Writes source/generated.ts: the API as TypeScript has it, from the documents in docs/api.

import { readFileSync, writeFileSync } from 'node:fs';
import { fileURLToPath } from 'node:url';

const greeting = 'Server.Hello';

// A documentation comment; nothing without lines.
function comment(indent, lines) {
  const safe = lines.filter(line => line).map(line => line.replaceAll('*/', '*\\/'));
  if (safe.length <= 1)
    return safe.map(line => `${indent}/** ${line} */`);
  return [`${indent}/**`, ...safe.map(line => `${indent} * ${line}`), `${indent} */`];
}

function isWide(schema) {
  return schema.type === 'integer' && schema.maximum > Number.MAX_SAFE_INTEGER;
}

const lastPart = name => name.split('.').at(-1);
const lowerFirst = name => name[0].toLowerCase() + name.slice(1);
const groupOf = name => name.split('.')[0];

function typeOf(schema) {
  if (schema['x-enumeration'])
    return lastPart(schema['x-enumeration']);
  switch (schema.type) {
    case 'boolean':
    case 'string':
    case 'number':
      return schema.type;
    case 'integer':
      return isWide(schema) ? 'bigint' : 'number';
    case 'array':
      return Array.isArray(schema.items) ? `[${schema.items.map(typeOf).join(', ')}]` : arrayOf(schema.items);
    case 'object':
      return objectType('  ', Object.entries(schema.properties));
  }
  throw new Error(`${schema.title}: a type that the generator does not know: ${schema.type}`);
}

function arrayOf(items) {
  return Array.isArray(items.items) ? `[${items.items.map(typeOf).join(', ')}][]` : `${typeOf(items)}[]`;
}

// Members: [name, schema] with the description in the schema.
function objectType(indent, members) {
  if (members.length === 0)
    return 'Record<string, never>';
  const lines = members.flatMap(([name, schema]) => [
    ...comment(`${indent}  `, [schema.description]),
    `${indent}  ${name}: ${typeOf(schema)};`,
  ]);
  return ['{', ...lines, `${indent}}`].join('\n');
}

// "@deprecated(Release) Text" says it as TypeScript's tools understand it.
function description(record) {
  const [, release, text] = /^@deprecated(?:\((\w+)\))? *(.*)$/.exec(record.description) ?? [];
  const level = record['x-level'] === 1 ? 'Preview: refused unless the host was started with `--level 1`.' : '';
  return text === undefined ? [record.description, level]
                            : [level, `@deprecated ${release ? `(${release}) ` : ''}${text}`];
}

function enumeration(type) {
  const name = lastPart(type.name);
  return [
    ...comment('', description(type)),
    `export const ${name} = {`,
    ...type.values.flatMap(value => [...comment('  ', [value.description]), `  ${value.name}: ${value.value},`]),
    '} as const;',
    `export type ${name} = (typeof ${name})[keyof typeof ${name}];`, '',
  ];
}

function resultCodes(results) {
  return [
    '/** Every result code by name; failures have the highest bit set. */',
    'export const ResultCode = {',
    ...results.map(({ name, code }) => `  ${name}: 0x${code.toString(16).toUpperCase().padStart(8, '0')},`),
    '} as const;',
    'export type ResultName = keyof typeof ResultCode;', '',
  ];
}

const outputsOf = method => Object.entries(method.result.schema.properties.outputs.properties);
const returnsTruth = method => method.result.schema.properties.returned !== undefined;

function functionTypes(method) {
  const inputs = method.params.map(({ name, schema, description: text }) => [name, { ...schema, description: text }]);
  return [
    `  '${method.name}': {`,
    `    inputs: ${objectType('    ', inputs)};`,
    `    outputs: ${objectType('    ', outputsOf(method))};`,
    `    returned: ${returnsTruth(method) ? 'boolean' : 'undefined'};`,
    '  };',
  ];
}

function operation(method) {
  const { name, params, errors } = method;
  const outputs = outputsOf(method);
  const inputs = params.length > 0 ? `inputs: Inputs<'${name}'>, ` : '';
  const call = `await this.#caller.call('${name}', ${inputs ? 'inputs' : '{}'}, options)`;
  let answer = 'void';
  let body = `    ${call};`;
  if (returnsTruth(method)) {
    answer = `Outputs<'${name}'> & { returned: boolean }`;
    body = `    const { outputs, returned } = ${call};\n    return { ...outputs, returned };`;
  } else if (outputs.length > 0) {
    answer = `Outputs<'${name}'>`;
    body = `    return (${call}).outputs;`;
  }
  const documented = errors.map(({ message, data }) => `@throws SubjectStoreError \`${message}\`: ${data.text}`);
  const truth = returnsTruth(method) ? /^True - (.*)$/m.exec(method['x-resultDocumentation'] ?? '')?.[1] : undefined;
  return [
    ...comment('  ', [...description(method), truth && `@returns \`returned\`: ${truth}`, ...documented]),
    `  async ${lowerFirst(lastPart(name))}(${inputs}options?: CallOptions): Promise<${answer}> {`,
    body,
    '  }', '',
  ];
}

function groupClass(group, methods) {
  return [
    ...comment('', description(group)),
    `export class ${group.name} {`,
    '  readonly #caller: Caller;', '',
    '  constructor(caller: Caller) {',
    '    this.#caller = caller;',
    '  }', '',
    ...methods.filter(({ name }) => groupOf(name) === group.name).flatMap(operation).slice(0, -1),
    '}', '',
  ];
}

// What the server tells: [name, schema of the parameters, texts].
function notifications(asyncapi) {
  const { messages } = asyncapi.channels.rpc;
  return Object.entries(asyncapi.operations).filter(([, { action }]) => action === 'send')
    .map(([name, operation]) => [name, messages[name].payload.properties.params, operation]);
}

function wideMembers(methods, told) {
  const wide = [
    ...methods.map(method => [method.name, outputsOf(method)]),
    ...told.map(([name, params]) => [name, Object.entries(params.properties)]),
  ].map(([name, members]) => [name, members.filter(([, schema]) => isWide(schema)).map(([member]) => `'${member}'`)]);
  return [
    '/** The members of outputs and parameters that are 64 bits wide: always a bigint. */',
    'export const wideMembers: Readonly<Record<string, readonly string[]>> = {',
    ...wide.filter(([, members]) => members.length > 0).map(([name, members]) => `  '${name}': [${members.join(', ')}],`),
    '};', '',
  ];
}

function refuseDuplicates(names) {
  const twice = names.find((name, i) => names.indexOf(name) !== i);
  if (twice !== undefined)
    throw new Error(`two types would be called ${twice}`);
}

// The text of source/generated.ts. The documents as read; `hash`: what the greeting of their host says of the API.
export function generate(openrpc, asyncapi, hash) {
  const { methods: all, 'x-types': types, 'x-results': results } = openrpc;
  const groups = types.filter(({ values }) => values.length === 0);
  const enumerations = types.filter(({ values }) => values.length > 0);
  const methods = all.filter(({ name }) => groups.some(group => group.name === groupOf(name)));
  const told = notifications(asyncapi);
  const [, helloParams] = told.find(([name]) => name === greeting);
  const callbacks = told.filter(([name]) => name !== greeting);
  refuseDuplicates([...groups, ...enumerations].map(({ name }) => lastPart(name)));

  return [
    '// Written by generate.mjs from docs/api; changes made here are lost.', '',
    'import type { CallOptions, Caller, Inputs, Method, Outputs, Result } from \'./types.js\';', '',
    '/** What the greeting of a host with the same API says in `api`. */',
    `export const apiHash = '${hash}';`, '',
    ...resultCodes(results),
    ...enumerations.flatMap(enumeration),
    '/** The functions of the API by their full names. */',
    'export interface Functions {',
    ...methods.flatMap(functionTypes),
    '}', '',
    '/** The parameters of the callbacks by their full names. */',
    'export interface Callbacks {',
    ...callbacks.flatMap(([name, params, record]) => [
      ...comment('  ', description(record)),
      `  '${name}': ${objectType('  ', Object.entries(params.properties))};`,
    ]),
    '}', '',
    ...comment('', description({ ...asyncapi.operations[greeting] })),
    `export interface Hello ${objectType('', Object.entries(helloParams.properties))}`, '',
    ...wideMembers(methods, callbacks),
    ...groups.flatMap(group => groupClass(group, methods)),
    '/** The groups of the API, each as an object. */',
    'export abstract class Groups implements Caller {',
    ...groups.flatMap(group => [...comment('  ', description(group)),
                                `  readonly ${lowerFirst(group.name)} = new ${group.name}(this);`]), '',
    '  /** Calls a function by its full name. */',
    '  abstract call<M extends Method>(method: M, inputs: Inputs<M>, options?: CallOptions): Promise<Result<M>>;',
    '}', '',
  ].join('\n');
}

const self = fileURLToPath(import.meta.url);
if (process.argv[1] === self) {
  const { apiFiles } = await import('../../scripts/api/files.mjs');
  const document = name => readFileSync(new URL(`../../docs/api/${name}.json`, import.meta.url), 'utf8');
  const path = 'clients/typescript/source/generated.ts';
  writeFileSync(new URL('source/generated.ts', import.meta.url), apiFiles(document('openrpc'), document('asyncapi'))[path]);
}
