# What the host finds in Fringe.9zf besides code: the plug-in property list that
# makes it a hidden filter, the scripting terminology of its event, an empty
# key-string dictionary, a string table, version information and a manifest.
#
# Field types: INT8/INT16/INT32 (unsigned, little-endian), CODE (four-character
# code, first character most significant), PSTRING (length byte + text),
# CSTRING (text + NUL). FRINGE_VERSION comes from the project (a.b.c.d).

set(VENDOR "9ZKT")
set(MODE_GRAYSCALE 64)  # first byte of 'mode'
set(MODE_RGB 16)
math(EXPR MODES "${MODE_GRAYSCALE} | ${MODE_RGB}")

resource_language(9 1)  # English (United States), 1033

# ---- Plug-in property list ----------------------------------------------
property_list_begin(ID 16000 VENDOR ${VENDOR})
property(nabo INT32 1)
property(kind CODE 9ZFM)                          # a filter module
property(name PSTRING "Fringe")
property(catg PSTRING "**Hidden**")               # never listed in a menu
property(vers INT16 0 INT16 4)                    # minor 0 (low half), major 4 (high half)
property(8664 CSTRING "ENTRYPOINT1" LENGTH 16)    # entry point of the 64-bit x86 code
property(mode INT8 ${MODES} INT8 0 INT8 0 INT8 0)
property(flly INT8 128 INT8 0 INT8 0 INT8 0)
property(enbl CSTRING "in (RXAPP_ImageMode, GrayScaleMode, RGBMode)")
# Filter cases 1 to 7: input handling, output handling, flags 1, flags 2.
# Cases 4 and 5 carry editable transparency.
property(fici
  INT8 4 INT8 4 INT8 6  INT8 0   # 1
  INT8 4 INT8 4 INT8 6  INT8 0   # 2
  INT8 4 INT8 4 INT8 14 INT8 0   # 3
  INT8 1 INT8 1 INT8 6  INT8 0   # 4
  INT8 1 INT8 1 INT8 6  INT8 0   # 5
  INT8 1 INT8 1 INT8 6  INT8 0   # 6
  INT8 1 INT8 1 INT8 6  INT8 0)  # 7
# Reference to the terminology below: version, class, event, resource, scope.
property(hstm INT32 0 CODE Fltr CODE fRNG INT16 128 CSTRING "Fringe0001")
property_list_end()

# ---- Scripting terminology ----------------------------------------------
resource_fields(TYPE AETE ID 128
  INT16 1                                                # terminology version
  INT8 1 INT8 0                                          # format 1.0
  INT16 0 INT16 0                                        # language, script
  INT16 1                                                # suites
  PSTRING "$$$/AETE/Common/Rastrix=Rastrix" PSTRING ""   # suite name, description
  CODE RSTX INT16 0 INT16 0                              # suite code, level, version
  INT16 1                                                # events
  PSTRING "$$$/HaldenPlugin/Fringe/DialogName/Name=Fringe" PSTRING ""
  CODE Fltr CODE fRNG                                    # event class and code
  CODE null PSTRING "" INT16 0                           # no reply
  CODE "#ImR" PSTRING "" INT16 0xB000                    # direct parameter: an image
  INT16 0                                                # no parameters of its own
  INT16 0 INT16 0 INT16 0)                               # classes, comparisons, enumerations

# ---- Key-string dictionary: a byte-order mark and no entries -------------
resource_fields(TYPE KSTR NAME "SHAREDVIREOSTRINGS.TXT" INT8 0xFE INT8 0xFF)

# ---- String table (texts are stored within double quotes) ----------------
string_table(
  2    "Fringe Scan"
  1000 "The image has no pixels to look at."
  1002 "No photo was found on the page."
  1004 "The page is blank."
  1005 "The photo covers the whole page."
  1006 "The photo touches the top edge of the page."
  1007 "The photo touches the bottom edge of the page."
  1008 "The photo touches the left edge of the page."
  1009 "The photo touches the right edge of the page."
  1010 "The photo lies inside the page."
  1011 "The photo is turned."
  1012 "The photo is straight."
  1013 "The image is too small."
  1014 "The image mode is not supported."
  1015 "The image is grayscale."
  1016 "The image is in color."
  1017 "The scan is too dark."
  1018 "The scan is too light."
  1019 "The corners of the photo were found.")

# ---- Version information ------------------------------------------------
version_information(ID 1 VERSION ${FRINGE_VERSION}
  FLAGS_MASK 0x3F
  OS 0x40004        # Windows NT, 32-bit interface
  FILE_TYPE 2       # a library
  LANGUAGE 0x0409 CODE_PAGE 1200
  STRINGS
    CompanyName      "Halden"
    FileDescription  "Fringe"
    FileVersion      "${FRINGE_VERSION_TEXT}"
    InternalName     "Fringe"
    OriginalFilename "Fringe.9zf"
    ProductName      "Halden Fringe"
    ProductVersion   "${FRINGE_VERSION_TEXT}")

# ---- Manifest: trust information only ------------------------------------
manifest(2 ${CMAKE_CURRENT_LIST_DIR}/fringe.manifest)
