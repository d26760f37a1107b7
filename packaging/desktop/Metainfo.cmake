# What software centres read. Screenshots want addresses in the web, and these sources know of no home
# there: whoever publishes a copy says where its pages and the pictures below lie.
#
# As a script: cmake -D OUTPUT=FILE [-D QEL_HOMEPAGE=…] [-D QEL_SCREENSHOTS=…] -P Metainfo.cmake
set(QEL_HOMEPAGE "" CACHE STRING "This copy's page in the web, for software centres")
set(QEL_SCREENSHOTS "" CACHE STRING "Folder in the web that has the pictures of docs/images, for software centres")

# Each with what it shows; the first is shown first. All are of a phone, 360 by 720.
set(QEL_PICTURES
  "now.png|The serving cell at a glance, and the tables of each technology"
  "signals.png|Curves of the serving cell and its strongest neighbours"
  "happenings.png|What changed, and the report that told it"
  "recordings.png|Recordings on the phone, with identities hidden")

function(qel_check_address option)
  if(${option} AND NOT ${option} MATCHES "^https://[^/ <>&\"']+(/[^ <>&\"']*)?$")
    message(FATAL_ERROR "${option} is no address in the web (https://…): ${${option}}")
  endif()
endfunction()

# The files of docs/images that a software centre shows.
function(qel_list_pictures variable)
  list(TRANSFORM QEL_PICTURES REPLACE "[|].*" "" OUTPUT_VARIABLE names)
  set(${variable} ${names} PARENT_SCOPE)
endfunction()

function(qel_write_metainfo output)
  set(QEL_METAINFO_WEB)
  qel_check_address(QEL_HOMEPAGE)
  if(QEL_HOMEPAGE)
    string(APPEND QEL_METAINFO_WEB "\n  <url type=\"homepage\">${QEL_HOMEPAGE}</url>")
  endif()
  qel_check_address(QEL_SCREENSHOTS)
  if(QEL_SCREENSHOTS)
    string(REGEX REPLACE "/+$" "" folder ${QEL_SCREENSHOTS})
    string(APPEND QEL_METAINFO_WEB "\n  <screenshots>")
    set(type " type=\"default\"")
    foreach(picture IN LISTS QEL_PICTURES)
      string(REGEX MATCH "^([^|]*)[|](.*)$" both ${picture})
      string(APPEND QEL_METAINFO_WEB "
    <screenshot${type}>
      <caption>${CMAKE_MATCH_2}</caption>
      <image type=\"source\" width=\"360\" height=\"720\">${folder}/${CMAKE_MATCH_1}</image>
    </screenshot>")
      set(type)
    endforeach()
    string(APPEND QEL_METAINFO_WEB "\n  </screenshots>")
  endif()
  configure_file(${CMAKE_CURRENT_FUNCTION_LIST_DIR}/tesk.qelwatch.viewer.metainfo.xml ${output} @ONLY)
endfunction()

if(CMAKE_SCRIPT_MODE_FILE STREQUAL CMAKE_CURRENT_LIST_FILE)
  qel_write_metainfo(${OUTPUT})
endif()
