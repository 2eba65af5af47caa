// So many blocks have their place at a time; buttons lead to those before and after. They come in
// groups that are drawn when they come near the view, and emptied when they are far from it.
const WINDOW = 5000, ROWS_OF_GROUP = 60, CARDS_OF_GROUP = 8;
const main = document.querySelector('main');
const blocks = document.getElementById('blocks');
let windowStart = 0;
let groups = new Map(); // element -> {from, to, kind, drawn}
let here = null;        // the block that the page has jumped to last
let landing = null;     // the same until somebody scrolls

const observer = new IntersectionObserver(entries => {
  for (const {target, isIntersecting, boundingClientRect} of entries) {
    const group = groups.get(target);
    if (!group)
      continue;
    if (isIntersecting)
      drawGroup(target, group);
    else if (group.drawn && !target.contains(document.activeElement))
      emptyGroup(target, group, boundingClientRect.height);
  }
}, {rootMargin: '900px 0px'});

// How many cards fit beside each other, and their widths; measured when the width changes.
const room = {};
function measure() {
  const rem = parseFloat(getComputedStyle(document.documentElement).fontSize);
  room.rem = rem;
  room.wide = blocks.clientWidth;
  room.high = innerHeight;
  room.fit = Math.max(1, Math.floor((room.wide + rem) / (27 * rem)));
  room.narrow = (room.wide - (room.fit - 1) * rem) / room.fit;
}

/** About how high a card is before it is drawn. */
function cardHeight(id, look) {
  const line = 26;
  if (look === 'curve')
    return 460;
  if (columnsOf(id) > 0)
    return 190 + Math.min(rowsOf(id) * line, room.high * 0.75);
  return 100 + Math.min(Math.ceil(rowsOf(id) / 10) * line, room.high * 0.75);
}

function groupHeight({from, to, kind}) {
  if (kind.look === 'row')
    return (to - from) * 48;
  const {fit} = room;
  let height = 0, line = 0, inLine = 0;
  for (let i = from; i < to; ++i) {
    const high = cardHeight(hits[i], kind.look) + 16;
    if (isWide(hits[i]) || inLine === fit) {
      height += line;
      line = inLine = 0;
    }
    line = Math.max(line, high);
    inLine = isWide(hits[i]) ? fit : inLine + 1;
  }
  return height + line;
}

function setGap(element, {kind}, height) {
  if (kind.look === 'row')
    element.replaceChildren(make('tr', {class: 'gap'},
                                 make('td', {colspan: 4, style: `height: ${height}px`})));
  else
    element.replaceChildren();
  element.style.minHeight = kind.look === 'row' ? '' : height + 'px';
}

function drawGroup(element, group) {
  if (group.drawn)
    return;
  group.drawn = true;
  const {narrow, wide, rem} = room;
  const inner = width => Math.max(220, Math.floor(width - 2 * rem - 2));
  const parts = [];
  for (let i = group.from; i < group.to; ++i) {
    const id = hits[i];
    parts.push(group.kind.look === 'row' ? rowOf(id) :
      cardOf(id, group.kind.look, inner(isWide(id) ? wide : narrow)));
  }
  const hadFocus = element.contains(document.activeElement);
  element.style.minHeight = '';
  element.replaceChildren(...parts);
  if (!valuesOf(hits[group.to - 1]))
    unfinished.add(element);
  const mark = here === null ? null : element.querySelector('#b' + here);
  mark?.classList.add('here');
  if (hadFocus)
    mark?.querySelector('[tabindex]').focus({preventScroll: true});
  if (landing !== null)
    land();
}

function emptyGroup(element, group, height) {
  group.drawn = false;
  setGap(element, group, height);
}

// Groups that were drawn before the browser had read their values.
const unfinished = new Set();
function finish() {
  for (const element of [...unfinished]) {
    const group = groups.get(element);
    if (group?.drawn && !valuesOf(hits[group.to - 1]))
      continue;
    unfinished.delete(element);
    if (group?.drawn) {
      group.drawn = false;
      drawGroup(element, group);
    }
  }
  if (document.readyState === 'loading')
    setTimeout(finish, 100);
}
document.addEventListener('readystatechange', finish);

