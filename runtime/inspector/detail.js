// What stands beside the tree: all of the row that is selected, its editor, and the methods of its class.

const kWide = /^(u?int64|u?int128)$/;  // whole numbers of these types are JSON strings

// An editor of a value by its kind. `json` gives what is to be sent, `input` is what to listen to.
function editorOf({ kind, type, value, labels, min, max, color, name }) {
  const label = { 'aria-label': name };
  if (kind === 'bool') {
    const input = make('input', { type: 'checkbox', ...label });
    input.checked = value === true;
    return { input, elements: [input], json: () => JSON.stringify(input.checked), isQuick: true, take: now => { input.checked = now; } };
  }
  if (kind === 'enum') {
    const input = make('select', label, ...(labels || []).map(item => make('option', { value: item.label, disabled: item.off }, item.label)));
    if (value !== undefined && !(labels || []).some(item => item.label === value)) input.append(make('option', { value }, String(value)));
    if (value !== undefined) input.value = value;
    return { input, elements: [input], json: () => JSON.stringify(input.value), isQuick: true, take: now => { input.value = now; } };
  }
  if (kind === 'int' || kind === 'uint' || kind === 'float') return numberEditor({ kind, type, value, min, max, color, label });
  if (kind === 'text') {
    const isColor = color && /^#[0-9a-f]{6}$/i.test(value || '');
    const input = isColor ? make('input', { type: 'color', ...label }) : make('textarea', { rows: 3, spellcheck: 'false', ...label });
    input.value = value === undefined ? '' : value;
    return { input, elements: [input], json: () => JSON.stringify(input.value), isQuick: isColor, take: now => { input.value = now; } };
  }
  const input = make('input', { type: 'text', spellcheck: 'false', ...label });
  input.value = kind === 'char' ? (value === undefined ? '' : value) : value === undefined ? defaultJson(kind) : JSON.stringify(value);
  return { input, elements: [input], take: now => { input.value = now; },
    json: () => (kind === 'char' ? JSON.stringify(input.value) : JSON.stringify(JSON.parse(input.value))) };
}
function defaultJson(kind) {
  return { list: '[]', set: '[]', map: '{}', class: '{}' }[kind] || 'null';
}
function numberEditor({ kind, type, value, min, max, color, label }) {
  const isWide = kWide.test(type || '');
  if (color && !isWide) {
    const input = make('input', { type: 'color', ...label });
    input.value = colorOf(String(value));
    return { input, elements: [input], json: () => String(parseInt(input.value.slice(1), 16)), isQuick: true,
      take: now => { input.value = colorOf(String(now)); } };
  }
  const isPlain = typeof value === 'number' || (value === undefined && !isWide);
  const input = make('input', { type: isPlain ? 'number' : 'text', step: kind === 'float' ? 'any' : 1, min, max, ...label });
  input.value = value === undefined ? 0 : value;
  const json = () => {
    const text = input.value.trim();
    if (kind === 'float' && !/^[-+]?(\d+\.?\d*|\.\d+)(e[-+]?\d+)?$/i.test(text)) return JSON.stringify(text);
    return isWide || !text ? JSON.stringify(text) : String(Number(text));
  };
  const elements = [input];
  if (isPlain && min !== undefined && max !== undefined) {
    const slider = make('input', { type: 'range', min, max, step: kind === 'float' ? (max - min) / 200 : 1, 'aria-label': `${label['aria-label']}, slider` });
    slider.value = input.value;
    slider.addEventListener('input', () => { input.value = slider.value; });
    slider.addEventListener('change', () => input.dispatchEvent(new Event('commit')));
    input.addEventListener('input', () => { slider.value = input.value; });
    elements.push(slider);
  }
  const take = now => {
    input.value = now;
    if (elements[1]) elements[1].value = now;
  };
  return { input, elements, json, take };
}

