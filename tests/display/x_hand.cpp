// A person at an X server, for tests that drive whole programs: reads a line for each thing to do, with tabs between
// the words, and answers each with one line.
//
//   drop X Y URI...       drags files to a point of the screen and drops them: "taken" or "refused"
//   click X Y             presses the left button there
//   drag X Y X2 Y2        moves from one point to the other with the left button down
//   keys NAME...          presses keys, each by the name of its symbol; "Control_L+o" holds the first one meanwhile
//   titles                the titles of the windows that are shown
//   close TITLE           asks the window with this title to close

#include <X11/Xlib.h>

#include <chrono>
#include <cstdio>
#include <iostream>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

#include "tests/display/x_client.h"

namespace {

using Words = std::vector<std::string>;

Words WordsOf(const std::string& line) {
  Words words;
  std::istringstream rest(line);
  for (std::string word; std::getline(rest, word, '\t');) words.push_back(word);
  return words;
}

POINT PointAt(const Words& words, std::size_t at) {
  return {static_cast<LONG>(std::stol(words.at(at))), static_cast<LONG>(std::stol(words.at(at + 1)))};
}

// As a person who sees where the keyboard is; after a while without.
void WaitForKeyboard(test::XClient& client) {
  for (int tries = 0; tries < 500 && !client.HasKeyboardOwner(); ++tries)
    std::this_thread::sleep_for(std::chrono::milliseconds(10));
}

void Press(test::XClient& client, const std::string& chord) {
  const std::size_t plus = chord.find('+');
  if (plus == std::string::npos) return client.Type(chord.c_str());
  client.Key(chord.substr(0, plus).c_str(), true);
  Press(client, chord.substr(plus + 1));
  client.Key(chord.substr(0, plus).c_str(), false);
}

void Drag(test::XClient& client, POINT from, POINT to) {
  constexpr int kSteps = 10;
  client.Move(from);
  client.Button(1, true);
  for (int step = 1; step <= kSteps; ++step)
    client.Move({from.x + (to.x - from.x) * step / kSteps, from.y + (to.y - from.y) * step / kSteps});
  client.Button(1, false);
}

std::string Drop(test::XClient& client, const Words& words) {
  std::string uris;
  for (std::size_t at = 3; at < words.size(); ++at) uris += words[at] + "\r\n";
  return client.Drop(PointAt(words, 1), uris) ? "taken" : "refused";
}

std::string Titles(test::XClient& client) {
  std::string line;
  for (const std::string& title : client.Titles()) line += (line.empty() ? "" : "\t") + title;
  return line;
}

std::string Do(test::XClient& client, const Words& words) {
  const std::string& what = words.at(0);
  if (what == "drop") return Drop(client, words);
  if (what == "titles") return Titles(client);
  if (what == "click") return client.Click(PointAt(words, 1)), "done";
  if (what == "drag") return Drag(client, PointAt(words, 1), PointAt(words, 3)), "done";
  if (what == "close") return client.AskToClose(words.at(1)), "done";
  if (what != "keys") return "unknown: " + what;
  WaitForKeyboard(client);
  for (std::size_t at = 1; at < words.size(); ++at) Press(client, words[at]);
  return "done";
}

}  // namespace

int main() {
  XSetErrorHandler([](Display*, XErrorEvent*) { return 0; });  // windows of others go at any time
  test::XClient client;
  if (!client.CanType()) return std::puts("no input"), 0;
  std::cout << "ready" << std::endl;
  for (std::string line; std::getline(std::cin, line);) std::cout << Do(client, WordsOf(line)) << std::endl;
  return 0;
}
