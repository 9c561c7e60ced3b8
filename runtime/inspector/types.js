// The types of the program by the projects that registered them, and all of one of them.

const types = {
  known: new Set(), list: null, detail: null, current: '', isLoaded: false,

  start(list, side) {
    this.list = list;
    this.detail = side;
    link.on('hello', () => { this.isLoaded = false; this.load(); });
    side.replaceChildren(make('p', { className: 'empty' }, 'Select a type.'));
  },
  async load() {
    const all = await link.ask('types').catch(() => null);
    if (!all) return;
    this.isLoaded = true;
    this.known.clear();
    const kinds = ['classes', 'enums', 'variants', 'interfaces', 'functors', 'typedefs'];
    this.list.replaceChildren(...all.projects.map(project => {
      const names = kinds.flatMap(kind => (project[kind] || []).map(name => ({ name, kind })));
      names.forEach(({ name }) => this.known.add(name));
      return names.length && make('li', {}, make('h3', {}, `${project.name.replaceAll('_', '/')}, release ${project.release}`),
        ...names.map(({ name, kind }) => make('button', { type: 'button', 'data-type': name, title: kind, onclick: () => this.show(name) }, name)));
    }).filter(Boolean));
    if (this.current) this.show(this.current);
  },
  async show(name) {
    this.current = name;
    route.remember();
    for (const button of this.list.querySelectorAll('button')) button.setAttribute('aria-current', String(button.dataset.type === name));
    const type = await attempt(link.ask('type', { name }));
    if (!type || this.current !== name) return;
    const facts = make('dl', { className: 'facts' });
    const add = (term, ...value) => facts.append(make('dt', {}, term), make('dd', {}, ...value));
    if (type.project) add('Project', `${type.project.replaceAll('_', '/')}, release ${type.release}`);
    if (type.size) add('Size', `${type.size} bytes`);
    if (type.type) add('Stands for', typeLink(type.type));
    if (type.metadata) add('Metadata', make('span', { className: 'mono' }, type.metadata));
    if (type.interfaces) add('Interfaces', ...type.interfaces.flatMap((base, i) => [i ? ', ' : '', typeLink(base)]));
    this.detail.replaceChildren(make('p', { className: 'path' }, type.is), make('h2', { className: 'mono' }, type.name), facts,
      ...this.table('Members', ['Name', 'Type', 'Since', 'Metadata'], (type.fields || []).map(field => [
        field.name, field.references ? 'the model' : field.type ? typeLink(field.type) : 'void', this.since(field), field.metadata || ''])),
      ...this.table('Labels', ['Label', 'Number', ''], (type.labels || []).map(label => [label.label, String(label.number), label.off ? 'off' : ''])),
      ...this.table('Methods', ['Name', 'Arguments', 'Result'], (type.methods || []).map(method => [
        method.name, method.args.map(argument => `${argument.type} ${argument.name}`).join(', ') + (method.const ? ' const' : ''), typeLink(method.result)])));
    this.detail.scrollTop = 0;
  },
  since(field) {
    if (field.calculated) return 'calculated';
    if (field.added === undefined) return '';
    return field.dropped === undefined ? `release ${field.added}` : `releases ${field.added} to ${field.dropped - 1}`;
  },
  table(title, heads, rows) {
    if (!rows.length) return [];
    return [make('h3', {}, title), make('div', { className: 'scroll' }, make('table', {},
      make('thead', {}, make('tr', {}, ...heads.map(head => make('th', { scope: 'col' }, head)))),
      make('tbody', {}, ...rows.map(cells => make('tr', {}, ...cells.map(cell => make('td', { className: 'mono' }, cell)))))))];
  },
};

// The text of a type, in which registered names lead to their types.
function typeLink(text) {
  const parts = text.split(/([A-Za-z_][\w:]*)/);
  return make('span', { className: 'mono' }, ...parts.map(part => (types.known.has(part)
    ? make('a', { className: 'quiet', href: `#types/${encodeURIComponent(part)}` }, part) : part)));
}
