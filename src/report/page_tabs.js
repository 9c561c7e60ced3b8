// The tabs: each is a row of `tabs`, made when it is first shown. What is shown stands in the address behind the #: a tab,
// and behind a slash what it is about, as the file that filters the timeline; so the way back works.

function timeCell(time, most) {
  const share = most > 0 ? Math.round(100 * time / most) : 0;
  return make("span", {class: "share", style: `--share:${share}%`}, time === 0 ? "\u2013" : duration(time));
}

function fileCell(row, note) {
  return [fileLink(row.file), row.failed ? make("strong", {class: "bad"}, " failed") : null,
    note ? make("span", {class: "note"}, note) : null];
}

// --- The tabs

const timeline = new Timeline();
const under = make("div");

function stepsTable(label, steps) {
  const most = Math.max(...steps.map((span) => span.time), 0);
  return makeTable(label, steps, [
    {title: "Step", value: nameOf, cell: (span) => [spanLink(span), span.failed ? make("strong", {class: "bad"}, " failed") : null,
      make("span", {class: "note"}, [KINDS[span.kind].label, reasonText(span.why)].filter(Boolean).join(": "))]},
    {title: "Slot", wide: true, value: (span) => span.slot, cell: (span) => slotName(span.slot)},
    {title: "Begin", numeric: true, rising: true, wide: true, value: (span) => span.begin, cell: (span) => duration(span.begin)},
    {title: "Time", numeric: true, value: (span) => span.time, cell: (span) => timeCell(span.time, most)},
  ], 2, nameOf);
}

function showTimeline(path) {
  const file = path === "" ? null : fileByPath.get(path) || null;
  timeline.show(file);
  if (!file) {
    const steps = data.critical.map((index) => spans[index]);
    const length = sumOf(steps, (span) => span.time);
    under.replaceChildren(
      make("h2", {}, `Critical path: ${duration(length)} of ${duration(data.total)}`),
      make("p", {class: "note"}, "The longest chain of steps of which each needs the one ahead of it: no number of jobs " +
        "makes the build shorter, faster steps in it do."),
      stepsTable("Critical path", steps));
    return;
  }
  const steps = spans.filter((span) => concerns(span, file));
  under.replaceChildren(
    make("div", {class: "filter", role: "status"}, [
      make("span", {}, ["Steps about ", make("b", {class: "path"}, file.path), ", and compilations that read it: ",
        `${count(steps.length, "step")}, ${duration(sumOf(steps, (span) => span.time))}`]),
      make("a", {href: "#timeline"}, "Show all steps")]),
    stepsTable("Steps of the file", steps));
}

function causesTable(files) {
  const rows = costsOfReasons(files), most = Math.max(...rows.map((row) => row.time), 0);
  const nameOfCause = ({why}) => (why.path !== undefined && fileByPath.has(why.path)
    ? [fileLink(fileByPath.get(why.path)), make("span", {class: "note"}, `changed ${clock(why.time)}`)] : why.text);
  return make("div", {}, [make("h2", {}, "Why"), makeTable("Why files were translated or compiled", rows, [
    {title: "Cause", value: (row) => row.why.text, cell: nameOfCause},
    {title: "Files", numeric: true, value: (row) => row.count, cell: (row) => row.count.toLocaleString("en")},
    {title: "Time", numeric: true, value: (row) => row.time, cell: (row) => timeCell(row.time, most)},
  ], 2, (row) => row.why.text)]);
}

