// Groups, as `lyra group` makes them: each folds into one line, and can be settled as one.

let isGrouped = false;
const folded = new Set();   // ids of groups
const groupLines = new Map();  // lines of the table by id of their group
const groupOfItem = new Map();  // the innermost group of an item

const walkGroups = (groups, visit, depth = 0) => {
  for (const group of groups || []) {
    visit(group, depth);
    // One group within another of the same members says nothing more.
    if (group.groups?.length > 1) walkGroups(group.groups, visit, depth + 1);
  }
};

const membersOf = group => group.members.map(n => itemOfNumber.get(String(n))).filter(Boolean);

const startGroups = () => walkGroups(data.groups, group => {
  for (const item of membersOf(group)) groupOfItem.set(item, group);
});

const lineOf = (group, depth) => {
  let line = groupLines.get(group.id);
  if (line) return line;
  const members = membersOf(group);
  const fold = button('', () => toggleGroup(group), { className: 'fold' });
  const settle = make('select', { className: 'decide', 'aria-label': `Status of all of ${group.label}` });
  settle.addEventListener('change', () => {
    if (settle.value) decide(members, { status: settle.value });
    settle.value = '';
  });
  settle.append(new Option('Settle all…', ''), ...statuses.map(word => new Option(word, word)));
  const summary = make('span', { className: 'summary' });
  line = make('tr', { className: 'group', 'data-group': group.id },
    make('th', { scope: 'rowgroup', colSpan: 9 }, fold, make('bdi', { className: 'label' }, group.label), summary, settle));
  line.style.setProperty('--depth', depth);
  groupLines.set(group.id, line);
  return line;
};

const showGroup = group => {
  const line = groupLines.get(group.id);
  if (!line) return;
  const members = membersOf(group), isOpen = !folded.has(group.id);
  const shown = members.filter(item => !item.isHidden);
  line.hidden = !shown.length || [...folded].some(id => id !== group.id && parents(group).includes(id));
  const fold = line.querySelector('.fold');
  fold.textContent = isOpen ? '▾' : '▸';
  fold.setAttribute('aria-expanded', String(isOpen));
  fold.setAttribute('aria-label', `${isOpen ? 'Fold' : 'Unfold'} ${group.label}`);
  const decided = byCount(members.map(statusOf)).map(([word, count]) => `${count} ${word.slice(0, 60)}`).join(', ');
  const worst = group.worst === undefined ? '' : ` · worst ${Number(group.worst.toPrecision(3))} mm`;
  line.querySelector('.summary').textContent = `${shown.length === members.length ? '' : shown.length + ' of '}${counted(members.length, 'interference')}${worst} · ${decided}`;
};

const parentOf = new Map();
const parents = group => {
  const chain = [];
  for (let id = parentOf.get(group.id); id; id = parentOf.get(id)) chain.push(id);
  return chain;
};

const showGroups = () => {
  if (!isGrouped) return;
  const isInFolded = item => {
    const group = groupOfItem.get(item);
    return !!group && (folded.has(group.id) || parents(group).some(id => folded.has(id)));
  };
  for (const item of items) {
    item.isFolded = isInFolded(item);
    item.row.hidden = item.isHidden || item.isFolded;
  }
  walkGroups(data.groups, showGroup);
};

const toggleGroup = group => {
  folded.has(group.id) ? folded.delete(group.id) : folded.add(group.id);
  showGroups();
};

/** Lines before their rows, in the order of the groups; the order of the table within them. */
const arrangeGroups = () => {
  const body = table.tBodies[0];
  for (const line of groupLines.values()) line.remove();
  if (!isGrouped) {
    for (const item of items) { item.isFolded = false; item.row.hidden = item.isHidden; }
    return;
  }
  const rank = new Map(items.map((item, place) => [item, place]));
  const append = (groups, depth, parent) => {
    for (const group of groups) {
      if (parent) parentOf.set(group.id, parent.id);
      body.append(lineOf(group, depth));
      if (group.groups?.length > 1) append(group.groups, depth + 1, group);
      else body.append(...membersOf(group).sort((a, b) => rank.get(a) - rank.get(b)).map(item => item.row));
    }
  };
  append(data.groups || [], 0, null);
  showGroups();
};

const groupRows = (on, isFolded) => {
  isGrouped = on;
  if (isFolded) walkGroups(data.groups, group => folded.add(group.id));
  arrange();
};

const startGrouping = () => {
  listeners.filtered.push(showGroups);
  listeners.decided.push(showGroups);
};
