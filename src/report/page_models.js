// The tabs on what is declared: all of it, and the releases of models.

function plainTable(label, heads, rows) {
  return make("div", {class: "plain", tabindex: "0", role: "region", "aria-label": label}, make("table", {}, [
    make("caption", {}, label), make("thead", {}, make("tr", {}, heads.map((head) => make("th", {scope: "col", class: "plain"}, head)))),
    make("tbody", {}, rows.map((row) => make("tr", {class: row.dim ? "gone" : null}, row.cells.map((cell, index) =>
      make(index === 0 ? "th" : "td", {scope: index === 0 ? "row" : null}, cell)))))]));
}

// --- One declaration

function memberTable(label, fields) {
  const columns = [
    ["Field", (field) => make("span", {class: "path"}, field.name), () => true],
    ["Type", typeText, () => true],
    ["Unit", unitOf, (field) => unitOf(field) !== ""],
    ["Metadata", (field) => make("span", {class: "path"}, otherMetadata(field)), (field) => otherMetadata(field) !== ""],
    ["Node", (field) => field.node || "", (field) => Boolean(field.node)],
    ["Came", (field) => (field.added ? `release ${field.added}` : "with the model"), (field) => field.added > 0],
    ["Went", (field) => (field.dropped ? `release ${field.dropped}` : ""), (field) => Boolean(field.dropped)],
  ].filter(([, , isUsed]) => fields.some(isUsed));
  return [make("h3", {}, label), plainTable(label, columns.map(([title]) => title),
    fields.map((field) => ({dim: Boolean(field.dropped), cells: columns.map(([, cell]) => cell(field))})))];
}

function argumentParts(argument) {
  return [argument.direction ? `${argument.direction} ` : "", typeText(argument), ` ${argument.name}`,
    argument.default ? ` = ${argument.default}` : ""];
}

function signature(called) {
  return make("span", {class: "path"}, [typeText(called.returns), ` ${called.name}(`,
    ...listOf((called.arguments || []).map((argument) => make("span", {}, argumentParts(argument)))), called.const ? ") const" : ")"]);
}

function methodList(methods) {
  const note = (method) => [unitOf(method), otherMetadata(method)].filter(Boolean).join(", ");
  return [make("h3", {}, "Methods"), make("ul", {class: "methods"}, methods.map((method) =>
    make("li", {}, [signature(method), note(method) ? make("span", {class: "note"}, note(method)) : null])))];
}

function factsOf(declared) {
  const source = sourceOf(declared), place = declared.line ? `${declared.file}:${declared.line}` : declared.file;
  const names = (list) => list && list.length && listOf(list.map((name) => declaredLink(name)));
  const users = usersByName.get(declared.name) || [];
  const userList = (list) => listOf(list.map((user) => make("span", {}, [declaredLink(user.declared.name), ` (${user.how})`])));
  const flags = ["exported", "reflected", "registered", "undefined"].filter((flag) => declared[flag]).join(", ");
  const most = 40;
  return [
    ["Stands in", [source ? sourceLink(source, place) : place, `, project ${declared.project}`]],
    ["Is", flags], ["Unit", unitOf(declared)], ["Metadata", otherMetadata(declared)],
    ["Template", declared.template], ["Remote", declared.remote], ["Within", declared.holder && declaredLink(declared.holder.name)],
    ["Type", declared.type && !declared.returns && typeText(declared)], ["Signature", declared.returns && signature(declared)],
    ["Model", declared.modelName && declaredLink(declared.modelName)],
    ["Interfaces", names(declared.interfaces)], ["Bases", names([...(declared.bases || []), ...(declared.basesBehindMixins || [])])],
    ["Mixins", names(declared.mixins)],
    ["Used by", users.length > 0 && [...userList(users.slice(0, most)), users.length > most ? ` and ${users.length - most} more` : ""]],
  ].filter(([, value]) => value && value.length !== 0);
}

