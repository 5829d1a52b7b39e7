# The vocabulary of the resource description: each call adds one resource to a
# Windows resource script (.rc) kept in the global property RC_SCRIPT.
# Binary resources are written as escaped byte strings, which the resource
# compiler copies verbatim (no terminator is added).

include(${CMAKE_CURRENT_LIST_DIR}/byte_encoding.cmake)

function(rc_append text)
  set_property(GLOBAL APPEND_STRING PROPERTY RC_SCRIPT "${text}")
endfunction()

# A quoted string literal of the resource script; a double quote is doubled.
function(rc_quote out text)
  if(NOT text STREQUAL "" AND NOT text MATCHES "^[ -~]+$")
    message(FATAL_ERROR "Resource text \"${text}\" holds characters outside printable ASCII")
  endif()
  string(REPLACE "\"" "\"\"" escaped "${text}")
  set(${out} "\"${escaped}\"" PARENT_SCOPE)
endfunction()

# Emits `name type` with the bytes as data, sixteen to a line.
function(rc_binary_resource name type)
  set(bytes ${ARGN})
  list(LENGTH bytes size)
  rc_append("\n// ${size} bytes\n${name} ${type}\nBEGIN\n")
  set(line "")
  set(column 0)
  foreach(byte IN LISTS bytes)
    string(APPEND line "\\x${byte}")
    math(EXPR column "${column} + 1")
    if(column EQUAL 16)
      rc_append("  \"${line}\"\n")
      set(line "")
      set(column 0)
    endif()
  endforeach()
  if(NOT line STREQUAL "")
    rc_append("  \"${line}\"\n")
  endif()
  rc_append("END\n")
endfunction()

# All resources that follow carry this language (primary, sub-language).
function(resource_language primary sub)
  rc_append("LANGUAGE ${primary}, ${sub}\n")
endfunction()

# resource_fields(TYPE type ID id|NAME name fields...): a binary resource made of
# the typed fields of encode_fields.
function(resource_fields)
  cmake_parse_arguments(PARSE_ARGV 0 R "" "TYPE;ID;NAME" "")
  if(DEFINED R_NAME)
    rc_quote(name "${R_NAME}")
  else()
    set(name ${R_ID})
  endif()
  set(bytes "")
  encode_fields(bytes "${R_UNPARSED_ARGUMENTS}")
  rc_binary_resource(${name} ${R_TYPE} ${bytes})
endfunction()

# ---- Plug-in property list ----------------------------------------------

# Starts a property list; the properties follow, then property_list_end().
function(property_list_begin)
  cmake_parse_arguments(PARSE_ARGV 0 P "" "ID;VENDOR" "")
  set_property(GLOBAL PROPERTY PIPL_ID ${P_ID})
  set_property(GLOBAL PROPERTY PIPL_VENDOR ${P_VENDOR})
  set_property(GLOBAL PROPERTY PIPL_COUNT 0)
  set_property(GLOBAL PROPERTY PIPL_BYTES "")
endfunction()

# property(key [LENGTH n] fields...): one property, its data padded with zero
# bytes to a multiple of four, or to `n` bytes when a wider field is wanted.
function(property key)
  cmake_parse_arguments(PARSE_ARGV 1 P "" "LENGTH" "")
  set(data "")
  encode_fields(data "${P_UNPARSED_ARGUMENTS}")
  encode_padding(data 4)
  list(LENGTH data length)
  if(DEFINED P_LENGTH)
    if(P_LENGTH LESS length OR NOT P_LENGTH MATCHES "^[0-9]+$")
      message(FATAL_ERROR "Property '${key}': ${length} bytes of data do not fit in ${P_LENGTH}")
    endif()
    math(EXPR remainder "${P_LENGTH} % 4")
    if(NOT remainder EQUAL 0)
      message(FATAL_ERROR "Property '${key}': length ${P_LENGTH} is not a multiple of 4")
    endif()
    while(length LESS P_LENGTH)
      list(APPEND data 00)
      math(EXPR length "${length} + 1")
    endwhile()
  endif()
  get_property(vendor GLOBAL PROPERTY PIPL_VENDOR)
  get_property(bytes GLOBAL PROPERTY PIPL_BYTES)
  encode_fields(bytes "CODE;${vendor};CODE;${key};INT32;0;INT32;${length}")
  list(APPEND bytes ${data})
  set_property(GLOBAL PROPERTY PIPL_BYTES "${bytes}")
  get_property(count GLOBAL PROPERTY PIPL_COUNT)
  math(EXPR count "${count} + 1")
  set_property(GLOBAL PROPERTY PIPL_COUNT ${count})
