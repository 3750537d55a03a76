// The pair of an interference in 3D, where its picture stood.

let view = null;        // what is seen: see openViewer
let drawing = null;     // one canvas, which goes from one interference to the next
let whyNotTurned = '';  // once it was tried

const viewed = () => view && view.item;
const viewerFields = () => view && view.fields;
const mayTurn = item => {
  if (!data.geometry || whyNotTurned || !item.section) return false;
  putIn(item.section);
  return !!item.section.querySelector('.picture');
};

const sphereOf = solids => {
  const low = [Infinity, Infinity, Infinity], high = [-Infinity, -Infinity, -Infinity];
  for (const { part, matrix } of solids)
    for (let corner = 0; corner < 8; ++corner) {
      const p = applied(matrix, part.low.map((l, axis) => l + (corner >> axis & 1) * part.size[axis]));
      for (let axis = 0; axis < 3; ++axis) {
        low[axis] = Math.min(low[axis], p[axis]);
        high[axis] = Math.max(high[axis], p[axis]);
      }
    }
  const centre = times(add(low, high), 0.5);
  return Number.isFinite(centre[0]) ? { centre, radius: lengthOf(subtract(high, centre)) } : { centre: [0, 0, 0], radius: 1 };
};

/** The instances of a product, where the picture shows them. */
const solidsOf = async (scene, shown, product_) => {
  if (!shown) return [];
  const moved = shown.to && product(matrixOf(shown.to), inverse(matrixOf(shown.from)));
  const solids = [];
  for (const [index, matrix, colour] of scene.instances.slice(shown.first, shown.end)) {
    const own = matrixOf(matrix);
    solids.push({
      part: await partOf(scene, index), matrix: moved ? product(moved, own) : own, product: product_,
      colour: { text: shown.colour || colour, isImposed: !!shown.colour },
    });
  }
  return solids;
};

const ghostsOf = async (scene, pair) => {
  const isShown = index => pair.products.some(shown => shown && index >= shown.first && index < shown.end);
  const ghosts = [];
  for (const [index, [part, matrix]] of scene.instances.entries())
    if (!isShown(index)) ghosts.push({ part: await partOf(scene, part), matrix: matrixOf(matrix) });
  return ghosts;
};

// A frame that turns has a pixel for each of the screen's and all triangles, or fewer where that is too slow; one that stands
// has four pixels for each, which smooths its edges. What was too slow twice is not tried again while it turns, since each
// other size has to be made room for.

const details = [{ scale: 1, cells: 0 }, { scale: 0.7, cells: 0 }, { scale: 0.7, cells: 64 }, { scale: 0.5, cells: 64 }, { scale: 0.35, cells: 32 }, { scale: 0.35, cells: 16 }];
const still = { scale: 2, cells: 0 }, tooSlow = 1000 / 33, quick = 1000 / 50, stillAfter = 150;
const pace = { coarseness: 0, frames: 0, meanTime: 0, failures: [] };
const keepPace = took => {
  const { coarseness } = pace, change = step => Object.assign(pace, { coarseness: coarseness + step, frames: 0, meanTime: 0 });
  if (isStill) {  // it begins to turn
    isStill = false;
    pace.failures = details.map(() => 0);
    return void change(coarseness ? -1 : 0);
  }
  if (++pace.frames < 4) return;  // until there is room
  pace.meanTime = pace.meanTime ? 0.8 * pace.meanTime + 0.2 * took : took;
  if (pace.meanTime > tooSlow && coarseness < details.length - 1) {
    ++pace.failures[coarseness];
    change(1);
  } else if (pace.frames > 30 && pace.meanTime < quick && coarseness && pace.failures[coarseness - 1] < 2) change(-1);
};
let isAsked = false, isStill = true, lastFrame = 0, stillTimer = 0;
const redraw = () => {
  if (isAsked) return;
  isAsked = true;
  delete drawing.canvas.dataset.still;
  clearTimeout(stillTimer);
  requestAnimationFrame(time => {
    isAsked = false;
    keepPace(time - lastFrame);
    lastFrame = time;
    drawNow(details[pace.coarseness]);
    stillTimer = setTimeout(() => { isStill = true; drawNow(still); }, stillAfter);
  });
};

