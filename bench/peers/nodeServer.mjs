// A peer for the benchmark: jayson with a compiled ajv schema, and no driver.
//
// Usage: nodeServer.mjs SCHEMA DEFINITIONS VALUE. Answers getProperty with the value. Prints the same
// line as the host, and runs until its standard input ends.

import { readFileSync } from "node:fs";
import Ajv from "ajv";
import jayson from "jayson";

const [schemaFile, definitionsFile, value] = process.argv.slice(2);
const { $schema, ...schema } = JSON.parse(readFileSync(schemaFile, "utf8"));
schema.definitions = JSON.parse(readFileSync(definitionsFile, "utf8")).definitions;
const isValid = new Ajv({ strict: false }).compile(schema.properties.params
  ? { ...schema.properties.params, definitions: schema.definitions } : schema);

const methods = {
  getProperty(params, done) {
    if (isValid(params)) done(null, { value: JSON.parse(value) });
    else done({ code: -32602, message: "Invalid params" });
  },
};
const server = new jayson.Server(methods).http();
server.listen(0, "127.0.0.1", () => {
  console.log(`Listening on http://127.0.0.1:${server.address().port}/qitrmc/Call`);
});
process.stdin.on("end", () => process.exit(0)).resume();
