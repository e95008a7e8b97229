// The source of a file: its rows with marks and names, and what is wrong with them below.

// Rows that become elements at once, as they come near the window.
const CHUNK = 100;

/** The rows of one file that are in the page. */
class FileRows {
  constructor(data) {
    this.data = data;
    this.isWhole = data.whole;
    this.shown = data.shown;
    this.count = data.rows.length;
    this.place = new Map(); // the index of a row's data by its number
    let i = 0;
    for (const [first, last] of this.isWhole ? [[1, this.count]] : this.shown) {
      for (let row = first; row <= last; row++) this.place.set(row, i++);
    }
  }

  /** The number of the first row that has a name; undefined when there is none in the page. */
  firstRowWith(name) {
    for (const number of this.place.keys()) {
      const row = this.row(number);
      if (!row.text.includes(name)) continue;
      const characters = charactersOf(row.text);
      const isIt = ([start, end, fact]) => fact >= 0 && textOf(characters, start, end) === name;
      if (namesIn(row, characters.length).some(isIt)) return number;
    }
    return undefined;
  }

  labelOf(number) {
    const { cell, label } = this.row(number);
    return cell ? `cell ${cell}, row ${label}` : `row ${label}`;
  }

  /** A row: its text with the characters cut before and after it, its names, its cell and its number there. */
  row(number) {
    const i = this.place.get(number);
    const row = this.data.rows[i];
    const [start, text, cutAfter] = typeof row === "string" ? [0, row, 0] : row;
    const [cell, label] = this.data.cells?.[i] ?? [null, number];
    return { number, start, text, cutAfter, names: this.data.names[i], cell, label };
  }
}

/** Characters of a text as the engine counts them: code points. */
const charactersOf = (text) => (/[\ud800-\udfff]/.test(text) ? Array.from(text) : text);
const textOf = (characters, start, end) => {
  const part = characters.slice(start, end);
  return typeof part === "string" ? part : part.join("");
};

/** The marks of a file's problems by row: [first, end, kind, what is said at the end of the row]. */
function marksOf(file) {
  const marks = new Map();
  const add = ([row, column, endRow, endColumn], kind, said) => {
    for (let at = row; at <= Math.min(endRow, row + CHUNK); at++) {
      const first = at === row ? column - 1 : 0;
      const end = at === endRow ? endColumn - 1 : Infinity;
      if (!marks.has(at)) marks.set(at, []);
      marks.get(at).push([first, end, kind, at === row ? said : ""]);
    }
  };
  for (const problem of file.problems) {
    for (const [row, column, endRow, endColumn, said] of problem.related ?? []) {
      add([row, column, endRow, endColumn], "related", said);
    }
    add(problem.at, problem.severity);
  }
  return marks;
}

/** The marks of a row as [start, end, kind] in its text, each of one character or more; not those of what is cut. */
function marksIn(row, length, marks) {
  const isHeld = ([first, end]) => end > row.start && (first < row.start + length || !row.cutAfter);
  return marks.filter(isHeld).map(([first, end, kind]) => {
    const start = Math.min(Math.max(first - row.start, 0), length);
    return [start, Math.max(Math.min(end - row.start, length), start + 1), kind];
  });
}

/** The names of a row as [start, end, fact, records] in its text. */
function namesIn(row, length) {
  const names = [];
  for (let i = 0; i < row.names.length; i += 4) {
    const [first, size, fact, records] = row.names.slice(i, i + 4);
    const start = first - row.start;
    if (start >= 0 && start + size <= length) names.push([start, start + size, fact, records]);
  }
  return names;
}

/** A row's text as nodes: cut where a mark or a name begins or ends. */
function rowNodes(data, row, allMarks) {
  const characters = charactersOf(row.text);
  const marks = marksIn(row, characters.length, allMarks);
  const names = namesIn(row, characters.length);
  const ends = [...marks, ...names].flatMap(([start, end]) => [start, end]);
  const cuts = [...new Set([0, characters.length, ...ends])].sort((a, b) => a - b);
  const nodes = cuts.slice(1).map((to, i) => {
    const from = cuts[i];
    const isIn = ([start, end]) => start <= from && to <= end;
    const text = textOf(characters, from, to).padEnd(to - from, " ");
    const name = names.find(isIn);
    const mark = marks.find(isIn);
    const node = name ? nameNode(data, text, name[2], name[3]) : text;
    return mark ? make("mark", { class: mark[2] }, node) : node;
  });
  return [row.start ? "…" : "", ...nodes, row.cutAfter ? "…" : ""];
}

/** One row of source, with its number. */
function rowElement(file, data, row, marks) {
  const said = marks.map((mark) => mark[3]).filter(Boolean);
  const link = { class: "number", href: fileLink(file, row.number), tabindex: "-1", "aria-label": `row ${row.label}` };
  return make(
    "div",
    { class: "row", "data-row": row.number },
    make("a", link, String(row.label)),
    make("code", {}, ...rowNodes(data, row, marks)),
    said.length ? make("span", { class: "said" }, said.join("; ")) : null,
  );
}

