# Installs the configuration file "new" as "name" into "directory", which is absolute or relative to the prefix. Keeps a
# different installed file, which may have the administrator's changes, and installs the new file as NAME.new.
cmake_path(ABSOLUTE_PATH directory BASE_DIRECTORY "${CMAKE_INSTALL_PREFIX}")
set(kept "$ENV{DESTDIR}${directory}/${name}")
if(EXISTS "${kept}")
    file(SHA256 "${kept}" hash_of_kept)
    file(SHA256 "${new}" hash_of_new)
    if(NOT hash_of_kept STREQUAL hash_of_new)
        string(APPEND name .new)
        message(STATUS "Keeping ${kept}; the new one is ${name}")
    endif()
endif()
file(INSTALL "${new}" DESTINATION "${directory}" RENAME ${name})
