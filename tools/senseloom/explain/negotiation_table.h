#pragma once

#include <cstdio>
#include <string>
#include <vector>

#include "explain/explanation.h"
#include "terminal/text_table.h"

namespace senseloom::tool {

// Prints what each session asked for under each key, what was made of it, who decided, and the property that the
// library returned for it: a row a key, and a column a session. Keys whose value is that of before have no row, unless
// the table is to be whole.
std::vector<TextRow> fewSessionsRows(const Sensor& sensor, const ExplainedNegotiation& negotiation, bool whole);
void printFewSessions(std::FILE* out, const Sensor& sensor, const ExplainedNegotiation& negotiation, bool whole);

// The same with a row a session and a column a key, for many sessions. Unless the table is to be whole, it has those
// keys alone whose value is another than before, and those sessions alone that made the call or decided one of them.
void printManySessions(std::FILE* out, const Sensor& sensor, const ExplainedNegotiation& negotiation, bool whole);

// Prints the stages that records go through now: of all sessions, or of those alone that have others than before.
std::vector<std::string> chainTexts(const ExplainedNegotiation& negotiation, bool all);
void printChains(std::FILE* out, const ExplainedNegotiation& negotiation, bool all);

}  // namespace senseloom::tool
