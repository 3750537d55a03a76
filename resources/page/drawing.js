// Drawing with WebGL 2: surfaces lit as in the pictures, edges, what is ghosted, and markers above all.

const surfaceVertex = `#version 300 es
layout(location = 0) in vec3 position; layout(location = 1) in vec2 octahedral; layout(location = 2) in mat4 rootFromPart;
uniform mat4 viewFromRoot; uniform vec3 low, size;
out vec3 place, normal;
void main() {
  vec3 n = vec3(octahedral, 1.0 - abs(octahedral.x) - abs(octahedral.y));
  if (n.z < 0.0) n.xy = (1.0 - abs(n.yx)) * vec2(n.x < 0.0 ? -1.0 : 1.0, n.y < 0.0 ? -1.0 : 1.0);
  vec4 root = rootFromPart * vec4(low + size * position, 1.0);
  place = root.xyz; normal = mat3(rootFromPart) * n;
  gl_Position = viewFromRoot * root;
}`;

// The light is that of the pictures: from the eye, and from one side. A processor that draws has roots, but no powers, at
// little cost: sRGB is I. Taylor's approximation by roots, within a step of a byte but for what is nearly black.
const surfaceFragment = defines => `#version 300 es
${defines}
precision highp float;
in vec3 place, normal;
uniform vec3 eye, sight, fill, colour; uniform float isPerspective, alpha; uniform vec4 section;
out vec4 shown;
vec3 srgb(vec3 c) {
  vec3 root = sqrt(c), fourth = sqrt(root);
  return 0.662002687 * root + 0.684122060 * fourth - 0.323583601 * sqrt(fourth) - 0.022541147 * c;
}
void main() {
#ifdef SECTION
  if (dot(section.xyz, place) > section.w) discard;
#endif
  vec3 toEye = isPerspective > 0.0 ? normalize(eye - place) : -sight;
  vec3 n = normalize(normal);
  if (dot(n, toEye) < 0.0) n = -n;
  vec3 light = (0.20 + 0.62 * max(dot(n, toEye), 0.0) + 0.28 * max(dot(n, fill), 0.0)) * colour;
#ifndef GHOST
  float shine = max(dot(n, normalize(fill + toEye)), 0.0);
  for (int i = 0; i < 5; ++i) shine *= shine;
  light += 0.07 * shine;
#endif
  // Inside, where a section opens it: flat and darker.
#ifdef SECTION
  if (!gl_FrontFacing) light = 0.45 * colour;
#endif
  shown = vec4(srgb(min(light, 1.0)) * alpha, alpha);
}`;

