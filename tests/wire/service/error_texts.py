"""The texts of failures, and the responses that contain them."""

import json

REQUEST = "The request is not a valid JSON-RPC 2.0 request. Send an object with \"jsonrpc\" equal to " \
    "\"2.0\", an \"id\" that is a string or a 32-bit integer, a \"method\" that is a string and " \
    "\"params\" that is an object, or send an array of at least one such object."
PARSE = "The body of the request is not valid JSON. Correct the text at the offset given, counted in " \
    "bytes from the start of the body, and send it again."
METHOD = "The service has no method of this name. Use a name from the list of methods in " \
    "docs/methods.md, with the same upper-case and lower-case letters. All names begin with a " \
    "lower-case letter, except GetChassisIpOrHostname."
PARAMS = "The parameters do not fit the method. Correct what the details name, and send the request " \
    "again. The parameters of each method are listed in docs/methods.md."
SERVER = "The request failed. The code and the message in \"data\" say why and what can be done " \
    "about it."
INTERNAL = "The service met an unexpected error. Send the request again; if the error returns, " \
    "report it together with the request."
RESERVED = "The device is reserved by another session. Repeat the request until that session has " \
    "given the device up, with reservation_timeout 0, because the session's own requests are held " \
    "up while yours waits; or share the device by naming the same reservation group in both " \
    "sessions."
NOT_CHASSIS = "The device is not a chassis. Name a device whose property Dev.ProductCategory is 1."
VALUE_TYPE = "The value does not have the data type of the property. Give a value of the requested " \
    "data type and within its range: an integer without a decimal point, an array even for a single " \
    "element of an array property, and for several resources an array with one value for each."
RESOURCE = "The name of a resource is unknown or malformed, or its device is missing or does not " \
    "answer. Use a name from the property Sys.Devices, Dev.PhysChans or Dev.NVMEM.Areas. A range " \
    "is written as Dev1/ch0:3 and has at most 1024 names. If the name is right, check that the " \
    "module is in its slot and that the device has power and a network connection."
SEVERAL = "A property that holds an array cannot be used on several resources at once. Send one " \
    "request for each resource."
UTF8 = "The name of a resource is not valid UTF-8 text. Encode the whole body of the request in UTF-8."
SESSION = "No session with this ID is open. Use a session_id from a result of initializeSession. It " \
    "is valid until its session is closed, by closeSession or by an initializeSession with " \
    "force_reserve, or until the service is restarted."
TOO_WIDE = "The data has more bits than the register. Give data that fits in size bits, or set size " \
    "to the width of the register: 8, 16, 32 or 64."
TOO_MANY = "The limit of 100 open sessions is reached. Close a session that is no longer needed with " \
    "closeSession, and send the request again. With force_reserve it succeeds only if a session " \
    "holds one of the named devices."
SKIPPED = "The request was not run, because an earlier request of the same batch failed. Correct the " \
    "request that failed, then send it again with all requests that follow it in the batch."


def text(description, *items):
    """One line: the description, an empty line and the items, with blanks for the line ends."""
    return description + ("  " + " ".join(items) if items else "")


def standing(code, message, id="1"):
    error = json.dumps({"code": code, "message": message}, separators=(",", ":"),
                       ensure_ascii=False)
    return f'{{"jsonrpc":"2.0","id":{id},"error":{error}}}'.encode()


def wrapped(code, message, id="1"):
    error = json.dumps(
        {"code": -32000, "message": SERVER,
         "data": {"qitrmc_code": code, "qitrmc_message": message}},
        separators=(",", ":"), ensure_ascii=False)
    return f'{{"jsonrpc":"2.0","id":{id},"error":{error}}}'.encode()
