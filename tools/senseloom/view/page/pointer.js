// What pointers do on the time line: point, click, drag, pinch, and turn a wheel.
import { byId } from "./elements.js";
import { grouped } from "./trace.js";

const LEAST_DRAG = 4; // pixels

export class Pointer {
  constructor(page) {
    this.page = page;
    this.down = new Map();
    this.isDragged = false;
    const timeline = byId("timeline");
    timeline.addEventListener("pointermove", (event) => this.onMove(event));
    timeline.addEventListener("pointerdown", (event) => this.onDown(event));
    timeline.addEventListener("pointerup", (event) => this.onUp(event));
    timeline.addEventListener("pointercancel", (event) => this.onUp(event));
    timeline.addEventListener("pointerleave", () => page.point(null));
    timeline.addEventListener("wheel", (event) => this.onWheel(event), { passive: false });
  }

  // The position below a pointer.
  placeOf(event) {
    const box = byId("ruler").getBoundingClientRect();
    const { from, to } = this.page.state.values;
    this.x = event.clientX - box.left;
    this.perPixel = (to - from) / box.width;
    return from + this.x * this.perPixel;
  }

  indexOf(event) {
    const { records } = this.page;
    const at = this.placeOf(event);
    const index = records.indexAt(at);
    if (index + 1 >= records.count) return index;
    return records.timeOf(index + 1) - at < at - records.timeOf(index) ? index + 1 : index;
  }

  // How many records share the pixel that is pointed at.
  note() {
    const { page, perPixel } = this;
    const { records } = page;
    const at = records.timeOf(page.pointed);
    const near = records.indexAt(at + perPixel) - records.indexAt(at);
    return near > 1 ? `and ${grouped(near)} more close by: zoom in to tell them apart` : "";
  }

  onMove(event) {
    if (this.page.records.count === 0) return;
    const before = this.down.get(event.pointerId);
    if (before === undefined) {
      const isOnLane = event.target instanceof HTMLCanvasElement;
      this.page.point(isOnLane ? this.indexOf(event) : null);
      return;
    }
    this.drag(event, before);
  }

  drag(event, before) {
    if (Math.abs(event.clientX - before.startX) > LEAST_DRAG && !this.isDragged) {
      this.isDragged = true;
      event.currentTarget.setPointerCapture(event.pointerId);
    }
    if (!this.isDragged) return;
    this.placeOf(event);
    const others = [...this.down.entries()].filter(([id]) => id !== event.pointerId);
    if (others.length === 0) {
      this.page.state.pan((before.x - event.clientX) * this.perPixel);
    } else {
      const [[, other]] = others;
      const factor = Math.abs(before.x - other.x) / Math.max(Math.abs(event.clientX - other.x), 1);
      this.page.state.zoom(factor, this.placeOf({ clientX: other.x }));
    }
    before.x = event.clientX;
  }

  onDown(event) {
    if (!(event.target instanceof HTMLCanvasElement) || event.button !== 0) return;
    this.isDragged = false;
    this.down.set(event.pointerId, { x: event.clientX, startX: event.clientX });
  }

  onUp(event) {
    const wasDown = this.down.delete(event.pointerId);
    if (!wasDown || this.isDragged || event.type !== "pointerup") return;
    const index = this.indexOf(event);
    const call = this.page.lanes.eventAt(this.x, event.target);
    if (call !== undefined) this.page.state.set({ event: call.index });
    else this.page.chooseRecord(index);
  }

  onWheel(event) {
    const at = this.placeOf(event);
    if (event.ctrlKey || event.metaKey) {
      event.preventDefault();
      this.page.state.zoom(Math.exp(event.deltaY / 300), at);
    } else if (event.shiftKey || Math.abs(event.deltaX) > Math.abs(event.deltaY)) {
      event.preventDefault();
      this.page.state.pan((event.deltaX || event.deltaY) * this.perPixel);
    }
  }
}
