# CLI11 for another machine: only headers, so those of this machine serve.
include("${CMAKE_CURRENT_LIST_DIR}/headers.cmake")
kq_headers_of_this_machine(CLI11 CLI11::CLI11 CLI)
