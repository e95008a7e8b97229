// The list of files: which are shown, in which order, and what one shows when it is open.

// Files that are in the list at once.
const PAGE = 200;
// Names that a search shows of a file.
const MOST_NAMES = 12;

/** A file's texts to search, in lower case. */
function haystackOf(file) {
  file.haystack ??= [file.path, file.names, file.more_codes, ...file.problems.map(problemText)].join("\n").toLowerCase();
  return file.haystack;
}
const problemText = (problem) => `${problem.code} ${problem.message} ${problem.hint ?? ""}`;

const hasAll = (text, words) => words.every((word) => text.includes(word));

/** The names in a file that have one of some words. */
function namesWith(file, words) {
  if (!words.length) return [];
  return file.names.split("\n").filter((name) => words.some((word) => name.toLowerCase().includes(word)));
}

class FileList {
  constructor() {
    this.list = byId("list");
    this.more = byId("more");
    this.words = [];
    this.folder = "";
    this.found = allFiles;
    this.limit = PAGE;
    this.open = new Set(); // files, so that they stay open while one types
    byId("search").addEventListener("input", () => this.searchSoon());
    byId("sort").addEventListener("change", () => this.update());
    byId("faulty").addEventListener("change", () => this.update());
    byId("controls").addEventListener("submit", (event) => event.preventDefault());
    byId("all").addEventListener("click", () => this.openAll());
    this.more.addEventListener("click", () => this.showMore());
    this.list.addEventListener("keydown", (event) => this.move(event));
  }

  searchSoon() {
    clearTimeout(this.timer);
    this.timer = setTimeout(() => this.update(), 80);
  }

  search(text) {
    byId("search").value = text;
    this.update();
  }

  /** Show the files below a folder, all for none. */
  showFolder(folder) {
    this.folder = folder;
    this.update();
  }

  /** Find and show the files anew. */
  update() {
    clearTimeout(this.timer);
    this.words = byId("search").value.toLowerCase().split(/\s+/).filter(Boolean);
    const isFaulty = byId("faulty").checked;
    this.found = allFiles.filter(
      (file) => (!isFaulty || file.count) && isBelow(file.path, this.folder) && hasAll(haystackOf(file), this.words),
    );
    const byPath = (a, b) => (a.path < b.path ? -1 : a.path > b.path ? 1 : a.number - b.number);
    this.found.sort(byId("sort").value === "problems" ? (a, b) => b.count - a.count || byPath(a, b) : byPath);
    this.limit = PAGE;
    this.render();
  }

  render() {
    this.list.replaceChildren(...this.found.slice(0, this.limit).map((file) => this.item(file)));
    this.showCounts();
  }

  showMore() {
    const start = this.limit;
    this.limit += PAGE;
    this.list.append(...this.found.slice(start, this.limit).map((file) => this.item(file)));
    this.showCounts();
    this.list.children[start]?.querySelector("summary").focus();
  }

  /** Open the files that are in the list, or close them if all are open. */
  openAll() {
    const all = [...this.list.querySelectorAll("details")];
    const isOpening = all.some((details) => !details.open);
    for (const details of all) details.open = isOpening;
  }

  showCounts() {
    const { found, words, folder } = this;
    const problems = found.reduce((sum, file) => sum + file.count, 0);
    const where = folder ? ` in ${folder}` : "";
    const isAll = found.length === allFiles.length;
    byId("found").textContent = found.length
      ? `${isAll ? "" : "found: "}${counted(found.length, "file")}${where}, ${counted(problems, "problem")}`
      : `Nothing${where} ${words.length ? `has “${words.join(" ")}”` : "to show"}.`;
    const left = found.length - this.limit;
    this.more.hidden = left <= 0;
    this.more.textContent = `Show ${Math.min(left, PAGE)} more of ${left.toLocaleString("en")}`;
  }

