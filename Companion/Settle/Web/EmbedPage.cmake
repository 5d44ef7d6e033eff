# Writes the C++ source ${OUTPUT}, which holds the files ${FILES}: called with "cmake -P" by the build.
set(types_html "text/html; charset=utf-8")
set(types_css "text/css; charset=utf-8")
set(types_svg "image/svg+xml")
set(types_js "text/javascript; charset=utf-8")

set(arrays "")
set(entries "")
set(number 0)
string(REPLACE "|" ";" files "${FILES}")
foreach(file IN LISTS files)
  get_filename_component(name "${file}" NAME)
  get_filename_component(extension "${file}" LAST_EXT)
  string(SUBSTRING "${extension}" 1 -1 extension)
  if(NOT types_${extension})
    message(FATAL_ERROR "${file}: no media type is known for .${extension}")
  endif()
  file(READ "${file}" bytes HEX)
  string(LENGTH "${bytes}" length)
  math(EXPR length "${length} / 2")
  # A byte over the last, so that an empty file is an array, too.
  string(REGEX REPLACE "(..)" "0x\\1," bytes "${bytes}")
  string(APPEND arrays "constexpr unsigned char kFile${number}[] = {${bytes}0};\n")
  string(APPEND entries "    {\"${name}\", \"${types_${extension}}\", Text(kFile${number}, ${length})},\n")
  math(EXPR number "${number} + 1")
endforeach()

file(WRITE "${OUTPUT}" "#include \"Settle/Web/PageFiles.h\"

namespace ovrin {

namespace {

${arrays}
std::string_view Text(const unsigned char* bytes, std::size_t size) {
    return {reinterpret_cast<const char*>(bytes), size};
}

const PageFile kFiles[] = {
${entries}};

} // namespace

std::span<const PageFile> PageFiles() {
    return kFiles;
}

} // namespace ovrin
")