function sectionOf(kind, from, to) {
  const body = kind.look === 'row' ? make('table', {}, make('thead', {}, make('tr', {},
    ...['Name', 'Value', 'Unit', 'Function'].map(title => make('th', {scope: 'col'}, title))))) :
    make('div');
  const step = kind.look === 'row' ? ROWS_OF_GROUP : CARDS_OF_GROUP;
  for (let at = from; at < to; at += step) {
    const group = {from: at, to: Math.min(at + step, to), kind, drawn: false};
    const element = kind.look === 'row' ? make('tbody') : make('div', {class: 'cards'});
    setGap(element, group, groupHeight(group));
    groups.set(element, group);
    body.append(element);
    observer.observe(element);
  }
  return make('section', {id: kind.keyword}, make('h2', {}, kind.keyword),
              kind.look === 'row' ? make('div', {class: 'values'}, body) : body);
}

/** Gives places to the hits from the one at `start` on. */
function showFrom(start) {
  observer.disconnect();
  groups = new Map();
  unfinished.clear();
  landing = null;
  hideTip();
  windowStart = Math.max(0, Math.min(start, hits.length - 1));
  const end = Math.min(windowStart + WINDOW, hits.length);
  const sections = [];
  if (windowStart > 0)
    sections.push(button(`${many(windowStart)} blocks before these`, () => {
      const last = hits[windowStart - 1];
      showFrom(windowStart - WINDOW);
      jump(last);
    }, {class: 'more'}));
  for (const kind of kinds) {
    const from = Math.max(kind.from, windowStart), to = Math.min(kind.to, end);
    if (from < to)
      sections.push(sectionOf(kind, from, to));
  }
  if (end < hits.length)
    sections.push(button(`${many(hits.length - end)} blocks after these`, () => {
      showFrom(end);
      jump(hits[end]);
    }, {class: 'more'}));
  blocks.replaceChildren(...sections);
}

// While somebody is typing, the index alone follows each key.
const PAUSE = 120; // ms
let timer = 0;
function showSoon() {
  clearTimeout(timer);
  timer = setTimeout(showNow, PAUSE);
}
function showNow() {
  if (timer === 0)
    return;
  clearTimeout(timer);
  timer = 0;
  showFrom(0);
}

function land() {
  document.getElementById('b' + landing)?.scrollIntoView({block: 'start'});
}

/** Scrolls to a block, wherever it is, and puts the focus there. */
function jump(id) {
  let place = lowerBound(hits, id);
  if (hits[place] !== id) {
    search.value = '';
    if (model.change)
      choose('all');
    else
      find();
    place = lowerBound(hits, id);
  }
  showNow();
  if (place < windowStart || place >= windowStart + WINDOW)
    showFrom(Math.max(0, place - ROWS_OF_GROUP));
  document.querySelector('.here')?.classList.remove('here');
  here = landing = id;
  for (const [element, group] of groups)
    if (group.from <= place && place < group.to)
      drawGroup(element, group);
  const element = document.getElementById('b' + id);
  element.classList.add('here');
  element.querySelector('[tabindex]').focus({preventScroll: true});
  land();
  closeIndex();
}

function jumpToHash() {
  const id = /^#b(\d+)$/.exec(location.hash)?.[1];
  if (id !== undefined && id < count)
    jump(+id);
}

for (const event of ['wheel', 'touchmove', 'pointerdown', 'keydown'])
  addEventListener(event, () => { landing = null; }, {passive: true});
addEventListener('hashchange', jumpToHash);
document.addEventListener('click', event => {
  const link = event.target.closest?.('a[href^="#b"]');
  if (link && link.hash === location.hash)
    jumpToHash();
});

new ResizeObserver(() => {
  if (blocks.clientWidth === room.wide)
    return;
  measure();
  for (const [element, group] of groups)
    if (group.drawn) {
      group.drawn = false;
      drawGroup(element, group);
    }
}).observe(blocks);
addEventListener('beforeprint', () => {
  for (const [element, group] of groups)
    drawGroup(element, group);
});