const drawNow = ({ scale, cells }) => {
  if (!view?.camera) return;
  const { canvas } = drawing, { camera } = view, ratio = scale * Math.min(devicePixelRatio || 1, 2);
  const width = Math.round(drawing.width * ratio), height = Math.round(drawing.height * ratio);
  if (!width || !height) return;
  if (canvas.width !== width || canvas.height !== height) Object.assign(canvas, { width, height });
  const viewFromRoot = camera.matrix(width / height, view.hasGhosts ? view.wholeSphere : view.sphere);
  drawing.draw({
    camera, viewFromRoot, section: view.section && sectionPlane(),
    solids: view.batches.filter((_, product) => !view.hidden[product]).flat().map(batch => coarseBatch(batch, cells)),
    ghosts: view.hasGhosts && view.ghosts ? view.ghosts.seen(viewFromRoot, camera, cells / 2, cells ? 0.5 / cells : 0) : [],
    points: view.pair.points, curve: view.curve, isDimension: view.pair.isDimension, marker: view.pair.markers, measured: view.measured,
  });
  if (scale === still.scale && !isAsked) canvas.dataset.still = '1';
};

// The section: a plane through the interference, which moves along its direction.

const sectionNormals = { view: () => times(view.camera.sight, -1), x: () => [1, 0, 0], y: () => [0, 1, 0], z: () => [0, 0, 1] };
const placeOf = pair => pair.points.length ? times(pair.points.reduce(add), 1 / pair.points.length) : view.sphere.centre;
const sectionPlane = () => {
  const { normal, offset, isFlipped } = view.section;
  const n = isFlipped ? times(normal, -1) : normal;
  return [...n, dot(n, add(placeOf(view.pair), times(normal, offset * view.sphere.radius)))];
};
const cut = direction => {
  view.section = { normal: sectionNormals[direction](), direction, offset: 0, isFlipped: false };
  showViewer();
};

// Measuring: the distance between two points of surfaces

const pick = event => {
  const box = drawing.canvas.getBoundingClientRect();
  const x = (event.clientX - box.x) / box.width * 2 - 1, y = 1 - (event.clientY - box.y) / box.height * 2;
  const ray = view.camera.ray(x, y, box.width / box.height);
  const plane = view.section && sectionPlane();
  let nearest = Infinity;
  for (const solid of view.solids) {
    if (view.hidden[solid.product]) continue;
    const partFromRoot = inverse(solid.matrix);
    const isSeen = distance => !plane || dot(plane, add(ray.from, times(ray.along, distance))) <= plane[3];
    nearest = Math.min(nearest, meets(solid.part, applied(partFromRoot, ray.from), applied(partFromRoot, ray.along, 0), isSeen));
  }
  return nearest === Infinity ? null : add(ray.from, times(ray.along, nearest));
};

const measure = event => {
  const point = pick(event);
  if (!point) return say('There is no surface here.');
  if (view.measured.length > 1) view.measured = [];
  view.measured.push(point);
  showViewer();
};

const lengthText = length => String(length >= 100 ? Math.round(length) : Number(length.toPrecision(3)));

// What is pressed and shown

const showViewer = () => {
  const { tools, hidden, section, measured } = view;
  tools.first.setAttribute('aria-pressed', String(hidden[0]));
  tools.second.setAttribute('aria-pressed', String(hidden[1]));
  tools.ghosts.setAttribute('aria-pressed', String(view.hasGhosts));
  tools.measure.setAttribute('aria-pressed', String(view.isMeasuring));
  tools.section.value = section ? section.direction : '';
  tools.offset.hidden = tools.flip.hidden = !section;
  if (section) tools.offset.value = section.offset;
  const [a, b] = measured;
  const length = b && lengthOf(subtract(a, b));
  tools.length.replaceChildren(...!view.isMeasuring ? [] : b
    ? [make('data', { value: String(length), title: `${length} mm` }, lengthText(length)), ' mm']
    : [a ? 'Pick the second point' : 'Pick two points']);
  redraw();
};

const toggleGhosts = async () => {
  const mine = view;
  mine.hasGhosts = !mine.hasGhosts;
  if (mine.hasGhosts && !mine.ghosts) {
    const ghosts = await ghostsOf(await readScene(), mine.pair);
    mine.wholeSphere = sphereOf([...ghosts, ...mine.solids]);
    mine.ghosts = new Ghosts(ghosts);
  }
  if (view === mine) showViewer();
};

