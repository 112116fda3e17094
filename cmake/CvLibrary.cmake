# cv_add_library(<name> [DIRS <folders...>] [TREES <folders...>] [EXCLUDE <files...>]
#                [LIBS <targets...>] [QT])
# One static library from every .cpp file of the given folders (DIRS: the
# folder itself; TREES: the folder and everything below it); new files are
# picked up without editing a list. EXCLUDE names single files (relative to
# the calling folder) that belong elsewhere. A library whose folders hold no
# source yet is an interface library, so the tree always configures.
function(cv_add_library name)
    cmake_parse_arguments(ARG "QT" "" "DIRS;TREES;EXCLUDE;LIBS" ${ARGN})
    cv_glob_sources(sources DIRS ${ARG_DIRS} TREES ${ARG_TREES} EXCLUDE ${ARG_EXCLUDE})
    if(sources)
        add_library(${name} STATIC ${sources})
        target_include_directories(${name} PUBLIC ${PROJECT_SOURCE_DIR}/src)
        target_link_libraries(${name} PUBLIC ${ARG_LIBS})
        if(ARG_QT)
            set_target_properties(${name} PROPERTIES AUTOMOC ON)
        endif()
    else()
        add_library(${name} INTERFACE)
        target_include_directories(${name} INTERFACE ${PROJECT_SOURCE_DIR}/src)
        target_link_libraries(${name} INTERFACE ${ARG_LIBS})
    endif()
endfunction()

# cv_glob_sources(<out> [DIRS <folders...>] [TREES <folders...>] [EXCLUDE <files...>])
# The .cpp files of the folders, relative to the calling folder.
function(cv_glob_sources out)
    cmake_parse_arguments(ARG "" "" "DIRS;TREES;EXCLUDE" ${ARGN})
    set(sources)
    foreach(dir ${ARG_DIRS})
        file(GLOB found CONFIGURE_DEPENDS ${CMAKE_CURRENT_SOURCE_DIR}/${dir}/*.cpp)
        list(APPEND sources ${found})
    endforeach()
    foreach(dir ${ARG_TREES})
        file(GLOB_RECURSE found CONFIGURE_DEPENDS ${CMAKE_CURRENT_SOURCE_DIR}/${dir}/*.cpp)
        list(APPEND sources ${found})
    endforeach()
    foreach(file ${ARG_EXCLUDE})
        list(REMOVE_ITEM sources ${CMAKE_CURRENT_SOURCE_DIR}/${file})
    endforeach()
    set(${out} ${sources} PARENT_SCOPE)
endfunction()
