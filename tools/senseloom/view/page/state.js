// What the page shows of its trace, and the same in its address, so that a view can be passed on.

const NUMBERS = ["from", "to", "record", "event", "session", "fate"];

export class State {
  constructor(whole, onChange) {
    this.whole = whole; // the span of all records
    this.onChange = onChange;
    this.values = { from: whole.from, to: whole.to, search: "" };
    this.readAddress();
    window.addEventListener("hashchange", () => {
      this.readAddress();
      this.onChange();
    });
  }

  readAddress() {
    const address = new URLSearchParams(window.location.hash.slice(1));
    const values = { from: this.whole.from, to: this.whole.to, search: address.get("search") ?? "" };
    for (const name of NUMBERS) {
      const number = Number.parseFloat(address.get(name));
      if (Number.isFinite(number)) values[name] = number;
    }
    Object.assign(values, this.clampedSpan(values.from, values.to));
    this.values = values;
  }

  // Undefined takes a value away.
  set(values) {
    Object.assign(this.values, values);
    Object.assign(this.values, this.clampedSpan(this.values.from, this.values.to));
    const address = new URLSearchParams();
    for (const [name, value] of Object.entries(this.values)) {
      if (value !== undefined && value !== "" && value !== this.whole[name]) address.set(name, String(value));
    }
    const { pathname, search } = window.location;
    const hash = address.toString();
    window.history.replaceState(null, "", hash === "" ? pathname + search : `#${hash}`);
    this.onChange();
  }

  clampedSpan(from, to) {
    const whole = this.whole.to - this.whole.from;
    const span = Math.min(Math.max(to - from, this.whole.least), whole);
    const start = Math.min(Math.max(from, this.whole.from), this.whole.to - span);
    return { from: start, to: start + span };
  }

  // Zooms by a factor with one position staying where it is.
  zoom(factor, at = (this.values.from + this.values.to) / 2) {
    const { from, to } = this.values;
    this.set({ from: at - (at - from) * factor, to: at + (to - at) * factor });
  }

  pan(distance) {
    const { from, to } = this.values;
    const { from: start, to: end } = this.whole;
    const step = Math.min(Math.max(distance, start - from), end - to);
    this.set({ from: from + step, to: to + step });
  }

  // Moves as little as it takes to show a position.
  reveal(at) {
    const { from, to } = this.values;
    if (at >= from && at <= to) return;
    this.pan(at - (from + to) / 2);
  }
}
