// The timeline: a row for the translation and one for each slot, drawn as far as it is in sight.

const SVG = "http://www.w3.org/2000/svg";
const ROW = 28, BAR = 22, AXIS = 24, LEAST = 1.5, MOST_ZOOM = 4096;

class Timeline {
  constructor() {
    this.zoom = 1;
    this.filter = null;
    this.selected = null;
    this.rows = Array.from({length: data.slots}, () => []);
    for (const span of spans) this.rows[span.slot].push(span);
    this.svg = make("svg", {"aria-hidden": "true"}, [], SVG);
    this.scroller = make("div", {
      class: "scroller", tabindex: "0", role: "application", "aria-roledescription": "timeline",
      "aria-label": `Timeline of ${count(spans.length, "step")} in ${count(data.slots, "row")}. Arrow keys go from step to ` +
        "step, plus and minus zoom, Enter shows the steps of a file alone. The tables have all of it as text.",
      onkeydown: (event) => this.onKey(event), onscroll: () => this.plan(), onclick: (event) => this.onClick(event),
    }, this.svg);
    this.told = make("p", {class: "told", "aria-live": "polite"}, "Select a step to see what it was.");
    this.labels = make("div", {class: "labels", "aria-hidden": "true"},
      this.rows.map((_, slot) => make("span", {}, slotName(slot))));
    this.element = make("div", {class: "timeline"}, [
      this.bar(), make("div", {class: "rows"}, [this.labels, this.scroller]), this.told]);
    new ResizeObserver(() => this.draw()).observe(this.scroller);
  }

  bar() {
    const button = (text, label, work) => make("button", {type: "button", "aria-label": label, onclick: work}, text);
    const mark = (group, text) => make("li", {}, [make("i", {class: `mark ${group}`}), text]);
    return make("div", {class: "bar"}, [
      make("ul", {class: "legend"}, [mark("translation", "translation"), mark("compiler", "compiler"), mark("linker", "linker"),
        mark("failed", "failed"), mark("critical", "critical path")]),
      make("div", {class: "buttons"}, [
        button("\u2212", "Zoom out", () => this.zoomTo(this.zoom / 2)), button("+", "Zoom in", () => this.zoomTo(this.zoom * 2)),
        button("Fit", "Fit all of the build", () => this.zoomTo(1))]),
    ]);
  }

  show(filter) {
    this.filter = filter;
    this.plan();
  }

  // --- Places

  get scale() {  // pixels for a microsecond
    return (this.scroller.clientWidth - 2) * this.zoom / Math.max(data.total, 1);
  }

  zoomTo(zoom) {
    const middle = (this.scroller.scrollLeft + this.scroller.clientWidth / 2) / this.scale;
    const at = this.selected ? this.selected.begin + this.selected.time / 2 : middle;
    this.zoom = Math.min(Math.max(zoom, 1), MOST_ZOOM);
    this.draw();
    this.scroller.scrollLeft = at * this.scale - this.scroller.clientWidth / 2;
    this.draw();
  }

  isDrawn(span) {
    return span.depth === 0 || (this.filter !== null && concerns(span, this.filter)) || span === this.selected;
  }

  // --- Drawing

  plan() {
    if (this.planned) return;
    this.planned = true;
    requestAnimationFrame(() => this.draw());
  }

  draw() {
    this.planned = false;
    const scale = this.scale;
    if (this.scroller.clientWidth === 0) return;  // not in sight
    const width = Math.max(Math.floor(data.total * scale), 1), height = AXIS + this.rows.length * ROW;
    const from = this.scroller.scrollLeft - 300, to = this.scroller.scrollLeft + this.scroller.clientWidth + 300;
    const parts = this.axis(scale, from, to, height);
    this.rows.forEach((row, slot) => this.drawRow(parts, row, AXIS + slot * ROW + (ROW - BAR) / 2, scale, from, to));
    this.svg.setAttribute("width", width);
    this.svg.setAttribute("height", height);
    this.svg.replaceChildren(...parts);
  }

  axis(scale, from, to, height) {
    const steps = [1e3, 2e3, 5e3, 1e4, 2e4, 5e4, 1e5, 2e5, 5e5, 1e6, 2e6, 5e6, 1e7, 2e7, 3e7, 6e7, 12e7, 3e8, 6e8, 18e8, 36e8];
    const step = steps.find((each) => each * scale >= 72) || steps[steps.length - 1];
    const parts = [];
    for (let at = Math.max(Math.floor(from / scale / step), 0) * step; at <= Math.min(data.total, to / scale); at += step) {
      const x = Math.round(at * scale) + 0.5;
      parts.push(make("line", {class: "tick", x1: x, x2: x, y1: AXIS - 6, y2: height}, [], SVG));
      if (x < data.total * scale - 40) parts.push(make("text", {class: "time", x: x + 4, y: 14}, this.timeText(at, step), SVG));
    }
    return parts;
  }

  timeText(at, step) {
    if (step < 1e6 && data.total < 6e7) return `${(at / 1e6).toFixed(step < 1e4 ? 3 : step < 1e5 ? 2 : 1)} s`;
    const seconds = at / 1e6;
    return seconds < 60 ? `${seconds} s` : `${Math.floor(seconds / 60)}:${String(Math.round(seconds % 60)).padStart(2, "0")}`;
  }

