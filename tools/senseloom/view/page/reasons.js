// For each session how many records came to what, as bars. A bar is a button that chooses its records.
import { byId, element } from "./elements.js";
import { counted, grouped } from "./trace.js";

const MOST_ACCOUNTS = 60;

export class Reasons {
  constructor(trace, colours, choose) {
    this.trace = trace;
    this.colours = colours;
    this.choose = choose;
  }

  show(find) {
    const sessions = this.trace.sessions.filter(({ index }) => find.showsSession(index));
    const parts = sessions.slice(0, MOST_ACCOUNTS).map((session) => this.account(session, find));
    if (sessions.length > MOST_ACCOUNTS) {
      const text = `${sessions.length - MOST_ACCOUNTS} more sessions: search for one.`;
      parts.push(element("p", { className: "quiet", text }));
    }
    byId("reasons").replaceChildren(...parts);
  }

  account(session, find) {
    const total = session.fates.reduce((sum, count) => sum + count, 0);
    const most = Math.max(...session.fates);
    const used = [...session.fates.entries()].filter(([, count]) => count > 0);
    const buttons = used.map(([fate, count]) => {
      const fill = element("i");
      fill.style.width = `${(100 * count) / most}%`;
      fill.style.background = this.colours.fates[fate];
      const isChosen = find.reason !== null && find.reason.session === session.index && find.reason.fate === fate;
      const button = element("button", { type: "button", className: "reason", "aria-pressed": isChosen }, [
        element("span", { text: this.trace.fates[fate] }),
        element("span", { text: grouped(count) }),
        element("span", { className: "bar", "aria-hidden": true }, [fill]),
      ]);
      button.dataset.reason = `${session.index} ${fate}`;
      button.addEventListener("click", () => this.choose(isChosen ? {} : { session: session.index, fate }));
      return button;
    });
    const sensor = this.trace.sensors[session.sensor].name;
    const title = element("h3", { text: `${session.name} ` }, [
      element("span", { className: "quiet", text: `${sensor}, ${counted(total, "record")}` }),
    ]);
    return element("div", { className: "account" }, [title, ...buttons]);
  }
}
