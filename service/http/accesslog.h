#pragma once

#include <httplib.h>

// One line for each request: who, what, the answer's status and size, and how long it took. Tokens
// and codes in the query and the keys of photos are cut out.
void noteRequestStart();
void logRequest(const httplib::Request &request, const httplib::Response &response);

// The address as it may be written down.
std::string withoutSecrets(const std::string &target);