endfunction()

# Writes the header (version 1, reserved 0, property count) and the list.
function(property_list_end)
  get_property(id GLOBAL PROPERTY PIPL_ID)
  get_property(count GLOBAL PROPERTY PIPL_COUNT)
  get_property(properties GLOBAL PROPERTY PIPL_BYTES)
  set(bytes "")
  encode_fields(bytes "INT16;1;INT32;0;INT32;${count}")
  rc_binary_resource(${id} PIPL ${bytes} ${properties})
endfunction()

# ---- String table -------------------------------------------------------

# string_table(id text id text ...): texts stored within double quotes.
function(string_table)
  rc_append("\nSTRINGTABLE\nBEGIN\n")
  math(EXPR last "${ARGC} - 1")
  foreach(i RANGE 0 ${last} 2)
    math(EXPR t "${i} + 1")
    rc_quote(text "\"${ARGV${t}}\"")
    rc_append("  ${ARGV${i}}, ${text}\n")
  endforeach()
  rc_append("END\n")
endfunction()

# ---- Version information ------------------------------------------------

# The integer as `width` hexadecimal digits, leading zeros kept.
function(hex_digits out value width)
  math(EXPR hex "${value}" OUTPUT_FORMAT HEXADECIMAL)
  string(REGEX REPLACE "^0x" "" digits "${hex}")
  string(LENGTH "${digits}" length)
  while(length LESS width)
    set(digits "0${digits}")
    math(EXPR length "${length} + 1")
  endwhile()
  set(${out} "${digits}" PARENT_SCOPE)
endfunction()

# version_information(ID id VERSION a.b.c.d FLAGS_MASK m OS os FILE_TYPE t
#                     LANGUAGE l CODE_PAGE c STRINGS key value ...)
# File and product version are both VERSION; flags, subtype and date are 0.
function(version_information)
  cmake_parse_arguments(PARSE_ARGV 0 V "" "ID;VERSION;FLAGS_MASK;OS;FILE_TYPE;LANGUAGE;CODE_PAGE"
                        "STRINGS")
  string(REPLACE "." "," numbers "${V_VERSION}")
  # The string block is named by language and code page as eight hex digits.
  hex_digits(language_digits "${V_LANGUAGE}" 4)
  hex_digits(code_page_digits "${V_CODE_PAGE}" 4)
  string(TOLOWER "${language_digits}${code_page_digits}" block)
  rc_append("\n${V_ID} VERSIONINFO\n")
  rc_append("FILEVERSION ${numbers}\nPRODUCTVERSION ${numbers}\n")
  math(EXPR mask "${V_FLAGS_MASK}")
  math(EXPR os "${V_OS}")
  rc_append("FILEFLAGSMASK ${mask}\nFILEFLAGS 0\nFILEOS ${os}\n")
  rc_append("FILETYPE ${V_FILE_TYPE}\nFILESUBTYPE 0\n")
  rc_append("BEGIN\n  BLOCK \"StringFileInfo\"\n  BEGIN\n    BLOCK \"${block}\"\n    BEGIN\n")
  list(LENGTH V_STRINGS n)
  math(EXPR last "${n} - 1")
  foreach(i RANGE 0 ${last} 2)
    math(EXPR t "${i} + 1")
    list(GET V_STRINGS ${i} key)
    list(GET V_STRINGS ${t} value)
    rc_quote(key "${key}")
    rc_quote(value "${value}")
    rc_append("      VALUE ${key}, ${value}\n")
  endforeach()
  math(EXPR language "${V_LANGUAGE}")
  math(EXPR code_page "${V_CODE_PAGE}")
  rc_append("    END\n  END\n  BLOCK \"VarFileInfo\"\n  BEGIN\n")
  rc_append("    VALUE \"Translation\", ${language}, ${code_page}\n  END\nEND\n")
endfunction()

# ---- Manifest -----------------------------------------------------------

# manifest(id file): the file's contents as an assembly manifest (type 24).
function(manifest id file)
  rc_quote(path "${file}")
  rc_append("\n${id} 24 ${path}\n")
endfunction()
