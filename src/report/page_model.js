"use strict";
// The data of the page, with what is asked of it, and the making of elements. Names are always set as text.

const data = JSON.parse(document.getElementById("data").textContent);

const KINDS = {
  translate: {label: "Translation", verb: "translated", group: "translation"},
  read: {label: "Declarations read", verb: "read for its declarations", group: "translation"},
  compile: {label: "Compiler", verb: "compiled", group: "compiler"},
  assemble: {label: "Assembler", verb: "assembled", group: "compiler"},
  resource: {label: "Resource compiler", verb: "compiled", group: "compiler"},
  link: {label: "Linker", verb: "linked", group: "linker"},
  manifest: {label: "Manifest tool", verb: "given its manifest", group: "linker"},
};

const files = data.files.map(([path, project, imports], index) => ({index, path, project: data.projects[project], imports}));
const fileByPath = new Map(files.map((file) => [file.path, file]));
const critical = new Set(data.critical);
const spans = data.spans.map((span, index) => ({
  ...span, index, slot: span.slot || 0, depth: span.depth || 0, inner: span.inner || 0, end: span.begin + span.time,
  file: span.file === undefined ? null : files[span.file], group: KINDS[span.kind].group, critical: critical.has(index),
  project: data.projects[span.project], why: span.why === undefined ? null : data.reasons[span.why],
}));

function nameOf(span) {
  return span.file ? span.file.path : span.output;
}

// All that a file imports, directly or through others, and itself: as indices.
const closures = new Map();
function closureOf(file) {
  let closure = closures.get(file.index);
  if (closure) return closure;
  closure = new Set([file.index]);
  const open = [file];
  while (open.length > 0) {
    for (const index of open.pop().imports) {
      if (closure.has(index)) continue;
      closure.add(index);
      open.push(files[index]);
    }
  }
  closures.set(file.index, closure);
  return closure;
}

// What a file has to do with a step: it is about the file, or a tool read it there.
function concerns(span, file) {
  if (!span.file) return false;
  return span.file === file || (span.group === "compiler" && closureOf(span.file).has(file.index));
}

// Per file: what its own steps took. A translation without those of its imports within it.
function costsOfFiles() {
  const costs = new Map();
  for (const span of spans) {
    if (!span.file || span.kind === "read") continue;
    const cost = costs.get(span.file) || {file: span.file, translation: 0, compiler: 0, why: null, failed: false};
    costs.set(span.file, cost);
    cost[span.group] += span.time - span.inner;
    cost.why = cost.why || span.why;
    cost.failed = cost.failed || Boolean(span.failed);
  }
  return [...costs.values()].map((cost) => ({...cost, total: cost.translation + cost.compiler}));
}

// Per reason: the files that were made for it, and what that took.
function costsOfReasons(costs) {
  const reasons = new Map();
  for (const {why, total} of costs) {
    if (!why) continue;
    if (!reasons.has(why)) reasons.set(why, {why, count: 0, time: 0});
    const reason = reasons.get(why);
    reason.count += 1;
    reason.time += total;
  }
  return [...reasons.values()];
}

// Per imported file: the compilations that its change caused, and those that read it.
function costsOfHeaders() {
  const costs = new Map();
  const costOf = (file) => {
    if (!costs.has(file)) costs.set(file, {file, causedCount: 0, caused: 0, readCount: 0, read: 0, changed: 0});
    return costs.get(file);
  };
  for (const span of spans) {
    if (span.group !== "compiler" || !span.file) continue;
    for (const index of closureOf(span.file)) {
      if (files[index] === span.file) continue;
      const cost = costOf(files[index]);
      cost.readCount += 1;
      cost.read += span.time;
    }
    const cause = span.why && span.why.path !== undefined ? fileByPath.get(span.why.path) : null;
    if (!cause || cause === span.file) continue;
    const cost = costOf(cause);
    cost.causedCount += 1;
    cost.caused += span.time;
    cost.changed = span.why.time;
  }
  return [...costs.values()];
}

function sumOf(list, value) {
  return list.reduce((sum, item) => sum + value(item), 0);
}

// --- Words

function duration(microseconds) {
  const ms = microseconds / 1000;
  if (ms < 1) return ms === 0 ? "0" : "<1 ms";
  if (ms < 1000) return `${Math.round(ms)} ms`;
  const seconds = ms / 1000;
  if (seconds < 9.995) return `${seconds.toFixed(2)} s`;
  if (seconds < 59.95) return `${seconds.toFixed(1)} s`;
  const whole = Math.round(seconds);
  return `${Math.floor(whole / 60)} min ${whole % 60} s`;
}

function count(number, one, many = `${one}s`) {
  return `${number.toLocaleString("en")} ${number === 1 ? one : many}`;
}

function clock(milliseconds) {
  return new Date(milliseconds).toLocaleString([], {dateStyle: "medium", timeStyle: "medium"});
}

function slotName(slot) {
  return slot === 0 ? "Translation" : `Slot ${slot}`;
}

function reasonText(why) {
  if (!why) return "";
  return why.time ? `${why.text} (${clock(why.time)})` : why.text;
}

// --- Elements

// Of HTML, or of SVG where `space` says so. Attributes that are null or false are left out.
function make(tag, attributes = {}, children = [], space = null) {
  const element = space ? document.createElementNS(space, tag) : document.createElement(tag);
  for (const [name, value] of Object.entries(attributes)) {
    if (name.startsWith("on")) element.addEventListener(name.slice(2), value);
    else if (value !== null && value !== false && value !== undefined) element.setAttribute(name, value === true ? "" : value);
  }
  element.append(...[children].flat().filter((child) => child !== null));
  return element;
}

// A path that may break behind its folders.
function pathText(path) {
  return path.split(/(?<=\/)/).flatMap((part, i) => (i > 0 ? [make("wbr"), part] : [part]));
}

// A link that filters the timeline by a file.
function fileLink(file) {
  return make("a", {class: "path", href: `#timeline/${encodeURIComponent(file.path)}`}, pathText(file.path));
}

function spanLink(span) {
  return span.file ? fileLink(span.file) : make("span", {class: "path"}, pathText(span.output));
}
