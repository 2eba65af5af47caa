#pragma once

/// The parts of the report's page that are the same for every file.
namespace page {

inline constexpr const char* kStyle = R"css(
:root { color-scheme: light dark; --page: #f6f6f4; --card: #fff; --ink: #1b1b1a; --quiet: #5d5c58;
  --line: #dddcd7; --accent: #1f66c1; --low: #fff; --high: #7db4f2; }
@media (prefers-color-scheme: dark) { :root { --page: #121211; --card: #1c1c1b; --ink: #ececea;
  --quiet: #a5a49e; --line: #373734; --accent: #6ea8f0; --low: #1c1c1b; --high: #2862ad; } }
* { box-sizing: border-box; }
body { margin: 0; background: var(--page); color: var(--ink); font: 15px/1.45 system-ui, sans-serif;
  display: grid; grid-template-columns: 19rem minmax(0, 1fr); }
nav { position: sticky; top: 0; height: 100vh; overflow: auto; padding: 1rem;
  border-right: 1px solid var(--line); background: var(--card); font-size: 13px; }
main { padding: 1.5rem 2rem 4rem; max-width: 90rem; }
a { color: var(--accent); text-decoration: none; }
a:hover { text-decoration: underline; }
input { width: 100%; padding: .5rem .6rem; font: inherit; color: inherit; background: var(--page);
  border: 1px solid var(--line); border-radius: 6px; }
nav ul { list-style: none; margin: .2rem 0 .8rem; padding: 0; }
nav li { padding: .12rem 0; overflow-wrap: anywhere; }
nav a { color: inherit; }
nav small { display: block; }
summary { cursor: pointer; font-weight: 600; margin-top: .6rem; }
small, .meta, summary span { color: var(--quiet); font-weight: 400; font-size: 13px; }
h1 { font-size: 1.5rem; margin: 0 0 .5rem; overflow-wrap: anywhere; }
h2 { font-size: 1rem; letter-spacing: .04em; margin: 2.2rem 0 .7rem; }
h3 { font-size: 1rem; margin: 0; overflow-wrap: anywhere; }
h3 small { display: block; }
pre { font: inherit; color: var(--quiet); white-space: pre-wrap; overflow-wrap: anywhere; margin: 0; }
.meta { margin: .3rem 0 .7rem; overflow-wrap: anywhere; }
.meta span + span::before { content: "\00b7"; margin: 0 .45em; }
.cards { display: grid; gap: 1rem; align-items: start;
  grid-template-columns: repeat(auto-fill, minmax(min(100%, 26rem), 1fr)); }
.wide { grid-column: 1 / -1; }
.card { background: var(--card); border: 1px solid var(--line); border-radius: 8px; padding: 1rem;
  min-width: 0; content-visibility: auto; contain-intrinsic-size: auto 20rem; scroll-margin-top: 1rem; }
.scroll { overflow: auto; max-height: 75vh; }
table { border-collapse: separate; border-spacing: 0; font-variant-numeric: tabular-nums;
  font-size: 13px; }
th, td { padding: .25rem .55rem; text-align: right; white-space: nowrap; unicode-bidi: isolate; }
th { font-weight: 500; color: var(--quiet); background: var(--card); }
thead th { position: sticky; top: 0; z-index: 1; border-bottom: 1px solid var(--line); }
tbody th { position: sticky; left: 0; border-right: 1px solid var(--line); }
thead th:first-child { left: 0; z-index: 2; border-right: 1px solid var(--line); }
td[style] { background: color-mix(in srgb, var(--high) calc(var(--t) * 100%), var(--low)); }
td:hover, th.on { color: var(--accent); }
td:hover { outline: 2px solid var(--accent); outline-offset: -2px; color: inherit; }
.values { overflow-x: auto; background: var(--card); border: 1px solid var(--line); border-radius: 8px; }
.values table { width: 100%; }
.values td { border-top: 1px solid var(--line); vertical-align: top; white-space: normal; }
.values th { position: static; border: 0; }
.values td:first-child { overflow-wrap: anywhere; min-width: 9rem; width: 45%; }
.values :is(th, td):not(:nth-child(2)) { text-align: left; }
.values small { display: block; }
.values td:hover { outline: 0; }
tr:target td, .card:target { background: color-mix(in srgb, var(--accent) 9%, var(--card)); }
svg { display: block; width: 100%; min-width: 380px; max-width: 580px; margin-bottom: .5rem; }
svg text { font-size: 12px; fill: var(--quiet); }
svg .grid { stroke: var(--line); }
svg .curve { fill: none; stroke: var(--accent); stroke-width: 2; stroke-linejoin: round; }
svg .point { fill: var(--accent); stroke: var(--card); stroke-width: 2; }
svg .aim { fill: transparent; }
svg .aim:hover { fill: var(--accent); fill-opacity: .25; }
#tip { position: fixed; z-index: 9; pointer-events: none; padding: .35rem .6rem; white-space: pre;
  background: var(--ink); color: var(--page); border-radius: 6px; font-size: 13px; max-width: 90vw;
  overflow: hidden; text-overflow: ellipsis; }
[hidden] { display: none !important; }
@media (max-width: 50rem) {
  body { display: block; }
  nav { position: static; height: auto; max-height: 45vh; border: 0;
    border-bottom: 1px solid var(--line); }
  main { padding: 1rem; }
}
@media print { nav { display: none; } body { display: block; } .scroll { max-height: none; } }
)css";

// Texts of the file reach the script as text of the document only and leave it the same way.
inline constexpr const char* kScript = R"js(
'use strict';
const search = document.getElementById('search');
const links = Array.from(document.querySelectorAll('nav li'), item => ({
  item, text: item.textContent.toLowerCase(),
  target: document.getElementById(item.firstChild.hash.slice(1)) }));
search.addEventListener('input', () => {
  const words = search.value.toLowerCase().split(/\s+/);
  let found = 0;
  for (const {item, text, target} of links) {
    const hide = !words.every(word => text.includes(word));
    item.hidden = target.hidden = hide;
    found += !hide;
  }
  for (const kind of document.querySelectorAll('nav details')) {
    const empty = !kind.querySelector('li:not([hidden])');
    kind.hidden = document.getElementById(kind.dataset.kind).hidden = empty;
  }
  document.getElementById('none').hidden = found > 0;
});
const tip = document.getElementById('tip');
let marked = [];
function tipOf(target) {
  if (target.dataset.tip)
    return target.dataset.tip;
  const table = target.closest('table');
  const row = target.parentElement.cells[0];
  const column = table.tHead.rows[0].cells[target.cellIndex];
  marked = [row, column];
  return table.dataset.x + ' ' + column.textContent + '\n' + table.dataset.y + ' ' +
    row.textContent + '\n' + target.textContent + ' ' + table.dataset.unit;
}
function show(event) {
  for (const cell of marked)
    cell.classList.remove('on');
  marked = [];
  const target = event.target.closest?.('[data-tip], .map td');
  tip.hidden = !target;
  if (!target)
    return;
  tip.textContent = tipOf(target);
  for (const cell of marked)
    cell.classList.add('on');
  tip.style.left = Math.max(Math.min(event.clientX + 14, innerWidth - tip.offsetWidth - 8), 8) + 'px';
  tip.style.top = Math.max(event.clientY - tip.offsetHeight - 10, 8) + 'px';
}
addEventListener('pointermove', show);
addEventListener('pointerdown', show);
addEventListener('scroll', () => { tip.hidden = true; }, true);
)js";

// The one script that the browser runs, whatever a file contains. The browser's console tells the
// new hash when the script has changed.
inline constexpr const char* kPolicy =
    "default-src 'none'; style-src 'unsafe-inline'; "
    "script-src 'sha256-gRortltfLJssBBwXqEnjUGGnEE1Rh6yPLorDDtSzngY='";

} // namespace page
