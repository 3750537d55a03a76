// What every part of the page's script uses. The files of this folder are one script, in the order that the build names.

const data = JSON.parse(document.getElementById('zor-data')?.textContent || '{}');
const table = document.getElementById('interferences');

/** A new element: make('a', { href: '#x', onclick: … }, 'text', child…). Texts never become markup. */
const make = (name, properties = {}, ...children) => {
  const element = document.createElement(name);
  for (const [key, value] of Object.entries(properties)) {
    if (key in element) element[key] = value;
    else element.setAttribute(key, value);
  }
  element.append(...children);
  return element;
};

const button = (text, onclick, properties = {}) => make('button', { type: 'button', onclick, ...properties }, text);

const counted = (count, thing) => `${count} ${thing}${count === 1 ? '' : 's'}`;

/** Told to screen readers, and shown for a moment. */
const say = (() => {
  const place = make('p', { className: 'said', role: 'status' });
  let timer = 0;
  document.body.append(place);
  return text => {
    place.textContent = text;
    place.classList.add('new');
    clearTimeout(timer);
    timer = setTimeout(() => place.classList.remove('new'), 4000);
  };
})();

/** Those who are told when decisions or what is shown change. */
const listeners = { decided: [], filtered: [] };
const tell = (event, ...what) => listeners[event].forEach(listener => listener(...what));

/** A dialog that answers which of its buttons was pressed; null when it was closed. */
const ask = (title, content, answers) => new Promise(resolve => {
  const dialog = make('dialog', { className: 'question', 'aria-label': title });
  const menu = make('menu');
  let answer = null;
  for (const [value, text] of Object.entries(answers)) {
    menu.append(button(text, () => { answer = value; dialog.close(); }, { className: menu.children.length ? '' : 'primary' }));
  }
  dialog.append(make('h2', {}, title), ...[].concat(content), menu);
  dialog.addEventListener('close', () => { dialog.remove(); resolve(answer); });
  document.body.append(dialog);
  dialog.showModal();
});

/** Hands a file to the browser's downloads. */
const download = (name, bytes, type) => {
  const url = URL.createObjectURL(new Blob([bytes], { type }));
  const link = make('a', { href: url, download: name });
  link.click();
  setTimeout(() => URL.revokeObjectURL(url), 60000);
};
