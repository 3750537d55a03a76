// Vectors, and a camera that turns round what it looks at. Matrices are 16 numbers, column by column.

const add = (a, b) => [a[0] + b[0], a[1] + b[1], a[2] + b[2]];
const subtract = (a, b) => [a[0] - b[0], a[1] - b[1], a[2] - b[2]];
const times = (a, s) => [a[0] * s, a[1] * s, a[2] * s];
const dot = (a, b) => a[0] * b[0] + a[1] * b[1] + a[2] * b[2];
const cross = (a, b) => [a[1] * b[2] - a[2] * b[1], a[2] * b[0] - a[0] * b[2], a[0] * b[1] - a[1] * b[0]];
const lengthOf = a => Math.hypot(...a);
const unit = a => times(a, 1 / (lengthOf(a) || 1));

/** Rodrigues' rotation of a vector about a unit axis. */
const turned = (v, axis, angle) => {
  const c = Math.cos(angle), s = Math.sin(angle);
  return add(add(times(v, c), times(cross(axis, v), s)), times(axis, dot(axis, v) * (1 - c)));
};

/** Three columns and a translation, as results and models have them. */
const matrixOf = m => [m[0], m[1], m[2], 0, m[3], m[4], m[5], 0, m[6], m[7], m[8], 0, m[9], m[10], m[11], 1];
const product = (a, b) => {
  const m = new Array(16);
  for (let c = 0; c < 4; ++c)
    for (let r = 0; r < 4; ++r)
      m[4 * c + r] = a[r] * b[4 * c] + a[4 + r] * b[4 * c + 1] + a[8 + r] * b[4 * c + 2] + a[12 + r] * b[4 * c + 3];
  return m;
};
const applied = (m, p, w = 1) => [
  m[0] * p[0] + m[4] * p[1] + m[8] * p[2] + m[12] * w,
  m[1] * p[0] + m[5] * p[1] + m[9] * p[2] + m[13] * w,
  m[2] * p[0] + m[6] * p[1] + m[10] * p[2] + m[14] * w];
/** Of a matrix whose last row is 0 0 0 1. */
const inverse = m => {
  const [x, y, z, t] = [0, 4, 8, 12].map(i => m.slice(i, i + 3));
  const rows = [cross(y, z), cross(z, x), cross(x, y)];
  const determinant = dot(x, rows[0]) || 1;
  const [a, b, c] = rows.map(row => times(row, 1 / determinant));
  return [a[0], b[0], c[0], 0, a[1], b[1], c[1], 0, a[2], b[2], c[2], 0, -dot(a, t), -dot(b, t), -dot(c, t), 1];
};

class Camera {
  /** @param picture the camera of a picture, as the scene has it. */
  constructor(picture) {
    this.picture = picture;
    this.reset();
  }
  reset() {
    const { perspective, eye, sight, up, focus, angle, height, near } = this.picture;
    Object.assign(this, { perspective, distance: focus, angle, height, near, isMoved: false });
    this.sight = unit(sight);
    this.right = unit(cross(this.sight, up));
    this.up = cross(this.right, this.sight);
    this.target = add(eye, times(this.sight, focus));
  }
  get eye() { return subtract(this.target, times(this.sight, this.distance)); }
  /** What the height of the view shows where it looks. */
  get shown() { return this.perspective ? 2 * this.distance * Math.tan(this.angle / 2) : this.height; }

  turn(x, y) {
    this.isMoved = true;
    this.sight = unit(turned(this.sight, this.up, -x));
    this.right = unit(cross(this.sight, this.up));
    this.sight = unit(turned(this.sight, this.right, -y));
    this.up = cross(this.right, this.sight);
  }
  /** @param x,y as shares of the view's height. */
  pan(x, y) {
    this.isMoved = true;
    this.target = add(this.target, add(times(this.right, -x * this.shown), times(this.up, y * this.shown)));
  }
  zoom(factor) {
    this.isMoved = true;
    this.distance *= factor;
    this.height *= factor;
  }

  /** @param sphere around everything: {centre, radius}. */
  matrix(aspect, sphere) {
    const { right, up, sight, eye } = this;
    const view = [right[0], up[0], -sight[0], 0, right[1], up[1], -sight[1], 0, right[2], up[2], -sight[2], 0,
      -dot(right, eye), -dot(up, eye), dot(sight, eye), 1];
    const depth = dot(subtract(sphere.centre, eye), sight);
    const far = Math.max(depth + sphere.radius, this.distance * 0.01) * 1.01;
    // Where the picture leaves out what is before its near plane, so does its view.
    const cut = this.isMoved ? 0 : this.near;
    if (!this.perspective) {
      const near = cut || Math.min(depth - sphere.radius, 0) * 1.01, h = 2 / this.height;
      return product([h / aspect, 0, 0, 0, 0, h, 0, 0, 0, 0, -2 / (far - near), 0, 0, 0, -(far + near) / (far - near), 1], view);
    }
    const near = Math.max(cut, depth - sphere.radius * 1.01, far * 2e-4);
    const f = 1 / Math.tan(this.angle / 2);
    return product([f / aspect, 0, 0, 0, 0, f, 0, 0, 0, 0, (far + near) / (near - far), -1, 0, 0, 2 * far * near / (near - far), 0], view);
  }
  /** The ray through a place of the view, from -1 to 1. */
  ray(x, y, aspect) {
    const across = add(times(this.right, x * aspect * this.shown / 2), times(this.up, y * this.shown / 2));
    if (!this.perspective) return { from: add(this.eye, across), along: this.sight };
    return { from: this.eye, along: unit(add(times(this.sight, this.distance), across)) };
  }
}