const detail = {
  element: null, node: null, shown: null, timer: 0, isDirty: false,

  start(element) {
    this.element = element;
    link.on('hello', () => this.node && this.load());
    this.show(null);
  },
  show(node) {
    if (node === this.node && node) return;
    this.node = node;
    this.isDirty = false;
    if (node) return this.load();
    this.shape = this.drawn = '';
    this.element.replaceChildren(make('p', { className: 'empty' }, 'Select a value to see all of it.'));
  },
  // The row has changed: what is being typed stays.
  refresh(isOther) {
    if (isOther) this.isDirty = false;
    this.timer ||= setTimeout(() => {
      this.timer = 0;
      if (this.node && !this.isBusy()) this.load();
    }, 150);
  },
  isBusy() {
    const active = document.activeElement;
    return this.isDirty || (this.element.contains(active) && active.matches('input:not([type=checkbox]), textarea, select'));
  },
  focus() {
    const input = this.element.querySelector('.editor input, .editor select, .editor textarea');
    if (input) input.focus();
    return !!input;
  },
  async load() {
    const node = this.node;
    const look = await link.ask('look', { path: node.path }).catch(error => ({ name: node.row.name, kind: 'none', text: error.message, bad: true }));
    if (node !== this.node) return;
    route.remember();
    // A value that changes is written over what is there: a button that moved could not be pressed.
    const shape = JSON.stringify([node.key, { ...look, text: 0, count: 0, value: look.kind === 'variant' && look.value, has: look.value !== undefined }]);
    this.look = look;
    if (shape === this.shape) return this.patch(look);
    const methods = this.typed();
    const isSame = this.drawn === node.key;
    this.shape = shape;
    this.drawn = node.key;
    this.list = this.facts(look);
    this.editing = this.plain = null;
    this.element.replaceChildren(...[
      make('p', { className: 'path mono' }, pathText(node.path)),
      make('h2', {}, look.name),
      look.help && make('p', { className: 'note' }, look.help),
      this.list, this.graphTools(look, node), this.value(look), this.listTools(look), this.elementTools(node), ...this.methods(look)].filter(Boolean));
    if (isSame) this.restore(methods);
  },
  patch(look) {
    const facts = this.facts(look);
    this.list.replaceWith(facts);
    this.list = facts;
    if (this.editing) this.editing.take(look.value);
    if (this.plain) this.plain.textContent = this.plainText(look);
  },

  facts(look) {
    const list = make('dl', { className: 'facts' });
    const add = (name, ...value) => list.append(make('dt', {}, name), make('dd', {}, ...value));
    if (look.type) add('Type', typeLink(look.type));
    if (look.class && look.class !== look.type) add('Class', typeLink(look.class));
    if (look.count !== undefined) add(look.class ? 'Members' : 'Elements', look.count.toLocaleString('en'));
    if (look.unit) add('Unit', look.unit);
    if (look.min !== undefined || look.max !== undefined) add('Range', `${look.min ?? '…'} to ${look.max ?? '…'}`);
    if (look.metadata) add('Metadata', make('span', { className: 'mono' }, look.metadata));
    if (look.fresh !== undefined) add('Calculated', look.fresh ? 'up to date' : make('span', { className: 'odd' }, 'stale: the next read calculates it'));
    return list;
  },
  value(look) {
    if (!look.editable || look.value === undefined) return this.plainValue(look);
    return look.kind === 'variant' ? this.variantEditor(look) : this.editor(look);
  },
  plainText(look) {
    const text = typeof look.value === 'string' ? look.value : look.value === undefined || look.kind !== 'variant' ? look.text : JSON.stringify(look.value, null, 1);
    return text && look.unit ? `${text} ${look.unit}` : text;
  },
  plainValue(look) {
    this.plain = make('pre', { className: look.bad ? 'bad' : '' }, this.plainText(look));
    return this.plain;
  },
  editor(look) {
    const editor = this.editing = editorOf(look);
    const form = make('form', { className: 'line editor' }, ...editor.elements, look.unit && make('span', { className: 'note' }, look.unit),
      !editor.isQuick && make('button', { className: 'main' }, 'Set'));
    return this.wire(form, editor);
  },
  wire(form, editor) {
    const send = async event => {
      event.preventDefault();
      await this.change('set', { path: this.node.path }, editor.json);
    };
    form.addEventListener('submit', send);
    form.addEventListener('input', () => { this.isDirty = true; });
    if (editor.isQuick) editor.input.addEventListener('change', send);
    editor.input.addEventListener('commit', send);
    editor.input.addEventListener('keydown', event => {
      if (event.key === 'Escape') this.leave();
      if (event.key === 'Enter' && (event.ctrlKey || event.metaKey)) send(event);
    });
    return form;
  },
  leave() {
    this.isDirty = false;
    this.load();
    tree.element.focus();
  },
  variantEditor(look) {
    const [item, value] = Object.entries(look.value)[0];
    const select = make('select', { 'aria-label': `${look.name}: item` }, ...look.items.map(name => make('option', {}, name)));
    select.value = item;
    const text = make('textarea', { rows: 3, spellcheck: 'false', 'aria-label': `${look.name}: value as JSON` });
    text.value = JSON.stringify(value, null, 1);
    select.addEventListener('change', () => { text.value = select.value === item ? JSON.stringify(value, null, 1) : 'null'; });
    const json = () => JSON.stringify({ [select.value]: JSON.parse(text.value) });
    const form = make('form', { className: 'line editor' }, select, text, make('button', { className: 'main' }, 'Set'));
    return this.wire(form, { input: text, json });
  },
  graphTools(look, node) {
    if (look.fresh === undefined && !look.graph) return null;
    const calculate = async () => {
      await attempt(link.ask('calculate', { path: node.path }));
      this.load();
    };
    return make('div', { className: 'line' },
      make('button', { type: 'button', onclick: () => graph.show({ path: node.path }, pathText(node.path)) }, 'Graph'),
      look.fresh === false && link.hello.changes && make('button', { type: 'button', onclick: calculate }, 'Calculate'));
  },
  listTools(look) {
    if (look.list !== 'all') return null;
    const add = () => this.change('insert', { path: this.node.path, at: this.look.count || 0 });
    return make('div', { className: 'line' }, make('button', { type: 'button', onclick: add }, 'Add an element'));
  },
  elementTools(node) {
    const list = node.parent;
    if (!link.hello || !link.hello.changes || !list || !list.row || list.row.kind !== 'list' || typeof node.row.step !== 'number') return null;
    const at = node.position;
    const path = list.path;
    const move = to => async () => {
      if (await this.change('move', { path, from: at, to }) !== undefined) tree.go(tree.selected.index() + to - at);
    };
    const isPlain = !list.row.type.includes('ref<');  // references only change their order
    return make('div', { className: 'line' },
      isPlain && make('button', { type: 'button', onclick: () => this.change('insert', { path, at }) }, 'Insert ahead'),
      make('button', { type: 'button', onclick: move(at - 1), disabled: at === 0 }, 'Move up'),
      make('button', { type: 'button', onclick: move(at + 1), disabled: at + 1 >= list.count }, 'Move down'),
      isPlain && make('button', { type: 'button', onclick: () => this.change('remove', { path, at }) }, 'Remove'));
  },
  async change(request, members, json) {
    const answer = await attempt((async () => link.ask(request, members, json && { value: json() }))());
    if (answer === undefined) return undefined;
    this.isDirty = false;
    if (this.node) this.load();
    return answer;
  },

  methods(look) {
    if (!look.methods || !look.methods.length) return [];
    return [make('h3', {}, 'Methods'), ...look.methods.map(method => this.method(method))];
  },
  method(method) {
    const editors = method.args.map(argument => editorOf(argument));
    const result = make('div', { className: 'result mono', 'aria-live': 'polite' });
    const signature = `${method.name}(${method.args.map(argument => argument.type).join(', ')})${method.const ? ' const' : ''} → ${method.result}`;
    const form = make('form', { className: 'method', 'data-method': method.name },
      make('div', { className: 'mono' }, signature),
      method.help && make('p', { className: 'note' }, method.help),
      ...method.args.map((argument, i) => make('label', {}, argument.name, make('span', { className: 'line' }, ...editors[i].elements))),
      method.trouble ? make('p', { className: 'note' }, `Not to be called from here (${method.trouble})`)
        : make('div', { className: 'line' }, make('button', {}, 'Call')), result);
    form.addEventListener('submit', async event => {
      event.preventDefault();
      const answer = await attempt((async () => {
        const args = `[${editors.map(editor => editor.json()).join(',')}]`;
        return link.ask('call', { path: this.node.path, method: method.name }, { args });
      })());
      if (answer === undefined) return;
      const texts = [answer.result ? `= ${rowText(answer.result)}` : 'done', ...answer.out.map(out => `${out.name} = ${rowText(out)}`)];
      result.textContent = texts.join(', ');
    });
    return form;
  },
  // What was typed and answered, over a new drawing.
  typed() {
    return [...this.element.querySelectorAll('.method')].map(form => ({
      name: form.dataset.method, result: form.querySelector('.result').textContent,
      values: [...form.elements].map(input => (input.type === 'checkbox' ? input.checked : input.value)) }));
  },
  restore(methods) {
    for (const { name, result, values } of methods) {
      const form = [...this.element.querySelectorAll('.method')].find(each => each.dataset.method === name);
      if (!form || form.elements.length !== values.length) continue;
      form.querySelector('.result').textContent = result;
      [...form.elements].forEach((input, i) => {
        if (input.type === 'checkbox') input.checked = values[i];
        else if (input.tagName !== 'BUTTON') input.value = values[i];
      });
    }
  },
};
