#pragma once
// Registers the icons and animations compiled into the shell library; call once after the
// QApplication exists.
void InitShellResources();
