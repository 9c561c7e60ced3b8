// The dependency graph around a value, as an SVG: on the left what it reads, on the right what reads it. Colours and words
// say what is stale; a node that is chosen takes the middle.

const SVG = 'http://www.w3.org/2000/svg';
const kNode = { width: 168, height: 58, across: 224, down: 72 };

function draw(tag, attributes = {}, ...children) {
  const element = document.createElementNS(SVG, tag);
  for (const [name, value] of Object.entries(attributes)) element.setAttribute(name, value);
  element.append(...children);
  return element;
}
function timeText(nanoseconds) {
  if (nanoseconds < 1e3) return `${nanoseconds} ns`;
  if (nanoseconds < 1e6) return `${(nanoseconds / 1e3).toFixed(1)} µs`;
  return nanoseconds < 1e9 ? `${(nanoseconds / 1e6).toFixed(1)} ms` : `${(nanoseconds / 1e9).toFixed(2)} s`;
}

const graph = {
  subject: null, drawn: '', timer: 0,

  start(panel) {
    this.title = make('h2', {}, 'Dependency graph');
    this.note = make('p', { className: 'note', role: 'status' });
    this.depth = make('select', { 'aria-label': 'How far' }, ...[1, 2, 3, 5, 8].map(depth => make('option', { value: depth }, `${depth} steps`)));
    this.depth.value = 3;
    this.depth.addEventListener('change', () => this.load());
    this.canvas = make('div', { className: 'scroll graph' });
    panel.append(make('div', { className: 'pad' }, make('div', { className: 'line' }, this.title, this.depth), this.note, this.canvas));
    this.say('Select an object or a value of one that calculates in the tree, and choose “Graph”.');
    setInterval(() => { if (route.view === 'graph' && this.subject && !document.hidden) this.load(); }, 700);
  },
  say(text, isBad) {
    this.note.textContent = text;
    this.note.classList.toggle('bad', !!isBad);
  },
  show(subject, title) {
    this.subject = subject;
    this.title.textContent = title;
    this.drawn = '';
    route.go('graph');
    return this.load();
  },
  async load() {
    const { subject } = this;
    const answer = await link.ask('graph', { ...subject, depth: Number(this.depth.value) }).catch(error => ({ error: error.message }));
    if (subject !== this.subject) return;
    const text = JSON.stringify(answer);
    if (text === this.drawn) return;
    this.drawn = text;
    if (answer.error) {
      this.canvas.replaceChildren();
      this.say(answer.error, true);
      return;
    }
    const stale = answer.nodes.filter(node => node.state !== 'fresh').length;
    this.say(`${answer.nodes.length} nodes, ${stale} of them stale${answer.partial ? '; more are left out' : ''}. Counts and times are those since a page looked here first.`);
    this.drawNodes(answer);
  },
  drawNodes({ nodes, links, around }) {
    const columns = new Map();
    const least = Math.min(...nodes.map(node => node.at));
    nodes.forEach(node => {
      const column = columns.get(node.at) || [];
      columns.set(node.at, column);
      node.x = 10 + (node.at - least) * kNode.across;
      node.y = column.push(node);
    });
    const rows = Math.max(...[...columns.values()].map(column => column.length));
    for (const column of columns.values()) {
      column.forEach((node, i) => { node.y = 10 + ((rows - column.length) / 2 + i) * kNode.down; });
    }
    const width = Math.max(...nodes.map(node => node.x)) + kNode.width + 10;
    const height = 10 + rows * kNode.down;
    const focused = document.activeElement && document.activeElement.dataset && document.activeElement.dataset.node;
    const svg = draw('svg', { width, height, viewBox: `0 0 ${width} ${height}`, role: 'group', 'aria-label': 'Nodes, from what is read to what reads it' },
      ...links.map(([from, to]) => this.line(nodes[from], nodes[to])), ...nodes.map((node, i) => this.node(node, i < around)));
    this.canvas.replaceChildren(svg);
    if (focused) [...svg.querySelectorAll('.node')].find(each => each.dataset.node === focused)?.focus();
  },
  line(from, to) {
    const x1 = from.x + kNode.width, y1 = from.y + kNode.height / 2, x2 = to.x, y2 = to.y + kNode.height / 2;
    const bend = Math.max(Math.abs(x2 - x1) / 2, 30);
    return draw('path', { class: `edge ${to.state}`, d: `M${x1},${y1} C${x1 + bend},${y1} ${x2 - bend},${y2} ${x2},${y2}` });
  },
  node(node, isSubject) {
    const state = { fresh: 'up to date', unsure: 'to be looked at', stale: 'stale', running: 'being calculated' }[node.state];
    const counts = node.kind === '$indep' || node.kind === 'field' ? node.kind
      : node.count ? `${node.count} × ${timeText(Math.round(node.total / node.count))}${node.failed ? `, ${node.failed} failed` : ''}` : node.kind;
    const value = node.empty ? state : node.text === undefined ? state : `${node.text}${node.state === 'fresh' ? '' : ` (${state})`}`;
    const name = node.name || node.kind;
    const element = draw('g', { class: `node ${node.state}${isSubject ? ' subject' : ''}`, transform: `translate(${node.x},${node.y})`, tabindex: 0, role: 'button',
      'aria-label': `${node.class}${node.class ? '::' : ''}${name}, ${value}, ${state}; ${counts}; reads ${node.inputs}, read by ${node.dependents}` },
    draw('rect', { width: kNode.width, height: kNode.height, rx: 7 }),
    draw('text', { x: 10, y: 18, class: 'title' }, shorten(name, 22)), draw('text', { x: 10, y: 35, class: 'value' }, shorten(value, 24)),
    draw('text', { x: 10, y: 50, class: 'count' }, shorten(counts, 28)),
    draw('title', {}, `${node.class}${node.class ? '::' : ''}${name} = ${value}\nreads ${node.inputs}, read by ${node.dependents}\n`
      + `calculated ${node.count} times, ${timeText(node.total)} in all, ${timeText(node.own)} of its own, at most ${timeText(node.longest)}`));
    element.dataset.node = node.node;
    const choose = () => this.show({ node: node.node }, `${node.class}${node.class ? '::' : ''}${name}`);
    element.addEventListener('click', choose);
    element.addEventListener('keydown', event => (event.key === 'Enter' || event.key === ' ') && (event.preventDefault(), choose()));
    return element;
  },
};
function shorten(text, most) {
  return text.length > most ? `${text.slice(0, most - 1)}…` : text;
}
