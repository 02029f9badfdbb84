// The studio's server refuses bad requests with the engine's message and changes nothing.
import assert from 'node:assert/strict';
import { after, before, test } from 'node:test';
import { request } from 'node:http';

import { copyOfExamples, filesOf, removeCopy, startStudio } from './server.mjs';

let dir;
let studio;

before(async () => {
  dir = copyOfExamples();
  studio = await startStudio(dir);
});

after(async () => {
  assert.equal(await studio.stop(), 0, 'the studio ends cleanly when it is stopped');
  removeCopy(dir);
});

/** A request with a raw path and body, as a browser would never send it. */
function raw(method, path, body) {
  const { hostname, port } = new URL(studio.url);
  return new Promise((resolvePromise, reject) => {
    const call = request({ hostname, port, method, path, headers: { 'Content-Type': 'application/json' } }, (reply) => {
      let text = '';
      reply.on('data', (chunk) => (text += chunk));
      reply.on('end', () => resolvePromise({ status: reply.statusCode, text, type: reply.headers['content-type'] }));
    });
    call.on('error', reject);
    if (body !== undefined) call.write(body);
    call.end();
  });
}

async function refused(method, path, body) {
  const reply = await raw(method, path, body);
  return { status: reply.status, error: JSON.parse(reply.text).error };
}

test('bad requests are answered with their status and the engine message, and no file changes', async () => {
  assert.equal((await raw('POST', '/api/open', '{"file": "Form1.kfm"}')).status, 200);
  const before = filesOf(dir);
  const served = studio.served;
  const cases = [
    ['POST', '/api/open', '{"file": ', 400, /^The request is not valid JSON: /],
    ['POST', '/api/open', '"Form1.kfm"', 400, 'The request must be a JSON object'],
    ['POST', '/api/open', '{"file": "../x.kfm"}', 403, `../x.kfm lies outside ${served}`],
    ['POST', '/api/open', '{"file": "/etc/passwd.kfm"}', 403, `/etc/passwd.kfm lies outside ${served}`],
    ['POST', '/api/new', '{"file": "../../Form9.kfm"}', 403, `../../Form9.kfm lies outside ${served}`],
    ['GET', '/api/modules/Form7', undefined, 404, "no open module is named 'Form7'"],
    ['POST', '/api/modules/Form1/property', '{"component": "Button9", "property": "Caption", "value": "x"}', 404,
      "Module Form1 has no component named 'Button9'"],
    ['POST', '/api/modules/Form1/property', '{"component": "Button1", "property": "Colour", "value": "x"}', 404,
      "Component Button1 has no property 'Colour'"],
    ['POST', '/api/modules/Form1/property', '{"component": "Button1", "property": "Left", "value": "abc"}', 422,
      "'abc' is not a valid integer value"],
    ['POST', '/api/modules/Form1/bind', '{"component": "Button1", "event": "OnClick", "handler": "not a name"}', 422,
      "'not a name' is not a valid method name"],
  ];
  for (const [method, path, body, status, message] of cases) {
    const reply = await refused(method, path, body);
    assert.equal(reply.status, status, `${method} ${path} ${body}`);
    assert.equal(typeof reply.error, 'string');
    if (message instanceof RegExp) assert.match(reply.error, message);
    else if (message !== undefined) assert.equal(reply.error, message);
  }
  assert.deepEqual(filesOf(dir), before);
  const state = JSON.parse((await raw('GET', '/api/modules/Form1')).text);
  assert.equal(state.modified, false, 'no refused request changed the module');
});

test('nothing outside the page and the API is served', async () => {
  for (const path of ['/../../etc/passwd', '/api/../README.md', '/%2e%2e/%2e%2e/etc/passwd', '/Form1.kfm', '/studio/API.md']) {
    const reply = await raw('GET', path);
    assert.ok(reply.status >= 400, `${path} answered ${reply.status}`);
    assert.doesNotMatch(reply.text, /root:|object Form1/, path);
  }
  const page = await raw('GET', '/');
  assert.equal(page.status, 200);
  assert.match(page.type, /^text\/html/);
  assert.match((await raw('GET', '/studio.js')).type, /^text\/javascript/);
});
