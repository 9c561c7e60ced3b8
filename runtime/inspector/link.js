'use strict';
// What all parts of the page share: elements made of texts, and the link to the program. Nothing that the program says
// is taken for HTML: it comes as text, and is put where text stands.

const byId = id => document.getElementById(id);

// An element: attributes, listeners (`onclick`), and children, of which strings are text.
function make(tag, attributes = {}, ...children) {
  const element = document.createElement(tag);
  for (const [name, value] of Object.entries(attributes)) {
    if (value === undefined || value === null || value === false) continue;
    if (name.startsWith('on')) element.addEventListener(name.slice(2), value);
    else if (name === 'className') element.className = value;
    else element.setAttribute(name, value === true ? '' : value);
  }
  element.append(...children.filter(child => child !== undefined && child !== null && child !== false));
  return element;
}

let alertTimer = 0;
function say(text) {
  byId('alert').textContent = text;
  byId('alert').hidden = false;
  clearTimeout(alertTimer);
  alertTimer = setTimeout(() => { byId('alert').hidden = true; }, 6000);
}

// The link: asks, and hears what it did not ask for. A link that breaks is taken up again for a while.
const link = {
  socket: null, waiting: new Map(), lastId: 0, tries: 0, hello: null, listeners: {},

  on(event, listener) { (this.listeners[event] ||= []).push(listener); },
  tell(event, data) { for (const listener of this.listeners[event] || []) listener(data); },

  open() {
    const address = location.href.replace(/^http/, 'ws').replace(/[?#].*$/, '').replace(/\/$/, '') + '/live';
    const socket = this.socket = new WebSocket(address);
    socket.binaryType = 'arraybuffer';
    socket.onopen = () => this.greet();
    socket.onmessage = event => this.hear(JSON.parse(event.data));
    socket.onclose = () => this.lose(socket);
  },
  async greet() {
    const hello = await this.ask('hello');
    this.tries = 0;
    this.hello = hello;
    this.tell('hello', hello);
    this.state('Live', 'good');
  },
  lose(socket) {
    if (socket !== this.socket) return;
    for (const { fail } of this.waiting.values()) fail(new Error('the program is gone'));
    this.waiting.clear();
    this.tell('lost');
    if (this.tries++ < 20) {
      this.state('The program has ended, or is busy', 'bad');
      setTimeout(() => this.open(), Math.min(250 * this.tries, 3000));
    } else {
      this.state('The program has ended', 'bad');
    }
  },
  state(text, kind) {
    byId('state').textContent = text;
    byId('state').className = kind;
  },

  hear(message) {
    if (message.push) return this.tell('push', message);
    const waiting = this.waiting.get(message.id);
    this.waiting.delete(message.id);
    if (!waiting) return;
    if (message.error !== undefined) waiting.fail(new Error(message.error));
    else waiting.done(message.ok);
  },
  // A request with bytes behind it.
  send(message, bytes) {
    const head = new TextEncoder().encode(`${JSON.stringify({ id: ++this.lastId, ...message })}\n`);
    const data = new Uint8Array(head.length + bytes.byteLength);
    data.set(head);
    data.set(new Uint8Array(bytes), head.length);
    return this.wait(this.lastId, data);
  },
  // A promise of the answer. `json` has members that are put in as they are: JSON that was written already.
  ask(request, members = {}, json = {}) {
    const id = ++this.lastId;
    let text = JSON.stringify({ id, do: request, ...members }).slice(0, -1);
    for (const [name, value] of Object.entries(json)) text += `,${JSON.stringify(name)}:${value}`;
    text += '}';
    return this.wait(id, text);
  },
  wait(id, data) {
    return new Promise((done, fail) => {
      if (!this.socket || this.socket.readyState !== WebSocket.OPEN) return fail(new Error('the program is gone'));
      this.waiting.set(id, { done, fail });
      this.socket.send(data);
    });
  },
};

// For who only wants to have it done: what goes wrong is said.
async function attempt(promise) {
  try {
    return await promise;
  } catch (error) {
    say(error.message);
    return undefined;
  }
}

const keyOf = path => JSON.stringify(path);
// orders.lines[2].amount
function pathText(path) {
  return path.map((step, at) => {
    if (typeof step === 'number') return `[${step}]`;
    if (typeof step === 'object') return `[${step.k === undefined ? `entry ${step.at}` : step.k}]`;
    return at === 0 ? step : `.${step}`;
  }).join('');
}
