# Run as a script: TEXT, a DeviceConfig in protobuf text format, to OUTPUT in its encoded form.
get_filename_component(directory ${OUTPUT} DIRECTORY)
file(MAKE_DIRECTORY ${directory})
execute_process(
  COMMAND ${PROTOC} -I ${SCHEMA_DIR} --encode=qelwatch.schema.DeviceConfig device_config.proto
  INPUT_FILE ${TEXT} OUTPUT_FILE ${OUTPUT} RESULT_VARIABLE result)
if(NOT result EQUAL 0)
  file(REMOVE ${OUTPUT})
  message(FATAL_ERROR "${TEXT} is no configuration")
endif()
