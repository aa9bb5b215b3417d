# nlohmann-json for another machine: it has only headers, so those of this machine will do.
include("${CMAKE_CURRENT_LIST_DIR}/headers.cmake")
kq_headers_of_this_machine(nlohmann_json nlohmann_json::nlohmann_json nlohmann)
