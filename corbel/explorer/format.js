// How the API's values read to a person. A value object carries the clock's value and, where
// they apply, the word and the unit that corbel gives it; the page adds nothing of its own.

export function isRead(value) {
  return value !== undefined && value !== null && value.value !== undefined && value.value !== null;
}

function rawText(value) {
  if (typeof value === 'string') {
    return value === '' ? '""' : value;
  }
  return String(value);
}

// "-12 ns", "6 (MASTER)", "-1 log2 s (500 ms)", "248 (default)", "rack-7", or why the value
// could not be read ("not supported by this clock").
export function valueText(value) {
  if (value === undefined || value === null) {
    return '—';
  }
  if (!isRead(value)) {
    return value.error || value.reason || 'not read';
  }
  let text = rawText(value.value);
  if (value.unit) {
    text += ' ' + value.unit;
  }
  if (value.word) {
    text += ' (' + value.word + ')';
  }
  return text;
}

// The word alone where there is one ("MASTER"), else the value.
export function wordText(value) {
  return isRead(value) && value.word ? value.word : valueText(value);
}

// A time of day in the browser's zone, with seconds: "20:42:10". Takes ISO 8601 or a Date.
export function timeOfDay(when) {
  if (!when) {
    return '—';
  }
  const time = new Date(when);
  return Number.isNaN(time.getTime()) ? String(when) : time.toLocaleTimeString([], {hour12: false});
}

// Replaces an element's text only when it differs, so that a live view does not disturb a
// reader's selection or a screen reader's position.
export function setText(element, text) {
  if (element.textContent !== text) {
    element.textContent = text;
  }
}

export function element(tag, className, text) {
  const node = document.createElement(tag);
  if (className) {
    node.className = className;
  }
  if (text !== undefined) {
    node.textContent = text;
  }
  return node;
}

export function clockLink(item) {
  const link = element('a', '', item);
  link.href = '#/clock/' + encodeURIComponent(item);
  return link;
}

// The clock identity of a port identity or an item name: "02-11-...-55:1" -> "02-11-...-55".
export function identityOf(portIdentity) {
  return String(portIdentity).split(':')[0].toUpperCase();
}
