// JSON without loss: whole numbers that a double does not hold keep all their digits.

const scalar = /"(?:[^"\\]|\\.)*"|-?\d+(?:\.\d+)?(?:[eE][+-]?\d+)?/g;
const tokens = /"(?:[^"\\]|\\.)*"|[{}[\],:]|[^\s{}[\],:"]+/g;

// Nobody outside can know it, so that no text is taken for a number.
const mark = `${Array.from(crypto.getRandomValues(new Uint32Array(4))).join('-')}:`;

// The value of a JSON text; a whole number that is not safe in a double becomes a BigInt. Throws a SyntaxError.
export function parse(text) {
  const marked = text.replace(scalar, token => {
    const unsafe = /^-?\d+$/.test(token) && !Number.isSafeInteger(Number(token));
    return unsafe ? JSON.stringify(mark + token) : token;
  });
  return JSON.parse(marked, (_, value) => {
    return typeof value === 'string' && value.startsWith(mark) ? BigInt(value.slice(mark.length)) : value;
  });
}

// The same JSON with line breaks where a line would grow over `width`; every token stays as it is.
export function pretty(text, width = 72) {
  const all = text.match(tokens) ?? [];
  let next = 0;

  function list(open, close, depth) {
    const items = [];
    while (next < all.length && all[next] !== close) {
      if (all[next] === ',') {
        ++next;
        continue;
      }
      const name = open === '{' ? `${all[next++]}: ` : '';
      next += open === '{' ? 1 : 0;
      items.push(name + value(depth + 1));
    }
    ++next;
    const line = open + items.join(', ') + close;
    if (line.length + 2 * depth <= width && !line.includes('\n'))
      return line;
    const indent = '  '.repeat(depth);
    return `${open}\n${items.map(item => `${indent}  ${item}`).join(',\n')}\n${indent}${close}`;
  }

  function value(depth) {
    const token = all[next++] ?? '';
    if (token === '{')
      return list('{', '}', depth);
    return token === '[' ? list('[', ']', depth) : token;
  }

  return value(0);
}
