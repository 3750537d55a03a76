// The current row, the selected ones, the bar of tools, and keys.

let current = null;
const selected = new Set();

const shownItems = () => {
  if (!isGrouped) return items.filter(item => !item.row.hidden);
  return Array.from(table.tBodies[0].rows).filter(row => row.dataset.n && !row.hidden).map(row => itemOfNumber.get(row.dataset.n));
};

/** An item, or all that are selected when it is one of them. */
const withSelected = item => selected.has(item) ? [...selected] : [item];
const chosen = () => selected.size ? [...selected] : current ? [current] : [];

const setCurrent = (item, isScrolled = true) => {
  current?.row.classList.remove('current');
  current?.row.removeAttribute('aria-current');
  current = item;
  markOnMap(item);
  if (!item) return;
  makeReady(item.row);
  item.row.classList.add('current');
  item.row.setAttribute('aria-current', 'true');
  if (isScrolled && viewed() !== item) item.row.scrollIntoView({ block: 'nearest' });
  if (viewed() && viewed() !== item) openViewer(item);
};

const select = (some, on) => {
  for (const item of some) {
    on ? selected.add(item) : selected.delete(item);
    item.row.classList.toggle('selected', on);
    item.row.setAttribute('aria-selected', String(on));
    const box = item.row.querySelector('.pick');
    if (box) box.checked = on;
  }
  showTools();
};

const step = by => {
  const shown = shownItems();
  if (!shown.length) return;
  const at = shown.indexOf(current);
  setCurrent(shown[at < 0 ? (by > 0 ? 0 : shown.length - 1) : Math.min(shown.length - 1, Math.max(0, at + by))]);
};

const nextGroup = () => {
  const groups = [];
  const shown = isGrouped ? shownItems() : items.filter(item => !item.isHidden);
  walkGroups(data.groups, group => { if (!(group.groups?.length > 1)) groups.push(group); });
  const at = groups.indexOf(groupOfItem.get(current));
  for (let i = 1; i <= groups.length; ++i) {
    const first = shown.find(item => groupOfItem.get(item) === groups[(at + i) % groups.length]);
    if (!first) continue;
    setCurrent(first);
    return say(groupOfItem.get(first).label.slice(0, 200));
  }
};

const writeComment = () => {
  if (!current) return;
  if (viewed() === current) return viewerFields().comment.focus();
  makeReady(current.section);
  current.section.scrollIntoView({ block: 'nearest' });
  current.fields?.comment.focus();
};

const commentOnAll = async () => {
  const some = chosen().filter(mayDecide);
  if (some.length < 2) return writeComment();
  const field = make('textarea', { rows: 4, className: 'field', 'aria-label': 'Comment' });
  const answer = await ask(`Comment on ${some.length} interferences`, field, { ok: 'Comment', cancel: 'Cancel' });
  if (answer === 'ok') decide(some, { comment: field.value });
};

const settle = status => {
  const some = chosen();
  if (!some.length) return say('Choose an interference first: j and k move, x selects.');
  decide(some, { status });
  const refused = some.filter(item => !mayDecide(item)).length;
  say(`${counted(some.length - refused, 'interference')}: ${status}.`);
  if (!selected.size && !refused) step(1);
};

const selectAll = () => {
  const shown = items.filter(item => !item.isHidden);
  const areAll = shown.every(item => selected.has(item));
  select(areAll ? [...selected] : shown, !areAll);
};

const help = () => ask('Keys', make('dl', { className: 'keys' }, ...Object.entries({
  'j k': 'next, previous', g: 'first of the next group', 'r i n': 'relevant, irrelevant, not inspected',
  c: 'comment; Escape ends', x: 'select or not', a: 'select all that are shown, or none', u: 'undo', 'Enter': 'turn the pair in 3D, or show the picture',
  Escape: 'select none; end 3D', '/': 'search', '?': 'this list',
}).flatMap(([keys, what]) => [make('dt', {}, ...keys.split(' ').map(key => make('kbd', {}, key))), make('dd', {}, what)])), { ok: 'Close' });

const openCurrent = () => {
  if (!current) return;
  if (mayTurn(current)) return openViewer(current);
  const link = current.section?.querySelector('.picture > a');
  if (link) large(link);
};

