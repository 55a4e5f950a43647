// The user's health thresholds for offset from master and mean path delay, in nanoseconds,
// kept in this browser (localStorage) across visits.

const KEY = 'corbel-explorer-thresholds';
const DEFAULTS = {offsetWarn: 1000, offsetAlarm: 100000, delayWarn: 100000, delayAlarm: 1000000};
let current = load();

function load() {
  try {
    const saved = JSON.parse(localStorage.getItem(KEY) || '{}');
    const merged = {...DEFAULTS};
    for (const name of Object.keys(DEFAULTS)) {
      if (Number.isFinite(saved[name]) && saved[name] >= 0) {
        merged[name] = saved[name];
      }
    }
    return merged;
  } catch {
    return {...DEFAULTS};
  }
}

// "ok", "warn" or "alarm" for a value in ns of 'offset' or 'delay'; "" without a value.
export function health(kind, nanoseconds) {
  if (typeof nanoseconds !== 'number') {
    return '';
  }
  const size = Math.abs(nanoseconds);
  if (size > current[kind + 'Alarm']) {
    return 'alarm';
  }
  return size > current[kind + 'Warn'] ? 'warn' : 'ok';
}

export const HEALTH_WORDS = {
  ok: 'within the thresholds',
  warn: 'above the warning threshold',
  alarm: 'above the alarm threshold',
};

// Fills the form, and keeps what the user applies; `changed` redraws the views.
export function bindThresholds(form, resetButton, changed) {
  const fill = () => {
    for (const name of Object.keys(DEFAULTS)) {
      form.elements[name].value = current[name];
    }
  };
  fill();
  form.addEventListener('submit', (event) => {
    event.preventDefault();
    const next = {...current};
    for (const name of Object.keys(DEFAULTS)) {
      const number = Number(form.elements[name].value);
      if (form.elements[name].value !== '' && Number.isFinite(number) && number >= 0) {
        next[name] = number;
      }
    }
    current = next;
    localStorage.setItem(KEY, JSON.stringify(current));
    fill();
    changed();
  });
  resetButton.addEventListener('click', () => {
    current = {...DEFAULTS};
    localStorage.removeItem(KEY);
    fill();
    changed();
  });
}
