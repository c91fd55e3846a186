# Writes OUT, a producing agency table ("code;abbreviation;name" lines, CR LF, 8-bit) from
# gdal-data's s57agencies.csv (IN: "#AgencyID,Token,Code,AgencyName"). The CSV's names hold
# "&amp;" and "&apos;", whose ";" would part the fields: they are decoded first. Names keep
# their own commas.
file(STRINGS ${IN} lines)
set(out "")
set(count 0)
foreach(line IN LISTS lines)
  string(REPLACE "&amp;" "&" line "${line}")
  string(REPLACE "&apos;" "'" line "${line}")
  string(REPLACE "&quot;" "\"" line "${line}")
  if(line MATCHES "^[0-9]+,([^,]*),([0-9]+),(.*)$")
    string(APPEND out "${CMAKE_MATCH_2};${CMAKE_MATCH_1};${CMAKE_MATCH_3}\r\n")
    math(EXPR count "${count} + 1")
  endif()
endforeach()
if(count LESS 200)
  message(FATAL_ERROR "only ${count} agencies in ${IN}")
endif()
file(WRITE ${OUT} "${out}")
