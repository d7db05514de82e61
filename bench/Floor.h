#pragma once

#include <memory>
#include <string>

// What nobody gets below: the JSON library alone, with its own settings and its own schema
// validator, doing for one request what every service of this kind must do.
class Floor {
  public:
    // `schemaFile` is the embedded schema of the method, `responses` as many equal texts as the
    // request has elements. Throws std::runtime_error when a text or schema cannot be used.
    Floor(const char* schemaFile, const std::string& request, const std::string& response);
    ~Floor();

    // Parses the request, validates each of its elements and prints the response, which is held as
    // a document. Returns the size of what was printed, 0 if an element is not valid.
    std::size_t run() const;

  private:
    struct Documents;
    std::unique_ptr<Documents> documents;
    std::string request;
};