  item(file) {
    const details = make("details", { class: "file", id: fileLink(file).slice(1) }, this.summary(file));
    details.addEventListener("toggle", () => {
      if (details.open) {
        this.open.add(file);
        this.fill(details, file);
      } else {
        this.open.delete(file);
      }
    });
    details.firstChild.addEventListener("click", () => {
      if (!details.open) history.replaceState(null, "", fileLink(file)); // to be copied
    });
    if (this.open.has(file)) this.fill(details, file);
    details.open = this.open.has(file);
    return make("li", {}, details);
  }

  summary(file) {
    const slash = file.path.lastIndexOf("/") + 1;
    const folder = make("span", { class: "folder" }, file.path.slice(0, slash));
    return make(
      "summary",
      {},
      make("span", { class: "path" }, folder, file.path.slice(slash)),
      make(
        "span",
        { class: "badges" },
        file.errors ? badge("error", counted(file.errors, "error")) : null,
        file.warnings ? badge("warning", counted(file.warnings, "warning")) : null,
        file.count ? null : badge("sound", "no problems"),
        make("span", { class: "lines" }, counted(file.lines, "line")),
      ),
    );
  }

  /** Put into an open file what it shows. */
  fill(details, file) {
    if (details.children.length > 1) return;
    const data = rowsOf(file);
    details.append(...this.foundNames(file, data));
    const omitted = file.count - file.problems.length;
    if (data) {
      details.view = new SourceView(file, data);
      details.append(details.view.element);
      details.view.element.querySelectorAll(".plain").forEach(fillWhenNear);
    } else if (!file.count) {
      details.append(make("p", { class: "note" }, "The page holds the rows around problems, and there are none here."));
    }
    if (omitted) {
      const verb = omitted === 1 ? "isn't" : "aren't";
      const text = `${counted(omitted, "problem")} ${verb} in this page; codeloom check shows all.`;
      details.append(make("p", { class: "note" }, text));
    }
  }

  /** The names that a search has found in a file; one whose row is in the page leads there. */
  foundNames(file, data) {
    const names = namesWith(file, this.words);
    if (!names.length) return [];
    const shown = names.slice(0, MOST_NAMES).map((name) => {
      const row = data?.firstRowWith(name);
      return row ? make("a", { href: fileLink(file, row) }, make("code", {}, name)) : make("code", {}, name);
    });
    const more = names.length > MOST_NAMES ? `and ${names.length - MOST_NAMES} more` : "";
    return [make("p", { class: "note" }, "Names found: ", ...shown.flatMap((name) => [name, " "]), more)];
  }

  /** Up and down go from file to file, home and end to the first and the last. */
  move(event) {
    if (!event.target.matches?.("summary") || event.altKey || event.ctrlKey || event.metaKey) return;
    const all = [...this.list.querySelectorAll("summary")];
    const i = all.indexOf(event.target);
    const next = { ArrowDown: all[i + 1], ArrowUp: all[i - 1], Home: all[0], End: all.at(-1) }[event.key];
    if (!next) return;
    event.preventDefault();
    next.focus();
  }

  /** Open a file, go to it or to one of its rows. */
  show(file, row) {
    if (!this.found.includes(file)) {
      byId("search").value = "";
      byId("faulty").checked = false;
      this.folder = "";
      this.update();
    }
    const at = this.found.indexOf(file);
    if (at >= this.limit) {
      this.limit = Math.ceil((at + 1) / PAGE) * PAGE;
      this.render();
    }
    const details = this.list.children[at].firstChild;
    this.fill(details, file);
    details.open = true;
    const element = row ? details.view?.reveal(row) : null;
    for (const old of this.list.querySelectorAll(".row.target")) old.classList.remove("target");
    element?.classList.add("target");
    const goThere = () => (element ?? details).scrollIntoView({ block: element ? "center" : "start" });
    goThere();
    requestAnimationFrame(goThere); // what is now in view may take more room than it was given before
    (element?.querySelector(".number") ?? details.querySelector("summary")).focus({ preventScroll: true });
  }
}

const isBelow = (path, folder) =>
  !folder || (folder === "." ? !path.includes("/") : path.startsWith(`${folder}/`));
