-- A wrk script that sends one CIM operation repeatedly. CIM_METHOD is the operation, CIM_BODY the file of the request's
-- body. Each @ in the body is replaced by the number of the request.
local file = assert(io.open(os.getenv("CIM_BODY"), "rb"))
local body = file:read("*a")
file:close()
local count = 0

wrk.method = "POST"
wrk.path = "/cimom"
wrk.headers["Content-Type"] = 'application/xml; charset="utf-8"'
wrk.headers["CIMOperation"] = "MethodCall"
wrk.headers["CIMMethod"] = os.getenv("CIM_METHOD")
wrk.headers["CIMObject"] = "root%2Fcimv2"

function request()
    count = count + 1
    return wrk.format(nil, nil, nil, (body:gsub("@", tostring(count))))
end

function done(summary, latency)
    local errors = summary.errors
    io.write(string.format('{"requests": %d, "seconds": %.6f, "milliseconds": %.3f, "errors": %d}\n',
        summary.requests, summary.duration / 1e6, latency:percentile(50) / 1e3,
        errors.connect + errors.read + errors.write + errors.status + errors.timeout))
end
