#pragma once
// The document of a pane drawn without the program's window (figures, benchmarks): it holds a
// project and changes nothing.

#include <memory>

#include "BlockProject.h"
#include "PaneView.h"

class CProjectHolder final : public IPaneDocument {
  public:
    explicit CProjectHolder(std::unique_ptr<CBlockProject> project)
        : m_project(std::move(project)) {}
    CBlockProject* Project() const override { return m_project.get(); }
    void SetModifiedFlag(bool) override {}

  private:
    std::unique_ptr<CBlockProject> m_project;
};
