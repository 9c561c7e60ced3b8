// Archives that are dropped here: what was read of one, which release wrote it, what became of its values, each of its
// bytes; and how two of them differ.

const archives = {
  slots: [null, null],

  start(panel) {
    this.panel = panel;
    this.file = make('input', { type: 'file', multiple: true, className: 'hidden', id: 'archive-file' });
    this.type = make('input', { type: 'text', 'aria-label': 'Type of the value', placeholder: 'Type, where << wrote it', spellcheck: 'false' });
    this.drop = make('div', { className: 'drop' },
      make('p', {}, 'Drop an archive here: what WriteObject wrote, or a value with the name of its type. A second one is compared with it.'),
      make('div', { className: 'line' }, make('label', { className: 'button', for: 'archive-file' }, 'Choose a file'), this.file, this.type,
        make('button', { type: 'button', onclick: () => this.clear() }, 'Clear')));
    this.body = make('div');
    panel.append(make('div', { className: 'pad' }, this.drop, this.body));
    this.file.addEventListener('change', () => this.take(this.file.files));
    for (const name of ['dragover', 'drop']) window.addEventListener(name, event => event.preventDefault());
    window.addEventListener('dragover', () => this.drop.classList.add('over'));
    window.addEventListener('dragleave', () => this.drop.classList.remove('over'));
    window.addEventListener('drop', event => {
      this.drop.classList.remove('over');
      if (event.dataTransfer && event.dataTransfer.files.length) this.take(event.dataTransfer.files);
    });
    link.on('lost', () => { this.slots = [null, null]; });
  },
  clear() {
    this.slots = [null, null];
    this.body.replaceChildren();
  },
  async take(files) {
    route.go('archives');
    for (const file of [...files].slice(0, 2)) {
      const slot = this.slots[0] ? 1 : 0;
      const answer = await attempt(link.send({ do: 'archive', slot, type: this.type.value.trim() }, await file.arrayBuffer()));
      if (!answer) return;
      this.slots[slot] = { ...answer, name: file.name };
    }
    this.file.value = '';
    this.show();
  },
  async show() {
    this.body.replaceChildren();
    if (this.slots[1]) {
      const answer = await attempt(link.ask('compare'));
      if (answer) this.body.append(make('h3', {}, `From ${this.slots[0].name} to ${this.slots[1].name}`), this.changes(answer.changes, 'Nothing differs.'));
    }
    this.slots.forEach((archive, slot) => archive && this.body.append(this.archive(archive, slot)));
  },
  archive(archive, slot) {
    const facts = make('dl', { className: 'facts' });
    const add = (name, ...value) => facts.append(make('dt', {}, name), make('dd', {}, ...value));
    if (archive.class) add('Class', typeLink(archive.class));
    add('Size', `${archive.size.toLocaleString('en')} bytes`);
    for (const { project, release, current, occurs } of archive.releases) {
      add(project.replaceAll('_', '/'), `written by release ${release}, now ${current < 0 ? 'not there' : current}${occurs ? '' : ' (no model of it occurs)'}`);
    }
    const section = make('section', { className: 'archive' }, make('h2', {}, archive.name), facts,
      archive.error && make('p', { className: 'bad', role: 'status' }, archive.error));
    if (archive.evolved.length) section.append(make('h3', {}, 'What $evolve made of it'), this.changes(archive.evolved, ''));
    if (archive.today) section.append(make('details', {}, make('summary', {}, 'As it is read today'), make('pre', {}, archive.today)));
    const table = make('tbody');
    const more = make('button', { type: 'button' }, 'More');
    const load = async () => {
      const first = table.children.length;
      const answer = await attempt(link.ask('parts', { slot, first, count: 300 }));
      if (!answer) return;
      table.append(...answer.parts.map(part => this.part(part)));
      more.hidden = table.children.length >= archive.parts || !answer.parts.length;
    };
    more.addEventListener('click', load);
    section.append(make('h3', {}, `Its bytes, ${archive.parts.toLocaleString('en')} parts`),
      make('div', { className: 'scroll' }, make('table', {}, this.head('Offset', 'Bytes', 'Path', 'Type', 'Value'), table)), more);
    load();
    return section;
  },
  head(...names) {
    return make('thead', {}, make('tr', {}, ...names.map(name => make('th', { scope: 'col' }, name))));
  },
  part(part) {
    const path = make('td', { className: 'mono' }, part.path);
    path.style.paddingLeft = `${12 * part.depth}px`;
    return make('tr', { className: part.rest ? 'bad' : '' }, make('td', { className: 'mono' }, part.at.toString(16).padStart(8, '0')), make('td', { className: 'mono' }, part.bytes),
      path, make('td', { className: 'mono' }, part.type), make('td', { className: 'mono' }, part.text));
  },
  changes(changes, nothing) {
    if (!changes.length) return make('p', { className: 'note' }, nothing);
    return make('div', { className: 'scroll' }, make('table', {}, this.head('', 'Path', 'Before', 'After'), make('tbody', {}, ...changes.map(change => make('tr', {},
      ...[change.kind, change.path, change.old, change.now].map(text => make('td', { className: 'mono' }, text)))))));
  },
};
