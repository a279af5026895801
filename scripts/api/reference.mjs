// Words the two documents that describe the API as one page for people.

const wireTypes = { boolean: 'truth value', number: 'double', string: 'text' };

function escaped(text) {
  return text.replace(/[\\`*_<>|[\]]/g, character => `\\${character}`);
}

// Links work within the page: its headings are the names.
function link(name) {
  return `[${name.split('.')[1]}](#${name.toLowerCase().replace(/[^\w-]/g, '')})`;
}

function typeOf(schema) {
  if (schema['x-enumeration'])
    return link(schema['x-enumeration']);
  if (schema.type === 'array')
    return Array.isArray(schema.items.items)
      ? `warnings: ${link(schema.items.items[0]['x-enumeration'])}`
      : `${schema.uniqueItems ? 'set' : 'list'} of texts`;
  if (schema.type === 'integer')
    return schema.maximum > 2 ** 32 ? 'unsigned 64-bit' : 'unsigned 32-bit';
  return wireTypes[schema.type];
}

function table(rows) {
  const lines = rows.map(cells => `| ${cells.join(' | ')} |`);
  return lines.length === 0 ? [] : ['| | name | type | |', '|---|---|---|---|', ...lines, ''];
}

function row(direction, name, schema, description) {
  return [direction, `\`${name}\``, typeOf(schema), escaped(description)];
}

// "Code - Meaning" lines as a list.
function results(documentation) {
  const lines = documentation.split('\n').filter(line => line !== '');
  return lines.map(line => line.replace(/^(\w+) - (.*)$/, (_, code, text) => `- \`${code}\`: ${escaped(text)}`));
}

// The description after its marks; "@deprecated(Release) " at its beginning is one.
function paragraph({ 'x-level': level, description }) {
  const [, mark = '', text] = /^@deprecated((?:\(\w+\))?) *(.*)$|/.exec(description);
  const marks = [...level === 1 ? ['**Preview.**'] : [], ...text !== undefined ? [`**Deprecated${mark && ` ${mark}`}.**`] : []];
  return [...marks, escaped(text ?? description)].join(' ');
}

function head(record) {
  return [`### ${record.name}`, '', paragraph(record), ''];
}

function describeFunction(method) {
  const { outputs, returned } = method.result.schema.properties;
  const rows = [
    ...method.params.map(({ name, schema, description }) => row('in', name, schema, description)),
    ...Object.entries(outputs.properties).map(([name, schema]) => row('out', name, schema, schema.description)),
  ];
  const answer = returned ? ['Answers a truth value, `returned`, beside its outputs.', ''] : [];
  const documented = method['x-resultDocumentation'] ??
                     method.errors.map(({ message, data }) => `${message} - ${data.text}`).join('\n');
  return [...head(method), ...table(rows), ...answer, ...results(documented), ''];
}

function describeCallback(callback) {
  return [...head(callback),
          ...table(callback.params.map(({ name, schema, description }) => row('with', name, schema, description)))];
}

function describeEnumeration(type) {
  return [...head(type), '| number | name | |', '|---|---|---|',
          ...type.values.map(({ name, value, description }) => `| ${value} | \`${name}\` | ${escaped(description)} |`), ''];
}

// What has its place under the group, in the order of the documents.
function describeGroup(group, { methods, callbacks, types }) {
  const isMember = ({ name }) => name.startsWith(`${group.name}.`);
  const section = (title, list, describe) =>
    list.some(isMember) ? [`**${title}**`, '', ...list.filter(isMember).flatMap(describe)] : [];
  return [`## ${group.name}`, '', paragraph(group), '',
          ...section('Functions', methods, describeFunction), ...section('Callbacks', callbacks, describeCallback),
          ...section('Enumerations', types.filter(({ values }) => values.length > 0), describeEnumeration)];
}

// `openrpc`: the document, read; `hash`: what the greeting says of the API.
export function reference(openrpc, hash) {
  const { methods, 'x-callbacks': callbacks, 'x-types': types, 'x-results': codes } = openrpc;
  const groups = types.filter(({ values }) => values.length === 0);
  const server = { name: 'Server', description: 'The server\'s own functions: docs/wire-protocol.md.', 'x-level': 2 };
  const described = [...groups, server].map(group => describeGroup(group, { methods, callbacks, types }));
  const contents = [...groups, server].map(({ name }) => `- [${name}](#${name.toLowerCase()})`);
  const unsigned = code => `0x${code.toString(16).toUpperCase().padStart(8, '0')}`;
  return [
    '# API reference', '',
    'Written by `scripts/describe-api` from what the host says of itself: [openrpc.json](openrpc.json),',
    '[asyncapi.json](asyncapi.json). How calls and notifications travel: [the wire protocol](../wire-protocol.md).', '',
    `\`api\` in the greeting: \`${hash}\``, '', ...contents, '- [Result codes](#result-codes)', '',
    ...described.flat(),
    '## Result codes', '', '| code | name |', '|---|---|',
    ...codes.map(({ name, code }) => `| ${unsigned(code)} | \`${name}\` |`), '',
  ].join('\n');
}
