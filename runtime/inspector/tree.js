// The objects as a tree of which only what is on the screen is there. A node knows how many rows stand below it, and
// those of them that were on the screen; the program is told which are, and tells what they are and when they change.

const kRow = 26;            // pixels, as in the style
const kMostPixels = 8e6;    // browsers limit the height of an element: beyond this scrolling goes in larger steps
const kMargin = 15;         // rows that are watched above and below

class TreeNode {
  constructor(parent, position, row) {
    this.parent = parent;
    this.position = position;
    this.kids = new Map();  // by position, as far as they are known
    this.open = false;
    this.take(row);
  }
  take(row) {
    this.row = row;
    this.path = this.parent ? [...this.parent.path, row.step] : [];
    this.key = keyOf(this.path);
    this.count = row.count || 0;
  }
  openKids() {
    return [...this.kids.values()].filter(kid => kid.open).sort((a, b) => a.position - b.position);
  }
  // Rows below it on the screen or off it.
  size() {
    return this.open ? this.openKids().reduce((sum, kid) => sum + kid.size(), this.count) : 0;
  }
  level() { return this.parent ? this.parent.level() + 1 : 0; }
  // The places of rows [skip, skip + need) below it.
  collect(skip, need, places) {
    let from = 0;
    for (const kid of [...this.openKids(), null]) {
      const end = kid ? kid.position + 1 : this.count;
      const plain = Math.max(end - from, 0);
      for (let at = from + skip; at < end && places.length < need; ++at) places.push({ parent: this, position: at });
      skip = Math.max(skip - plain, 0);
      if (!kid || places.length >= need) return;
      const size = kid.size();
      if (skip < size) kid.collect(skip, need, places);
      skip = Math.max(skip - size, 0);
      from = end;
    }
  }
  // Which row a place below it is.
  indexOf(position) {
    return this.openKids().reduce((sum, kid) => (kid.position < position ? sum + kid.size() : sum), position);
  }
  index() { return this.parent.parent ? this.parent.index() + 1 + this.parent.indexOf(this.position) : this.parent.indexOf(this.position); }
}

// The element of a row, whose parts change only where they must.
class RowView {
  constructor(index) {
    this.index = index;
    this.parts = {};
    this.element = make('div', { role: 'treeitem', id: `row${index}`, 'data-index': index });
    for (const name of ['twist', 'name', 'swatch', 'text', 'unit', 'stale', 'type']) {
      this.parts[name] = this.element.appendChild(make('span', { className: name }));
    }
    this.parts.twist.setAttribute('aria-hidden', 'true');
    this.parts.stale.title = 'An input has changed since it was calculated';
  }
  set(name, value) {
    if (value === undefined) this.element.removeAttribute(name);
    else if (this.element.getAttribute(name) !== String(value)) this.element.setAttribute(name, value);
  }
  write(texts) {
    for (const [name, text] of Object.entries(texts)) {
      if (this.parts[name].textContent !== text) this.parts[name].textContent = text;
      if (name === 'unit' || name === 'stale') this.parts[name].hidden = !text;
    }
  }
}

