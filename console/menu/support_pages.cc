#include "console/menu/support_pages.h"

#include <fstream>

namespace Tarnel {

namespace {

constexpr char SUPPORT_FILE[] = "/etc/halvren/support";
constexpr char COMMENT = '#';
constexpr char PAGE_BREAK = '$';

const char* KeyColour(bool usable) { return usable ? "{color:white}" : "{color:light-grey}"; }

}  // namespace

std::vector<std::string> LoadSupportPages() {
  std::ifstream file(SUPPORT_FILE);
  std::vector<std::string> pages;
  if (!file) {
    return pages;
  }
  std::string page;
  for (std::string line; std::getline(file, line);) {
    if (line.starts_with(COMMENT)) {
      continue;
    }
    if (line.starts_with(PAGE_BREAK)) {
      pages.push_back(page);
      page.clear();
    } else {
      page += line + "\n";
    }
  }
  pages.push_back(page);
  return pages;
}

std::string SupportPageText(const std::vector<std::string>& pages, size_t page) {
  if (pages.empty()) {
    return "";
  }
  return std::string(KeyColour(page > 0)) + "<Page Up>       {/color}{color:white}" +
         std::to_string(page + 1) + "/" + std::to_string(pages.size()) + "{/color}" +
         KeyColour(page + 1 < pages.size()) + "     <Page Down>{/color}\n" + pages[page];
}

}  // namespace Tarnel
