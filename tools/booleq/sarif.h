// Findings as SARIF 2.1.0, the form in which checkers pass them to other programs. They are written
// one by one, so that a million of them takes no memory.
#ifndef BOOLEQ_SARIF_H
#define BOOLEQ_SARIF_H

#include <cstdint>
#include <cstdio>
#include <string>
#include <vector>

#include "output.h"

namespace booleq {

struct SarifRule {
    std::string id;
    std::string level; // "error", "warning" or "note"
    std::string sentence;
};

struct SarifResult {
    size_t rule; // index of the rule
    std::string message;
    std::string file;
    uint32_t line;    // 0: none
    std::string path; // of the cell or net
};

class SarifFile {
  public:
    // Fails: IoError when the file cannot be written, here and in the members.
    SarifFile(const std::string& file, std::vector<SarifRule> rules);
    ~SarifFile();
    SarifFile(const SarifFile&) = delete;
    SarifFile& operator=(const SarifFile&) = delete;

    void Put(const SarifResult& result);
    // The file is complete after this, and not before.
    void Finish();

  private:
    std::string m_name;
    std::vector<SarifRule> m_rules;
    std::FILE* m_stream;
    Output m_output;
    std::string m_tail;
    bool m_is_first = true;
};

} // namespace booleq

#endif
