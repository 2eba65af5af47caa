'use strict';
// The page's model is JSON in script elements: one with what the index shows, and after this script
// some with the values of the blocks. Texts of the file reach the document as text alone.

const model = JSON.parse(document.getElementById('model').textContent);
const {kinds, texts, name, langname} = model;
const count = name.length;
const text = (column, id) => texts[model[column][id]];
const columnsOf = id => model.columns[id];
const rowsOf = id => model.rows[id];
const CHANGES = ['same', 'changed', 'added', 'removed'];
const changeOf = id => model.change ? model.change[id] : 0;

let first = 0;
for (const kind of kinds) {
  kind.first = first;
  first += kind.count;
}
const kindOf = id => kinds.findLast(kind => kind.first <= id);

const chunks = document.getElementsByClassName('chunk');
const parsed = new Map();
const KEPT_CHUNKS = 24;

/** The values of a block: w, x and y as far as it has them; null while the page is loading. */
function valuesOf(id) {
  let low = 0, high = chunks.length;
  while (low + 1 < high) {
    const middle = (low + high) >> 1;
    if (+chunks[middle].dataset.first <= id)
      low = middle;
    else
      high = middle;
  }
  const chunk = chunks[low];
  // The last one may not be whole while the browser is still reading the page.
  if (!chunk || (low + 1 === chunks.length && document.readyState === 'loading'))
    return null;
  if (!parsed.has(low)) {
    if (parsed.size >= KEPT_CHUNKS)
      parsed.delete(parsed.keys().next().value);
    parsed.set(low, JSON.parse(chunk.textContent));
  }
  return parsed.get(low)[id - chunk.dataset.first];
}

// A value is a number, a text, null for none or false for not-a-number.
const number = value => typeof value === 'number' ? value : NaN;
const isText = value => typeof value === 'string';
const isInfinite = value => value === Infinity || value === -Infinity;

/** The shortest digits that read back as the same number, a text as it is. */
function shown(value) {
  if (value === undefined || value === null)
    return '–';
  if (value === false)
    return 'not a number';
  if (isInfinite(value))
    return value > 0 ? '∞' : '−∞';
  return Object.is(value, -0) ? '-0' : String(value);
}

/** The difference of two numbers without the digits that subtracting has made up. */
function difference(from, to) {
  if (Number.isNaN(number(from)) || Number.isNaN(number(to)))
    return null;
  if (from === to) // two infinities too
    return 0;
  return Number((to - from).toPrecision(12));
}

function shownDifference(value) {
  return value > 0 ? '+' + shown(value) : shown(value);
}

const withUnit = (value, unit) => unit ? `${value} ${unit}` : value;
const titled = (title, unit) => unit ? `${title} [${unit}]` : title;
const many = n => n.toLocaleString('en');
