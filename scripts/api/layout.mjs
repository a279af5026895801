// Lays out JSON without reading its numbers, which may be greater than a double holds.

const tokens = /"(?:[^"\\]|\\.)*"|[{}[\],:]|[^\s{}[\],:"]+/g;
const width = 100;

// The text without blanks between its tokens.
export function compact(json) {
  return json.match(tokens).join('');
}

// The text with a line for each member and element, but for what is short.
export function spread(json) {
  const all = json.match(tokens);
  let next = 0;

  function value(indent) {
    const first = all[next++];
    if (first !== '{' && first !== '[')
      return first;
    const parts = [];
    while (all[next] !== '}' && all[next] !== ']') {
      if (all[next] === ',')
        ++next;
      const name = first === '{' ? `${all[next]}: ` : '';
      if (first === '{')
        next += 2;
      parts.push(name + value(`${indent}  `));
    }
    const last = all[next++];
    const line = `${first}${parts.join(', ')}${last}`;
    if (!line.includes('\n') && indent.length + line.length <= width)
      return line;
    return `${first}\n${parts.map(part => `${indent}  ${part}`).join(',\n')}\n${indent}${last}`;
  }

  return `${value('')}\n`;
}
