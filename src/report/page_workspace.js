// What the workspace declares and imports, as its tabs ask for it.

const workspace = data.workspace || null;
const MODEL_KINDS = new Set(["struct", "class", "adt", "mixin", "model"]);

// Those in the bodies of classes as well, each behind its class.
const declarations = [];
const declarationsByName = new Map();
function addDeclarations(list, holder) {
  for (const declared of list) {
    declared.holder = holder;
    declarations.push(declared);
    if (!declarationsByName.has(declared.name)) declarationsByName.set(declared.name, []);
    declarationsByName.get(declared.name).push(declared);
    addDeclarations(declared.nested || [], declared);
  }
}
if (workspace) addDeclarations(workspace.reflection.declarations, null);

const models = declarations.filter((declared) => declared.model);

const sources = workspace ? workspace.imports.files.map(([path, project, faulty, imports], index) =>
  ({index, path, faulty, project: workspace.imports.projects[project], imports, importers: []})) : [];
for (const source of sources) {
  source.imports = source.imports.map((index) => sources[index]);
  for (const imported of source.imports) imported.importers.push(source);
}
const sourceByPath = new Map(sources.map((source) => [source.path, source]));

// Declarations name a file with its root in front.
function sourceOf(declared) {
  for (let path = declared.file; path; path = path.includes("/") ? path.slice(path.indexOf("/") + 1) : "") {
    if (sourceByPath.has(path)) return sourceByPath.get(path);
  }
  return null;
}

// --- Members

function fieldsOf(declared) {
  const items = (declared.items || []).flatMap((item) => item.fields
    ? item.fields.map((field) => ({...field, name: `${item.name}.${field.name}`})) : item.shape ? [item] : []);
  return [...(declared.model ? declared.model.fields : []), ...(declared.fields || []), ...(declared.attributes || []), ...items];
}

function namesInShape(shape, names = []) {
  if (!shape) return names;
  if (shape.name !== undefined) names.push(shape.name);
  namesInShape(shape.key, names);
  return namesInShape(shape.of, names);
}

function metadataOf(member) {
  const inShape = (shape) => (shape ? [...(shape.metadata || []), ...inShape(shape.key), ...inShape(shape.of)] : []);
  return [...(member.metadata || []), ...inShape(member.shape)];
}

function valueText(value) {
  if (Array.isArray(value)) return `[${value.map(valueText).join(", ")}]`;
  if (value !== null && typeof value === "object") return `${value.call}(${value.arguments.map(valueText).join(", ")})`;
  return typeof value === "string" ? JSON.stringify(value) : String(value);
}

function isUnit(value) {
  return value !== null && typeof value === "object" && !Array.isArray(value) && /^(.*::)?unit$/i.test(value.call);
}

function unitOf(member) {
  return metadataOf(member).filter(isUnit).map((unit) =>
    unit.arguments.map((part) => (typeof part === "string" ? part : valueText(part))).join(" ")).join(", ");
}

function otherMetadata(member) {
  return metadataOf(member).filter((value) => !isUnit(value)).map(valueText).join(", ");
}

// Per name: who holds it in a field, derives from it or implements it.
const usersByName = new Map();
for (const declared of declarations) {
  const add = (name, how) => {
    if (!usersByName.has(name)) usersByName.set(name, []);
    usersByName.get(name).push({declared, how});
  };
  for (const field of fieldsOf(declared)) new Set(namesInShape(field.shape)).forEach((name) => add(name, `field ${field.name}`));
  (declared.interfaces || []).forEach((name) => add(name, "implements it"));
  [...(declared.bases || []), ...(declared.basesBehindMixins || [])].forEach((name) => add(name, "derives from it"));
  (declared.mixins || []).forEach((name) => add(name, "mixes it in"));
  if (declared.modelName) add(declared.modelName, "has it for its model");
}

function searchTextOf(declared) {
  const parts = [declared.name, declared.kind, declared.project, declared.file, otherMetadata(declared), unitOf(declared)];
  for (const field of fieldsOf(declared)) parts.push(field.name, field.type, unitOf(field), otherMetadata(field));
  for (const method of declared.methods || []) parts.push(method.name);
  for (const label of declared.labels || []) parts.push(label.name);
  for (const item of declared.items || []) parts.push(item.name);
  return [...parts, ...(declared.interfaces || []), ...(declared.bases || [])].join(" ");
}

