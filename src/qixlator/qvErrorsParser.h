#pragma once

#include <cstdint>

#include "qihtl/String.h"

// The reader of status explanation files: text files that hold the descriptions of status codes.
//
//     <?xml version="1.0" ...
//     <qidocument>
//     <qierror code="-1">
//     The description, on any number of lines.
//     </qierror>
//     </qidocument>
//
// This is no XML parser. It looks at the start of each line and nothing else, in any case of
// letters, and takes the text of a line as it stands. The code is decimal, or hexadecimal with 0x;
// one beyond a signed number of 32 bits, such as 0xFFFC2C40, is no code's.
// <qicomment> and </qicomment> enclose lines to be skipped.
//
// A search replaces `output` by the description, or leaves it empty: an empty output with a status
// that is not negative means that there is none here. A search does nothing but clear `output` when
// the status is already negative. Nothing is kept between searches, which may run on any thread.
namespace qixlator {

// Searches one file. A file that does not begin as an explanation file has no descriptions.
// qiapalerr_resourceNotFound when it cannot be opened or is faulty; the first block of the code
// ends the search.
void findErrorDescriptionFromFile(const char* path, std::int32_t code, qihtl::String* output,
                                  qierr_Status* status);

// Searches the regular files of a directory, not those below it, whose extension is exactly "txt"
// or "err", in the order of the operating system, up to the first description or failure.
// qiapalerr_resourceNotFound also when the directory cannot be read.
void findErrorDescriptionFromDir(const char* directory, std::int32_t code, qihtl::String* output,
                                 qierr_Status* status);

// Searches the language's directory below `errorsDirectory` and then `errorsDirectory` itself. A
// missing language directory is a failure.
void findErrorDescriptionFromErrorsDir(const char* errorsDirectory, std::int32_t code,
                                       std::int32_t language, qihtl::String* output,
                                       qierr_Status* status);

// The name of a language's directory: English, French, German, Japanese, Korean, ChineseS for 0 to
// 5. Any other number sets qiapalerr_invalidParameter and gives "".
const char* convertLangToDir(std::int32_t language, qierr_Status* status);

}  // namespace qixlator
