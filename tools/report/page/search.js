const search = document.getElementById('search');
const counter = document.getElementById('count');
const everything = Int32Array.from({length: count}, (_, id) => id);
let haystack = null;
let lastWords = '';
let found = everything; // by words alone
let hits = everything;  // of these, the ones with the chosen changes
let chosen = model.change ? 'differences' : 'all';

function makeHaystack() {
  haystack = new Array(count);
  const lower = texts.map(one => one.toLowerCase());
  const {displayname, unit, unitX, unitY} = model;
  for (let id = 0; id < count; ++id)
    haystack[id] = `${name[id]}\n${langname[id]}`.toLowerCase() + '\n' + lower[displayname[id]] +
      '\n' + lower[model.function[id]] + '\n' + lower[unit[id]] + '\n' + lower[unitX[id]] + '\n' +
      lower[unitY[id]];
}

const words = () => lastWords.split(/\s+/).filter(Boolean);

function find() {
  const query = search.value.toLowerCase().trim();
  if (list.scrollTop > 0) // before anything changes: asking later costs a layout
    list.scrollTop = 0;
  if (!haystack && query)
    makeHaystack();
  if (query !== lastWords || found === everything) {
    // A longer query finds among what the shorter one has found.
    const among = lastWords && query.startsWith(lastWords) ? found : everything;
    lastWords = query;
    const all = words();
    found = all.length === 0 ? everything :
      among.filter(id => all.every(word => haystack[id].includes(word)));
  }
  hits = !model.change || chosen === 'all' ? found :
    found.filter(id => chosen === 'differences' ? model.change[id] > 0 :
      CHANGES[model.change[id]] === chosen);
  for (const kind of kinds) {
    kind.from = lowerBound(hits, kind.first);
    kind.to = lowerBound(hits, kind.first + kind.count);
  }
  counter.textContent = hits.length === count ? `${many(count)} blocks` :
    hits.length === 0 ? 'Nothing found.' : `${many(hits.length)} of ${many(count)} blocks`;
  chooseRow(-1);
  drawIndex(0);
  showSoon();
}

function lowerBound(sorted, value) {
  let low = 0, high = sorted.length;
  while (low < high) {
    const middle = (low + high) >> 1;
    if (sorted[middle] < value)
      low = middle + 1;
    else
      high = middle;
  }
  return low;
}
