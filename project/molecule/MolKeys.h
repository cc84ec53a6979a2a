#pragma once
// Process-wide bookkeeping of molecule keys. A new key never equals a key issued before or a
// key read from a file during this run, so molecules created after loading a project cannot
// take a key that the project's block set already uses.

#include <string>

// A key no molecule of this run has used or loaded: upper-case hex without leading zeros.
std::string NewMoleculeKey();
// Records a key read from a file so that NewMoleculeKey() never returns it.
void NoteLoadedMoleculeKey(const std::string& key);
