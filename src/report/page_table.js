// Tables, and what stands where there is nothing to be shown.

const MOST_ROWS = 200;

// A table that can be sorted and searched. Columns: {title, value(row) to sort by, cell(row), numeric, rising, wide}: numbers
// begin with the largest unless they rise; a wide column is left out where there is little room.
function makeTable(label, rows, columns, sortedBy, textOf) {
  const falls = (column) => column.numeric === true && !column.rising;
  let order = sortedBy, descending = falls(columns[sortedBy]), all = false, words = "";
  const body = make("tbody"), status = make("p", {class: "status", "aria-live": "polite"});
  const heads = columns.map((column, index) => make("th", {scope: "col", class: classOf(column)},
    make("button", {type: "button", onclick: () => sortBy(index)}, column.title)));
  const more = make("button", {type: "button", class: "more", onclick: () => { all = true; fill(); }});

  function classOf(column) {
    return [column.numeric && "number", column.wide && "wide"].filter(Boolean).join(" ") || null;
  }
  function sortBy(index) {
    descending = index === order ? !descending : falls(columns[index]);
    order = index;
    fill();
  }
  function isFound(text) {
    return words.split(" ").every((word) => text.includes(word));
  }
  function fill() {
    const {value} = columns[order], sign = descending ? -1 : 1;
    const found = rows.filter((row) => isFound(textOf(row).toLowerCase()));
    const compare = (a, b) => (a < b ? -1 : a > b ? 1 : 0);
    found.sort((a, b) => sign * compare(value(a), value(b)) || compare(textOf(a), textOf(b)));
    const shown = all ? found : found.slice(0, MOST_ROWS);
    body.replaceChildren(...shown.map((row) => make("tr", {}, columns.map((column, index) =>
      make(index === 0 ? "th" : "td", {class: classOf(column), scope: index === 0 ? "row" : null}, column.cell(row))))));
    heads.forEach((head, index) =>
      head.setAttribute("aria-sort", index !== order ? "none" : descending ? "descending" : "ascending"));
    status.textContent = words ? `${found.length} of ${rows.length} found` : "";
    more.hidden = shown.length === found.length;
    more.textContent = `Show all ${found.length.toLocaleString("en")}`;
  }
  const search = make("input", {type: "search", placeholder: "Search", "aria-label": `Search in ${label}`,
    oninput: (event) => { words = event.target.value.toLowerCase(); fill(); }});
  fill();
  return make("div", {class: "table"}, [
    rows.length > 10 ? make("div", {class: "search"}, [search, status]) : null,
    make("table", {}, [make("caption", {}, label), make("thead", {}, make("tr", {}, heads)), body]), more]);
}

function empty(text) {
  return make("p", {class: "empty"}, text);
}
