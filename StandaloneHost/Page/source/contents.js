// The list of contents, and the search that narrows it and the reference down.

import { breakable, h, linkTo } from './dom.js';
import { counted } from './reference.js';

// Everything that can be searched for in a function, callback or enumeration, in lower case.
function searchText(record, enumerations) {
  const of = ({ name, text, schema }) => [name, text, schema?.['x-enumeration'] ?? ''];
  const values = record.values ?? [];
  return [record.name, record.text, record.level === 1 ? 'preview' : '', record.deprecated ? 'deprecated' : '',
          ...(record.inputs ?? []).flatMap(of), ...(record.outputs ?? []).flatMap(of),
          ...(record.results ?? []).flatMap(of), ...values.flatMap(({ name, description }) => [name, description])]
    .join('\n').toLowerCase();
}

// The links to all sections and what stands in them. A section: { group, element, entries: [{ record, element }] }.
export class Contents {
  #parts;
  #input;
  #found;
  #overview;

  constructor(sections, { nav, input, found, overview, enumerations }) {
    this.#input = input;
    this.#found = found;
    this.#overview = overview;
    this.#parts = sections.map(({ group, element, entries }) => {
      const items = entries.map(entry => ({
        ...entry,
        text: searchText(entry.record, enumerations),
        link: h('li', {}, linkTo(entry.record.name, breakable(entry.record.short), entry.record.kind)),
      }));
      const link = h('li', {}, linkTo(group.name, [h('span', {}, breakable(group.name)), h('span', { className: 'count' },
                                                                 String(group.functions.length))], 'group'),
                     h('ul', {}, items.map(item => item.link)));
      return { element, link, items };
    });
    nav.replaceChildren(h('details', { className: 'list', open: matchMedia('(min-width: 60rem)').matches },
                          h('summary', {}, 'Contents'), h('ul', {}, this.#parts.map(({ link }) => link))));
    input.addEventListener('input', () => this.search(input.value));
    input.addEventListener('keydown', event => this.#onKey(event));
    document.addEventListener('keydown', event => this.#onShortcut(event));
    // It may have been typed before there was anything to be searched, or kept by the browser.
    this.search(input.value);
  }

  // Shows what has all of the words; everything without a word.
  search(text) {
    const words = text.toLowerCase().split(/\s+/).filter(word => word !== '');
    const counts = { function: 0, callback: 0, enumeration: 0 };
    for (const { element, link, items } of this.#parts) {
      let any = false;
      for (const item of items) {
        const fits = words.every(word => item.text.includes(word));
        item.element.hidden = item.link.hidden = !fits;
        counts[item.record.kind] += Number(fits);
        any ||= fits;
      }
      element.hidden = link.hidden = !any;
    }
    this.#overview.hidden = words.length > 0;
    if (words.length > 0)
      scrollTo(0, 0);
    const found = Object.entries(counts).filter(([, count]) => count > 0).map(([kind, count]) => counted(count, kind));
    this.#found.textContent = words.length === 0 ? '' : found.join(', ') || 'Nothing has all of these words.';
    this.#highlight(words);
  }

  // Ends the search, if there is one.
  clear() {
    if (this.#input.value === '')
      return;
    this.#input.value = '';
    this.search('');
  }

  // Colours the words where they stand, where the browser can do so without changing the page.
  #highlight(words) {
    if (!globalThis.CSS?.highlights)
      return;
    CSS.highlights.delete('found');
    if (words.length === 0)
      return;
    const ranges = [];
    for (const { element } of this.#parts.flatMap(({ items }) => items).filter(({ element }) => !element.hidden)) {
      const walker = document.createTreeWalker(element, NodeFilter.SHOW_TEXT);
      for (let node = walker.nextNode(); node && ranges.length < 2000; node = walker.nextNode())
        ranges.push(...rangesIn(node, words));
    }
    CSS.highlights.set('found', new Highlight(...ranges));
  }

  #onKey(event) {
    if (event.key === 'Escape')
      this.clear();
    if (event.key !== 'Enter')
      return;
    const first = this.#parts.flatMap(({ items }) => items).find(({ element }) => !element.hidden);
    first?.element.scrollIntoView();
    first?.element.querySelector('h3').focus({ preventScroll: true });
  }

  #onShortcut(event) {
    const typing = event.target instanceof Element && event.target.closest('input, textarea, select');
    if (event.key !== '/' || typing || event.ctrlKey || event.metaKey || event.altKey)
      return;
    event.preventDefault();
    this.#input.focus();
    this.#input.select();
  }
}

function rangesIn(node, words) {
  const text = node.data.toLowerCase();
  if (text.length !== node.data.length)
    return []; // the places differ
  return words.flatMap(word => {
    const ranges = [];
    for (let at = text.indexOf(word); at >= 0; at = text.indexOf(word, at + word.length)) {
      const range = new Range();
      range.setStart(node, at);
      range.setEnd(node, at + word.length);
      ranges.push(range);
    }
    return ranges;
  });
}

// Marks the link to what is read, while the page is scrolled.
export function followReading(sections, nav) {
  const links = new Map(Array.from(nav.querySelectorAll('a'), link => [decodeURIComponent(link.hash.slice(1)), link]));
  let current;
  const observer = new IntersectionObserver(entries => {
    const entry = entries.find(({ isIntersecting }) => isIntersecting);
    if (!entry)
      return;
    current?.removeAttribute('aria-current');
    current = links.get(entry.target.id);
    current?.setAttribute('aria-current', 'true');
    const list = nav.querySelector('.list');
    if (current && list.scrollHeight > list.clientHeight && !nav.contains(document.activeElement)) {
      const offset = current.getBoundingClientRect().top - list.getBoundingClientRect().top;
      if (offset < 0 || offset > list.clientHeight - 32)
        list.scrollTop += offset - list.clientHeight / 3;
    }
  }, { rootMargin: '-20% 0px -75% 0px' });
  for (const { entries } of sections)
    entries.forEach(({ element }) => observer.observe(element));
}
