function fill(element, attributes, children) {
  for (const key in attributes)
    element.setAttribute(key, attributes[key]);
  element.append(...children);
  return element;
}
const make = (tag, attributes, ...children) =>
  fill(document.createElement(tag), attributes, children);
const draw = (tag, attributes, ...children) =>
  fill(document.createElementNS('http://www.w3.org/2000/svg', tag), attributes, children);

function button(label, action, attributes) {
  const element = make('button', {type: 'button', ...attributes}, label);
  element.addEventListener('click', action);
  return element;
}
