// The page comes to life: links within it, the keys, the colours.

const list = new FileList();
const folders = new Folders((folder) => {
  history.replaceState(null, "", folder ? fragment("folder", folder) : "#files");
  chooseFolder(folder);
});

function chooseFolder(folder) {
  list.showFolder(folder);
  folders.mark(folder);
}

/** Go where the address says: to a file or a row of it, a folder, a code, what a search finds. */
function follow() {
  const [, kind, rest] = /^#(file|folder|code|find)-(.*)$/s.exec(decoded(location.hash)) ?? [];
  if (kind === "code") {
    const details = document.getElementById(`code-${rest}`);
    if (details) details.open = true;
    details?.querySelector("summary").focus();
  } else if (kind === "folder") {
    chooseFolder(rest);
    byId("files").scrollIntoView();
  } else if (kind === "find") {
    list.search(rest);
    byId("files").scrollIntoView();
  } else if (kind === "file") {
    showFile(rest);
  }
}

function showFile(text) {
  const [, path, row] = /^(.*):(\d+)$/s.exec(text) ?? [null, text, ""];
  const named = (name) => allFiles.find((file) => file.path === name);
  const file = named(text) ?? named(path);
  if (file) list.show(file, named(text) ? 0 : Number(row));
}

function decoded(text) {
  try {
    return decodeURIComponent(text);
  } catch {
    return text;
  }
}

const THEMES = ["system", "light", "dark"];

function setTheme(theme) {
  document.documentElement.dataset.theme = theme;
  byId("theme").textContent = `Theme: ${theme}`;
}

function startTheme() {
  // A page from a file may have no storage.
  const stored = () => {
    try {
      return localStorage.getItem("codeloom-theme");
    } catch {
      return null;
    }
  };
  setTheme(THEMES.includes(stored()) ? stored() : "system");
  byId("theme").hidden = false;
  byId("theme").addEventListener("click", () => {
    const theme = THEMES[(THEMES.indexOf(document.documentElement.dataset.theme) + 1) % THEMES.length];
    setTheme(theme);
    try {
      localStorage.setItem("codeloom-theme", theme);
    } catch {
      // it holds for this visit
    }
  });
}

document.addEventListener("keydown", (event) => {
  if (event.key !== "/" || event.altKey || event.ctrlKey || event.metaKey) return;
  if (event.target.matches?.("input, select, textarea")) return;
  event.preventDefault();
  byId("search").focus();
});
/** What is scrolled to isn't to lie below the controls where these stay at the top. */
function keepClear() {
  const controls = byId("controls");
  const height = getComputedStyle(controls).position === "sticky" ? controls.offsetHeight : 0;
  document.documentElement.style.setProperty("--controls", `${height}px`);
}

addEventListener("hashchange", follow);
document.addEventListener("click", (event) => {
  // The address doesn't change, but what it shows may have been closed since.
  const link = event.target.closest?.("a[href^='#']");
  if (link && link.hash === location.hash) follow();
});
addEventListener("resize", keepClear);
followNames(byId("list"));
startTheme();
byId("browser").hidden = false;
list.update();
keepClear();
follow();
