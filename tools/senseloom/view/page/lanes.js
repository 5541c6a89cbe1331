// The rows of the time line: a ruler, and for each sensor its records and its sessions, in groups.
import { Columns, LaneDrawing } from "./drawing.js";
import { byId, element, swatch } from "./elements.js";
import { counted, grouped } from "./trace.js";

const MOST_LANES = 100;

export class Lanes {
  constructor(trace, colours, clock) {
    this.trace = trace;
    this.colours = colours;
    this.clock = clock;
    this.rows = [];
    this.isCut = false;
  }

  // Builds the rows that a search leaves; `choose` is given the name of a class that was clicked.
  build(find, choose) {
    this.rows = [];
    const parts = [];
    const sessions = this.trace.sessions.filter(({ index }) => find.showsSession(index));
    this.isCut = sessions.length > MOST_LANES;
    const shown = sessions.slice(0, MOST_LANES);
    for (const sensor of this.trace.sensors) {
      const own = shown.filter((session) => session.sensor === sensor.index);
      if (!find.showsSensor(sensor.index) || (this.isCut && own.length === 0)) continue;
      parts.push(this.heading(sensor, choose), this.addRow(sensor, null));
      for (const session of own) parts.push(this.addRow(sensor, session));
    }
    byId("lanes").replaceChildren(...parts);
  }

  heading(sensor, choose) {
    const hues = [...sensor.hues.entries()].filter(([, text]) => text !== null);
    const buttons = hues.map(([hue, text]) => {
      const button = element("button", { type: "button", className: "hue", title: `Search for ${text}` }, [
        swatch(this.colours.hues[hue]),
        text,
      ]);
      button.addEventListener("click", () => choose(text));
      return button;
    });
    const words = element("span", { className: "quiet", text: sensor.title });
    const title = element("h3", { text: `${sensor.name} ` }, [words]);
    return element("div", { className: "sensor" }, [title, ...buttons]);
  }

  addRow(sensor, session) {
    const canvas = element("canvas", { role: "img" });
    const label = element("div", { className: "label" });
    if (session === null) {
      canvas.setAttribute("aria-label", `Records of ${sensor.name}`);
      label.append(element("b", { text: "records" }));
    } else {
      const total = session.fates.reduce((sum, count) => sum + count, 0);
      const results = `${grouped(session.results)} of ${counted(total, "record")}`;
      canvas.setAttribute("aria-label", `What ${session.name} received: ${results}`);
      label.append(element("b", { text: session.name, title: session.name }), element("span", { text: results }));
    }
    this.rows.push({ sensor, session, canvas, lane: (session ?? sensor).lane });
    return element("div", { className: `lane ${session === null ? "records" : "session"}` }, [label, canvas]);
  }

  draw({ from, to, record }, find) {
    const ruler = new LaneDrawing(byId("ruler").firstElementChild, this.colours);
    const { width } = ruler;
    const columns = new Columns(this.trace, this.rows.map(({ lane }) => lane), { from, to }, width);
    const xOf = (at) => ((at - from) / (to - from)) * width;
    const cursor = record === undefined ? null : xOf(this.trace.pageRecords.timeOf(record));
    ruler.drawRuler(this.clock.marks(from, to, width / 110).map(({ at, text }) => ({ x: xOf(at), text })));
    if (cursor !== null) ruler.drawCursor(cursor);

    this.marks = this.eventMarks(xOf, width);
    for (const row of this.rows) {
      const drawing = new LaneDrawing(row.canvas, this.colours);
      const marks = this.marks.get(row.sensor.index) ?? [];
      if (row.session === null) drawing.drawRecords(columns, row.lane, row.sensor, find);
      else drawing.drawSession(columns, row.session, row.sensor, find);
      drawing.drawNegotiations(marks.filter(({ event }) => event.table !== undefined).map(({ x }) => x));
      if (row.session !== null) {
        const own = marks.filter(({ event }) => event.call === "set_option" && event.session === row.session.index);
        drawing.drawRequests(own.map(({ x, event }) => ({ x, failed: event.failed })));
      }
      if (cursor !== null) drawing.drawCursor(cursor);
    }
  }

  // The events in view, by sensor, with their places.
  eventMarks(xOf, width) {
    const marks = new Map();
    for (const event of this.trace.negotiations()) {
      const x = xOf(this.trace.timeBefore(event.at));
      if (x < -5 || x > width + 5) continue;
      const { sensor } = this.trace.sessions[event.session];
      if (!marks.has(sensor)) marks.set(sensor, []);
      marks.get(sensor).push({ x, event });
    }
    return marks;
  }

  // The event whose mark is close to a place; undefined if none is.
  eventAt(x, canvas) {
    const row = this.rows.find((each) => each.canvas === canvas);
    const marks = row === undefined ? [] : (this.marks.get(row.sensor.index) ?? []);
    const close = marks.filter((mark) => Math.abs(mark.x - x) <= 5 && mark.event.line !== 0);
    return close.sort((one, other) => Math.abs(one.x - x) - Math.abs(other.x - x))[0]?.event;
  }
}
