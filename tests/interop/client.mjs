// What the protocol's own client makes of kelvash-mcp: it connects, lists, calls, is refused, follows
// the progress of a call and cancels it, and judges each result by the schema that was listed.
//
//     node client.mjs KELVASH-MCP EXAMPLES

import assert from "node:assert/strict";
import {writeFileSync} from "node:fs";

import {Client} from "@modelcontextprotocol/sdk/client/index.js";
import {StdioClientTransport} from "@modelcontextprotocol/sdk/client/stdio.js";
import {LoggingMessageNotificationSchema} from "@modelcontextprotocol/sdk/types.js";

const [server, examples] = process.argv.slice(2);

writeFileSync("slow.xml", `<plugin><version>1.0.0</version><commands>
  <command path="slow"><description>Wait</description>
    <meta-data><meta-data-entry name="read-only">true</meta-data-entry></meta-data>
    <input-spec/><output-spec><string/></output-spec><format-parameters/>
    <execute>echo patience &gt;&amp;2; sleep 20</execute></command></commands></plugin>`);

const client = new Client({name: "interop", version: "1"});
const lines = [];
client.setNotificationHandler(LoggingMessageNotificationSchema,
                              (message) => lines.push(message.params.data));
await client.connect(new StdioClientTransport({
    command: server,
    args: ["--plugin-dir", `${examples}/commands`, "--plugin", "slow.xml"],
    env: {...process.env, KELVASH_COMMANDS: `${examples}/commands/scripts`},
}));
await client.ping();
await client.setLoggingLevel("debug");

const {tools} = await client.listTools();
assert(tools.every((tool) => tool.annotations.readOnlyHint));
assert(tools.some((tool) => tool.name === "storage_filesystem_list"));

const {structuredContent, content} = await client.callTool({name: "storage_filesystem_list"});
assert.deepEqual(JSON.parse(content[0].text), structuredContent.result);
const {result} = (await client.callTool(
    {name: "kelvash_command_list", arguments: {"command-filter": "list"}})).structuredContent;
assert(result.length > 3 && result.every((row) => row.Command.includes("list")));

const refused = await client.callTool(
    {name: "account_user_get", arguments: {name: "nobody at all", color: "red"}});
assert(refused.isError);
assert.match(refused.content[0].text, /Unknown parameter : color\n.*expected regular expression/);
await assert.rejects(client.callTool({name: "nosuch"}), /Unknown tool: nosuch/);

const abort = new AbortController();
const waited = client.callTool({name: "slow"}, undefined,
                               {signal: abort.signal, onprogress: () => abort.abort("enough")});
await assert.rejects(waited, /enough/);
assert.deepEqual(lines, ["patience"]);
assert.deepEqual(await client.ping(), {});
await client.close();
console.log(`${tools.length} tools, 1 passed, 0 failed`);
