const ruler = document.createElement('canvas').getContext('2d');
ruler.font = '12px system-ui, sans-serif';
const widthOf = label => ruler.measureText(label).width;

/** The label, cut to a width in pixels. */
function cut(label, width) {
  if (widthOf(label) <= width)
    return label;
  let length = Math.min(label.length, Math.ceil(width / 3));
  while (length > 1 && widthOf(label.slice(0, length) + '…') > width)
    --length;
  return label.slice(0, length) + '…';
}

const TOP = 12, HEIGHT = 264, BOTTOM = HEIGHT - 46, INSET = 10;

/** Places the points of an X axis: by their numbers, or texts at even distances. */
function axisX(series, left, right) {
  const range = rangeOf(...series.map(one => one.xs));
  const byIndex = range.empty;
  if (byIndex)
    Object.assign(range, {low: 0, high: Math.max(...series.map(one => one.xs.length)) - 1});
  const at = x => left + INSET + shareOf(range, x) * (right - left - 2 * INSET);
  return {
    at(one, i) {
      const x = byIndex ? i : number(one.xs[i]);
      return isInfinite(x) ? (x > 0 ? right : left) : at(x);
    },
    labels() {
      if (!byIndex)
        return ticksOf(range, right - left > 300 ? 5 : 3).map(tick => [at(tick), tickLabel(tick)]);
      return series[0].xs.map((x, i) => [at(i), isText(x) ? x : '']).filter(([, label]) => label);
    },
  };
}

/**
 * The points of some series as lines over X. A series has xs, values, label, color and a dash if
 * wanted. An infinite value is a triangle at the edge. The arrow keys walk over the points.
 */
