// The pane of notifications: the connection's state, and a bounded list of what it brought.

import { breakable, code, h, linkTo } from './dom.js';
import { valueOf } from './types.js';

const kept = 200;

const two = (number, width = 2) => String(number).padStart(width, '0');
const timeOf = date => `${two(date.getHours())}:${two(date.getMinutes())}:${two(date.getSeconds())}.${
  two(date.getMilliseconds(), 3)}`;

export class Notifications {
  #live;
  #callbacks;
  #enumerations;
  #waiting = [];
  #dropped = 0;
  #scheduled = false;
  #paused = false;
  #timer;
  #state = h('p', { className: 'state', role: 'status' });
  #notice = h('div', { className: 'notices', role: 'status' });
  #list = h('ol', { className: 'notifications', 'aria-label': 'Notifications, the newest first', tabIndex: 0 });
  #pause = h('button', { type: 'button', on: { click: () => this.#togglePause() } }, 'Pause');
  #all = h('button', { type: 'button', on: { click: () => this.#toggleAll() } });
  #empty = h('p', { className: 'muted' }, 'Nothing has been heard of yet. Subscribe to a callback to hear of changes.');

  constructor(live, { pane, callbacks, enumerations }) {
    this.#live = live;
    this.#callbacks = callbacks;
    this.#enumerations = enumerations;
    const body = h('div', { id: 'live-body', className: 'body' },
                   h('p', { className: 'actions' }, this.#all, this.#pause,
                     h('button', { type: 'button', on: { click: () => this.#clear() } }, 'Clear')),
                   this.#notice, this.#empty, this.#list);
    const toggle = h('button', {
      type: 'button', className: 'toggle', 'aria-expanded': 'false', 'aria-controls': body.id,
      on: {
        click() {
          const open = pane.classList.toggle('open');
          toggle.setAttribute('aria-expanded', String(open));
        },
      },
    }, 'Notifications');
    pane.replaceChildren(h('header', {}, h('h2', {}, 'Notifications'), toggle, this.#state), body);
    live.addEventListener('notification', ({ detail }) => this.#receive(detail));
    live.addEventListener('state', () => this.#showState());
    live.addEventListener('subscriptions', () => this.#showSubscriptions());
    live.addEventListener('epoch', () => this.note('The host was started anew: what was remembered of it may be stale. ' +
                                                   'The subscriptions have been renewed.'));
    this.#showState();
    this.#showSubscriptions();
  }

  // Tells what a subscription was answered, when it was refused.
  tell = (answer, name) => {
    const error = answer?.message.error;
    if (error)
      this.note(`${name}: ${error.message}. ${error.data?.text ?? ''}`);
  };

  complain = failure => this.note(failure.message);

  // Something to be read, until it is taken away.
  note(text, ...more) {
    const notice = h('div', { className: 'notice' }, h('p', {}, text, ...more),
                     h('button', { type: 'button', className: 'quiet', 'aria-label': 'Dismiss the notice',
                                   on: { click: () => notice.remove() } }, 'Dismiss'));
    this.#notice.prepend(notice);
    while (this.#notice.children.length > 3)
      this.#notice.lastChild.remove();
  }

  #receive(message) {
    this.#waiting.push({ message, time: new Date() });
    if (this.#waiting.length > kept) {
      this.#waiting.shift();
      ++this.#dropped;
    }
    if (this.#paused)
      this.#showPause();
    else
      this.#schedule();
  }

  // Many that come at once are shown at once.
  #schedule() {
    if (this.#scheduled)
      return;
    this.#scheduled = true;
    setTimeout(() => {
      this.#scheduled = false;
      if (!this.#paused)
        this.#show();
    }, 50);
  }

  #show() {
    const items = this.#waiting.reverse().map(({ message, time }) => this.#item(message, time));
    this.#waiting = [];
    this.#dropped = 0;
    this.#list.prepend(...items);
    while (this.#list.children.length > kept)
      this.#list.lastChild.remove();
    this.#empty.hidden = this.#list.children.length > 0;
  }

  #item({ method, params = {} }, time) {
    const { sequence, ...values } = params;
    const record = this.#callbacks.find(({ name }) => name === method);
    return h('li', {},
             h('p', { className: 'when' }, h('time', { dateTime: time.toISOString() }, timeOf(time)),
               h('span', { className: 'sequence' }, `sequence ${sequence}`)),
             linkTo(method, [h('span', { className: 'prefix' }, method.slice(0, method.indexOf('.') + 1)), h('wbr'),
                             breakable(method.slice(method.indexOf('.') + 1))]),
             Object.entries(values).map(([name, value]) => {
               const schema = record?.inputs.find(input => input.name === name)?.schema ?? {};
               return h('p', {}, h('span', { className: 'muted' }, code(name)), ' ',
                        valueOf(value, schema, this.#enumerations));
             }));
  }

  #clear() {
    this.#waiting = [];
    this.#dropped = 0;
    this.#list.replaceChildren();
    this.#empty.hidden = false;
    this.#showPause();
  }

  #togglePause() {
    this.#paused = !this.#paused;
    this.#showPause();
    if (!this.#paused)
      this.#show();
  }

  #showPause() {
    const waiting = this.#waiting.length + this.#dropped;
    this.#pause.textContent = !this.#paused ? 'Pause' : waiting > 0 ? `Go on (${waiting})` : 'Go on';
  }

  #allSubscribed() {
    return this.#callbacks.every(({ name }) => this.#live.subscribed.has(name));
  }

  async #toggleAll() {
    const method = this.#allSubscribed() ? 'Server.Unsubscribe' : 'Server.Subscribe';
    const granted = Number(this.#live.greeting?.levels?.granted ?? 0);
    for (const { name, level } of this.#callbacks) {
      if (level < granted)
        continue;
      try {
        this.tell(await this.#live.change(method, name), name);
      } catch (failure) {
        return this.complain(failure);
      }
    }
  }

  #showSubscriptions() {
    const number = this.#live.subscribed.size;
    this.#all.textContent = this.#allSubscribed() ? 'Unsubscribe all' : 'Subscribe to all';
    this.#empty.textContent = number === 0
      ? 'Nothing is subscribed to. Subscribe to a callback to hear of changes.'
      : 'Nothing has changed yet.';
  }

  #showState() {
    clearInterval(this.#timer);
    const { name, until, reason } = this.#live.state;
    this.#state.className = `state ${name}`;
    if (name === 'open') {
      this.#state.textContent = `Connected, session ${this.#live.greeting.session}`;
    } else if (name === 'connecting') {
      this.#state.textContent = 'Connecting…';
    } else {
      const left = h('span', { 'aria-hidden': 'true' });
      const count = () => {
        left.textContent = ` Next attempt in ${Math.max(0, Math.ceil((until - Date.now()) / 1000))} s.`;
      };
      count();
      this.#timer = setInterval(count, 1000);
      this.#state.replaceChildren(`Not connected${reason ? `: ${reason}` : ''}.`, left, ' ',
                                  h('button', { type: 'button', className: 'quiet',
                                                on: { click: () => this.#live.connect() } }, 'Connect now'));
    }
  }
}
