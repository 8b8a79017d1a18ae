# Public headers live beside their sources; each folder registers its own and they are
# installed under include/avpost/ keeping the folder structure.
function(avpost_public_headers)
  foreach(header IN LISTS ARGN)
    get_filename_component(abs "${header}" ABSOLUTE BASE_DIR "${CMAKE_CURRENT_SOURCE_DIR}")
    set_property(GLOBAL APPEND PROPERTY AVPOST_PUBLIC_HEADERS "${abs}")
  endforeach()
endfunction()
