// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/mirror/layout_solver.h"

#include <glpk.h>

#include <functional>
#include <map>
#include <memory>

namespace vaelo {

namespace {

constexpr int TimeLimit = 200;  // milliseconds, for each priority

/// A column of the problem that says by how much a relation is broken.
struct Break {
  int column;
  double weight;
};

struct ProblemDelete {
  void operator()(glp_prob* problem) const { glp_delete_prob(problem); }
};

int addBreak(glp_prob* problem) {
  const int column = glp_add_cols(problem, 1);
  glp_set_col_bnds(problem, column, GLP_LO, 0, 0);
  return column;
}

}  // namespace

std::vector<double> LayoutSolver::solve() const {
  const std::unique_ptr<glp_prob, ProblemDelete> held(glp_create_prob());
  glp_prob* problem = held.get();
  glp_set_obj_dir(problem, GLP_MIN);
  if (lengths_ > 0) glp_add_cols(problem, lengths_);
  for (int column = 1; column <= lengths_; ++column) glp_set_col_bnds(problem, column, GLP_FR, 0, 0);
  std::map<float, std::vector<Break>, std::greater<>> levels;
  for (const Row& row : rows_) {
    // A length may stand in two terms, which the library doesn't add up.
    std::map<int, double> factors;
    for (const Term& term : row.terms) factors[term.length + 1] += term.factor;
    if (row.relation != LayoutRelation::LessThanOrEqual) factors[addBreak(problem)] = 1;
    if (row.relation != LayoutRelation::GreaterThanOrEqual) factors[addBreak(problem)] = -1;
    std::vector<int> columns(1);  // the library counts from one
    std::vector<double> values(1);
    for (const auto& [column, factor] : factors) {
      columns.push_back(column);
      values.push_back(factor);
      if (column > lengths_) levels[row.priority].push_back({column, row.weight});
    }
    const int added = glp_add_rows(problem, 1);
    glp_set_mat_row(problem, added, static_cast<int>(factors.size()), columns.data(), values.data());
    const int bound = row.relation == LayoutRelation::Equal             ? GLP_FX
                      : row.relation == LayoutRelation::LessThanOrEqual ? GLP_UP
                                                                        : GLP_LO;
    glp_set_row_bnds(problem, added, bound, row.constant, row.constant);
  }
  glp_smcp parameters;
  glp_init_smcp(&parameters);
  parameters.msg_lev = GLP_MSG_OFF;
  parameters.tm_lim = TimeLimit;
  for (const auto& [priority, breaks] : levels) {
    for (const Break& each : breaks) glp_set_obj_coef(problem, each.column, each.weight);
    if (glp_simplex(problem, &parameters) != 0 || glp_get_status(problem) != GLP_OPT) return {};
    for (const Break& each : breaks) {
      glp_set_obj_coef(problem, each.column, 0);
      constexpr double exact = 1e-6;
      const double broken = glp_get_col_prim(problem, each.column);
      if (broken > exact) {
        glp_set_col_bnds(problem, each.column, GLP_DB, 0, broken);
      } else {
        glp_set_col_bnds(problem, each.column, GLP_FX, 0, 0);
      }
    }
  }
  std::vector<double> lengths;
  for (int column = 1; column <= lengths_; ++column) lengths.push_back(glp_get_col_prim(problem, column));
  return lengths;
}

}  // namespace vaelo
