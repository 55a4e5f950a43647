// The settings form of one clock port: the settable values, the changes sent in one write,
// the expert's sentences next to the fields they concern, and what the clock then accepted,
// refused and what was not sent. The write token is asked once and kept for this tab only.

import {postSettings} from './api.js';
import {inGroupOrder} from './clock.js';
import {element, isRead, valueText} from './format.js';

const TOKEN_KEY = 'corbel-explorer-token';
const NUMERIC = new Set(['u32', 'i32', 'double']);

function inputText(value) {
  if (!isRead(value)) {
    return '';
  }
  return typeof value.value === 'object' ? String(value.value.utc ?? '') : String(value.value);
}

function fieldElements(name, value) {
  const id = 'set-' + name;
  const label = element('label', '', name);
  label.htmlFor = id;
  const input = element('input');
  input.id = id;
  input.name = name;
  input.dataset.type = value.type;
  if (value.type === 'bool') {
    input.type = 'checkbox';
  } else {
    input.type = 'text';
    input.spellcheck = false;
    input.autocomplete = 'off';
    if (NUMERIC.has(value.type)) {
      input.inputMode = value.type === 'double' ? 'decimal' : 'numeric';
    }
    if (value.type === 'timestamp') {
      input.placeholder = 'UTC, such as 2026-12-06T20:15:00Z';
    }
  }
  const hint = element('span', 'hint');
  hint.id = id + '-hint';
  const error = element('p', 'field-error');
  error.id = id + '-error';
  error.hidden = true;
  input.setAttribute('aria-describedby', hint.id + ' ' + error.id);
  const box = element('div', 'field');
  box.append(input, hint, error);
  return {label, box, input, hint, error};
}

function current(input) {
  return input.type === 'checkbox' ? String(input.checked) : input.value;
}

function show(input, text) {
  if (input.type === 'checkbox') {
    input.checked = text === 'true';
  } else {
    input.value = text;
  }
  input.dataset.initial = text;
}

// The JSON value that the tag's type needs, or an error sentence.
function parsed(input) {
  const text = current(input);
  if (input.type === 'checkbox') {
    return {value: input.checked};
  }
  if (NUMERIC.has(input.dataset.type)) {
    const number = Number(text.trim());
    return text.trim() === '' || !Number.isFinite(number) ? {error: 'Enter a number.'} :
      {value: number};
  }
  return {value: text};
}

export class SettingsForm {
  constructor(elements, written) {
    Object.assign(this, elements);
    this.written = written;
    this.item = '';
    this.names = '';
    this.fields = new Map();
    this.form.addEventListener('submit', (event) => {
      event.preventDefault();
      this.send();
    });
    this.forget.addEventListener('click', () => {
      sessionStorage.removeItem(TOKEN_KEY);
      this.showToken();
      this.tokenInput.focus();
    });
    this.showToken();
  }

  showToken() {
    const kept = Boolean(sessionStorage.getItem(TOKEN_KEY));
    this.tokenBox.hidden = kept;
    this.tokenKept.hidden = !kept;
  }

  // Builds the fields for a new clock or a new set of settable values; otherwise brings the
  // fields that the user has not touched up to date with the clock.
  render(clock) {
    const settable = inGroupOrder(Object.keys(clock.values).filter((name) => clock.values[name].settable));
    if (clock.item !== this.item || settable.join() !== this.names) {
      this.item = clock.item;
      this.names = settable.join();
      this.fields.clear();
      this.fieldBox.replaceChildren();
      this.result.replaceChildren();
      for (const name of settable) {
        const field = fieldElements(name, clock.values[name]);
        this.fields.set(name, field);
        this.fieldBox.append(field.label, field.box);
      }
    }
    for (const [name, field] of this.fields) {
      const value = clock.values[name];
      const text = inputText(value);
      if (field.input.dataset.initial === undefined || current(field.input) === field.input.dataset.initial) {
        show(field.input, text);
      }
      field.hint.textContent = 'now ' + valueText(value);
    }
  }

  clearErrors() {
    for (const field of [...this.fields.values(), this.tokenField()]) {
      field.error.hidden = true;
      field.error.textContent = '';
      field.input.removeAttribute('aria-invalid');
    }
  }

  tokenField() {
    return {input: this.tokenInput, error: this.tokenError};
  }

