// Reads what the tool packed: integers of seven bits a byte, the lowest first, in base64.

export class ByteReader {
  constructor(text) {
    const letters = atob(text);
    this.bytes = new Uint8Array(letters.length);
    for (let i = 0; i < letters.length; ++i) this.bytes[i] = letters.charCodeAt(i);
    this.at = 0;
  }

  isAtEnd() {
    return this.at >= this.bytes.length;
  }

  // Beyond 32 bits, too, so not by shifts.
  next() {
    let value = 0;
    let factor = 1;
    let byte = 128;
    while (byte > 127) {
      byte = this.bytes[this.at++];
      value += (byte & 127) * factor;
      factor *= 128;
    }
    return value;
  }

  nextSigned() {
    const value = this.next();
    return value % 2 === 0 ? value / 2 : -(value + 1) / 2;
  }
}
