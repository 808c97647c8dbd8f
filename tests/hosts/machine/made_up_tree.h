#pragma once

#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <string>

#include "hosts/machine/facts.h"

namespace Machine {

// A made-up machine: a directory that stands in for "/" and goes away with the object.
class MadeUpTree {
 public:
  MadeUpTree() {
    std::string pattern = (std::filesystem::temp_directory_path() / "machine-XXXXXX").string();
    if (mkdtemp(pattern.data()) == nullptr) throw std::runtime_error("no temporary directory");
    _root = pattern;
  }
  ~MadeUpTree() {
    std::error_code error;
    std::filesystem::remove_all(_root, error);
  }
  MadeUpTree(const MadeUpTree&) = delete;
  MadeUpTree& operator=(const MadeUpTree&) = delete;

  // Paths start with a slash.
  void Write(const std::string& path, const std::string& content) {
    std::filesystem::create_directories(Inside(path).parent_path());
    std::ofstream(Inside(path), std::ios::binary) << content;
  }

  // `target` is another path of the tree and is made as a directory when it is not there.
  // The link is a relative one, as the kernel makes them.
  void Link(const std::string& path, const std::string& target) {
    std::filesystem::create_directories(Inside(target));
    std::filesystem::create_directories(Inside(path).parent_path());
    const std::filesystem::path relative =
        std::filesystem::relative(Inside(target), Inside(path).parent_path());
    std::filesystem::create_directory_symlink(relative, Inside(path));
  }

  Sources AsSources() const { return {_root.string()}; }

 private:
  std::filesystem::path Inside(const std::string& path) const { return _root.string() + path; }

  std::filesystem::path _root;
};

}  // namespace Machine
