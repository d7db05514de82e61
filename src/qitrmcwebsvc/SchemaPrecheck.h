#pragma once

#include "qitrmcwebsvc/Json.h"
#include "qitrmcwebsvc/SchemaNode.h"

namespace nQITRMCWEBSVC100 {

// Recognises most valid requests at a small part of what a run of the JSON library's validator
// (SchemaRun) costs. It knows only the keywords that the schemas of the methods use, and leaves
// values undecided that a schema describes by anything else.
class SchemaPrecheck {
  public:
    enum class Verdict {
        Valid,    // the library's validator accepts the request
        Invalid,  // the library's validator refuses it
        Undecided
    };

    // `schema` contains the definitions that it refers to. It must outlive this object and stay
    // unchanged.
    explicit SchemaPrecheck(const JsonValue& schema);

    // Several threads may call this function at the same time. It allocates no memory, its time is
    // linear in the size of the request, and its use of the call stack is bounded.
    Verdict verdictOn(const JsonValue& request) const;

  private:
    const SchemaNode root;
};

}  // namespace nQITRMCWEBSVC100
