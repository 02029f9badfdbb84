// The studio's page. Every change is a request to the engine (host/studio/API.md); the
// page draws what the engine answers and nothing else, so the surfaces, the inspector and
// the tree are always the engine's own. Requests go one at a time, in the order the user
// made them; pointer moves that pile up while one is in flight are sent as one.

const $ = (selector, root = document) => root.querySelector(selector);
const $$ = (selector, root = document) => [...root.querySelectorAll(selector)];

/** The open modules' last states, by name, in the order their panes stand. */
const modules = new Map();
/** The module the inspector, tree and source show; the palette and commands act on it. */
let active = null;

//===----------------------------------------------------------------------===//
// Talking to the engine
//===----------------------------------------------------------------------===//

class EngineError extends Error {}

async function send(method, path, body) {
  const init = { method, headers: {} };
  if (body !== undefined) {
    init.headers['Content-Type'] = 'application/json';
    init.body = JSON.stringify(body);
  }
  const reply = await fetch(path, init);
  const data = await reply.json().catch(() => ({ error: `${reply.status} ${reply.statusText}` }));
  if (!reply.ok) throw new EngineError(data.error ?? String(reply.status));
  return data;
}

let queue = Promise.resolve();
let pending = 0;

/** Counts the jobs not done yet on the page's body, so a script can wait for quiet. */
function countPending(change) {
  pending += change;
  document.body.dataset.pending = String(pending);
}

/** Runs `job` after every job queued before it; a failure shows its message verbatim. */
function serial(job) {
  countPending(+1);
  const run = queue.then(job).catch((error) => {
    showMessage(error.message, true);
    throw error;
  });
  queue = run.catch(() => {}).finally(() => countPending(-1));
  return run;
}

function showMessage(text, isError = false) {
  const line = $('#message');
  line.textContent = text;
  line.classList.toggle('error', isError);
}

const modulePath = (name, action = '') =>
  `/api/modules/${encodeURIComponent(name)}${action ? `/${action}` : ''}`;

/** Asks the module `name` to do `action`, then redraws everything the change may reach. */
function change(name, action, body = {}) {
  return serial(async () => {
    const state = await send('POST', modulePath(name, action), body);
    showMessage('');
    await redrawAfter(state);
    return state;
  });
}

async function redrawAfter(state) {
  drawModule(state);
  // An ancestor's change reaches its open descendants: every other pane asks again.
  for (const name of [...modules.keys()]) {
    if (name !== state.name) drawModule(await send('GET', modulePath(name)));
  }
  if (active === state.name) await drawSide(state);
}

//===----------------------------------------------------------------------===//
// Module panes
//===----------------------------------------------------------------------===//

function paneOf(name) {
  let pane = $(`.pane[data-module="${CSS.escape(name)}"]`);
  if (pane) return pane;
  pane = document.createElement('div');
  pane.className = 'pane';
  pane.dataset.module = name;
  const title = document.createElement('h3');
  const surface = document.createElement('div');
  surface.className = 'surface';
  surface.tabIndex = 0;
  pane.append(title, surface);
  $('#surfaces').append(pane);
  listenToSurface(surface, name);
  return pane;
}

function drawModule(state) {
  modules.set(state.name, state);
  const pane = paneOf(state.name);
  const title = $('h3', pane);
  title.textContent = `${state.name} (${state.file})`;
  title.classList.toggle('modified', state.modified);
  const picture = new DOMParser().parseFromString(state.svg, 'image/svg+xml').documentElement;
  $('.surface', pane).replaceChildren(document.importNode(picture, true));
  if (state.name === active) showArmed(state.tool);
  refreshAncestors();
}

/** The palette shows which class the next press creates; the arrow when none. */
function showArmed(className) {
  for (const tool of $$('#palette .tool')) tool.classList.toggle('armed', tool.dataset.class === className);
}

function activate(moduleName) {
  if (active === moduleName) return;
  active = moduleName;
  for (const pane of $$('.pane')) pane.classList.toggle('active', pane.dataset.module === moduleName);
  const state = modules.get(moduleName);
  if (!state) return;
  showArmed(state.tool);
  serial(() => drawSide(modules.get(moduleName))).catch(() => {});
}

