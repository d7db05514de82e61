#pragma once

#include <cstdint>

#include "qihtl/String.h"

// Searches status explanation files: text files with the descriptions of status codes.
//
//     <?xml version="1.0" ...
//     <qidocument>
//     <qierror code="-1">
//     The description, on any number of lines.
//     </qierror>
//     </qidocument>
//
// This is not an XML parser. It compares only the start of each line with the tags, in any case of
// letters, and takes the text of a line as it stands. The code is decimal, or hexadecimal with 0x;
// a number outside the signed 32-bit range, such as 0xFFFC2C40, matches no code. <qicomment> and
// </qicomment> enclose lines to be skipped.
//
// A search replaces `output` by the description. An empty output with a status that is not negative
// means that there is no description. If the status is already negative, a search only clears
// `output`. A search may run on any thread. The results of searches of a directory are kept, and
// given again as long as neither the directory nor any file that the search looked at has changed.
namespace qixlator {

// Searches one file up to the first block for the code. A file that does not begin like an
// explanation file has no descriptions. qiapalerr_resourceNotFound if the file cannot be opened or
// is invalid.
void findErrorDescriptionFromFile(const char* path, std::int32_t code, qihtl::String* output,
                                  qierr_Status* status);

// Searches the regular files of a directory (not of its subdirectories) whose extension is exactly
// "txt" or "err", in the order of the operating system, up to the first description or failure.
// qiapalerr_resourceNotFound also if the directory cannot be read.
void findErrorDescriptionFromDir(const char* directory, std::int32_t code, qihtl::String* output,
                                 qierr_Status* status);

// Searches the language's subdirectory of `errorsDirectory` and then `errorsDirectory` itself. A
// missing subdirectory is a failure.
void findErrorDescriptionFromErrorsDir(const char* errorsDirectory, std::int32_t code,
                                       std::int32_t language, qihtl::String* output,
                                       qierr_Status* status);

// The name of a language's directory: English, French, German, Japanese, Korean, ChineseS for 0 to
// 5. Any other number sets qiapalerr_invalidParameter and returns "".
const char* convertLangToDir(std::int32_t language, qierr_Status* status);

}  // namespace qixlator
