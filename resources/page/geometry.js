// The geometry of the model's parts. It stands in blocks, in the page or beside it, each read when it is first needed.

const blocks = new Map();
const waiting = new Map();

// A page from a disk can fetch nothing, but its script may put in scripts: each hands its text to this.
window.zorBlock = (name, text) => waiting.get(name)?.(text);

const blockText = name => new Promise((resolve, reject) => {
  const inside = document.getElementById('zor-block-' + name);
  if (inside) return resolve(inside.textContent);
  waiting.set(name, resolve);
  const script = make('script', { src: `viewer/${name}.js` });
  script.addEventListener('error', () => reject(new Error(`viewer/${name}.js is not there`)));
  script.addEventListener('load', () => { script.remove(); waiting.delete(name); });
  document.head.append(script);
});

const block = name => {
  if (!blocks.has(name)) blocks.set(name, blockText(name).then(text => unpacked(bytesOfBase64(text))));
  return blocks.get(name);
};

let sceneRead = null;
const readScene = () => sceneRead ??= block('scene').then(bytes => JSON.parse(new TextDecoder().decode(bytes)));

/** Reads what toolkit/publishing/viewer/MeshCoding writes. */
class MeshReader {
  constructor(bytes) { this.bytes = bytes; this.at = 0; }
  number() {
    let value = 0, shift = 0, byte;
    do {
      byte = this.bytes[this.at++];
      value += (byte & 0x7F) * 2 ** shift;
      shift += 7;
    } while (byte & 0x80);
    return value;
  }
  /** Into an array of 16-bit numbers, so many apart. */
  positions(count, into, stride) {
    const { bytes, at } = this;
    for (let axis = 0; axis < 3; ++axis) {
      const low = at + axis * count, high = low + 3 * count;
      for (let i = 0, last = 0; i < count; ++i) {
        const folded = bytes[low + i] | bytes[high + i] << 8;
        last = (last + (folded >> 1 ^ -(folded & 1))) & 0xFFFF;
        into[i * stride + axis] = last;
      }
    }
    this.at += 6 * count;
    return into;
  }
}

const readPart = async (index, part) => {
  const reader = new MeshReader(await block('part-' + index));
  const { points, triangles, lines, linePoints } = part;
  // Eight bytes of position, four of normal.
  const vertices = new ArrayBuffer(12 * points);
  reader.positions(points, new Uint16Array(vertices), 6);
  const normals = new Int8Array(vertices);
  for (let axis = 0; axis < 2; ++axis)
    for (let i = 0; i < points; ++i) normals[12 * i + 8 + axis] = reader.bytes[reader.at++];
  const corners = new (points > 0xFFFF ? Uint32Array : Uint16Array)(3 * triangles);
  for (let i = 0, next = 0; i < corners.length; ++i) {
    corners[i] = next - reader.number();
    if (corners[i] === next) ++next;
  }
  const lineVertices = lines ? reader.positions(linePoints, new Uint16Array(4 * linePoints), 4) : new Uint16Array(0);
  const segments = [];
  for (let line = 0, first = 0; line < lines; ++line) {
    const count = reader.number();
    for (let i = 1; i < count; ++i) segments.push(first + i - 1, first + i);
    first += count;
  }
  return { ...part, vertices, corners, lineVertices, segments: new Uint32Array(segments), positions: new Uint16Array(vertices) };
};

const parts = new Map();
const partOf = (scene, index) => {
  if (!parts.has(index)) parts.set(index, readPart(index, scene.parts[index]));
  return parts.get(index);
};

/** A point of a part, in millimetres. */
const pointOf = (part, index) => [0, 1, 2].map(axis => part.low[axis] + part.size[axis] * part.positions[6 * index + axis] / 65535);

/** Where a ray first meets a part; the distance, or Infinity. Möller and Trumbore, "Fast, minimum storage ray/triangle intersection", 1997. */
const meets = (part, from, along, accept) => {
  let nearest = Infinity;
  const at = index => {
    const p = part.positions, i = 6 * index;
    return [part.low[0] + part.size[0] * p[i] / 65535, part.low[1] + part.size[1] * p[i + 1] / 65535, part.low[2] + part.size[2] * p[i + 2] / 65535];
  };
  for (let i = 0; i < part.corners.length; i += 3) {
    const a = at(part.corners[i]);
    const ab = subtract(at(part.corners[i + 1]), a), ac = subtract(at(part.corners[i + 2]), a);
    const p = cross(along, ac), determinant = dot(ab, p);
    if (determinant === 0) continue;
    const t = subtract(from, a), u = dot(t, p) / determinant;
    if (u < 0 || u > 1) continue;
    const q = cross(t, ab), v = dot(along, q) / determinant;
    if (v < 0 || u + v > 1) continue;
    const distance = dot(ac, q) / determinant;
    if (distance > 0 && distance < nearest && accept(distance)) nearest = distance;
  }
  return nearest;
};
