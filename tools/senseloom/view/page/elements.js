// Elements of the page. Texts of the trace become text nodes, never markup.

export function byId(id) {
  return document.getElementById(id);
}

export function element(name, { className, text, ...attributes } = {}, children = []) {
  const made = document.createElement(name);
  if (className !== undefined) made.className = className;
  if (text !== undefined) made.textContent = text;
  for (const [key, value] of Object.entries(attributes)) made.setAttribute(key, String(value));
  made.append(...children);
  return made;
}

export function swatch(colour) {
  const made = element("span", { className: "swatch" });
  made.style.background = colour;
  return made;
}

export function table(heading, rows) {
  const cells = (name, row) => element("tr", {}, row.map((text, index) => cell(index === 0 ? "th" : name, text)));
  const cell = (name, content) =>
    content instanceof Node ? element(name, {}, [content]) : element(name, { text: content });
  const head = element("thead", {}, [cells("th", heading)]);
  for (const each of head.querySelectorAll("th")) each.scope = "col";
  const body = element("tbody", {}, rows.map((row) => cells("td", row)));
  for (const each of body.querySelectorAll("th")) each.scope = "row";
  return element("table", {}, [head, body]);
}
