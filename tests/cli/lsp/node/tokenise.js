// Tokenises database files by the grammar for VS Code, and compares with what the tool reads:
// tokenise.js TARVIK GRAMMAR DATABASE-DIRECTORY
"use strict";
const assert = require("assert");
const { execFileSync } = require("child_process");
const fs = require("fs");
const path = require("path");
const oniguruma = require("vscode-oniguruma");
const textmate = require("vscode-textmate");

const [tarvik, grammarPath, database] = process.argv.slice(2);

async function loadGrammar() {
  const wasm = fs.readFileSync(path.join(path.dirname(require.resolve("vscode-oniguruma")), "onig.wasm"));
  await oniguruma.loadWASM(wasm.buffer.slice(wasm.byteOffset, wasm.byteOffset + wasm.byteLength));
  const registry = new textmate.Registry({
    onigLib: Promise.resolve({
      createOnigScanner: (patterns) => new oniguruma.OnigScanner(patterns),
      createOnigString: (text) => new oniguruma.OnigString(text),
    }),
    loadGrammar: async () => textmate.parseRawGrammar(fs.readFileSync(grammarPath, "utf8"), grammarPath),
  });
  return registry.loadGrammar("source.acd");
}

// All tokens that are not blank, as [text, innermost scope].
function tokensOf(grammar, text) {
  const tokens = [];
  let state = textmate.INITIAL;
  for (const line of text.split("\n")) {
    const result = grammar.tokenizeLine(line, state);
    state = result.ruleStack;
    for (const token of result.tokens) {
      const part = line.slice(token.startIndex, token.endIndex);
      if (part.trim() !== "") {
        tokens.push([part, token.scopes[token.scopes.length - 1]]);
      }
    }
  }
  return tokens;
}

const withScope = (tokens, scope) => tokens.filter((token) => token[1] === scope).map((token) => token[0]);

async function main() {
  const grammar = await loadGrammar();
  let devices = [];
  let files = 0;
  for (const name of fs.readdirSync(database).filter((each) => each.endsWith(".acd"))) {
    const tokens = tokensOf(grammar, fs.readFileSync(path.join(database, name), "utf8"));
    for (const [part, scope] of tokens) {
      assert.ok(!scope.startsWith("invalid") && scope !== "source.acd", `${name}: ${part} is ${scope}`);
    }
    devices = devices.concat(withScope(tokens, "entity.name.section.acd"));
    assert.ok(withScope(tokens, "variable.other.key.acd").every((key) => /^[A-Z0-9_]+$/.test(key)), name);
    ++files;
  }
  const known = JSON.parse(execFileSync(tarvik, ["--database", database, "--json", "devices"], { maxBuffer: 1 << 26 }));
  const names = known.devices.filter((device) => device.family !== "spi").map((device) => device.name);
  assert.ok(files > 2 && names.length > 10);
  assert.deepStrictEqual(devices.sort(), names.sort());

  const scopesOf = (text) => tokensOf(grammar, text).map((token) => token[1].replace(".acd", ""));
  assert.deepStrictEqual(scopesOf("KEY += a,1"), [
    "variable.other.key",
    "keyword.operator.assignment",
    "string.unquoted",
    "punctuation.separator.field",
    "constant.numeric",
  ]);
  assert.deepStrictEqual(scopesOf("K = a, \\\n # [b]\n[C]").slice(-4), [
    "string.unquoted", // a continuation, whatever it looks like
    "punctuation.section.begin",
    "entity.name.section",
    "punctuation.section.end",
  ]);
  for (const malformed of ["no equals sign", "[open", "[a b]", "[a] b", "[]"]) {
    assert.match(scopesOf(malformed)[0], /^invalid/, malformed);
  }
}

main().catch((error) => {
  console.error(error);
  process.exit(1);
});