function showDeclaration(declared) {
  const {model} = declared;
  const parts = [
    make("h2", {}, [make("span", {class: "kind"}, declared.kind), " ", declared.name]),
    make("dl", {class: "facts"}, factsOf(declared).map(([name, value]) => make("div", {}, [make("dt", {}, name), make("dd", {}, value)])))];
  if (model) {
    parts.push(...memberTable("Fields of the model", model.fields));
    if (model.releases.length > 1) {
      parts.push(make("p", {}, make("a", {href: `#history/${encodeURIComponent(declared.name)}`}, `History of ${count(model.releases.length, "release")}`)));
    }
  }
  if ((declared.attributes || []).length) parts.push(...memberTable("Attributes", declared.attributes));
  if ((declared.fields || []).length) parts.push(...memberTable("Fields", declared.fields));
  if ((declared.methods || []).length) parts.push(...methodList(declared.methods));
  if (declared.labels) {
    parts.push(make("h3", {}, "Labels"), plainTable("Labels", ["Label", "Value", ""], declared.labels.map((label) =>
      ({cells: [label.name, String(label.value), [label.default && "default", label.disabled && "disabled"].filter(Boolean).join(", ")]}))));
  }
  if (declared.items) {
    parts.push(make("h3", {}, "Items"), plainTable("Items", ["Item", "Tag", "Holds"], declared.items.map((item) => ({cells: [item.name,
      String(item.tag), item.fields ? listOf(item.fields.map((field) => make("span", {}, [typeText(field), ` ${field.name}`]))) : typeText(item)]}))));
  }
  const nested = declared.nested || [];
  if (nested.length) parts.push(make("h3", {}, "Declared within"), make("p", {}, listOf(nested.map((inner) => declaredLink(inner.name)))));
  return parts;
}

// --- All declarations

function declarationsTable(kind) {
  const rows = declarations.filter((declared) => kind === "" || declared.kind === kind || (kind === "with a model" && declared.model));
  const texts = new Map(rows.map((declared) => [declared, searchTextOf(declared)]));
  const units = (declared) => [...new Set(fieldsOf(declared).map(unitOf).filter(Boolean))].join(", ");
  const fields = (declared) => fieldsOf(declared).filter((field) => !field.dropped).length;
  return makeTable("Declarations", rows, [
    {title: "Name", value: (row) => row.name, cell: (row) => [declaredLink(row.name),
      make("span", {class: "note"}, row.line ? `${row.file}:${row.line}` : row.file)]},
    {title: "Kind", value: (row) => row.kind, cell: (row) => row.kind},
    {title: "Project", wide: true, value: (row) => row.project, cell: (row) => row.project},
    {title: "Units", wide: true, value: units, cell: units},
    {title: "Interfaces", wide: true, value: (row) => (row.interfaces || []).join(), cell: (row) => listOf((row.interfaces || []).map((name) => declaredLink(name)))},
    {title: "Fields", numeric: true, value: fields, cell: (row) => (fields(row) ? String(fields(row)) : "\u2013")},
  ], 0, (row) => texts.get(row));
}

const modelViews = makeViews(() => {
  if (declarations.length === 0) return [empty("Nothing is declared.")];
  const kinds = [...new Set(declarations.map((declared) => declared.kind))].sort();
  const table = make("div"), fill = (kind) => table.replaceChildren(declarationsTable(kind));
  const choice = make("select", {onchange: (event) => fill(event.target.value)}, [
    make("option", {value: ""}, `All kinds (${declarations.length.toLocaleString("en")})`),
    models.length ? make("option", {value: "with a model"}, `with a model (${models.length.toLocaleString("en")})`) : null,
    ...kinds.map((kind) => make("option", {value: kind}, `${kind} (${declarations.filter((declared) => declared.kind === kind).length.toLocaleString("en")})`))]);
  fill("");
  return [make("p", {class: "note"}, "Search finds names, fields, types, units, metadata, methods and interfaces."),
    make("label", {class: "choice"}, ["Kind ", choice]), table];
}, (name) => {
  const found = declarationsByName.get(name);
  return found ? [backLink("models", "All declarations"), ...found.flatMap(showDeclaration)] : null;
});

// --- The history of a model

