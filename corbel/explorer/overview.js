// The overview: a row per clock port, updated in place at every poll so that keyboard focus
// on a row's link survives the refresh.

import {HEALTH_WORDS, health} from './thresholds.js';
import {clockLink, element, isRead, setText, timeOfDay, valueText, wordText} from './format.js';

const COLUMNS = ['domain', 'portState', 'priority1', 'priority2', 'clockClass', 'stepsRemoved',
  'offsetFromMaster', 'meanPathDelay', 'lastRead'];
const TEXT_COLUMNS = ['portState', 'clockClass', 'lastRead'];
const HEALTH_OF = {offsetFromMaster: 'offset', meanPathDelay: 'delay'};

const rows = new Map();  // upper-case item -> {row, cells}

function newRow(item) {
  const row = element('tr');
  row.dataset.item = item;
  const head = element('th');
  head.scope = 'row';
  const description = element('span', 'description');
  head.append(clockLink(item), element('span', 'badge', 'vanished'), description);
  row.append(head);
  const cells = {description};
  for (const column of COLUMNS) {
    cells[column] = element('td', TEXT_COLUMNS.includes(column) ? '' : 'num');
    cells[column].dataset.column = column;
    row.append(cells[column]);
  }
  return {row, cells};
}

// A quantity coloured by the user's thresholds; the colour's meaning is also said in words
// for those who do not see it. The last values of a vanished clock are not judged.
function setHealthCell(cell, kind, value, present) {
  const level = present && isRead(value) ? health(kind, value.value) : '';
  const text = valueText(value);
  if (cell.dataset.text === text && cell.dataset.health === level) {
    return;
  }
  cell.dataset.text = text;
  cell.dataset.health = level;
  cell.className = 'num' + (level ? ' health-' + level : '');
  cell.replaceChildren(text);
  if (level) {
    cell.append(element('span', 'visually-hidden', ', ' + HEALTH_WORDS[level]));
  }
}

function cellText(clock, column) {
  const value = clock.values[column];
  switch (column) {
    case 'domain':
      return String(clock.domain);
    case 'portState':
      return wordText(value);
    case 'lastRead':
      return timeOfDay(clock.lastRead) + (clock.lastReadOk === false ? ' (failed)' : '');
    default:
      return valueText(value);
  }
}

export function renderOverview(clocks, tbody, empty) {
  const seen = new Set();
  clocks.forEach((clock, index) => {
    const key = clock.item.toUpperCase();
    seen.add(key);
    if (!rows.has(key)) {
      rows.set(key, newRow(clock.item));
    }
    const {row, cells} = rows.get(key);
    row.classList.toggle('vanished', !clock.present);
    const description = clock.values.userDescription;
    setText(cells.description, isRead(description) ? String(description.value) : '');
    for (const column of COLUMNS) {
      if (HEALTH_OF[column]) {
        setHealthCell(cells[column], HEALTH_OF[column], clock.values[column], clock.present);
      } else {
        setText(cells[column], cellText(clock, column));
      }
    }
    if (tbody.children[index] !== row) {
      tbody.insertBefore(row, tbody.children[index] || null);
    }
  });
  for (const [key, {row}] of rows) {
    if (!seen.has(key)) {
      row.remove();
      rows.delete(key);
    }
  }
  empty.hidden = clocks.length > 0;
}

// Thresholds changed: recolour every row at the next render.
export function forgetHealth() {
  for (const {cells} of rows.values()) {
    for (const column of Object.keys(HEALTH_OF)) {
      delete cells[column].dataset.health;
    }
  }
}
