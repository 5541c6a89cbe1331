// Timestamps as people read them.

const NANOSECONDS = 1_000_000_000n;
const LONGEST_DURATION = 100n * 3600n; // in seconds; what is beyond is a date, or days
const FIRST_DATE = 631_152_000n; // 1990
const STEPS = [1, 2, 5, 10, 15, 30, 60, 120, 300, 600, 900, 1800, 3600, 7200, 10800, 21600, 43200, 86400]; // seconds

function twoDigits(number) {
  return String(number).padStart(2, "0");
}

export class Clock {
  constructor(trace) {
    this.first = BigInt(trace.firstTimestamp);
    this.unit = BigInt(trace.timeUnit); // in nanoseconds
    this.isTime = trace.isTime;
  }

  timestamp(time) {
    return BigInt.asUintN(64, this.first + BigInt(Math.round(time)));
  }

  // A time counts from the first timestamp, in its unit.
  text(time) {
    const nanoseconds = this.timestamp(time) * this.unit;
    const seconds = nanoseconds / NANOSECONDS;
    const rest = String(nanoseconds % NANOSECONDS).padStart(9, "0").replace(/0+$/, "");
    const fraction = rest === "" ? "" : `.${rest.padEnd(3, "0")}`;
    const minutes = `${twoDigits((seconds / 60n) % 60n)}:${twoDigits(seconds % 60n)}${fraction}`;
    if (seconds < LONGEST_DURATION) return `${seconds / 3600n}:${minutes}`;
    const clock = `${(seconds / 3600n) % 24n}:${minutes}`;
    const date = new Date(Number(seconds) * 1000);
    if (seconds < FIRST_DATE || Number.isNaN(date.getTime())) return `${seconds / 86400n} d ${clock}`;
    return `${date.toISOString().slice(0, 10)} ${clock}`;
  }

  // Marks for an axis: positions within a span, with their texts.
  marks(from, to, most) {
    if (!this.isTime) return this.plainMarks(from, to, most);
    const perSecond = Number(NANOSECONDS) / Number(this.unit);
    const least = (to - from) / most / perSecond;
    const step = (STEPS.find((seconds) => seconds >= least) ?? roundUp(least)) * perSecond;
    const size = least < 1 ? Math.max(roundUp(least) * perSecond, 1) : Math.max(step, 1);
    const offset = Number(this.first % BigInt(Math.round(size)));
    const marks = [];
    for (let at = Math.ceil((from + offset) / size) * size - offset; at <= to; at += size) {
      marks.push({ at, text: this.text(at) });
    }
    return marks;
  }

  plainMarks(from, to, most) {
    const size = Math.max(roundUp((to - from) / most), 1);
    const marks = [];
    for (let at = Math.ceil(from / size) * size; at <= to; at += size) marks.push({ at, text: `record ${at + 1}` });
    return marks;
  }
}

// To 1, 2 or 5 times a power of ten.
export function roundUp(least) {
  const power = 10 ** Math.floor(Math.log10(least));
  return [1, 2, 5, 10].map((factor) => factor * power).find((size) => size >= least * 0.999);
}
