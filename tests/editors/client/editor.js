// As much of the editor's interface as the extension and its client of the language server ask for, without a window: documents,
// settings, commands, and what was registered and shown. Classes that nothing here looks into are empty ones.
'use strict';

const path = require('path');
const { pathToFileURL, fileURLToPath } = require('url');

class Disposable {
  constructor(end = () => undefined) {
    this.dispose = end;
  }
}

class EventEmitter {
  constructor() {
    this.listeners = new Set();
    this.event = (listener, self) => {
      const bound = self ? listener.bind(self) : listener;
      this.listeners.add(bound);
      return new Disposable(() => this.listeners.delete(bound));
    };
  }
  fire(value) {
    return [...this.listeners].map((listener) => listener(value));
  }
  dispose() {
    this.listeners.clear();
  }
}

class Uri {
  constructor(scheme, at, query = '') {
    Object.assign(this, { scheme, path: at, query, authority: '', fragment: '', fsPath: at });
  }
  static file = (at) => new Uri('file', at);
  static from = ({ scheme, path: at, query }) => new Uri(scheme, at, query);
  static parse(text) {
    if (text.startsWith('file:')) return Uri.file(fileURLToPath(text));
    const [, scheme, at, query] = /^([\w-]+):([^?]*)\??(.*)$/.exec(text);
    return new Uri(scheme, decodeURIComponent(at), decodeURIComponent(query));
  }
  toString() {
    if (this.scheme === 'file') return pathToFileURL(this.path).href;
    return `${this.scheme}:${encodeURI(this.path)}?${encodeURIComponent(this.query)}`;
  }
  with = (change) => Object.assign(new Uri(this.scheme, this.path, this.query), change);
}

class Position {
  constructor(line, character) {
    Object.assign(this, { line, character });
  }
}

class Range {
  constructor(start, end) {
    Object.assign(this, { start, end });
  }
}

class Diagnostic {
  constructor(range, message, severity) {
    Object.assign(this, { range, message, severity });
  }
}

class CancellationTokenSource {
  token = { isCancellationRequested: false, onCancellationRequested: new EventEmitter().event };
  cancel() {}
  dispose() {}
}

class Task {
  constructor(definition, scope, name, source, execution, matchers) {
    Object.assign(this, { definition, scope, name, source, execution, matchers });
  }
}

class ProcessExecution {
  constructor(command, given, options) {
    Object.assign(this, { process: command, args: given, options });
  }
}

// A module whose unknown capitalised names are empty classes and whose unknown events never come.
const lenient = (known) =>
  new Proxy(known, {
    get(target, name) {
      if (typeof name !== 'string' || name in target) return target[name];
      if (/^on(Did|Will)[A-Z]/.test(name)) return new EventEmitter().event;
      if (/^register[A-Z]|^create[A-Z]/.test(name)) return () => new Disposable();
      return /^[A-Z]/.test(name) ? (target[name] = class {}) : undefined;
    },
  });

