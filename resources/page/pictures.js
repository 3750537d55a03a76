// Pictures shown large.

/** A picture in the page itself as an address. */
const addressOf = link => {
  const reference = link.getAttribute('href');
  if (!reference.startsWith('#')) return link.href;
  return document.getElementById(reference.slice(1))?.querySelector('image')?.getAttribute('href') || '';
};

const large = (() => {
  const dialog = make('dialog', { className: 'large', 'aria-label': 'Picture' });
  const image = make('img');
  let current = null, all = [];
  const links = () => Array.from(document.querySelectorAll('a.zoom')).filter(link => !link.closest('[hidden]'));
  const show = link => {
    current = link;
    image.src = addressOf(link);
    image.alt = link.firstElementChild?.alt || link.firstElementChild?.getAttribute('aria-label') || '';
  };
  dialog.append(image);
  dialog.addEventListener('click', () => dialog.close());
  dialog.addEventListener('keydown', event => {
    const step = { ArrowRight: 1, ArrowLeft: -1 }[event.key];
    if (!step) return;
    if (!all.length) all = links();
    show(all[(all.indexOf(current) + step + all.length) % all.length]);
  });
  document.body.append(dialog);
  return link => { all = []; show(link); dialog.showModal(); };
})();

document.addEventListener('click', event => {
  const link = event.target.closest?.('a.zoom');
  if (!link || event.ctrlKey || event.metaKey || event.shiftKey || event.button) return;
  event.preventDefault();
  const item = itemAt(link);
  if (item && link.matches('.picture > a') && mayTurn(item)) openViewer(item);
  else large(link);
});