// A row for each field, a column for each release; what is read aloud stands in the cells.
function lifeTable(declared, releases) {
  const renames = releases.flatMap(({came}) => came.filter(({from}) => from));
  const newNames = new Set(renames.map(({field}) => field)), oldNames = new Set(renames.map(({from}) => from));
  const cell = (field, number) => {
    const lives = field.added <= number && !(field.dropped && field.dropped <= number);
    if (lives && field.added === number) return make("span", {class: "life came"}, newNames.has(field) ? "renamed" : "came");
    if (field.dropped === number) return make("span", {class: "life went"}, oldNames.has(field) ? "renamed" : "went");
    return lives ? make("span", {class: "life"}, make("span", {class: "hidden"}, "is there")) : "";
  };
  return plainTable(`Fields of ${declared.name} by release`, ["Field", ...releases.map(({number}) => `Release ${number}`)],
    declared.model.fields.map((field) => ({dim: Boolean(field.dropped), cells: [
      make("span", {class: "path"}, [field.name, make("span", {class: "note"}, [typeText(field)])]),
      ...releases.map(({number}) => cell(field, number))]})));
}

function cameItem({field, from}) {
  const how = from ? [" from ", make("b", {class: "path"}, from.name)]
    : field.evolve ? (field.evolve.reads.length ? [", computed from ", ...listOf(field.evolve.reads.map((name) => make("b", {class: "path"}, name)))] : [", computed"])
      : [];
  return make("li", {class: from ? "renamed" : "came"}, [
    make("p", {}, [make("span", {class: "sign"}, from ? "renamed " : "came "), make("b", {class: "path"}, field.name), " ", typeText(field), ...how]),
    field.evolve && field.evolve.code ? make("pre", {tabindex: "0", "aria-label": `Code of ${field.name}`}, make("code", {}, field.evolve.code)) : null]);
}

function showHistory(declared) {
  const releases = releasesOf(declared);
  const latest = releases[releases.length - 1].number;
  return [
    make("h2", {}, ["History of ", declaredLink(declared.name)]),
    make("p", {class: "note"}, releases.length === 1 ? "It has had one release." : `${count(releases.length, "release")}. Archives of each can be ` +
      `read by release ${latest}: a field that came later has the value that its code computes, or else its initial one.`),
    lifeTable(declared, releases),
    make("ol", {class: "releases", reversed: true}, [...releases].reverse().map(({number, came, went}, index) => make("li", {}, [
      make("h3", {}, `Release ${number}${index === 0 ? ", the latest" : ""}`),
      make("ul", {class: "changes"}, [...came.map(cameItem), ...went.map((field) => make("li", {class: "went"},
        make("p", {}, [make("span", {class: "sign"}, "went "), make("b", {class: "path"}, field.name), " ", typeText(field)])))]),
    ])))];
}

const historyViews = makeViews(() => {
  if (models.length === 0) return [empty("No model is declared.")];
  const rows = models.map((declared) => ({declared, releases: releasesOf(declared)}));
  const sum = (row, value) => sumOf(row.releases, value), later = (row) => row.releases.slice(1);
  const number = (title, value, wide = false) => ({title, numeric: true, wide, value, cell: (row) => (value(row) ? String(value(row)) : "\u2013")});
  return [makeTable("Models", rows, [
    {title: "Model", value: ({declared}) => declared.name, cell: ({declared}) => [
      make("a", {class: "path", href: `#history/${encodeURIComponent(declared.name)}`}, declared.name),
      make("span", {class: "note"}, `${declared.file}:${declared.line}`)]},
    number("Release", (row) => row.releases[row.releases.length - 1].number),
    number("Fields", ({declared}) => declared.model.fields.filter((field) => !field.dropped).length, true),
    number("Came", (row) => sumOf(later(row), ({came}) => came.filter(({from}) => !from).length)),
    number("Went", (row) => sum(row, ({went}) => went.length)),
    number("Renamed", (row) => sum(row, ({came}) => came.filter(({from}) => from).length), true),
  ], 1, ({declared}) => `${declared.name} ${declared.model.fields.map((field) => field.name).join(" ")}`)];
}, (name) => {
  const found = (declarationsByName.get(name) || []).filter((declared) => declared.model);
  return found.length ? [backLink("history", "All models"), ...found.flatMap(showHistory)] : null;
});