/** The surface's coordinates of a pointer event: those of the module's picture. */
function surfacePoint(surface, event) {
  const svg = $(':scope > svg', surface);
  const box = svg.getBoundingClientRect();
  const width = svg.viewBox.baseVal?.width || box.width;
  const height = svg.viewBox.baseVal?.height || box.height;
  return {
    x: Math.round(((event.clientX - box.left) * width) / box.width),
    y: Math.round(((event.clientY - box.top) * height) / box.height),
  };
}

const shiftOf = (event) =>
  [event.shiftKey && 'shift', event.ctrlKey && 'ctrl', event.altKey && 'alt'].filter(Boolean);

function listenToSurface(surface, moduleName) {
  let pressed = false;
  let pendingMove = null;

  surface.addEventListener('pointerdown', (event) => {
    if (event.button !== 0) return;
    activate(moduleName);
    surface.focus();
    surface.setPointerCapture(event.pointerId);
    pressed = true;
    change(moduleName, 'mouse', { action: 'down', ...surfacePoint(surface, event), shift: shiftOf(event) }).catch(() => {});
    event.preventDefault();
  });
  surface.addEventListener('pointermove', (event) => {
    if (!pressed) return;
    const queued = pendingMove !== null;
    pendingMove = surfacePoint(surface, event);
    if (queued) return; // the move already waiting in the queue takes this point
    serial(async () => {
      const point = pendingMove;
      pendingMove = null;
      drawModule(await send('POST', modulePath(moduleName, 'mouse'), { action: 'move', ...point }));
    }).catch(() => {});
  });
  surface.addEventListener('pointerup', (event) => {
    if (!pressed) return;
    pressed = false;
    change(moduleName, 'mouse', { action: 'up', ...surfacePoint(surface, event) }).catch(() => {});
  });

  surface.addEventListener('keydown', (event) => {
    const keys = { ArrowLeft: 'left', ArrowRight: 'right', ArrowUp: 'up', ArrowDown: 'down', Tab: 'tab',
      Enter: 'enter', Escape: 'escape', Delete: 'delete' };
    const clipboard = { c: 'copy', x: 'cut', v: 'paste' };
    if (event.ctrlKey && clipboard[event.key]) {
      change(moduleName, 'command', { command: clipboard[event.key] }).catch(() => {});
    } else if (keys[event.key]) {
      change(moduleName, 'key', { key: keys[event.key], shift: shiftOf(event) }).catch(() => {});
    } else {
      return;
    }
    event.preventDefault();
  });

  // A class dragged from the palette is created where it is dropped.
  surface.addEventListener('dragover', (event) => {
    if (event.dataTransfer.types.includes('application/x-formkit-class')) event.preventDefault();
  });
  surface.addEventListener('drop', (event) => {
    const className = event.dataTransfer.getData('application/x-formkit-class');
    if (!className) return;
    event.preventDefault();
    activate(moduleName);
    change(moduleName, 'create', { class: className, ...surfacePoint(surface, event) }).catch(() => {});
  });
}

//===----------------------------------------------------------------------===//
// The side: inspector, structure tree, source
//===----------------------------------------------------------------------===//

async function drawSide(state) {
  drawTree(state);
  $('#source').textContent = state.source;
  await drawInspector(state.name);
}

function drawTree(state) {
  const selected = new Set(state.selection);
  const item = (node) => {
    const li = document.createElement('li');
    const label = document.createElement('span');
    label.className = 'node';
    label.textContent = node.caption;
    if (node.name) {
      label.dataset.name = node.name;
      label.classList.toggle('selected', selected.has(node.name));
      label.addEventListener('click', () => change(state.name, 'select', { names: [node.name] }).catch(() => {}));
    }
    li.append(label);
    if (node.children?.length) {
      const list = document.createElement('ul');
      list.append(...node.children.map(item));
      li.append(list);
    }
    return li;
  };
  $('#tree').replaceChildren(...(state.tree?.caption ? [item(state.tree)] : []));
}

async function drawInspector(moduleName) {
  const data = await send('GET', modulePath(moduleName, 'inspector'));
  if (moduleName !== active) return;
  const component = data.components[0];
  $('#inspected').textContent = component;
  const body = $('#inspector tbody');
  body.replaceChildren(...data.properties.map((property) => inspectorRow(moduleName, component, property)));
}

