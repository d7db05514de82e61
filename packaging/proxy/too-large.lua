-- For haproxy.cfg: reads the body of a request to its end, and answers with 413.
core.register_service("too_large", "http", function(applet)
  repeat
    local part = applet:receive(65536)
  until part == ""
  applet:set_status(413)
  applet:add_header("content-length", "0")
  applet:start_response()
end)
