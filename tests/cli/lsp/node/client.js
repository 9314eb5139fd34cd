// Speaks with `tarvik lsp` by the protocol library of VS Code: client.js TARVIK DATABASE-DIRECTORY
"use strict";
const assert = require("assert");
const { spawn } = require("child_process");
const fs = require("fs");
const os = require("os");
const path = require("path");
const { pathToFileURL } = require("url");
const lsp = require("vscode-languageserver-protocol/node");

const [tarvik, database] = process.argv.slice(2);

async function main() {
  const directory = fs.mkdtempSync(path.join(os.tmpdir(), "tarvik-client-"));
  fs.cpSync(database, directory, { recursive: true });
  const uriOf = (name) => pathToFileURL(path.join(directory, name)).toString();
  const textOf = (name) => fs.readFileSync(path.join(directory, name), "utf8");

  const server = spawn(tarvik, ["lsp"], { stdio: ["pipe", "pipe", "inherit"] });
  const ended = new Promise((resolve) => server.on("exit", resolve));
  const connection = lsp.createProtocolConnection(server.stdout, server.stdin, console);
  const published = new Map();
  let wake = () => {};
  connection.onNotification(lsp.PublishDiagnosticsNotification.type, (params) => {
    published.set(params.uri, params.diagnostics);
    wake();
  });
  let watched = false;
  connection.onRequest(lsp.RegistrationRequest.type, () => {
    watched = true;
  });
  connection.listen();

  const until = async (condition) => {
    while (!condition()) {
      await new Promise((resolve) => (wake = resolve));
    }
  };
  const change = (name, version, text) =>
    connection.sendNotification(lsp.DidChangeTextDocumentNotification.type, {
      textDocument: { uri: uriOf(name), version },
      contentChanges: [{ text }],
    });

  const initialized = await connection.sendRequest(lsp.InitializeRequest.type, {
    processId: process.pid,
    rootUri: pathToFileURL(directory).toString(),
    capabilities: {
      general: { positionEncodings: ["utf-16"] },
      workspace: { didChangeWatchedFiles: { dynamicRegistration: true } },
    },
  });
  assert.strictEqual(initialized.capabilities.positionEncoding, "utf-16");
  await connection.sendNotification(lsp.InitializedNotification.type, {});

  const name = "kestrel.acd";
  const text = textOf(name);
  await connection.sendNotification(lsp.DidOpenTextDocumentNotification.type, {
    textDocument: { uri: uriOf(name), languageId: "acd", version: 1, text },
  });
  await until(() => published.has(uriOf(name)));
  assert.deepStrictEqual(published.get(uriOf(name)), []);

  await change(name, 2, text.replace(/^OPERATION/m, "OPERATOIN"));
  await until(() => published.get(uriOf(name)).some((each) => each.code === "K102"));
  const finding = published.get(uriOf(name)).find((each) => each.code === "K102");
  const actions = await connection.sendRequest(lsp.CodeActionRequest.type, {
    textDocument: { uri: uriOf(name) },
    range: finding.range,
    context: { diagnostics: [finding] },
  });
  assert.strictEqual(actions.length, 1);
  assert.strictEqual(actions[0].edit.changes[uriOf(name)][0].newText, "OPERATION");
  await change(name, 3, text);
  await until(() => published.get(uriOf(name)).length === 0);

  const lines = text.split("\n");
  const header = lines.findIndex((line) => line.startsWith("[KS50]"));
  const position = { line: header, character: 2 };
  const document = { textDocument: { uri: uriOf(name) } };
  const hover = await connection.sendRequest(lsp.HoverRequest.type, { ...document, position });
  assert.match(hover.contents.value, /device \*\*KS50\*\* of family kestrel/);
  const references = await connection.sendRequest(lsp.ReferencesRequest.type, {
    ...document,
    position,
    context: { includeDeclaration: false },
  });
  assert.ok(references.some((each) => each.uri === uriOf("base.acd")));
  const renaming = await connection.sendRequest(lsp.RenameRequest.type, { ...document, position, newName: "KS51" });
  assert.deepStrictEqual(Object.keys(renaming.changes).sort(), [uriOf("base.acd"), uriOf(name)].sort());
  const completion = await connection.sendRequest(lsp.CompletionRequest.type, {
    ...document,
    position: { line: lines.length - 1, character: 0 },
  });
  assert.ok(completion.items.some((item) => item.label === "PROPERTIES"));
  const symbols = await connection.sendRequest(lsp.DocumentSymbolRequest.type, document);
  assert.ok(symbols.some((symbol) => symbol.name === "KS50"));
  const formatting = await connection.sendRequest(lsp.DocumentFormattingRequest.type, {
    ...document,
    options: { tabSize: 4, insertSpaces: true },
  });
  assert.deepStrictEqual(formatting, []);
  await assert.rejects(connection.sendRequest("no/such", {}), (error) => error.code === lsp.ErrorCodes.MethodNotFound);

  assert.ok(watched);
  await connection.sendRequest(lsp.ShutdownRequest.type);
  await connection.sendNotification(lsp.ExitNotification.type);
  assert.strictEqual(await ended, 0);
  connection.dispose();
  fs.rmSync(directory, { recursive: true });
}

main().catch((error) => {
  console.error(error);
  process.exit(1);
});
