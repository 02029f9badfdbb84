// Starts `formkit studio` on a fresh copy of the examples, for one test file.
import { spawn } from 'node:child_process';
import { cpSync, mkdirSync, mkdtempSync, readdirSync, readFileSync, rmSync } from 'node:fs';
import { dirname, join, resolve } from 'node:path';
import { fileURLToPath } from 'node:url';

export const repository = resolve(dirname(fileURLToPath(import.meta.url)), '..', '..');
export const formkit = resolve(repository, process.env.FORMKIT ?? 'build/release/host/formkit');

/** A copy of examples/ under build/studio-e2e, its files only. */
export function copyOfExamples() {
  const parent = join(repository, 'build', 'studio-e2e');
  mkdirSync(parent, { recursive: true });
  const dir = mkdtempSync(join(parent, 'examples-'));
  for (const file of readdirSync(join(repository, 'examples'), { withFileTypes: true })) {
    if (file.isFile()) cpSync(join(repository, 'examples', file.name), join(dir, file.name));
  }
  return dir;
}

/** Every file of `dir` with its bytes. */
export function filesOf(dir) {
  const files = {};
  for (const name of readdirSync(dir).sort()) files[name] = readFileSync(join(dir, name)).toString('base64');
  return files;
}

/** Runs the studio over `dir` on a port the system picks; resolves once it listens. */
export function startStudio(dir) {
  return new Promise((resolvePromise, reject) => {
    const child = spawn(formkit, ['studio', dir, '--port', '0'], { stdio: ['ignore', 'pipe', 'pipe'] });
    let output = '';
    const fail = (why) => reject(new Error(`formkit studio did not start: ${why}\n${output}`));
    child.on('error', (error) => fail(error.message));
    child.on('exit', (code) => fail(`exit ${code}`));
    child.stderr.on('data', (chunk) => (output += chunk));
    child.stdout.on('data', (chunk) => {
      output += chunk;
      const found = output.match(/^formkit studio: serving (.*) at (http:\/\/127\.0\.0\.1:\d+\/)$/m);
      if (found) resolvePromise({ url: found[2], served: found[1], stop: () => stopStudio(child) });
    });
  });
}

function stopStudio(child) {
  return new Promise((resolvePromise) => {
    if (child.exitCode !== null) return resolvePromise(child.exitCode);
    child.removeAllListeners('exit');
    child.on('exit', (code) => resolvePromise(code));
    child.kill('SIGTERM');
  });
}

export function removeCopy(dir) {
  rmSync(dir, { recursive: true, force: true });
}
