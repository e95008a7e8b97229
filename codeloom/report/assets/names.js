// Names in the source: what is known of one is shown while the mouse or the keyboard is on it.

/** A name, or a word such as `return` of which something is recorded. */
function nameNode(data, text, fact, records) {
  const role = fact < 0 ? "" : data.data.facts[fact][0];
  const node = make("span", { class: `name ${role.replaceAll(" ", "-")}`, tabindex: "-1" }, text);
  node.known = { data: data.data, fact, records };
  return node;
}

/** The keyboard comes to the first name of some rows; arrows go on from there. */
function makeReachable(rows) {
  const first = rows.querySelector(".name");
  if (first) first.tabIndex = 0;
}

const tip = byId("tip");
let tipped = null;

function showTip(name) {
  if (tipped === name) return;
  hideTip();
  const { data, fact, records } = name.known;
  const [role, where] = fact < 0 ? ["", ""] : data.facts[fact];
  const title = make("strong", {}, name.textContent);
  tip.replaceChildren(
    make("p", {}, title, role ? ` ${role}` : "", where ? make("span", {}, ` in ${where}`) : null),
    ...(data.records[records] ?? []).map((said) => make("p", { class: "said" }, said)),
  );
  tip.hidden = false;
  placeTip(name.getBoundingClientRect());
  name.setAttribute("aria-describedby", "tip");
  for (const other of name.closest(".source").querySelectorAll(".name")) {
    other.classList.toggle("same", other.textContent === name.textContent);
  }
  tipped = name;
}

function placeTip(at) {
  const room = document.documentElement;
  const left = Math.max(8, Math.min(at.left, room.clientWidth - tip.offsetWidth - 8));
  const below = at.bottom + 6;
  const isBelow = below + tip.offsetHeight < room.clientHeight;
  tip.style.left = `${left}px`;
  tip.style.top = `${isBelow ? below : Math.max(8, at.top - tip.offsetHeight - 6)}px`;
}

function hideTip() {
  if (!tipped) return;
  tip.hidden = true;
  tipped.removeAttribute("aria-describedby");
  for (const same of document.querySelectorAll(".name.same")) same.classList.remove("same");
  tipped = null;
}

/** Left and right go to the next name, up and down to the nearest one on another row. */
function moveFrom(name, key) {
  const rows = name.closest(".stretch");
  const names = [...rows.querySelectorAll(".name")];
  const i = names.indexOf(name);
  let next = { ArrowRight: names[i + 1], ArrowLeft: names[i - 1], Home: names[0], End: names.at(-1) }[key];
  if (key === "ArrowDown" || key === "ArrowUp") {
    const { left } = name.getBoundingClientRect();
    const distance = (other) => Math.abs(other.getBoundingClientRect().left - left);
    const others = key === "ArrowDown" ? names.slice(i + 1) : names.slice(0, i).reverse();
    const row = others.find((other) => other.closest(".row") !== name.closest(".row"))?.closest(".row");
    next = others.filter((other) => row && other.closest(".row") === row).sort((a, b) => distance(a) - distance(b))[0];
  }
  if (!next) return;
  name.tabIndex = -1;
  next.tabIndex = 0;
  next.focus();
}

function followNames(list) {
  const nameAt = (event) => (event.target instanceof Element ? event.target.closest(".name") : null);
  list.addEventListener("pointerover", (event) => (nameAt(event) ? showTip(nameAt(event)) : hideTip()));
  list.addEventListener("pointerleave", hideTip);
  list.addEventListener("focusin", (event) => (nameAt(event) ? showTip(nameAt(event)) : hideTip()));
  list.addEventListener("focusout", hideTip);
  list.addEventListener("keydown", (event) => {
    const name = nameAt(event);
    if (!name || event.altKey || event.ctrlKey || event.metaKey) return;
    if (!["ArrowLeft", "ArrowRight", "ArrowUp", "ArrowDown", "Home", "End"].includes(event.key)) return;
    event.preventDefault();
    event.stopPropagation();
    moveFrom(name, event.key);
  });
  document.addEventListener("keydown", (event) => event.key === "Escape" && hideTip());
  const place = () => tipped && placeTip(tipped.getBoundingClientRect());
  addEventListener("scroll", place, { passive: true, capture: true });
}
