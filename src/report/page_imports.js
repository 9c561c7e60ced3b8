// The tab on imports: a graph around a file, what it imports to the right and what imports it to the left. A file is drawn
// once on each side, at its shortest way; what is behind it unfolds from there.

const NODE_WIDTH = 210, NODE_HEIGHT = 40, NODE_GAP = 10, COLUMN_GAP = 70, EDGE = 16;
const MOST_NEXT = 16;    // files of a node; more are folded by their folders
const MOST_OF_FOLDER = 40;
const MOST_NODES = 300;  // that "Unfold" goes on to

const folderOf = (path) => path.slice(0, path.lastIndexOf("/") + 1);

// All that can be reached, with the number of steps and the file ahead: by source.
function reachOf(source, next) {
  const reach = new Map([[source, {steps: 0, via: null}]]);
  let level = [source];
  for (let steps = 1; level.length > 0; ++steps) {
    const following = [];
    for (const at of level) {
      for (const other of next(at)) {
        if (reach.has(other)) continue;
        reach.set(other, {steps, via: at});
        following.push(other);
      }
    }
    level = following;
  }
  return reach;
}
const importsOf = (source) => source.imports, importersOf = (source) => source.importers;

class ImportGraph {
  constructor(source) {
    this.centre = source;
    this.open = new Set(["1/", "-1/"]);
    this.reach = {"1": reachOf(source, importsOf), "-1": reachOf(source, importersOf)};
    this.svg = make("svg", {"aria-hidden": "true"}, [], SVG);
    this.scroller = make("div", {class: "scroller", tabindex: "0", role: "application", "aria-roledescription": "graph",
      "aria-label": `Imports around ${source.path}. Arrow keys go from file to file, Space folds and unfolds, Enter puts a file ` +
        "into the middle, Home goes back to it. The table has all of it as text.",
      onkeydown: (event) => this.onKey(event), onclick: (event) => this.onClick(event), ondblclick: () => this.goTo(this.selected)}, this.svg);
    this.told = make("p", {class: "told", "aria-live": "polite"});
    const button = (text, work) => make("button", {type: "button", onclick: work}, text);
    this.element = make("div", {class: "timeline graph"}, [
      make("div", {class: "bar"}, [
        make("ul", {class: "legend"}, [make("li", {}, "\u2190 imported by"), make("li", {}, "imports \u2192")]),
        make("div", {class: "buttons"}, [button("Unfold", () => this.unfoldAll()), button("Fold", () => this.foldAll())])]),
      this.scroller, this.told]);
    this.layOut();
    this.select(this.nodes[0]);
  }

  // --- What is shown

  keyOf(side, source) {
    return source === this.centre ? `${side}/` : `${side}/${source.index}`;
  }

  nextOf(node, side) {
    if (node.folder !== undefined) {
      const shown = node.members.slice(0, MOST_OF_FOLDER).map((source) => ({key: this.keyOf(side, source), source}));
      const rest = node.members.length - shown.length;
      return rest > 0 ? [...shown, {key: `${node.key}+`, text: `${rest.toLocaleString("en")} more`, note: "in the table below"}] : shown;
    }
    if (!node.source) return [];
    const next = [...(side > 0 ? importsOf : importersOf)(node.source)].sort((a, b) => (a.path < b.path ? -1 : 1));
    const leaf = (source) => ({key: this.keyOf(side, source), source});
    if (next.length <= MOST_NEXT) return next.map(leaf);
    const folders = new Map();
    for (const source of next) folders.set(folderOf(source.path), [...(folders.get(folderOf(source.path)) || []), source]);
    return [...folders].map(([folder, members]) => (members.length === 1 ? leaf(members[0]) : {key: `${this.keyOf(side, node.source)}/${folder}`,
      folder, members, text: folder || "./", note: `${members.length.toLocaleString("en")} files`}));
  }

  isOpen(node, side) {
    return this.open.has(node.source === this.centre ? `${side}/` : node.key);
  }

  layOut() {
    const centre = {key: "/", source: this.centre, column: 0, side: 0};
    this.nodes = [centre];
    this.edges = [];
    for (const side of [1, -1]) {
      const placed = new Map([[`${side}/`, centre]]);
      let level = [centre];
      for (let column = side; level.length > 0; column += side) {
        const following = [];
        for (const node of level) {
          const next = this.nextOf(node, side);
          if (node !== centre) node.foldable = next.length > 0;
          if (!this.isOpen(node, side)) continue;
          for (const one of next) {
            const known = placed.get(one.key);
            this.edges.push({from: node, to: known || one, side});
            if (known) continue;
            Object.assign(one, {column, side});
            placed.set(one.key, one);
            following.push(one);
            this.nodes.push(one);
          }
        }
        level = following;
      }
    }
    this.place();
    this.draw();
  }

