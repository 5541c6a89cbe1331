// What is told of one record: what it shows, and what became of it for each session.
import { byId, element, swatch, table } from "./elements.js";
import { grouped } from "./trace.js";

export class Details {
  constructor(trace, colours, clock) {
    this.trace = trace;
    this.colours = colours;
    this.clock = clock;
  }

  heading(record) {
    const { contents } = this.trace.pageRecords;
    const content = contents[record.content];
    const when = this.clock.isTime ? `${this.clock.text(record.time)} ` : "";
    const what = `${this.trace.sensors[content.sensor].name}: ${this.trace.contentText(content)}`;
    return `line ${grouped(record.line)}, ${when}(timestamp ${this.clock.timestamp(record.time)}), ${what}`;
  }

  fates(record) {
    const { contents } = this.trace.pageRecords;
    return record.receptions.map(({ session, verdict, result }) => ({
      session: this.trace.sessions[session].name,
      verdict: this.trace.verdictText(verdict),
      fate: this.trace.pageRecords.verdicts[verdict].fate,
      result: result < 0 ? "" : this.trace.contentText(contents[result]),
    }));
  }

  // As one sentence, for the slider.
  text(record) {
    const texts = this.fates(record).map(({ session, verdict, result }) => [`${session} ${verdict}`, result]);
    const fates = texts.map((parts) => parts.filter((text) => text !== "").join(", "));
    return `${this.heading(record)}; ${fates.join("; ") || "no session"}`;
  }

  show(record, isChosen, note) {
    const box = byId("record");
    if (record === null) {
      const text = "Point at a record, or choose one with the arrow keys.";
      box.replaceChildren(element("p", { className: "quiet", text }));
      return;
    }
    const rows = this.fates(record).map(({ session, verdict, fate, result }) => [
      session,
      element("span", {}, [swatch(this.colours.fates[fate]), ` ${verdict}`]),
      result,
    ]);
    const parts = [element("p", {}, [element("b", { text: this.heading(record) }), ` ${note}`])];
    if (rows.length > 0) {
      parts.push(element("div", { className: "scroll" }, [table(["session", "became of it", "received"], rows)]));
    } else {
      parts.push(element("p", { className: "quiet", text: "No session was open on the sensor." }));
    }
    box.replaceChildren(...parts);
    box.classList.toggle("chosen", isChosen);
  }
}
