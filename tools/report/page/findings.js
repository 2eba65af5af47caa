const SEVERITIES = ['note', 'warning', 'error'];

/** The block that a finding names: its keyword, a blank and its name. */
function idOfBlock(title) {
  const kind = kinds.find(one => title.startsWith(one.keyword + ' '));
  if (!kind)
    return -1;
  return name.indexOf(title.slice(kind.keyword.length + 1), kind.first);
}

function findingRow([severity, line, block, message, id]) {
  const target = block ? idOfBlock(block) : -1;
  return make('tr', {class: SEVERITIES[severity]}, make('td', {}, SEVERITIES[severity]),
    make('td', {}, line ? String(line) : ''),
    make('td', {}, target < 0 ? block : make('a', {href: '#b' + target}, block)),
    make('td', {}, message, ' ', make('small', {}, `[${id}]`)));
}

/** The findings of one file, the worst first; open when data may be lost. */
function drawFindings(file, most) {
  const all = model.findings[file];
  if (!all || all.length === 0)
    return;
  const sorted = all.toSorted((a, b) => b[0] - a[0]);
  const box = document.getElementById('findings' + file);
  const heads = ['Severity', 'Line', 'Block', 'Finding'];
  box.querySelector('details')?.remove();
  box.append(make('details', sorted[0][0] > 0 ? {open: ''} : {},
    make('summary', {}, all.length === 1 ? '1 finding' : `${many(all.length)} findings`),
    make('div', {class: 'scroll'},
      make('table', {},
        make('thead', {}, make('tr', {}, ...heads.map(title => make('th', {scope: 'col'}, title)))),
        make('tbody', {}, ...sorted.slice(0, most).map(findingRow))),
      most < all.length ?
        button(`Show all ${many(all.length)}`, () => drawFindings(file, all.length)) : '')));
}
