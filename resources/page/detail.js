// What is drawn of many triangles: equal instances together, nothing beside the view, and fewer while it turns.

/** Of a part the triangles that stay when its vertices are those of a grid: J. Rossignac and P. Borrel, "Multi-resolution 3D approximations", 1993. */
const coarsened = (part, cells) => {
  const shift = 16 - Math.log2(cells), { positions, corners } = part;
  const firstIn = new Map(), same = new Uint32Array(part.points), kept = [], ranges = [];
  for (let i = 0; i < same.length; ++i) {
    const [x, y, z] = positions.subarray(6 * i, 6 * i + 3);
    const cell = ((x >> shift) * cells + (y >> shift)) * cells + (z >> shift);
    if (!firstIn.has(cell)) firstIn.set(cell, i);
    same[i] = firstIn.get(cell);
  }
  let at = 0;
  for (const [colour, triangles] of part.ranges) {
    const before = kept.length;
    for (const end = at + 3 * triangles; at < end; at += 3) {
      const a = same[corners[at]], b = same[corners[at + 1]], c = same[corners[at + 2]];
      if (a !== b && b !== c && c !== a) kept.push(a, b, c);
    }
    ranges.push([colour, (kept.length - before) / 3]);
  }
  return { ...part, corners: new corners.constructor(kept), ranges };
};

/** @param cells of a grid along each side of the part; 0: the part as it is. */
const coarsePart = (part, cells) => {
  if (!cells) return part;
  part.coarse ??= new Map();
  if (!part.coarse.has(cells)) part.coarse.set(cells, coarsened(part, cells));
  return part.coarse.get(cells);
};
const coarseBatch = (batch, cells) => {
  if (!cells) return batch;
  batch.coarse ??= new Map();
  if (!batch.coarse.has(cells)) batch.coarse.set(cells, { ...batch, part: coarsePart(batch.part, cells) });
  return batch.coarse.get(cells);
};

/** Instances of one part in one colour, of [{part, matrix, colour}], are drawn together. */
const batchesOf = solids => {
  const batches = [];
  for (const { part, matrix, colour } of solids) {
    const isSame = batch => batch.part === part && batch.colour.text === colour.text && batch.colour.isImposed === colour.isImposed;
    let batch = batches.find(isSame);
    if (!batch) batches.push(batch = { part, colour, matrices: [] });
    batch.matrices.push(...matrix);
  }
  return batches;
};

/** The rest of an assembly. */
class Ghosts {
  constructor(solids) {
    this.solids = solids.map(solid => ({ ...solid, sphere: sphereOf([solid]) }));
    this.batches = new Map();  // by part
  }
  /** Batches of those that are in the view, and larger than a share of its height. */
  seen(viewFromRoot, camera, cells, share) {
    const m = viewFromRoot, row = i => [m[i], m[i + 4], m[i + 8], m[i + 12]];
    const planes = [0, 1].flatMap(i => [1, -1].map(sign => row(3).map((value, k) => value + sign * row(i)[k])))
      .map(plane => ({ plane, length: lengthOf(plane.slice(0, 3)) || 1 }));
    const height = centre => camera.perspective
      ? 2 * Math.tan(camera.angle / 2) * Math.max(dot(subtract(centre, camera.eye), camera.sight), 0) : camera.height;
    for (const batch of this.batches.values()) batch.matrices = [];
    for (const { part, matrix, sphere: { centre, radius } } of this.solids) {
      if (planes.some(({ plane, length }) => dot(plane, centre) + plane[3] < -radius * length)) continue;
      if (2 * radius < share * height(centre)) continue;
      const shown = coarsePart(part, cells);
      if (!this.batches.has(shown)) this.batches.set(shown, { part: shown, matrices: [] });
      this.batches.get(shown).matrices.push(...matrix);
    }
    return [...this.batches.values()].filter(batch => batch.matrices.length);
  }
}
