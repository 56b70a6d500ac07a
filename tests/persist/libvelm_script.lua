-- Drives the libvelm module from the stock interpreter:
--   lua5.1 libvelm_script.lua <folder of libvelm.so> <scratch folder>
-- Prints one line per check and "libvelm script: ok" at the end; argument
-- errors and failures are checked by the embedded host's tests.
local libdir, scratch = arg[1], arg[2]
package.cpath = libdir .. "/?.so;" .. package.cpath
local libvelm = require "libvelm"

local function check(label, condition)
  if not condition then error("check failed: " .. label, 2) end
  print("ok " .. label)
end

-- A 16-bit stereo WAVE file of n frames, written byte by byte.
local function write_wave(path, rate, channels, n)
  local function u16(v) return string.char(v % 256, math.floor(v / 256) % 256) end
  local function u32(v) return u16(v % 65536) .. u16(math.floor(v / 65536)) end
  local data = {}
  for i = 0, n - 1 do
    for c = 1, channels do
      local s = math.floor(12000 * math.sin(2 * math.pi * 440 * i / rate + c))
      data[#data + 1] = u16(s % 65536)
    end
  end
  local bytes = table.concat(data)
  local f = assert(io.open(path, "wb"))
  f:write("RIFF", u32(36 + #bytes), "WAVE", "fmt ", u32(16), u16(1), u16(channels), u32(rate),
          u32(rate * channels * 2), u16(channels * 2), u16(16), "data", u32(#bytes), bytes)
  f:close()
end

local function size(path)
  local f = io.open(path, "rb")
  if not f then return 0 end
  local n = f:seek("end")
  f:close()
  return n
end

local input = scratch .. "/tone.wav"
write_wave(input, 16000, 2, 8000)

local doc, err = libvelm.open(input)
check("open answers a document", doc ~= nil and err == nil)
check("the document prints", tostring(doc):match("^VELMAUDIO object at 0x") ~= nil)
check("save under a new name and type", doc:save(scratch .. "/copy.flac") == true)
check("save in place", doc:save() == true)

local again = libvelm.open(scratch .. "/copy.flac", "AUTO")
check("reopen the saved file", again ~= nil)
check("save the reopened file in a named format", again:save(scratch .. "/back.wav", "WAVE"))
local samples = 8000 * 2 * 2
check("the round trip keeps every sample", size(scratch .. "/back.wav") >= samples and size(scratch .. "/back.wav") < samples + 1024)

local none, message = libvelm.open(scratch .. "/missing.wav")
check("open of a missing file", none == nil and message == "Unable to open VELMAUDIO.")

local plain = libvelm:new()
check("new without a format", plain ~= nil and plain:save(scratch .. "/plain.wav"))
local stereo = libvelm:new("AUTO[sr=44100,nc=2]")
check("new with a format", stereo ~= nil and stereo:save(scratch .. "/stereo.wav"))

-- Four documents were made; each is collected once.
doc, again, plain, stereo = nil, nil, nil, nil
collectgarbage()
collectgarbage()
print("libvelm script: ok")
