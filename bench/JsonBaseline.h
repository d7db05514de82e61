#pragma once

#include <memory>
#include <string>

// The lower bound for the time of a request: the JSON library alone, with its default settings and
// schema validator, does the work that no such service can avoid.
class JsonBaseline {
  public:
    // `schemaFile` is the embedded schema of the method, `response` the text to print. Throws
    // std::runtime_error if a text or schema is invalid.
    JsonBaseline(const char* schemaFile, const std::string& request, const std::string& response);
    ~JsonBaseline();

    // Parses the request, validates each of its elements and prints the response from a document.
    // Returns the size of the printed text, or 0 if an element is invalid.
    std::size_t run() const;

  private:
    struct Documents;
    std::unique_ptr<Documents> documents;
    std::string request;
};
