/** Where the points of one axis are in another: an index for each, -1 for none. */
function placesOf(points, others) {
  const places = new Map(others.map((point, i) => [point, i]));
  return points.map((point, i) => others[i] === point ? i : places.get(point) ?? -1);
}

/** The difference of two maps, at the points that both have. */
function mapDifference(map, other) {
  const {id, columns, x, y, w} = map;
  const indices = n => Array.from({length: n}, (_, i) => i);
  const rows = Math.max(Math.ceil(w.length / columns), y.length);
  const inX = x.length ? placesOf(x, other.x) : indices(columns);
  const inY = y.length ? placesOf(y, other.y) : indices(rows);
  const otherAt = (row, column) => inX[column] < 0 || inY[row] < 0 || inX[column] >= other.columns ?
    undefined : other.w[inY[row] * other.columns + inX[column]];
  const all = [];
  for (let i = 0; i < w.length; ++i)
    all.push(difference(w[i], otherAt(Math.floor(i / columns), i % columns)));
  const {low, high, empty} = rangeOf(all);
  const reach = Math.max(Math.abs(low), Math.abs(high));
  const range = {low: -reach, high: reach, empty};
  const table = grid({
    columns, rows, label: `${name[id]}, difference`, look: 'map diverging', corner: 'y \\ x',
    head: column => pointOrIndex(x, column), side: row => pointOrIndex(y, row),
    cell: (row, column) => {
      const i = row * columns + column;
      if (i >= w.length)
        return null;
      const to = otherAt(row, column), by = all[i];
      return {text: by === null && (isText(w[i]) || isText(to)) ? shown(to) : shownDifference(by),
        kind: Object.is(w[i], to) ? 'quiet' : '',
        share: Number.isFinite(by) ? shareOf(range, by) : undefined,
        tip: `${map.titleX} ${pointOrIndex(x, column)}\n${map.titleY} ${pointOrIndex(y, row)}\n` +
          `${withUnit(shown(w[i]), map.unit)} → ${withUnit(shown(to), other.unit)}`};
    },
  });
  return make('div', {}, table, colorLegend(range, map.unit, true));
}

const FIELDS = {langname: 'LANGNAME', displayname: 'DISPLAYNAME', function: 'FUNKTION',
  unit: 'EINHEIT_W', unitX: 'EINHEIT_X', unitY: 'EINHEIT_Y', axisX: 'distribution of x',
  axisY: 'distribution of y', x: 'points of x', y: 'points of y'};

/** What differs beside the values. */
function changedTexts(own, other) {
  const rows = Object.keys(FIELDS).filter(field => field in other);
  if (rows.length === 0)
    return '';
  const MOST = 24;
  const side = value => !Array.isArray(value) ? value || '–' :
    value.slice(0, MOST).map(shown).join(' ') + (value.length > MOST ? ' …' : '');
  return make('div', {class: 'scroll'}, make('table', {class: 'changes'}, make('thead', {},
    make('tr', {}, make('th', {scope: 'col'}, ''), make('th', {scope: 'col'}, model.title),
         make('th', {scope: 'col'}, model.other))),
    make('tbody', {}, ...rows.map(field => make('tr', {}, make('th', {scope: 'row'}, FIELDS[field]),
      make('td', {}, side(own[field])), make('td', {}, side(other[field])))))));
}

/** The rows of a list that differ. */
function listDifference(label, from, to, unit) {
  const places = [];
  for (let i = 0; i < Math.max(from.length, to.length); ++i)
    if (!Object.is(from[i], to[i]))
      places.push(i);
  const columns = [i => shown(from[i]), i => shown(to[i]),
                   i => shownDifference(difference(from[i], to[i]))];
  const heads = [model.title, model.other, 'difference'];
  return grid({columns: 3, rows: places.length, label, corner: '', head: column => heads[column],
    side: row => String(places[row]),
    cell: (row, column) => ({text: columns[column](places[row]),
      kind: column < 2 ? kindOfCell([from, to][column][places[row]]) : '',
      tip: `${places[row]}\n${withUnit(shown(from[places[row]]), unit)} → ` +
        withUnit(shown(to[places[row]]), unit)})});
}