  place() {
    this.columns = new Map();
    for (const node of this.nodes) {
      if (!this.columns.has(node.column)) this.columns.set(node.column, []);
      this.columns.get(node.column).push(node);
    }
    const first = Math.min(...this.columns.keys()), last = Math.max(...this.columns.keys());
    const most = Math.max(...[...this.columns.values()].map((column) => column.length));
    this.height = Math.max(most, 3) * (NODE_HEIGHT + NODE_GAP) + 2 * EDGE;
    this.width = (last - first + 1) * (NODE_WIDTH + COLUMN_GAP) - COLUMN_GAP + 2 * EDGE + 20;
    for (const [number, column] of this.columns) {
      const top = (this.height - column.length * (NODE_HEIGHT + NODE_GAP) + NODE_GAP) / 2;
      column.forEach((node, row) => {
        node.row = row;
        node.x = EDGE + 10 + (number - first) * (NODE_WIDTH + COLUMN_GAP);
        node.y = top + row * (NODE_HEIGHT + NODE_GAP);
      });
    }
  }

  // --- Drawing

  draw() {
    this.svg.setAttribute("width", this.width);
    this.svg.setAttribute("height", this.height);
    this.svg.replaceChildren(...this.edges.map((edge) => this.edge(edge)), ...this.nodes.map((node, index) => this.node(node, index)));
  }

  edge({from, to, side}) {
    const x1 = from.x + (side > 0 ? NODE_WIDTH : 0), y1 = from.y + NODE_HEIGHT / 2, y2 = to.y + NODE_HEIGHT / 2;
    const isBack = (to.column - from.column) * side <= 0;  // it stands no farther out
    const x2 = to.x + ((side > 0) === isBack ? NODE_WIDTH : 0), bend = side * COLUMN_GAP * 0.5;
    return make("path", {class: from === this.selected || to === this.selected ? "edge selected" : "edge",
      d: `M${x1},${y1} C${x1 + bend},${y1} ${isBack ? x2 + bend : x2 - bend},${y2} ${x2},${y2}`}, [], SVG);
  }

  node(node, index) {
    const {source, x, y} = node, fits = (text, most) => (text.length > most ? `\u2026${text.slice(1 - most)}` : text);
    const name = source ? source.path.slice(folderOf(source.path).length) : node.text;
    const under = source ? folderOf(source.path) : node.note;
    const kind = ["node", source === this.centre && "centre", node === this.selected && "selected", !source && "folder",
      source && source.faulty && "failed"].filter(Boolean).join(" ");
    const parts = [make("title", {}, this.text(node), SVG),
      make("rect", {x, y, width: NODE_WIDTH, height: NODE_HEIGHT, rx: 6}, [], SVG),
      make("text", {class: "first", x: x + 10, y: y + 17}, fits(name, 27), SVG),
      make("text", {class: "second", x: x + 10, y: y + 33}, fits(under, 31), SVG)];
    if (node.foldable) {
      const cx = x + (node.side > 0 ? NODE_WIDTH : 0), cy = y + NODE_HEIGHT / 2;
      parts.push(make("g", {class: "fold", "data-fold": index}, [make("circle", {cx, cy, r: 9}, [], SVG),
        make("text", {x: cx, y: cy + 4}, this.isOpen(node, node.side) ? "\u2212" : "+", SVG)], SVG));
    }
    return make("g", {class: kind, "data-node": index}, parts, SVG);
  }

  // --- What is told of a node

  text(node) {
    const {source} = node;
    if (!source) return [node.folder === undefined ? null : node.folder, node.text, node.note].filter(Boolean).join(", ");
    const inAll = (next, number) => (number ? `${count(number, "file")}, ${(reachOf(source, next).size - 1).toLocaleString("en")} in all` : "none");
    const parts = [source.path, `project ${source.project}`, `imports ${inAll(importsOf, source.imports.length)}`,
      `imported by ${inAll(importersOf, source.importers.length)}`];
    if (source.faulty) parts.push("could not be translated, so what it imports is not known");
    return parts.join("; ");
  }

  select(node) {
    if (!node) return;
    this.selected = node;
    const state = node.foldable ? (this.isOpen(node, node.side) ? "; unfolded" : "; folded") : "";
    this.told.replaceChildren(this.text(node) + state,
      ...(node.source && node.source !== this.centre ? [" ", make("a", {href: `#imports/${encodeURIComponent(node.source.path)}`}, "Into the middle")] : []));
    this.draw();
    this.reveal(node);
  }

  reveal(node) {
    const {scroller} = this, right = node.x + NODE_WIDTH + EDGE, bottom = node.y + NODE_HEIGHT + EDGE;
    if (node.source === this.centre) {
      scroller.scrollLeft = node.x + NODE_WIDTH / 2 - scroller.clientWidth / 2;
      scroller.scrollTop = node.y + NODE_HEIGHT / 2 - scroller.clientHeight / 2;
      return;
    }
    if (node.x - EDGE < scroller.scrollLeft) scroller.scrollLeft = node.x - EDGE;
    else if (right > scroller.scrollLeft + scroller.clientWidth) scroller.scrollLeft = right - scroller.clientWidth;
    if (node.y - EDGE < scroller.scrollTop) scroller.scrollTop = node.y - EDGE;
    else if (bottom > scroller.scrollTop + scroller.clientHeight) scroller.scrollTop = bottom - scroller.clientHeight;
  }

