// Draws lanes: what a sensor recorded, and for each session what it received and what became of the records.

const MOST_ROWS = 32768; // of records or sums in one picture
const WIDEST_SUM = 4; // in columns
const WIDEST_EVENT = 7;
const RESULT_TOP = 10;
const RESULT_HEIGHT = 24;
const FATE_TOP = 36;
const FATE_HEIGHT = 9;
const DIMMED = 0.12;
const LOWEST_SHARE = 0.06;

// What each lane has in each column of a picture.
export class Columns {
  constructor(trace, lanes, { from, to }, width) {
    this.trace = trace;
    this.from = from;
    this.to = to;
    this.width = width;
    this.keys = trace.pageRecords.keys;
    this.size = this.keys.last + 1;
    this.counts = new Map(lanes.map((lane) => [lane, new Float32Array(width * this.size)]));
    this.heldBefore = new Map();
    this.first = 0;
    if (trace.pageRecords.count > 0) this.gather(trace.pageRecords, new Set(lanes));
  }

  columnOf(at) {
    return Math.floor(((at - this.from) / (this.to - this.from)) * this.width);
  }

  // Where what comes before a record lies.
  columnOfEvent(at) {
    return at === Infinity ? this.width : this.columnOf(this.trace.timeBefore(at));
  }

  gather(records, lanes) {
    const first = records.indexAt(this.from);
    this.first = first;
    const last = records.indexAt(this.to);
    this.heldBefore = records.lastHuesBefore(first, lanes);
    const timeAt = (rows, row, index) => (records.isTime ? rows.times[row] : index);
    records.forEach(first, last, MOST_ROWS, (rows, row, index) => {
      const column = this.columnOf(timeAt(rows, row, index));
      if (rows.size === 1 && column < 0) {
        this.noteHeld(rows, row, index);
        return;
      }
      if (column >= this.width) return;
      const isLast = rows.size === 1 || row + 1 === rows.times.length;
      const next = isLast ? column : this.columnOf(timeAt(rows, row + 1, index + rows.size));
      const end = Math.min(Math.max(next, column + 1), column + WIDEST_SUM, this.width);
      for (let each = Math.max(column, 0); each < end; ++each) this.addRow(rows, row, each);
    });
  }

  // A record before the picture that holds on into it.
  noteHeld(rows, row, index) {
    for (let cell = rows.starts[row]; cell < rows.starts[row + 1]; ++cell) {
      if (rows.keys[cell] !== this.keys.last) continue;
      this.heldBefore.set(rows.lanes[cell], { hue: rows.values[cell] - 1, index });
    }
  }

  addRow(rows, row, column) {
    for (let cell = rows.starts[row]; cell < rows.starts[row + 1]; ++cell) {
      const counts = this.counts.get(rows.lanes[cell]);
      if (counts === undefined) continue;
      const key = rows.keys[cell];
      const at = column * this.size + key;
      const value = rows.values[cell];
      if (key === this.keys.last) counts[at] = value;
      else counts[at] = key === this.keys.greatest ? Math.max(counts[at], value) : counts[at] + value;
    }
  }
}

export class LaneDrawing {
  constructor(canvas, colours) {
    const scale = window.devicePixelRatio || 1;
    this.width = Math.max(1, Math.floor(canvas.clientWidth));
    this.height = canvas.clientHeight;
    canvas.width = this.width * scale;
    canvas.height = this.height * scale;
    this.context = canvas.getContext("2d");
    this.context.scale(scale, scale);
    this.colours = colours;
  }

  fill(colour, x, y, width, height, isDimmed = false) {
    this.context.globalAlpha = isDimmed ? DIMMED : 1;
    this.context.fillStyle = colour;
    this.context.fillRect(x, y, width, height);
    this.context.globalAlpha = 1;
  }

  drawRecords(columns, lane, sensor, find) {
    const shows = (hue) => find.showsHue(sensor.index, hue);
    this.drawHues(columns, lane, sensor, { top: 0, height: this.height, shows, spans: [{ from: 0, to: Infinity }] });
  }

  drawSession(columns, session, sensor, find) {
    for (const { from, to } of session.spans) this.drawSpan(columns, from, to);
    const isChosen = find.reason === null || find.reason.session === session.index;
    const shows = (hue) => isChosen && find.showsHue(sensor.index, hue);
    const box = { top: RESULT_TOP, height: RESULT_HEIGHT, shows, spans: session.spans };
    this.drawHues(columns, session.lane, sensor, box);
    this.drawFates(columns, session, find);
  }

  // The time during which a session is open.
  drawSpan(columns, from, to) {
    const left = Math.max(0, columns.columnOfEvent(from));
    const right = Math.min(this.width, columns.columnOfEvent(to));
    if (right < left) return;
    this.fill(this.colours.open, left, RESULT_TOP, Math.max(1, right - left), RESULT_HEIGHT);
  }

  drawHues(columns, lane, sensor, box) {
    const counts = columns.counts.get(lane);
    if (sensor.lasts) {
      this.drawLasting(columns, counts, box, columns.heldBefore.get(lane));
      return;
    }
    let greatest = 0;
    for (let at = columns.keys.greatest; at < counts.length; at += columns.size) {
      greatest = Math.max(greatest, counts[at]);
    }
    this.drawEvents(columns, counts, box, sensor.isAmount ? Math.max(greatest, 1) : 0);
  }

