// Search, choice, order, and counts by type and status.

const form = document.querySelector('.filters');

const offer = (select, words) => {
  const chosen = select.value;
  const all = new Set(words);
  if (chosen) all.add(chosen);  // it stays chosen when the last one has changed
  select.replaceChildren(new Option('All', ''), ...[...all].map(word => new Option(word, word)));
  select.value = chosen;
};

const textOf = item => item.text ||= item.row.textContent.toLowerCase();

const filter = () => {
  const { text, type, status, change } = form.elements;
  const wanted = text.value.trim().toLowerCase();
  let shown = 0;
  for (const item of items) {
    const fits = (!type.value || item.type === type.value) && (!status.value || statusOf(item) === status.value) &&
      (!change?.value || item.change === change.value) && (!wanted || textOf(item).includes(wanted));
    item.isHidden = !fits;
    if (item.section) item.section.hidden = !fits;
    item.row.hidden = !fits || !!item.isFolded;
    shown += fits;
  }
  form.querySelector('output').value = `${shown} of ${items.length} shown`;
  tell('filtered');
};

// Order

const keyOf = (row, column, isNumber) => {
  const cell = row.cells[column];
  if (!isNumber) return cell.textContent.trim();
  const number = parseFloat((cell.querySelector('data')?.value ?? cell.textContent).replace(',', '.'));
  return Number.isNaN(number) ? Infinity : number;
};

const sort = (header, column) => {
  const isNumber = header.classList.contains('number');
  const down = header.getAttribute('aria-sort') === 'ascending';
  for (const other of header.parentNode.cells) other.removeAttribute('aria-sort');
  header.setAttribute('aria-sort', down ? 'descending' : 'ascending');
  const order = new Intl.Collator(undefined, { numeric: true });
  const compare = isNumber ? (a, b) => a < b ? -1 : a > b ? 1 : 0 : order.compare;
  const keyed = items.map(item => ({ item, key: keyOf(item.row, column, isNumber) }));
  keyed.sort((a, b) => (down ? compare(b.key, a.key) : compare(a.key, b.key)) || a.item.place - b.item.place);
  items.splice(0, items.length, ...keyed.map(({ item }) => item));
  arrange();
};

/** Puts the rows in their order; groups.js puts them under the lines of their groups. */
const arrange = () => {
  table.tBodies[0].append(...items.map(item => item.row));
  arrangeGroups();
};

// Counts

const classOf = { Clash: 'clash', Contact: 'contact', Clearance: 'clearance' };
const mostWords = 12;

const byCount = words => {
  const counts = new Map();
  for (const word of words) counts.set(word, (counts.get(word) || 0) + 1);
  return [...counts].sort((a, b) => b[1] - a[1]);
};

const showMatrix = () => {
  const matrix = document.getElementById('matrix');
  if (!matrix) return;
  const live = items.filter(item => item.change !== 'resolved' && item.change !== 'not comparable');
  const types = byCount(live.map(item => item.type)).slice(0, mostWords);
  const statuses = byCount(live.map(statusOf)).slice(0, mostWords);
  const counts = new Map();
  for (const item of live) {
    const key = JSON.stringify([item.type, statusOf(item)]);
    counts.set(key, (counts.get(key) || 0) + 1);
  }
  const cell = (count, type, status, name) => {
    const { type: chosenType, status: chosenStatus } = form.elements;
    const isChosen = chosenType.value === type && chosenStatus.value === status && (type || status);
    const choose = () => {
      chosenType.value = isChosen ? '' : type;
      chosenStatus.value = isChosen ? '' : status;
      form.dispatchEvent(new Event('input'));
      [...matrix.querySelectorAll('button')].find(b => b.dataset.name === name)?.focus();
    };
    const field = button(count, choose, { 'aria-label': `${count}: ${name}`, 'aria-pressed': String(!!isChosen), 'data-name': name });
    return make('td', { className: 'number' + (type && status ? '' : ' all') }, count ? field : make('span', { className: 'none' }, '0'));
  };
  const shortened = word => make('bdi', {}, word.length > 120 ? word.slice(0, 120) + '…' : word);
  matrix.tHead.rows[0].replaceChildren(make('th', { scope: 'col' }, 'Type'),
    ...statuses.map(([word]) => make('th', { scope: 'col', className: 'number' }, shortened(word))),
    make('th', { scope: 'col', className: 'number' }, 'All'));
  matrix.tBodies[0].replaceChildren(...types.map(([type, all]) => make('tr', {},
    make('th', { scope: 'row' }, make('span', { className: 'dot ' + (classOf[type] || 'other') }), shortened(type)),
    ...statuses.map(([status]) => cell(counts.get(JSON.stringify([type, status])) || 0, type, status, `${type}, ${status}`)),
    cell(all, type, '', `${type}, every status`))));
  matrix.tFoot.rows[0].replaceChildren(make('th', { scope: 'row' }, 'All'),
    ...statuses.map(([status, all]) => cell(all, '', status, `Every type, ${status}`)),
    cell(live.length, '', '', 'Everything'));
};

const startTable = () => {
  offer(form.elements.type, items.map(item => item.type));
  const offerStatuses = () => offer(form.elements.status, items.map(statusOf));
  offerStatuses();
  if (form.elements.change) offer(form.elements.change, items.map(item => item.change));
  form.addEventListener('input', () => { filter(); showMatrix(); });
  form.addEventListener('submit', event => event.preventDefault());
  form.hidden = false;
  listeners.decided.push(changed => {
    for (const item of changed) item.text = '';
    offerStatuses();
    filter();
    showMatrix();
  });
  Array.from(table.tHead.rows[0].cells).forEach((header, column) => {
    if (header.classList.contains('plain')) return;
    const name = header.textContent;
    header.replaceChildren(button(name, () => sort(header, column)));
  });
  showMatrix();
  filter();
};
