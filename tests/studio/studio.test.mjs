// The studio in headless Chromium: a person's session from the palette to the saved file.
import assert from 'node:assert/strict';
import { execFileSync } from 'node:child_process';
import { copyFileSync, mkdirSync, readFileSync } from 'node:fs';
import { join } from 'node:path';
import { after, before, test } from 'node:test';
import { chromium } from 'playwright-core';
import { PNG } from 'pngjs';

import { copyOfExamples, formkit, removeCopy, repository, startStudio } from './server.mjs';

const chromiumPath = process.env.CHROMIUM ?? '/usr/bin/chromium';
const screenshots = join(repository, 'build', 'studio');

let dir;
let studio;
let browser;
let page;

before(async () => {
  dir = copyOfExamples();
  studio = await startStudio(dir);
  // Headless, in a fresh profile of its own; without the network it does not reach for.
  browser = await chromium.launch({
    executablePath: chromiumPath,
    headless: true,
    args: ['--no-sandbox', '--disable-gpu', '--disable-quic', '--no-first-run',
      '--disable-background-networking', '--disable-component-update', '--disable-sync'],
  });
  page = await browser.newPage({ viewport: { width: 1500, height: 820 } });
  await page.goto(studio.url);
  await page.waitForSelector('body[data-ready="true"]');
});

after(async () => {
  await browser?.close();
  assert.equal(await studio.stop(), 0);
  removeCopy(dir);
});

const pane = (module) => page.locator(`.pane[data-module="${module}"]`);
const surface = (module) => pane(module).locator('.surface > svg');
const row = (property) => page.locator(`#inspector tr[data-property="${property}"]`);
const message = () => page.locator('#message');

/** Waits until every request the page made was answered and drawn. */
async function quiet() {
  await page.waitForFunction(() => document.body.dataset.pending === '0');
}

async function inspected() {
  await quiet();
  return page.locator('#inspected').textContent();
}

/** Clicks surface point (x, y) of `module` and waits for the engine's answer. */
async function clickOn(module, x, y) {
  const point = await onSurface(module, x, y);
  await page.mouse.click(point.x, point.y);
  await quiet();
}

/** The page coordinates of surface point (x, y) of `module`. */
async function onSurface(module, x, y) {
  const box = await surface(module).boundingBox();
  return { x: box.x + x, y: box.y + y };
}

async function openModule(file, module) {
  await page.selectOption('#files', file);
  await page.click('#open');
  await pane(module).waitFor();
}

/** Types `value` into the inspector's row for `property` and commits it with Enter. */
async function setInInspector(property, value) {
  await quiet();
  const editor = row(property).locator('input');
  await editor.fill(value);
  await editor.press('Enter');
  await quiet();
}

async function inspectorValue(property) {
  await quiet();
  return row(property).locator('input, select').inputValue();
}

function pixel(png, x, y) {
  const at = (png.width * Math.round(y) + Math.round(x)) * 4;
  return [png.data[at], png.data[at + 1], png.data[at + 2]];
}

