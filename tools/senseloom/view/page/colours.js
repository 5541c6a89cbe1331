// The colours of the system's choice, light or dark.

// By fate, in the order of the tool.
const FATES = {
  light: ["#1a7f37", "#aab4bf", "#bf8700", "#6e9bd1", "#8a63b8", "#3aa6a6", "#93694e", "#d887b8", "#d1242f", "#000000"],
  dark: ["#3fb950", "#59636e", "#d29922", "#4f7cb5", "#a583d6", "#4cc0bf", "#b58a6c", "#e79fcb", "#ff7b72", "#ffffff"],
};

export class Colours {
  constructor(trace, onChange) {
    this.trace = trace;
    this.query = window.matchMedia("(prefers-color-scheme: dark)");
    this.query.addEventListener("change", () => {
      this.read();
      onChange();
    });
    this.read();
  }

  read() {
    const isDark = this.query.matches;
    this.hues = isDark ? this.trace.darkHues : this.trace.lightHues;
    this.fates = isDark ? FATES.dark : FATES.light;
    const style = getComputedStyle(document.documentElement);
    for (const name of ["back", "text", "quiet", "line", "open", "ask", "no", "focus"]) {
      this[name] = style.getPropertyValue(`--${name}`);
    }
  }
}
