// The explorer page in a real browser (Debian's chromium) against corbel serve.
// Environment (tools/explorer sets it): EXPLORER_URL (the server), EXPLORER_TOKEN (its write
// token), EXPLORER_CLOCKS (how many clock ports it lists), EXPLORER_WRITABLE (a clock that
// accepts SET), EXPLORER_FOLLOWER (a slave of another listed clock), EXPLORER_SHOTS (a folder
// for the screenshots), EXPLORER_READ_ONLY=1 when the server runs with --read-only (then only
// the form's absence is checked).
import assert from 'node:assert/strict';
import {mkdirSync, mkdtempSync, rmSync} from 'node:fs';
import {tmpdir} from 'node:os';
import {join} from 'node:path';
import {after, before, test} from 'node:test';
import {chromium} from 'playwright-core';

const base = process.env.EXPLORER_URL;
const writable = process.env.EXPLORER_WRITABLE;
const follower = process.env.EXPLORER_FOLLOWER;
const shots = process.env.EXPLORER_SHOTS || 'build/explorer';
const readOnly = process.env.EXPLORER_READ_ONLY === '1';
const errors = [];
let context;
let profile;

async function api(path) {
  const response = await fetch(base + path);
  assert.equal(response.status, 200, path);
  return response.json();
}

// Waits for a condition of the clocks themselves (a slave takes a few seconds to follow).
async function until(condition, what) {
  for (let attempt = 0; attempt < 60; attempt++) {
    if (await condition()) {
      return;
    }
    await new Promise((resolve) => setTimeout(resolve, 500));
  }
  assert.fail('waited 30 s in vain for ' + what);
}

// A new tab (the previous one closed): its own session storage, so no write token is kept.
let page;
async function open(hash) {
  await page?.close();
  page = await context.newPage();
  page.on('console', (message) => message.type() === 'error' && errors.push(message.text()));
  page.on('pageerror', (error) => errors.push(error.message));
  await page.goto(base + '/' + hash);
  return page;
}

const shot = (page, name, fullPage = true) => page.screenshot({path: join(shots, name), fullPage});
const clock = async (item) => (await api('/api/v1/clocks/' + item)).values;
const writesSince = async (id) => (await api('/api/v1/events?since=' + id)).events
    .filter((event) => event.item === writable && event.kind === 'written');

before(async () => {
  mkdirSync(shots, {recursive: true});
  profile = mkdtempSync(join(tmpdir(), 'explorer-profile-'));
  context = await chromium.launchPersistentContext(profile, {
    executablePath: '/usr/bin/chromium',
    args: ['--no-sandbox', '--headless', '--disable-gpu', '--disable-background-networking',
      '--disable-component-update', '--disable-sync', '--no-first-run'],
    viewport: {width: 1280, height: 960},
  });
  context.setDefaultTimeout(15000);
});

after(async () => {
  await context?.close();
  rmSync(profile, {recursive: true, force: true});
});

test('the overview lists every clock with its port state in words', {skip: readOnly}, async () => {
  const {clocks} = await api('/api/v1/clocks');
  assert.equal(clocks.length, Number(process.env.EXPLORER_CLOCKS));
  page = await open('');
  await page.waitForFunction((n) => document.querySelectorAll('#clocks tbody tr').length === n &&
      !document.querySelector('#clocks td[data-column=lastRead]:empty'), clocks.length);
  const rows = await page.$$eval('#clocks tbody tr', (all) => all.map((row) =>
    [row.dataset.item, row.querySelector('[data-column=portState]').textContent]));
  assert.deepEqual(rows.map(([item]) => item), clocks.map((each) => each.item));
  // The words are the server's (corbel's formatter); the page shows the number where it has none.
  const shape = clocks.every((each) => each.values.portState.word) ? /^[A-Z_]+$/ : /^\d+$/;
  assert.ok(rows.every(([, state]) => shape.test(state)), JSON.stringify(rows));
  await shot(page, 'overview.png');
});

