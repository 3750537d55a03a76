// The map of the model: links to what is shown, the current one marked.

const startMap = () => {
  const links = Array.from(document.querySelectorAll('.map a'));
  if (!links.length) return;
  const show = () => {
    for (const link of links) link.classList.toggle('hidden', !!itemAt(link)?.isHidden);
  };
  listeners.filtered.push(show);
  for (const link of links) {
    link.append(Object.assign(document.createElementNS('http://www.w3.org/2000/svg', 'title'), { textContent: link.getAttribute('aria-label') }));
    link.addEventListener('click', () => setCurrent(itemAt(link), false));
  }
};

const markOnMap = item => {
  document.querySelector('.map a.current')?.classList.remove('current');
  const link = item && document.querySelector(`.map a[data-n="${CSS.escape(item.n)}"]`);
  if (!link) return;
  link.classList.add('current');
  link.parentNode.append(link);  // above its neighbours
};
