let filters = [];
function choose(what) {
  chosen = what;
  for (const [filter, element] of filters)
    element.setAttribute('aria-pressed', filter === what);
  find();
  showNow();
}
function drawFilters() {
  const counts = [0, 0, 0, 0];
  for (const change of model.change)
    ++counts[change];
  const box = document.getElementById('filters');
  filters = [['differences', count - counts[0]], ['changed', counts[1]], ['added', counts[2]],
             ['removed', counts[3]], ['all', count]].map(([what, n]) => {
    const element = button(`${what} ${many(n)}`, () => choose(what), {'aria-pressed': what === chosen});
    box.append(element);
    return [what, element];
  });
  box.hidden = false;
}

if (model.change)
  drawFilters();
drawFindings(0, 100);
drawFindings(1, 100);
measure();
listHeight = list.clientHeight;
find();
showNow();
jumpToHash();
finish();
window.requestIdleCallback?.(() => haystack ?? makeHaystack());
