const distributions = new Map();
for (const kind of kinds)
  if (kind.keyword === 'STUETZSTELLENVERTEILUNG')
    for (let id = kind.first + kind.count - 1; id >= kind.first; --id)
      distributions.set(name[id], id);

/** Everything about a block, for drawing; null while its values are not loaded. */
function blockOf(id) {
  const values = valuesOf(id);
  if (!values)
    return null;
  const block = {id, columns: columnsOf(id), rows: rowsOf(id), x: [], y: [], w: [],
    langname: langname[id]};
  for (const column of ['displayname', 'function', 'unit', 'unitX', 'unitY', 'axisX', 'axisY'])
    block[column] = text(column, id);
  Object.assign(block, values);
  return withTitles(block);
}

function withTitles(block) {
  block.titleX = titled(block.axisX || 'x', block.unitX);
  block.titleY = titled(block.axisY || 'y', block.unitY);
  block.titleW = titled(block.displayname || name[block.id], block.unit);
  return block;
}

/** The block as the other file has it: with what differs taken from there. */
const otherOf = block => withTitles({...block, ...block.o});

const badge = id => changeOf(id) ?
  make('span', {class: 'badge ' + CHANGES[changeOf(id)]}, CHANGES[changeOf(id)]) : '';

function axisInfo(letter, unit, distribution) {
  if (!unit && !distribution)
    return '';
  const info = make('span', {}, titled(letter, unit));
  if (!distribution)
    return info;
  const id = distributions.get(distribution);
  info.append(' from ', id === undefined ? distribution + ', which the file lacks' :
    make('a', {href: '#b' + id}, distribution));
  return info;
}

function views(card, width, choices) {
  const area = make('div');
  const tabs = choices.map(([label, body]) => {
    const tab = button(label, () => {
      for (const other of tabs)
        other.setAttribute('aria-pressed', other === tab);
      area.replaceChildren(body(width));
    }, {'aria-pressed': false});
    return tab;
  });
  card.append(make('p', {class: 'tabs', role: 'group', 'aria-label': 'View'}, ...tabs), area);
  tabs[0].setAttribute('aria-pressed', true);
  area.append(choices[0][1](width));
}

/** Numbers alone have a plot. */
const series = (block, label, color, dash) => {
  const length = Math.min(block.x.length, block.w.length);
  return {xs: block.x.slice(0, length), values: block.w.slice(0, length), label, color, dash};
};

/** Plots are as wide as their card, up to a limit. */
const plotWidth = width => Math.min(width, 620);

function drawCurve(card, block, width) {
  const other = block.o && otherOf(block);
  const lines = other ? [series(block, model.title, 'var(--accent)', '6 4'),
                         series(other, model.other, 'var(--other)')] :
    [series(block, '', 'var(--accent)')];
  const svg = lines[0].values.length > 0 && plot(plotWidth(width), {title: name[block.id], titleX: block.titleX,
    titleW: block.titleW, unitX: block.unitX, unitW: block.unit, series: lines});
  if (svg)
    card.append(svg);
  if (!other) {
    card.append(rowsTable(name[block.id], [['x', block.x, block.unitX], ['w', block.w, block.unit]]));
    return;
  }
  card.append(legendOf(lines));
  const places = placesOf(block.x, other.x);
  const there = places.map(i => i < 0 ? undefined : other.w[i]);
  card.append(rowsTable(name[block.id], [['x', block.x, block.unitX],
    [model.title, block.w, block.unit], [model.other, there, other.unit],
    ['difference', block.w.map((w, i) => difference(w, there[i])), block.unit, shownDifference]]));
  if (block.o.x)
    card.append(rowsTable(model.other, [['x', other.x, other.unitX], ['w', other.w, other.unit]]));
}

const NONE = 'There are no numbers to draw.';

function drawMap(card, block, width) {
  const other = block.o && otherOf(block);
  const BESIDE = 960; // room for the table and the lines
  if (!other && width >= BESIDE) {
    const lines = mapLines(block, 460);
    card.append(make('div', {class: lines ? 'beside' : ''}, mapTable(block), lines));
    return;
  }
  if (other)
    views(card, width, [
      ['Difference', () => mapDifference(block, other)], [model.title, () => mapTable(block)],
      [model.other, () => mapTable(other)], ['Lines of ' + model.title, w => mapLines(block, w) || NONE],
      ['Lines of ' + model.other, w => mapLines(other, w) || NONE]]);
  else
    views(card, width, [['Table', () => mapTable(block)], ['Lines', w => mapLines(block, w) || NONE]]);
}

const NARROW_MAP = 6; // columns that fit in half a window
const isWide = id => columnsOf(id) > NARROW_MAP;
const sizeOf = id => (columnsOf(id) ? `${many(columnsOf(id))} × ${many(rowsOf(id))}` :
  many(rowsOf(id))) + (rowsOf(id) === 1 && columnsOf(id) < 2 ? ' value' : ' values');

function cardOf(id, look, width) {
  const card = make('section', {class: 'card' + (isWide(id) ? ' wide' : ''), id: 'b' + id});
  card.append(make('h3', {tabindex: -1}, name[id], badge(id), make('small', {}, langname[id])));
  const block = blockOf(id);
  if (!block)
    return card;
  const meta = make('p', {class: 'meta'}, make('span', {}, titled(sizeOf(id), block.unit)));
  for (const info of [block.displayname, block.function])
    if (info)
      meta.append(make('span', {}, info));
  if (look !== 'list')
    meta.append(axisInfo('x', block.unitX, block.axisX), axisInfo('y', block.unitY, block.axisY));
  card.append(meta, block.o ? changedTexts(block, block.o) : '');
  if (look === 'curve')
    drawCurve(card, block, width);
  else if (block.columns > 0)
    drawMap(card, block, width);
  else if (block.o?.w)
    card.append(listDifference(name[id], block.w, block.o.w, block.unit));
  else
    card.append(listTable(name[id], block.w, block.unit));
  return card;
}

/** What one file says, and the other if it says something else. */
function fromTo(own, other) {
  const changed = other !== undefined && other !== own;
  return changed ? [own || '–', ' → ', make('strong', {}, other || '–')] : [own];
}

function rowOf(id) {
  const block = blockOf(id);
  const from = block ? block.w[0] : '', other = block?.o ?? {};
  const to = other.w ? other.w[0] : from;
  const value = make('td', {class: isText(from) ? 'text' : ''}, shown(from));
  if (!Object.is(from, to)) {
    const by = difference(from, to);
    value.append(' → ', make('strong', {}, shown(to)),
                 by === null ? '' : make('small', {}, shownDifference(by)));
  }
  const displayname = fromTo(text('displayname', id), other.displayname);
  return make('tr', {id: 'b' + id},
    make('th', {scope: 'row', tabindex: -1}, name[id], badge(id),
      make('small', {}, ...fromTo(langname[id], other.langname),
           displayname.join('') ? ' · ' : '', ...displayname)),
    value, make('td', {}, ...fromTo(text('unit', id), other.unit)),
    make('td', {}, ...fromTo(text('function', id), other.function)));
}
