// A unit of change on one Db: BEGIN IMMEDIATE when it is the outermost,
// a savepoint inside another. Undone on destruction unless committed.
#pragma once

namespace TarnCtl::Store {

class Db;

class Transaction {
 public:
  explicit Transaction(Db& db);
  ~Transaction();
  Transaction(const Transaction&) = delete;
  Transaction& operator=(const Transaction&) = delete;

  // REQUIRES: this is the innermost open transaction of its Db.
  void Commit();

 private:
  Db& db_;
  int depth_;
  bool done_ = false;
};

}  // namespace TarnCtl::Store
