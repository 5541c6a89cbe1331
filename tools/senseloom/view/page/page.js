// The page: its parts, and what pointers and keys do to them.
import { Calls } from "./calls.js";
import { Colours } from "./colours.js";
import { Details } from "./details.js";
import { byId, element } from "./elements.js";
import { Find } from "./find.js";
import { Lanes } from "./lanes.js";
import { Pointer } from "./pointer.js";
import { Reasons } from "./reasons.js";
import { Records } from "./records.js";
import { State } from "./state.js";
import { Clock } from "./time.js";
import { counted, Trace } from "./trace.js";

const ZOOM = 1.6;
const MOST_STEPS = 200_000; // records looked at for the next one that passes

class Page {
  constructor(trace) {
    this.trace = trace;
    this.records = trace.pageRecords;
    this.colours = new Colours(trace, () => this.rebuild());
    const clock = new Clock(trace);
    this.lanes = new Lanes(trace, this.colours, clock);
    this.details = new Details(trace, this.colours, clock);
    this.state = new State(trace.whole, () => this.update());
    this.reasons = new Reasons(trace, this.colours, (reason) => this.choose(reason));
    this.calls = new Calls(trace, (event) => this.state.set({ event }));
    this.pointer = new Pointer(this);
    this.pointed = null;
    this.describe();
    byId("search").addEventListener("input", (event) => this.state.set({ search: event.target.value }));
    for (const button of document.querySelectorAll("#zoom button")) {
      button.addEventListener("click", () => this.keys[button.dataset.key]());
    }
    this.keys = this.keyActions();
    document.addEventListener("keydown", (event) => this.onKey(event));
    new ResizeObserver(() => this.update()).observe(byId("timeline"));
  }

  describe() {
    const { title, calls, sessions, sensors, fates } = this.trace;
    byId("title").textContent = title;
    const counts = [counted(calls, "call"), counted(this.records.count, "record"), counted(sessions.length, "session")];
    byId("about").textContent = counts.join(", ");
    byId("empty").hidden = this.records.count > 0;
    byId("ruler").hidden = this.records.count === 0;
    const used = fates.filter((_, fate) => sessions.some((session) => session.fates[fate] > 0));
    const words = [...[...sessions, ...sensors].map(({ name }) => name), ...used];
    const hues = sensors.flatMap((sensor) => sensor.hues.filter((text) => text !== null));
    const options = [...new Set([...words, ...hues])].slice(0, 500).map((value) => element("option", { value }));
    byId("words").replaceChildren(...options);
  }

  keyActions() {
    const tenth = () => (this.state.values.to - this.state.values.from) / 10;
    return {
      ArrowLeft: () => this.step(-1),
      ArrowRight: () => this.step(1),
      PageUp: () => this.state.pan(-tenth()),
      PageDown: () => this.state.pan(tenth()),
      Home: () => this.stepFrom(-1, 1),
      End: () => this.stepFrom(this.records.count, -1),
      "+": () => this.state.zoom(1 / ZOOM, this.middle()),
      "=": () => this.state.zoom(1 / ZOOM, this.middle()),
      "-": () => this.state.zoom(ZOOM, this.middle()),
      0: () => this.state.set({ from: this.trace.whole.from, to: this.trace.whole.to }),
      n: () => this.openNear(1),
      p: () => this.openNear(-1),
      "/": () => byId("search").focus(),
      Escape: () => this.choose({}),
    };
  }

  onKey(event) {
    const isTyping = event.target instanceof HTMLInputElement;
    if (event.ctrlKey || event.metaKey || event.altKey || byId("negotiation").open) return;
    if (isTyping && event.key !== "Escape") return;
    const action = this.keys[event.key.length === 1 ? event.key.toLowerCase() : event.key];
    if (action === undefined || this.records.count === 0) return;
    event.preventDefault();
    if (isTyping) this.state.set({ search: "" });
    action();
  }

