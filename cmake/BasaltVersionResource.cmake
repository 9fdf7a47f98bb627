# basalt_add_version_resource(<target> PRODUCT_VERSION <a[.b[.c[.d]]]>
#                             [PRODUCT_NAME <text>] [INTERNAL_NAME <text>] [LEGAL_COPYRIGHT <text>]
#                             [FILE_DESCRIPTION <text>] [COMMENT <text>] [FILE_VERSION <a[.b[.c[.d]]]>])
#
# Adds a version resource, which VersionInfo reads, to a program. Each number is at most 65535, missing ones are 0;
# FILE_VERSION defaults to PRODUCT_VERSION. The text "ProductVersion" is the product version as written, the other
# texts are any UTF-8; a text that is not given has no entry in the resource.

function(basalt_add_version_resource target)
  set(texts PRODUCT_NAME INTERNAL_NAME LEGAL_COPYRIGHT PRODUCT_VERSION FILE_DESCRIPTION COMMENT)
  cmake_parse_arguments(PARSE_ARGV 1 arg "" "${texts};FILE_VERSION" "")
  if(arg_UNPARSED_ARGUMENTS)
    message(FATAL_ERROR "basalt_add_version_resource: unknown: ${arg_UNPARSED_ARGUMENTS}")
  endif()
  if(NOT DEFINED arg_PRODUCT_VERSION)
    message(FATAL_ERROR "basalt_add_version_resource: PRODUCT_VERSION is missing")
  endif()
  if(NOT DEFINED arg_FILE_VERSION)
    set(arg_FILE_VERSION "${arg_PRODUCT_VERSION}")
  endif()
  foreach(version PRODUCT_VERSION FILE_VERSION)
    if(NOT arg_${version} MATCHES "^[0-9]+(\\.[0-9]+(\\.[0-9]+(\\.[0-9]+)?)?)?$")
      message(FATAL_ERROR "basalt_add_version_resource: ${version} is no a.b.c.d: ${arg_${version}}")
    endif()
    string(REPLACE "." ";" numbers "${arg_${version}}.0.0.0")
    list(SUBLIST numbers 0 4 numbers)
    set(BASALT_${version} "")
    foreach(number ${numbers})
      string(REGEX REPLACE "^0+([0-9])" "\\1" number "${number}")  # a leading 0 would make it octal
      if(number GREATER 65535)
        message(FATAL_ERROR "basalt_add_version_resource: ${number} of ${version} is above 65535")
      endif()
      list(APPEND BASALT_${version} ${number})
    endforeach()
    list(JOIN BASALT_${version} ", " BASALT_${version})
  endforeach()

  # Through a generated file: on a command line some texts would be taken for keywords.
  set(keys ProductName InternalName LegalCopyright ProductVersion FileDescription Comment)
  set(BASALT_TEXTS "")
  foreach(text key IN ZIP_LISTS texts keys)
    if(DEFINED arg_${text})
      string(APPEND BASALT_TEXTS "    block.add_text(u\"${key}\", uR\"basalt_text(${arg_${text}})basalt_text\");\n")
    endif()
  endforeach()

  get_target_property(binary_dir ${target} BINARY_DIR)
  set(source "${binary_dir}/${target}_version_resource.cpp")
  configure_file("${CMAKE_CURRENT_FUNCTION_LIST_DIR}/version_resource.cpp.in" "${source}" @ONLY)
  # not joined with other sources, whose names could clash
  set_source_files_properties("${source}" PROPERTIES SKIP_UNITY_BUILD_INCLUSION ON)
  target_sources(${target} PRIVATE "${source}")
endfunction()