  // --- Folding

  selectAgain(key) {
    this.select(this.nodes.find((node) => node.key === key) || this.nodes[0]);
  }

  fold(node) {
    if (!node || !node.foldable) return;
    if (!this.open.delete(node.key)) this.open.add(node.key);
    this.layOut();
    this.selectAgain(node.key);
  }

  unfoldAll() {
    for (const node of this.nodes.filter((each) => each.foldable && !this.isOpen(each, each.side))) {
      if (this.nodes.length >= MOST_NODES) break;
      this.open.add(node.key);
      this.layOut();
    }
    this.selectAgain(this.selected.key);
  }

  foldAll() {
    this.open = new Set(["1/", "-1/"]);
    this.layOut();
    this.selectAgain(this.selected.key);
  }

  // --- Keys and clicks

  onClick(event) {
    const fold = event.target.closest("[data-fold]"), node = event.target.closest("[data-node]");
    if (fold) this.fold(this.nodes[Number(fold.dataset.fold)]);
    else if (node) this.select(this.nodes[Number(node.dataset.node)]);
  }

  goTo(node) {
    if (node && node.source) location.hash = `imports/${encodeURIComponent(node.source.path)}`;
  }

  onKey(event) {
    if (event.ctrlKey || event.metaKey || event.altKey) return;
    const {column, row, y} = this.selected, at = (number) => this.columns.get(number) || [];
    const nearest = (list) => list.reduce((best, node) => (!best || Math.abs(node.y - y) < Math.abs(best.y - y) ? node : best), null);
    if (event.key === "ArrowUp") this.select(at(column)[row - 1]);
    else if (event.key === "ArrowDown") this.select(at(column)[row + 1]);
    else if (event.key === "ArrowLeft") this.select(nearest(at(column - 1)));
    else if (event.key === "ArrowRight") this.select(nearest(at(column + 1)));
    else if (event.key === "Home") this.select(this.nodes[0]);
    else if (event.key === " ") this.fold(this.selected);
    else if (event.key === "Enter") this.goTo(this.selected);
    else return;
    event.preventDefault();
  }

  // All that stands on either side, near files first.
  table() {
    const rows = [["imported", 1], ["importing", -1]].flatMap(([how, side]) =>
      [...this.reach[side]].filter(([source]) => source !== this.centre).map(([source, way]) => ({source, how, ...way})));
    return makeTable(`All files around ${this.centre.path}`, rows, [
      {title: "File", value: (row) => row.source.path, cell: (row) => [sourceLink(row.source),
        row.steps > 1 ? make("span", {class: "note"}, `by way of ${row.via.path}`) : null]},
      {title: "Is", value: (row) => row.how, cell: (row) => row.how},
      {title: "Project", wide: true, value: (row) => row.source.project, cell: (row) => row.source.project},
      {title: "Steps", numeric: true, rising: true, value: (row) => row.steps, cell: (row) => String(row.steps)},
    ], 3, (row) => `${row.source.path} ${row.how}`);
  }
}

const MOST_WORK = 5e7;  // steps of counting what is reached from each file

const importViews = makeViews(() => {
  if (sources.length === 0) return [empty("No file is translated.")];
  const isCounted = sources.length * sumOf(sources, (source) => source.imports.length) < MOST_WORK;
  const reach = new Map(isCounted ? sources.map((source) => [source, reachOf(source, importersOf).size - 1]) : []);
  const number = (title, value, wide = false) => ({title, numeric: true, wide, value, cell: (row) => (value(row) ? value(row).toLocaleString("en") : "\u2013")});
  return [make("p", {class: "note"}, "A file's name shows the graph around it. A change of a file makes all that import it be translated and " +
    "compiled again, directly or by way of others."), makeTable("Files", sources, [
    {title: "File", value: (row) => row.path, cell: (row) => [sourceLink(row), row.faulty ? make("strong", {class: "bad"}, " error") : null]},
    {title: "Project", wide: true, value: (row) => row.project, cell: (row) => row.project},
    number("Imports", (row) => row.imports.length, true), number("Imported by", (row) => row.importers.length, isCounted),
    ...(isCounted ? [number("In all", (row) => reach.get(row))] : []),
  ], isCounted ? 4 : 3, (row) => row.path)];
}, (path) => {
  const source = sourceByPath.get(path);
  if (!source) return null;
  const graph = new ImportGraph(source);
  requestAnimationFrame(() => graph.select(graph.nodes[0]));  // into sight, once it is shown
  return [backLink("imports", "All files"), make("h2", {}, ["Imports around ", make("span", {class: "path"}, source.path)]), graph.element,
    graph.table()];
});