const viewerKeys = {
  ArrowLeft: camera => camera.turn(-0.1, 0), ArrowRight: camera => camera.turn(0.1, 0),
  ArrowUp: camera => camera.turn(0, -0.1), ArrowDown: camera => camera.turn(0, 0.1),
  'Shift ArrowLeft': camera => camera.pan(-0.05, 0), 'Shift ArrowRight': camera => camera.pan(0.05, 0),
  'Shift ArrowUp': camera => camera.pan(0, -0.05), 'Shift ArrowDown': camera => camera.pan(0, 0.05),
  '+': camera => camera.zoom(0.87), '-': camera => camera.zoom(1.15), 0: camera => camera.reset(),
  1: () => { view.hidden[0] = !view.hidden[0]; }, 2: () => { view.hidden[1] = !view.hidden[1]; },
  s: () => view.section ? view.section = null : cut('view'), t: toggleGhosts,
  m: () => { view.isMeasuring = !view.isMeasuring; view.measured = []; },
};

const listenToPointers = canvas => {
  const pointers = new Map();
  let start = null;
  canvas.addEventListener('pointerdown', event => {
    canvas.setPointerCapture(event.pointerId);
    pointers.set(event.pointerId, event);
    start = { x: event.clientX, y: event.clientY, isClick: pointers.size === 1 };
    canvas.focus({ preventScroll: true });
  });
  canvas.addEventListener('pointermove', event => {
    const before = pointers.get(event.pointerId);
    if (!before || !view) return;
    const size = canvas.clientHeight, x = (event.clientX - before.clientX) / size, y = (event.clientY - before.clientY) / size;
    if (Math.hypot(event.clientX - start.x, event.clientY - start.y) > 4) start.isClick = false;
    if (pointers.size === 2) {
      const other = [...pointers.values()].find(pointer => pointer.pointerId !== event.pointerId);
      const apart = pointer => Math.hypot(pointer.clientX - other.clientX, pointer.clientY - other.clientY) || 1;
      view.camera.zoom(apart(before) / apart(event));
      view.camera.pan(x / 2, y / 2);
    } else if (event.buttons & 6 || event.shiftKey) view.camera.pan(x, y);
    else view.camera.turn(x * 4, y * 4);
    pointers.set(event.pointerId, event);
    redraw();
  });
  for (const end of ['pointerup', 'pointercancel'])
    canvas.addEventListener(end, event => {
      if (end === 'pointerup' && start?.isClick && view?.isMeasuring) measure(event);
      pointers.delete(event.pointerId);
    });
  canvas.addEventListener('contextmenu', event => event.preventDefault());
  canvas.addEventListener('wheel', event => {
    event.preventDefault();
    view?.camera.zoom(Math.exp(Math.max(-1, Math.min(1, event.deltaY / 400))));
    redraw();
  }, { passive: false });
  canvas.addEventListener('keydown', event => {
    if (event.ctrlKey || event.metaKey || event.altKey || !view?.camera) return;
    const key = (event.shiftKey && event.key.startsWith('Arrow') ? 'Shift ' : '') + event.key;
    const action = viewerKeys[key];
    if (!action) return;
    event.preventDefault();
    event.stopPropagation();
    action(view.camera);
    if (view && !/^(Shift )?Arrow|[-+0]/.test(key)) showViewer();  // for what only turns no layout is made anew
    else if (view) redraw();
  });
};

const makeDrawing = () => {
  const canvas = make('canvas', { tabIndex: 0, role: 'img' });
  drawing = new Drawing(canvas);
  listenToPointers(canvas);
  canvas.addEventListener('webglcontextlost', () => { whyNotTurned = 'the graphics were lost'; closeViewer(); say('The 3D view ended: the graphics were lost.'); });
  // Asked for here alone, since each answer may need a layout.
  drawing.fit = () => Object.assign(drawing, { width: canvas.clientWidth, height: canvas.clientHeight });
  new ResizeObserver(() => { const { width } = drawing; if (drawing.fit().width !== width) redraw(); }).observe(canvas);
};

