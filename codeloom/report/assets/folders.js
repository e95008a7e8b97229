// The tree of folders. One of them is chosen, and the list shows the files below it.

/** Folders by name, each {name, path, files, problems, folders}; those with nothing beside them are joined. */
function folderTree() {
  const root = { name: "all files", path: "", files: 0, problems: 0, folders: new Map() };
  for (const file of allFiles) {
    const parts = file.path.split("/").slice(0, -1);
    let folder = root;
    count(folder, file);
    for (const [i, name] of parts.entries()) {
      const path = parts.slice(0, i + 1).join("/");
      if (!folder.folders.has(name)) folder.folders.set(name, { name, path, files: 0, problems: 0, folders: new Map() });
      folder = folder.folders.get(name);
      count(folder, file);
    }
  }
  return joined(root);
}

function count(folder, file) {
  folder.files++;
  folder.problems += file.count;
}

function joined(folder) {
  const folders = [...folder.folders.values()].map(joined);
  const [only] = folders;
  if (folder.path && folders.length === 1 && only.files === folder.files) {
    return { ...only, name: `${folder.name}/${only.name}` };
  }
  return { ...folder, folders };
}

/** A number, with its noun for those who can't see what it belongs to. */
const badge = (count, noun, severity) =>
  make("span", { class: `badge ${severity}` }, count.toLocaleString("en"), make("span", { class: "for-ears" }, ` ${noun}${count === 1 ? "" : "s"}`));

class Folders {
  constructor(onChosen) {
    this.onChosen = onChosen;
    this.root = folderTree();
    this.tree = make("ul", { role: "tree", "aria-label": "Folders" }, this.item(this.root, true));
    this.tree.querySelector("[role=treeitem]").tabIndex = 0;
    this.tree.addEventListener("keydown", (event) => this.move(event));
    this.tree.addEventListener("click", (event) => this.click(event));
    this.mark("");
    const isWide = matchMedia("(min-width: 900px)");
    const details = make("details", {}, make("summary", {}, "Folders"), this.tree);
    const adapt = () => (details.open = isWide.matches);
    isWide.addEventListener("change", adapt);
    adapt();
    if (this.root.folders.length) byId("folders").append(details);
    else byId("folders").remove();
  }

  /** A folder, open when it is to be or when there is nothing beside it. */
  item(folder, isOpen) {
    const label = make(
      "span",
      { class: "label" },
      make("span", { class: "arrow", "aria-hidden": "true" }),
      make("span", { class: "name-of-folder" }, folder.name),
      folder.problems ? badge(folder.problems, "problem", "error") : make("span", { class: "lines" }, counted(folder.files, "file")),
    );
    const item = make("li", { role: "treeitem", tabindex: "-1", "aria-selected": "false" }, label);
    item.dataset.path = folder.path;
    if (folder.folders.length) {
      item.setAttribute("aria-expanded", String(isOpen));
      item.make = () => make("ul", { role: "group" }, ...folder.folders.map((each) => this.item(each, folder.folders.length === 1)));
      if (isOpen) item.append(item.make());
    }
    return item;
  }

  open(item, isOpen) {
    if (!item.make) return;
    item.setAttribute("aria-expanded", String(isOpen));
    if (isOpen && item.children.length === 1) item.append(item.make());
  }

  click(event) {
    const item = event.target.closest("[role=treeitem]");
    if (!item) return;
    if (event.target.matches(".arrow")) this.open(item, item.getAttribute("aria-expanded") !== "true");
    else this.choose(item);
    this.focus(item);
  }

  choose(item) {
    this.open(item, true);
    this.onChosen(item.dataset.path);
  }

  /** Show which folder is chosen. */
  mark(path) {
    for (const item of this.tree.querySelectorAll("[role=treeitem]")) {
      item.setAttribute("aria-selected", String(item.dataset.path === path));
    }
  }

  focus(item) {
    for (const other of this.tree.querySelectorAll('[tabindex="0"]')) other.tabIndex = -1;
    item.tabIndex = 0;
    item.focus();
  }

  move(event) {
    const item = event.target.closest("[role=treeitem]");
    const seen = [...this.tree.querySelectorAll("[role=treeitem]")].filter((each) => each.offsetParent);
    const i = seen.indexOf(item);
    const isOpen = item.getAttribute("aria-expanded") === "true";
    const actions = {
      ArrowDown: () => this.focus(seen[i + 1] ?? item),
      ArrowUp: () => this.focus(seen[i - 1] ?? item),
      Home: () => this.focus(seen[0]),
      End: () => this.focus(seen.at(-1)),
      ArrowRight: () => (isOpen ? this.focus(seen[i + 1] ?? item) : this.open(item, true)),
      ArrowLeft: () => (isOpen ? this.open(item, false) : this.focus(item.parentElement.closest("[role=treeitem]") ?? item)),
      Enter: () => this.choose(item),
      " ": () => this.choose(item),
    };
    if (!actions[event.key] || event.altKey || event.ctrlKey || event.metaKey) return;
    event.preventDefault();
    actions[event.key]();
  }
}