function inspectorRow(moduleName, component, property) {
  const row = document.createElement('tr');
  row.dataset.property = property.name;
  row.classList.toggle('event', property.kind === 'event');
  const label = document.createElement('td');
  label.textContent = property.name;
  const cell = document.createElement('td');
  const editor = property.values.length && !property.readOnly ? valueList(property) : document.createElement('input');
  editor.value = property.value;
  editor.disabled = property.readOnly;
  const commit = () => {
    if (editor.value === property.value) return;
    const body = property.kind === 'event'
      ? { component, event: property.name, handler: editor.value }
      : { component, property: property.name, value: editor.value };
    // A refused value: the message stays shown and the editor goes back to the engine's value.
    change(moduleName, property.kind === 'event' ? 'bind' : 'property', body)
      .catch(() => serial(() => drawInspector(moduleName)));
  };
  if (editor.tagName === 'SELECT') {
    editor.addEventListener('change', commit);
  } else {
    editor.addEventListener('keydown', (event) => {
      if (event.key === 'Enter') commit();
      if (event.key === 'Escape') editor.value = property.value;
    });
    editor.addEventListener('blur', commit);
  }
  cell.append(editor);
  row.append(label, cell);
  return row;
}

function valueList(property) {
  const list = document.createElement('select');
  const values = property.values.includes(property.value) ? property.values : [property.value, ...property.values];
  list.append(...values.map((value) => new Option(value, value)));
  return list;
}

//===----------------------------------------------------------------------===//
// The bar and the palette
//===----------------------------------------------------------------------===//

function refreshAncestors() {
  const list = $('#new-ancestor');
  const chosen = list.value;
  list.replaceChildren(new Option('no ancestor', ''), ...[...modules.keys()].map((n) => new Option(n, n)));
  list.value = modules.has(chosen) ? chosen : '';
}

async function openModule(body, path) {
  return serial(async () => {
    const state = await send('POST', path, body);
    showMessage('');
    drawModule(state);
    active = null;
    activate(state.name);
    return state;
  });
}

function requireActive() {
  if (active) return true;
  showMessage('Open a module first.', true);
  return false;
}

async function start() {
  const [files, palette] = await Promise.all([send('GET', '/api/files'), send('GET', '/api/palette')]);
  $('#files').replaceChildren(...files.files.map((file) => new Option(file, file)));
  for (const className of palette.classes) {
    const tool = document.createElement('button');
    tool.type = 'button';
    tool.className = 'tool';
    tool.dataset.class = className;
    tool.textContent = className;
    tool.draggable = true;
    tool.addEventListener('dragstart', (event) => {
      event.dataTransfer.setData('application/x-formkit-class', className);
      event.dataTransfer.effectAllowed = 'copy';
    });
    $('#palette').append(tool);
  }
  $('#palette').addEventListener('click', (event) => {
    const tool = event.target.closest('.tool');
    if (tool && requireActive()) change(active, 'tool', { class: tool.dataset.class }).catch(() => {});
  });
  $('#open').addEventListener('click', () => openModule({ file: $('#files').value }, '/api/open').catch(() => {}));
  $('#new').addEventListener('click', () => {
    const body = { file: $('#new-file').value.trim() };
    if ($('#new-ancestor').value) body.ancestor = $('#new-ancestor').value;
    openModule(body, '/api/new').catch(() => {});
  });
  $('#save').addEventListener('click', () => {
    if (requireActive()) change(active, 'save').catch(() => {});
  });
  for (const button of $$('#bar [data-command]')) {
    button.addEventListener('click', () => {
      if (!requireActive()) return;
      const body = { command: button.dataset.command };
      if (button.dataset.how) body.how = button.dataset.how;
      change(active, 'command', body).catch(() => {});
    });
  }
  for (const module of (await send('GET', '/api/modules')).modules) {
    drawModule(await send('GET', modulePath(module.name)));
    activate(module.name);
  }
  document.body.dataset.ready = 'true';
}

start().catch((error) => showMessage(error.message, true));