/** What is wrong, with its hint and the places that it has to do with. */
function problemElement(file, data, problem) {
  const related = (problem.related ?? [])
    .filter(([row]) => row !== problem.at[0]) // on its own row it is said there
    .map(([row, , , , said]) => {
      const link = make("a", { href: fileLink(file, row) }, data.labelOf(row));
      return make("li", {}, `${said}: `, link);
    });
  return make(
    "div",
    { class: `problem ${problem.severity}` },
    make(
      "p",
      {},
      make("a", { class: "place", href: fileLink(file, problem.at[0]) }, placeOf(problem)),
      " ",
      make("a", { class: `code ${problem.severity}`, href: `#code-${problem.code}` }, problem.code),
      problem.severity === "warning" ? " warning: " : " ",
      make("span", { class: "message" }, problem.message),
    ),
    problem.hint ? make("p", { class: "hint" }, "hint: ", problem.hint) : null,
    related.length ? make("ul", { class: "places" }, ...related) : null,
  );
}

/** The source of one open file. */
class SourceView {
  constructor(file, data) {
    this.file = file;
    this.data = data;
    this.marks = marksOf(file);
    this.problems = Map.groupBy(file.problems, (problem) => problem.at[0]);
    // It scrolls sideways, by keyboard too.
    const attributes = { class: "source", role: "group", tabindex: "0", "aria-label": `Source of ${file.path}` };
    this.element = make("div", attributes, ...this.parts());
  }

  /** The rows around problems, with what is between them; all rows of a file without problems. */
  parts() {
    const { shown, isWhole, count } = this.data;
    if (!shown.length) return this.chunks(1, count);
    const parts = [];
    let next = 1;
    for (const [first, last] of shown) {
      if (first > next) parts.push(this.gap(next, first - 1));
      parts.push(this.stretch(first, last));
      next = last + 1;
    }
    if (isWhole && next <= count) parts.push(this.gap(next, count));
    return parts;
  }

  gap(first, last) {
    if (!this.data.isWhole) return make("div", { class: "gap" }, "⋯");
    const [from, to] = [this.data.labelOf(first), this.data.labelOf(last)];
    const text = first === last ? `Show ${from}` : `Show ${from} to ${to}`;
    const button = make("button", { class: "gap", type: "button", "data-first": first, "data-last": last }, text);
    button.addEventListener("click", () => this.openGap(button));
    return button;
  }

  openGap(button) {
    const chunks = this.chunks(Number(button.dataset.first), Number(button.dataset.last));
    button.replaceWith(...chunks);
    chunks.slice(1).forEach(fillWhenNear);
    chunks[0].fill().focus({ preventScroll: true });
  }

  chunks(first, last) {
    const chunks = [];
    for (let row = first; row <= last; row += CHUNK) {
      chunks.push(this.chunk(row, Math.min(row + CHUNK - 1, last)));
    }
    return chunks;
  }

  /** Rows as plain text, which the browser can search, until they are near the window. */
  chunk(first, last) {
    const rows = [];
    for (let row = first; row <= last; row++) rows.push(this.data.row(row).text);
    const attributes = { class: "stretch plain", "data-first": first, "data-last": last };
    const element = make("pre", attributes, rows.join("\n"));
    element.fill = () => {
      const rows = this.stretch(first, last);
      element.replaceWith(rows);
      return rows;
    };
    return element;
  }

  stretch(first, last) {
    const element = make("div", {
      class: "stretch",
      role: "group",
      tabindex: "-1",
      "aria-label": first === last ? `Row ${first}` : `Rows ${first} to ${last}`,
    });
    let cell = null;
    for (let number = first; number <= last; number++) {
      const row = this.data.row(number);
      if (row.cell !== cell) {
        cell = row.cell;
        element.append(make("p", { class: "cell" }, `cell ${cell}`));
      }
      element.append(rowElement(this.file, this.data, row, this.marks.get(number) ?? []));
      for (const problem of this.problems.get(number) ?? []) {
        element.append(problemElement(this.file, this.data, problem));
      }
    }
    makeReachable(element);
    return element;
  }

  /** The element of a row, which is made now if it wasn't there yet; null when the page doesn't hold it. */
  reveal(row) {
    for (const part of this.element.querySelectorAll("[data-first]")) {
      if (Number(part.dataset.first) > row || row > Number(part.dataset.last)) continue;
      if (part.matches("button")) {
        this.openGap(part);
        return this.reveal(row);
      }
      part.fill();
      break;
    }
    return this.element.querySelector(`[data-row="${row}"]`);
  }
}

const nearness = new IntersectionObserver(
  (entries) => {
    for (const { isIntersecting, target } of entries) {
      if (!isIntersecting) continue;
      nearness.unobserve(target);
      if (target.isConnected) target.fill();
    }
  },
  { rootMargin: "600px" },
);
const fillWhenNear = (chunk) => nearness.observe(chunk);