function plot(width, {title, titleX, titleW, unitX, unitW, series}) {
  const range = rangeOf(...series.map(one => one.values));
  if (range.empty) {
    if (!series.some(one => one.values.some(isInfinite)))
      return null;
    Object.assign(range, {low: 0, high: 0});
  }
  const atW = w => isInfinite(w) ? (w > 0 ? TOP + 5 : BOTTOM - 5) :
    BOTTOM - INSET - shareOf(range, w) * (BOTTOM - TOP - 2 * INSET);
  const ticksW = ticksOf(range, 5).map(tick => [atW(tick), tickLabel(tick)]);
  const left = 32 + Math.max(20, ...ticksW.map(([, label]) => widthOf(label)));
  const right = width - 8;
  const x = axisX(series, left, right);

  const svg = draw('svg', {width, height: HEIGHT, viewBox: `0 0 ${width} ${HEIGHT}`, tabindex: 0,
    role: 'slider', 'aria-label': title + ', points', 'aria-valuemin': 1});
  let free = HEIGHT; // where the next label has room
  for (const [y, label] of ticksW) {
    if (y > free)
      continue;
    free = y - 14;
    svg.append(draw('line', {class: 'grid', x1: left, x2: right, y1: y, y2: y}),
               draw('text', {'text-anchor': 'end', x: left - 6, y: y + 4}, label));
  }
  free = 0;
  for (const [place, whole] of x.labels()) {
    const label = cut(whole, Math.min(130, width / 3));
    const half = widthOf(label) / 2;
    const middle = Math.max(half, Math.min(place, width - half));
    svg.append(draw('line', {class: 'grid', x1: place, x2: place, y1: TOP, y2: BOTTOM}));
    if (middle - half < free)
      continue;
    free = middle + half + 10;
    svg.append(draw('text', {class: 'label', 'text-anchor': 'middle', x: middle, y: BOTTOM + 16},
                    label));
  }
  const middle = (TOP + BOTTOM) / 2;
  svg.append(
    draw('text', {'text-anchor': 'middle', x: (left + right) / 2, y: HEIGHT - 8},
         cut(titleX, right - left)),
    draw('text', {'text-anchor': 'middle', transform: `translate(14 ${middle}) rotate(-90)`},
         cut(titleW, BOTTOM - TOP)));

  const few = series.length * series[0].values.length <= 150;
  series.forEach((one, s) => {
    one.points = [];
    let path = '', open = false;
    const group = draw('g', {style: `color: ${one.color}`, class: 'series'});
    one.values.forEach((w, i) => {
      const px = x.at(one, i), py = atW(number(w));
      if (!Number.isFinite(px) || !Number.isFinite(py)) {
        open = false;
        return;
      }
      one.points.push({px, py, i, s});
      if (isInfinite(w)) {
        const tail = py + (w > 0 ? 9 : -9);
        group.append(draw('path', {class: 'infinite', d: `M${px} ${py}L${px - 5} ${tail}h10z`}));
        open = false;
        return;
      }
      path += `${open ? 'L' : 'M'}${px.toFixed(2)} ${py.toFixed(2)}`;
      open = !isInfinite(one.xs[i]);
      if (few)
        group.append(draw('circle', {class: 'point', cx: px.toFixed(2), cy: py.toFixed(2), r: 3.5}));
    });
    group.prepend(draw('path', {class: 'curve', d: path, 'stroke-dasharray': one.dash || 'none'}));
    svg.append(group);
    one.group = group;
  });

  const ring = draw('circle', {class: 'ring', r: 7, visibility: 'hidden'});
  svg.append(ring);
  const drawn = series.filter(one => one.points.length > 0);
  const counted = drawn.reduce((sum, one) => sum + one.points.length, 0);
  svg.setAttribute('aria-valuemax', counted);
  svg.setAttribute('aria-valuenow', 0);
  svg.setAttribute('aria-valuetext', `${counted} points; the arrow keys walk over them`);
  let at = null;

  function leave() {
    ring.setAttribute('visibility', 'hidden');
    for (const one of drawn)
      one.group.classList.remove('on');
    hideTip();
  }
  function go(s, p, quiet) {
    const one = drawn[s], point = one.points[p];
    leave();
    at = {s, p};
    ring.setAttribute('cx', point.px);
    ring.setAttribute('cy', point.py);
    ring.setAttribute('visibility', 'visible');
    if (drawn.length > 1)
      one.group.classList.add('on');
    const lines = [one.label, withUnit(shown(one.xs[point.i]), unitX),
                   withUnit(shown(one.values[point.i]), unitW)].filter(Boolean);
    const box = svg.getBoundingClientRect();
    showTip(lines.join('\n'), box.left + point.px * box.width / width,
            box.top + point.py * box.height / HEIGHT, quiet ? null : () => go(s, p, false));
    if (quiet)
      return;
    const before = drawn.slice(0, s).reduce((sum, other) => sum + other.points.length, 0);
    svg.setAttribute('aria-valuenow', before + p + 1);
    svg.setAttribute('aria-valuetext', lines.join(', '));
  }
  svg.addEventListener('pointermove', event => {
    const box = svg.getBoundingClientRect();
    const px = (event.clientX - box.left) * width / box.width;
    const py = (event.clientY - box.top) * HEIGHT / box.height;
    let best = null, nearest = 40 * 40;
    drawn.forEach((one, s) => one.points.forEach((point, p) => {
      const square = (point.px - px) ** 2 + (point.py - py) ** 2;
      if (square < nearest)
        [nearest, best] = [square, [s, p]];
    }));
    if (best)
      go(...best, true);
    else
      leave();
  });
  svg.addEventListener('pointerleave', leave);
  svg.addEventListener('blur', leave);
  svg.addEventListener('keydown', event => {
    const last = at ? drawn[at.s].points.length - 1 : 0;
    const move = {
      ArrowRight: ({s, p}) => [s, Math.min(p + 1, last)], ArrowLeft: ({s, p}) => [s, Math.max(p - 1, 0)],
      Home: ({s}) => [s, 0], End: ({s}) => [s, last],
      ArrowUp: ({s, p}) => [Math.min(s + 1, drawn.length - 1), p],
      ArrowDown: ({s, p}) => [Math.max(s - 1, 0), p],
    }[event.key];
    if (!move || drawn.length === 0)
      return;
    event.preventDefault();
    const [s, p] = at ? move(at) : [0, 0];
    go(s, Math.min(p, drawn[s].points.length - 1), false);
  });
  return svg;
}

const seriesColor = (i, n) => n < 2 ? 'var(--accent)' :
  `color-mix(in oklab, var(--last) ${(100 * i / (n - 1)).toFixed(1)}%, var(--first))`;

function legendOf(series) {
  const swatch = one => make('span', {class: 'swatch' + (one.dash ? ' dashed' : ''),
    style: `color: ${one.color}`});
  return make('p', {class: 'legend'},
              ...series.map(one => make('span', {}, swatch(one), one.label)));
}