  mark(field, sentence) {
    field.error.textContent = sentence;
    field.error.hidden = false;
    field.input.setAttribute('aria-invalid', 'true');
  }

  report(outcome, sentence, lists) {
    const summary = element('p', 'summary ' + outcome, sentence);
    this.result.dataset.outcome = outcome;
    this.result.replaceChildren(summary);
    if (lists) {
      const list = element('dl', 'outcome');
      for (const [term, names] of lists) {
        list.append(element('dt', '', term), element('dd', '', names.length ? names.join(', ') : 'none'));
      }
      this.result.append(list);
    }
  }

  // The changed fields as the JSON body, or null after marking the fields that do not parse.
  changes() {
    const body = {};
    let first = null;
    for (const [name, field] of this.fields) {
      if (current(field.input) === field.input.dataset.initial) {
        continue;
      }
      const {value, error} = parsed(field.input);
      if (error) {
        this.mark(field, error);
        first = first || field.input;
      } else {
        body[name] = value;
      }
    }
    if (first) {
      this.report('local', 'Nothing was sent: correct the values marked.');
      first.focus();
      return null;
    }
    return body;
  }

  async send() {
    this.clearErrors();
    const body = this.changes();
    if (!body) {
      return;
    }
    if (Object.keys(body).length === 0) {
      this.report('local', 'Nothing to send: no value was changed.');
      return;
    }
    const token = sessionStorage.getItem(TOKEN_KEY) || this.tokenInput.value.trim();
    if (!token) {
      this.mark(this.tokenField(), 'Enter the write token that corbel serve printed at start.');
      this.report('local', 'Nothing was sent: the write token is missing.');
      this.tokenInput.focus();
      return;
    }
    this.sendButton.disabled = true;
    this.report('sending', 'Sending ' + Object.keys(body).join(', ') + ' …');
    try {
      const answer = await postSettings(this.item, body, token);
      this.answered(answer, token);
    } catch (failure) {
      this.report('error', 'The server did not answer: ' + failure.message);
    } finally {
      this.sendButton.disabled = false;
    }
  }

  answered({status, body}, token) {
    if (status === 401) {
      sessionStorage.removeItem(TOKEN_KEY);
      this.showToken();
      this.mark(this.tokenField(), 'The server does not accept this token.');
      this.report('unauthorized', 'The server refused the write without a valid token: ' +
          (body.message || 'unauthorized') + ' Nothing was sent. Enter the token that corbel ' +
          'serve printed at start (or the first line of its --token-file).');
      this.tokenInput.focus();
      return;
    }
    if (status === 200 || status === 422 || status === 502) {
      sessionStorage.setItem(TOKEN_KEY, token);
      this.tokenInput.value = '';
      this.showToken();
    }
    if (status === 422) {
      this.rejected(body.sentences || {});
    } else if (status === 200 || status === 502) {
      this.wrote(body);
    } else {
      this.report('error', `The server refused the write (${status} ${body.error || ''}): ` +
          (body.message || 'no reason given') + '.');
    }
  }

  rejected(sentences) {
    const names = Object.keys(sentences);
    this.report('rejected', `Nothing was sent: the expert's validation rejected ` +
        (names.length === 1 ? 'one value.' : names.length + ' values.'));
    for (const name of names) {
      const field = this.fields.get(name);
      if (field) {
        this.mark(field, sentences[name]);
      } else {
        this.result.append(element('p', 'field-error', name + ': ' + sentences[name]));
      }
    }
    this.fields.get(names[0])?.input.focus();
  }

  wrote(body) {
    const written = body.written || [];
    const refused = body.refused;
    for (const name of written) {
      const input = this.fields.get(name)?.input;
      input && (input.dataset.initial = current(input));
    }
    const reason = refused ? refused.reason || refused.error || 'no reason given' : '';
    if (refused && this.fields.has(refused.name)) {
      this.mark(this.fields.get(refused.name), 'The clock refused it: ' + reason + '.');
    }
    this.report(refused ? 'refused' : 'written',
        refused ? `The clock refused ${refused.name} (${reason}).` : 'The clock accepted every change.',
        [['Written', written], ['Refused', refused ? [refused.name + ': ' + reason] : []],
          ['Not sent', body.notSent || []]]);
    this.written();
  }
}
