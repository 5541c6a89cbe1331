// What the page knows of its trace beside the records: words, and when sessions were open.

export class Trace {
  constructor(summary, records) {
    Object.assign(this, summary);
    this.pageRecords = records;
    this.whole = this.wholeSpan();
    this.sensors.forEach((sensor, index) => Object.assign(sensor, { index }));
    this.sessions.forEach((session, index) => Object.assign(session, { index, spans: [] }));
    this.eventTimes = new Map(this.events.map((event) => [event.at, event.time]));
    this.events.forEach((event, index) => this.noteEvent(event, index));
  }

  noteEvent(event, index) {
    event.index = index;
    const { spans } = this.sessions[event.session];
    const isOpen = spans.at(-1)?.to === Infinity;
    if (event.call === "open" && !event.failed && !isOpen) spans.push({ from: event.at, to: Infinity });
    if (event.call === "close" && isOpen && event.line !== 0) spans.at(-1).to = event.at;
  }

  // From the first record to as long behind the last as records are apart on average, to show its effect.
  wholeSpan() {
    const { count, isTime } = this.pageRecords;
    if (!isTime) return { from: 0, to: Math.max(count, 1), least: 1 };
    const last = this.pageRecords.timeOf(count - 1);
    return { from: 0, to: last + last / (count - 1), least: last / count };
  }

  // The position of an event that comes before a record.
  timeBefore(at) {
    return this.pageRecords.isTime ? (this.eventTimes.get(at) ?? this.whole.to) : at;
  }

  // Events that have something to show: who asked for what, and what that led to.
  negotiations() {
    return this.events.filter((event) => event.says !== undefined);
  }

  hueText(sensor, hue) {
    return this.sensors[sensor].hues[hue] ?? "";
  }

  contentText(content) {
    const sensor = this.sensors[content.sensor];
    const parts = content.hues.map(([hue, count]) => {
      const text = this.hueText(content.sensor, hue);
      return count > 1 ? `${count} × ${text}` : text;
    });
    if (sensor.isAmount) return `${grouped(content.height)} ${parts.join(", ")}`;
    return parts.join(", ") || "nothing";
  }

  // What became of a record, as the tool's explanations word it.
  verdictText(number) {
    const verdict = this.pageRecords.verdicts[number];
    let next = 0;
    return this.wordings[verdict.wording].replace(/#/g, () => verdict.numbers[next++]);
  }

  eventText(event) {
    const session = this.sessions[event.session];
    return `${session.name} on ${this.sensors[session.sensor].name} ${event.says}`;
  }
}

export function grouped(number) {
  return number.toLocaleString("en-US");
}

export function counted(number, one, several = `${one}s`) {
  return `${grouped(number)} ${number === 1 ? one : several}`;
}
