# Turns every PNG file of PICTURE_DIR into a byte array in OUTPUT, a C++ file
# that defines velm::resources::kPicture<name> for each <name>.png:
#
#   cmake -DPICTURE_DIR=<folder> -DOUTPUT=<file.cpp> -P embed.cmake
file(GLOB pictures "${PICTURE_DIR}/*.png")
list(SORT pictures)
# CMake expressions have no {n} repeat.
string(REPEAT "0x..," 16 line_pattern)
set(text "// Made by embed.cmake from the files in widgets/resources/pictures.\n")
string(APPEND text "#include \"widgets/resources/picturedata.h\"\n\nnamespace velm::resources {\n")
foreach(picture IN LISTS pictures)
  get_filename_component(name "${picture}" NAME_WE)
  file(READ "${picture}" hex HEX)
  # Sixteen bytes a line: "0x89,0x50,...".
  string(REGEX REPLACE "([0-9a-f][0-9a-f])" "0x\\1," bytes "${hex}")
  string(REGEX REPLACE "(${line_pattern})" "\\1\n  " bytes "${bytes}")
  string(APPEND text "\nstatic const unsigned char k${name}Bytes[] = {\n  ${bytes}\n};\n")
  string(APPEND text "extern const EmbeddedPicture kPicture${name} = {\"${name}\", k${name}Bytes, sizeof k${name}Bytes};\n")
endforeach()
string(APPEND text "\n} // namespace velm::resources\n")
file(WRITE "${OUTPUT}" "${text}")
