# Installs the build into PREFIX and checks that what the desktop entry names
# is there: the program of Exec, the icon of Icon, and the metainfo that
# launches the entry.
file(REMOVE_RECURSE ${PREFIX})
execute_process(COMMAND ${CMAKE_COMMAND} --install ${BUILD} --prefix ${PREFIX}
                RESULT_VARIABLE result OUTPUT_QUIET)
if(NOT result EQUAL 0)
    message(FATAL_ERROR "cmake --install failed: ${result}")
endif()

set(id org.quorvel.Quorvel)
set(entry ${PREFIX}/share/applications/${id}.desktop)
foreach(path ${PREFIX}/bin/quorvel ${entry} ${PREFIX}/share/icons/hicolor/scalable/apps/${id}.svg
             ${PREFIX}/share/metainfo/${id}.metainfo.xml)
    if(NOT EXISTS ${path})
        message(FATAL_ERROR "not installed: ${path}")
    endif()
endforeach()

file(STRINGS ${entry} exec REGEX "^Exec=")
file(STRINGS ${entry} icon REGEX "^Icon=")
if(NOT exec STREQUAL "Exec=quorvel" OR NOT icon STREQUAL "Icon=${id}")
    message(FATAL_ERROR "the entry names ${exec} and ${icon}")
endif()
file(READ ${PREFIX}/share/metainfo/${id}.metainfo.xml metainfo)
if(NOT metainfo MATCHES "<launchable type=\"desktop-id\">${id}.desktop</launchable>")
    message(FATAL_ERROR "the metainfo does not launch ${id}.desktop")
endif()
if(VALIDATE)
    execute_process(COMMAND ${VALIDATE} ${entry} RESULT_VARIABLE result)
    if(NOT result EQUAL 0)
        message(FATAL_ERROR "the installed entry does not validate")
    endif()
endif()