  // Steps that are too narrow to be told apart are one bar, the paler the less of its time they take.
  drawRow(parts, row, y, scale, from, to) {
    let crowd = null;
    const flush = () => {
      if (crowd) {
        const width = Math.max(crowd.end - crowd.x, LEAST);
        parts.push(make("rect", {class: `step ${crowd.group}${crowd.dim ? " dim" : ""}`, x: crowd.x, y, width, height: BAR,
          "fill-opacity": Math.max(crowd.busy / width, 0.3).toFixed(2), "data-span": crowd.span.index}, [], SVG));
      }
      crowd = null;
    };
    for (const span of row) {
      const x = span.begin * scale, width = span.time * scale;
      if (x + width < from || x > to || !this.isDrawn(span)) continue;
      const dim = this.filter !== null && !concerns(span, this.filter);
      if (width < LEAST && !span.failed && span !== this.selected && (dim || this.filter === null)) {
        if (crowd && crowd.group === span.group && x - crowd.end < 1) {
          crowd.end = x + width;
          crowd.busy += width;
          continue;
        }
        flush();
        crowd = {x, end: x + width, busy: width, group: span.group, span, dim};
        continue;
      }
      flush();
      parts.push(...this.step(span, x, y, width, dim));
    }
    flush();
  }

  step(span, x, y, width, dim) {
    const shown = Math.max(width - (width > 4 ? 1 : 0), LEAST);
    const kind = ["step", span.group, dim && "dim", span.failed && "failed", span.critical && "critical",
      span === this.selected && "selected"].filter(Boolean).join(" ");
    const parts = [make("rect", {class: kind, x, y, width: shown, height: BAR, rx: Math.min(3, shown / 2), "data-span": span.index},
      make("title", {}, this.text(span), SVG), SVG)];
    const name = (span.failed ? "! " : "") + nameOf(span).split("/").pop();
    const room = Math.floor((width - 10) / 6.8);
    if (room >= 3 && !dim) {
      const text = name.length > room ? `${name.slice(0, room - 1)}\u2026` : name;
      parts.push(make("text", {class: `name ${span.failed ? "failed" : ""}`, x: x + 5, y: y + BAR / 2 + 4}, text, SVG));
    }
    return parts;
  }

  // --- What is told of a step

  text(span) {
    const parts = [nameOf(span), `${KINDS[span.kind].verb} in ${duration(span.time)}, from ${duration(span.begin)} on, ` +
      `${slotName(span.slot).toLowerCase()}`];
    if (span.inner) parts.push(`${duration(span.inner)} of it for imports`);
    if (span.failed) parts.push("failed");
    if (span.cut) parts.push("ended with the run");
    if (span.critical) parts.push("on the critical path");
    if (span.why) parts.push(`why: ${reasonText(span.why)}`);
    return parts.join("; ");
  }

  select(span) {
    if (!span) return;
    this.selected = span;
    const text = this.text(span);
    this.told.replaceChildren(spanLink(span), text.slice(nameOf(span).length));
    const left = span.begin * this.scale, right = span.end * this.scale;
    if (left < this.scroller.scrollLeft || right > this.scroller.scrollLeft + this.scroller.clientWidth) {
      this.scroller.scrollLeft = left - 40;
    }
    this.plan();
  }

  // --- Keys and clicks

  onClick(event) {
    const index = event.target.dataset && event.target.dataset.span;
    if (index !== undefined) this.select(spans[Number(index)]);
  }

  neighbour(key) {
    const shown = (row) => row.filter((span) => this.isDrawn(span) && (!this.filter || concerns(span, this.filter)));
    if (!this.selected) return shown(spans)[0];
    const row = shown(this.rows[this.selected.slot]), at = row.indexOf(this.selected);
    if (key === "ArrowLeft") return row[Math.max(at - 1, 0)];
    if (key === "ArrowRight") return row[Math.min(at + 1, row.length - 1)];
    if (key === "Home") return row[0];
    if (key === "End") return row[row.length - 1];
    const step = key === "ArrowUp" ? -1 : 1;
    for (let slot = this.selected.slot + step; slot >= 0 && slot < this.rows.length; slot += step) {
      const distance = (span) => Math.abs(span.begin - this.selected.begin);
      const nearest = shown(this.rows[slot]).reduce((best, span) => (!best || distance(span) < distance(best) ? span : best), null);
      if (nearest) return nearest;
    }
    return this.selected;
  }

  onKey(event) {
    if (event.ctrlKey || event.metaKey || event.altKey) return;
    if (event.key === "+" || event.key === "=") this.zoomTo(this.zoom * 2);
    else if (event.key === "-") this.zoomTo(this.zoom / 2);
    else if (event.key === "0") this.zoomTo(1);
    else if (event.key === "Enter" && this.selected && this.selected.file) {
      location.hash = `timeline/${encodeURIComponent(this.selected.file.path)}`;
    } else if (event.key === "Escape") location.hash = "timeline";
    else if (/^(Arrow|Home|End)/.test(event.key)) this.select(this.neighbour(event.key));
    else return;
    event.preventDefault();
  }
}
