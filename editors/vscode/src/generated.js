// The generated texts that are shown, kept as the server tells them.
'use strict';

const SHOW = 'qrex.showGenerated';
const HIDE = 'qrex.hideGenerated';

/** @typedef {{uri: string, languageId: string, text: string}} Generated */

class GeneratedTexts {
  /**
   * @param {(command: string, uri: string) => Promise<any>} execute runs a command of the server
   * @param {(uri: string) => void} changed called when a text that is shown has become another
   */
  constructor(execute, changed) {
    this._execute = execute;
    this._changed = changed;
    /** @type {Map<string, string>} */
    this._texts = new Map();
  }

  /**
   * @param {string} uri of the source
   * @returns {Promise<Generated>}
   */
  async show(uri) {
    const answer = await this._execute(SHOW, uri);
    if (!answer || typeof answer.text !== 'string') throw new Error('There is no generated text of this file');
    this._texts.set(uri, answer.text);
    return answer;
  }

  /** @param {string} uri */
  text(uri) {
    return this._texts.get(uri);
  }

  /**
   * What the server tells of a text that has just been closed is dropped.
   * @param {{uri: string, text: string}} notification
   */
  update({ uri, text }) {
    if (!this._texts.has(uri) || this._texts.get(uri) === text) return;
    this._texts.set(uri, text);
    this._changed(uri);
  }

  /** @param {string} uri */
  async hide(uri) {
    if (this._texts.delete(uri)) await this._execute(HIDE, uri);
  }

  /** A server that has been started anew knows of nothing that is shown. */
  async showAgain() {
    for (const [uri, before] of [...this._texts]) {
      const { text } = await this.show(uri).catch(() => ({ text: before }));
      if (text !== before) this._changed(uri);
    }
  }
}

module.exports = { GeneratedTexts };
