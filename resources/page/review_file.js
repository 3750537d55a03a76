// Review files: decisions as JSON, for `lyra review apply`, for a colleague, and to be opened here again.

const reviewFormat = 'zorlyra-review/1';

const reviewText = () => {
  const entries = [];
  for (const [id, decision] of decisions) {
    const item = itemOfId.get(id);
    if (!item) continue;
    const entry = { id, index: Number(item.n) };
    if (decision.status !== undefined) {
      if (statuses.includes(item.base.status)) entry.baseStatus = item.base.status;
      entry.status = decision.status;
    }
    if (decision.comment !== undefined) entry.comment = decision.comment;
    entries.push({ ...entry, who: decision.who, when: decision.when });
  }
  entries.sort((a, b) => a.index - b.index);
  const result = { document: data.document || '', hash: data.hash || '' };
  return JSON.stringify({ format: reviewFormat, result, entries }, null, 1) + '\n';
};

const saveReview = () => {
  if (!decisions.size) return say('There is nothing to save: no decision differs from the result.');
  download('review.json', reviewText(), 'application/json');
  stored(storeKey + ' saved', JSON.stringify([...decisions]));
  tell('decided', []);
  say(`Saved as review.json: ${counted(decisions.size, 'decision')}.`);
};

const isSaved = () => stored(storeKey + ' saved') === JSON.stringify([...decisions]);

/** The decisions in a review file. Raises an Error that says what is wrong. */
const readReview = text => {
  let file;
  try { file = JSON.parse(text); } catch { throw new Error('it is no JSON'); }
  if (file?.format !== reviewFormat) throw new Error('it is no review file');
  if (!Array.isArray(file.entries)) throw new Error('it has no entries');
  const entries = [];
  for (const entry of file.entries) {
    if (typeof entry?.id !== 'string') throw new Error('an entry has no id');
    const decision = { who: String(entry.who ?? ''), when: String(entry.when ?? '') };
    if (entry.status != null) {
      const known = statuses.find(word => word.toLowerCase() === String(entry.status).replaceAll('-', ' ').toLowerCase());
      if (!known) throw new Error(`an entry has the unknown status "${String(entry.status).slice(0, 60)}"`);
      decision.status = known;
    }
    if (entry.comment != null) decision.comment = String(entry.comment);
    entries.push([entry.id, decision]);
  }
  return { isOfThisResult: !data.hash || !file.result?.hash || file.result.hash === data.hash, entries };
};

const differs = (mine, theirs, what) => mine[what] !== undefined && theirs[what] !== undefined && mine[what] !== theirs[what];

/** Takes in the decisions of a file. Where both decided, and differently, the reader chooses. */
const openReview = async (name, text) => {
  let review;
  try { review = readReview(text); } catch (error) {
    await ask('The file cannot be opened', make('p', {}, `${name}: ${error.message}.`), { ok: 'OK' });
    return;
  }
  const known = review.entries.filter(([id]) => itemOfId.has(id) && mayDecide(itemOfId.get(id)));
  const conflicts = known.filter(([id, theirs]) => {
    const mine = decisions.get(id);
    return mine && (differs(mine, theirs, 'status') || differs(mine, theirs, 'comment'));
  });
  let prefersTheirs = false;
  if (conflicts.length) {
    const list = make('ul', { className: 'conflicts' }, ...conflicts.slice(0, 50).map(([id, theirs]) => {
      const mine = decisions.get(id), item = itemOfId.get(id);
      const words = d => [d.status, d.comment && `“${d.comment.slice(0, 80)}”`].filter(Boolean).join(', ');
      return make('li', {}, make('strong', {}, item.n), make('bdi', {}, ` here ${words(mine)}${mine.who ? ` (${mine.who})` : ''}; in the file ${words(theirs)}${theirs.who ? ` (${theirs.who})` : ''}`));
    }));
    const answer = await ask('Both decided, and differently',
      [make('p', {}, `${counted(conflicts.length, 'interference')} of ${known.length} in ${name}:`), list],
      { mine: 'Keep mine', theirs: 'Take theirs', cancel: 'Take nothing' });
    if (answer !== 'mine' && answer !== 'theirs') return;
    prefersTheirs = answer === 'theirs';
  }
  const before = [];
  for (const [id, theirs] of known) {
    const item = itemOfId.get(id), mine = decisions.get(id);
    const merged = prefersTheirs || !mine ? { ...mine, ...theirs } : { ...theirs, ...mine };
    before.push([item, mine]);
    put(item, reduced(item, merged));
  }
  if (before.length) undone.push(before);
  keep();
  tell('decided', before.map(([item]) => item));
  const unknown = review.entries.length - known.length;
  say(`${name}: ${counted(known.length, 'decision')} taken in` + (unknown ? `, ${unknown} on other interferences left out` : '') +
    (review.isOfThisResult ? '.' : '. It was made of another state of the result.'));
};

const chooseReview = () => {
  const chooser = make('input', { type: 'file', accept: '.json,application/json', className: 'sr', 'aria-label': 'Review file', tabIndex: -1 });
  chooser.addEventListener('change', async () => {
    const [file] = chooser.files;
    if (file) await openReview(file.name, await file.text());
    chooser.remove();
  });
  chooser.addEventListener('cancel', () => chooser.remove());
  document.body.append(chooser);
  chooser.click();
};
