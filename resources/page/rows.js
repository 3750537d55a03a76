// The interferences: a row of the table and a section each.

/** @typedef {{row, section, n: string, id: string, place: number, type, base: {status, comment}, text}} Item */
const items = table ? Array.from(table.tBodies[0].rows, (row, place) => ({
  row, place,
  n: row.dataset.n, id: row.dataset.id, type: row.dataset.type, change: row.dataset.change || '',
  section: document.getElementById('i' + row.dataset.n),
  text: '',
  base: { status: row.dataset.status },
})) : [];
const itemOfNumber = new Map(items.map(item => [item.n, item]));
const itemOfId = new Map(items.map(item => [item.id, item]));
const itemAt = node => {
  const place = node.closest('[data-n]');
  return place && itemOfNumber.get(place.dataset.n);
};

/** Of thousands, sections and pictures are text that is read only where they are seen. */
const putIn = place => {
  for (const later of place.querySelectorAll('noscript.later'))
    later.replaceWith(...new DOMParser().parseFromString(later.textContent, 'text/html').body.childNodes);
};

/** The whole comment is in the section; a row has its beginning. */
const commentOf = item => {
  if (item.base.comment === undefined && item.section) putIn(item.section);
  item.base.comment ??= item.section?.querySelector('blockquote bdi')?.textContent ?? '';
  return item.base.comment;
};

// What is seen of thousands of rows and sections is made ready when it comes near.
const readers = [];
const whenNear = reader => readers.push(reader);
const makeReady = place => {
  if (place.dataset.ready) return;
  place.dataset.ready = '1';
  const item = itemAt(place);
  putIn(place);
  for (const reader of readers) reader(item, place === item.row);
};
const watchRows = () => {
  addEventListener('beforeprint', () => putIn(document));
  const near = new IntersectionObserver(entries => {
    for (const { isIntersecting, target } of entries) {
      if (!isIntersecting) continue;
      near.unobserve(target);
      makeReady(target);
    }
  }, { rootMargin: '100%' });
  for (const { row, section } of items) {
    near.observe(row);
    if (section) near.observe(section);
  }
};
