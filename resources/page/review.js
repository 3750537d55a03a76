// Decisions: what the reader makes of each interference. They are kept in the browser, and leave the page as a file.

const statuses = ['Relevant', 'Irrelevant', 'Not inspected'];

/** Of each stable id what differs from the result: {status?, comment?, who, when}. */
const decisions = new Map();
const undone = [];  // former states, the last one first to be undone
const storeKey = 'zorlyra-review/1 ' + (data.hash || location.pathname);

const statusOf = item => decisions.get(item.id)?.status ?? item.base.status;
const commentNow = item => decisions.get(item.id)?.comment ?? commentOf(item);
/** What is resolved, or could not be compared, is another result's to decide. */
const mayDecide = item => !!item.id && item.change !== 'resolved' && item.change !== 'not comparable';

const stored = (key, value) => {
  try {
    if (value === undefined) return localStorage.getItem(key);
    localStorage.setItem(key, value);
    return true;
  } catch {
    return value === undefined ? null : false;
  }
};

const reviewer = () => stored('zorlyra-reviewer') || '';

const keep = () => {
  if (!stored(storeKey, JSON.stringify([...decisions]))) say('The browser keeps nothing of a page like this: save the review before you leave.');
};

/** Other windows may show the same result: theirs is taken over as it is made. */
const takeKept = text => {
  let kept;
  try { kept = JSON.parse(text || '[]'); } catch { return; }
  if (!Array.isArray(kept)) return;
  const before = new Set(decisions.keys());
  decisions.clear();
  for (const entry of kept) {
    if (!Array.isArray(entry) || !itemOfId.has(entry[0]) || typeof entry[1] !== 'object' || !entry[1]) continue;
    const { status, comment, who, when } = entry[1];
    const decision = { who: String(who || ''), when: String(when || '') };
    if (statuses.includes(status)) decision.status = status;
    if (typeof comment === 'string') decision.comment = comment;
    decisions.set(entry[0], decision);
    before.add(entry[0]);
  }
  return [...before].map(id => itemOfId.get(id)).filter(Boolean);
};

/** Without what says the same as the result; undefined when nothing is left. */
const reduced = (item, decision) => {
  const { status, comment, ...rest } = decision;
  const left = { ...rest };
  if (status !== undefined && status !== item.base.status) left.status = status;
  if (comment !== undefined && comment !== commentOf(item)) left.comment = comment;
  return left.status === undefined && left.comment === undefined ? undefined : left;
};

const put = (item, decision) => decision ? decisions.set(item.id, decision) : decisions.delete(item.id);

/** Decides on some: each change is {status} or {comment} or both. One step to undo. */
const decide = (some, change) => {
  const open = some.filter(mayDecide);
  const before = [];
  const now = new Date().toISOString().replace(/\.\d+Z$/, 'Z');
  for (const item of open) {
    const old = decisions.get(item.id);
    const decision = reduced(item, { ...old, ...change, who: reviewer(), when: now });
    if (decision?.status === old?.status && decision?.comment === old?.comment) continue;
    before.push([item, old]);
    put(item, decision);
  }
  if (!before.length) return;
  undone.push(before);
  keep();
  tell('decided', before.map(([item]) => item));
};

const undo = () => {
  const step = undone.pop();
  if (!step) return say('There is nothing to undo.');
  for (const [item, old] of step) put(item, old);
  keep();
  tell('decided', step.map(([item]) => item));
  say(`Undone: ${counted(step.length, 'interference')}.`);
};

// What shows them

const statusClass = { Relevant: 'relevant', Irrelevant: 'irrelevant', 'Not inspected': 'open' };

const statusField = item => {
  const field = make('select', { className: 'decide', 'aria-label': `Status of ${item.n}` });
  field.addEventListener('change', () => decide(withSelected(item), { status: field.value }));
  return field;
};

const fillStatusField = (field, item) => {
  const words = statuses.includes(item.base.status) ? statuses : [item.base.status, ...statuses];
  if (field.options.length !== words.length) field.replaceChildren(...words.map(word => new Option(word.slice(0, 60), word)));
  field.value = statusOf(item);
  field.className = 'decide ' + (statusClass[field.value] || 'other');
};

const commentField = (item, rows) => {
  const field = make('textarea', { rows, className: 'decide field', 'aria-label': `Comment on ${item.n}`, placeholder: 'Comment' });
  field.addEventListener('change', () => decide([item], { comment: field.value }));
  field.addEventListener('keydown', event => {
    if (event.key === 'Escape' || (event.key === 'Enter' && (event.ctrlKey || event.metaKey))) field.blur();
  });
  return field;
};

const shortComment = text => text.length > 120 ? text.slice(0, 120) + '…' : text;

const startReview = () => {
  for (const item of items) item.base.status = data.statuses?.[item.n] ?? item.base.status;
  takeKept(stored(storeKey));

  whenNear((item, isRow) => {
    if (!mayDecide(item)) return;
    if (isRow) {
      const cell = item.row.querySelector('td.status');
      const field = statusField(item);
      cell.replaceChildren(field);
      item.rowField = field;
    } else {
      const place = make('div', { className: 'settle decide' });
      item.fields = { status: statusField(item), comment: commentField(item, 2) };
      place.append(item.fields.status, item.fields.comment);
      item.section.querySelector('.details').append(place);
      item.section.querySelector('h2 .status')?.classList.add('decided');
    }
    show(item);
  });

  const show = item => {
    const decision = decisions.get(item.id);
    item.row.classList.toggle('changed', !!decision);
    item.row.dataset.status = statusOf(item);
    const status = statusOf(item), comment = commentNow(item);
    if (item.rowField) fillStatusField(item.rowField, item);
    else if (item.row.querySelector('td.status bdi')) item.row.querySelector('td.status bdi').textContent = status.slice(0, 120);
    if (decision?.comment !== undefined || item.hadComment) {
      item.hadComment = true;
      item.row.querySelector('td.comment').replaceChildren(make('bdi', {}, shortComment(comment)));
      if (comment) table.classList.remove('no-comment');
      showQuote(item, comment);
    }
    const heading = item.section?.querySelector('h2 .status bdi');
    if (heading) heading.textContent = status;
    for (const fields of [item.fields, item === viewed() ? viewerFields() : null]) {
      if (!fields) continue;
      fillStatusField(fields.status, item);
      if (document.activeElement !== fields.comment) fields.comment.value = comment;
    }
  };
  const showQuote = (item, comment) => {
    let quote = item.section?.querySelector('blockquote');
    if (!quote && item.section) {
      quote = make('blockquote', {}, make('bdi'));
      item.section.querySelector('.details').append(quote);
    }
    if (!quote) return;
    quote.firstElementChild.textContent = comment;
    quote.hidden = !comment;
  };

  listeners.decided.push(changed => changed.forEach(show));
  for (const id of decisions.keys()) show(itemOfId.get(id));
  addEventListener('storage', event => {
    if (event.key !== storeKey) return;
    undone.length = 0;
    const changed = takeKept(event.newValue);
    if (changed) tell('decided', changed);
    say('Decisions of another window were taken over.');
  });
};
