const MOST_CELLS = 4000, MOST_COLUMNS = 200;

/**
 * A table of rows and columns with a head for each. `cell` says what is at a row and column:
 * {text, share, tip, kind}. `look` is its class. Large ones are cut; a button shows more.
 */
function grid(content, most = MOST_CELLS) {
  const {columns, rows, head, side, corner, cell, label, look = ''} = content;
  const wide = Math.min(columns, Math.max(MOST_COLUMNS, Math.floor(most / Math.max(rows, 1))));
  const high = Math.min(rows, Math.max(1, Math.floor(most / Math.max(wide, 1))));
  const body = make('tbody');
  for (let row = 0; row < high; ++row) {
    const line = body.appendChild(make('tr', {}, make('th', {scope: 'row'}, side(row))));
    for (let column = 0; column < wide; ++column) {
      const found = cell(row, column);
      if (!found)
        break;
      const element = line.appendChild(make('td', {tabindex: row || column ? -1 : 0}, found.text));
      if (found.kind)
        element.className = found.kind;
      if (found.share !== undefined)
        element.style.setProperty('--t', found.share.toFixed(3));
    }
  }
  const table = make('table', {class: 'grid ' + look, 'aria-label': label}, body);
  if (head) {
    const top = make('tr', {}, make('th', {scope: 'col'}, corner));
    for (let column = 0; column < wide; ++column)
      top.append(make('th', {scope: 'col', class: rows && cell(0, column)?.kind || ''}, head(column)));
    table.prepend(make('thead', {}, top));
  }
  table.tipOf = (row, column) => cell(row, column)?.tip;
  const box = make('div', {class: 'scroll'}, table);
  if (wide < columns || high < rows)
    box.append(button(`Show more: these are ${many(wide)} of ${many(columns)} columns and ` +
                      `${many(high)} of ${many(rows)} rows`,
                      () => box.replaceWith(grid(content, most * 8))));
  return box;
}

function tipOfCell(cell, left, top, again) {
  hideTip();
  const table = cell.closest('table');
  const row = cell.parentElement.sectionRowIndex;
  const lines = table.tipOf(row, cell.cellIndex - 1);
  marked = [cell.parentElement.cells[0], table.tHead?.rows[0].cells[cell.cellIndex]].filter(Boolean);
  for (const header of marked)
    header.classList.add('on');
  if (lines)
    showTip(lines, left, top, again);
}

function tipAtCell(cell) {
  const box = cell.getBoundingClientRect();
  tipOfCell(cell, box.left, box.top, () => tipAtCell(cell));
}

addEventListener('pointermove', event => {
  const cell = event.target.closest?.('.grid td');
  if (cell)
    tipOfCell(cell, event.clientX, event.clientY);
  else if (!event.target.closest?.('svg'))
    hideTip();
});
addEventListener('focusin', event => {
  const cell = event.target.closest?.('.grid td');
  if (cell)
    tipAtCell(cell);
});
addEventListener('focusout', hideTip);
addEventListener('pointerdown', event => {
  const cell = event.target.closest?.('.grid td');
  if (cell)
    walkTo(cell);
});

function walkTo(cell) {
  for (const other of cell.closest('table').querySelectorAll('td[tabindex="0"]'))
    other.tabIndex = -1;
  cell.tabIndex = 0;
  cell.focus({preventScroll: true});
  cell.scrollIntoView({block: 'nearest', inline: 'nearest'});
  tipAtCell(cell);
}

/** The arrow keys, Home and End walk over the cells of a table. */
function walk(event, cell) {
  const rows = cell.closest('tbody').rows;
  const row = cell.parentElement.sectionRowIndex, column = cell.cellIndex;
  const to = {
    ArrowLeft: [row, column - 1], ArrowRight: [row, column + 1], ArrowUp: [row - 1, column],
    ArrowDown: [row + 1, column], Home: [row, 1], End: [row, rows[row].cells.length - 1],
  }[event.key];
  if (!to)
    return;
  event.preventDefault();
  const next = rows[to[0]]?.cells[to[1]];
  if (next?.tagName === 'TD')
    walkTo(next);
}

const kindOfCell = value => isText(value) ? 'text' : isInfinite(value) ? 'infinite' : '';

/** A list of values in rows of ten, each row with the number of its first. */
function listTable(label, values, unit) {
  const ROW = 10;
  return grid({
    columns: Math.min(ROW, values.length), rows: Math.ceil(values.length / ROW), label, corner: '',
    side: row => String(row * ROW),
    cell: (row, column) => {
      const i = row * ROW + column;
      return i < values.length && {text: shown(values[i]), kind: kindOfCell(values[i]),
        tip: `${i}\n${withUnit(shown(values[i]), unit)}`};
    },
  });
}

/** Rows of values over one head, as a curve has them: rows of [title, values, unit]. */
function rowsTable(label, rows) {
  return grid({
    columns: Math.max(...rows.map(([, values]) => values.length)), rows: rows.length, label,
    side: row => rows[row][0],
    cell: (row, column) => {
      const [, values, unit, look] = rows[row];
      return {text: (look || shown)(values[column]), kind: kindOfCell(values[column]),
        tip: rows.map(([title, list, its, its_look]) =>
          `${title} ${withUnit((its_look || shown)(list[column]), its)}`).join('\n')};
    },
  });
}

const pointOrIndex = (points, i) => points.length ? shown(points[i]) : String(i);

function colorLegend(range, unit, diverging) {
  if (range.empty)
    return '';
  return make('p', {class: 'legend'}, make('span', {}, shown(range.low)),
              make('span', {class: diverging ? 'ramp diverging' : 'ramp'}),
              make('span', {}, withUnit(shown(range.high), unit)));
}

/** A map as a table, its numbers coloured by size. */
function mapTable(map) {
  const {id, columns, x, y, w} = map;
  const range = rangeOf(w);
  const table = grid({
    columns, rows: Math.max(Math.ceil(w.length / columns), y.length), label: name[id], look: 'map',
    corner: 'y \\ x', head: column => pointOrIndex(x, column), side: row => pointOrIndex(y, row),
    cell: (row, column) => {
      const i = row * columns + column;
      return i < w.length && {text: shown(w[i]), kind: kindOfCell(w[i]),
        share: Number.isFinite(w[i]) ? shareOf(range, w[i]) : undefined,
        tip: `${map.titleX} ${pointOrIndex(x, column)}\n${map.titleY} ${pointOrIndex(y, row)}\n` +
          withUnit(shown(w[i]), map.unit)};
    },
  });
  return make('div', {}, table, colorLegend(range, map.unit));
}

/** A map as lines over X, one for each point of Y; an empty text when there is nothing to draw. */
function mapLines(map, width) {
  const {id, columns, x, y, w} = map;
  const xs = x.length ? x : Array.from({length: columns}, (_, i) => i);
  const rows = Math.ceil(w.length / columns);
  const series = [];
  for (let row = 0; row < rows; ++row)
    series.push({xs, values: w.slice(row * columns, (row + 1) * columns),
      label: `${map.titleY} ${pointOrIndex(y, row)}`, color: seriesColor(row, rows)});
  const svg = series.length && plot(plotWidth(width), {title: name[id], titleX: map.titleX, titleW: map.titleW,
    unitX: map.unitX, unitW: map.unit, series});
  if (!svg)
    return '';
  const MOST = 24;
  const step = Math.ceil(series.length / MOST);
  return make('div', {}, svg, legendOf(series.filter((_, i) => i % step === 0)));
}
