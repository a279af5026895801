// Asks for the token that the host was started with.

import { code, h } from './dom.js';
import { hasToken, setToken } from './rpc.js';

// The form, in a dialog that leaves only by a token or a refusal. `refused`: one was sent, and was wrong. Answers true
// when there is one to try.
export function askForToken(refused) {
  const input = h('input', { type: 'password', id: 'token', autocomplete: 'off', required: true, spellcheck: 'false',
                             'aria-describedby': 'token-about' });
  return new Promise(done => {
    const dialog = h('dialog', { 'aria-labelledby': 'token-title' },
                     h('form', { method: 'dialog', on: { submit: event => {
                       event.preventDefault();
                       setToken(input.value.trim());
                       dialog.close();
                     } } },
                       h('h2', { id: 'token-title' }, 'This host asks for a token'),
                       refused && h('p', { className: 'complaint', role: 'alert' }, 'The host did not accept that token.'),
                       h('p', { id: 'token-about' }, 'It is in the file that the host was started with, ',
                         code('--token-file'), '. This tab remembers it until it is closed.'),
                       h('label', { for: 'token' }, 'Token'), input,
                       h('p', { className: 'actions' }, h('button', { type: 'submit', className: 'primary' }, 'Use it'),
                         h('button', { type: 'button', on: { click: () => dialog.close() } }, 'Cancel'))));
    dialog.addEventListener('close', () => {
      dialog.remove();
      done(hasToken());
    });
    if (refused)
      setToken('');
    document.body.append(dialog);
    dialog.showModal();
    input.focus();
  });
}
