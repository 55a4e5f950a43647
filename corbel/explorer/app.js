// The explorer: the clocks that corbel serve watches, read from its API at the server's own
// interval. Views by the address's fragment: #/ (overview), #/hierarchy, #/clock/ITEM.

import {ApiError, clockPath, getJson} from './api.js';
import {forgetClock, renderEvents, renderHeader, renderValues} from './clock.js';
import {renderDrift} from './drift.js';
import {setText, timeOfDay} from './format.js';
import {renderHierarchy} from './hierarchy.js';
import {forgetHealth, renderOverview} from './overview.js';
import {SettingsForm} from './settings.js';
import {bindThresholds} from './thresholds.js';

const $ = (id) => document.getElementById(id);
const HISTORY_EVERY_SECONDS = 5;  // the history is the largest answer: fetched less often

const state = {
  status: null,
  clocks: [],
  events: [],  // oldest first, as the server keeps them
  lastEvent: 0,
  clock: null,  // the clock of the clock view, or null
  missing: '',  // the item of the clock view when the server knows no such clock
  history: null,
  historyAt: 0,
};

const settings = new SettingsForm({
  form: $('settings'), fieldBox: $('fields'), tokenBox: $('tokenBox'), tokenInput: $('token'),
  tokenError: $('tokenError'), tokenKept: $('tokenKept'), forget: $('forgetToken'),
  sendButton: $('send'), result: $('writeResult'),
}, () => refresh());

function route() {
  const hash = location.hash;
  if (hash.startsWith('#/clock/')) {
    return {name: 'clock', item: decodeURIComponent(hash.slice('#/clock/'.length))};
  }
  return {name: hash === '#/hierarchy' ? 'hierarchy' : 'overview'};
}

function banner(text) {
  $('banner').hidden = !text;
  setText($('banner'), text);
}

function renderStatus() {
  const status = state.status;
  if (!status) {
    return;
  }
  const discovery = status.discovery ?
    `${status.discovery.clocks} clock ports found at ${timeOfDay(status.discovery.time)}` :
    'first discovery running';
  const writes = status.writes === 'read-only' ? 'read-only' : 'writes with a token';
  setText($('server'), `corbel serve ${status.version} · ${discovery} · read every ` +
      `${status.interval} s · ${writes}`);
}

function renderClockView(view) {
  const clock = state.clock;
  $('clockBody').hidden = !clock;
  if (!clock) {
    setText($('clock-title'), view.item);
    setText($('clockState'), state.missing === view.item ?
      'No clock port answers to this item name.' : 'Reading the clock …');
    return;
  }
  renderHeader(clock, $('clock-title'), $('clockState'));
  renderValues(clock, $('groups'), $('other'));
  if (state.history) {
    renderDrift(state.history, $('chart'), $('chartSummary'));
  }
  renderEvents(state.events, clock.item, $('events'), $('noEvents'));
  const readOnly = state.status?.writes === 'read-only';
  $('readOnly').hidden = !readOnly;
  $('settings').hidden = readOnly;
  if (!readOnly) {
    settings.render(clock);
  }
}

function render() {
  const view = route();
  for (const name of ['overview', 'hierarchy', 'clock']) {
    $(name).hidden = name !== view.name;
  }
  for (const link of document.querySelectorAll('nav a')) {
    link.toggleAttribute('aria-current', link.dataset.view === view.name);
  }
  renderStatus();
  if (view.name === 'overview') {
    renderOverview(state.clocks, document.querySelector('#clocks tbody'), $('noClocks'));
  } else if (view.name === 'hierarchy') {
    renderHierarchy(state.clocks, $('domains'));
  } else {
    renderClockView(view);
  }
}

async function readEvents() {
  const answer = await getJson('/api/v1/events?since=' + state.lastEvent);
  if (answer.last < state.lastEvent) {
    state.events = [];  // the server started again: its numbers did too
    state.lastEvent = 0;
  }
  // Two reads may overlap (a write refreshes at once): keep each event once.
  const fresh = (answer.events || []).filter((event) => event.id > state.lastEvent);
  state.events = state.events.concat(fresh).slice(-1000);
  state.lastEvent = Math.max(state.lastEvent, answer.last);
}

async function readClock(item) {
  let clock = null;
  try {
    clock = await getJson(clockPath(item));
  } catch (failure) {
    if (!(failure instanceof ApiError && failure.status === 404)) {
      throw failure;
    }
  }
  const due = clock && (state.history?.item !== clock.item ||
      Date.now() - state.historyAt >= HISTORY_EVERY_SECONDS * 1000);
  const history = due ? await getJson(clockPath(item) + '/history') : state.history;
  if (route().item === item) {  // the user may have moved on meanwhile
    state.clock = clock;
    state.missing = clock ? '' : item;
    state.history = history;
    state.historyAt = due ? Date.now() : state.historyAt;
  }
}

async function refresh() {
  try {
    state.status = await getJson('/api/v1/status');
    const view = route();
    const [clocks] = await Promise.all([getJson('/api/v1/clocks'), readEvents(),
      view.name === 'clock' ? readClock(view.item) : null]);
    state.clocks = clocks.clocks || [];
    banner(state.status.discovery ? '' : 'The server is finding the clocks; the first ' +
        'discovery has not finished yet.');
  } catch (failure) {
    const why = failure instanceof ApiError ? `answers ${failure.status} ${failure.word}: ` +
      failure.message : 'does not answer';
    banner(failure.status === 503 ? 'The server is finding the clocks; the first discovery ' +
        'has not finished yet.' : `The server ${why} (${timeOfDay(new Date())}); trying again.`);
  }
  render();
}

// One chain of polls: a view change starts a new one and the older one ends.
let timer = 0;
let chain = 0;
async function poll() {
  const mine = ++chain;
  clearTimeout(timer);
  await refresh();
  if (mine === chain) {
    timer = setTimeout(poll, Math.max(state.status?.interval || 1, 0.5) * 1000);
  }
}

window.addEventListener('hashchange', () => {
  const view = route();
  if (view.name !== 'clock' || view.item !== state.clock?.item) {
    state.clock = null;
    state.history = null;
    forgetClock();
  }
  render();
  $(view.name === 'clock' ? 'clock-title' : view.name + '-title').focus();
  poll();
});

bindThresholds($('thresholds'), $('thresholdsReset'), () => {
  forgetHealth();
  render();
});
render();  // the view's frame at once; its data with the first answers
poll();
