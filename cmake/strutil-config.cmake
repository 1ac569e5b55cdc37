include(${CMAKE_CURRENT_LIST_DIR}/strutil-targets.cmake)