  // Where zooming with keys holds on: at the chosen record if it is in view.
  middle() {
    const { from, to, record } = this.state.values;
    const at = record === undefined ? NaN : this.records.timeOf(record);
    return at >= from && at <= to ? at : (from + to) / 2;
  }

  choose({ session, fate }) {
    this.state.set({ session, fate });
  }

  chooseRecord(record) {
    this.state.set({ record });
  }

  step(direction) {
    const { record, from } = this.state.values;
    this.stepFrom(record ?? this.records.indexAt(from) - direction, direction);
  }

  // Chooses the next record that the search and the chosen reason leave.
  stepFrom(start, direction) {
    let index = start + direction;
    for (let steps = 0; index >= 0 && index < this.records.count && steps < MOST_STEPS; ++steps) {
      if (this.find.passes(this.records.record(index))) {
        this.state.values.record = index;
        this.state.reveal(this.records.timeOf(index));
        this.chooseRecord(index);
        return;
      }
      index += direction;
    }
  }

  openNear(direction) {
    const { record, from } = this.state.values;
    const event = this.calls.near(record ?? this.records.indexAt(from), direction);
    if (event === undefined) return;
    this.state.set({ event: event.index, record: Math.min(event.at, this.records.count - 1) });
    this.state.reveal(this.trace.timeBefore(event.at));
  }

  point(index) {
    this.pointed = index;
    this.showDetails();
  }

  // Draws at most once for each picture that the screen shows.
  update() {
    if (this.isAwaited) return;
    this.isAwaited = true;
    requestAnimationFrame(() => {
      this.isAwaited = false;
      this.draw();
    });
  }

  rebuild() {
    this.builtFor = undefined;
    this.update();
  }

  draw() {
    const { search, session, fate, event } = this.state.values;
    const wanted = JSON.stringify([search, session, fate]);
    if (wanted !== this.builtFor) {
      this.builtFor = wanted;
      this.find = new Find(this.trace, this.state.values);
      if (document.activeElement !== byId("search")) byId("search").value = search;
      this.lanes.build(this.find, (text) => this.state.set({ search: text === search ? "" : text }));
      this.showReasons();
      this.showFound();
    }
    if (this.records.count > 0) this.lanes.draw(this.state.values, this.find);
    this.calls.list(this.state.values, this.find);
    this.calls.show(event);
    this.showDetails();
  }

  // The button that was clicked keeps the focus.
  showReasons() {
    const focused = document.activeElement?.dataset.reason;
    this.reasons.show(this.find);
    if (focused !== undefined) document.querySelector(`[data-reason="${focused}"]`)?.focus();
  }

  showFound() {
    const texts = this.find.unknown.map((term) => `Nothing is called “${term}”.`);
    const { reason } = this.find;
    if (reason !== null) {
      texts.push(`Only “${this.trace.fates[reason.fate]}” of ${this.trace.sessions[reason.session].name}.`);
    }
    if (this.lanes.isCut) texts.push("Not all sessions are shown: search for one.");
    byId("found").textContent = texts.join(" ");
  }

  showDetails() {
    if (this.records.count === 0) return;
    const { record, from } = this.state.values;
    const index = this.pointed ?? record;
    const shown = index === undefined ? null : this.records.record(Math.min(index, this.records.count - 1));
    const note = this.pointed === null ? "" : this.pointer.note();
    this.details.show(shown, this.pointed === null, note);
    const slider = byId("ruler");
    const chosen = this.records.record(Math.min(record ?? this.records.indexAt(from), this.records.count - 1));
    slider.setAttribute("aria-valuemin", "1");
    slider.setAttribute("aria-valuemax", String(this.records.count));
    slider.setAttribute("aria-valuenow", String(chosen.index + 1));
    slider.setAttribute("aria-valuetext", this.details.text(chosen));
  }
}

function linesOf(id) {
  const text = byId(id).textContent;
  return text === "" ? [] : text.split("\n");
}

const summary = JSON.parse(byId("summary").textContent);
const page = new Page(new Trace(summary, new Records(summary, linesOf("records"), linesOf("levels"))));
page.update();