test('the hierarchy: each domain grandmaster on top, a slave under its master', {skip: readOnly}, async () => {
  const parentOf = async () => (await clock(follower)).parentPortIdentity.value;
  await until(async () => !(await parentOf()).startsWith(follower.split(':')[0]), 'the slave');
  const {clocks} = await api('/api/v1/clocks');
  page = await open('#/hierarchy');
  await page.locator(`li[data-item="${await parentOf()}"] li[data-item="${follower}"]`).waitFor();
  for (const domain of new Set(clocks.map((each) => each.domain))) {
    const grandmaster = clocks.find((each) => each.domain === domain)
        .values.grandmasterIdentity.value;
    const top = await page.locator(`section[data-domain="${domain}"] .tree > li`).first()
        .getAttribute('data-item');
    assert.equal(top.split(':')[0], grandmaster, `domain ${domain}`);
  }
  await shot(page, 'hierarchy.png');
});

test('the health colours follow the thresholds the user sets, kept across visits', {skip: readOnly}, async () => {
  page = await open('');
  await page.locator(`tr[data-item="${follower}"] td[data-column=meanPathDelay]:not(:empty)`).waitFor();
  await page.locator('.thresholds summary').press('Enter');
  await page.fill('#delayAlarm', '0');
  await page.press('#delayAlarm', 'Enter');
  const delay = `tr[data-item="${follower}"] td[data-column=meanPathDelay].health-alarm`;
  await page.locator(delay).waitFor();
  await page.reload();
  await page.locator(delay).waitFor();
});

test('one clock, reached by keyboard: its data sets and a chart with points', {skip: readOnly}, async () => {
  page = await open('');
  await page.focus(`#clocks a[href="#/clock/${encodeURIComponent(follower)}"]`);
  await page.keyboard.press('Enter');
  await page.waitForFunction(() => Chart.getChart(document.getElementById('chart'))
      ?.data.datasets.every((set) => set.data.length > 0));
  await page.locator('#groups caption', {hasText: 'Default data set'}).waitFor();
  await shot(page, 'clock.png', false);
});

async function send(page, values) {
  for (const [field, value] of Object.entries(values)) {
    await page.fill(field, value);
  }
  await page.press('#set-priority1', 'Enter');
  await page.waitForSelector('#writeResult:not([data-outcome=sending]) .summary');
  return page.getAttribute('#writeResult', 'data-outcome');
}

test('an edit of priority1 is shown after the write; 300 is rejected by the field and not sent',
    {skip: readOnly}, async () => {
      page = await open('#/clock/' + encodeURIComponent(writable));
      await page.waitForSelector('#set-priority1');
      const next = (await clock(writable)).priority1.value === 61 ? 62 : 61;
      const token = process.env.EXPLORER_TOKEN;
      assert.equal(await send(page, {'#set-priority1': String(next), '#token': token}), 'written');
      await page.locator('#groups tr[data-name=priority1] td', {hasText: String(next)}).waitFor();

      const {last} = await api('/api/v1/events?since=0');
      assert.equal(await send(page, {'#set-priority1': '300'}), 'rejected');
      assert.match(await page.textContent('#set-priority1-error'), /\S/);
      assert.equal(await page.isVisible('#tokenBox'), false, 'the token is kept for the tab');
      await shot(page, 'rejected.png');
      assert.deepEqual(await writesSince(last), []);
      assert.equal((await clock(writable)).priority1.value, next);
    });

test('a write without a valid token is refused with a clear message', {skip: readOnly}, async () => {
  page = await open('#/clock/' + encodeURIComponent(writable));
  await page.waitForSelector('#set-priority1');
  const {last} = await api('/api/v1/events?since=0');
  assert.equal(await send(page, {'#set-priority1': '7'}), 'local');
  assert.match(await page.textContent('#tokenError'), /Enter the write token/);
  assert.equal(await send(page, {'#token': 'not-the-token'}), 'unauthorized');
  assert.match(await page.textContent('#writeResult'), /refused the write without a valid token/);
  assert.deepEqual(await writesSince(last), []);
});

test('a read-only server offers no form', {skip: !readOnly}, async () => {
  page = await open('#/clock/' + encodeURIComponent(writable));
  await page.locator('#readOnly').waitFor();
  assert.equal(await page.isVisible('#settings'), false);
});

test('no console errors', async () => {
  // The two refusals above are answers the page asks for; the browser logs each as a failed
  // resource load, which the page cannot prevent.
  const unexpected = errors.filter((text) => !/status of (401|422)/.test(text));
  assert.deepEqual(unexpected, []);
});
