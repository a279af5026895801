// Makes elements. Whatever comes as a child is inserted as text, never as markup.

// An element with these properties (those of the element, or attributes where it has no such property) and children.
// `on` holds listeners; children that are null or false are left out, lists are spread.
export function h(tag, properties = {}, ...children) {
  const element = document.createElement(tag);
  for (const [name, value] of Object.entries(properties)) {
    if (name === 'on') {
      for (const [event, listener] of Object.entries(value))
        element.addEventListener(event, listener);
    } else if (value === undefined || value === false) {
      continue;
    } else if (name in element && typeof value !== 'string') {
      element[name] = value;
    } else {
      element.setAttribute(name === 'className' ? 'class' : name, value);
    }
  }
  element.append(...children.flat(Infinity).filter(child => child !== undefined && child !== null && child !== false));
  return element;
}

let lastId = 0;

// An id that no other element has.
export function newId(what) {
  return `${what}-${++lastId}`;
}

export function code(...children) {
  return h('code', {}, ...children);
}

// A name that may be broken before its capitals and after its dots.
export function breakable(name) {
  return name.split(/(?<=\.)|(?<=[a-z])(?=[A-Z])/).flatMap((part, i) => i > 0 ? [h('wbr'), part] : [part]);
}

// Where the function, group, callback or enumeration of that name stands in the page.
export function linkTo(name, text = breakable(name), className = undefined) {
  return h('a', { href: `#/${encodeURIComponent(name)}`, className }, text);
}

// Puts a text into the clipboard; false when the browser lets nobody do so.
export async function copy(text) {
  try {
    await navigator.clipboard.writeText(text);
    return true;
  } catch {
    // There is none on a page that came without encryption from another machine.
    const field = h('textarea', { readOnly: true, className: 'unseen' });
    field.value = text;
    document.body.append(field);
    field.select();
    const done = document.execCommand('copy');
    field.remove();
    return done;
  }
}

// A button that copies what `text()` answers, and says that it did.
export function copyButton(text, label) {
  const words = h('span', { 'aria-live': 'polite' }, 'Copy');
  return h('button', {
    type: 'button', className: 'quiet', 'aria-label': label,
    on: {
      async click({ currentTarget }) {
        const done = await copy(text());
        words.textContent = done ? 'Copied' : 'Not copied';
        currentTarget.setAttribute('aria-label', `${label}: ${words.textContent.toLowerCase()}`);
        setTimeout(() => {
          words.textContent = 'Copy';
        }, 1500);
      },
    },
  }, words);
}
