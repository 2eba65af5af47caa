/** The lowest and highest finite number of some lists; low is above high when there is none. */
function rangeOf(...lists) {
  let low = Infinity, high = -Infinity;
  for (const list of lists)
    for (const value of list)
      if (Number.isFinite(value)) {
        low = Math.min(low, value);
        high = Math.max(high, value);
      }
  return {low, high, empty: low > high};
}

/** 0 for low to 1 for high. Halves keep the widest range from overflowing. */
function shareOf({low, high}, value) {
  const span = high / 2 - low / 2;
  return span > 0 ? (value / 2 - low / 2) / span : 0.5;
}

/** Round numbers within the range, at most one more than `most`. */
function ticksOf({low, high}, most) {
  const rough = (high - low) / most;
  const power = 10 ** Math.floor(Math.log10(rough));
  const step = power * (rough / power > 5 ? 10 : rough / power > 2 ? 5 : rough / power > 1 ? 2 : 1);
  const start = Math.ceil(low / step);
  if (!(power > 0) || !Number.isFinite(step) || !Number.isFinite(start) || start + 1 === start)
    return low < high ? [low, high] : [low];
  const ticks = [];
  for (let i = 0; i <= most && (start + i) * step <= high; ++i)
    ticks.push((start + i) * step + 0);
  return ticks;
}

function tickLabel(tick) {
  const rounded = String(Number(tick.toPrecision(7)));
  return rounded.length < String(tick).length ? rounded : String(tick);
}