const buildTabs = [
  {id: "timeline", title: "Timeline", show: (path) => { if (spans.length) showTimeline(path); },
    make: () => (spans.length ? [timeline.element, under] : [empty("Nothing was stale: no step was run.")])},
  {id: "files", title: "Files", make: () => {
    const rows = costsOfFiles(), most = Math.max(...rows.map((row) => row.total), 0);
    if (rows.length === 0) return [empty("No file was translated or compiled.")];
    return [causesTable(rows), make("h2", {}, "Slowest files"), make("p", {class: "note"}, "Times of a translation are without " +
      "those of the imports within it. A file's name shows its steps on the timeline."), makeTable("Slowest files", rows, [
      {title: "File", value: (row) => row.file.path, cell: (row) => fileCell(row, reasonText(row.why))},
      {title: "Translation", numeric: true, wide: true, value: (row) => row.translation, cell: (row) => duration(row.translation)},
      {title: "Compiler", numeric: true, wide: true, value: (row) => row.compiler,
        cell: (row) => (row.compiler ? duration(row.compiler) : "\u2013")},
      {title: "Time", numeric: true, value: (row) => row.total, cell: (row) => timeCell(row.total, most)},
    ], 3, (row) => row.file.path)];
  }},
  {id: "headers", title: "Headers", make: () => {
    const rows = costsOfHeaders(), most = Math.max(...rows.map((row) => Math.max(row.caused, row.read)), 0);
    if (rows.length === 0) return [empty("No object was compiled that imports a header.")];
    const objects = (number, time) => [timeCell(time, most), make("span", {class: "note"}, number ? count(number, "object") : "")];
    return [make("p", {class: "note"}, "Caused: the compilations that were run because the header had changed. Read in: all " +
      "compilations of this build that read it, which a change of it would cause again."), makeTable("Cost of headers", rows, [
      {title: "Header", value: (row) => row.file.path,
        cell: (row) => fileCell(row, row.changed ? `changed ${clock(row.changed)}` : "")},
      {title: "Caused", numeric: true, value: (row) => row.caused * 1e6 + row.read / 1e6,
        cell: (row) => objects(row.causedCount, row.caused)},
      {title: "Read in", numeric: true, value: (row) => row.read, cell: (row) => objects(row.readCount, row.read)},
    ], 1, (row) => row.file.path)];
  }},
  {id: "messages", title: "Messages", badge: () => data.errors + data.warnings || data.messages.length, make: () => {
    if (data.messages.length === 0) return [empty("No errors, no warnings.")];
    const list = make("ol", {class: "messages"});
    const fill = (most) => list.replaceChildren(...sortedMessages().slice(0, most).map(messageItem));
    const more = make("button", {type: "button", class: "more", hidden: data.messages.length <= MOST_ROWS,
      onclick: () => { fill(data.messages.length); more.hidden = true; }}, `Show all ${data.messages.length.toLocaleString("en")}`);
    fill(MOST_ROWS);
    return [list, more];
  }},
];
const tabs = [...(data.built ? buildTabs : []),
  {id: "models", title: "Models", ...modelViews}, {id: "history", title: "History", ...historyViews},
  {id: "imports", title: "Imports", ...importViews}];

function sortedMessages() {  // errors ahead, else as they came
  return [...data.messages].sort((a, b) => (a.severity === b.severity ? 0 : a.severity === "error" ? -1 : 1));
}

function messageItem(message) {
  const file = message.path === undefined ? null : fileByPath.get(message.path);
  const place = message.place === undefined ? null : message.line > 0 ? `${message.place}:${message.line}` : message.place;
  return make("li", {class: message.severity}, [
    make("p", {class: "place"}, [make("strong", {class: message.severity === "error" ? "bad" : "odd"}, message.severity), " ",
      place === null ? null : make("span", {class: "path"}, pathText(place)), " ",
      file ? make("a", {href: `#timeline/${encodeURIComponent(file.path)}`}, "steps") : null]),
    make("p", {class: "message"}, message.text.replace(/^(error|warning) ?:? ?/, "")),
    message.generated ? make("p", {class: "note path"}, pathText(message.generated)) : null,
    message.lines && message.lines.length ? make("pre", {tabindex: "0", "aria-label": "Source lines"},
      message.lines.map(([number, text]) => make("span", {class: number === message.line ? "line here" : "line"},
        [make("i", {}, String(number)), `${text}\n`]))) : null,
  ]);
}