const toolsOf = item => {
  const names = Array.from(item.section.querySelectorAll('.card strong'), name => name.textContent);
  const toggle = (text, action, label, key) => button(text, () => { action(); showViewer(); }, { 'aria-pressed': 'false', 'aria-label': label, title: `${label} (${key})` });
  const act = name => () => viewerKeys[name](view.camera);
  const tools = {
    home: button('Picture’s view', () => { view.camera.reset(); redraw(); }, { title: 'Back to where the picture was taken from (0)' }),
    first: toggle('Hide 1', act('1'), `Hide 1: ${names[0] || 'the first product'}`, '1'),
    second: toggle('Hide 2', act('2'), `Hide 2: ${names[1] || 'the second product'}`, '2'),
    ghosts: toggle('Assembly', () => { toggleGhosts(); }, 'Assembly: show the rest of it', 't'),
    section: make('select', { 'aria-label': 'Section through the interference', title: 'Section (s)' }, new Option('No section', ''),
      new Option('Section facing me', 'view'), new Option('Section across x', 'x'), new Option('Section across y', 'y'), new Option('Section across z', 'z')),
    offset: make('input', { type: 'range', min: -1, max: 1, step: 'any', 'aria-label': 'Place of the section' }),
    flip: button('Flip', () => { view.section.isFlipped = !view.section.isFlipped; redraw(); }),
    measure: toggle('Measure', act('m'), 'Measure between two points', 'm'),
    length: make('output', { className: 'length', 'aria-live': 'polite' }),
    close: button('Close', () => closeViewer(), { title: 'Back to the picture (Escape)' }),
  };
  tools.section.addEventListener('change', () => {
    tools.section.value ? cut(tools.section.value) : view.section = null;
    showViewer();
  });
  tools.offset.addEventListener('input', () => { view.section.offset = Number(tools.offset.value); redraw(); });
  return tools;
};

const closeViewer = () => {
  if (!view) return;
  const { figure, place, item } = view;
  view = null;
  place.remove();
  figure.classList.remove('turned');
  figure.querySelector('a')?.focus({ preventScroll: true });
  setCurrent(item, false);
};

const openViewer = async item => {
  makeReady(item.section);
  if (view) closeViewer();
  const figure = item.section.querySelector('.picture');
  if (!figure) return;
  try {
    if (!drawing) makeDrawing();
    const scene = await readScene();
    const pair = scene.pairs[item.n];
    if (!pair) { large(figure.querySelector('a')); return; }
    const solids = [...await solidsOf(scene, pair.products[0], 0), ...await solidsOf(scene, pair.products[1], 1)];
    const tools = toolsOf(item);
    const fields = mayDecide(item) ? { status: statusField(item), comment: commentField(item, 1) } : null;
    drawing.canvas.setAttribute('aria-label', `3D view of interference ${item.n}. Arrow keys turn, with Shift they move, plus and minus zoom, 0 is the picture’s view.`);
    const place = make('div', { className: 'viewer' }, drawing.canvas,
      make('div', { className: 'tools', role: 'toolbar', 'aria-label': '3D view' }, ...Object.values(tools)),
      ...(fields ? [make('div', { className: 'settle decide' }, fields.status, fields.comment)] : []),
      ...(scene.simplified ? [make('p', { className: 'note' }, `Simplified for size: about ${Math.round(100 * scene.simplified)} % of the triangles, up to ${(100 * scene.error).toPrecision(2)} % of a part’s size off.`)] : []));
    const sphere = sphereOf(solids);
    const batches = [0, 1].map(which => batchesOf(solids.filter(solid => solid.product === which)));
    const curve = pair.curve.flat().map(i => pair.points[i]);
    view = { item, figure, place, pair, solids, batches, curve, tools, fields, sphere, wholeSphere: sphere, camera: new Camera(pair.camera),
      hidden: [false, false], ghosts: null, hasGhosts: false, section: null, measured: [], isMeasuring: false };
    drawing.canvas.style.aspectRatio = scene.size.join(' / ');
    figure.classList.add('turned');
    figure.prepend(place);
    if (current !== item) setCurrent(item, false);
    item.section.scrollIntoView({ block: 'nearest' });
    drawing.canvas.focus({ preventScroll: true });
    if (fields) tell('decided', [item]);
    drawing.fit();
    showViewer();
    drawNow(still);
  } catch (error) {
    whyNotTurned = error.message;
    view = null;
    figure.append(make('figcaption', { className: 'note', role: 'status' }, `The picture cannot be turned: ${error.message}.`));
  }
};

const startViewer = () => whenNear((item, isRow) => {
  if (isRow || !data.geometry || whyNotTurned) return;
  const figure = item.section.querySelector('.picture');
  if (!figure) return;
  figure.querySelector('a').title = 'Turn it in 3D';
  figure.append(make('p', { className: 'turn' }, button('Turn in 3D', () => openViewer(item), { 'aria-label': `Turn in 3D: interference ${item.n}` }),
    button('Enlarge', () => large(figure.querySelector('a')), { 'aria-label': `Enlarge the picture of ${item.n}` })));
});