test('a button from the palette is placed, snapped, captioned, bound and saved', async () => {
  await openModule('Form1.kfm', 'Form1');
  const before = PNG.sync.read(await page.screenshot());

  // Dragged from the palette onto an empty part of the form: it lands on the 8-pixel grid.
  const drop = await onSurface('Form1', 150, 230);
  await page.dragAndDrop('#palette .tool[data-class="TButton"]', `.pane[data-module="Form1"] .surface`, {
    targetPosition: { x: drop.x - (await surface('Form1').boundingBox()).x, y: drop.y - (await surface('Form1').boundingBox()).y },
  });
  await quiet();
  assert.equal(await surface('Form1').locator('g#Button3').count(), 1);
  assert.equal(await page.locator('#tree .node[data-name="Button3"]').count(), 1);
  assert.equal(await inspected(), 'Button3');
  assert.equal(await inspectorValue('Left'), '152');
  assert.equal(await inspectorValue('Top'), '232');

  // Moved with the mouse by (13, 10): the engine snaps it to the grid again.
  const grip = await onSurface('Form1', 162, 240);
  await page.mouse.move(grip.x, grip.y);
  await page.mouse.down();
  await page.mouse.move(grip.x + 7, grip.y + 5, { steps: 3 });
  await page.mouse.move(grip.x + 13, grip.y + 10, { steps: 3 });
  await page.mouse.up();
  assert.equal(await inspectorValue('Left'), '168');
  assert.equal(await inspectorValue('Top'), '240');

  // The caption changes the picture; the name changes the tree.
  await setInInspector('Caption', 'Go');
  assert.equal(await surface('Form1').locator('g#Button3 text', { hasText: 'Go' }).count(), 1);
  await setInInspector('Name', 'GoButton');
  assert.equal(await page.locator('#tree .node[data-name="GoButton"]').count(), 1);
  assert.equal(await page.locator('#tree .node[data-name="Button3"]').count(), 0);

  // Its click event bound to a new handler, which the source shows.
  await setInInspector('OnClick', 'GoClick');
  assert.match(await page.locator('#source').textContent(), /GoClick/);

  assert.equal(await pane('Form1').locator('h3.modified').count(), 1);
  await page.click('#save');
  await quiet();
  assert.equal(await pane('Form1').locator('h3.modified').count(), 0);
  const saved = readFileSync(join(dir, 'Form1.kfm'), 'utf8');
  assert.match(saved, /object GoButton: TButton\n\s+Left = 168\n\s+Top = 240\n/);
  assert.match(saved, /Caption = "Go"/);
  assert.match(saved, /OnClick = GoClick/);
  const tree = execFileSync(formkit, ['tree', join(dir, 'Form1.kfm')], { encoding: 'utf8' });
  assert.match(tree, /^  GoButton \(TButton\)$/m);

  // The screenshot: where the button now stands, its frame and caption are drawn over
  // what was the empty form.
  mkdirSync(screenshots, { recursive: true });
  const shot = join(screenshots, 'studio.png');
  await page.screenshot({ path: shot });
  const after = PNG.sync.read(readFileSync(shot));
  const box = await surface('Form1').locator('g#GoButton').boundingBox();
  const dark = (png, x, y) => pixel(png, x, y).every((channel) => channel < 96);
  let changed = 0;
  let total = 0;
  let caption = 0;
  for (let y = Math.ceil(box.y); y < box.y + box.height; y += 1) {
    for (let x = Math.ceil(box.x); x < box.x + box.width; x += 1) {
      total += 1;
      if (pixel(before, x, y).join() !== pixel(after, x, y).join()) changed += 1;
      const inCaption = Math.abs(x - (box.x + box.width / 2)) < 10 && Math.abs(y - (box.y + box.height / 2)) < 5;
      if (inCaption && dark(after, x, y) && !dark(before, x, y)) caption += 1;
    }
  }
  assert.ok(total > 1000, `the button's box is ${box.width} by ${box.height}`);
  assert.ok(changed / total > 0.15, `only ${changed} of ${total} pixels changed where the button stands`);
  assert.ok(caption > 5, 'its caption is drawn in its middle');
  if (process.env.FK_STUDIO_SCREENSHOT_DOCS === '1') copyFileSync(shot, join(repository, 'docs', 'studio.png'));
});

test('an edit in the ancestor reaches its open descendant', async () => {
  await openModule('Form2.kfm', 'Form2');
  await quiet();
  assert.equal(await pane('Form1').count(), 1, 'both stand side by side');
  await clickOn('Form1', 420, 290);
  assert.equal(await page.locator('.pane.active').getAttribute('data-module'), 'Form1');
  assert.equal(await inspected(), 'Button2');
  await setInInspector('Caption', 'Later');
  assert.equal(await surface('Form2').locator('g#Button2 text', { hasText: 'Later' }).count(), 1);
  // The descendant's own caption stays its own.
  assert.equal(await surface('Form2').locator('g#Button1 text', { hasText: 'Save' }).count(), 1);
});

test('a value the editor refuses is shown with the engine message', async () => {
  await clickOn('Form1', 330, 290);
  assert.equal(await inspected(), 'Button1');
  const left = await inspectorValue('Left');
  const direct = await page.evaluate(async () => {
    const reply = await fetch('/api/modules/Form1/property', {
      method: 'POST',
      headers: { 'Content-Type': 'application/json' },
      body: JSON.stringify({ component: 'Button1', property: 'Left', value: 'abc' }),
    });
    return { status: reply.status, ...(await reply.json()) };
  });
  assert.equal(direct.status, 422);
  await setInInspector('Left', 'abc');
  assert.equal(await message().textContent(), direct.error);
  assert.equal(direct.error, "'abc' is not a valid integer value");
  assert.equal(await message().getAttribute('class'), 'error');
  // The inspector goes back to the engine's value.
  assert.equal(await inspectorValue('Left'), left);
});
