# Fails when a C or C++ file of the project is not laid out as .clang-format says.
if(NOT CLANG_FORMAT)
    message("clang-format not found")
    return()
endif()
file(GLOB_RECURSE sources LIST_DIRECTORIES false
     ${SOURCE_DIR}/classes/*.h ${SOURCE_DIR}/classes/*.cpp
     ${SOURCE_DIR}/include/*.h ${SOURCE_DIR}/src/*.cpp
     ${SOURCE_DIR}/image_processor/*.h ${SOURCE_DIR}/image_processor/*.cpp
     ${SOURCE_DIR}/geovision/*.h ${SOURCE_DIR}/geovision/*.cpp
     ${SOURCE_DIR}/tools/*.h ${SOURCE_DIR}/tools/*.cpp
     ${SOURCE_DIR}/tests/*.h ${SOURCE_DIR}/tests/*.cpp
     ${SOURCE_DIR}/tests/*.c ${SOURCE_DIR}/examples/*.c
     ${SOURCE_DIR}/bench/*.h ${SOURCE_DIR}/bench/*.cpp)
execute_process(COMMAND ${CLANG_FORMAT} --dry-run --Werror ${sources} RESULT_VARIABLE status)
if(NOT status EQUAL 0)
    message(FATAL_ERROR "clang-format would change the files above")
endif()
