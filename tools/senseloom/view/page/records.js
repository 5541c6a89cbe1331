// The records of the page, unpacked a block at a time when they are needed, and the sums of the levels. Both come as
// rows: a row has a time and cells, and a cell a lane, a key and a value. The keys are hues first, then fates.
import { ByteReader } from "./bytes.js";

const ROWS_PER_SUM = 64;
const MOST_BLOCKS_KEPT = 32;

// How the keys of cells are laid out, for so many hues and fates.
export class Keys {
  constructor(hues, fates) {
    this.hues = hues;
    this.firstFate = hues;
    this.greatest = hues + fates;
    this.last = hues + fates + 1;
  }
}

class Rows {
  constructor(size) {
    this.times = [];
    this.starts = [0];
    this.lanes = [];
    this.keys = [];
    this.values = [];
    this.size = size; // records in a row
  }

  addCell(lane, key, value) {
    this.lanes.push(lane);
    this.keys.push(key);
    this.values.push(value);
  }

  endRow(time) {
    this.times.push(time);
    this.starts.push(this.lanes.length);
  }
}

function unpackLevel(text, size) {
  const reader = new ByteReader(text);
  const rows = new Rows(size);
  let time = 0;
  while (!reader.isAtEnd()) {
    time += reader.nextSigned();
    for (let cells = reader.next(); cells > 0; --cells) rows.addCell(reader.next(), reader.next(), reader.next());
    rows.endRow(time);
  }
  return rows;
}

function unpackContents(text) {
  const reader = new ByteReader(text);
  const contents = [];
  while (!reader.isAtEnd()) {
    const size = reader.next();
    const content = { sensor: reader.next(), height: reader.next(), hues: [] };
    for (let i = 2; i < size; i += 2) content.hues.push([reader.next(), reader.next()]);
    contents.push(content);
  }
  return contents;
}

function unpackVerdicts(text) {
  const reader = new ByteReader(text);
  const verdicts = [];
  while (!reader.isAtEnd()) {
    const verdict = { numbers: new Array(reader.next() - 2), fate: reader.next(), wording: reader.next() };
    for (let i = 0; i < verdict.numbers.length; ++i) verdict.numbers[i] = reader.next();
    verdicts.push(verdict);
  }
  return verdicts;
}

export class Records {
  constructor(summary, recordTexts, levelTexts) {
    this.count = summary.records;
    this.keys = new Keys(summary.lightHues.length, summary.fates.length);
    this.contents = unpackContents(summary.contents);
    this.verdicts = unpackVerdicts(summary.verdicts);
    this.audiences = summary.audiences;
    this.sensors = summary.sensors;
    this.sessions = summary.sessions;
    this.isTime = summary.isTime;
    this.blockSize = summary.recordsInBlock;
    this.texts = recordTexts;
    this.blocks = new Map();
    this.levels = levelTexts.map((text, i) => unpackLevel(text, ROWS_PER_SUM ** (i + 1)));
    this.blockTimes = this.timesOfBlocks();
  }

  // Where each block begins: its first record is the first of a sum.
  timesOfBlocks() {
    if (this.levels.length === 0) return [0];
    const step = this.blockSize / ROWS_PER_SUM;
    return this.texts.map((_, block) => this.levels[0].times[block * step]);
  }

  // The last record at a time or before it.
  indexAt(time) {
    if (!this.isTime) return Math.min(Math.max(Math.floor(time), 0), this.count - 1);
    const block = Math.max(0, lastNotAfter(this.blockTimes, time));
    const row = lastNotAfter(this.block(block).rows.times, time);
    return Math.max(0, block * this.blockSize + row);
  }

  timeOf(index) {
    return this.isTime ? this.record(index).time : index;
  }

  // A record with what became of it.
  record(index) {
    const block = this.block(Math.floor(index / this.blockSize));
    return { index, ...block.records[index % this.blockSize] };
  }

