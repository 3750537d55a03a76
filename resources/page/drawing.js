// Drawing with WebGL 2: surfaces lit as in the pictures, edges, what is ghosted, and markers above all.

const surfaceVertex = `#version 300 es
layout(location = 0) in vec3 position; layout(location = 1) in vec2 octahedral;
uniform mat4 viewFromRoot, rootFromPart; uniform vec3 low, size;
out vec3 place, normal;
void main() {
  vec3 n = vec3(octahedral, 1.0 - abs(octahedral.x) - abs(octahedral.y));
  if (n.z < 0.0) n.xy = (1.0 - abs(n.yx)) * vec2(n.x < 0.0 ? -1.0 : 1.0, n.y < 0.0 ? -1.0 : 1.0);
  vec4 root = rootFromPart * vec4(low + size * position, 1.0);
  place = root.xyz; normal = mat3(rootFromPart) * n;
  gl_Position = viewFromRoot * root;
}`;

// The light is that of the pictures: from the eye, and from one side.
const surfaceFragment = defines => `#version 300 es
${defines}
precision highp float;
in vec3 place, normal;
uniform vec3 eye, sight, fill, colour; uniform float isPerspective, alpha; uniform vec4 section;
out vec4 shown;
vec3 srgb(vec3 c) { return mix(12.92 * c, 1.055 * pow(c, vec3(1.0 / 2.4)) - 0.055, step(0.0031308, c)); }
void main() {
#ifdef SECTION
  if (dot(section.xyz, place) > section.w) discard;
#endif
  vec3 toEye = isPerspective > 0.0 ? normalize(eye - place) : -sight;
  vec3 n = normalize(normal);
  if (dot(n, toEye) < 0.0) n = -n;
  float shine = pow(max(dot(n, normalize(fill + toEye)), 0.0), 32.0);
  vec3 light = (0.20 + 0.62 * max(dot(n, toEye), 0.0) + 0.28 * max(dot(n, fill), 0.0)) * colour + 0.07 * shine;
  // Inside, where a section opens it: flat and darker.
#ifdef SECTION
  if (!gl_FrontFacing) light = 0.45 * colour;
#endif
  shown = vec4(srgb(min(light, 1.0)) * alpha, alpha);
}`;

const lineVertex = `#version 300 es
layout(location = 0) in vec3 position;
uniform mat4 viewFromRoot, rootFromPart; uniform vec3 low, size; uniform float pointSize;
out vec3 place;
void main() {
  vec4 root = rootFromPart * vec4(low + size * position, 1.0);
  place = root.xyz;
  gl_Position = viewFromRoot * root; gl_PointSize = pointSize;
}`;

const lineFragment = `#version 300 es
precision highp float;
in vec3 place;
uniform vec4 colour, section; uniform float hasSection, isBall;
out vec4 shown;
void main() {
  if (hasSection > 0.0 && dot(section.xyz, place) > section.w) discard;
  float light = 1.0;
  if (isBall > 0.0) {
    vec2 p = 2.0 * gl_PointCoord - 1.0;
    if (dot(p, p) > 1.0) discard;
    light = 0.45 + 0.55 * sqrt(1.0 - dot(p, p));
  }
  shown = vec4(colour.rgb * light * colour.a, colour.a);
}`;

const identity = [1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1];

/** "#rrggbb" as light. */
const lightOf = colour => [1, 3, 5].map(at => {
  const value = parseInt(colour.slice(at, at + 2), 16) / 255;
  return value <= 0.04045 ? value / 12.92 : ((value + 0.055) / 1.055) ** 2.4;
});
const bytesOf = colour => [1, 3, 5].map(at => parseInt(colour.slice(at, at + 2), 16) / 255);

