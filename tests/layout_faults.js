// What of a page is wider than the window, and siblings that lie on each other.
() => {
  const PARENTS =
    ".top, .top nav, .tiles, .charts, .bars li, #controls, .columns, #list, summary, .badges, .label, .row, tr";
  const faults = [];
  const width = document.documentElement.clientWidth;
  const shown = (element) => element.outerHTML.slice(0, 90);
  const overlap = (a, b) =>
    a.left < b.right - 1 && b.left < a.right - 1 && a.top < b.bottom - 1 && b.top < a.bottom - 1;

  if (document.documentElement.scrollWidth > width) faults.push("the page is wider than the window");
  for (const parent of document.querySelectorAll(PARENTS)) {
    const placed = [...parent.children]
      .map((element) => [element, element.getBoundingClientRect()])
      .filter(([, box]) => box.width && box.height);
    for (const [i, [element, box]] of placed.entries()) {
      const mayBeWide = parent.closest(".source"); // it scrolls by itself
      if (!mayBeWide && (box.left < -1 || box.right > width + 1)) faults.push(`outside: ${shown(element)}`);
      for (const [other, otherBox] of placed.slice(i + 1)) {
        if (overlap(box, otherBox)) faults.push(`${shown(element)} lies on ${shown(other)}`);
      }
    }
  }
  return faults;
}
