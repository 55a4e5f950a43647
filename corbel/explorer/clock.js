// One clock port: its values grouped as the clock's data sets group them, and its events.

import {element, isRead, setText, timeOfDay, valueText, wordText} from './format.js';

// The data sets in the order of IEEE 1588's management; a value of a name not listed here
// is still shown, under "Other values".
const GROUPS = [
  ['Default data set', ['domainNumber', 'priority1', 'priority2', 'slaveOnly', 'twoStepFlag',
    'clockClass', 'clockAccuracy']],
  ['Current data set', ['stepsRemoved', 'offsetFromMaster', 'meanPathDelay']],
  ['Parent data set', ['parentPortIdentity', 'grandmasterIdentity', 'grandmasterPriority1',
    'grandmasterPriority2', 'grandmasterClockClass', 'grandmasterClockAccuracy',
    'parentOffsetVariance', 'parentPhaseChangeRate', 'parentReserved']],
  ['Time properties data set', ['timeSource', 'ptpTimescale', 'timeTraceable',
    'frequencyTraceable']],
  ['Port data set', ['portState', 'portEnabled', 'delayMechanism', 'logAnnounceInterval',
    'announceReceiptTimeout', 'logSyncInterval', 'logMinPdelayReqInterval']],
  ['UTC properties', ['currentUtcOffset', 'currentUtcOffsetValid', 'leap59', 'leap61']],
  ['Time', ['time']],
  ['Clock description', ['userDescription', 'productDescription', 'profileIdentity',
    'networkAddress', 'hardwareAddress', 'ownManufacturer']],
];

// Names in the order of the groups above, those of no group last.
export function inGroupOrder(names) {
  const order = GROUPS.flatMap(([, listed]) => listed);
  const rank = (name) => (order.includes(name) ? order.indexOf(name) : order.length);
  return [...names].sort((a, b) => rank(a) - rank(b));
}

function groupElement(title, names, values) {
  const section = element('section', 'group');
  const table = element('table');
  section.append(table);
  table.append(element('caption', '', title));
  for (const name of names) {
    const value = values[name];
    const row = element('tr');
    row.dataset.name = name;
    const head = element('th', '', name);
    head.scope = 'row';
    const cell = element('td', isRead(value) ? '' : 'unread', valueText(value));
    if (value && value.settable) {
      cell.append(element('span', 'badge settable', 'settable'));
    }
    row.append(head, cell);
    table.append(row);
  }
  return section;
}

let shownValues = '';

// `other`: a <details> for the host's constant properties and any value of no data set,
// folded away since they say little about the clock; it stays in place, so that its
// summary keeps the focus across refreshes.
export function renderValues(clock, container, other) {
  const signature = JSON.stringify(clock.values);
  if (signature === shownValues) {
    return;
  }
  shownValues = signature;
  const listed = new Set(GROUPS.flatMap(([, names]) => names));
  const groups = GROUPS.map(([title, names]) => [title, names.filter((name) => name in clock.values)]);
  const rest = Object.keys(clock.values).filter((name) => !listed.has(name));
  container.replaceChildren(...groups.filter(([, names]) => names.length > 0)
      .map(([title, names]) => groupElement(title, names, clock.values)));
  other.hidden = rest.length === 0;
  setText(other.querySelector('summary'), `Other values (${rest.length})`);
  other.querySelector('div').replaceChildren(groupElement('Other values', rest, clock.values));
}

export function renderHeader(clock, title, state) {
  setText(title, clock.item);
  const parts = ['Domain ' + clock.domain, wordText(clock.values.portState)];
  const description = clock.values.userDescription;
  if (isRead(description) && description.value) {
    parts.push(description.value);
  }
  parts.push(clock.present ? 'last read ' + timeOfDay(clock.lastRead) +
      (clock.lastReadOk === false ? ' (failed)' : '') :
    'vanished: no answer since ' + timeOfDay(clock.lastSeen));
  setText(state, parts.join(' · '));
  state.classList.toggle('vanished', !clock.present);
}

let shownEvents = '';

export function renderEvents(events, item, list, empty) {
  const mine = events.filter((event) => String(event.item).toUpperCase() === item.toUpperCase());
  const newest = mine.slice(-100).reverse();
  const signature = item + ':' + newest.map((event) => event.id).join(',');
  if (signature === shownEvents) {
    return;
  }
  shownEvents = signature;
  list.replaceChildren(...newest.map((event) => {
    const entry = element('li', 'event ' + event.kind);
    entry.dataset.kind = event.kind;
    const time = element('time', '', timeOfDay(event.time));
    time.dateTime = event.time;
    entry.append(time, element('span', 'badge', event.kind), element('span', '', event.message));
    return entry;
  }));
  empty.hidden = newest.length > 0;
}

// Leaving a clock: the next one starts from nothing.
export function forgetClock() {
  shownValues = '';
  shownEvents = '';
}