class Drawing {
  /** Raises an Error when there is no WebGL 2. */
  constructor(canvas) {
    const gl = this.gl = canvas.getContext('webgl2', { antialias: false, alpha: false, preserveDrawingBuffer: true });
    if (!gl) throw new Error('this browser has no WebGL 2');
    this.canvas = canvas;
    // Two programs, since one that leaves out pixels cannot test depths early.
    this.whole = this.program(surfaceVertex, surfaceFragment(''));
    this.cut = this.program(surfaceVertex, surfaceFragment('#define SECTION'));
    this.lines = this.program(lineVertex, lineFragment);
    this.buffers = new Map();  // of each part
    this.loose = { array: gl.createVertexArray(), buffer: gl.createBuffer() };
    gl.bindVertexArray(this.loose.array);
    gl.bindBuffer(gl.ARRAY_BUFFER, this.loose.buffer);
    gl.enableVertexAttribArray(0);
    gl.vertexAttribPointer(0, 3, gl.FLOAT, false, 0, 0);
    gl.enable(gl.DEPTH_TEST);
    gl.blendFunc(gl.ONE, gl.ONE_MINUS_SRC_ALPHA);
  }
  program(vertex, fragment) {
    const { gl } = this, program = gl.createProgram();
    for (const [type, source] of [[gl.VERTEX_SHADER, vertex], [gl.FRAGMENT_SHADER, fragment]]) {
      const shader = gl.createShader(type);
      gl.shaderSource(shader, source);
      gl.compileShader(shader);
      gl.attachShader(program, shader);
    }
    gl.linkProgram(program);
    if (!gl.getProgramParameter(program, gl.LINK_STATUS) && !gl.isContextLost()) throw new Error(gl.getProgramInfoLog(program));
    const places = {};
    const count = gl.getProgramParameter(program, gl.ACTIVE_UNIFORMS) || 0;
    for (let i = 0; i < count; ++i) {
      const { name } = gl.getActiveUniform(program, i);
      places[name] = gl.getUniformLocation(program, name);
    }
    return { program, places };
  }
  buffersOf(part) {
    let buffers = this.buffers.get(part);
    if (buffers) return buffers;
    const { gl } = this;
    const filled = (target, bytes) => {
      const buffer = gl.createBuffer();
      gl.bindBuffer(target, buffer);
      gl.bufferData(target, bytes, gl.STATIC_DRAW);
    };
    const surfaces = gl.createVertexArray();
    gl.bindVertexArray(surfaces);
    filled(gl.ARRAY_BUFFER, part.vertices);
    gl.enableVertexAttribArray(0);
    gl.vertexAttribPointer(0, 3, gl.UNSIGNED_SHORT, true, 12, 0);
    gl.enableVertexAttribArray(1);
    gl.vertexAttribPointer(1, 2, gl.BYTE, true, 12, 8);
    filled(gl.ELEMENT_ARRAY_BUFFER, part.corners);
    const lines = gl.createVertexArray();
    gl.bindVertexArray(lines);
    filled(gl.ARRAY_BUFFER, part.lineVertices);
    gl.enableVertexAttribArray(0);
    gl.vertexAttribPointer(0, 3, gl.UNSIGNED_SHORT, true, 8, 0);
    filled(gl.ELEMENT_ARRAY_BUFFER, part.segments);
    gl.bindVertexArray(null);
    buffers = { surfaces, lines, type: part.corners.BYTES_PER_ELEMENT === 4 ? gl.UNSIGNED_INT : gl.UNSIGNED_SHORT };
    this.buffers.set(part, buffers);
    return buffers;
  }
  set(places, values) {
    const { gl } = this;
    for (const [name, value] of Object.entries(values)) {
      const place = places[name];
      if (!place) continue;
      if (typeof value === 'number') gl.uniform1f(place, value);
      else if (value.length === 16) gl.uniformMatrix4fv(place, false, value);
      else if (value.length === 4) gl.uniform4fv(place, value);
      else gl.uniform3fv(place, value);
    }
  }

