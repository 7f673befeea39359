// tidewater documents: the man pages and completions, made from the options themselves.

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <functional>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "commands.hpp"
#include "stream.hpp"
#include "tidewater/version.h"

namespace tidewater::command {

namespace {

namespace fs = std::filesystem;

// A subcommand with the words that lead to it.
struct Page {
  const CLI::App* app;
  std::vector<std::string> words;  // "tidewater", "systems", "list"

  std::string name(const char* between) const {
    std::string text;
    for (const std::string& word : words) text += (text.empty() ? "" : between) + word;
    return text;
  }
};

bool is_shown(const CLI::App& app) { return !app.get_group().empty(); }

std::vector<Page> pages_of(const CLI::App& root) {
  std::vector<Page> pages = {{&root, {"tidewater"}}};
  for (std::size_t i = 0; i < pages.size(); ++i) {
    const Page page = pages[i];
    for (const CLI::App* sub : page.app->get_subcommands([](const CLI::App*) { return true; })) {
      if (!is_shown(*sub)) continue;
      Page next{sub, page.words};
      next.words.push_back(sub->get_name());
      pages.push_back(std::move(next));
    }
  }
  return pages;
}

std::vector<const CLI::Option*> options_of(const CLI::App& app, bool positional) {
  std::vector<const CLI::Option*> list;
  for (const CLI::Option* option : app.get_options()) {
    if (option->get_positional() == positional) list.push_back(option);
  }
  return list;
}

std::vector<std::string> names_of(const CLI::Option& option) {
  std::vector<std::string> names;
  for (const std::string& name : option.get_snames()) names.push_back("-" + name);
  for (const std::string& name : option.get_lnames()) names.push_back("--" + name);
  return names;
}

bool takes_value(const CLI::Option& option) { return option.get_items_expected_max() > 0; }

// The words that an option's check allows: "{a,b,c}".
std::vector<std::string> choices_of(const CLI::Option& option) {
  const std::string type = option.get_type_name();
  const std::size_t open = type.find('{');
  const std::size_t close = type.find('}');
  std::vector<std::string> words;
  if (open == type.npos || close == type.npos) return words;
  std::string word;
  for (std::size_t i = open + 1; i <= close; ++i) {
    if (type[i] == ',' || type[i] == '}') {
      words.push_back(word);
      word.clear();
    } else {
      word += type[i];
    }
  }
  return words;
}

// Text for troff: its own marks stand for themselves.
std::string troff(const std::string& text) {
  std::string out;
  bool line_begins = true;
  for (const char c : text) {
    if (line_begins && (c == '.' || c == '\'')) out += "\\&";
    if (c == '\\') {
      out += "\\e";
    } else if (c == '-') {
      out += "\\-";
    } else {
      out += c;
    }
    line_begins = c == '\n';
  }
  return out;
}

std::string man_page(const Page& page) {
  const CLI::App& app = *page.app;
  std::string title = page.name("-");
  std::transform(title.begin(), title.end(), title.begin(),
                 [](char c) { return c >= 'a' && c <= 'z' ? static_cast<char>(c - 32) : c; });
  std::string about = app.get_description();
  const std::size_t first_line = about.find('\n');
  std::string brief = about.substr(0, first_line);
  if (!brief.empty() && brief.back() == '.') brief.pop_back();
  if (!brief.empty() && brief[0] >= 'A' && brief[0] <= 'Z')
    brief[0] = static_cast<char>(brief[0] + 32);
  std::string text = ".TH " + title + " 1 \"\" \"Tidewater " TIDEWATER_VERSION "\"\n";
  text += ".SH NAME\n" + troff(page.name("-")) + " \\- " + troff(brief) + "\n";
  text += ".SH SYNOPSIS\n.B " + page.name(" ") + "\n[\\fIoptions\\fR]";
  for (const CLI::Option* option : options_of(app, true)) {
    text += " [\\fI" + option->get_name(true) + "\\fR...]";
  }
  if (!app.get_subcommands([](const CLI::App*) { return true; }).empty())
    text += " \\fIcommand\\fR";
  text += "\n.SH DESCRIPTION\n" + troff(about) + "\n";
  bool any = false;
  for (const CLI::App* sub : app.get_subcommands([](const CLI::App*) { return true; })) {
    if (!is_shown(*sub)) continue;
    if (!std::exchange(any, true)) text += ".SH COMMANDS\n";
    std::string line = sub->get_description();
    text += ".TP\n.B " + sub->get_name() + "\n" + troff(line.substr(0, line.find('\n'))) + "\n";
  }
  text += ".SH OPTIONS\n";
  for (const bool positional : {true, false}) {
    for (const CLI::Option* option : options_of(app, positional)) {
      std::string head;
      if (positional) {
        head = "\\fI" + option->get_name(true) + "\\fR";
      } else {
        for (const std::string& name : names_of(*option)) {
          head += (head.empty() ? "" : ", ") + ("\\fB" + troff(name) + "\\fR");
        }
        const auto choices = choices_of(*option);
        std::string value;
        for (const std::string& choice : choices) value += (value.empty() ? "" : "|") + choice;
        if (takes_value(*option))
          head += " \\fI" + (value.empty() ? "value" : troff(value)) + "\\fR";
      }
      text += ".TP\n" + head + "\n" + troff(option->get_description());
      const std::string usual = option->get_default_str();
      if (!usual.empty() && takes_value(*option)) text += " (usually " + troff(usual) + ")";
      text += "\n";
    }
  }
  if (!app.get_footer().empty()) {
    text += ".SH NOTES\n.nf\n" + troff(app.get_footer()) + "\n.fi\n";
  }
  text +=
      ".SH EXIT STATUS\n0 when every line was done, 1 when some lines were not, 2 when the command "
      "could not be carried out.\n";
  return text;
}

std::string bash_completion(const std::vector<Page>& pages) {
  std::string text =
      "# bash completion for tidewater\n_tidewater() {\n"
      "  local word=${COMP_WORDS[COMP_CWORD]} before=${COMP_WORDS[COMP_CWORD-1]} path=tidewater i\n"
      "  for ((i = 1; i < COMP_CWORD; i++)); do\n"
      "    case \"$path ${COMP_WORDS[i]}\" in\n";
  for (const Page& page : pages) {
    if (page.words.size() > 1)
      text += "      \"" + page.name(" ") + "\") path=\"" + page.name(" ") + "\" ;;\n";
  }
  text += "    esac\n  done\n  case \"$path $before\" in\n";
  for (const Page& page : pages) {
    for (const CLI::Option* option : options_of(*page.app, false)) {
      const auto choices = choices_of(*option);
      if (choices.empty()) continue;
      std::string words;
      for (const std::string& choice : choices) words += (words.empty() ? "" : " ") + choice;
      for (const std::string& name : names_of(*option)) {
        text += "    \"" + page.name(" ") + " " + name + "\") COMPREPLY=($(compgen -W \"" + words +
                "\" -- \"$word\")); return ;;\n";
      }
    }
  }
  text += "  esac\n  case \"$path\" in\n";
  for (const Page& page : pages) {
    std::string words;
    for (const CLI::App* sub : page.app->get_subcommands([](const CLI::App*) { return true; })) {
      if (is_shown(*sub)) words += sub->get_name() + " ";
    }
    for (const CLI::Option* option : options_of(*page.app, false)) {
      for (const std::string& name : names_of(*option)) words += name + " ";
    }
    if (!words.empty()) words.pop_back();
    text += "    \"" + page.name(" ") + "\") COMPREPLY=($(compgen -W \"" + words +
            "\" -- \"$word\")) ;;\n";
  }
  return text + "  esac\n}\ncomplete -o default -F _tidewater tidewater\n";
}

// Single quotes for the shells.
std::string in_quotes(const std::string& text) {
  std::string out = "'";
  for (const char c : text) {
    if (c == '\'') {
      out += "'\\''";
    } else {
      out += c == '\n' ? ' ' : c;
    }
  }
  return out + "'";
}

std::string brief(const std::string& text) {
  std::string line = text.substr(0, text.find('\n'));
  std::erase_if(line, [](char c) { return c == '[' || c == ']' || c == ':'; });
  return line.substr(0, 70);
}

std::string zsh_completion(const std::vector<Page>& pages) {
  std::string text =
      "#compdef tidewater\n_tidewater() {\n  local path=tidewater i\n"
      "  for ((i = 2; i < CURRENT; i++)); do\n    case \"$path ${words[i]}\" in\n";
  for (const Page& page : pages) {
    if (page.words.size() > 1)
      text += "      \"" + page.name(" ") + "\") path=\"" + page.name(" ") + "\" ;;\n";
  }
  text += "    esac\n  done\n  case \"$path\" in\n";
  for (const Page& page : pages) {
    text += "    \"" + page.name(" ") + "\")\n";
    std::string subs;
    for (const CLI::App* sub : page.app->get_subcommands([](const CLI::App*) { return true; })) {
      if (is_shown(*sub))
        subs += " " + in_quotes(sub->get_name() + ":" + brief(sub->get_description()));
    }
    if (!subs.empty())
      text += "      local -a commands=(" + subs + " )\n      _describe command commands\n";
    text += "      local -a options=(";
    for (const CLI::Option* option : options_of(*page.app, false)) {
      for (const std::string& name : names_of(*option)) {
        text += " " + in_quotes(name + ":" + brief(option->get_description()));
      }
    }
    text += " )\n      _describe option options\n      _files ;;\n";
  }
  return text + "  esac\n}\n_tidewater \"$@\"\n";
}

std::string fish_completion(const std::vector<Page>& pages) {
  std::string text = "# fish completion for tidewater\n";
  for (const Page& page : pages) {
    std::string condition = "__fish_use_subcommand";
    if (page.words.size() > 1) {
      condition.clear();
      for (std::size_t i = 1; i < page.words.size(); ++i) {
        condition += (i > 1 ? "; and " : "") + ("__fish_seen_subcommand_from " + page.words[i]);
      }
    }
    const std::string start = "complete -c tidewater -n " + in_quotes(condition);
    for (const CLI::App* sub : page.app->get_subcommands([](const CLI::App*) { return true; })) {
      if (is_shown(*sub)) {
        text += start + " -a " + sub->get_name() + " -d " +
                in_quotes(brief(sub->get_description())) + "\n";
      }
    }
    for (const CLI::Option* option : options_of(*page.app, false)) {
      text += start;
      for (const std::string& name : option->get_snames()) text += " -s " + name;
      for (const std::string& name : option->get_lnames()) text += " -l " + name;
      std::string words;
      for (const std::string& choice : choices_of(*option))
        words += (words.empty() ? "" : " ") + choice;
      if (!words.empty()) text += " -x -a " + in_quotes(words);
      if (words.empty() && takes_value(*option)) text += " -r";
      text += " -d " + in_quotes(brief(option->get_description())) + "\n";
    }
  }
  return text;
}

void put(const fs::path& file, const std::string& text) {
  fs::create_directories(file.parent_path());
  std::ofstream stream(file, std::ios::binary);
  stream << text;
  stream.close();
  if (!stream) throw std::runtime_error(file.string() + " cannot be written");
}

void write_documents(const CLI::App& root, const fs::path& folder) {
  const std::vector<Page> pages = pages_of(root);
  for (const Page& page : pages) put(folder / "man1" / (page.name("-") + ".1"), man_page(page));
  put(folder / "completions" / "tidewater.bash", bash_completion(pages));
  put(folder / "completions" / "_tidewater", zsh_completion(pages));
  put(folder / "completions" / "tidewater.fish", fish_completion(pages));
}

}  // namespace

void add_documents(CLI::App& app, int& exit_status) {
  auto folder = std::make_shared<std::string>();
  CLI::App* command =
      app.add_subcommand("documents", "Writes the man pages and completions into a folder.");
  command->group("");  // for the build
  command->add_option("folder", *folder, "where to")->required();
  command->callback([&app, folder, &exit_status] {
    write_documents(app, *folder);
    exit_status = 0;
  });
}

}  // namespace tidewater::command
