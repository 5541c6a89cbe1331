// What a search and a chosen reason leave. A search has terms between commas, each a part of the name of a session, of
// a sensor, of a class, or of a reason.

function isPart(term, ...texts) {
  return texts.some((text) => text !== null && text.toLowerCase().includes(term));
}

export class Find {
  constructor(trace, { search, session, fate }) {
    this.trace = trace;
    this.reason = session !== undefined && fate !== undefined ? { session, fate } : null;
    this.sessions = new Set();
    this.sensors = new Set();
    this.fates = new Set();
    this.hues = trace.sensors.map(() => new Set());
    this.unknown = [];
    const terms = search.toLowerCase().split(",").map((term) => term.trim()).filter((term) => term !== "");
    for (const term of terms) {
      if (!this.addTerm(term)) this.unknown.push(term);
    }
    this.hasHues = this.hues.some((hues) => hues.size > 0);
  }

  addTerm(term) {
    const { sessions, sensors, fates } = this.trace;
    let found = false;
    const look = (rows, set, textsOf) =>
      rows.forEach((row, index) => {
        if (!isPart(term, ...textsOf(row))) return;
        set.add(index);
        found = true;
      });
    look(sessions, this.sessions, (session) => [session.name]);
    look(sensors, this.sensors, (sensor) => [sensor.name, sensor.title]);
    look(fates, this.fates, (fate) => [fate]);
    sensors.forEach((sensor, index) => look(sensor.hues, this.hues[index], (text) => [text]));
    return found;
  }

  showsSession(index) {
    if (this.sessions.size + this.sensors.size === 0) return true;
    return this.sessions.has(index) || this.sensors.has(this.trace.sessions[index].sensor);
  }

  showsSensor(index) {
    if (this.sessions.size + this.sensors.size === 0) return true;
    const isOfSensor = (session) => this.trace.sessions[session].sensor === index;
    return this.sensors.has(index) || [...this.sessions].some(isOfSensor);
  }

  showsHue(sensor, hue) {
    return !this.hasHues || this.hues[sensor].has(hue);
  }

  showsFate(session, fate) {
    if (this.reason !== null) return this.reason.session === session && this.reason.fate === fate;
    return this.fates.size === 0 || this.fates.has(fate);
  }

  passes(record) {
    const { contents, verdicts } = this.trace.pageRecords;
    const { sensor } = contents[record.content];
    if (!this.showsSensor(sensor)) return false;
    const showsContent = (content) => contents[content].hues.some(([hue]) => this.showsHue(sensor, hue));
    const receptions = record.receptions.filter(({ session }) => this.showsSession(session));
    const results = receptions.filter(({ result }) => result >= 0);
    const shown = [record.content, ...results.map(({ result }) => result)];
    if (this.hasHues && !shown.some(showsContent)) return false;
    if (this.reason === null && this.fates.size === 0) return true;
    return receptions.some(({ session, verdict }) => this.showsFate(session, verdicts[verdict].fate));
  }
}