// --- The frame

function buildFigures() {
  const tools = spans.filter((span) => span.group !== "translation");
  const compiled = tools.filter((span) => span.group === "compiler");
  const path = sumOf(data.critical, (index) => spans[index].time);
  const translation = sumOf(spans.filter((span) => span.group === "translation"), (span) => span.time - span.inner);
  return [["Time", duration(data.total)], ["Critical path", duration(path)], ["Translation", duration(translation)],
    ["Compiler time", duration(sumOf(compiled, (span) => span.time))], ["Objects", compiled.length.toLocaleString("en")],
    ["Slots", String(data.slots - 1)], ["Errors", String(data.errors), data.errors > 0 && "bad"],
    ["Warnings", String(data.warnings), data.warnings > 0 && "odd"]];
}

function workspaceFigures() {
  const {faults, imports} = workspace;
  const counted = [["Projects", imports.projects], ["Files", sources], ["Declarations", declarations], ["Models", models],
    ["Interfaces", declarations.filter((declared) => declared.kind === "interface")], ["Errors", faults, faults.length > 0 && "bad"]];
  return counted.map(([name, list, kind]) => [name, list.length.toLocaleString("en"), kind]);
}

function showHeading() {
  const figures = data.built ? buildFigures() : workspaceFigures();
  document.getElementById("figures").append(...figures.map(([name, value, kind]) =>
    make("div", {}, [make("dt", {}, name),
      make("dd", {class: kind || null, id: `figure-${name.split(" ")[0].toLowerCase()}`}, value)])));
  document.getElementById("title").textContent = data.title;
  document.getElementById("subtitle").textContent = `${data.subtitle} | ${clock(data.began)}`;
  document.title = `${data.title}: ${data.built ? "build report" : "report"}`;
  const verdict = document.getElementById("verdict");
  if (!data.built) {
    verdict.textContent = "Nothing was built";
    return;
  }
  verdict.textContent = !data.completed ? "Ended early" : data.errors > 0 ? "Completed with errors" : "Completed";
  verdict.className = data.completed && data.errors === 0 ? "good" : "bad";
}

function showTab() {
  const [id, ...rest] = location.hash.slice(1).split("/");
  const wanted = tabs.find((tab) => tab.id === id) || tabs[0];
  for (const tab of tabs) {
    const isShown = tab === wanted;
    tab.link.setAttribute("aria-selected", String(isShown));
    tab.link.tabIndex = isShown ? 0 : -1;
    tab.panel.hidden = !isShown;
    if (isShown && !tab.isMade) {
      tab.panel.append(...tab.make());
      tab.isMade = true;
    }
  }
  let file = "";
  try {
    file = decodeURIComponent(rest.join("/"));
  } catch {  // no address that the page has written
  }
  if (wanted.show) wanted.show(file);
}

function onTabKey(event) {
  const at = tabs.findIndex((tab) => tab.link === document.activeElement);
  const step = {ArrowRight: 1, ArrowLeft: -1}[event.key];
  if (at < 0 || !step) return;
  const next = tabs[(at + step + tabs.length) % tabs.length];
  location.hash = next.id;
  next.link.focus();
  event.preventDefault();
}

for (const tab of tabs) {
  const badge = tab.badge ? tab.badge() : 0;
  tab.link = make("a", {id: `tab-${tab.id}`, role: "tab", href: `#${tab.id}`, "aria-controls": `panel-${tab.id}`},
    [tab.title, badge ? make("span", {class: "badge"}, badge.toLocaleString("en")) : null]);
  tab.panel = make("section", {id: `panel-${tab.id}`, role: "tabpanel", "aria-labelledby": `tab-${tab.id}`, hidden: true});
  document.getElementById("tabs").append(tab.link);
  document.getElementById("panels").append(tab.panel);
}
document.getElementById("tabs").addEventListener("keydown", onTabKey);
window.addEventListener("hashchange", showTab);
showHeading();
showTab();
