// A disclosure button with its panel, and a row of tabs.

import { code, copyButton, h, newId } from './dom.js';

// A button that opens and closes a panel, which `fill()` makes when it is first opened.
export function disclosure(label, name, fill) {
  const id = newId('panel');
  const panel = h('div', { id, className: 'panel', hidden: true });
  const button = h('button', {
    type: 'button', className: 'disclose', 'aria-expanded': 'false', 'aria-controls': id,
    'aria-label': `${label}: ${name}`,
    on: {
      click() {
        panel.hidden = !panel.hidden;
        button.setAttribute('aria-expanded', String(!panel.hidden));
        if (!panel.hidden && !panel.hasChildNodes())
          panel.append(fill());
      },
    },
  }, label);
  return [button, panel];
}

// The language that was looked at last, for all snippets of the page.
let language = 'curl';

// A host may have made its certificate itself; who calls it has to be told.
function certificateHint() {
  return h('p', { className: 'hint' }, "Where the host's certificate is one that the machine does not know: ",
           code('--cacert FILE'), ' for curl, ', code('--tls-ca FILE'), ' for the command line, ',
           code('context=ssl.create_default_context(cafile=FILE)'), ' for urlopen.');
}

// Snippets as tabs. `make()` answers [language, text] each, or throws what keeps it from it. `refresh` shows them anew.
export function snippetTabs(make, name) {
  const tabs = h('div', { role: 'tablist', className: 'tabs', 'aria-label': `Languages of the snippet: ${name}` });
  const text = h('code', {});
  const pre = h('pre', { tabIndex: 0 }, text);
  const view = h('div', { role: 'tabpanel', id: newId('snippet') }, pre);
  let snippets = [];
  let current;

  function select(chosen, byUser) {
    current = snippets.find(([each]) => each === chosen) ?? snippets[0];
    if (byUser)
      language = chosen;
    for (const tab of tabs.children) {
      const selected = tab.textContent === current[0];
      tab.setAttribute('aria-selected', String(selected));
      tab.tabIndex = selected ? 0 : -1;
      if (selected) {
        view.setAttribute('aria-labelledby', tab.id);
        if (byUser)
          tab.focus();
      }
    }
    text.textContent = current[1];
  }

  function move({ key }) {
    const step = { ArrowRight: 1, ArrowLeft: -1 }[key];
    if (step === undefined)
      return;
    const next = (snippets.indexOf(current) + step + snippets.length) % snippets.length;
    select(snippets[next][0], true);
  }

  function refresh() {
    try {
      snippets = make();
    } catch (failure) {
      text.textContent = failure.message;
      return;
    }
    if (tabs.children.length === 0)
      tabs.append(...snippets.map(([each]) => h('button', {
        type: 'button', role: 'tab', id: newId('tab'), 'aria-controls': view.id,
        on: { click: () => select(each, true), keydown: move },
      }, each)));
    select(current?.[0] ?? language, false);
  }

  refresh();
  const row = h('div', { className: 'row' }, tabs, copyButton(() => text.textContent, `Copy the snippet: ${name}`));
  return { element: h('div', { className: 'snippets' }, row, view, location.protocol === 'https:' && certificateHint()),
           refresh };
}
