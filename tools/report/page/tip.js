const tip = document.getElementById('tip');
let marked = [];   // the head cells of what it tells about
let follow = null; // shows it anew after scrolling, where the keyboard has led to it

function hideTip() {
  tip.hidden = true;
  follow = null;
  for (const cell of marked)
    cell.classList.remove('on');
  marked = [];
}

function showTip(lines, left, top, again = null) {
  tip.textContent = lines;
  tip.hidden = false;
  follow = again;
  tip.style.left = Math.max(Math.min(left + 14, innerWidth - tip.offsetWidth - 8), 8) + 'px';
  tip.style.top = Math.max(top - tip.offsetHeight - 10, 8) + 'px';
}

addEventListener('scroll', () => follow ? follow() : hideTip(), true);
