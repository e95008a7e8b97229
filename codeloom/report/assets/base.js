"use strict";
// What all parts need: elements, data, places in words.

const byId = (id) => document.getElementById(id);

/** An element with attributes and children; texts become text nodes, so nothing in them is markup. */
function make(tag, attributes = {}, ...children) {
  const element = document.createElement(tag);
  for (const [name, value] of Object.entries(attributes)) {
    if (value !== undefined && value !== null && value !== false) element.setAttribute(name, value);
  }
  element.append(...children.filter((child) => child)); // null and empty texts are nothing
  return element;
}

const readData = (id) => JSON.parse(byId(id).textContent);

const counted = (count, noun) => `${count.toLocaleString("en")} ${noun}${count === 1 ? "" : "s"}`;

/** Every file: its path, counts, problems and names. */
const allFiles = readData("data-files").map((file, number) => ({
  number,
  lines: 0,
  errors: 0,
  warnings: 0,
  problems: [],
  more_codes: "", // of problems that aren't in the page
  names: "",
  ...file,
  count: (file.errors ?? 0) + (file.warnings ?? 0),
}));

/** The rows of a file that are in the page, or null; read when somebody wants to see them. */
function rowsOf(file) {
  if (file.data === undefined) {
    const element = byId(`data-rows-${file.number}`);
    file.data = element ? new FileRows(JSON.parse(element.textContent)) : null;
  }
  return file.data;
}

/** Where a problem is, as people read it. */
function placeOf(problem) {
  const [row, column] = problem.at;
  return problem.cell ? `cell ${problem.cell[0]}, ${problem.cell[1]}:${column}` : `${row}:${column}`;
}

/** The address within the page of a file, a folder and so on. */
const fragment = (kind, text) => `#${kind}-${encodeURI(text).replaceAll("#", "%23")}`;
const fileLink = (file, row) => fragment("file", file.path) + (row ? `:${row}` : "");

/** A count, set off by what it counts. */
const badge = (kind, ...content) => make("span", { class: `badge ${kind}` }, ...content);