  // Calls `show` with the rows that lie in a span of records, in order: (rows, row, index of its first record). These
  // are records, or sums if there would be too many.
  forEach(first, last, mostRows, show) {
    const level = this.levels.find((rows) => (last - first) / rows.size <= mostRows) ?? this.levels.at(-1);
    if (last - first <= mostRows || level === undefined) {
      for (let index = first; index <= last; ++index) {
        const { rows } = this.block(Math.floor(index / this.blockSize));
        show(rows, index % this.blockSize, index);
      }
      return;
    }
    const end = Math.floor(last / level.size);
    for (let row = Math.floor(first / level.size); row <= end; ++row) show(level, row, row * level.size);
  }

  // The hue that each of these lanes last showed before a record, with the index where that was seen, as a map.
  lastHuesBefore(index, lanes) {
    const found = new Map();
    const look = (rows, row, firstIndex) => {
      for (let cell = rows.starts[row]; cell < rows.starts[row + 1]; ++cell) {
        const lane = rows.lanes[cell];
        if (rows.keys[cell] !== this.keys.last || !lanes.has(lane) || found.has(lane)) continue;
        found.set(lane, { hue: rows.values[cell] - 1, index: firstIndex });
      }
    };
    const [sums] = this.levels;
    for (let i = index - 1; i >= 0 && found.size < lanes.size; --i) {
      if (sums === undefined || (i + 1) % ROWS_PER_SUM !== 0) {
        look(this.block(Math.floor(i / this.blockSize)).rows, i % this.blockSize, i);
      } else {
        look(sums, (i + 1) / ROWS_PER_SUM - 1, i);
        i -= ROWS_PER_SUM - 1;
      }
    }
    return found;
  }

  block(number) {
    let block = this.blocks.get(number);
    if (block !== undefined) return block;
    if (this.blocks.size === MOST_BLOCKS_KEPT) this.blocks.delete(this.blocks.keys().next().value);
    block = this.unpackBlock(number);
    this.blocks.set(number, block);
    return block;
  }

  unpackBlock(number) {
    const reader = new ByteReader(this.texts[number]);
    const rows = new Rows(1);
    const records = [];
    let time = 0;
    let line = 0;
    while (!reader.isAtEnd()) {
      time += reader.nextSigned();
      line += reader.next();
      const record = { time, line, content: reader.next(), audience: reader.next(), receptions: [] };
      this.unpackReceptions(reader, record);
      this.addCells(rows, record);
      rows.endRow(time);
      records.push(record);
    }
    return { rows, records };
  }

  unpackReceptions(reader, record) {
    for (const session of this.audiences[record.audience]) {
      record.receptions.push({ session, verdict: reader.next(), result: reader.next() - 1 });
    }
  }

  addCells(rows, record) {
    const content = this.contents[record.content];
    this.addContent(rows, this.sensors[content.sensor].lane, content);
    for (const { session, verdict, result } of record.receptions) {
      const { lane } = this.sessions[session];
      rows.addCell(lane, this.keys.firstFate + this.verdicts[verdict].fate, 1);
      if (result >= 0) this.addContent(rows, lane, this.contents[result]);
    }
  }

  addContent(rows, lane, content) {
    let most = 0;
    let last = -1;
    for (const [hue, count] of content.hues) {
      rows.addCell(lane, hue, count);
      if (count <= most) continue;
      most = count;
      last = hue;
    }
    if (content.height > 0) rows.addCell(lane, this.keys.greatest, content.height);
    if (last >= 0) rows.addCell(lane, this.keys.last, last + 1);
  }
}

// The place of the last number that is not above a limit, in rising numbers; -1 if all are.
export function lastNotAfter(numbers, limit) {
  let low = 0;
  let high = numbers.length;
  while (low < high) {
    const middle = (low + high) >> 1;
    if (numbers[middle] <= limit) low = middle + 1;
    else high = middle;
  }
  return low - 1;
}