/** An editor with one folder open; `files` are what is found there, by their names. */
function makeEditor(folder, settings, files) {
  const editor = { diagnostics: new Map(), commands: new Map(), providers: new Map(), errors: [], shown: [], tasks: new Map() };
  const [opened, closed, changed, configured] = [0, 0, 0, 0].map(() => new EventEmitter());
  const documents = [];

  const makeDocument = (uri, languageId, text) => ({
    uri, languageId, version: 1, isClosed: false, fileName: uri.fsPath, getText: () => text, set: (next) => (text = next),
  });

  editor.open = (name, languageId, text) => {
    const document = makeDocument(Uri.file(path.join(folder, name)), languageId, text);
    documents.push(document);
    opened.fire(document);
    vscode.window.activeTextEditor = { document };
    return document;
  };
  editor.edit = (document, text) => {
    document.set(text);
    ++document.version;
    changed.fire({ document, contentChanges: [{ text }], reason: undefined });
  };
  editor.close = (document) => {
    documents.splice(documents.indexOf(document), 1);
    closed.fire(document);
  };
  editor.configure = (name, value) => {
    settings[name] = value;
    return Promise.all(configured.fire({ affectsConfiguration: (asked) => `${asked}.${name}` === `qrex.${name}` }));
  };
  editor.run = (command) => editor.commands.get(command)();

  const vscode = lenient({
    Disposable, EventEmitter, Uri, Position, Range, Diagnostic, CancellationTokenSource, Task, ProcessExecution,
    version: '1.82.0',
    DiagnosticSeverity: { Error: 0, Warning: 1, Information: 2, Hint: 3 },
    CodeActionKind: { Empty: { append: () => ({}) } },
    TaskGroup: { Build: 'build', Clean: 'clean' },
    ViewColumn: { Beside: -2 },
    env: { language: 'en', appName: 'test', onDidChangeTelemetryEnabled: new EventEmitter().event },
    extensions: lenient({ all: [], getExtension: () => undefined }),
    l10n: { t: (text) => text },
    languages: lenient({
      createDiagnosticCollection: () => ({
        set: (uri, list) => editor.diagnostics.set(uri.toString(), list),
        delete: (uri) => editor.diagnostics.delete(uri.toString()),
        clear: () => editor.diagnostics.clear(),
        dispose() {},
      }),
      match: (selector, document) =>
        [selector].flat().some((one) => one.language === document.languageId && one.scheme === document.uri.scheme) ? 10 : 0,
      async setTextDocumentLanguage(document, languageId) {
        closed.fire(document);  // as the editor tells it
        document.languageId = languageId;
        opened.fire(document);
        return document;
      },
    }),
    commands: lenient({
      registerCommand(name, call) {
        if (editor.commands.has(name)) throw new Error(`command '${name}' already exists`);
        editor.commands.set(name, call);
        return new Disposable(() => editor.commands.delete(name));
      },
      executeCommand: async () => undefined,
    }),
    tasks: lenient({ registerTaskProvider: (type, provider) => (editor.tasks.set(type, provider), new Disposable()) }),
    window: lenient({
      activeTextEditor: undefined,
      visibleTextEditors: [],
      tabGroups: { all: [], onDidChangeTabs: new EventEmitter().event, onDidChangeTabGroups: new EventEmitter().event },
      createOutputChannel: () => ({ append() {}, appendLine() {}, show() {}, clear() {}, dispose() {} }),
      showErrorMessage: async (text) => void editor.errors.push(text),
      showTextDocument: async (document) => void editor.shown.push(document),
    }),
    workspace: lenient({
      workspaceFolders: [{ uri: Uri.file(folder), name: path.basename(folder), index: 0 }],
      textDocuments: documents,
      notebookDocuments: [],
      onDidOpenTextDocument: opened.event,
      onDidCloseTextDocument: closed.event,
      onDidChangeTextDocument: changed.event,
      onDidChangeConfiguration: configured.event,
      getConfiguration: (section) => ({
        get: (name, fallback) => (section === 'qrex' && name in settings ? settings[name] : fallback),
      }),
      createFileSystemWatcher: () => lenient(new Disposable()),
      registerTextDocumentContentProvider(scheme, provider) {
        editor.providers.set(scheme, provider);
        provider.onDidChange((uri) => {
          const document = documents.find((one) => one.uri.toString() === uri.toString());
          if (document) Promise.resolve(provider.provideTextDocumentContent(uri)).then((text) => document.set(text));
        });
        return new Disposable();
      },
      async openTextDocument(uri) {
        const text = await editor.providers.get(uri.scheme).provideTextDocumentContent(uri);
        const document = makeDocument(uri, 'plaintext', text);
        documents.push(document);
        opened.fire(document);
        return document;
      },
      findFiles: async () => files.map((name) => Uri.file(path.join(folder, name))),
    }),
    RelativePattern: class {
      constructor(base, pattern) {
        Object.assign(this, { base, pattern });
      }
    },
  });
  editor.module = vscode;
  return editor;
}

module.exports = { Uri, makeEditor };