// --- Releases

// A field is taken for another one under a new name where the code of its release only hands the value on.
function renamedFrom(field, byName) {
  if (!field.evolve || field.evolve.reads.length !== 1) return null;
  const old = byName.get(field.evolve.reads[0]);
  if (!old || old.dropped !== field.added || old.type !== field.type) return null;
  const code = field.evolve.code.replace(/\s+/g, "");
  const hands = [`${field.name}=${old.name};`, `${field.name}=std::move(${old.name});`, `${field.name}.swap(${old.name});`,
    `std::swap(${field.name},${old.name});`, `swap(${field.name},${old.name});`];
  return hands.includes(code) ? old : null;
}

// Of a model: {number, came: [{field, from}], went: [field]}, where a renamed field is not among those that went.
function releasesOf(declared) {
  const byName = new Map(declared.model.fields.map((field) => [field.name, field]));
  return declared.model.releases.map(({release, drops, adds}) => {
    const came = adds.map((name) => ({field: byName.get(name), from: renamedFrom(byName.get(name), byName)}));
    const kept = new Set(came.map(({from}) => from));
    return {number: release, came, went: drops.map((name) => byName.get(name)).filter((field) => !kept.has(field))};
  });
}

// --- Elements of all three tabs

function declaredLink(name, text = name) {
  if (!declarationsByName.has(name)) return text;
  return make("a", {class: "path", href: `#models/${encodeURIComponent(name)}`}, text);
}

function sourceLink(source, text = source.path) {
  return make("a", {class: "path", href: `#imports/${encodeURIComponent(source.path)}`}, pathText(text));
}

function listOf(parts) {
  return parts.flatMap((part, index) => (index > 0 ? [", ", part] : [part]));
}

// The text of a type, in which the names of what is declared are links.
function typeText(member) {
  const names = [...new Set(namesInShape(member.shape))].filter((name) => declarationsByName.has(name));
  const parts = [];
  let rest = member.type;
  while (rest !== "") {
    const found = names.map((name) => [rest.indexOf(name), name]).filter(([at]) => at >= 0)
      .sort((a, b) => a[0] - b[0] || b[1].length - a[1].length)[0];
    if (!found) break;
    parts.push(rest.slice(0, found[0]), declaredLink(found[1]));
    rest = rest.slice(found[0] + found[1].length);
  }
  return make("span", {class: "path"}, [...parts, rest]);
}

// What is missing in these tabs; null: nothing.
function faultsNotice() {
  if (!workspace) return null;
  const {faults, faultyFiles} = workspace;
  if (faults.length === 0 && faultyFiles.length === 0) return null;
  const place = (fault) => (fault.place === undefined ? "" : `${fault.place}:${fault.line}: `);
  return make("div", {class: "notice"}, [
    make("p", {}, [make("strong", {class: "bad"}, count(faults.length, "error")),
      ` in the workspace. ${faultyFiles.length ? `What ${count(faultyFiles.length, "file")} that could not be translated would declare and import` :
        "What they are about"} is missing here.`]),
    make("ul", {}, faults.slice(0, 20).map((fault) => make("li", {}, [make("span", {class: "path"}, place(fault)), fault.text]))),
    faults.length > 20 ? make("p", {class: "note"}, `And ${faults.length - 20} more.`) : null]);
}

// A tab with a list and a view of one thing in it, which the address names. `view(name)` gives elements, or null for an
// unknown name.
function makeViews(list, view) {
  const lists = make("div"), details = make("div");
  return {
    make: () => {
      if (!workspace) return [empty("The run ended before the workspace was known.")];
      lists.append(...list());
      return [faultsNotice(), lists, details].filter(Boolean);
    },
    show: (name) => {
      if (!workspace) return;
      const shown = name === "" ? null : view(name);
      details.replaceChildren(...(shown || []).filter(Boolean));
      details.hidden = !shown;
      lists.hidden = Boolean(shown);
    },
  };
}

function backLink(tab, text) {
  return make("p", {class: "back"}, make("a", {href: `#${tab}`}, text));
}
