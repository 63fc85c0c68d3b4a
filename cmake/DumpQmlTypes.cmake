# cmake -DQMLPLUGINDUMP=... -DIMPORT_DIR=... -DOUTPUT=... -P DumpQmlTypes.cmake
set(ENV{QT_QPA_PLATFORM} offscreen)
set(ENV{QML2_IMPORT_PATH} "${IMPORT_DIR}")
execute_process(
    COMMAND "${QMLPLUGINDUMP}" -nonrelocatable -noforceqtquick Orvane.Loomkit 1.0 "${IMPORT_DIR}"
    OUTPUT_FILE "${OUTPUT}.new"
    ERROR_VARIABLE errors
    RESULT_VARIABLE result)
if(NOT result EQUAL 0)
    message(FATAL_ERROR "qmlplugindump failed (${result}):\n${errors}")
endif()
file(RENAME "${OUTPUT}.new" "${OUTPUT}")