const tree = {
  root: null, nodes: new Map(), first: 0, selected: null, watched: '', element: null, space: null, isDrawn: true, views: new Map(),

  start(element) {
    this.element = element;
    this.space = element.appendChild(make('div', { className: 'space', role: 'presentation' }));
    this.root = new TreeNode(null, 0, { step: '' });
    this.root.open = true;
    this.nodes.set(this.root.key, this.root);
    element.addEventListener('scroll', () => this.onScroll());
    element.addEventListener('keydown', event => this.onKey(event));
    element.addEventListener('click', event => this.onClick(event));
    new ResizeObserver(() => this.draw()).observe(element);
    link.on('lost', () => { this.watched = ''; });
    link.on('hello', () => this.draw());
    link.on('push', message => this.onPush(message));
  },

  // --- What the program tells

  onPush(message) {
    for (const range of message.ranges || []) {
      const node = this.nodes.get(keyOf(range.path));
      if (!node) continue;
      if (range.count !== undefined) this.setCount(node, range.count);
      for (const [position, row] of range.rows || []) this.setRow(node, position, row);
    }
    if (message.ranges) this.draw();
  },
  setCount(node, count) {
    if (count < 0) this.close(node);
    node.count = Math.max(count, 0);
    for (const [position, kid] of node.kids) {
      if (position >= node.count) this.forget(node, kid);
    }
    if (this.selected && this.selected.parent === node && this.selected.position >= node.count) this.select(null);
  },
  setRow(node, position, row) {
    const kid = node.kids.get(position);
    if (!kid) {
      node.kids.set(position, new TreeNode(node, position, row));
      return;
    }
    const isOther = keyOf(kid.row.step) !== keyOf(row.step);
    if (isOther) this.close(kid);
    const isSame = keyOf(kid.row) === keyOf(row);
    kid.changed = isOther || isSame ? kid.changed : performance.now();
    kid.take(row);
    if (kid.open) this.nodes.set(kid.key, kid);
    if (kid.open && !kid.count) this.close(kid);
    if (kid === this.selected) detail.refresh(isOther);
  },
  forget(node, kid) {
    this.close(kid);
    node.kids.delete(kid.position);
  },
  close(node) {
    for (const kid of node.openKids()) this.close(kid);
    if (!node.parent) return;
    node.open = false;
    this.nodes.delete(node.key);
    node.kids.clear();
    if (this.selected && this.isBelow(this.selected, node)) this.select(node);
  },
  isBelow(node, outer) {
    while (node.parent) {
      node = node.parent;
      if (node === outer) return true;
    }
    return false;
  },

  // --- What the user does

  toggle(node, open = !node.open) {
    if (open === node.open || (open && !node.count)) return;
    if (open) {
      node.open = true;
      this.nodes.set(node.key, node);
    } else {
      this.close(node);
    }
    this.draw();
  },
  select(node, isQuiet) {
    this.selected = node;
    detail.show(node);
    if (node && !isQuiet) this.reveal(node);
    this.draw();
  },
  onClick(event) {
    const row = event.target.closest('.row');
    const node = row && this.at(Number(row.dataset.index));
    if (!node) return;
    if (event.target.closest('.twist') || event.detail === 2) this.toggle(node);
    if (!event.target.closest('.twist')) this.select(node, true);
  },
  onKey(event) {
    const total = this.root.size();
    if (!total || event.altKey || event.ctrlKey || event.metaKey) return;
    const at = this.selected ? this.selected.index() : -1;
    const page = Math.max(Math.floor(this.element.clientHeight / kRow) - 1, 1);
    const moves = { ArrowDown: at + 1, ArrowUp: at - 1, PageDown: at + page, PageUp: at - page, Home: 0, End: total - 1 };
    const node = this.selected;
    if (event.key in moves) {
      this.go(Math.min(Math.max(moves[event.key], 0), total - 1));
    } else if (event.key === 'ArrowRight' && node) {
      node.open ? this.go(at + 1) : this.toggle(node, true);
    } else if (event.key === 'ArrowLeft' && node) {
      if (node.open) this.toggle(node, false);
      else if (node.parent.parent) this.select(node.parent);
    } else if ((event.key === 'Enter' || event.key === ' ') && node) {
      event.key === 'Enter' && detail.focus() || this.toggle(node);
    } else {
      return;
    }
    event.preventDefault();
  },
  // Selects a row, which may have to come first.
  go(index) {
    const node = this.at(index);
    if (node) return this.select(node);
    const places = [];
    this.root.collect(index, 1, places);
    if (!places.length) return;
    this.first = index;
    this.pending = places[0];
    this.draw();
  },
  at(index) {
    const places = [];
    this.root.collect(index, 1, places);
    return places.length ? places[0].parent.kids.get(places[0].position) : undefined;
  },

  // Opens all that leads to a path, and selects what is there.
  async find(path) {
    let node = this.root;
    for (const step of path) {
      if (node !== this.root && !node.open) this.toggle(node, true);
      let position = typeof step === 'number' ? step : typeof step === 'object' ? step.at : -1;
      const first = position < 0 ? 0 : position;
      const answer = await link.ask('rows', { path: node.path, first, count: position < 0 ? 400 : 1 });
      this.setCount(node, answer.count);
      const at = answer.rows.findIndex(row => position >= 0 || row.step === step);
      if (at < 0) throw new Error('nothing is there any more');
      position = first + at;
      if (!node.kids.has(position)) node.kids.set(position, new TreeNode(node, position, answer.rows[at]));
      node = node.kids.get(position);
    }
    if (node !== this.root) this.select(node);
  },

  // --- What is on the screen

  rows() { return Math.ceil(this.element.clientHeight / kRow) + 1; },
  pixels() { return Math.min(this.root.size() * kRow, kMostPixels); },
  mostFirst() { return Math.max(this.root.size() - Math.floor(this.element.clientHeight / kRow), 0); },
  mostScroll() { return Math.max(this.pixels() - this.element.clientHeight, 1); },
  onScroll() {
    if (this.isScrolledHere === this.element.scrollTop) return;
    const isWhole = this.root.size() * kRow <= kMostPixels;
    this.first = isWhole ? Math.floor(this.element.scrollTop / kRow) : Math.round(this.element.scrollTop / this.mostScroll() * this.mostFirst());
    this.offset = isWhole ? this.element.scrollTop % kRow : 0;
    this.draw();
  },
  // Brings a row into sight.
  reveal(node) {
    const index = node.index();
    const whole = Math.max(Math.floor(this.element.clientHeight / kRow) - 1, 1);
    if (index >= this.first && index < this.first + whole) return;
    this.first = Math.min(Math.max(index < this.first ? index : index - whole + 1, 0), this.mostFirst());
    this.offset = 0;
    this.space.style.height = `${this.pixels()}px`;
    const isWhole = this.root.size() * kRow <= kMostPixels;
    this.element.scrollTop = isWhole ? this.first * kRow : this.first / Math.max(this.mostFirst(), 1) * this.mostScroll();
    this.isScrolledHere = this.element.scrollTop;
  },
  draw() {
    if (!this.isDrawn) return;
    this.isDrawn = false;
    requestAnimationFrame(() => {
      this.isDrawn = true;
      this.drawNow();
    });
  },
  drawNow() {
    if (!this.element.clientHeight) return;
    this.first = Math.min(this.first, this.mostFirst());
    this.space.style.height = `${Math.max(this.pixels(), this.element.clientHeight - 1)}px`;
    const places = [];
    this.root.collect(this.first, this.rows(), places);
    const top = this.element.scrollTop - (this.offset || 0);
    const views = places.map((place, i) => this.rowElement(place, this.first + i, top + i * kRow));
    const kept = new Map(views.map(view => [view.index, view]));
    for (const [index, view] of this.views) kept.has(index) || view.element.remove();
    views.forEach(({ element }, i) => this.space.children[i] === element || this.space.insertBefore(element, this.space.children[i] || null));
    this.views = kept;
    const shown = this.selected && this.space.querySelector('[aria-selected="true"]');
    if (shown) this.element.setAttribute('aria-activedescendant', shown.id);
    else this.element.removeAttribute('aria-activedescendant');
    this.watch(places);
    if (this.pending && this.pending.parent.kids.has(this.pending.position)) {
      const { parent, position } = this.pending;
      this.pending = null;
      this.select(parent.kids.get(position));
    }
  },
  // The element of a row stays while the row is on the screen: it may be under a finger.
  rowElement({ parent, position }, index, top) {
    const node = parent.kids.get(position);
    const row = node ? node.row : { name: '…', kind: 'none', text: '' };
    const flash = !!node && performance.now() - node.changed < 1000;
    const view = this.views.get(index) || new RowView(index);
    view.element.className = `row ${row.kind}${row.bad ? ' bad' : ''}${flash ? ' flash' : ''}`;
    view.element.style.top = `${top}px`;
    view.element.style.paddingLeft = `${4 + 16 * parent.level()}px`;
    view.set('aria-level', parent.level() + 1);
    view.set('aria-setsize', parent.count);
    view.set('aria-posinset', position + 1);
    view.set('aria-expanded', row.count ? node.open : undefined);
    view.set('aria-selected', !!node && node === this.selected);
    view.write({ twist: !row.count ? '' : node.open ? '▾' : '▸', name: row.name, text: rowText(row), unit: row.unit || '',
      stale: row.fresh === false ? 'stale' : '', type: row.type || '' });
    view.parts.swatch.hidden = !row.color;
    if (row.color) view.parts.swatch.style.background = colorOf(row.text);
    if (flash) setTimeout(() => this.draw(), 1050);
    return view;
  },
  // Tells the program what is on the screen, and what stands beside it.
  watch(places) {
    const ranges = new Map();
    const add = (parent, from, to) => {
      const range = ranges.get(parent.key) || { path: parent.path, from, to };
      ranges.set(parent.key, { path: parent.path, from: Math.min(range.from, from), to: Math.max(range.to, to) });
    };
    for (const { parent, position } of places) add(parent, position - kMargin, position + 1 + kMargin);
    if (!ranges.has(this.root.key)) add(this.root, 0, 0);
    const list = [...ranges.values()].slice(0, 60).map(({ path, from, to }) => {
      const first = Math.max(from, 0);
      return { path, first, count: Math.min(Math.max(to - first, 0), 120) };
    });
    if (this.selected) list.push({ path: this.selected.parent.path, first: this.selected.position, count: 1 });
    const text = JSON.stringify(list);
    if (text === this.watched) return;
    this.watched = text;
    link.ask('watch', { ranges: list }).catch(() => { this.watched = ''; });
  },
};

function rowText(row) {
  return row.kind === 'text' || row.kind === 'char' ? `“${row.text}”` : row.text || '';
}
function colorOf(text) {
  const digits = /^#?([0-9a-f]{6})$/i.exec(text);
  if (digits) return `#${digits[1]}`;
  return /^\d+$/.test(text) ? `#${(Number(text) & 0xffffff).toString(16).padStart(6, '0')}` : '#000000';
}
