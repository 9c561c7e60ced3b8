#!/usr/bin/env node
// Stands in for qrex-lsp: keeps open documents, answers the commands on generated text (upper case, so that it tells what it
// was made of), and tells back how it was started.
'use strict';

const documents = new Map();
const shown = new Set();
let started;

function send(message) {
  const text = JSON.stringify({ jsonrpc: '2.0', ...message });
  process.stdout.write(`Content-Length: ${Buffer.byteLength(text)}\r\n\r\n${text}`);
}

const generated = (uri) => `// ${documents.has(uri) ? documents.get(uri).toUpperCase() : 'FROM DISK'}`;

const COMMANDS = {
  'qrex.showGenerated'([uri]) {
    if (uri.endsWith('none.cpp')) return null;
    shown.add(uri);
    return { uri, languageId: 'cpp', text: generated(uri) };
  },
  'qrex.hideGenerated'([uri]) {
    shown.delete(uri);
    return null;
  },
  'test.state': () => ({ started, shown: [...shown], documents: [...documents] }),
};

const METHODS = {
  initialize(params) {
    started = { options: params.initializationOptions, arguments: process.argv.slice(2), folder: process.cwd() };
    return {
      capabilities: {
        textDocumentSync: 1,
        hoverProvider: true,
        executeCommandProvider: { commands: Object.keys(COMMANDS) },
      },
    };
  },
  shutdown: () => null,
  'textDocument/hover': () => ({ contents: 'hovered' }),
  'workspace/executeCommand': ({ command, arguments: given }) => COMMANDS[command](given),
  exit: () => process.exit(0),
  'textDocument/didOpen': ({ textDocument: { uri, text, languageId } }) => changed(uri, text, languageId),
  'textDocument/didChange': ({ textDocument: { uri }, contentChanges: [{ text }] }) => changed(uri, text),
};

function changed(uri, text, languageId) {
  documents.set(uri, text);
  const range = { start: { line: 0, character: 0 }, end: { line: 0, character: 1 } };
  const diagnostics = text.includes('wrong') ? [{ range, severity: 1, source: 'qrex', message: `wrong ${languageId || ''}` }] : [];
  send({ method: 'textDocument/publishDiagnostics', params: { uri, diagnostics } });
  if (shown.has(uri)) send({ method: 'qrex/generatedChanged', params: { uri, text: generated(uri) } });
}

let pending = Buffer.alloc(0);
process.stdin.on('data', (part) => {
  pending = Buffer.concat([pending, part]);
  for (;;) {
    const head = pending.indexOf('\r\n\r\n');
    if (head < 0) return;
    const length = Number(/Content-Length: (\d+)/i.exec(pending.subarray(0, head).toString())[1]);
    if (pending.length < head + 4 + length) return;
    const { id, method, params } = JSON.parse(pending.subarray(head + 4, head + 4 + length).toString());
    pending = pending.subarray(head + 4 + length);
    const result = METHODS[method] ? METHODS[method](params) : null;
    if (id !== undefined && method) send({ id, result });
  }
});
process.stdin.on('end', () => process.exit(1));