const lineVertex = `#version 300 es
layout(location = 0) in vec3 position; layout(location = 2) in mat4 rootFromPart;
uniform mat4 viewFromRoot; uniform vec3 low, size, shift; uniform float pointSize;
out vec3 place;
void main() {
  vec4 root = rootFromPart * vec4(low + size * position, 1.0);
  place = root.xyz;
  gl_Position = viewFromRoot * root; gl_PointSize = pointSize;
  gl_Position.xyz += shift * gl_Position.w;
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

/** "#rrggbb" as light. */
const lightOf = colour => [1, 3, 5].map(at => {
  const value = parseInt(colour.slice(at, at + 2), 16) / 255;
  return value <= 0.04045 ? value / 12.92 : ((value + 0.055) / 1.055) ** 2.4;
});
const ghostColour = lightOf('#8a949e');
const bytesOf = colour => [1, 3, 5].map(at => parseInt(colour.slice(at, at + 2), 16) / 255);

class Drawing {
  /** Raises an Error when there is no WebGL 2. */
  constructor(canvas) {
    const gl = this.gl = canvas.getContext('webgl2', { antialias: false, alpha: false, preserveDrawingBuffer: true });
    if (!gl) throw new Error('this browser has no WebGL 2');
    this.canvas = canvas;
    // Two programs each, since one that leaves out pixels cannot test depths early.
    const programs = define => ['', '#define SECTION\n'].map(section => this.program(surfaceVertex, surfaceFragment(section + define)));
    this.solid = programs('');
    this.ghost = programs('#define GHOST');
    this.lines = this.program(lineVertex, lineFragment);
    this.buffers = new WeakMap();  // of each part
    this.arrays = new WeakMap();   // of each batch
    this.loose = { array: gl.createVertexArray(), buffer: gl.createBuffer() };
    gl.bindVertexArray(this.loose.array);
    gl.bindBuffer(gl.ARRAY_BUFFER, this.loose.buffer);
    gl.enableVertexAttribArray(0);
    gl.vertexAttribPointer(0, 3, gl.FLOAT, false, 0, 0);
    [[1, 0, 0, 0], [0, 1, 0, 0], [0, 0, 1, 0], [0, 0, 0, 1]].forEach((column, i) => gl.vertexAttrib4fv(2 + i, column));
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
    gl.bindVertexArray(null);
    const filled = (target, bytes) => {
      const buffer = gl.createBuffer();
      gl.bindBuffer(target, buffer);
      gl.bufferData(target, bytes, gl.STATIC_DRAW);
      return buffer;
    };
    buffers = {
      vertices: filled(gl.ARRAY_BUFFER, part.vertices), corners: filled(gl.ELEMENT_ARRAY_BUFFER, part.corners),
      lineVertices: filled(gl.ARRAY_BUFFER, part.lineVertices), segments: filled(gl.ELEMENT_ARRAY_BUFFER, part.segments),
    };
    this.buffers.set(part, buffers);
    return buffers;
  }
  arraysOf(batch) {
    const { gl } = this;
    let arrays = this.arrays.get(batch);
    const fill = places => {
      gl.bindBuffer(gl.ARRAY_BUFFER, places);
      gl.bufferData(gl.ARRAY_BUFFER, new Float32Array(batch.matrices), gl.DYNAMIC_DRAW);
    };
    if (arrays) {
      if (arrays.matrices !== batch.matrices) fill(arrays.places);
      arrays.matrices = batch.matrices;
      return arrays;
    }
    const buffers = this.buffersOf(batch.part), places = gl.createBuffer();
    fill(places);
    const array = (vertices, indices, stride) => {
      const own = gl.createVertexArray();
      gl.bindVertexArray(own);
      gl.bindBuffer(gl.ELEMENT_ARRAY_BUFFER, indices);
      for (let column = 0; column < 4; ++column) {
        gl.enableVertexAttribArray(2 + column);
        gl.vertexAttribPointer(2 + column, 4, gl.FLOAT, false, 64, 16 * column);
        gl.vertexAttribDivisor(2 + column, 1);
      }
      gl.bindBuffer(gl.ARRAY_BUFFER, vertices);
      gl.enableVertexAttribArray(0);
      gl.vertexAttribPointer(0, 3, gl.UNSIGNED_SHORT, true, stride, 0);
      return own;
    };
    const lines = array(buffers.lineVertices, buffers.segments, 8);
    gl.bindBuffer(gl.ARRAY_BUFFER, places);
    const surfaces = array(buffers.vertices, buffers.corners, 12);
    gl.enableVertexAttribArray(1);
    gl.vertexAttribPointer(1, 2, gl.BYTE, true, 12, 8);
    gl.bindVertexArray(null);
    arrays = { surfaces, lines, places, matrices: batch.matrices };
    this.arrays.set(batch, arrays);
    return arrays;
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

  /** @param view {camera, viewFromRoot, section, solids, ghosts, points, curve, marker}; solids and ghosts are batches. */
  draw(view) {
    const { gl, canvas } = this, { camera, section } = view;
    gl.viewport(0, 0, canvas.width, canvas.height);
    gl.clearColor(1, 1, 1, 1);
    gl.clear(gl.COLOR_BUFFER_BIT | gl.DEPTH_BUFFER_BIT);
    const common = {
      viewFromRoot: view.viewFromRoot, eye: camera.eye, sight: camera.sight,
      // From the upper left, behind the eye.
      fill: add(add(times(camera.right, -0.5323), times(camera.up, 0.725864)), times(camera.sight, -0.435518)),
      isPerspective: camera.perspective ? 1 : 0, section: section || [0, 0, 0, 0], hasSection: section ? 1 : 0,
    };
    const solid = this.solid[section ? 1 : 0];
    gl.useProgram(solid.program);
    this.set(solid.places, { ...common, alpha: 1 });
    gl.enable(gl.POLYGON_OFFSET_FILL);
    gl.polygonOffset(1, 1);
    for (const batch of view.solids) this.surfaces(solid, batch);
    gl.disable(gl.POLYGON_OFFSET_FILL);
    gl.useProgram(this.lines.program);
    gl.enable(gl.BLEND);
    this.set(this.lines.places, { ...common, colour: [0.08, 0.09, 0.1, 0.6], isBall: 0, pointSize: 1, shift: [0, 0, 0] });
    for (const batch of view.solids) {
      const { part, matrices } = batch;
      gl.bindVertexArray(this.arraysOf(batch).lines);
      this.set(this.lines.places, { low: part.low, size: part.size });
      gl.drawElementsInstanced(gl.LINES, part.segments.length, gl.UNSIGNED_INT, 0, matrices.length / 16);
    }
    if (view.ghosts.length) {
      const ghost = this.ghost[section ? 1 : 0];
      gl.useProgram(ghost.program);
      this.set(ghost.places, { ...common, alpha: section ? 0.13 : 0.2, colour: ghostColour });
      gl.depthMask(false);
      if (!section) gl.enable(gl.CULL_FACE);
      for (const batch of view.ghosts) this.triangles(ghost, batch, 0, batch.part.corners.length);
      gl.disable(gl.CULL_FACE);
      gl.depthMask(true);
    }
    this.markers(view, common);
    gl.disable(gl.BLEND);
    gl.bindVertexArray(null);
  }
  surfaces(program, batch) {
    const { part, colour } = batch;
    let first = 0;
    for (const [own, triangles] of part.ranges) {
      this.set(program.places, { colour: lightOf((colour.isImposed ? '' : own) || colour.text) });
      this.triangles(program, batch, first, 3 * triangles);
      first += 3 * triangles;
    }
  }
  triangles({ places }, batch, first, count) {
    const { gl } = this, { part, matrices } = batch, bytes = part.corners.BYTES_PER_ELEMENT;
    gl.bindVertexArray(this.arraysOf(batch).surfaces);
    this.set(places, { low: part.low, size: part.size });
    gl.drawElementsInstanced(gl.TRIANGLES, count, bytes === 4 ? gl.UNSIGNED_INT : gl.UNSIGNED_SHORT, first * bytes, matrices.length / 16);
  }
  /** Above everything, since what is marked mostly lies inside. */
  markers(view, common) {
    const { gl } = this;
    gl.useProgram(this.lines.program);
    gl.disable(gl.DEPTH_TEST);
    gl.bindVertexArray(this.loose.array);
    gl.bindBuffer(gl.ARRAY_BUFFER, this.loose.buffer);
    this.set(this.lines.places, { ...common, hasSection: 0, low: [0, 0, 0], size: [1, 1, 1] });
    const some = (mode, points, colour, pointSize) => {
      if (!points.length) return;
      gl.bufferData(gl.ARRAY_BUFFER, new Float32Array(points.flat()), gl.STREAM_DRAW);
      this.set(this.lines.places, { colour: [...bytesOf(colour), 1], pointSize, isBall: mode === gl.POINTS ? 1 : 0 });
      // Lines are a pixel wide: broader ones are several, side by side.
      for (const x of mode === gl.LINES ? [-1, 0, 1] : [0])
        for (const y of mode === gl.LINES ? [-1, 0, 1] : [0]) {
          this.set(this.lines.places, { shift: [2 * x / this.canvas.width, 2 * y / this.canvas.height, 0] });
          gl.drawArrays(mode, 0, points.length);
        }
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
