// The requests and negotiations in view, and the table of one of them.
import { byId, element, table } from "./elements.js";
import { grouped } from "./trace.js";

const MOST_LISTED = 200;
const PROBLEMS = new Set(["refusal", "unexplained"]);

export class Calls {
  constructor(trace, open) {
    this.trace = trace;
    this.open = open;
    byId("close").addEventListener("click", () => open(undefined));
    byId("negotiation").addEventListener("close", () => open(undefined));
    byId("previous").addEventListener("click", () => this.step(-1));
    byId("next").addEventListener("click", () => this.step(1));
  }

  list({ from, to }, find) {
    const inView = this.trace.negotiations().filter((event) => {
      const at = this.trace.timeBefore(event.at);
      return at >= from && at <= to && find.showsSession(event.session);
    });
    const more = inView.length - MOST_LISTED;
    const note = inView.length === 0 ? "None in view." : "";
    byId("calls-note").textContent = more > 0 ? `${grouped(more)} more: zoom in.` : note;
    byId("calls").replaceChildren(...inView.slice(0, MOST_LISTED).map((event) => this.item(event)));
  }

  item(event) {
    const line = event.line === 0 ? "end: " : `line ${event.line}: `;
    const button = element("button", { type: "button", text: line + this.trace.eventText(event) });
    if (event.told.some(({ about }) => PROBLEMS.has(about))) button.classList.add("no");
    button.addEventListener("click", () => this.open(event.index));
    return element("li", {}, [button]);
  }

  // The next or previous one after or before a record that negotiated.
  near(at, direction) {
    const all = this.trace.negotiations().filter((event) => event.line !== 0);
    if (direction > 0) return all.find((event) => event.at > at);
    return all.filter((event) => event.at < at).at(-1);
  }

  step(direction) {
    const all = this.trace.negotiations();
    const next = all.findIndex((event) => event.index === this.shown) + direction;
    if (next >= 0 && next < all.length) this.open(all[next].index);
  }

  show(index) {
    const dialog = byId("negotiation");
    if (index === this.shown) return;
    this.shown = index;
    const event = this.trace.events[index];
    if (event === undefined) {
      dialog.close();
      return;
    }
    const line = event.line === 0 ? "End of the trace" : `Line ${event.line}`;
    byId("negotiation-title").textContent = `${line}: ${this.trace.eventText(event)}`;
    byId("negotiation-body").replaceChildren(...this.parts(event));
    if (!dialog.open) dialog.showModal();
    byId("negotiation-title").focus();
  }

  parts(event) {
    const parts = event.told.map(({ about, text, logged }) => {
      const label = about === "unexplained" || about === "logged" ? `${about}: ` : "";
      const line = logged === null ? [] : [element("span", { className: "quiet", text: ` (logged: ${logged})` })];
      const className = PROBLEMS.has(about) ? "no" : "";
      return element("p", { className }, [label + text, ...line]);
    });
    if (event.table !== undefined) {
      const [heading, ...rows] = event.table;
      parts.push(element("div", { className: "scroll", tabindex: 0 }, [table(heading, rows)]));
    }
    return [...parts, ...(event.chains ?? []).map((text) => element("p", { text }))];
  }
}
