# vorlan_add_subdirectories(): adds every sub-folder of the current folder that has a
# CMakeLists.txt, so each area brings its own tests, benchmarks or fuzz targets.
function(vorlan_add_subdirectories)
  file(GLOB dirs LIST_DIRECTORIES true CONFIGURE_DEPENDS ${CMAKE_CURRENT_SOURCE_DIR}/*)
  foreach(dir ${dirs})
    if(IS_DIRECTORY ${dir} AND EXISTS ${dir}/CMakeLists.txt)
      add_subdirectory(${dir})
    endif()
  endforeach()
endfunction()