  // Each class holds until the next one, or until the session is closed.
  drawLasting(columns, counts, box, before) {
    const { size, keys } = columns;
    const edges = new Set(box.spans.flatMap(({ from, to }) => [from, to]).map((at) => columns.columnOfEvent(at)));
    const goesOn = (span) => span.from <= before.index && columns.first < span.to;
    let held = before !== undefined && box.spans.some(goesOn) ? before.hue : -1;
    let start = 0;
    const endRun = (column) => {
      if (held < 0 || column <= start) return;
      this.fill(this.colours.hues[held], start, box.top, column - start, box.height, !box.shows(held));
    };
    for (let column = 0; column < this.width; ++column) {
      const last = counts[column * size + keys.last] - 1;
      if (!edges.has(column) && last < 0) continue;
      endRun(column);
      start = column;
      held = last;
      if (last < 0) continue;
      this.drawStack(counts, column * size, keys.hues, this.colours.hues, { ...box, x: column, width: 1 });
      start = column + 1;
    }
    endRun(this.width);
  }

  // How wide marks in columns can be without running into each other.
  eventWidth(isUsed) {
    let width = WIDEST_EVENT;
    let before = -WIDEST_EVENT;
    for (let column = 0; column < this.width; ++column) {
      if (!isUsed(column)) continue;
      width = Math.min(width, Math.max(1, column - before - 1));
      before = column;
    }
    return width;
  }

  drawEvents(columns, counts, box, greatest) {
    const { size, keys } = columns;
    const isUsed = (column) => counts[column * size + keys.last] > 0;
    const width = this.eventWidth(isUsed);
    for (let column = 0; column < this.width; ++column) {
      if (!isUsed(column)) continue;
      const share = greatest === 0 ? 1 : Math.max(LOWEST_SHARE, counts[column * size + keys.greatest] / greatest);
      const height = box.height * share;
      const top = box.top + box.height - height;
      this.drawStack(counts, column * size, keys.hues, this.colours.hues, { ...box, x: column, width, height, top });
    }
  }

  drawFates(columns, session, find) {
    const counts = columns.counts.get(session.lane);
    const { size, keys } = columns;
    const shows = (fate) => find.showsFate(session.index, fate);
    const fates = keys.greatest - keys.firstFate;
    const firstOf = (column) => column * size + keys.firstFate;
    const isUsed = (column) => counts.subarray(firstOf(column), firstOf(column) + fates).some((count) => count > 0);
    const width = this.eventWidth(isUsed);
    for (let column = 0; column < this.width; ++column) {
      const box = { top: FATE_TOP, height: FATE_HEIGHT, width, x: column, shows };
      this.drawStack(counts, firstOf(column), fates, this.colours.fates, box);
    }
  }

  // The shares of what is in one column, from the bottom up.
  drawStack(counts, first, number, colours, { x, width, top, height, shows }) {
    let total = 0;
    for (let i = 0; i < number; ++i) total += counts[first + i];
    let bottom = top + height;
    for (let i = 0; i < number; ++i) {
      if (counts[first + i] === 0) continue;
      const part = (height * counts[first + i]) / total;
      bottom -= part;
      this.fill(colours[i], x, bottom, width, part, !shows(i));
    }
  }

  drawNegotiations(positions) {
    const { context } = this;
    context.strokeStyle = this.colours.text;
    context.setLineDash([2, 3]);
    context.globalAlpha = 0.7;
    context.beginPath();
    for (const x of positions) {
      context.moveTo(Math.round(x) + 0.5, 0);
      context.lineTo(Math.round(x) + 0.5, this.height);
    }
    context.stroke();
    context.setLineDash([]);
    context.globalAlpha = 1;
  }

  // A diamond for each request, and a cross for one that was refused.
  drawRequests(requests) {
    const { context } = this;
    for (const { x, failed } of requests) {
      context.beginPath();
      if (failed) {
        context.strokeStyle = this.colours.no;
        context.lineWidth = 1.6;
        context.moveTo(x - 4, 0.5);
        context.lineTo(x + 4, 8.5);
        context.moveTo(x + 4, 0.5);
        context.lineTo(x - 4, 8.5);
        context.stroke();
        context.lineWidth = 1;
      } else {
        context.fillStyle = this.colours.ask;
        context.moveTo(x, 0);
        context.lineTo(x + 4.5, 4.5);
        context.lineTo(x, 9);
        context.lineTo(x - 4.5, 4.5);
        context.fill();
      }
    }
  }

  drawCursor(x) {
    this.fill(this.colours.focus, Math.round(x) - 1, 0, 2, this.height);
  }

  drawRuler(marks) {
    const { context } = this;
    context.font = getComputedStyle(document.body).font.replace(/\d+px/, "12px");
    context.fillStyle = this.colours.quiet;
    this.fill(this.colours.line, 0, this.height - 1, this.width, 1);
    context.fillStyle = this.colours.quiet;
    let end = 0;
    for (const { x, text } of marks) {
      const half = context.measureText(text).width / 2;
      const left = Math.min(Math.max(x - half, 0), this.width - 2 * half);
      context.fillRect(Math.round(x), this.height - 6, 1, 6);
      if (left < end) continue;
      context.fillText(text, left, 16);
      end = left + 2 * half + 12;
    }
  }
}
