// Starts the language server; everything else is in the server.
const { workspace } = require("vscode");
const { LanguageClient } = require("vscode-languageclient/node");

let client;

exports.activate = () => {
  const settings = workspace.getConfiguration("tarvik");
  client = new LanguageClient(
    "tarvik",
    "Tarvik",
    { command: settings.get("path"), args: ["lsp"] },
    {
      documentSelector: [{ scheme: "file", language: "acd" }],
      initializationOptions: { database: settings.get("database") },
    }
  );
  return client.start();
};

exports.deactivate = () => client && client.stop();
