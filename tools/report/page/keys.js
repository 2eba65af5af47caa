const nav = document.querySelector('nav');
const toggle = document.getElementById('toggle');

// On a narrow screen the index is open while somebody searches only.
function openIndex() {
  nav.classList.add('open');
  toggle.setAttribute('aria-expanded', true);
}
function closeIndex() {
  nav.classList.remove('open');
  toggle.setAttribute('aria-expanded', false);
}
toggle.addEventListener('click', () =>
  nav.classList.contains('open') ? closeIndex() : openIndex());
search.addEventListener('focus', openIndex);
search.addEventListener('input', find);
list.addEventListener('scroll', () => requestAnimationFrame(() => drawIndex()));

search.addEventListener('keydown', event => {
  const step = {ArrowDown: 1, ArrowUp: -1}[event.key];
  if (step) {
    event.preventDefault();
    const next = nextRow(current + step, step);
    if (next >= 0)
      chooseRow(next);
  } else if (event.key === 'Enter') {
    const row = current >= 0 ? current : nextRow(0, 1);
    if (row < 0)
      return;
    const hash = '#b' + rowAt(rowsOfKinds(), row).id;
    if (location.hash === hash)
      jumpToHash();
    else
      location.hash = hash;
  }
});

addEventListener('keydown', event => {
  if (event.key === '/' && event.target !== search && !event.ctrlKey && !event.metaKey) {
    event.preventDefault();
    search.focus();
    search.select();
  } else if (event.key === 'Escape') {
    const tipWasShown = !tip.hidden;
    hideTip();
    if (event.target === search) {
      search.value = '';
      find();
    } else if (search.value && !tipWasShown) {
      search.value = '';
      find();
      if (here !== null)
        jump(here); // Other blocks take their places around it.
    }
    closeIndex();
  } else if (event.target.matches?.('.grid td')) {
    walk(event, event.target);
  }
});
