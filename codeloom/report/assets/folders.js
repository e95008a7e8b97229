// The tree of folders. One of them is chosen, and the list shows the files below it.

const newFolder = (name, path) => ({ name, path, files: 0, problems: 0, folders: new Map() });

/** The folder that holds all, with those below it. */
function folderTree() {
  const root = newFolder("all files", "");
  for (const file of allFiles) {
    let folder = root;
    count(folder, file);
    for (let end = file.path.indexOf("/", 1); end > 0; end = file.path.indexOf("/", end + 1)) {
      const path = file.path.slice(0, end);
      const name = folder === root ? path : path.slice(folder.path.length + 1);
      if (!folder.folders.has(name)) folder.folders.set(name, newFolder(name, path));
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

/** A folder whose only content is another one, as one with that. */
function joined(folder) {
  const folders = [...folder.folders.values()].map(joined);
  const [only] = folders;
  if (folder.path && folders.length === 1 && only.files === folder.files) {
    return { ...only, name: `${folder.name}/${only.name}` };
  }
  return { ...folder, folders };
}

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
    const { problems } = folder;
    const noun = make("span", { class: "for-ears" }, problems === 1 ? " problem" : " problems");
    const label = make(
      "span",
      { class: "label" },
      make("span", { class: "arrow", "aria-hidden": "true" }),
      make("span", { class: "name-of-folder" }, folder.name),
      problems
        ? badge("error", problems.toLocaleString("en"), noun)
        : make("span", { class: "lines" }, counted(folder.files, "file")),
    );
    const item = make("li", { role: "treeitem", tabindex: "-1", "aria-selected": "false" }, label);
    item.dataset.path = folder.path;
    if (folder.folders.length) {
      item.setAttribute("aria-expanded", String(isOpen));
      const isAlone = folder.folders.length === 1;
      item.make = () => make("ul", { role: "group" }, ...folder.folders.map((each) => this.item(each, isAlone)));
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

  /** Show which folder is chosen, and open those that it is in. */
  mark(path) {
    const isAbove = (item) => !item.dataset.path || path.startsWith(`${item.dataset.path}/`);
    for (let item = this.tree.firstChild; item && path; ) {
      this.open(item, true);
      item = [...(item.lastChild.children ?? [])].find((each) => each.matches("li") && isAbove(each));
    }
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
    const parent = item.parentElement.closest("[role=treeitem]");
    const actions = {
      ArrowDown: () => this.focus(seen[i + 1] ?? item),
      ArrowUp: () => this.focus(seen[i - 1] ?? item),
      Home: () => this.focus(seen[0]),
      End: () => this.focus(seen.at(-1)),
      ArrowRight: () => (isOpen ? this.focus(seen[i + 1] ?? item) : this.open(item, true)),
      ArrowLeft: () => (isOpen ? this.open(item, false) : this.focus(parent ?? item)),
      Enter: () => this.choose(item),
      " ": () => this.choose(item),
    };
    if (!actions[event.key] || event.altKey || event.ctrlKey || event.metaKey) return;
    event.preventDefault();
    actions[event.key]();
  }
}
