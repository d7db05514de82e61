// What a program writes with the types: everything here compiles, and each line below an
// expected error would not.
import { GetPropertyParams, InitializeSessionParams, Request, Response, statusCodes } from "./qitrmc";

const open: InitializeSessionParams = { devices: ["Mod1", "Mod2"], access: "ReadOnly" };
const nothing: InitializeSessionParams = {};
const read: GetPropertyParams = {
  session_id: "_session1",
  property: "PSU.Voltage",
  physical_channels: "Mod2/ch0:1",
};
const request: Request<"getProperty"> = { jsonrpc: "2.0", id: 1, method: "getProperty", params: read };

export function idOf(answer: Response<"initializeSession">): string {
  return "result" in answer ? answer.result.session_id : String(answer.error.data?.qitrmc_code);
}

export const isReserved = (code: number): boolean => code === statusCodes.deviceReserved;

// @ts-expect-error two kinds of resources
const two: InitializeSessionParams = { devices: "Mod1", nvmem_areas: "Mod1/user" };
// @ts-expect-error the property is missing
const incomplete: GetPropertyParams = { session_id: "_session1" };
// @ts-expect-error no such access
const access: InitializeSessionParams = { access: 2 };
// @ts-expect-error no such method
const unknown: Request<"getPropertys"> = { jsonrpc: "2.0", id: 1, method: "getPropertys", params: {} };
// @ts-expect-error no such member in the result
export const wrong = (answer: Response<"closeSession">) => "result" in answer && answer.result.session_id.length;

export const used = [open, nothing, request, two, incomplete, access, unknown];
