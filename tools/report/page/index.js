// All rows are as high, so that only those in view are in the document. Browsers limit how high
// an element is: beyond that a pixel of the scroll bar stands for several rows' pixels.
const ROW_HEIGHT = 42, MOST_HEIGHT = 8e6;
const list = document.getElementById('list');
const rows = document.getElementById('rows');
let current = -1;   // the row that Enter jumps to
let listHeight = 0; // asking the browser for it again and again costs a layout each time

/** The rows: of each kind that has hits a heading, and its blocks unless it is folded. */
function rowsOfKinds() {
  let at = 0;
  const parts = [];
  for (const kind of kinds)
    if (kind.to > kind.from) {
      parts.push({kind, at});
      at += 1 + (kind.folded ? 0 : kind.to - kind.from);
    }
  return {parts, total: at};
}

/** What row `i` shows: {kind} or {id}. */
function rowAt({parts}, i) {
  const part = parts.findLast(one => one.at <= i);
  return i === part.at ? {kind: part.kind} : {id: hits[part.kind.from + i - part.at - 1]};
}

/** The text with the words of the search marked. */
function withMarks(whole) {
  const lower = whole.toLowerCase();
  if (!lastWords || lower.length !== whole.length)
    return [whole];
  const places = [];
  for (const word of words()) {
    const at = lower.indexOf(word);
    if (at >= 0)
      places.push([at, at + word.length]);
  }
  places.sort((a, b) => a[0] - b[0]);
  const pieces = [];
  let end = 0;
  for (const [from, to] of places)
    if (from >= end) {
      pieces.push(whole.slice(end, from), make('mark', {}, whole.slice(from, to)));
      end = to;
    }
  pieces.push(whole.slice(end));
  return pieces;
}

function indexRow(row, i) {
  if (row.kind) {
    const {kind} = row;
    const shownCount = kind.to - kind.from;
    return button('', () => {
      kind.folded = !kind.folded;
      drawIndex();
    }, {class: 'kind', 'aria-expanded': !kind.folded, tabindex: -1}).appendChild(
      make('span', {}, kind.keyword, make('small', {}, shownCount === kind.count ?
        many(kind.count) : `${many(shownCount)} of ${many(kind.count)}`))).parentElement;
  }
  const {id} = row;
  const info = [langname[id], text('displayname', id), text('function', id),
    [...new Set([text('unit', id), text('unitX', id), text('unitY', id)].filter(Boolean))]
      .map(unit => `[${unit}]`).join(' ')].filter(Boolean).join(' · ');
  return make('a', {href: '#b' + id, id: 'row' + i, role: 'option', tabindex: -1, title: name[id],
    'aria-selected': i === current, class: CHANGES[changeOf(id)]},
    make('span', {}, ...withMarks(name[id])), make('small', {}, ...withMarks(info)));
}

function drawIndex(scrolled = list.scrollTop) {
  const all = rowsOfKinds();
  const whole = all.total * ROW_HEIGHT;
  const height = Math.min(whole, MOST_HEIGHT);
  const view = listHeight;
  rows.style.height = height + 'px';
  const scale = height > view ? (whole - view) / (height - view) : 1;
  const top = Math.min(scrolled, Math.max(height - view, 0));
  const from = Math.max(Math.floor(top * scale / ROW_HEIGHT) - 4, 0);
  const to = Math.min(all.total, from + Math.ceil(view / ROW_HEIGHT) + 9);
  const drawn = make('div', {style: `top: ${top - top * scale + from * ROW_HEIGHT}px`});
  for (let i = from; i < to; ++i)
    drawn.append(indexRow(rowAt(all, i), i));
  rows.replaceChildren(drawn);
}

/** Makes row `i` the current one and scrolls it into view; -1 for none. */
function chooseRow(i) {
  current = i;
  if (i < 0) {
    search.removeAttribute('aria-activedescendant');
    return;
  }
  const view = listHeight, {total} = rowsOfKinds();
  const whole = total * ROW_HEIGHT, height = Math.min(whole, MOST_HEIGHT);
  const scale = height > view ? (whole - view) / (height - view) : 1;
  const top = list.scrollTop * scale;
  if (i * ROW_HEIGHT < top + ROW_HEIGHT)
    list.scrollTop = (i - 1) * ROW_HEIGHT / scale;
  else if ((i + 1) * ROW_HEIGHT > top + view)
    list.scrollTop = ((i + 1) * ROW_HEIGHT - view) / scale;
  search.setAttribute('aria-activedescendant', 'row' + i);
  drawIndex();
}

/** The next row from `i` on, by step, that is a block; -1 for none. */
function nextRow(i, step) {
  const all = rowsOfKinds();
  while (i >= 0 && i < all.total && rowAt(all, i).kind)
    i += step;
  return i >= 0 && i < all.total ? i : -1;
}

new ResizeObserver(() => {
  listHeight = list.clientHeight;
  drawIndex();
}).observe(list);