const keys = {
  j: () => step(1), k: () => step(-1), r: () => settle('Relevant'), i: () => settle('Irrelevant'), n: () => settle('Not inspected'),
  c: commentOnAll, g: nextGroup, u: undo, a: selectAll, x: () => current && select([current], !selected.has(current)),
  '/': () => form.elements.text.focus(), '?': help, Enter: openCurrent,
  Escape: () => viewed() ? closeViewer() : select([...selected], false),
};

// The bar of tools

const tools = {};

const showTools = () => {
  if (!tools.bar) return;
  const changes = decisions.size;
  tools.count.textContent = changes ? `${counted(changes, 'decision')}${isSaved() ? ', saved' : ', not saved'}` : 'No decisions yet';
  tools.save.disabled = !changes;
  tools.undo.disabled = !undone.length;
  tools.selected.textContent = selected.size ? `${selected.size} selected` : '';
  for (const action of tools.actions) action.disabled = !chosen().length;
};

const startTools = () => {
  const who = make('input', { className: 'field who', value: reviewer(), autocomplete: 'name', placeholder: 'Your name', 'aria-label': 'Your name, for the review file' });
  who.addEventListener('change', () => stored('zorlyra-reviewer', who.value.trim()));
  const group = make('select', { name: 'groups' }, new Option('None', ''), new Option('Open', 'open'), new Option('Folded', 'folded'));
  group.addEventListener('change', () => { folded.clear(); groupRows(!!group.value, group.value === 'folded'); });
  const act = (text, action, key) => button(text, action, { title: `Key ${key}`, 'aria-keyshortcuts': key });
  tools.actions = [act('Relevant', () => settle('Relevant'), 'r'), act('Irrelevant', () => settle('Irrelevant'), 'i'),
    act('Not inspected', () => settle('Not inspected'), 'n'), act('Comment', commentOnAll, 'c')];
  tools.count = make('span', { className: 'count', role: 'status' });
  tools.selected = make('span', { className: 'count' });
  tools.undo = act('Undo', undo, 'u');
  tools.save = button('Save review', saveReview, { className: 'primary' });
  tools.bar = make('div', { className: 'bar', role: 'toolbar', 'aria-label': 'Review' },
    make('span', { className: 'set' }, ...tools.actions), tools.selected,
    make('span', { className: 'end' }, tools.count, tools.undo, who, tools.save, button('Open review…', chooseReview),
      ...(data.oneFile && data.sha256 ? [button('Save result', saveResult)] : []), button('?', help, { 'aria-label': 'Keys (?)' })));
  if (data.groups?.length) form.querySelector('output').before(make('label', {}, 'Groups ', group));
  document.querySelector('.wide').before(tools.bar);
  listeners.decided.push(showTools);
  showTools();
};

const startKeys = () => {
  startTools();
  whenNear((item, isRow) => {
    if (!isRow || !mayDecide(item)) return;
    const box = make('input', { type: 'checkbox', className: 'pick', 'aria-label': `Select ${item.n}`, checked: selected.has(item) });
    box.addEventListener('click', event => {
      const shown = shownItems();
      const from = shown.indexOf(lastPicked), to = shown.indexOf(item);
      const some = event.shiftKey && from >= 0 ? shown.slice(Math.min(from, to), Math.max(from, to) + 1) : [item];
      select(some, box.checked);
      lastPicked = item;
    });
    item.row.cells[0].prepend(box);
  });
  let lastPicked = null;
  table.tBodies[0].addEventListener('click', event => {
    const item = itemAt(event.target);
    if (!item || event.target.closest('select, input')) { if (item) setCurrent(item, false); return; }
    if (event.target.closest('a, button')) return setCurrent(item, false);
    if (event.ctrlKey || event.metaKey) select([item], !selected.has(item));
    setCurrent(item, false);
    showTools();
  });
  document.addEventListener('keydown', event => {
    if (event.ctrlKey || event.metaKey || event.altKey || event.defaultPrevented) return;
    if (document.querySelector('dialog[open]')) return;
    const isText = event.target.closest?.('input:not([type=checkbox]), textarea, select');
    if (isText && event.key !== 'Escape') return;
    if (event.key === 'Enter' && event.target.closest?.('a, button, summary')) return;
    const action = keys[event.key];
    if (!action) return;
    event.preventDefault();
    isText ? event.target.blur() : action();
    showTools();
  });
};