  /** @param view {camera, sphere, section, solids, ghosts, points, curve, marker}; solids and ghosts are [{part, matrix, colour}]. */
  draw(view) {
    const { gl, canvas } = this, { camera, section } = view;
    gl.viewport(0, 0, canvas.width, canvas.height);
    gl.clearColor(1, 1, 1, 1);
    gl.clear(gl.COLOR_BUFFER_BIT | gl.DEPTH_BUFFER_BIT);
    const common = {
      viewFromRoot: camera.matrix(canvas.width / canvas.height, view.sphere), eye: camera.eye, sight: camera.sight,
      // From the upper left, behind the eye.
      fill: add(add(times(camera.right, -0.5323), times(camera.up, 0.725864)), times(camera.sight, -0.435518)),
      isPerspective: camera.perspective ? 1 : 0, section: section || [0, 0, 0, 0], hasSection: section ? 1 : 0,
    };
    this.surfaces = section ? this.cut : this.whole;
    gl.useProgram(this.surfaces.program);
    this.set(this.surfaces.places, { ...common, alpha: 1 });
    gl.enable(gl.POLYGON_OFFSET_FILL);
    gl.polygonOffset(1, 1);
    for (const solid of view.solids) this.surface(solid, solid.colour);
    gl.disable(gl.POLYGON_OFFSET_FILL);
    gl.useProgram(this.lines.program);
    gl.enable(gl.BLEND);
    this.set(this.lines.places, { ...common, colour: [0.08, 0.09, 0.1, 0.6], isBall: 0, pointSize: 1 });
    for (const { part, matrix } of view.solids) {
      gl.bindVertexArray(this.buffersOf(part).lines);
      this.set(this.lines.places, { rootFromPart: matrix, low: part.low, size: part.size });
      gl.drawElements(gl.LINES, part.segments.length, gl.UNSIGNED_INT, 0);
    }
    if (view.ghosts.length) {
      gl.useProgram(this.surfaces.program);
      this.set(this.surfaces.places, { ...common, alpha: 0.13 });
      gl.depthMask(false);
      for (const ghost of view.ghosts) this.surface(ghost, '#8a949e');
      gl.depthMask(true);
    }
    this.markers(view, common);
    gl.disable(gl.BLEND);
    gl.bindVertexArray(null);
  }
  surface({ part, matrix }, colour) {
    const { gl } = this, buffers = this.buffersOf(part);
    gl.bindVertexArray(buffers.surfaces);
    this.set(this.surfaces.places, { rootFromPart: matrix, low: part.low, size: part.size });
    let first = 0;
    for (const [own, triangles] of part.ranges) {
      this.set(this.surfaces.places, { colour: lightOf((colour.isImposed ? '' : own) || colour.text || colour) });
      gl.drawElements(gl.TRIANGLES, 3 * triangles, buffers.type, first * (buffers.type === gl.UNSIGNED_INT ? 4 : 2));
      first += 3 * triangles;
    }
  }
  /** Above everything, since what is marked mostly lies inside. */
  markers(view, common) {
    const { gl } = this;
    gl.useProgram(this.lines.program);
    gl.disable(gl.DEPTH_TEST);
    gl.bindVertexArray(this.loose.array);
    gl.bindBuffer(gl.ARRAY_BUFFER, this.loose.buffer);
    this.set(this.lines.places, { ...common, hasSection: 0, rootFromPart: identity, low: [0, 0, 0], size: [1, 1, 1] });
    const some = (mode, points, colour, pointSize) => {
      if (!points.length) return;
      gl.bufferData(gl.ARRAY_BUFFER, new Float32Array(points.flat()), gl.STREAM_DRAW);
      this.set(this.lines.places, { colour: [...bytesOf(colour), 1], pointSize, isBall: mode === gl.POINTS ? 1 : 0 });
      gl.drawArrays(mode, 0, points.length);
    };
    const ball = Math.max(6, Math.round(this.canvas.height / (view.points.length > 60 ? 60 : 32)));
    if (view.isDimension) some(gl.LINES, view.points, view.marker, 1);
    some(gl.LINES, view.curve, view.marker, 1);
    some(gl.POINTS, view.points, view.marker, ball);
    some(gl.LINES, view.measured.length === 2 ? view.measured : [], '#1f5fa8', 1);
    some(gl.POINTS, view.measured, '#1f5fa8', Math.round(this.canvas.height / 40));
    gl.enable(gl.DEPTH_TEST);
  }
}
