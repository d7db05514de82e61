-- For wrk: opens and closes sessions. The connections of a thread share the open sessions.

local open = '{"jsonrpc":"2.0","id":1,"method":"initializeSession"}'
local close = '{"jsonrpc":"2.0","id":1,"method":"closeSession","params":{"session_id":"%s"}}'
local ids = {}

function request()
  local id = table.remove(ids)
  return wrk.format("POST", nil, nil, id and close:format(id) or open)
end

function response(status, headers, body)
  ids[#ids + 1] = body:match('_session%d+')
end
