# Compiles the committed .ts sources and builds a resource file that puts the
# .qm files under :/languages.
file(GLOB LOOMKIT_TS_FILES CONFIGURE_DEPENDS ${CMAKE_CURRENT_LIST_DIR}/LoomkitPlugin_*.ts)
set_source_files_properties(${LOOMKIT_TS_FILES} PROPERTIES OUTPUT_LOCATION ${CMAKE_BINARY_DIR}/languages)
qt5_add_translation(LOOMKIT_QM_FILES ${LOOMKIT_TS_FILES} OPTIONS -silent)

set(qrc "<!DOCTYPE RCC><RCC version=\"1.0\">\n<qresource prefix=\"/languages\">\n")
foreach(qm ${LOOMKIT_QM_FILES})
    get_filename_component(name ${qm} NAME)
    string(APPEND qrc "    <file alias=\"${name}\">${qm}</file>\n")
endforeach()
string(APPEND qrc "</qresource>\n</RCC>\n")
file(WRITE ${CMAKE_BINARY_DIR}/languages/languages.qrc "${qrc}")
add_custom_command(OUTPUT ${CMAKE_BINARY_DIR}/languages/qrc_languages.cpp
    COMMAND Qt5::rcc -name languages -o ${CMAKE_BINARY_DIR}/languages/qrc_languages.cpp
            ${CMAKE_BINARY_DIR}/languages/languages.qrc
    DEPENDS ${LOOMKIT_QM_FILES} ${CMAKE_BINARY_DIR}/languages/languages.qrc
    VERBATIM)
set(LOOMKIT_LANGUAGES_QRC ${CMAKE_BINARY_DIR}/languages/qrc_languages.cpp)
