// The frame: tabs, search, undo, what changed last, and the address, which has what is shown so that a reload keeps it.

const views = {};  // by name: the tab, the panel, what to do when it is shown

function addView(name, title, ...children) {
  const panel = make('section', { id: `view-${name}`, role: 'tabpanel', 'aria-labelledby': `tab-${name}`, hidden: true }, ...children);
  const tab = make('button', { type: 'button', role: 'tab', id: `tab-${name}`, 'aria-controls': `view-${name}`, 'aria-selected': 'false',
    tabindex: -1, onclick: () => route.go(name) }, title);
  byId('tabs').append(tab);
  byId('panels').append(panel);
  views[name] = { tab, panel };
  return panel;
}

const route = {
  view: 'objects',
  go(view, isFirst) {
    this.view = views[view] ? view : 'objects';
    for (const [name, { tab, panel }] of Object.entries(views)) {
      tab.setAttribute('aria-selected', String(name === this.view));
      tab.tabIndex = name === this.view ? 0 : -1;
      panel.hidden = name !== this.view;
    }
    if (!isFirst) this.remember();
    tree.draw();
    if (views[this.view].onShow) views[this.view].onShow();
  },
  // The address without a step in the history.
  remember() {
    const subject = { objects: tree.selected && JSON.stringify(tree.selected.path), types: types.current }[this.view];
    const hash = `#${this.view}${subject ? `/${encodeURIComponent(subject)}` : ''}`;
    if (location.hash !== hash) history.replaceState(null, '', hash);
  },
  read() {
    const [view, subject] = location.hash.slice(1).split('/');
    const text = subject ? decodeURIComponent(subject) : '';
    if (view === 'types' && text) types.show(text);
    if (view === 'objects' && text.startsWith('[')) {
      const path = JSON.parse(text);
      if (!tree.selected || tree.selected.key !== keyOf(path)) tree.find(path).catch(() => {});
    }
    if (views[view]) this.go(view);
  },
};

const search = {
  timer: 0, list: null,
  start(panel) {
    this.list = panel.insertBefore(make('ul', { className: 'names', hidden: true, 'aria-label': 'Found' }), panel.firstChild);
    this.note = make('li', { className: 'note', role: 'status' });
    byId('search').addEventListener('input', () => {
      clearTimeout(this.timer);
      this.timer = setTimeout(() => this.begin(byId('search').value.trim()), 200);
    });
    byId('search').addEventListener('keydown', event => event.key === 'Escape' && this.end());
    link.on('push', ({ found }) => found && this.add(found));
  },
  begin(text) {
    link.ask('find', { text }).catch(() => {});
    this.list.hidden = !text;
    tree.element.hidden = !!text;
    this.note.textContent = 'Searching …';
    this.list.replaceChildren(this.note);
    if (text) route.go('objects');
    else tree.draw();
  },
  end() {
    byId('search').value = '';
    this.begin('');
  },
  add({ hits, done, cut }) {
    for (const hit of hits) {
      this.list.append(make('li', {}, make('button', { type: 'button', className: 'mono', onclick: () => this.open(hit.path) },
        pathText(hit.path), hit.text ? ` = ${rowText(hit)}` : '')));
    }
    const count = this.list.children.length - 1;
    if (done) this.note.textContent = cut ? `The first ${count} places` : count === 1 ? '1 place' : `${count} places`;
  },
  open(path) {
    this.end();
    attempt(tree.find(path)).then(() => tree.element.focus());
  },
};

// What hooks told, the latest first.
const changes = {
  total: 0,
  start(panel) {
    this.note = make('p', { className: 'note' }, 'Nothing has changed since this page looks. What models with hooks write is listed here.');
    this.body = make('tbody');
    panel.append(make('div', { className: 'pad' }, this.note, make('div', { className: 'scroll' }, make('table', {}, make('thead', {}, make('tr', {},
      ...['Time', 'Class', 'Field', 'Change', 'Times'].map(head => make('th', { scope: 'col' }, head)))), this.body))));
    link.on('push', ({ logs }) => (logs || []).forEach(log => this.add(log)));
  },
  add({ total, items }) {
    this.total += total;
    this.note.textContent = `${this.total.toLocaleString('en')} changes since this page looks; the last of them:`;
    const time = new Date().toLocaleTimeString('en-GB');
    for (const item of items) {
      this.body.prepend(make('tr', {}, ...[time, item.what, item.path, item.kind, String(item.times)].map(text => make('td', { className: 'mono' }, text))));
    }
    while (this.body.children.length > 200) this.body.lastChild.remove();
  },
};

function startUndo() {
  for (const name of ['undo', 'redo']) byId(name).addEventListener('click', () => attempt(link.ask(name)).then(() => detail.node && detail.load()));
  link.on('hello', hello => {
    byId('undo').hidden = byId('redo').hidden = !hello.changes;
  });
  link.on('push', ({ undo }) => {
    if (!undo) return;
    ['undo', 'redo'].forEach((name, i) => {
      byId(name).disabled = !undo[i];
      byId(name).title = undo[i] ? `${name}: ${undo[i]}` : '';
    });
  });
  document.addEventListener('keydown', event => {
    if (!(event.ctrlKey || event.metaKey) || event.target.matches('input, textarea')) return;
    const name = { z: event.shiftKey ? 'redo' : 'undo', y: 'redo' }[event.key.toLowerCase()];
    if (!name || byId(name).disabled) return;
    event.preventDefault();
    byId(name).click();
  });
}

function startTabs() {
  byId('tabs').addEventListener('keydown', event => {
    const step = { ArrowRight: 1, ArrowLeft: -1 }[event.key];
    if (!step) return;
    const names = Object.keys(views);
    const next = names[(names.indexOf(route.view) + step + names.length) % names.length];
    route.go(next);
    views[next].tab.focus();
  });
}

function start() {
  const treeElement = make('div', { className: 'tree', role: 'tree', tabindex: 0, 'aria-label': 'Objects' });
  const left = make('div', {}, treeElement);
  const side = make('aside', { className: 'side', 'aria-label': 'Selected value' });
  addView('objects', 'Objects', left, side).classList.add('split');
  const typeSide = make('div', { className: 'side' });
  const typeList = make('ul', { className: 'names', 'aria-label': 'Types' });
  addView('types', 'Types', typeList, typeSide).classList.add('split', 'types');
  changes.start(addView('changes', 'Changes'));
  graph.start(addView('graph', 'Graph'));
  archives.start(addView('archives', 'Archives'));
  search.start(left);
  tree.start(treeElement);
  detail.start(side);
  types.start(typeList, typeSide);
  startUndo();
  startTabs();
  link.on('hello', hello => {
    document.title = byId('title').textContent = hello.title;
    route.read();
  });
  window.addEventListener('hashchange', () => route.read());
  route.go(location.hash.slice(1).split('/')[0], true);
  link.open();
}
// Only once: `hello` comes again with each link.
start();
