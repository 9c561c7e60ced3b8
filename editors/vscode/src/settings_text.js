// Files `.inc` are of many languages. Those of ours are told by their first statement.
'use strict';

const COMMENT = /^(?:\s|@?\/\/[^\n]*|@?\/\*[\s\S]*?\*\/)+/;
// Macros may stand ahead of statements; C++ has them, too, but no statement of ours behind them.
const MACROS = new RegExp(
  ['@\\s*(?:import|importpath)\\s*"[^"\\n]*"', '@\\s*def\\b[^\\n{]*=\\s*\\{[^}]*\\}', '@\\s*(?:def|let|assert|println?)\\b[^\\n]*']
    .map((one) => `^${one}`)
    .join('|'),
);
const STATEMENT = new RegExp(
  [
    '[+-](?:cpp|rc|link)\\b\\s*[({]',
    '\\$[A-Za-z_]\\w*\\s*=\\s*"',
    '(?:config|subproj|toolfiles)\\s*\\{',
    'directories\\s*[-+["]',
    '(?:general|prebuildevent|prelinkevent|postbuildevent)\\s*[({]',
    '[A-Za-z]\\w*\\s*\\+?=\\s*(?:[{"]|true\\b|false\\b|\\w+\\s*$)',
    '(?:PATH|INCLUDE|LIB)\\s*\\(\\s*"',
  ].join('|'),
  'my',
);

/** @param {string} text */
function looksLikeSettings(text) {
  let rest = text.slice(0, 20000);
  for (;;) {
    const before = rest.length;
    rest = rest.replace(COMMENT, '').replace(MACROS, '');
    if (rest.length === before) break;
  }
  STATEMENT.lastIndex = 0;
  return STATEMENT.test(rest);
}

module.exports = { looksLikeSettings };
